#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>

#include "tests/manifests/StarTrackRowsFixture.h"

namespace quendal {
namespace {

using test::Pad;
using ::testing::ElementsAre;

constexpr std::string_view kClass = "Quendal.clsAaEES610";

using AaEES610Test = test::StarTrackRowsFixture;

// Today's packs are the rows; each chosen row adds its pack's line.
TEST_F(AaEES610Test, EachChosenPackAddsItsLine) {
  AddCartons(1, "AAE0001", 2);
  AddCartons(2, "AAE0002", 1);
  Run run = Start(kClass);
  ASSERT_EQ(run.loaded, 3);
  EXPECT_EQ(run.grid(0, 1).Text(), Sscc(10));
  EXPECT_EQ(run.grid(1, 3).Text(), "2 of 2");
  EXPECT_EQ(run.rows->Process(1, run.log), 1);
  EXPECT_EQ(run.rows->Process(2, run.log), 2);
  EXPECT_EQ(run.rows->Process(3, run.log), 0);
  EXPECT_TRUE(run.rows->Term());
  const auto line = [](std::string_view no, int serial, std::string_view pack) {
    return "ES610" + Pad("10293847", 10) + Pad(no, 20) + "20240314" + Sscc(serial) + std::string(pack) +
           Pad("Harbour Retail DC", 40) + Pad("12 Wharf Road", 40) + Pad("PORT MELBOURNE", 30) + "VIC" +
           "3207" + "00000.00" + Pad("", 10);
  };
  EXPECT_THAT(Lines("ES610_SRX_20240314.TXT"),
              ElementsAre(line("AAE0001", 11, "002002"), line("AAE0002", 20, "001001")));
  EXPECT_EQ(host.LogMessages().back(), "Row 3 is not one of the 3 loaded rows.");
}

TEST_F(AaEES610Test, NoPacksAndASiteLayout) {
  Run empty = Start(kClass);
  EXPECT_EQ(empty.loaded, 0);
  EXPECT_EQ(host.LogMessages().back(), "No Packs found to process.");

  std::ofstream(folder + "clsAaEES610.layout")
      << "record consignment\n  \"C\"\n  cut 4 ConNote.ConNoteNo\nrecord pack\n  cut 6 Pack.SSCC\n"
         "  zero 1 PackNo\n";
  AddCartons(1, "AAE0001", 2);
  Run run = Start(kClass);
  run.rows->Process(1, run.log);
  EXPECT_THAT(Lines("ES610_SRX_20240314.TXT"), ElementsAre("CAAE0", "0009312"));
}

}  // namespace
}  // namespace quendal
