#include "cli/Work.h"

#include <algorithm>
#include <ostream>

namespace quendal::cli {

LabelRun PrintLabels(LabelInterface& labels, const Ref<host::System>& system,
                     const std::string& printer, const std::vector<Ref<host::Pack>>& packs,
                     std::optional<std::int16_t> qty) {
  LabelRun run;
  run.init = labels.Init(system, printer);
  for (const auto& pack : packs)
    run.labels.emplace_back(pack->PackId().Whole(), labels.PrintLabel(pack, qty));
  return run;
}

LogList Despatch(ConsignmentInterface& consignment, const Ref<host::System>& system,
                 const Ref<host::ConNote>& conNote) {
  Ref<host::PackList> packs = conNote->Packs();
  Ref<host::ASN> asn = packs->Count() > 0 ? packs->Item(1)->ASN() : Ref<host::ASN>();
  LogList vtErrorLog;
  consignment.Process(system, conNote, asn, packs, vtErrorLog);
  return vtErrorLog;
}

RowRun RunRows(RowInterface& rows, const Ref<host::System>& system, std::int16_t ediDocId,
               const std::optional<std::vector<std::int32_t>>& chosen, const Progress& progress) {
  RowRun run;
  run.init = rows.Init(system, ediDocId, run.columns);
  run.loaded = rows.Load({}, run.rows);
  std::vector<std::int32_t> which;
  if (chosen) {
    for (auto row : *chosen)
      if (row < 0 || static_cast<std::size_t>(row) >= run.rows.Rows())
        throw UsageError("row " + std::to_string(row) + " is not among the " +
                         std::to_string(run.rows.Rows()) + " rows loaded (rows count from 0)");
    which = *chosen;
  } else {
    for (std::size_t i = 0; i < run.rows.Rows(); ++i) which.push_back(static_cast<std::int32_t>(i));
  }
  for (auto row : which) {
    run.processed.emplace_back(row, rows.Process(row, run.vtErrorLog));
    if (progress) progress(run.processed.size(), which.size());
  }
  run.term = rows.Term();
  return run;
}

Progress TerminalProgress(std::ostream& out) {
  return [&out](std::size_t done, std::size_t total) {
    const std::size_t step = std::max<std::size_t>(total / 100, 1);
    if (done % step != 0 && done != total) return;
    out << "\rProcess: " << done << " of " << total << " rows" << (done == total ? "\n" : "")
        << std::flush;
  };
}

json GridJson(const Grid& grid) {
  json table = json::array();
  for (std::size_t r = 0; r < grid.Rows(); ++r) {
    json row = json::array();
    for (std::size_t c = 0; c < grid.Columns(); ++c) row.push_back(VarJson(grid(r, c)));
    table.push_back(row);
  }
  return table;
}

void PrintGrid(std::ostream& out, const Grid& columns, const Grid& rows) {
  // Column definitions are one per grid column, the caption first.
  std::vector<std::string> header{"Row"};
  for (std::size_t c = 0; c < rows.Columns(); ++c)
    header.push_back(c < columns.Rows() && columns.Columns() > 0 ? VarText(columns(c, 0))
                                                                 : "Column " + std::to_string(c));
  std::vector<std::vector<std::string>> lines;
  for (std::size_t r = 0; r < rows.Rows(); ++r) {
    std::vector<std::string> line{std::to_string(r)};
    for (std::size_t c = 0; c < rows.Columns(); ++c) line.push_back(VarText(rows(r, c)));
    lines.push_back(std::move(line));
  }
  PrintTable(out, header, lines);
}

}  // namespace quendal::cli
