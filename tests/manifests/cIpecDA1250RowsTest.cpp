#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>

#include "frame/VB.h"
#include "tests/manifests/StarTrackRowsFixture.h"

namespace quendal {
namespace {

using test::Pad;
using test::Sp;
using ::testing::ElementsAre;

constexpr std::string_view kManifest = "Quendal.clsIpecDA1250Manifest";
constexpr std::string_view kEndOfDay = "Quendal.clsIpecDA1250EOD";

// The Ipec 1250 manifest and end-of-day runs over the row fixture's
// carrier (account "SRX" 10293847), receiver and delivery address.
class Ipec1250RowsTest : public test::StarTrackRowsFixture {
 protected:
  void SetUp() override {
    StarTrackRowsFixture::SetUp();
    order->fields["DeliveryAddress"] = host.Make<host::Address>(
        {{"Line1", "1341 Dandenong Road"}, {"Line2", "Loading Dock 3"}, {"Phone", "03 9555 0101"}});
  }
  // The date parts of the records: today's on the clock.
  static std::string Yymmdd() { return Format(Var(Today()), "YYMMDD"); }
  static std::string Yyyymmdd() { return Format(Var(Today()), "YYYYMMDD"); }

  std::string Head(std::string_view no) const {
    return "40" + Yymmdd() + "C" + Pad("10293847", 10) + Pad(no, 12) + "X" + Pad("Harbour Retail DC", 30);
  }
  std::string Tail(std::string_view weight, std::string_view cubic) const {
    return Pad("PORT MELBOURNE", 25) + "VIC" + "3207" + "0002" + std::string(weight) +
           std::string(cubic) + Pad("ASN-000501", 20) + Pad("Leave at the loading dock", 30);
  }
  std::string ManifestRecord(std::string_view no, std::string_view weight) const {
    return Head(no) + Pad("1341 Dandenong Road", 30) + Pad("Loading Dock 3", 30) +
           Tail(weight, "00.035") + Sp(10) + Pad("1234567", 10) + Sp(100) + Pad("03 9555 0101", 20) +
           Sp(143) + Sp(5) + Sp(28);
  }
  std::string DayRecord(std::string_view no, std::string_view cubic) const {
    return Head(no) + Pad("12 Wharf Road", 30) + Sp(30) + Tail("0012.5", cubic) + Sp(240);
  }
  std::vector<std::string> Items(std::string_view no, int first) const {
    std::vector<std::string> items;
    for (int i = 0; i < 2; ++i)
      items.push_back("40" + Yymmdd() + "I" + Pad(no, 12) + "000" + std::to_string(i + 1) +
                      Sscc(first * 10 + i) + "000000");
    return items;
  }
  // The 1250 files of the folder.
  std::vector<std::string> DatFiles() const {
    std::vector<std::string> names;
    for (const std::string& name : FilesInFolder())
      if (name.ends_with(".DAT")) names.push_back(name);
    return names;
  }
  static std::vector<std::string> Join(std::vector<std::vector<std::string>> parts) {
    std::vector<std::string> all;
    for (auto& part : parts) all.insert(all.end(), part.begin(), part.end());
    return all;
  }
};

// Two rows a few minutes apart go into the day's one file; a consignment
// of no weight says 0.1 kg and one of no cube 0.001; no trailer is added.
TEST_F(Ipec1250RowsTest, AManifestRunWritesOneFileWithoutTrailer) {
  ClockOnRealDate();
  AddCartons(1, "IPE0001", 2);
  AddCartons(2, "IPE0002", 2, {{"Weight", 0}, {"Volume", 0}});
  Run run = Start(kManifest);
  ASSERT_EQ(run.loaded, 2);
  EXPECT_EQ(run.rows->Process(0, run.log), 1);
  SetNow(Now().AddSeconds(300));
  EXPECT_EQ(run.rows->Process(1, run.log), 2);
  EXPECT_TRUE(run.rows->Term());

  ASSERT_EQ(DatFiles().size(), 1u);
  EXPECT_TRUE(DatFiles()[0].starts_with("T1250_SRX_"));
  std::string noCube = ManifestRecord("IPE0002", "0000.1");
  noCube.replace(noCube.find("0000.100.035"), 12, "0000.100.001");
  EXPECT_EQ(Lines(DatFiles()[0]),
            Join({{ManifestRecord("IPE0001", "0012.5")}, Items("IPE0001", 1), {noCube}, Items("IPE0002", 2)}));
  EXPECT_EQ(host.conNotes[0]->fields["ManifestId"].Whole(), 1);
  EXPECT_TRUE(SummaryJobs().empty());
  EXPECT_EQ(host.LogMessages()[0], "ConNote IPE0001. ActiveX called Quendal.clsIpecDA1250Manifest");
}

// The end of day keeps the day file's trailer last as each row adds to it,
// writes a cube of nothing as such and prints the day's summary.
TEST_F(Ipec1250RowsTest, AnEndOfDayMovesTheTrailerAndPrintsTheSummary) {
  ClockOnRealDate();
  AddCartons(1, "IPE0001", 2);
  AddCartons(2, "IPE0002", 2, {{"Volume", 0}});
  Run run = Start(kEndOfDay);
  ASSERT_EQ(run.loaded, 2);
  EXPECT_EQ(run.rows->Process(0, run.log), 1);
  ASSERT_EQ(DatFiles().size(), 1u);
  EXPECT_EQ(Lines(DatFiles()[0]),
            Join({{DayRecord("IPE0001", "00.035")}, Items("IPE0001", 1), {Yyyymmdd(), "%%EOF"}}));
  SetNow(Now().AddSeconds(300));
  EXPECT_EQ(run.rows->Process(1, run.log), 2);
  EXPECT_TRUE(run.rows->Term());
  ASSERT_EQ(DatFiles().size(), 1u);
  EXPECT_EQ(Lines(DatFiles()[0]),
            Join({{DayRecord("IPE0001", "00.035")}, Items("IPE0001", 1), {DayRecord("IPE0002", "00.000")},
                  Items("IPE0002", 2), {Yyyymmdd(), "%%EOF"}}));
  EXPECT_EQ(SummaryJobs().size(), 1u);
}

// A manifest run that adds to a day file ending with the trailer keeps the
// trailer last and adds none of its own.
TEST_F(Ipec1250RowsTest, AManifestRunKeepsAnExistingTrailerLast) {
  AddCartons(1, "IPE0001", 2);
  Run day = Start(kEndOfDay);
  day.rows->Process(0, day.log);
  host.conNotes[0]->fields["ManifestId"] = Var();
  Run manifest = Start(kManifest);
  manifest.rows->Process(0, manifest.log);
  EXPECT_EQ(Lines(DatFiles()[0]),
            Join({{DayRecord("IPE0001", "00.035")}, Items("IPE0001", 1),
                  {ManifestRecord("IPE0001", "0012.5")}, Items("IPE0001", 1), {Yyyymmdd(), "%%EOF"}}));
}

TEST_F(Ipec1250RowsTest, SiteLayoutsReorderAndResize) {
  std::ofstream(folder + "clsIpecDA1250Manifest.layout")
      << "record consignment\n  cut 7 ManifestNumber\n  cutright 10 ConNote.ConNoteNo\n"
         "  cut 6 DeliveryAddress.Phone\n  number \"00.0\" ConNote.Weight or \"00.1\"\n";
  std::ofstream(folder + "clsIpecDA1250EOD.layout")
      << "record pack\n  zero 2 PackNo\n  cut 3 ConNote.ConNoteNo\nrecord trailer\n  \"END\"\n";
  AddCartons(1, "IPE0001", 2, {{"Weight", 0}});
  Run manifest = Start(kManifest);
  manifest.rows->Process(0, manifest.log);
  ASSERT_EQ(DatFiles().size(), 1u);
  EXPECT_THAT(Lines(DatFiles()[0]), ElementsAre("1234567   IPE000103 95500.1"));
  std::filesystem::remove(folder + DatFiles()[0]);
  Run day = Start(kEndOfDay);
  day.rows->Process(0, day.log);
  EXPECT_THAT(Lines(DatFiles()[0]), ElementsAre("01IPE", "02IPE", "END"));
}

TEST_F(Ipec1250RowsTest, AFailedManifestSaveWritesNothing) {
  host.manifestSaveFails = true;
  AddCartons(1, "IPE0001", 2);
  Run run = Start(kManifest);
  EXPECT_EQ(run.rows->Process(0, run.log), 0);
  EXPECT_EQ(host.LogMessages().back(), "Failed to create mainifest ID");
  EXPECT_TRUE(DatFiles().empty());
}

}  // namespace
}  // namespace quendal
