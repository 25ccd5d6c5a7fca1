// The host's nullable value: Null, flag, 32/64-bit integer, number, text,
// date, or a host object. Host members, grid cells and optional arguments
// all travel as Var.
#pragma once

#include <compare>
#include <concepts>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <variant>

namespace quendal {

namespace host {
class Object;
}

// A local date-time without zone, to the second.
class DateTime {
 public:
  DateTime() = default;
  static DateTime FromParts(int year, int month, int day, int hour = 0, int minute = 0,
                            int second = 0);
  // "YYYY-MM-DD", "YYYY-MM-DDTHH:MM:SS" or "YYYY-MM-DD HH:MM:SS"; nullopt when malformed.
  static std::optional<DateTime> Parse(std::string_view text);

  int Year() const;
  int Month() const;
  int Day() const;
  int Hour() const;
  int Minute() const;
  int Second() const;
  int Weekday() const;  // 0 = Sunday

  DateTime AddDays(int days) const;
  DateTime AddSeconds(std::int64_t seconds) const;
  DateTime DateOnly() const;
  bool HasTime() const;
  std::int64_t Seconds() const { return seconds_; }  // since 1970-01-01 00:00:00 local
  std::string Iso() const;                           // "YYYY-MM-DDTHH:MM:SS"

  auto operator<=>(const DateTime&) const = default;

 private:
  explicit DateTime(std::int64_t seconds) : seconds_(seconds) {}
  std::int64_t seconds_ = 0;
};

class Var {
 public:
  enum class Type { Null, Flag, Int32, Int64, Number, Text, Date, Object };

  Var() = default;
  Var(std::nullptr_t) {}
  Var(bool b) : v_(b) {}
  template <std::integral T>
    requires(!std::same_as<T, bool>)
  Var(T i) {
    if constexpr (sizeof(T) <= 4 && std::is_signed_v<T>)
      v_ = static_cast<std::int32_t>(i);
    else if constexpr (sizeof(T) < 4)
      v_ = static_cast<std::int32_t>(i);
    else
      v_ = static_cast<std::int64_t>(i);
  }
  Var(double d) : v_(d) {}
  Var(float f) : v_(static_cast<double>(f)) {}
  Var(std::string s) : v_(std::move(s)) {}
  Var(std::string_view s) : v_(std::string(s)) {}
  Var(const char* s) : v_(std::string(s)) {}
  Var(DateTime d) : v_(d) {}
  Var(std::shared_ptr<host::Object> o);
  template <class T>
    requires std::derived_from<T, host::Object>
  Var(std::shared_ptr<T> o) : Var(std::shared_ptr<host::Object>(std::move(o))) {}

  Type type() const { return static_cast<Type>(v_.index()); }
  bool IsNull() const { return v_.index() == 0; }
  bool IsText() const { return type() == Type::Text; }
  bool IsDate() const { return type() == Type::Date; }
  bool IsObject() const { return type() == Type::Object; }
  bool IsNumberType() const;  // integer or number

  // Text as the host's runtime writes it; Null reads as "".
  std::string Text() const;
  // The value as a number: numbers, flags (True = -1), numeric text, dates.
  // Null raises "Invalid use of Null"; other text raises "Type mismatch".
  double Number() const;
  // Number() rounded to a whole number, halves to even.
  std::int64_t Whole() const;
  // Number() when the value is numeric, else the fallback (Null, empty or other text).
  double NumberOr(double fallback) const;
  // True for numbers, flags and text that reads as a number.
  bool IsNumeric() const;
  // The value as a flag: "True"/"False" (any case), numbers (0 is False).
  bool Flag() const;
  // A date value, or text in one of the forms DateTime::Parse accepts or "dd/mm/yyyy[ hh:mm:ss]".
  DateTime Date() const;
  std::shared_ptr<host::Object> Object() const;  // null unless the value holds an object

  bool operator==(const Var& other) const;

 private:
  std::variant<std::monostate, bool, std::int32_t, std::int64_t, double, std::string, DateTime,
               std::shared_ptr<host::Object>>
      v_;
};

}  // namespace quendal
