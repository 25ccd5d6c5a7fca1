#include "labels/Separator.h"

#include <algorithm>
#include <array>
#include <vector>

#include "frame/VB.h"
#include "labels/LabelPrinter.h"
#include "labels/Vpcl.h"
#include "platform/Machine.h"

namespace quendal {

namespace {

constexpr std::string_view kNumber = "9";
constexpr int kRow = 580;      // every text starts near the label's top edge
constexpr int kAlong = 3;      // and runs along the label
constexpr std::string_view kVPCLII = "VPCLII";

// The five message slots across the label: column, font, size, width.
struct Slot {
  int column, font, size, width;
};
constexpr std::array<Slot, 5> kSlots = {{
    {150, 3, 2, 20},
    {110, 1, 2, 30},
    {10, 3, 2, 20},
    {55, 1, 2, 30},
    {83, 1, 2, 35},
}};

constexpr vpcl::Text kTitle{kRow, 300, 3, 2, 2, 'W', 'L', kAlong, "SEPARATOR"};
constexpr vpcl::Text kCaption{kRow, 250, 3, 1, 1, 'B', 'L', kAlong, "NEW STORE/ITEM/LOCATION:"};

// The message's lines: up to four ended by a line break, and the rest.
std::vector<std::string> Lines(std::string_view message) {
  std::vector<std::string> lines;
  std::size_t at = 0;
  while (lines.size() < kSlots.size() - 1) {
    const std::size_t end = message.find_first_of("\r\n", at);
    if (end == std::string_view::npos) break;
    lines.emplace_back(message.substr(at, end - at));
    at = end + (message.compare(end, 2, "\r\n") == 0 ? 2 : 1);
  }
  if (at < message.size() || lines.size() < kSlots.size() - 1)
    lines.emplace_back(message.substr(std::min(at, message.size())));
  return lines;
}

}  // namespace

std::string SeparatorJob(std::string_view message, std::string_view batchMode) {
  const std::vector<std::string> lines = Lines(message);
  // Slots 1 to 4 always; slot 5 only for a fifth line.
  const std::size_t slots = lines.size() >= kSlots.size() ? kSlots.size() : kSlots.size() - 1;
  std::vector<std::string> texts;
  for (std::size_t i = 0; i < slots; ++i)
    texts.push_back(UCase(Left(i < lines.size() ? lines[i] : std::string(), kSlots[i].width)));
  std::vector<vpcl::Packet> packets{kTitle, kCaption};
  for (std::size_t i = 0; i < slots; ++i) {
    const Slot& s = kSlots[i];
    packets.push_back(vpcl::Text{kRow, s.column, s.font, s.size, s.size, 'B', 'L', kAlong, texts[i]});
  }
  return vpcl::RenderFormat(kNumber, vpcl::Format{"SCMSEP", 600, 400, packets}) +
         vpcl::Batch(kNumber, 1, batchMode).Finish();
}

bool LabelPrinter::Separator(const std::string& aPrinterId, const std::string& aMessage) {
  bool result = false;
  Procedure proc = Guard("Function Separator");
  ChannelScope scope(*this);
  if (!proc([&] { printerName_ = aPrinterId; })) return result;
  bool opened = false;
  if (!proc([&] { opened = OpenPtr(); }) || !opened) return result;
  // A raw printer the spooler would not open takes no separator.
  if (!ChannelOpen()) return result;
  std::string language;
  if (!proc([&] { language = system_->PrinterLanguage().Text(); })) return result;
  // Only VPCL II printers get a separator; for other languages nothing is
  // built, and no empty job is queued.
  std::string job;
  if (language == kVPCLII &&
      !proc([&] { job = SeparatorJob(aMessage, system_->PrinterBatchMode().Text()); }))
    return result;
  if (!job.empty()) {
    if (!proc([&] { WriteChannel(job); })) return result;
    if (!proc([&] { ClosePtr(); })) return result;
  }
  return result = true;
}

namespace {

// The first of the pack's attributes under these keys that has a value.
std::string Attribute(host::Pack& pack, std::initializer_list<std::string_view> keys) {
  for (std::string_view key : keys) {
    const std::string value = pack.GetAttribute(Var(key)).Text();
    if (!value.empty()) return value;
  }
  return {};
}

std::string Style(host::Pack& pack) { return Attribute(pack, {"STYLE", "ITEM_STYLE/STOCKID"}); }

// The separator's message for a pack: its id, then each attribute that has
// a value, a line each.
std::string PackMessage(host::Pack& pack) {
  std::string message = "PACK ID " + pack.PackId().Text();
  const auto line = [&](std::string_view caption, const std::string& value) {
    if (!value.empty()) message += "\r\n" + std::string(caption) + " " + value;
  };
  line("STYLE", Style(pack));
  line("ITEM ID", Attribute(pack, {"DESCRIPTION", "DESC", "DESCR", "ITEM_DESCRIPTION"}));
  line("APN", Attribute(pack, {"EAN/UPC", "ITEM_EAN/UPC", "APN", "EAN", "UPC"}));
  line("USER ID", Attribute(pack, {"USER", "PACKERID"}));
  line("JOB ID", Attribute(pack, {"JOBID", "JOB", "BIG TICKET JOB ID"}));
  line("REFER", Attribute(pack, {"DELIVERYREF"}));
  return message;
}

}  // namespace

std::string PackListLabelPrinter::RatioSeparator(const std::string& aMessage) {
  std::string result;
  Procedure proc = Guard("Function RatioSeparator");
  proc([&] { result = SeparatorJob(aMessage, system_->PrinterBatchMode().Text()); });
  return result;
}

bool PackListLabelPrinter::PrintAllLabels(const Ref<host::PackList>& aPackList, bool bSeperator,
                                          bool bStyleSort) {
  bool result = false;
  Procedure proc = Guard("Function PrintAllLabels");
  ChannelScope scope(*this);
  bool opened = false;
  if (!proc([&] { opened = OpenPtr(); }) || !opened || !ChannelOpen()) return result;
  std::string job;
  struct Entry {
    Ref<host::Pack> pack;
    std::string style;
  };
  std::vector<Entry> packs;
  if (!proc([&] {
        copies_ = 1;
        for (const Ref<host::Pack>& pack : *aPackList)
          packs.push_back({pack, bStyleSort ? Style(*pack) : std::string()});
        if (bStyleSort)
          std::stable_sort(packs.begin(), packs.end(),
                           [](const Entry& a, const Entry& b) { return a.style < b.style; });
      }))
    return result;

  // A separator goes before the first pack and wherever the order (or, in a
  // style-sorted run, the style) changes.
  std::string order, style, message;
  bool first = true;
  for (const Entry& entry : packs) {
    std::string packOrder;
    if (!proc([&] {
          packOrder = entry.pack->Order()->OrderNo().Text();
          message = PackMessage(*entry.pack);
        }))
      return result;
    const bool changed = first || packOrder != order || (bStyleSort && entry.style != style);
    first = false;
    order = packOrder;
    style = entry.style;
    if (changed && bSeperator && !proc([&] { job += RatioSeparator(message) + "\r\n"; }))
      return result;
    if (!proc([&] {
          PumpMessages();
          pack_ = entry.pack;
        }) ||
        !FillValues(proc) || !proc([&] { job += VPCLIIBatchCommand(); }))
      return result;
  }
  if (bStyleSort && bSeperator && !packs.empty() &&
      !proc([&] { job += RatioSeparator(message) + "\r\n"; }))
    return result;
  // Only a raw printer takes the job's text.
  if (RawChannelOpen()) {
    if (!proc([&] { WriteChannel(job); })) return result;
    if (!proc([&] { ClosePtr(); })) return result;
  }
  return result = true;
}

}  // namespace quendal
