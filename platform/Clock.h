// The current local date and time. QUENDAL_NOW=YYYY-MM-DDTHH:MM:SS (or
// SetNow) fixes it, so runs and tests are reproducible.
#pragma once

#include <optional>

#include "frame/Var.h"

namespace quendal {

DateTime Now();
DateTime Today();
// Fixes the clock for this process (nullopt returns to QUENDAL_NOW or the system clock).
void SetNow(std::optional<DateTime> now);

}  // namespace quendal
