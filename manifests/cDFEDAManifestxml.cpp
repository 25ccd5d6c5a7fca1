#include "manifests/cDFEDAManifestxml.h"

#include "manifests/DangerousGoodsDeclaration.h"

namespace quendal {

namespace {

// Consignments without packs are written too; cartons and pallets each get
// their own carton line.
constexpr DfeVariant kManifestRun{.refusePackless = false, .linePerGroup = true};

constexpr std::size_t kRowColumns = 7;

}  // namespace

clsDFEDAManifestxml::clsDFEDAManifestxml()
    : ConsolidatedManifestRows("clsDFEDAManifestxml", kManifestColumns, kRowColumns,
                               SummarySource::OwnManifest),
      DfeWriter(kManifestRun, *this, ModuleName()) {}

bool clsDFEDAManifestxml::DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) {
  return PrintDangerousGoodsDeclaration(DeclarationForm::StarTrack, system_, aConnote,
                                        ModuleName());
}

std::int32_t clsDFEDAManifestxml::ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                                             LogList&) {
  std::int32_t result = 0;
  if (!ManifestSaved(proc, "Failed to create mainifest ID")) return result;
  std::string folder;
  if (!proc([&] { folder = ediDocument_->OutputFolder().Text(); })) return result;
  // A consignment counts as manifested once its elements are in the file.
  const bool written = Write(proc, conNote, folder, [&] {
    return proc([&] {
      conNote->SetManifestId(manifest_->ManifestId());
      conNote->Update(Var(8));
    });
  });
  if (!written) return result;
  proc([&] { result = ConNoteIdResult(conNote); });
  return result;
}

// Only a run that created a manifest has a summary to print.
bool clsDFEDAManifestxml::TermWork(Procedure& proc) {
  bool created = false;
  if (!proc([&] { created = manifest_ && manifest_->ManifestId().NumberOr(0) != 0; })) return false;
  if (!created) return true;
  bool printed = false;
  if (!proc([&] { printed = PrintTodaysSummary(); })) return false;
  return printed;
}

std::unique_ptr<Component> MakeDFEDAManifestxml() {
  return std::make_unique<clsDFEDAManifestxml>();
}

}  // namespace quendal
