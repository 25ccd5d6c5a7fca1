#include "manifests/cStarTrackEODcln.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "carrierfiles/cStarTrackDAcln.h"
#include "frame/VB.h"
#include "tests/manifests/StarTrackRowsFixture.h"

namespace quendal {
namespace {

using test::Pad;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;

constexpr std::string_view kEndOfDay = "Quendal.clsStarTrackEODcln";

class StarTrackEndOfDayTest : public test::StarTrackRowsFixture {
 protected:
  // Today's file is the one created today, so the clock runs on the real date.
  void SetUp() override {
    StarTrackRowsFixture::SetUp();
    ClockOnRealDate();
  }
};

TEST_F(StarTrackEndOfDayTest, NoWeightIsOneNoAuthorityToLeaveAndEveryPackACarton) {
  carrier->fields["Options"] = "#%ATL";
  AddCartons(101, "E1", 2, {{"Weight", Var()}});
  AddCartons(102, "E2", 1, {{"Weight", 0.2}});
  host.packs.back()->fields["PackType"] = "SATCHEL";
  EXPECT_THAT(RunAll(kEndOfDay), ElementsAre(101, 102));

  ASSERT_THAT(FilesInFolder(), ElementsAre("SRX00501.CLN"));
  const std::string e1 = RecordOf("SRX00501.CLN", "E1");
  EXPECT_EQ(e1.substr(259, 5), "    1");
  EXPECT_EQ(e1.substr(264, 5), "   30");  // two packs of 12 items
  const std::string e2 = RecordOf("SRX00501.CLN", "E2");
  EXPECT_EQ(e2.substr(259, 5), "    1");
  EXPECT_EQ(e2.substr(278), "CTN");
  for (const std::string& line : Lines("SRX00501.CLN")) {
    EXPECT_FALSE(line.starts_with("15") && line[22] == 'E') << line;
    if (line.starts_with("20" + Pad("E2", 20))) {
      EXPECT_TRUE(line.ends_with("S CTN")) << line;
    }
  }
  EXPECT_EQ(host.conNotes[0]->Get("CubicTotal").Number(), 0.03);
  // Nothing is stamped with a manifest.
  EXPECT_TRUE(host.conNotes[0]->Get("ManifestId").IsNull());
}

TEST_F(StarTrackEndOfDayTest, TodaysFileIsSharedWithTheDespatchClassButNotTheManifestRun) {
  // The despatch step sent E1 this morning: today's file exists.
  auto first = AddCartons(101, "E1", 1);
  clsStarTrackDAcln despatchClass;
  LogList log;
  despatchClass.Process(host.system, first, asn, host::Object::As<host::PackList>(first->Get("Packs")), log);
  ASSERT_THAT(FilesInFolder(), ElementsAre("SRX00501.CLN"));

  // The manifest run starts its own file for E1 and E2 ...
  AddCartons(102, "E2", 1);
  EXPECT_THAT(RunAll("Quendal.clsStarTrackManifestcln"), ElementsAre(101, 102));
  EXPECT_THAT(FilesInFolder(), ElementsAre("SRX00501.CLN", "SRX34567.CLN"));

  // ... the end-of-day run joins today's file: E1 is there already, E2 is added.
  EXPECT_THAT(RunAll(kEndOfDay), ElementsAre(0, 102));
  EXPECT_THAT(host.LogMessages(), testing::Contains("Cannot process, connoteno already exists E1"));
  EXPECT_THAT(FilesInFolder(), ElementsAre("SRX00501.CLN", "SRX34567.CLN"));
  EXPECT_NE(RecordOf("SRX00501.CLN", "E2"), "<none>");
  EXPECT_EQ(Lines("SRX00501.CLN").front().substr(0, 15), "00NSRX00501.CLN");
}

TEST_F(StarTrackEndOfDayTest, TermSumsUpTodaysConsignments) {
  AddCartons(101, "E1", 2);
  AddCartons(102, "YESTERDAY", 1, {{"ConNoteDate", Now().AddDays(-1)}});
  Run run = Start(kEndOfDay);
  ASSERT_EQ(run.loaded, 1);
  ASSERT_EQ(run.columns.Rows(), 5u);
  EXPECT_EQ(run.columns(3, 0).Text(), "Order No");
  ASSERT_EQ(run.grid.Columns(), 6u);
  EXPECT_EQ(run.grid(0, 4).Text(), "");
  EXPECT_TRUE(run.grid(0, 5).IsNull());
  EXPECT_TRUE(run.rows->Term());  // Term without any row still sums up the day
  ASSERT_EQ(SummaryJobs().size(), 1u);
  const std::string summary = test::PdfWords(SummaryJobs().front());
  EXPECT_THAT(summary, HasSubstr("E1 S ASN-000501"));
  EXPECT_THAT(summary, Not(HasSubstr("YESTERDAY")));

  // A summary that cannot be printed is logged, and Term says so.
  host.system->fields["DocumentPrinter"] = "Nowhere";
  EXPECT_FALSE(run.rows->Term());
  EXPECT_EQ(host.LogMessages().back(),
            "Consignment Summary Print could not be printed on \"Nowhere\".");

  // The host finds no consignment of the run's vendor and carrier (the
  // consignments' vendor has lost its code): nothing to print, and the log says so.
  vendor->fields["VendorCode"] = Var();
  const std::size_t jobs = SummaryJobs().size();
  EXPECT_TRUE(run.rows->Term());
  EXPECT_EQ(SummaryJobs().size(), jobs);
  EXPECT_EQ(host.LogMessages().back(),
            "Consignment Summary Print: the host found no consignments of vendor \"ALP\" and carrier "
            "\"STE\" for " + Format(Var(Today()), "Short Date") + "; nothing was printed.");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Term");
}

}  // namespace
}  // namespace quendal
