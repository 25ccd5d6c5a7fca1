// The three kinds of work, written only against the family interfaces, so
// that they run every class of a family: labels, one consignment, a row run.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "cli/Cli.h"
#include "frame/Component.h"

namespace quendal::cli {

struct LabelRun {
  bool init = false;
  std::vector<std::pair<std::int64_t, bool>> labels;  // pack id, PrintLabel's result
};

// Init once with the printer, then PrintLabel per pack.
LabelRun PrintLabels(LabelInterface& labels, const Ref<host::System>& system,
                     const std::string& printer, const std::vector<Ref<host::Pack>>& packs,
                     std::optional<std::int16_t> qty);

// Process(System, ConNote, ASN of its first pack, its packs); the log ids it handed back.
LogList Despatch(ConsignmentInterface& consignment, const Ref<host::System>& system,
                 const Ref<host::ConNote>& conNote);

struct RowRun {
  bool init = false;
  Grid columns;
  std::int32_t loaded = 0;
  Grid rows;
  std::vector<std::pair<std::int32_t, std::int32_t>> processed;  // row, Process's result
  bool term = false;
  LogList vtErrorLog;
};

// Rows done of the rows to do, after each Process.
using Progress = std::function<void(std::size_t done, std::size_t total)>;

// Init, Load, Process of the chosen rows (0-based; all when none are given), Term.
// UsageError for a row the load did not return (before any row is processed).
RowRun RunRows(RowInterface& rows, const Ref<host::System>& system, std::int16_t ediDocId,
               const std::optional<std::vector<std::int32_t>>& chosen,
               const Progress& progress = {});

// Shows a run's progress on a terminal: "rows done of rows" on one line
// that is rewritten in place, about a hundred times a run.
Progress TerminalProgress(std::ostream& out);

json GridJson(const Grid& grid);
void PrintGrid(std::ostream& out, const Grid& columns, const Grid& rows);

}  // namespace quendal::cli
