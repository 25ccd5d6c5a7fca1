// libFuzzer target: any layout file must read without crashing, looping or
// reading out of bounds; a refused one is placed at a line and column of
// the text and said in a short printable message; an accepted one renders
// every record, whatever its values hold, as one line without line breaks,
// and a delimited record reads back as one value per field.
#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include "carrierfiles/Layout.h"
#include "tests/fuzz/FuzzInput.h"

using quendal::fuzz::Check;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  // The layout file, and a value (by default with delimiters, quotes and a
  // line break) handed to every computed text value.
  const auto [bytes, value] = quendal::fuzz::SplitInput(data, size, "a,\"b\"\t;|\r\n");

  const quendal::LayoutRead read = quendal::ReadLayout(bytes);
  if (!read.layout) {
    const std::size_t lines = static_cast<std::size_t>(std::count(bytes.begin(), bytes.end(), '\n') +
                                                       std::count(bytes.begin(), bytes.end(), '\r'));
    Check(read.problem.line >= 1 && static_cast<std::size_t>(read.problem.line) <= lines + 1);
    Check(read.problem.column >= 1 && static_cast<std::size_t>(read.problem.column) <= bytes.size() + 3);
    Check(!read.problem.message.empty() && read.problem.message.size() < 300);
    for (const char c : read.problem.message) Check(c >= 0x20 && c < 0x7F);
    return 0;
  }
  const quendal::Layout& layout = *read.layout;
  Check(!layout.records.empty());
  quendal::LayoutValues values;
  values.serviceCode = value;
  values.fileName = value;
  values.manifestNumber = quendal::Var(value);
  values.packCount = 3;
  values.totalWeight = 12.5;
  for (const quendal::LayoutRecord& record : layout.records) {
    const std::string line = quendal::RenderRecord(layout, record, values, nullptr, 2);
    Check(line.find_first_of("\r\n") == std::string::npos);
    // A record without fields is an empty line, which has no columns.
    if (record.fields.empty())
      Check(line.empty());
    else if (layout.delimited)
      Check(quendal::fuzz::DelimitedValues(line, layout.delimiter).size() == record.fields.size());
  }
  return 0;
}
