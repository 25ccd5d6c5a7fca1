#include "manifests/RowWriter.h"

#include <cstdint>
#include <unordered_set>

#include "platform/Clock.h"

namespace quendal {

RowWriter::RowWriter(std::string_view className, std::span<const GridColumn> columns,
                     std::size_t rowColumns)
    : Lifecycle(className), columns_(columns), rowColumns_(rowColumns) {}

bool RowWriter::Init(const Ref<host::System>& system, std::int16_t EDIDocId, Grid& Columns) {
  bool result = false;
  Procedure proc = Guard("Function Init");
  if (!proc([&] {
        processAll_ = true;
        system_ = system;
      }))
    return result;
  if (!proc([&] {
        ediDocument_ = host::CurrentLibrary().NewEDIDocument();
        ediDocument_->SetID(EDIDocId);
        ediDocument_->Load();
      }))
    return result;
  if (!proc([&] {
        vendor_ = host::CurrentLibrary().NewVendor();
        vendor_->SetVendorId(ediDocument_->VendorId());
        vendor_->Load();
      }))
    return result;
  if (!proc([&] {
        partner_ = host::CurrentLibrary().NewPartner();
        partner_->SetPartnerId(ediDocument_->PartnerId());
        partner_->Load();
      }))
    return result;
  if (!proc([&] {
        carrier_ = host::CurrentLibrary().NewCarrier();
        carrier_->SetCarrierId(ediDocument_->CarrierId());
        carrier_->Load();
      }))
    return result;
  if (!proc([&] { manifest_ = host::CurrentLibrary().NewManifest(); })) return result;
  if (!proc([&] {
        Columns.Resize(columns_.size(), 3);
        for (std::size_t c = 0; c < columns_.size(); ++c) {
          Columns(c, 0) = Var(columns_[c].caption);
          Columns(c, 1) = Var(columns_[c].alignment);
          Columns(c, 2) = Var(columns_[c].width);
        }
      }))
    return result;
  result = true;
  return result;
}

std::int32_t RowWriter::Load(const std::string& a_sFileName, Grid& a_vtRows) {
  std::int32_t result = 0;
  Procedure proc = Guard("Function Load");
  Ref<host::ConNotes> found;
  std::int32_t count = 0;
  if (!proc([&] {
        fileName_ = a_sFileName;
        conNotes_.clear();
        a_vtRows = Grid();
      }))
    return result;
  if (!proc([&] {
        found = QueryConNotes();
        if (found) count = found->Count();
      }))
    return result;
  if (!proc([&] {
        if (count > 0) return true;
        WriteLog(0, "Load", "No Consignments found to process.");
        return false;
      }))
    return result;

  Grid rows(static_cast<std::size_t>(count), rowColumns_);
  // A consignment listed twice by the host keeps its first row only, so it
  // cannot be written twice into one run.
  std::unordered_set<std::string> keys;
  for (std::int32_t i = 1; i <= count; ++i) {
    if (!proc([&] {
          Ref<host::ConNote> conNote = found->Item(i);
          const std::string key = conNote->ConNoteId().Text();
          if (!key.empty() && keys.contains(key)) return true;
          // The row counts once it is filled, so a retried row is not added twice.
          FillRow(rows, conNotes_.size(), conNote);
          conNotes_.push_back(conNote);
          if (!key.empty()) keys.insert(key);
          return true;
        }))
      return result;
  }
  if (!proc([&] {
        if (conNotes_.size() == rows.Rows()) {
          a_vtRows = std::move(rows);
          return;
        }
        a_vtRows.Resize(conNotes_.size(), rowColumns_);
        for (std::size_t r = 0; r < conNotes_.size(); ++r)
          for (std::size_t c = 0; c < rowColumns_; ++c) a_vtRows(r, c) = rows(r, c);
      }))
    return result;
  result = static_cast<std::int32_t>(conNotes_.size());
  return result;
}

void RowWriter::FillRow(Grid& rows, std::size_t row, const Ref<host::ConNote>& conNote) {
  rows(row, 0) = conNote->ConNoteNo();
  rows(row, 1) = conNote->PartnerCode();
  rows(row, 2) = conNote->DeliveryLocation();
  rows(row, 3) = Var(conNote->Service().Text() + "-" + conNote->ServiceLevel().Text());
  for (std::size_t c = 4; c < columns_.size() && c < rowColumns_; ++c) rows(row, c) = Var("");
}

std::int32_t RowWriter::Process(std::int32_t a_lRowNum, LogList& vtErrorLog) {
  std::int32_t result = 0;
  Procedure proc = Guard("Function Process");
  Ref<host::ConNote> conNote;
  if (!proc([&] {
        // A row the host did not get from Load names no consignment: say so
        // and leave the other rows alone.
        if (a_lRowNum < 0 || static_cast<std::size_t>(a_lRowNum) >= conNotes_.size()) {
          WriteLog(0, "Process",
                   "Row " + std::to_string(a_lRowNum) + " is not one of the " +
                       std::to_string(conNotes_.size()) + " loaded rows.");
          vtErrorLog.push_back(LastLogId());
          return false;
        }
        conNote = conNotes_[static_cast<std::size_t>(a_lRowNum)];
        return true;
      }))
    return result;
  result = ProcessRow(proc, conNote, vtErrorLog);
  return result;
}

bool RowWriter::Term() {
  bool result = false;
  Procedure proc = Guard("Function Term");
  if (!TermWork(proc)) return result;
  result = true;
  return result;
}

bool RowWriter::TermWork(Procedure&) { return true; }

Ref<host::ConNotes> RowWriter::ManifestConNotes() {
  return system_->GetManifestConNotes(ediDocument_->VendorId(), ediDocument_->CarrierId());
}

Ref<host::ConNotes> RowWriter::TodaysConNotes() {
  const DateTime today = Today();
  return system_->GetConNotesByDate(Var(today), Var(today.AddDays(1)), ediDocument_->VendorId(),
                                    ediDocument_->CarrierId());
}

std::int32_t RowWriter::ConNoteIdResult(const Ref<host::ConNote>& conNote) {
  const double id = conNote->ConNoteId().NumberOr(0);
  return id >= INT32_MIN && id <= INT32_MAX ? static_cast<std::int32_t>(id) : 0;
}

bool RowWriter::SaveManifestRecord() {
  if (manifest_->ManifestId().NumberOr(0) != 0) return true;
  manifest_->SetVendorId(ediDocument_->VendorId());
  manifest_->SetCarrierId(ediDocument_->CarrierId());
  manifest_->SetManifestDate(Var(Now()));
  if (!manifest_->Save()) return false;
  // A save that hands back no id has not made a record consignments can point to.
  return manifest_->ManifestId().NumberOr(0) != 0;
}

}  // namespace quendal
