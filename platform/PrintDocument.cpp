#include "platform/PrintDocument.h"

namespace quendal {

std::vector<TableColumn> ParseTableFormat(std::string_view format) {
  std::vector<TableColumn> columns;
  for (const std::string& entry : TableCells(format)) {
    std::string_view rest(entry);
    TableColumn column;
    if (rest.starts_with('<')) {
      rest.remove_prefix(1);
    } else if (rest.starts_with('^')) {
      column.align = TableColumn::Align::Centre;
      rest.remove_prefix(1);
    }
    if (rest.starts_with('+')) rest.remove_prefix(1);
    int width = 0;
    bool digits = !rest.empty();
    for (char c : rest) {
      if (c < '0' || c > '9' || width > 1000000) {
        digits = false;
        break;
      }
      width = width * 10 + (c - '0');
    }
    if (!digits) continue;
    column.width = width;
    columns.push_back(column);
  }
  return columns;
}

TableRow TableCells(std::string_view text) {
  TableRow cells;
  std::size_t start = 0;
  for (;;) {
    const std::size_t bar = text.find('|', start);
    cells.emplace_back(text.substr(start, bar == std::string_view::npos ? bar : bar - start));
    if (bar == std::string_view::npos) break;
    start = bar + 1;
  }
  return cells;
}

}  // namespace quendal
