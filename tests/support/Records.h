// Pieces of expected fixed-width records: a text padded to its field, and spaces.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace quendal::test {

inline std::string Pad(std::string_view text, std::size_t width) {
  std::string out(text);
  if (out.size() < width) out.append(width - out.size(), ' ');
  return out;
}

inline std::string Sp(std::size_t n) { return std::string(n, ' '); }

// The lines of a carrier file, each without its CR LF ending.
inline std::vector<std::string> CrLfLines(std::string_view bytes) {
  std::vector<std::string> lines;
  std::size_t start = 0;
  while (start < bytes.size()) {
    const std::size_t end = bytes.find("\r\n", start);
    if (end == std::string_view::npos) {
      lines.emplace_back(bytes.substr(start));
      break;
    }
    lines.emplace_back(bytes.substr(start, end - start));
    start = end + 2;
  }
  return lines;
}

}  // namespace quendal::test
