// The Ipec 1250 manifest and end-of-day runs: the consignments a run lists
// are written row by row to Ipec's 1250 file with the layout procedure of
// the despatch class, and both offer the consolidated manifest. The two
// runs differ by the points of Ipec1250RowsVariant and by their layouts.
#pragma once

#include <cstddef>
#include <span>
#include <string_view>

#include "carrierfiles/LayoutWriter.h"
#include "manifests/ConsolidatedManifest.h"

namespace quendal {

struct Ipec1250RowsVariant {
  // Lists the consignments awaiting a manifest, creates the run's manifest
  // record on the first row, writes to the EDI document's output folder,
  // stamps each written consignment with the manifest and shows the shipped
  // and scheduled dates. Otherwise the run lists today's consignments,
  // writes to the carrier's folder and prints the day's summary at Term.
  bool manifestRun;
  std::span<const GridColumn> columns;
  std::size_t rowColumns;
  LayoutVariant layout;
};

class Ipec1250Rows : public ConsignmentFileRows, private LayoutWriter::Owner {
 protected:
  explicit Ipec1250Rows(const Ipec1250RowsVariant& variant);

  std::int32_t ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                          LogList& vtErrorLog) override;
  bool TermWork(Procedure& proc) override;
  void CloseOpenFile() override { writer_.Close(); }
  // The file's messages carry their error number as their level, as the despatch class's do.
  long LogLevel(long errorNumber) const override { return errorNumber; }

 private:
  void LogLine(long errorNumber, std::string_view procedure, std::string_view message) override;

  const Ipec1250RowsVariant& variant_;
  LayoutWriter writer_;
};

}  // namespace quendal
