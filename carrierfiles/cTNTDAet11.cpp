#include "carrierfiles/cTNTDAet11.h"

#include <array>
#include <charconv>
#include <vector>

#include "carrierfiles/FixedRecord.h"
#include "carrierfiles/TailJournal.h"
#include "frame/VB.h"
#include "frame/host/Read.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileLock.h"
#include "platform/CodePage.h"

namespace quendal {

using host::First;
using host::Read;

namespace {

using namespace record;

constexpr std::string_view kOpenFile = "Open carrier message file";

// "A" batch header: batch reference, origin depot, when the batch was
// started, file version "11".
constexpr std::array kBatchHeader = {
    Literal("A"),         TextLeft(20),  // batch reference (A-value)
    Spaces(42),
    TextRight(3),  // origin depot
    Date("YYYYMMDDHHMM"), Literal("11"),
};
static_assert(Width(kBatchHeader) == 80);

// "B" sender: batch number, the sender's account and its name and address.
// The carrier's layout announces 206 characters, but its fields at their
// positions end at 186: the fields are written as laid out.
constexpr std::array kSender = {
    Literal("B"), TextLeft(10),  // batch number (B-value)
    TextLeft(15),                // account reference
    TextLeft(10),                // account number
    TextLeft(30),                // sender name
    TextLeft(30),                // sender street
    Spaces(30),
    TextLeft(20),  // suburb
    TextRight(3),  // state
    TextRight(4),  // postcode
    Spaces(33),
};
static_assert(Width(kSender) == 186);

// "C" consignment: the receiver, the consignment date and the service.
constexpr std::array kConsignment = {
    Literal("C"),     TextLeft(10),  // batch number
    TextLeft(15),                    // consignment number
    Literal("001"),   Spaces(25),
    CutLeft(30),   // partner's short name and receiver name
    TextLeft(30),  // receiver street
    Spaces(30),
    TextLeft(20),  // suburb
    TextRight(3),  // state
    TextRight(4),  // postcode
    Spaces(33),
    Date("DDMMYYYY"),  // consignment date
    TextLeft(4),       // TNT service code
    Literal("0S00"),  Spaces(42),
};
static_assert(Width(kConsignment) == 262);

// "E" delivery instruction: the latest delivery date in words.
constexpr std::array kInstruction = {
    Literal("E"), TextLeft(10),  // batch number
    TextLeft(15),                // consignment number
    Literal("0"),
    TextLeft(80),  // "deliver not after date " + date
};
static_assert(Width(kInstruction) == 107);

// "F" freight: notice, kind and number of packs, weight in kilograms
// ("KG") and volume in cubic metres ("CO").
constexpr std::array kFreight = {
    Literal("F"),
    TextLeft(10),  // batch number
    TextLeft(15),  // consignment number
    Literal("001"),
    TextLeft(15),  // advance ship notice
    TextLeft(20),  // "Pallets" or "Cartons"
    Spaces(6),
    Zero(5),  // packs
    Number("00000.000"),
    Literal("KG"),
    Spaces(23),
    Number("00.0000000"),
    Literal("CO"),
    Spaces(10),
};
static_assert(Width(kFreight) == 131);

// "H" items: a sequence number and eight slots, each the pack's SSCC
// without its leading "00" (18 digits) and two spaces.
constexpr std::array kItems = {
    Literal("H"), TextLeft(10),  // batch number
    TextLeft(15),                // consignment number
    Zero(3),                     // sequence number
};
constexpr std::array kSlot = {TextLeft(18), Spaces(2)};
constexpr int kSlots = 8;
static_assert(Width(kItems) + kSlots * Width(kSlot) == 189);

// "Z" trailer: the batch reference and the number of lines, itself included.
constexpr std::array kTrailer = {
    Literal("Z"), TextLeft(20),  // batch reference
    Zero(5),                     // lines
};
static_assert(Width(kTrailer) == 26);

// A value "as text": a date as the runtime writes it, anything else as it is.
std::string AsText(const Var& value) {
  if (const auto date = host::DateOf(value)) return Var(*date).Text();
  return value.Text();
}

// Lines of bytes, each without its line break; a last line without one is left out.
std::vector<std::string_view> CompleteLines(std::string_view bytes) {
  std::vector<std::string_view> lines;
  std::size_t start = 0;
  for (std::size_t end; (end = bytes.find('\n', start)) != std::string_view::npos;
       start = end + 1) {
    std::string_view line = bytes.substr(start, end - start);
    if (line.ends_with('\r')) line.remove_suffix(1);
    lines.push_back(line);
  }
  return lines;
}

// The batch values of an existing file, from its first "A" and "B" lines,
// as WriteFile restores them; `header` is the "A" line as it stands.
struct Batch {
  std::string aValue;
  std::string bValue;
  std::string header;
};

constexpr std::size_t kHeadBytes = 8192;

Batch BatchOf(std::string_view head) {
  Batch batch;
  bool a = false;
  bool b = false;
  for (std::string_view line : CompleteLines(head)) {
    if (!a && line.starts_with('A')) {
      batch.aValue = Trim(FromCodePage(line.substr(1, 20)));
      batch.header = std::string(line);
      a = true;
    }
    if (!b && line.starts_with('B')) {
      batch.bValue = Trim(FromCodePage(line.substr(1, 10)));
      b = true;
    }
  }
  return batch;
}

// Where this batch's trailer starts within the file's end, and its count.
// The last line must be whole (ended by CR LF) and read "Z", the batch
// reference as the trailers of this file carry it, and the line count.
// The first trailer carries the reference as the "A" line holds it; later
// ones the reference as restored from there (the two differ only for a
// reference longer than its field or with leading spaces).
struct Trailer {
  std::size_t at = 0;
  std::uint64_t count = 0;
};

std::optional<Trailer> FindTrailer(const TailJournal::End& end, const Batch& batch) {
  std::string_view bytes = end.bytes;
  if (!bytes.ends_with("\r\n")) return std::nullopt;
  const std::string_view body = bytes.substr(0, bytes.size() - 2);
  const std::size_t lineBreak = body.rfind('\n');
  if (lineBreak == std::string_view::npos && end.offset != 0) return std::nullopt;
  const std::size_t at = lineBreak == std::string_view::npos ? 0 : lineBreak + 1;
  const std::string_view line = body.substr(at);

  std::vector<std::string> references = {"Z" +
                                         ToCodePage(record::Fill(TextLeft(20), Var(batch.aValue)))};
  // The header's reference field: what stands between "A" and the 59
  // characters of spaces, depot, date and version that end the line.
  if (batch.header.size() >= 80)
    references.push_back("Z" + batch.header.substr(1, batch.header.size() - 60));
  for (const std::string& reference : references) {
    if (!line.starts_with(reference)) continue;
    const std::string_view digits = line.substr(reference.size());
    if (digits.size() < 5 || digits.size() > 18) continue;
    std::uint64_t count = 0;
    const auto [next, error] = std::from_chars(digits.data(), digits.data() + digits.size(), count);
    if (error == std::errc() && next == digits.data() + digits.size()) return Trailer{at, count};
  }
  return std::nullopt;
}

}  // namespace

clsTNTDAet11::clsTNTDAet11() : ConsignmentWriter("clsTNTDAet11") {}

void clsTNTDAet11::Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
                           const Ref<host::PackList>& lstPacks) {
  Procedure proc = Guard("Sub Process");
  std::string no;
  Ref<host::Carrier> carrier;
  std::string folder;
  std::string path;
  if (!proc([&] {
        no = objConNote->ConNoteNo().Text();
        carrier = objConNote->Carrier();
        folder = Read(carrier, &host::Carrier::FileFolder).Text();
        if (!HasFolder(folder)) return false;
        // One file per account and day; the folder text ends with its separator.
        path = folder + SafeNamePart(Read(carrier, &host::Carrier::AccountRef).Text()) +
               Format(Var(Today()), "DDMM") + "1200.TXT";
        return true;
      }))
    return;

  // From here to the end of the call the file is this station's alone: the
  // batch values and the line count it reads stay true until its own
  // consignment and trailer are in.
  FileLock lock;
  if (!proc([&] {
        if (lock.Acquire(path)) return true;
        LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + folder);
        return false;
      }))
    return;

  // An addition that a crash interrupted is completed before anything else.
  TailJournal journal(path);
  if (!proc([&] {
        if (journal.Finish() != TailJournal::Recovery::Failed) return true;
        LogLine(0, kOpenFile, "Cannot open file to add consignment " + folder);
        return false;
      }))
    return;

  // An existing batch gives the batch values; a new one takes them from
  // this consignment's notice and number.
  bool existing = false;
  Batch batch;
  std::uint64_t kept = 0;  // lines kept by WriteFile
  if (!proc([&] {
        existing = FileSize(path).value_or(0) > 0;
        if (!existing) {
          aValue_ = Read(objASN, &host::ASN::ASNNo).Text();
          bValue_ = objConNote->ConNoteId().Text();
          return true;
        }
        // The values are those of the batch the consignment joins.
        aValue_.clear();
        bValue_.clear();
        if (!tailReplacement_) {
          kept = static_cast<std::uint64_t>(WriteFile(path));
          if (kept > 0) return true;
        } else if (const auto head = ReadFileHead(path, kHeadBytes)) {
          batch = BatchOf(*head);
          aValue_ = batch.aValue;
          bValue_ = batch.bValue;
          return true;
        }
        LogLine(0, kOpenFile, "Cannot open file to add consignment " + folder);
        return false;
      }))
    return;

  // Every record must keep its width, the new batch's header records too.
  record::FitCheck fit;
  std::string header;
  if (!existing && !proc([&] {
        const Ref<host::Vendor> vendor = objConNote->Vendor();
        header =
            CarrierLine(record::Render(
                kBatchHeader,
                {aValue_, Left(Read(objASN, &host::ASN::OriginCode).Text(), 3), Now()})) +
            CarrierLine(record::Render(
                kSender,
                {bValue_, Read(carrier, &host::Carrier::AccountRef),
                 Read(carrier, &host::Carrier::AccountNumber), Read(vendor, &host::Vendor::Name),
                 Read(vendor, &host::Vendor::AddressLine2), Read(vendor, &host::Vendor::Suburb),
                 Read(vendor, &host::Vendor::State), Read(vendor, &host::Vendor::Postcode)}));
      }))
    return;

  std::string body;
  std::uint64_t lines = 0;
  if (!proc([&] {
        const Ref<host::Receiver> receiver = objConNote->Receiver();
        const std::string name = Read(objConNote->Partner(), &host::Partner::ShortName).Text() +
                                 " " + Read(receiver, &host::Receiver::Name).Text();
        body = CarrierLine(record::Render(
            kConsignment,
            {bValue_, no, name, Read(receiver, &host::Receiver::AddressLine2),
             Read(receiver, &host::Receiver::Suburb), Read(receiver, &host::Receiver::State),
             Read(receiver, &host::Receiver::Postcode), objConNote->ConNoteDate(),
             ServiceCode(ServiceTable::TNTET11, objConNote)}));
        const Ref<host::Despatch> despatch =
            Read(First(Read(objConNote, &host::ConNote::Packs)), &host::Pack::Despatch);
        body += CarrierLine(record::Render(
            kInstruction,
            {bValue_, no,
             "deliver not after date " + AsText(Read(despatch, &host::Despatch::NotAfter))}));
        const bool pallets = UCase(Read(First(lstPacks), &host::Pack::PackType).Text()) == "PALLET";
        const double weight = objConNote->Weight().NumberOr(0);
        body += CarrierLine(record::Render(
            kFreight, {bValue_, no, Read(objASN, &host::ASN::ASNNo),
                       pallets ? "Pallets" : "Cartons", lstPacks ? lstPacks->Count() : 0,
                       weight > 1 ? weight : 1.0, objConNote->Volume().NumberOr(0)}));
        lines = 3;
      }))
    return;

  // One "H" line per eight packs, the last one filled with blank slots; a
  // consignment without packs still has one.
  if (!proc([&] {
        const std::int32_t count = lstPacks ? lstPacks->Count() : 0;
        std::string items;
        std::int32_t sequence = 0;
        for (std::int32_t first = 1; first <= count || sequence == 0; first += kSlots) {
          std::string line = record::Render(kItems, {bValue_, no, ++sequence});
          for (std::int32_t i = first; i < first + kSlots; ++i) {
            const Var sscc =
                i <= count ? Var(Mid(Read(lstPacks->Item(i), &host::Pack::SSCC).Text(), 3, 18))
                           : Var();
            line += record::Render(kSlot, {sscc});
          }
          items += CarrierLine(line);
        }
        body += items;
        lines += static_cast<std::uint64_t>(sequence);
      }))
    return;

  if (!proc([&] {
        if (fit.Fits()) return true;
        LogLine(0, kOpenFile, fit.Refusal(no));
        return false;
      }))
    return;

  const auto trailer = [&](std::uint64_t count) {
    return CarrierLine(record::Render(kTrailer, {aValue_, static_cast<std::int64_t>(count)}));
  };

  if (!tailReplacement_) {
    if (!proc([&] {
          if (File().Open(path)) return true;
          LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + folder);
          return false;
        }))
      return;
    proc([&] {
      const std::uint64_t before = existing ? kept : 2;
      if (!File().Append((existing ? std::string() : header) + body + trailer(before + lines + 1)))
        throw Error(err::kDeviceIO);
      CloseOpenFile();
    });
    return;
  }

  // The consignment and the new trailer replace the old trailer in one
  // journalled write; a new file gets the batch header first.
  proc([&] {
    std::uint64_t previous = 0;  // lines before the consignment, the old trailer not counted
    const auto find = [&](const TailJournal::End& end) -> std::optional<std::size_t> {
      if (!existing)
        return end.bytes.empty() && end.offset == 0 ? std::optional<std::size_t>(0) : std::nullopt;
      const std::optional<Trailer> found = FindTrailer(end, batch);
      if (!found || found->count == 0) return std::nullopt;
      previous = found->count - 1;
      // The new trailer must keep its width too: a count too large for its
      // field refuses the consignment (the fit check says which).
      if (trailer(previous + lines + 1); !fit.Fits()) return std::nullopt;
      return found->at;
    };
    const auto build = [&](std::string_view) {
      return existing ? body + trailer(previous + lines + 1)
                      : header + body + trailer(2 + lines + 1);
    };
    switch (journal.Replace(find, build)) {
      case TailJournal::Outcome::Replaced:
        return true;
      case TailJournal::Outcome::NoTail:
        if (!fit.Fits()) {
          LogLine(0, kOpenFile, fit.Refusal(no));
          return false;
        }
        LogLine(0, kOpenFile, "Cannot open file to add consignment " + folder);
        LogLine(0, kOpenFile,
                "ConNote " + no + " not added: the last line of " + path +
                    " is not the trailer of its batch");
        return false;
      case TailJournal::Outcome::CannotOpen:
        LogLine(err::kPathFileAccess, kOpenFile, "Cannot open file " + folder);
        return false;
      case TailJournal::Outcome::Failed:
        break;
    }
    throw Error(err::kDeviceIO);
  });
}

std::unique_ptr<Component> MakeTNTDAet11() { return std::make_unique<clsTNTDAet11>(); }

}  // namespace quendal
