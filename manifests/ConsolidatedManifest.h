// The consolidated manifest, "Consignment Summary Print": one landscape
// document listing the consignments of a manifest run or of a date range,
// with each consignment's packs, weight and volume, their totals, the
// dangerous goods warranty and the sender and driver signature block that
// the carrier's driver signs at pickup.
//
// A row class that prints it derives from ConsolidatedManifestRows and
// names where its consignments come from; Term prints today's summary.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "manifests/RowWriter.h"

namespace quendal {

// Where a class's summary takes its consignments from.
enum class SummarySource {
  OwnManifest,  // the consignments of the class's own manifest record
  DateRange,    // the host's consignments of the dates, vendor and carrier asked for
};

class ConsolidatedManifestRows : public RowWriter, public virtual ConsolidatedManifestInterface {
 public:
  std::int16_t ConsolidatedManifestPrint(const std::string& aBeginDate, const std::string& aEndDate,
                                         const std::string& aVendorId,
                                         const std::string& aCarrierId, std::int16_t aReportOption,
                                         const std::string& aHTMLFileName) override;
  std::string ConsolidatedManifestFile() const override { return kept_; }

 protected:
  ConsolidatedManifestRows(std::string_view className, std::span<const GridColumn> columns,
                           std::size_t rowColumns, SummarySource source);

  // Prints the summary of today's consignments of the run's vendor and
  // carrier on the document printer; false when it could not be printed.
  bool PrintTodaysSummary();

 private:
  Ref<host::ConNotes> SummaryConNotes(const std::string& aBeginDate, const std::string& aEndDate,
                                      const std::string& aVendorId, const std::string& aCarrierId);

  SummarySource source_;
  std::string kept_;
};

}  // namespace quendal
