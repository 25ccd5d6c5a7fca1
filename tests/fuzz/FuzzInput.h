// What the fuzz targets share: a check that aborts, so that libFuzzer keeps
// the input that broke it; an input split into a file and a value; and a
// delimited line read back into its values.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

namespace quendal::fuzz {

// Names the failed check's line, so a crash input found by a long run says
// which promise it broke.
// (The builtins, not std::source_location, which this clang lacks with libstdc++ 12.)
inline void Check(bool condition, const char* file = __builtin_FILE(), int line = __builtin_LINE()) {
  if (condition) return;
  std::fprintf(stderr, "check failed at %s:%d\n", file, line);
  std::abort();
}

// A file and a value taken from one input: its first byte gives the length
// of the value at the input's end (0: `fallback`), the bytes between are the file.
struct FileAndValue {
  std::string_view file;
  std::string value;
};
inline FileAndValue SplitInput(const std::uint8_t* data, std::size_t size,
                               std::string_view fallback) {
  const std::string_view input(reinterpret_cast<const char*>(data) + 1, size - 1);
  const std::size_t length = std::min<std::size_t>(data[0] % 17, input.size());
  return {input.substr(0, input.size() - length),
          length == 0 ? std::string(fallback) : std::string(input.substr(input.size() - length))};
}

// The values of a delimited line: double quotes that open a value group it,
// and a doubled quote inside them stands for one; a tab always separates.
inline std::vector<std::string> DelimitedValues(std::string_view line, char delimiter) {
  std::vector<std::string> values(1);
  bool quoted = false;
  for (std::size_t i = 0; i < line.size(); ++i) {
    const char c = line[i];
    if (delimiter != '\t' && quoted && c == '"' && i + 1 < line.size() && line[i + 1] == '"') {
      values.back() += '"';
      ++i;
    } else if (delimiter != '\t' && c == '"' && (quoted || values.back().empty())) {
      quoted = !quoted;
    } else if (c == delimiter && !quoted) {
      values.emplace_back();
    } else {
      values.back() += c;
    }
  }
  Check(!quoted);
  return values;
}

}  // namespace quendal::fuzz
