#include "frame/Var.h"

#include <charconv>
#include <cmath>
#include <cstdio>

#include "frame/Error.h"
#include "frame/VB.h"
#include "frame/host/Host.h"

namespace quendal {

namespace {

constexpr std::int64_t kSecondsPerDay = 86400;

// Days since 1970-01-01 of a civil date (proleptic Gregorian).
std::int64_t DaysFromCivil(std::int64_t y, unsigned m, unsigned d) {
  y -= m <= 2;
  const std::int64_t era = (y >= 0 ? y : y - 399) / 400;
  const unsigned yoe = static_cast<unsigned>(y - era * 400);
  const unsigned doy = (153 * (m + (m > 2 ? -3 : 9)) + 2) / 5 + d - 1;
  const unsigned doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
  return era * 146097 + static_cast<std::int64_t>(doe) - 719468;
}

struct Civil {
  int year;
  int month;
  int day;
};

Civil CivilFromDays(std::int64_t z) {
  z += 719468;
  const std::int64_t era = (z >= 0 ? z : z - 146096) / 146097;
  const unsigned doe = static_cast<unsigned>(z - era * 146097);
  const unsigned yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
  const std::int64_t y = static_cast<std::int64_t>(yoe) + era * 400;
  const unsigned doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
  const unsigned mp = (5 * doy + 2) / 153;
  const unsigned d = doy - (153 * mp + 2) / 5 + 1;
  const unsigned m = mp < 10 ? mp + 3 : mp - 9;
  return {static_cast<int>(y + (m <= 2)), static_cast<int>(m), static_cast<int>(d)};
}

std::int64_t FloorDiv(std::int64_t a, std::int64_t b) {
  std::int64_t q = a / b;
  if ((a % b != 0) && ((a < 0) != (b < 0))) --q;
  return q;
}

bool ReadInt(std::string_view text, std::size_t pos, std::size_t len, int& out) {
  if (pos + len > text.size()) return false;
  int value = 0;
  for (std::size_t i = pos; i < pos + len; ++i) {
    if (text[i] < '0' || text[i] > '9') return false;
    value = value * 10 + (text[i] - '0');
  }
  out = value;
  return true;
}

bool ValidParts(int y, int mo, int d, int h, int mi, int s) {
  if (y < 1 || y > 9999 || mo < 1 || mo > 12 || d < 1 || h > 23 || mi > 59 || s > 59) return false;
  static constexpr int kDays[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  const bool leap = (y % 4 == 0 && y % 100 != 0) || y % 400 == 0;
  return d <= kDays[mo - 1] + (mo == 2 && leap ? 1 : 0);
}

// "dd/mm/yyyy[ hh:mm:ss]" (the host's short date) or "yyyy/mm/dd[ ...]".
std::optional<DateTime> ParseSlashed(std::string_view t) {
  int y = 0, mo = 0, d = 0, h = 0, mi = 0, s = 0;
  std::size_t timeAt = 0;
  if (t.size() >= 10 && t[2] == '/' && t[5] == '/' && ReadInt(t, 0, 2, d) && ReadInt(t, 3, 2, mo) &&
      ReadInt(t, 6, 4, y)) {
    timeAt = 10;
  } else if (t.size() >= 10 && t[4] == '/' && t[7] == '/' && ReadInt(t, 0, 4, y) &&
             ReadInt(t, 5, 2, mo) && ReadInt(t, 8, 2, d)) {
    timeAt = 10;
  } else {
    return std::nullopt;
  }
  if (t.size() > timeAt) {
    if (t.size() != timeAt + 9 || t[timeAt] != ' ' || t[timeAt + 3] != ':' || t[timeAt + 6] != ':' ||
        !ReadInt(t, timeAt + 1, 2, h) || !ReadInt(t, timeAt + 4, 2, mi) ||
        !ReadInt(t, timeAt + 7, 2, s))
      return std::nullopt;
  }
  if (!ValidParts(y, mo, d, h, mi, s)) return std::nullopt;
  return DateTime::FromParts(y, mo, d, h, mi, s);
}

// OLE automation date: days since 1899-12-30, fraction = time of day.
constexpr std::int64_t kOleEpochDays = -25569;

}  // namespace

DateTime DateTime::FromParts(int year, int month, int day, int hour, int minute, int second) {
  return DateTime(DaysFromCivil(year, static_cast<unsigned>(month), static_cast<unsigned>(day)) *
                      kSecondsPerDay +
                  hour * 3600 + minute * 60 + second);
}

std::optional<DateTime> DateTime::Parse(std::string_view t) {
  int y = 0, mo = 0, d = 0, h = 0, mi = 0, s = 0;
  if (t.size() < 10 || t[4] != '-' || t[7] != '-' || !ReadInt(t, 0, 4, y) || !ReadInt(t, 5, 2, mo) ||
      !ReadInt(t, 8, 2, d))
    return std::nullopt;
  if (t.size() != 10) {
    if (t.size() != 19 || (t[10] != 'T' && t[10] != ' ') || t[13] != ':' || t[16] != ':' ||
        !ReadInt(t, 11, 2, h) || !ReadInt(t, 14, 2, mi) || !ReadInt(t, 17, 2, s))
      return std::nullopt;
  }
  if (!ValidParts(y, mo, d, h, mi, s)) return std::nullopt;
  return FromParts(y, mo, d, h, mi, s);
}

int DateTime::Year() const { return CivilFromDays(FloorDiv(seconds_, kSecondsPerDay)).year; }
int DateTime::Month() const { return CivilFromDays(FloorDiv(seconds_, kSecondsPerDay)).month; }
int DateTime::Day() const { return CivilFromDays(FloorDiv(seconds_, kSecondsPerDay)).day; }
int DateTime::Hour() const {
  return static_cast<int>((seconds_ - FloorDiv(seconds_, kSecondsPerDay) * kSecondsPerDay) / 3600);
}
int DateTime::Minute() const {
  return static_cast<int>((seconds_ - FloorDiv(seconds_, kSecondsPerDay) * kSecondsPerDay) % 3600 /
                          60);
}
int DateTime::Second() const {
  return static_cast<int>((seconds_ - FloorDiv(seconds_, kSecondsPerDay) * kSecondsPerDay) % 60);
}
int DateTime::Weekday() const {
  // 1970-01-01 was a Thursday.
  const std::int64_t days = FloorDiv(seconds_, kSecondsPerDay);
  return static_cast<int>(((days % 7) + 7 + 4) % 7);
}
DateTime DateTime::AddDays(int days) const { return DateTime(seconds_ + days * kSecondsPerDay); }
DateTime DateTime::AddSeconds(std::int64_t seconds) const { return DateTime(seconds_ + seconds); }
DateTime DateTime::DateOnly() const {
  return DateTime(FloorDiv(seconds_, kSecondsPerDay) * kSecondsPerDay);
}
bool DateTime::HasTime() const { return seconds_ != DateOnly().seconds_; }
std::string DateTime::Iso() const {
  char buf[32];
  std::snprintf(buf, sizeof buf, "%04d-%02d-%02dT%02d:%02d:%02d", Year(), Month(), Day(), Hour(),
                Minute(), Second());
  return buf;
}

Var::Var(std::shared_ptr<host::Object> o) {
  if (o) v_ = std::move(o);
}

bool Var::IsNumberType() const {
  const Type t = type();
  return t == Type::Int32 || t == Type::Int64 || t == Type::Number;
}

std::string Var::Text() const {
  switch (type()) {
    case Type::Null:
      return {};
    case Type::Flag:
      return std::get<bool>(v_) ? "True" : "False";
    case Type::Int32:
      return std::to_string(std::get<std::int32_t>(v_));
    case Type::Int64:
      return std::to_string(std::get<std::int64_t>(v_));
    case Type::Number:
      return NumberText(std::get<double>(v_));
    case Type::Text:
      return std::get<std::string>(v_);
    case Type::Date: {
      const DateTime d = std::get<DateTime>(v_);
      return Format(Var(d), d.HasTime() ? "dd/mm/yyyy hh:nn:ss" : "dd/mm/yyyy");
    }
    case Type::Object:
      throw Error(err::kTypeMismatch);
  }
  return {};
}

double Var::Number() const {
  switch (type()) {
    case Type::Null:
      throw Error(err::kInvalidUseOfNull);
    case Type::Flag:
      return std::get<bool>(v_) ? -1.0 : 0.0;
    case Type::Int32:
      return std::get<std::int32_t>(v_);
    case Type::Int64:
      return static_cast<double>(std::get<std::int64_t>(v_));
    case Type::Number:
      return std::get<double>(v_);
    case Type::Text: {
      const std::string& s = std::get<std::string>(v_);
      if (!IsNumericText(s)) throw Error(err::kTypeMismatch);
      const std::string t = Trim(s);
      return std::strtod(t.c_str(), nullptr);
    }
    case Type::Date: {
      const std::int64_t secs = std::get<DateTime>(v_).Seconds();
      return static_cast<double>(secs) / kSecondsPerDay - kOleEpochDays;
    }
    case Type::Object:
      break;
  }
  throw Error(err::kTypeMismatch);
}

std::int64_t Var::Whole() const {
  const double n = Number();
  if (!(std::fabs(n) < 9.2e18)) throw Error(err::kOverflow);
  return RoundHalfEven(n);
}

double Var::NumberOr(double fallback) const { return IsNumeric() ? Number() : fallback; }

bool Var::IsNumeric() const {
  switch (type()) {
    case Type::Flag:
    case Type::Int32:
    case Type::Int64:
    case Type::Number:
      return true;
    case Type::Text:
      return IsNumericText(std::get<std::string>(v_));
    default:
      return false;
  }
}

bool Var::Flag() const {
  switch (type()) {
    case Type::Null:
      throw Error(err::kInvalidUseOfNull);
    case Type::Flag:
      return std::get<bool>(v_);
    case Type::Text:
      return TextToFlag(std::get<std::string>(v_));
    case Type::Object:
      throw Error(err::kTypeMismatch);
    default:
      return Number() != 0.0;
  }
}

DateTime Var::Date() const {
  switch (type()) {
    case Type::Null:
      throw Error(err::kInvalidUseOfNull);
    case Type::Date:
      return std::get<DateTime>(v_);
    case Type::Text: {
      const std::string t = Trim(std::get<std::string>(v_));
      if (auto d = DateTime::Parse(t)) return *d;
      if (auto d = ParseSlashed(t)) return *d;
      throw Error(err::kTypeMismatch);
    }
    case Type::Object:
      throw Error(err::kTypeMismatch);
    default: {
      const double serial = Number();
      if (!(std::fabs(serial) < 3e6)) throw Error(err::kOverflow);
      const double secs = (serial + kOleEpochDays) * kSecondsPerDay;
      return DateTime::FromParts(1970, 1, 1).AddSeconds(static_cast<std::int64_t>(std::llround(secs)));
    }
  }
}

std::shared_ptr<host::Object> Var::Object() const {
  if (type() != Type::Object) return nullptr;
  return std::get<std::shared_ptr<host::Object>>(v_);
}

bool Var::operator==(const Var& other) const { return v_ == other.v_; }

}  // namespace quendal
