#include "manifests/ConsolidatedManifest.h"

#include <array>
#include <optional>
#include <vector>

#include "frame/VB.h"
#include "frame/host/Read.h"
#include "platform/Clock.h"
#include "platform/PrintDocument.h"

namespace quendal {

using host::First;
using host::Read;

namespace {

constexpr std::string_view kTitle = "Consignment Summary Print";
constexpr int kLandscape = 2;
constexpr Colour kShade = 0xE0E0E0;
const std::string kFont = "Arial";
constexpr double kPoints = 10;

// Date, sender and carrier above the consignments.
constexpr std::string_view kHeadingFormat = "<+1500|<+7500|<+2000|<+3000";
constexpr std::string_view kConsignmentFormat =
    "<+1900|^+200|^+1500|<+4000|<+4000|^+1500|^+800|^+900";
constexpr std::string_view kConsignmentHeader =
    "Consignment No|P|Sender Ref|Receiver Name|Receiver Town|Logistic Units|Weight|Volume";
constexpr std::string_view kSignatureFormat = "<+6000|<+2000|<+6000";

constexpr std::array<std::string_view, 3> kWarranty = {
    "DANGEROUS GOODS WARRANTY:",
    "I hereby declare that these consignments do not contain dangerous goods, and that these "
    "consignments do not contain any unauthorised explosive or incendiary devices.",
    "Please accept for carriage the goods described hereon subject to the Terms and Conditions of "
    "the Carrier. I am also aware that these consignments will be subject to security screening "
    "and clearing.",
};

// What the sender and the driver fill in by hand at pickup.
const std::array<TableRow, 3> kSignatures = {{
    {"Sender name: ______________________________", " ", "Driver ID: ______________________________"},
    {"Sender signature: ______________________________", " ",
     "Driver signature ______________________________"},
    {"", " ", "Pickup time: ______________________________"},
}};

// Everything the document shows, read from the host before it is drawn.
struct Summary {
  std::array<TableRow, 4> heading;
  std::vector<TableRow> rows;  // one per consignment with packs, then the totals
  double packs = 0;
  double weight = 0;
  double volume = 0;
};

// Town, state and postcode as one line, separated by single spaces.
std::string Spaced(const Var& a, const Var& b, const Var& c) {
  return a.Text() + " " + b.Text() + " " + c.Text();
}

std::array<TableRow, 4> Heading(const Ref<host::ConNote>& first, const std::string& beginDate) {
  const Ref<host::Vendor> v = Read(first, &host::ConNote::Vendor);
  const Ref<host::Carrier> c = Read(first, &host::ConNote::Carrier);
  auto text = [](const Var& value) { return value.Text(); };
  return {{
      {"Date:", Format(Var(beginDate), "Long Date"), "", ""},
      {"Sender:", text(Read(v, &host::Vendor::Name)), "Carrier:", text(Read(c, &host::Carrier::Name))},
      {"", text(Read(v, &host::Vendor::AddressLine2)), "Service Code:",
       text(Read(first, &host::ConNote::Service))},
      {"", Spaced(Read(v, &host::Vendor::AddressLine3), Read(v, &host::Vendor::State),
                  Read(v, &host::Vendor::Postcode)),
       "Account Ref:", text(Read(c, &host::Carrier::AccountNumber))},
  }};
}

// The consignment's row, added to the summary with its packs, weight and
// volume; a consignment without packs is left out. A weight or volume that
// is not a number is printed as it is but adds nothing to the totals.
void AddConsignment(Summary& summary, const Ref<host::ConNote>& conNote) {
  const Ref<host::PackList> packs = Read(conNote, &host::ConNote::Packs);
  const std::int32_t count = packs ? packs->Count() : 0;
  if (count <= 0) return;
  const Ref<host::Receiver> r = Read(conNote, &host::ConNote::Receiver);
  auto text = [](const Var& value) { return value.Text(); };
  const Var weight = conNote->Weight();
  const Var volume = conNote->Volume();
  summary.rows.push_back({
      conNote->ConNoteNo().Text(),
      "S",
      text(Read(Read(First(packs), &host::Pack::ASN), &host::ASN::ASNNo)),
      text(Read(r, &host::Receiver::AddressLine1)) + " " + text(Read(r, &host::Receiver::Name)),
      Spaced(Read(r, &host::Receiver::Suburb), Read(r, &host::Receiver::State),
             Read(r, &host::Receiver::Postcode)),
      std::to_string(count),
      weight.Text(),
      volume.Text(),
  });
  summary.packs += count;
  if (weight.IsNumeric()) summary.weight += weight.Number();
  if (volume.IsNumeric()) summary.volume += volume.Number();
}

// Draws the summary; with `keep` the finished PDF is kept for the user
// (its path in `kept`) instead of being printed. False when it could be
// neither printed nor kept, or its HTML copy could not be written.
bool Draw(const Summary& summary, const std::string& printer, std::optional<bool> keep,
          const std::string& htmlFile, std::string& kept) {
  std::unique_ptr<PrintDocument> doc = NewPrintDocument();
  doc->SetPrinter(printer);
  doc->SetOrientation(kLandscape);
  doc->BeginDoc(std::string(kTitle));
  if (!htmlFile.empty()) doc->SetOutputFile(htmlFile);
  if (keep) doc->SetPreview(*keep);
  doc->SetFontSize(kPoints);

  for (const TableRow& row : summary.heading) doc->AddTable(kHeadingFormat, row, {}, kShade);
  doc->AddTable(kConsignmentFormat, TableCells(kConsignmentHeader), summary.rows, kShade);

  doc->Paragraph("", kFont, kPoints);
  for (std::string_view text : kWarranty) doc->Paragraph(std::string(text), kFont, kPoints);
  doc->Paragraph("", kFont, kPoints);

  for (std::size_t i = 0; i < kSignatures.size(); ++i) {
    if (i > 0) doc->Paragraph("", kFont, kPoints);
    doc->AddTable(kSignatureFormat, kSignatures[i], {}, std::nullopt);
  }
  if (!doc->EndDoc()) return false;
  if (keep.value_or(false)) {
    kept = doc->Show();
    return !kept.empty();
  }
  return true;
}

}  // namespace

ConsolidatedManifestRows::ConsolidatedManifestRows(std::string_view className,
                                                   std::span<const GridColumn> columns,
                                                   std::size_t rowColumns, SummarySource source)
    : RowWriter(className, columns, rowColumns), source_(source) {}

Ref<host::ConNotes> ConsolidatedManifestRows::SummaryConNotes(const std::string& aBeginDate,
                                                              const std::string& aEndDate,
                                                              const std::string& aVendorId,
                                                              const std::string& aCarrierId) {
  if (source_ == SummarySource::OwnManifest) {
    // A manifest record that was never saved has no consignments; asking
    // the host for those of manifest 0 would list every consignment that
    // still awaits one.
    if (!manifest_ || manifest_->ManifestId().NumberOr(0) == 0)
      return host::CurrentLibrary().NewConNotes();
    return manifest_->ConNotes();
  }
  const std::string dayAfter = Format(Var(Var(aEndDate).Date().AddDays(1)), "yyyy/mm/dd");
  return system_->GetConNotesByDate(Var(aBeginDate), Var(dayAfter), Var(aVendorId), Var(aCarrierId));
}

std::int16_t ConsolidatedManifestRows::ConsolidatedManifestPrint(
    const std::string& aBeginDate, const std::string& aEndDate, const std::string& aVendorId,
    const std::string& aCarrierId, std::int16_t aReportOption, const std::string& aHTMLFileName) {
  std::int16_t result = kNotProduced;
  Procedure proc = Guard("Function ConsolidatedManifestPrint");
  Ref<host::ConNotes> list;
  std::int32_t count = 0;
  if (!proc([&] {
        kept_.clear();
        list = SummaryConNotes(aBeginDate, aEndDate, aVendorId, aCarrierId);
        count = list ? list->Count() : 0;
      }))
    return result;
  if (!list) {
    result = kNoList;
    return result;
  }
  if (count <= 0) {
    result = kEmptyList;
    return result;
  }

  Summary summary;
  if (!proc([&] { summary.heading = Heading(list->Item(1), aBeginDate); })) return result;
  for (std::int32_t i = 1; i <= count; ++i) {
    // A consignment that cannot be read is left out whole (or the report
    // ends), never half added.
    Summary row;
    if (!proc([&] {
          row.rows.clear();
          row.packs = row.weight = row.volume = 0;
          AddConsignment(row, list->Item(i));
        }))
      return result;
    if (row.rows.empty()) continue;
    summary.rows.push_back(std::move(row.rows.front()));
    summary.packs += row.packs;
    summary.weight += row.weight;
    summary.volume += row.volume;
  }
  summary.rows.push_back({"TOTAL", "", "", "", "", NumberText(summary.packs),
                          NumberText(summary.weight), NumberText(summary.volume)});

  std::string printer;
  if (!proc([&] { printer = system_->DocumentPrinter().Text(); })) return result;
  // 1 prints without asking anyone; 0 and 2 keep the document for the user
  // to see; any other option leaves the document's own default (printing).
  std::optional<bool> keep;
  if (aReportOption == 1) keep = false;
  if (aReportOption == 0 || aReportOption == 2) keep = true;
  bool produced = false;
  if (!proc([&] { produced = Draw(summary, printer, keep, aHTMLFileName, kept_); })) return result;
  if (!produced) {
    proc([&] {
      WriteLog(0, "ConsolidatedManifestPrint",
               std::string(kTitle) + " could not be " +
                   (keep.value_or(false) ? std::string("kept") : "printed on \"" + printer + "\"") +
                   (aHTMLFileName.empty() ? std::string() : " or written to " + aHTMLFileName) + ".");
    });
    return result;
  }
  result = kProduced;
  return result;
}

bool ConsolidatedManifestRows::PrintTodaysSummary() {
  const std::string today = Format(Var(Today()), "Short Date");
  const std::string vendor = Read(vendor_, &host::Vendor::VendorCode).Text();
  const std::string carrier = Read(carrier_, &host::Carrier::CarrierCode).Text();
  const std::int16_t result = ConsolidatedManifestPrint(today, today, vendor, carrier, 1, "");
  // The driver signs the summary at pickup: a run that ends without one says so.
  if (result == kNoList || result == kEmptyList)
    WriteLog(0, "Term",
             std::string(kTitle) + ": the host found no consignments of vendor \"" + vendor +
                 "\" and carrier \"" + carrier + "\" for " + today + "; nothing was printed.");
  return result != kNotProduced;
}

ConsignmentFileRows::ConsignmentFileRows(std::string_view className,
                                         std::span<const GridColumn> columns,
                                         std::size_t rowColumns, SummarySource source,
                                         bool manifestRun)
    : ConsolidatedManifestRows(className, columns, rowColumns, source), manifestRun_(manifestRun) {}

Ref<host::ConNotes> ConsignmentFileRows::QueryConNotes() {
  return manifestRun_ ? ManifestConNotes() : TodaysConNotes();
}

void ConsignmentFileRows::FillRow(Grid& rows, std::size_t row, const Ref<host::ConNote>& conNote) {
  if (manifestRun_)
    FillManifestRow(rows, row, conNote);
  else
    RowWriter::FillRow(rows, row, conNote);
}

bool ConsignmentFileRows::OpenRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                                  Ref<host::PackList>& packs, Ref<host::ASN>& asn) {
  if (!proc([&] {
        LogLine(0, "Process",
                "ConNote " + conNote->ConNoteNo().Text() + ". ActiveX called " + ClassName());
      }))
    return false;
  return proc([&] {
    packs = conNote->Packs();
    asn = host::Read(host::First(packs), &host::Pack::ASN);
  });
}

}  // namespace quendal
