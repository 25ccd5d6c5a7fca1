// The StarTrack manifest and end-of-day runs: the consignments a run lists
// are written row by row to StarTrack's CLN file with the same consignment
// procedure as the despatch class, and Term prints the consolidated
// manifest. The two runs differ only by the points of StarTrackRowsVariant.
#pragma once

#include <cstddef>
#include <span>
#include <string_view>

#include "carrierfiles/ClnWriter.h"
#include "manifests/ConsolidatedManifest.h"

namespace quendal {

struct StarTrackRowsVariant {
  std::string_view className;
  // Lists the consignments awaiting a manifest, creates the run's manifest
  // record on the first row, names the file after its number, stamps each
  // written consignment with it, shows the shipped and scheduled dates and
  // sums up the manifest's consignments. Otherwise the run lists today's
  // consignments and sums up the day's.
  bool manifestRun;
  std::span<const GridColumn> columns;
  std::size_t rowColumns;
  ClnVariant cln;
};

class StarTrackClnRows : public ConsolidatedManifestRows, private ClnWriter::Owner {
 public:
  // Prints nothing.
  bool DGDeclaration();
  // Prints the consignment's dangerous goods declaration on the System's
  // document printer; false when it could not be printed.
  bool DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) override;

 protected:
  explicit StarTrackClnRows(const StarTrackRowsVariant& variant);

  Ref<host::ConNotes> QueryConNotes() override;
  void FillRow(Grid& rows, std::size_t row, const Ref<host::ConNote>& conNote) override;
  std::int32_t ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                          LogList& vtErrorLog) override;
  bool TermWork(Procedure& proc) override;
  void CloseOpenFile() override { cln_.Close(); }
  // The CLN messages carry their error number as their level, as the despatch class's do.
  long LogLevel(long errorNumber) const override { return errorNumber; }

 private:
  void LogLine(long errorNumber, std::string_view procedure, std::string_view message) override;

  const StarTrackRowsVariant& variant_;
  ClnWriter cln_;
  // The caller's list while a row runs: it keeps what it held and gets each
  // entry's id as the entry is written, as the despatch class's does.
  LogList* errorLog_ = nullptr;
};

}  // namespace quendal
