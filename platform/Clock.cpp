#include "platform/Clock.h"

#include <cstdlib>
#include <ctime>

namespace quendal {

namespace {
std::optional<DateTime>& Fixed() {
  static std::optional<DateTime> fixed;
  return fixed;
}
}  // namespace

DateTime Now() {
  if (Fixed()) return *Fixed();
  if (const char* env = std::getenv("QUENDAL_NOW")) {
    if (auto d = DateTime::Parse(env)) return *d;
  }
  const std::time_t t = std::time(nullptr);
  std::tm local{};
  localtime_r(&t, &local);
  return DateTime::FromParts(local.tm_year + 1900, local.tm_mon + 1, local.tm_mday, local.tm_hour,
                             local.tm_min, local.tm_sec);
}

DateTime Today() { return Now().DateOnly(); }

void SetNow(std::optional<DateTime> now) { Fixed() = now; }

}  // namespace quendal
