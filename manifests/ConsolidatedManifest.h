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

// A manifest run (the consignments awaiting a manifest, whose grid also
// shows their shipped and scheduled dates) or an end-of-day run (today's
// consignments) that writes each chosen consignment to a carrier file.
class ConsignmentFileRows : public ConsolidatedManifestRows {
 protected:
  ConsignmentFileRows(std::string_view className, std::span<const GridColumn> columns,
                      std::size_t rowColumns, SummarySource source, bool manifestRun);

  Ref<host::ConNotes> QueryConNotes() override;
  void FillRow(Grid& rows, std::size_t row, const Ref<host::ConNote>& conNote) override;
  // The first steps of a row: logs the call, and takes the consignment's own
  // packs and the notice of the first, which stand in for what the despatch
  // step hands a despatch class.
  bool OpenRow(Procedure& proc, const Ref<host::ConNote>& conNote, Ref<host::PackList>& packs,
               Ref<host::ASN>& asn);

  const bool manifestRun_;
};

}  // namespace quendal
