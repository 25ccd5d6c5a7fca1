#include "frame/Var.h"

#include <gtest/gtest.h>

#include "frame/Error.h"

namespace quendal {
namespace {

TEST(VarTest, NullReadsAsEmptyTextAndRefusesArithmetic) {
  const Var null;
  EXPECT_TRUE(null.IsNull());
  EXPECT_EQ(null.Text(), "");
  EXPECT_FALSE(null.IsNumeric());
  EXPECT_EQ(null.NumberOr(0), 0);
  try {
    (void)null.Number();
    FAIL();
  } catch (const Error& e) {
    EXPECT_EQ(e.Number(), err::kInvalidUseOfNull);
  }
}

TEST(VarTest, TextOfEachKind) {
  EXPECT_EQ(Var(true).Text(), "True");
  EXPECT_EQ(Var(42).Text(), "42");
  EXPECT_EQ(Var(std::int64_t{1} << 40).Text(), "1099511627776");
  EXPECT_EQ(Var(182.95).Text(), "182.95");
  EXPECT_EQ(Var(DateTime::FromParts(2024, 3, 14)).Text(), "14/03/2024");
  EXPECT_EQ(Var(DateTime::FromParts(2024, 3, 14, 15, 30, 0)).Text(), "14/03/2024 15:30:00");
}

TEST(VarTest, NumbersFromText) {
  EXPECT_DOUBLE_EQ(Var(" 8.79").Number(), 8.79);
  EXPECT_EQ(Var("heavy").NumberOr(-1), -1);
  EXPECT_THROW((void)Var("heavy").Number(), Error);
  EXPECT_EQ(Var(2.5).Whole(), 2);
  EXPECT_EQ(Var(true).Number(), -1);
}

TEST(VarTest, DatesParseAndCompute) {
  const auto d = DateTime::Parse("2024-02-28T23:59:59");
  ASSERT_TRUE(d);
  EXPECT_EQ(d->AddSeconds(1).Iso(), "2024-02-29T00:00:00");
  EXPECT_EQ(d->AddDays(2).Iso(), "2024-03-01T23:59:59");
  EXPECT_FALSE(DateTime::Parse("2023-02-29"));
  EXPECT_FALSE(DateTime::Parse("2024-13-01"));
  EXPECT_FALSE(DateTime::Parse("2024-03-14T25:00:00"));
  EXPECT_FALSE(DateTime::Parse("14/03/2024x"));
  EXPECT_EQ(Var("2024/03/14").Date().Iso(), "2024-03-14T00:00:00");
  EXPECT_EQ(Var("14/03/2024 08:00:00").Date().Iso(), "2024-03-14T08:00:00");
  EXPECT_EQ(DateTime::FromParts(1960, 1, 1).Iso(), "1960-01-01T00:00:00");
  EXPECT_EQ(DateTime::FromParts(2024, 3, 14).Weekday(), 4);
  // The runtime's date serial: 1899-12-30 is day 0.
  EXPECT_DOUBLE_EQ(Var(DateTime::FromParts(1900, 1, 1, 12)).Number(), 2.5);
}

TEST(VarTest, FlagsFromTextAndNumbers) {
  EXPECT_TRUE(Var("True").Flag());
  EXPECT_FALSE(Var(0).Flag());
  EXPECT_THROW((void)Var("maybe").Flag(), Error);
}

}  // namespace
}  // namespace quendal
