// Pieces of expected fixed-width records: a text padded to its field, and spaces.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace quendal::test {

inline std::string Pad(std::string_view text, std::size_t width) {
  std::string out(text);
  if (out.size() < width) out.append(width - out.size(), ' ');
  return out;
}

inline std::string Sp(std::size_t n) { return std::string(n, ' '); }

}  // namespace quendal::test
