#include "frame/VB.h"

#include <gtest/gtest.h>

#include "frame/Error.h"

namespace quendal {
namespace {

TEST(VBTest, LeftRightMidCountCharactersNotBytes) {
  EXPECT_EQ(Left("ABCDEF", 4), "ABCD");
  EXPECT_EQ(Left("AB", 4), "AB");
  EXPECT_EQ(Left("AB", 0), "");
  EXPECT_EQ(Left("AB", -3), "");
  EXPECT_EQ(Left("CAFÉ CRÈME", 4), "CAFÉ");  // É is two bytes; it is kept whole
  EXPECT_EQ(Right("00093123450000000012", 18), "093123450000000012");
  EXPECT_EQ(Right("12345", 18), "12345");
  EXPECT_EQ(Right("ABCDÉ", 2), "DÉ");
  EXPECT_EQ(Mid("ABCDEFGH", 2, 10), "BCDEFGH");
  EXPECT_EQ(Mid("ABCDEFGH", 3), "CDEFGH");
  EXPECT_EQ(Mid("ABC", 9), "");
  EXPECT_THROW(Mid("ABC", 0), Error);
  EXPECT_EQ(Len("CRÈME"), 5);
}

TEST(VBTest, TrimRemovesSpacesOnly) {
  EXPECT_EQ(Trim("  A B  "), "A B");
  EXPECT_EQ(Trim("    "), "");
  EXPECT_EQ(Trim("\tA\t"), "\tA\t");
  EXPECT_EQ(LTrim("  A "), "A ");
  EXPECT_EQ(RTrim("  A "), "  A");
}

TEST(VBTest, CaseCoversLatinLetters) {
  EXPECT_EQ(UCase("richmond crème"), "RICHMOND CRÈME");
  EXPECT_EQ(LCase("ÉCOLE"), "école");
  EXPECT_EQ(UCase("a÷b"), "A÷B");  // the division sign has no case
}

TEST(VBTest, InStrAndReplace) {
  EXPECT_EQ(InStr("OPT #%ATL", "#%ATL"), 5);
  EXPECT_EQ(InStr("opt", "#%ATL"), 0);
  EXPECT_EQ(Replace("a~201b~201", "~201", "|"), "a|b|");
}

TEST(VBTest, NumbersAsTheRuntimeWritesThem) {
  EXPECT_EQ(NumberText(12.5), "12.5");
  EXPECT_EQ(NumberText(3.0), "3");
  EXPECT_EQ(NumberText(0.4 * 100), "40");
  EXPECT_EQ(NumberText(0.1 + 0.2), "0.3");
  EXPECT_EQ(NumberText(-0.0), "0");
  EXPECT_EQ(NumberText(1e20), "1E+20");
  EXPECT_EQ(NumberText(123456789012345678.0), "1.23456789012346E+17");
  EXPECT_EQ(NumberText(-182.95), "-182.95");
}

TEST(VBTest, RoundingTakesHalvesToEven) {
  EXPECT_EQ(RoundHalfEven(0.5), 0);
  EXPECT_EQ(RoundHalfEven(1.5), 2);
  EXPECT_EQ(RoundHalfEven(2.5), 2);
  EXPECT_EQ(RoundHalfEven(-2.5), -2);
  EXPECT_EQ(RoundHalfEven(182.95), 183);
  EXPECT_DOUBLE_EQ(Round(0.125, 2), 0.12);
}

TEST(VBTest, TextToFlag) {
  EXPECT_TRUE(TextToFlag("True"));
  EXPECT_TRUE(TextToFlag("TRUE"));
  EXPECT_FALSE(TextToFlag("False"));
  EXPECT_FALSE(TextToFlag("0"));
  EXPECT_TRUE(TextToFlag("-1"));
  EXPECT_TRUE(TextToFlag(" 2.5 "));
  EXPECT_THROW(TextToFlag("Yes"), Error);
  EXPECT_THROW(TextToFlag(""), Error);
}

TEST(VBTest, NumericText) {
  EXPECT_TRUE(IsNumericText(" 12.5 "));
  EXPECT_TRUE(IsNumericText("-1e3"));
  EXPECT_TRUE(IsNumericText(".5"));
  EXPECT_FALSE(IsNumericText(""));
  EXPECT_FALSE(IsNumericText("."));
  EXPECT_FALSE(IsNumericText("12kg"));
  EXPECT_FALSE(IsNumericText("1e"));
}

}  // namespace
}  // namespace quendal
