#include "platform/Clock.h"

#include <gtest/gtest.h>

#include <cstdlib>

namespace quendal {
namespace {

TEST(ClockTest, FixedByEnvironmentOrByCall) {
  ::setenv("QUENDAL_NOW", "2024-03-14T15:30:00", 1);
  EXPECT_EQ(Now().Iso(), "2024-03-14T15:30:00");
  EXPECT_EQ(Today().Iso(), "2024-03-14T00:00:00");
  SetNow(DateTime::FromParts(2025, 1, 2, 3, 4, 5));
  EXPECT_EQ(Now().Iso(), "2025-01-02T03:04:05");
  SetNow(std::nullopt);
  ::setenv("QUENDAL_NOW", "garbage", 1);
  EXPECT_GT(Now().Year(), 2000);  // a malformed value falls back to the system clock
  ::unsetenv("QUENDAL_NOW");
}

}  // namespace
}  // namespace quendal
