#include "manifests/StarTrackClnRows.h"

#include "frame/host/Read.h"
#include "manifests/DangerousGoodsDeclaration.h"

namespace quendal {

StarTrackClnRows::StarTrackClnRows(const StarTrackRowsVariant& variant)
    : ConsignmentFileRows(variant.className, variant.columns, variant.rowColumns,
                          variant.manifestRun ? SummarySource::OwnManifest : SummarySource::DateRange,
                          variant.manifestRun),
      variant_(variant),
      cln_(variant.cln, *this) {}

bool StarTrackClnRows::DGDeclaration() { return false; }

bool StarTrackClnRows::DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) {
  return PrintDangerousGoodsDeclaration(DeclarationForm::StarTrack, system_, aConnote,
                                        ModuleName());
}

std::int32_t StarTrackClnRows::ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                                          LogList&) {
  std::int32_t result = 0;
  struct Done {
    ClnWriter& cln;
    ~Done() { cln.Close(); }
  } done{cln_};

  ClnConsignment consignment;
  consignment.conNote = conNote;
  if (!OpenRow(proc, conNote, consignment.packs, consignment.asn)) return result;
  if (variant_.manifestRun) {
    if (!ManifestSaved(proc, "Failed to create manifest ID")) return result;
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
