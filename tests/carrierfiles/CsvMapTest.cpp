#include "carrierfiles/CsvMap.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>

namespace quendal {
namespace {

using ::testing::ElementsAre;

constexpr std::array<std::string_view, 3> kNames = {"CONSIGNMENTNOTENO", "CONTAINERNO",
                                                    "PACKWEIGHT"};

std::vector<std::ptrdiff_t> Columns(std::string_view bytes) {
  return ReadCsvMap(bytes, kNames).columns;
}

TEST(CsvMapTest, LineEndsAndByteOrderMarksOfAnyEditorGiveTheSameColumns) {
  const std::vector<std::ptrdiff_t> expected = {1, 2, 0};
  EXPECT_EQ(Columns("CONTAINERNO\nPACKWEIGHT\nCONSIGNMENTNOTENO"), expected);
  EXPECT_EQ(Columns("CONTAINERNO\r\nPACKWEIGHT\r\nCONSIGNMENTNOTENO\r\n"), expected);
  EXPECT_EQ(Columns("CONTAINERNO\rPACKWEIGHT\rCONSIGNMENTNOTENO\r"), expected);
  EXPECT_EQ(Columns("\xEF\xBB\xBF"
                    "CONTAINERNO\r\nPACKWEIGHT\nCONSIGNMENTNOTENO"),
            expected);
  // UTF-16 as Notepad saves "Unicode", little- and big-endian.
  const std::string_view ascii = "ContainerNo\r\nPackWeight\r\nConsignmentNoteNo\r\n";
  std::string little = "\xFF\xFE", big = "\xFE\xFF";
  for (char c : ascii) {
    little += {c, '\0'};
    big += {'\0', c};
  }
  EXPECT_EQ(Columns(little), expected);
  EXPECT_EQ(Columns(big), expected);
}

TEST(CsvMapTest, LinesThatNameNoFieldKeepTheirColumnAndAreNotedOnce) {
  const std::string longLine(70000, 'X');
  const CsvMap map =
      ReadCsvMap("CONTAINERNO\n\n \t\nWHATEVER\n" + longLine + "\nwhatever\n\n\n", kNames);
  EXPECT_THAT(map.columns, ElementsAre(1, kNoField, kNoField, kNoField, kNoField, kNoField));
  EXPECT_THAT(
      map.notes,
      ElementsAre(
          "line 2 is blank; its column is written empty.",
          "line 3 is blank; its column is written empty.",
          "line 4 names no field: \"WHATEVER\"; its column is written empty.",
          "line 5 is too long to name a field (70000 bytes); its column is written empty."));
  EXPECT_TRUE(ReadCsvMap("\r\n \r\n\t", kNames).columns.empty());

  // A damaged file can't flood the log; what a note shows of a name is printable.
  std::string damaged = "PACKWEIGHT\n";
  for (int i = 0; i < 500; ++i) damaged += "BAD\x01" + std::to_string(i) + "\xC3\xA9\n";
  const CsvMap flood = ReadCsvMap(damaged, kNames);
  EXPECT_EQ(flood.columns.size(), 501u);
  ASSERT_EQ(flood.notes.size(), 11u);
  EXPECT_EQ(flood.notes[0], "line 2 names no field: \"BAD?0??\"; its column is written empty.");
  EXPECT_EQ(flood.notes[10], "490 more lines name no field; their columns are written empty.");
}

TEST(CsvMapTest, OnlyValuesThatWouldSplitTheColumnAreQuotedAndLineBreaksAreSpaces) {
  std::string line;
  for (std::string_view value :
       {"plain", "", "a,b", "say \"hi\"", "two\nlines", "cr\r", "tab\there"}) {
    if (!line.empty()) line += ',';
    AppendCsvValue(line, value);
  }
  EXPECT_EQ(line, "plain,,\"a,b\",\"say \"\"hi\"\"\",two lines,cr ,tab\there");
  line.clear();
  AppendCsvValue(line, "a,\r\nb");
  EXPECT_EQ(line, "\"a,  b\"");
}

}  // namespace
}  // namespace quendal
