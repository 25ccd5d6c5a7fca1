#include "manifests/StarTrackClnRows.h"

#include "frame/host/Read.h"
#include "manifests/DangerousGoodsDeclaration.h"

namespace quendal {

StarTrackClnRows::StarTrackClnRows(const StarTrackRowsVariant& variant)
    : ConsolidatedManifestRows(variant.className, variant.columns, variant.rowColumns,
                               variant.manifestRun ? SummarySource::OwnManifest
                                                   : SummarySource::DateRange),
      variant_(variant),
      cln_(variant.cln, *this) {}

bool StarTrackClnRows::DGDeclaration() { return false; }

bool StarTrackClnRows::DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) {
  return PrintDangerousGoodsDeclaration(DeclarationForm::StarTrack, system_, aConnote,
                                        ModuleName());
}

Ref<host::ConNotes> StarTrackClnRows::QueryConNotes() {
  return variant_.manifestRun ? ManifestConNotes() : TodaysConNotes();
}

void StarTrackClnRows::FillRow(Grid& rows, std::size_t row, const Ref<host::ConNote>& conNote) {
  RowWriter::FillRow(rows, row, conNote);
  if (!variant_.manifestRun) return;
  rows(row, 4) = conNote->ConNoteDate();
  rows(row, 5) = conNote->ScheduledDate();
}

void StarTrackClnRows::LogLine(long errorNumber, std::string_view procedure,
                               std::string_view message) {
  WriteLog(errorNumber, procedure, message);
  if (errorLog_) errorLog_->push_back(LastLogId());
}

std::int32_t StarTrackClnRows::ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                                          LogList& vtErrorLog) {
  std::int32_t result = 0;
  errorLog_ = &vtErrorLog;
  struct Done {
    StarTrackClnRows& self;
    ~Done() {
      self.errorLog_ = nullptr;
      self.cln_.Close();
    }
  } done{*this};

  ClnConsignment consignment;
  if (!proc([&] {
        consignment.conNote = conNote;
        LogLine(0, "Process",
                "ConNote " + conNote->ConNoteNo().Text() + ". ActiveX called " + ClassName());
      }))
    return result;
  // The consignment's own packs and the notice of the first stand in for
  // what the despatch step hands the despatch class.
  if (!proc([&] {
        consignment.packs = conNote->Packs();
        consignment.asn = host::Read(host::First(consignment.packs), &host::Pack::ASN);
      }))
    return result;
  if (variant_.manifestRun) {
    bool saved = false;
    if (!proc([&] { saved = SaveManifestRecord(); })) return result;
    if (!proc([&] {
          if (saved) return true;
          LogLine(0, "Process", "Failed to create manifest ID");
          return false;
        }))
      return result;
    if (!proc([&] { consignment.manifestNumber = manifest_->ManifestNumber(); })) return result;
  }
  // A consignment counts as manifested once its records are in the file.
  const bool written = cln_.Write(proc, consignment, [&] {
    if (!variant_.manifestRun) return true;
    return proc([&] { conNote->SetManifestId(manifest_->ManifestId()); });
  });
  if (!written) return result;
  proc([&] { result = ConNoteIdResult(conNote); });
  return result;
}

bool StarTrackClnRows::TermWork(Procedure& proc) {
  bool printed = false;
  if (!proc([&] { printed = PrintTodaysSummary(); })) return false;
  return printed;
}

}  // namespace quendal
