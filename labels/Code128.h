// Code 128 symbol tables: the element widths of the 107 symbols, their
// module strings, and the values of characters in code sets A and B.
// Shared by the encoder and its tests; everything here is built at compile
// time.
#pragma once

#include <array>
#include <cstdint>
#include <string_view>

namespace quendal::code128 {

// Symbol values with a meaning of their own.
inline constexpr int kCodeC = 99;
inline constexpr int kCodeB = 100;  // in sets A and C
inline constexpr int kCodeA = 101;  // in sets B and C
inline constexpr int kFnc1 = 102;
inline constexpr int kStartA = 103;
inline constexpr int kStartB = 104;
inline constexpr int kStartC = 105;
inline constexpr int kStop = 106;
inline constexpr int kSymbolCount = 107;

// The group separator stands for FNC1 in the data.
inline constexpr unsigned char kGroupSeparator = 29;

// Element widths of each symbol, bar first: six elements of 11 modules, the
// stop symbol seven of 13 (its last bar is the termination bar).
inline constexpr std::array<std::string_view, kSymbolCount> kWidths = {
    "212222", "222122", "222221", "121223", "121322", "131222", "122213", "122312", "132212",
    "221213", "221312", "231212", "112232", "122132", "122231", "113222", "123122", "123221",
    "223211", "221132", "221231", "213212", "223112", "312131", "311222", "321122", "321221",
    "312212", "322112", "322211", "212123", "212321", "232121", "111323", "131123", "131321",
    "112313", "132113", "132311", "211313", "231113", "231311", "112133", "112331", "132131",
    "113123", "113321", "133121", "313121", "211331", "231131", "213113", "213311", "213131",
    "311123", "311321", "331121", "312113", "312311", "332111", "314111", "221411", "431111",
    "111224", "111422", "121124", "121421", "141122", "141221", "112214", "112412", "122114",
    "122411", "142112", "142211", "241211", "221114", "413111", "241112", "134111", "111242",
    "121142", "121241", "114212", "124112", "124211", "411212", "421112", "421211", "212141",
    "214121", "412121", "111143", "111341", "131141", "114113", "114311", "411113", "411311",
    "113141", "114131", "311141", "411131", "211412", "211214", "211232", "2331112"};

namespace detail {
constexpr int Sum(std::string_view widths, std::size_t first, std::size_t step) {
  int sum = 0;
  for (std::size_t i = first; i < widths.size(); i += step) sum += widths[i] - '0';
  return sum;
}
constexpr bool WellFormed() {
  for (int v = 0; v < kSymbolCount; ++v) {
    const std::string_view w = kWidths[static_cast<std::size_t>(v)];
    const bool stop = v == kStop;
    if (w.size() != (stop ? 7u : 6u)) return false;
    if (Sum(w, 0, 1) != (stop ? 13 : 11)) return false;
    // Bars of every symbol add up to an even number of modules (the
    // symbology's own parity check).
    if (Sum(w, 0, 2) % 2 != 0) return false;
  }
  return true;
}
}  // namespace detail
static_assert(detail::WellFormed(), "Code 128 width table");
static_assert(kWidths[kStartB] == "211214" && kWidths[kStop] == "2331112");

inline constexpr int kSymbolModules = 11;
inline constexpr int kStopModules = 13;

// The module string of every symbol ('1' bar, '0' space), as the widths
// alternate from a bar.
inline constexpr auto kModules = [] {
  std::array<std::array<char, kStopModules>, kSymbolCount> modules{};
  for (int v = 0; v < kSymbolCount; ++v) {
    std::size_t at = 0;
    char module = '1';
    for (char width : kWidths[static_cast<std::size_t>(v)]) {
      for (int i = 0; i < width - '0'; ++i) modules[static_cast<std::size_t>(v)][at++] = module;
      module = module == '1' ? '0' : '1';
    }
  }
  return modules;
}();
static_assert(std::string_view(kModules[kStartB].data(), kSymbolModules) == "11010010000");

// Value of a character in code set A: codes 32-95 give 0-63, codes 0-31
// give 64-95, the group separator gives FNC1; -1 where set A has none.
inline constexpr auto kSetA = [] {
  std::array<std::int8_t, 256> values{};
  values.fill(-1);
  for (int c = 0; c < 32; ++c) values[static_cast<std::size_t>(c)] = static_cast<std::int8_t>(c + 64);
  for (int c = 32; c < 96; ++c) values[static_cast<std::size_t>(c)] = static_cast<std::int8_t>(c - 32);
  values[kGroupSeparator] = kFnc1;
  return values;
}();
// Value of a character in code set B: codes 32-127 give 0-95, the group
// separator gives FNC1; -1 where set B has none.
inline constexpr auto kSetB = [] {
  std::array<std::int8_t, 256> values{};
  values.fill(-1);
  for (int c = 32; c < 128; ++c) values[static_cast<std::size_t>(c)] = static_cast<std::int8_t>(c - 32);
  values[kGroupSeparator] = kFnc1;
  return values;
}();
static_assert(kSetA.size() == 256 && kSetB.size() == 256);
static_assert(kSetA['A'] == 33 && kSetA['\n'] == 74 && kSetA['a'] == -1 && kSetA[200] == -1);
static_assert(kSetB['a'] == 65 && kSetB[127] == 95 && kSetB['\n'] == -1 && kSetB[29] == kFnc1);

constexpr int CodeSetAValue(unsigned char c) { return kSetA[c]; }
constexpr int CodeSetBValue(unsigned char c) { return kSetB[c]; }

}  // namespace quendal::code128
