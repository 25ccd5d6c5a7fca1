#include <gtest/gtest.h>

#include "frame/VB.h"

namespace quendal {
namespace {

const Var kPacked = DateTime::FromParts(2024, 3, 14, 15, 30, 45);
const Var kMorning = DateTime::FromParts(2024, 1, 5, 8, 7, 9);

TEST(FormatTest, DateMasks) {
  EXPECT_EQ(Format(kPacked, "dd/mm/yy"), "14/03/24");
  EXPECT_EQ(Format(kPacked, "YYYYMMDDHHMMSS"), "20240314153045");
  EXPECT_EQ(Format(kPacked, "YYYYMMDDHHMM"), "202403141530");
  EXPECT_EQ(Format(kPacked, "YYYY-MM-DD"), "2024-03-14");
  EXPECT_EQ(Format(kPacked, "yyyy-mm-dd"), "2024-03-14");
  EXPECT_EQ(Format(kPacked, "DD-MMM-YYYY  "), "14-Mar-2024  ");
  EXPECT_EQ(Format(kPacked, "DD-MMM-YYYY   "), "14-Mar-2024   ");
  EXPECT_EQ(Format(kMorning, "DDMMYYYY"), "05012024");
  EXPECT_EQ(Format(kMorning, "DDMM"), "0501");
  EXPECT_EQ(Format(kMorning, "YYMMDDHHMM"), "2401050807");
  EXPECT_EQ(Format(kMorning, "yyyymmdd"), "20240105");
  EXPECT_EQ(Format(kMorning, "hhmm"), "0807");
  EXPECT_EQ(Format(kMorning, "HHMM"), "0807");
  EXPECT_EQ(Format(kMorning, "hh:mm:ss"), "08:07:09");
  // "mm" after "dd" is the month; "ss" follows the hour directly.
  EXPECT_EQ(Format(kMorning, "ddmmyyhhss"), "0501240809");
  EXPECT_EQ(Format(kPacked, "DD/MM/YYYY HH:MM:SS"), "14/03/2024 15:30:45");
  EXPECT_EQ(Format(kPacked, "Short Date"), "14/03/2024");
  EXPECT_EQ(Format(kPacked, "Long Date"), "Thursday, 14 March 2024");
}

TEST(FormatTest, DatesGivenAsTextAndMissingDates) {
  EXPECT_EQ(Format(Var("2024-03-14T15:30:45"), "YYYYMMDD"), "20240314");
  EXPECT_EQ(Format(Var("14/03/2024"), "yyyy-mm-dd"), "2024-03-14");
  EXPECT_EQ(Format(Var(), "dd/mm/yy"), "");
  EXPECT_EQ(Format(Var("not a date"), "dd/mm/yy"), "not a date");
}

TEST(FormatTest, NumberMasks) {
  EXPECT_EQ(Format(Var(12), "0000"), "0012");
  EXPECT_EQ(Format(Var(12345), "0000"), "12345");  // never cut
  EXPECT_EQ(Format(Var(3), "000000000"), "000000003");
  EXPECT_EQ(Format(Var(12.5), "00000.000"), "00012.500");
  EXPECT_EQ(Format(Var(-1.5), "00.0000000"), "-01.5000000");
  EXPECT_EQ(Format(Var(12.5), "###0.00"), "12.50");
  EXPECT_EQ(Format(Var(1234.567), "###0.00"), "1234.57");
  EXPECT_EQ(Format(Var(0.4), "###0.00"), "0.40");
  EXPECT_EQ(Format(Var(2.675), "###0.00"), "2.68");  // rounds as the value reads
  EXPECT_EQ(Format(Var(0.125), "0.00"), "0.13");     // halves away from zero
  EXPECT_EQ(Format(Var(12.0), "####0.0#"), "12.0");
  EXPECT_EQ(Format(Var(12.345), "####0.0#"), "12.35");
  EXPECT_EQ(Format(Var(9.999), "####0.0#"), "10.0");
  EXPECT_EQ(Format(Var("7"), "0000"), "0007");
  EXPECT_EQ(Format(Var("abc"), "0000"), "abc");
  EXPECT_EQ(Format(Var(-0.001), "0.00"), "0.00");
}

TEST(FormatTest, TextFillMasks) {
  EXPECT_EQ(Format(Var("AB"), "!@@@@@"), "AB   ");
  EXPECT_EQ(Format(Var("AB"), "@@@@@"), "   AB");
  EXPECT_EQ(Format(Var("ABCDEFG"), "!@@@"), "ABCDEFG");  // never cut
  EXPECT_EQ(Format(Var(), "@@@"), "");
  EXPECT_EQ(Format(Var(42), "!@@@@"), "42  ");
  EXPECT_EQ(Format(Var("CRÈME"), "!@@@@@@"), "CRÈME ");  // padding counts characters
}

}  // namespace
}  // namespace quendal
