// The frame of the row classes: manifest and end-of-day runs that list
// consignments as grid rows and write the rows the operator picks.
//
//   Init(System, EDIDocId, Columns)  the EDI document and what it names
//   Load(a_sFileName, a_vtRows)       the consignments as grid rows
//   Process(a_lRowNum, vtErrorLog)    one chosen row
//   Term()                            the run's closing work
//
// A row class says which consignments it lists, what its grid shows, what
// it does per row and at the end; the frame does the rest once for all.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "frame/ComponentBase.h"

namespace quendal {

// One column of the host's grid: caption, alignment code, width in the grid's units.
struct GridColumn {
  std::string_view caption;
  int alignment;
  int width;
};

// The grid most runs show: number, partner, delivery location, order and
// the row's result.
inline constexpr std::array<GridColumn, 5> kConsignmentColumns = {{
    {"ConNote No", 0, 1500},
    {"Partner", 2, 1000},
    {"Delivery Locn", 0, 2000},
    {"Order No", 0, 2600},
    {"Result", 0, 3000},
}};

class RowWriter : public virtual RowInterface, public Lifecycle {
 public:
  bool Init(const Ref<host::System>& system, std::int16_t EDIDocId, Grid& Columns) override;
  std::int32_t Load(const std::string& a_sFileName, Grid& a_vtRows) override;
  std::int32_t Process(std::int32_t a_lRowNum, LogList& vtErrorLog) override;
  bool Term() override;

 protected:
  // `columns` is the grid's column table; `rowColumns` the width of the row table.
  RowWriter(std::string_view className, std::span<const GridColumn> columns,
            std::size_t rowColumns);

  // The consignments the run lists (Nothing or empty: none).
  virtual Ref<host::ConNotes> QueryConNotes() = 0;
  // Fills row `row` of the row table for the consignment. The default shows
  // number, partner, delivery location and service; the other cells stay empty text.
  virtual void FillRow(Grid& rows, std::size_t row, const Ref<host::ConNote>& conNote);
  // The work of one chosen row, as further steps of the Process procedure;
  // returns the row's result (the consignment's id, 0 when the row failed).
  virtual std::int32_t ProcessRow(Procedure& proc, const Ref<host::ConNote>& conNote,
                                  LogList& vtErrorLog) = 0;
  // The closing work, as steps of the Term procedure; false when a step left it.
  virtual bool TermWork(Procedure& proc);

  // The consignments awaiting a manifest for the document's vendor and carrier.
  Ref<host::ConNotes> ManifestConNotes();
  // Today's consignments (today up to, not including, tomorrow) of the document's vendor and
  // carrier.
  Ref<host::ConNotes> TodaysConNotes();
  // Gives the run's manifest record its vendor, carrier and date and saves
  // it, once per object; true when the record has an id.
  bool SaveManifestRecord();

  std::size_t RowCount() const { return conNotes_.size(); }

  // The consignment's id as a row's result; 0 when the 32-bit result
  // cannot hold it, as that is no id the host could look up.
  static std::int32_t ConNoteIdResult(const Ref<host::ConNote>& conNote);

  Ref<host::EDIDocument> ediDocument_;
  Ref<host::Vendor> vendor_;
  Ref<host::Partner> partner_;
  Ref<host::Carrier> carrier_;
  Ref<host::Manifest> manifest_;
  std::string fileName_;

 private:
  std::span<const GridColumn> columns_;
  std::size_t rowColumns_;
  // The loaded consignments in row order; row i is conNotes_[i].
  std::vector<Ref<host::ConNote>> conNotes_;
};

}  // namespace quendal
