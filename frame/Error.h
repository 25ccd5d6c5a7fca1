// The library's error type and the runtime error numbers it raises.
#pragma once

#include <stdexcept>
#include <string>
#include <string_view>

namespace quendal {

namespace err {
inline constexpr long kInvalidCall = 5;
inline constexpr long kOverflow = 6;
inline constexpr long kSubscript = 9;
inline constexpr long kDivisionByZero = 11;
inline constexpr long kTypeMismatch = 13;
inline constexpr long kBadFileName = 52;
inline constexpr long kFileNotFound = 53;
inline constexpr long kDeviceIO = 57;
inline constexpr long kPermissionDenied = 70;
inline constexpr long kPathFileAccess = 75;
inline constexpr long kPathNotFound = 76;
inline constexpr long kObjectNotSet = 91;
inline constexpr long kInvalidUseOfNull = 94;
inline constexpr long kObjectRequired = 424;
inline constexpr long kCannotCreateObject = 429;
inline constexpr long kNoSuchMember = 438;
inline constexpr long kAutomation = 440;
inline constexpr long kUnknownPrinter = 1801;
}  // namespace err

// The standard description of a runtime error number, with a generic
// fallback for numbers the library does not know.
std::string_view StandardDescription(long number);

// A failure inside the library or a host call. `source` is the error's
// source text; a host reporting a remote failure sets it to a digit other
// than 0 followed by the component name and "!".
class Error : public std::runtime_error {
 public:
  explicit Error(long number, std::string description = {}, std::string source = {});

  long Number() const { return number_; }
  const std::string& Description() const { return description_; }
  const std::string& Source() const { return source_; }

 private:
  long number_;
  std::string description_;
  std::string source_;
};

}  // namespace quendal
