#include "labels/WinPrint.h"

#include <cstring>

#include "frame/FailSafe.h"
#include "frame/VB.h"
#include "labels/Code128.h"

namespace quendal {

namespace {

constexpr std::string_view kModule = "mWinPrint";
constexpr std::string_view kFnc1Marker = "~201";

bool IsDigit(unsigned char c) { return c >= '0' && c <= '9'; }

// Writes symbols as modules into a buffer sized for the worst case and
// keeps the weighted checksum of everything after the start symbol.
class SymbolWriter {
 public:
  SymbolWriter(std::string& out, int start) : out_(out), at_(out.data()), checksum_(start) {
    Put(start);
  }
  void Emit(int value) {
    ++weight_;
    checksum_ = (checksum_ + weight_ % 103 * value) % 103;
    Put(value);
  }
  void Finish() {
    Put(static_cast<int>(checksum_ % 103));
    std::memcpy(at_, code128::kModules[code128::kStop].data(), code128::kStopModules);
    at_ += code128::kStopModules;
    out_.resize(static_cast<std::size_t>(at_ - out_.data()));
  }

 private:
  void Put(int value) {
    std::memcpy(at_, code128::kModules[static_cast<std::size_t>(value)].data(),
                code128::kSymbolModules);
    at_ += code128::kSymbolModules;
  }
  std::string& out_;
  char* at_;
  long weight_ = 0;
  long checksum_;
};

std::string Encode(std::string_view data) {
  using namespace code128;
  const std::size_t n = data.size();
  // Every character gives at most a code-set switch and a value.
  std::string out((2 * n + 2) * kSymbolModules + kStopModules, '\0');
  const bool hasFnc1 = data.find(kFnc1Marker) != std::string_view::npos ||
                       data.find(static_cast<char>(kGroupSeparator)) != std::string_view::npos;
  bool fourDigits = n >= 4;
  for (std::size_t i = 0; fourDigits && i < 4; ++i) fourDigits = IsDigit(data[i]);

  if (!hasFnc1 && !fourDigits) {
    SymbolWriter writer(out, kStartB);
    for (unsigned char c : data)
      if (const int value = CodeSetBValue(c); value >= 0) writer.Emit(value);
    writer.Finish();
    return out;
  }

  enum class Set { A, B, C };
  Set set = Set::C;
  SymbolWriter writer(out, kStartC);
  for (std::size_t i = 0; i < n;) {
    unsigned char c = static_cast<unsigned char>(data[i]);
    std::size_t width = 1;
    if (c == '~' && data.substr(i, 4) == kFnc1Marker) {
      c = kGroupSeparator;
      width = 4;
    }
    if (set == Set::C && IsDigit(c) && width == 1 && i + 1 < n &&
        IsDigit(static_cast<unsigned char>(data[i + 1]))) {
      writer.Emit((c - '0') * 10 + (data[i + 1] - '0'));
      i += 2;
      continue;
    }
    if (set == Set::C && c == kGroupSeparator) {
      writer.Emit(kFnc1);
    } else if (const int a = CodeSetAValue(c); a >= 0) {
      if (set != Set::A) writer.Emit(kCodeA);
      set = Set::A;
      writer.Emit(a);
    } else if (const int b = CodeSetBValue(c); b >= 0) {
      if (set != Set::B) writer.Emit(kCodeB);
      set = Set::B;
      writer.Emit(b);
    }
    i += width;
  }
  writer.Finish();
  return out;
}

}  // namespace

std::string BarPattern(std::string_view data) {
  std::string result;
  Procedure proc(kModule, "Function BarPattern");
  proc([&] { result = Encode(data); });
  return result;
}

std::string ConvertPattern(std::string_view widths) {
  std::string result;
  Procedure proc(kModule, "Function ConvertPattern");
  proc([&] {
    std::string modules;
    modules.reserve(widths.size() * 2);
    char module = '1';
    for (unsigned char width : widths) {
      if (!IsDigit(width)) continue;
      modules.append(static_cast<std::size_t>(width - '0'), module);
      module = module == '1' ? '0' : '1';
    }
    result = std::move(modules);
  });
  return result;
}

std::string GetBars(int index) {
  if (index < 1 || index > code128::kSymbolCount) return {};
  return std::string(code128::kWidths[static_cast<std::size_t>(index - 1)]);
}

std::string CreateArticleID(std::string_view articleId, std::string_view suffix) {
  std::string digits;
  const std::string prefix = Left(articleId, 3);
  for (unsigned char c : prefix)
    digits += (c >= '0' && c <= '9') ? static_cast<char>(c) : static_cast<char>('0' + c % 10);
  digits += Mid(articleId, 4);
  digits += suffix;
  int odd = 0;
  int even = 0;
  int position = 1;  // from the right
  for (auto it = digits.rbegin(); it != digits.rend(); ++it, ++position) {
    const int value = (*it >= '0' && *it <= '9') ? *it - '0' : 0;
    (position % 2 ? odd : even) += value;
  }
  const int r = (odd * 3 + even) % 10;
  const char check = static_cast<char>('0' + (r == 0 ? 0 : 10 - r));
  return std::string(articleId) + std::string(suffix) + check;
}

std::string CreateBarcode(std::string_view articleId, std::string_view suffix) {
  return CreateArticleID(articleId, suffix);
}

std::string RemoveInvalidChar(std::string_view text) { return Replace(text, "\"", ""); }

}  // namespace quendal
