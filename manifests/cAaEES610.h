// AaE's ES610 manifest: a row run over today's packs for the EDI
// document's carrier, one grid row per pack; each chosen row adds that
// pack's line to the day's ES610 file in the carrier's folder, laid out by
// clsAaEES610.layout.
#pragma once

#include <memory>
#include <vector>

#include "carrierfiles/LayoutWriter.h"
#include "manifests/RowWriter.h"

namespace quendal {

class clsAaEES610 : public RowWriter, private LayoutWriter::Owner {
 public:
  clsAaEES610();

  std::int32_t Load(const std::string& a_sFileName, Grid& a_vtRows) override;
  std::int32_t Process(std::int32_t a_lRowNum, LogList& vtErrorLog) override;

 protected:
  Ref<host::ConNotes> QueryConNotes() override { return TodaysConNotes(); }
  // Rows are packs: Process does the work of a row itself.
  std::int32_t ProcessRow(Procedure&, const Ref<host::ConNote>&, LogList&) override { return 0; }
  void CloseOpenFile() override { writer_.Close(); }
  long LogLevel(long errorNumber) const override { return errorNumber; }

 private:
  void LogLine(long errorNumber, std::string_view procedure, std::string_view message) override;

  // A row: the consignment and the position of the pack in it.
  struct PackRow {
    Ref<host::ConNote> conNote;
    std::int32_t packNo = 0;
  };
  std::vector<PackRow> rows_;
  LayoutWriter writer_;
};

std::unique_ptr<Component> MakeAaEES610();

}  // namespace quendal
