#include "manifests/cAaEES610.h"

#include <array>
#include <unordered_set>

#include "frame/host/Read.h"

namespace quendal {

using host::Read;

namespace {

constexpr std::array<GridColumn, 5> kColumns = {{
    {"ConNote No", 0, 1500},
    {"SSCC", 0, 2400},
    {"Delivery Locn", 0, 2000},
    {"Pack", 2, 800},
    {"Result", 0, 3000},
}};

// One file per account and day.
constexpr LayoutVariant kVariant{
    .className = "clsAaEES610",
    .prefix = "ES610_",
    .accountInName = true,
    .stampMask = "YYYYMMDD",
    .extension = ".TXT",
    .reuseTodaysFile = false,
    .serviceTable = std::nullopt,
    .writesTrailer = true,
};

}  // namespace

clsAaEES610::clsAaEES610() : RowWriter(kVariant.className, kColumns, 5), writer_(kVariant, *this) {}

void clsAaEES610::LogLine(long errorNumber, std::string_view procedure, std::string_view message) {
  RowWriter::LogLine(errorNumber, procedure, message);
}

std::int32_t clsAaEES610::Load(const std::string& a_sFileName, Grid& a_vtRows) {
  std::int32_t result = 0;
  Procedure proc = Guard("Function Load");
  Ref<host::ConNotes> found;
  std::int32_t count = 0;
  if (!proc([&] {
        fileName_ = a_sFileName;
        rows_.clear();
        a_vtRows = Grid();
        found = QueryConNotes();
        count = found ? found->Count() : 0;
      }))
    return result;
  // A consignment listed twice by the host gives its packs once, so no
  // pack can be written twice into one run.
  std::unordered_set<std::string> keys;
  for (std::int32_t i = 1; i <= count; ++i) {
    if (!proc([&] {
          const Ref<host::ConNote> conNote = found->Item(i);
          const std::string key = conNote->ConNoteId().Text();
          if (!key.empty() && !keys.insert(key).second) return;
          const Ref<host::PackList> packs = conNote->Packs();
          const std::int32_t packCount = packs ? packs->Count() : 0;
          for (std::int32_t p = 1; p <= packCount; ++p) rows_.push_back({conNote, p});
        }))
      return result;
  }
  if (!proc([&] {
        if (!rows_.empty()) return true;
        WriteLog(0, "Load", "No Packs found to process.");
        return false;
      }))
    return result;
  if (!proc([&] {
        Grid rows(rows_.size(), kColumns.size());
        for (std::size_t r = 0; r < rows_.size(); ++r) {
          const PackRow& row = rows_[r];
          const Ref<host::PackList> packs = row.conNote->Packs();
          rows(r, 0) = row.conNote->ConNoteNo();
          rows(r, 1) = Read(packs->Item(row.packNo), &host::Pack::SSCC);
          rows(r, 2) = row.conNote->DeliveryLocation();
          rows(r, 3) = Var(std::to_string(row.packNo) + " of " + std::to_string(packs->Count()));
          rows(r, 4) = Var("");
        }
        a_vtRows = std::move(rows);
      }))
    return result;
  result = static_cast<std::int32_t>(rows_.size());
  return result;
}

std::int32_t clsAaEES610::Process(std::int32_t a_lRowNum, LogList& vtErrorLog) {
  std::int32_t result = 0;
  Procedure proc = Guard("Function Process");
  const RowLog rowLog(*this, vtErrorLog);
  struct Done {
    clsAaEES610& self;
    ~Done() { self.writer_.Close(); }
  } done{*this};
  PackRow row;
  if (!proc([&] {
        // A row the host did not get from Load names no pack: say so and
        // leave the other rows alone.
        if (a_lRowNum < 0 || static_cast<std::size_t>(a_lRowNum) >= rows_.size()) {
          LogLine(0, "Process",
                  "Row " + std::to_string(a_lRowNum) + " is not one of the " +
                      std::to_string(rows_.size()) + " loaded rows.");
          return false;
        }
        row = rows_[static_cast<std::size_t>(a_lRowNum)];
        return true;
      }))
    return result;
  LayoutConsignment consignment;
  if (!proc([&] {
        LogLine(0, "Process",
                "ConNote " + row.conNote->ConNoteNo().Text() + ". ActiveX called " + ClassName());
        consignment.conNote = row.conNote;
        consignment.packs = row.conNote->Packs();
        consignment.asn = Read(consignment.packs->Item(row.packNo), &host::Pack::ASN);
        consignment.folder = Read(row.conNote->Carrier(), &host::Carrier::FileFolder).Text();
        consignment.onlyPack = row.packNo;
      }))
    return result;
  if (!writer_.Write(proc, consignment)) return result;
  proc([&] { result = ConNoteIdResult(row.conNote); });
  return result;
}

std::unique_ptr<Component> MakeAaEES610() { return std::make_unique<clsAaEES610>(); }

}  // namespace quendal
