#include "frame/VB.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cctype>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <vector>

#include "frame/Error.h"

namespace quendal {

namespace {

bool IsContinuation(char c) { return (static_cast<unsigned char>(c) & 0xC0) == 0x80; }

// Byte offset of the n-th character (0-based); text.size() when past the end.
std::size_t ByteOffset(std::string_view text, long n) {
  std::size_t i = 0;
  for (long c = 0; c < n && i < text.size(); ++c) {
    ++i;
    while (i < text.size() && IsContinuation(text[i])) ++i;
  }
  return i;
}

template <class Change>
std::string ChangeCase(std::string_view text, Change change) {
  std::string out(text);
  for (std::size_t i = 0; i < out.size(); ++i) {
    const auto c = static_cast<unsigned char>(out[i]);
    if (c < 0x80) {
      out[i] = static_cast<char>(change(c, false));
    } else if (c == 0xC3 && i + 1 < out.size()) {
      // Latin-1 letters U+00C0..U+00FE are C3 80..C3 BE; lower = upper + 0x20.
      out[i + 1] = static_cast<char>(change(static_cast<unsigned char>(out[i + 1]), true));
      ++i;
    }
  }
  return out;
}

constexpr std::array<std::string_view, 12> kMonths = {
    "January", "February", "March",     "April",   "May",      "June",
    "July",    "August",   "September", "October", "November", "December"};
constexpr std::array<std::string_view, 7> kWeekdays = {
    "Sunday", "Monday", "Tuesday", "Wednesday", "Thursday", "Friday", "Saturday"};

char Lower(char c) { return static_cast<char>(std::tolower(static_cast<unsigned char>(c))); }

bool IsDateLetter(char c) {
  const char l = Lower(c);
  return l == 'd' || l == 'm' || l == 'y' || l == 'h' || l == 'n' || l == 's';
}

void AppendTwoDigits(std::string& out, int v) {
  if (v >= 0 && v < 100) {
    out += static_cast<char>('0' + v / 10);
    out += static_cast<char>('0' + v % 10);
    return;
  }
  char buf[16];
  std::snprintf(buf, sizeof buf, "%02d", v);
  out += buf;
}

// The end of the run of mask characters starting at `i`: a run of one date
// letter (any case), or of literal text.
std::size_t RunEnd(std::string_view mask, std::size_t i) {
  std::size_t j = i;
  if (IsDateLetter(mask[i])) {
    const char l = Lower(mask[i]);
    while (j < mask.size() && Lower(mask[j]) == l) ++j;
  } else {
    while (j < mask.size() && !IsDateLetter(mask[j])) ++j;
  }
  return j;
}

std::string FormatDate(const DateTime& d, std::string_view mask) {
  if (mask == "Short Date") mask = "dd/mm/yyyy";
  if (mask == "Long Date") mask = "dddd, d mmmm yyyy";
  std::string out;
  out.reserve(mask.size() + 16);
  char previous = 0;  // previous date letter
  for (std::size_t i = 0; i < mask.size();) {
    const std::size_t end = RunEnd(mask, i);
    if (!IsDateLetter(mask[i])) {
      out += mask.substr(i, end - i);
      i = end;
      continue;
    }
    const char letter = Lower(mask[i]);
    const std::size_t count = end - i;
    char next = 0;  // the next date letter
    for (std::size_t j = end; j < mask.size(); ++j)
      if (IsDateLetter(mask[j])) {
        next = Lower(mask[j]);
        break;
      }
    switch (letter) {
      case 'd':
        if (count == 1) out += std::to_string(d.Day());
        else if (count == 2) AppendTwoDigits(out, d.Day());
        else if (count == 3) out += kWeekdays[d.Weekday()].substr(0, 3);
        else out += kWeekdays[d.Weekday()];
        break;
      case 'm':
        if (count <= 2 && (previous == 'h' || next == 's')) {
          if (count == 1) out += std::to_string(d.Minute());
          else AppendTwoDigits(out, d.Minute());
        } else if (count == 1) {
          out += std::to_string(d.Month());
        } else if (count == 2) {
          AppendTwoDigits(out, d.Month());
        } else if (count == 3) {
          out += kMonths[d.Month() - 1].substr(0, 3);
        } else {
          out += kMonths[d.Month() - 1];
        }
        break;
      case 'y':
        if (count <= 2) AppendTwoDigits(out, d.Year() % 100);
        else out += std::to_string(d.Year());
        break;
      case 'h':
        if (count == 1) out += std::to_string(d.Hour());
        else AppendTwoDigits(out, d.Hour());
        break;
      case 'n':
        if (count == 1) out += std::to_string(d.Minute());
        else AppendTwoDigits(out, d.Minute());
        break;
      case 's':
        if (count == 1) out += std::to_string(d.Second());
        else AppendTwoDigits(out, d.Second());
        break;
    }
    previous = letter;
    i = end;
  }
  return out;
}

// Decimal digits of |value| rounded half away from zero to `decimals`
// places, worked on the 15-significant-digit text of the value so that
// 1234.567 and 2.675 round as they read.
std::string RoundedDigits(double value, int decimals, std::string& intPart) {
  char buf[64];
  std::snprintf(buf, sizeof buf, "%.14e", std::fabs(value));
  // buf: d.dddddddddddddde[+-]XX
  std::string digits;
  digits += buf[0];
  digits.append(buf + 2, 14);
  const int exponent = std::atoi(buf + 17);
  // Digit string with the decimal point after position (exponent + 1).
  int pointAt = exponent + 1;
  if (pointAt <= 0) {
    digits.insert(0, static_cast<std::size_t>(-pointAt + 1), '0');
    pointAt = 1;
  }
  while (static_cast<int>(digits.size()) < pointAt + decimals + 1) digits += '0';
  const std::size_t keep = static_cast<std::size_t>(pointAt + decimals);
  const bool up = digits[keep] >= '5';
  digits.resize(keep);
  if (up) {
    int i = static_cast<int>(keep) - 1;
    for (; i >= 0; --i) {
      if (digits[static_cast<std::size_t>(i)] == '9') {
        digits[static_cast<std::size_t>(i)] = '0';
      } else {
        ++digits[static_cast<std::size_t>(i)];
        break;
      }
    }
    if (i < 0) {
      digits.insert(0, "1");
      ++pointAt;
    }
  }
  intPart = digits.substr(0, static_cast<std::size_t>(pointAt));
  const std::size_t nz = intPart.find_first_not_of('0');
  intPart = nz == std::string::npos ? "" : intPart.substr(nz);
  return digits.substr(static_cast<std::size_t>(pointAt));
}

std::string FormatNumber(double value, std::string_view mask) {
  const std::size_t point = mask.find('.');
  // A whole number under a mask without decimals: its digits, padded with
  // zeros to the mask's count of "0", as the general path below gives them.
  if (point == std::string_view::npos && std::fabs(value) < 1e15 && value == std::trunc(value)) {
    const std::size_t minInt = static_cast<std::size_t>(std::count(mask.begin(), mask.end(), '0'));
    char digits[24];
    const auto whole = static_cast<long long>(std::fabs(value));
    char* end = whole == 0 ? digits : std::to_chars(digits, digits + sizeof digits, whole).ptr;
    const std::size_t length = static_cast<std::size_t>(end - digits);
    std::string out;
    out.reserve(minInt + length + 1);
    if (value < 0) out += '-';
    if (length < minInt) out.append(minInt - length, '0');
    out.append(digits, end);
    return out;
  }
  const std::string_view intMask = mask.substr(0, point);
  const std::string_view fracMask =
      point == std::string_view::npos ? std::string_view{} : mask.substr(point + 1);
  std::size_t minInt = 0;
  for (char c : intMask)
    if (c == '0') ++minInt;
  std::size_t minFrac = 0;
  for (char c : fracMask)
    if (c == '0') ++minFrac;
  std::string intPart;
  std::string frac = RoundedDigits(value, static_cast<int>(fracMask.size()), intPart);
  while (frac.size() > minFrac && frac.back() == '0') frac.pop_back();
  if (intPart.size() < minInt) intPart.insert(0, minInt - intPart.size(), '0');
  const bool zero = intPart.find_first_not_of('0') == std::string::npos &&
                    frac.find_first_not_of('0') == std::string::npos;
  std::string out = (value < 0 && !zero) ? "-" : "";
  out += intPart;
  if (point != std::string_view::npos && (!frac.empty() || fracMask.empty())) out += "." + frac;
  return out;
}

std::string FormatText(const std::string& text, std::string_view mask) {
  const bool left = !mask.empty() && mask.front() == '!';
  long width = 0;
  for (char c : mask)
    if (c == '@') ++width;
  const long len = Len(text);
  if (len >= width) return text;
  return left ? text + Spaces(width - len) : Spaces(width - len) + text;
}

enum class MaskKind { Text, Date, Number, Other };

MaskKind KindOf(std::string_view mask) {
  if (mask.find('@') != std::string_view::npos) return MaskKind::Text;
  if (mask == "Short Date" || mask == "Long Date") return MaskKind::Date;
  if (mask.find_first_of("0#") != std::string_view::npos) return MaskKind::Number;
  for (char c : mask)
    if (IsDateLetter(c)) return MaskKind::Date;
  return MaskKind::Other;
}

}  // namespace

std::string Left(std::string_view text, long n) {
  if (n <= 0) return {};
  return std::string(text.substr(0, ByteOffset(text, n)));
}

std::string Right(std::string_view text, long n) {
  const long len = Len(text);
  if (n >= len) return std::string(text);
  if (n <= 0) return {};
  return std::string(text.substr(ByteOffset(text, len - n)));
}

std::string Mid(std::string_view text, long start, long length) {
  if (start < 1) throw Error(err::kInvalidCall);
  const std::size_t from = ByteOffset(text, start - 1);
  if (length < 0) return std::string(text.substr(from));
  const std::string_view rest = text.substr(from);
  return std::string(rest.substr(0, ByteOffset(rest, length)));
}

long Len(std::string_view text) {
  long n = 0;
  for (char c : text)
    if (!IsContinuation(c)) ++n;
  return n;
}

std::string LTrim(std::string_view text) {
  const std::size_t b = text.find_first_not_of(' ');
  return b == std::string_view::npos ? std::string() : std::string(text.substr(b));
}

std::string RTrim(std::string_view text) {
  const std::size_t e = text.find_last_not_of(' ');
  return e == std::string_view::npos ? std::string() : std::string(text.substr(0, e + 1));
}

std::string Trim(std::string_view text) { return LTrim(RTrim(text)); }

std::string UCase(std::string_view text) {
  return ChangeCase(text, [](unsigned char c, bool latin1) -> unsigned char {
    if (!latin1) return static_cast<unsigned char>(std::toupper(c));
    return (c >= 0xA0 && c <= 0xBE && c != 0xB7) ? static_cast<unsigned char>(c - 0x20) : c;
  });
}

std::string LCase(std::string_view text) {
  return ChangeCase(text, [](unsigned char c, bool latin1) -> unsigned char {
    if (!latin1) return static_cast<unsigned char>(std::tolower(c));
    return (c >= 0x80 && c <= 0x9E && c != 0x97) ? static_cast<unsigned char>(c + 0x20) : c;
  });
}

long InStr(std::string_view text, std::string_view what) {
  const std::size_t at = text.find(what);
  return at == std::string_view::npos ? 0 : Len(text.substr(0, at)) + 1;
}

std::string Replace(std::string_view text, std::string_view what, std::string_view with) {
  if (what.empty()) return std::string(text);
  std::string out;
  std::size_t from = 0;
  for (std::size_t at; (at = text.find(what, from)) != std::string_view::npos; from = at + what.size()) {
    out += text.substr(from, at - from);
    out += with;
  }
  out += text.substr(from);
  return out;
}

std::string Spaces(long n) { return n > 0 ? std::string(static_cast<std::size_t>(n), ' ') : ""; }

std::string NumberText(double value) {
  if (value == 0.0) return "0";
  if (!std::isfinite(value)) return std::isnan(value) ? "NaN" : (value > 0 ? "INF" : "-INF");
  char buf[64];
  std::snprintf(buf, sizeof buf, "%.15G", value);
  std::string s = buf;
  // %G already drops trailing zeros; exponents are written with at least two digits, as here.
  return s;
}

std::int64_t RoundHalfEven(double value) {
  const double r = std::nearbyint(value);  // default rounding mode: to nearest, ties to even
  return static_cast<std::int64_t>(r);
}

double Round(double value, int digits) {
  const double scale = std::pow(10.0, digits);
  return std::nearbyint(value * scale) / scale;
}

bool IsNumericText(std::string_view text) {
  std::size_t i = 0;
  const std::size_t n = text.size();
  while (i < n && text[i] == ' ') ++i;
  if (i < n && (text[i] == '+' || text[i] == '-')) ++i;
  std::size_t digits = 0;
  while (i < n && std::isdigit(static_cast<unsigned char>(text[i]))) ++i, ++digits;
  if (i < n && text[i] == '.') {
    ++i;
    while (i < n && std::isdigit(static_cast<unsigned char>(text[i]))) ++i, ++digits;
  }
  if (digits == 0) return false;
  if (i < n && (text[i] == 'e' || text[i] == 'E')) {
    ++i;
    if (i < n && (text[i] == '+' || text[i] == '-')) ++i;
    std::size_t expDigits = 0;
    while (i < n && std::isdigit(static_cast<unsigned char>(text[i]))) ++i, ++expDigits;
    if (expDigits == 0) return false;
  }
  while (i < n && text[i] == ' ') ++i;
  return i == n;
}

bool TextToFlag(std::string_view text) {
  const std::string t = LCase(Trim(text));
  if (t == "true") return true;
  if (t == "false") return false;
  if (IsNumericText(t)) return std::strtod(t.c_str(), nullptr) != 0.0;
  throw Error(err::kTypeMismatch);
}

std::string Format(const Var& value, std::string_view mask) {
  if (value.IsNull()) return {};
  if (mask.empty()) return value.Text();
  switch (KindOf(mask)) {
    case MaskKind::Text:
      return FormatText(value.Text(), mask);
    case MaskKind::Date: {
      if (value.IsDate()) return FormatDate(value.Date(), mask);
      if (value.IsText()) {
        try {
          return FormatDate(value.Date(), mask);
        } catch (const Error&) {
          return value.Text();
        }
      }
      if (value.IsNumeric()) return FormatDate(value.Date(), mask);
      return value.Text();
    }
    case MaskKind::Number:
      if (value.IsDate() || !value.IsNumeric()) return value.Text();
      return FormatNumber(value.Number(), mask);
    case MaskKind::Other:
      break;
  }
  return std::string(mask);
}

}  // namespace quendal
