// DFE's manifest run: the consignments awaiting a manifest, each written to
// the day's DFE despatch advice in the EDI document's output folder (its
// cartons and its pallets on carton lines of their own) and stamped with
// the run's manifest record, created on the first row. Term prints the
// manifest's consignment summary when the run created one.
#pragma once

#include <memory>

#include "carrierfiles/DfeWriter.h"
#include "manifests/ConsolidatedManifest.h"

namespace quendal {

class clsDFEDAManifestxml : public ConsolidatedManifestRows,
                            public DfeWriter,
                            private DfeWriter::Owner {
 public:
  clsDFEDAManifestxml();

  // Prints the consignment's dangerous goods declarations (StarTrack's
  // form) on the System's document printer; false when one could not be printed.
  bool DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) override;

 protected:
  Ref<host::ConNotes> QueryConNotes() override { return ManifestConNotes(); }
  void FillRow(Grid& rows, std::size_t row, const Ref<host::ConNote>& conNote) override {
    FillManifestRow(rows, row, conNote);
  }
  std::int32_t ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                          LogList& vtErrorLog) override;
  bool TermWork(Procedure& proc) override;
  // Its messages carry their error number as their level, as the despatch class's do.
  long LogLevel(long errorNumber) const override { return errorNumber; }

 private:
  void LogLine(long errorNumber, std::string_view procedure, std::string_view message) override {
    RowWriter::LogLine(errorNumber, procedure, message);
  }
};

std::unique_ptr<Component> MakeDFEDAManifestxml();

}  // namespace quendal
