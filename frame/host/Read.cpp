#include "frame/host/Read.h"

namespace quendal::host {

bool IsTrue(const Var& value) {
  if (value.IsNull()) return false;
  try {
    return value.Flag();
  } catch (const Error&) {
    return false;
  }
}

std::optional<DateTime> DateOf(const Var& value) {
  if (value.IsNull() || value.IsObject()) return std::nullopt;
  if (value.IsText() && value.Text().find_first_not_of(' ') == std::string::npos) return std::nullopt;
  try {
    return value.Date();
  } catch (const Error&) {
    return std::nullopt;
  }
}

bool SameValue(const Var& a, const Var& b) {
  if (a.IsNumeric() && b.IsNumeric()) return a.Number() == b.Number();
  return a.Text() == b.Text();
}

}  // namespace quendal::host
