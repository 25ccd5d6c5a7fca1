// Counts that a longer run by hand sets from the environment, so that it
// needs no rebuild.
#pragma once

#include <cstdlib>

namespace quendal::test {

// The positive whole number in the environment variable `name`, else `fallback`.
inline long EnvCount(const char* name, long fallback) {
  const char* text = std::getenv(name);
  if (!text || !*text) return fallback;
  char* end = nullptr;
  const long value = std::strtol(text, &end, 10);
  return end && *end == '\0' && value > 0 ? value : fallback;
}

}  // namespace quendal::test
