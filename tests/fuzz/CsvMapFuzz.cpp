// libFuzzer target: any map file must read without crashing, looping or
// reading out of bounds; every column must name a catalogue field or none;
// what the reader says about the file must be a short printable text; and a
// line laid out from the map must read back as one value per column,
// whatever the value holds (a line break in it is written as a space).
#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include "carrierfiles/CsvMap.h"
#include "tests/fuzz/FuzzInput.h"

using quendal::fuzz::Check;

namespace {

constexpr std::array<std::string_view, 6> kCatalogue = {
    "CONSIGNMENTNOTENO", "CONTAINERNO", "PACKWEIGHT", "RECEIVERNAME", "SHIPNOTESTATUS", "A"};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  // The map file, and a value (by default with a comma, quotes and a line
  // break) written in every column that names a field.
  const auto [bytes, value] = quendal::fuzz::SplitInput(data, size, "a,\"b\"\r\n");

  const quendal::CsvMap map = quendal::ReadCsvMap(bytes, kCatalogue);
  for (const std::ptrdiff_t column : map.columns)
    Check(column == quendal::kNoField ||
          (column >= 0 && static_cast<std::size_t>(column) < kCatalogue.size()));
  Check(map.notes.size() <= 11);
  for (const std::string& note : map.notes) {
    Check(note.size() < 200);
    for (const char c : note) Check(c >= 0x20 && c < 0x7F);
  }

  if (map.columns.empty()) return 0;
  std::string line;
  for (std::size_t i = 0; i < map.columns.size(); ++i) {
    if (i > 0) line += ',';
    quendal::AppendCsvValue(line, map.columns[i] == quendal::kNoField ? std::string_view() : value);
  }
  std::string written(value);
  std::replace_if(written.begin(), written.end(), [](char c) { return c == '\r' || c == '\n'; }, ' ');
  const std::vector<std::string> values = quendal::fuzz::DelimitedValues(line, ',');
  Check(values.size() == map.columns.size());
  for (std::size_t i = 0; i < values.size(); ++i)
    Check(values[i] == (map.columns[i] == quendal::kNoField ? std::string() : written));
  return 0;
}
