// The map file of a map-driven despatch advice, and the comma-separated
// line it lays out. A map file names, one per line, the fields to write and
// their column order. Sites edit map files by hand, so the reader takes LF,
// CR LF or CR line ends, a byte-order mark (UTF-8, or UTF-16 as Notepad
// saves "Unicode"), spaces and tabs around a name, names in any case, blank
// lines and lines of any length, and says what it made of each line that
// names no field. Such a line keeps its column, written empty, so the
// columns after it stay where the site put them; blank lines after the last
// name are an editor's leftovers and add no column.
#pragma once

#include <cstddef>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace quendal {

// A map file larger than this is refused rather than read: a real one is a
// few hundred bytes.
inline constexpr std::size_t kMapFileLimit = 64 * 1024;
// A line longer than this (after trimming) can't be a field name.
inline constexpr std::size_t kMapNameLimit = 64;

inline constexpr std::ptrdiff_t kNoField = -1;

struct CsvMap {
  // One entry per column: the index of the field it names in the
  // catalogue, or kNoField for a column written empty.
  std::vector<std::ptrdiff_t> columns;
  // What a site should hear about the lines that name no field, each a
  // phrase that follows the map file's name ("line 4 is blank; ...").
  std::vector<std::string> notes;
};

// Lays out the map file's bytes against the catalogue's field names
// (upper case). An unknown name is noted once however often it appears.
CsvMap ReadCsvMap(std::string_view bytes, std::span<const std::string_view> catalogue);

// The bytes of a hand-edited file as single-byte text: a UTF-8 byte-order
// mark is dropped, and UTF-16 (marked by its byte-order mark) becomes ASCII
// with "?" for anything else, which no name in such a file holds.
std::string DecodeHandEdited(std::string_view bytes);

// Lines ended by CR LF, LF or CR; the last line counts without an ending.
std::vector<std::string_view> SplitLines(std::string_view text);

// A text as a log line may show it: printable ASCII (others become "?"), at
// most 40 characters followed by "..." when longer.
std::string ShownText(std::string_view text);

// Appends one value to a delimited line: as it stands, or in double quotes
// with each quote doubled when it holds the delimiter or a double quote, so
// that it stays one column. Line breaks become spaces: a record is one line.
void AppendCsvValue(std::string& line, std::string_view value, char delimiter = ',');

}  // namespace quendal
