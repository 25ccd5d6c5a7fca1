#include <gtest/gtest.h>

#include <algorithm>
#include <set>

#include "labels/cAaEGenericSCM.h"
#include "tests/labels/DrawnPage.h"
#include "tests/labels/LabelFixture.h"
#include "tests/support/Barcodes.h"

namespace quendal {
namespace {

// The second of three cartons of an overnight consignment, weighing 7.5 kg:
// its whole format, its data written into the constant texts, then a batch
// of one label.
const std::string kReceiver =
    "{F,460,A,R,E,600,400,\"AAE\"|C,550,12,0,2,1,1,B,L,0,0,\"HARBOUR STORES CHADSTONE\"|"
    "C,532,12,0,2,1,1,B,L,0,0,\"SHOP 210\"|C,514,12,0,2,1,1,B,L,0,0,\"\"|"
    "C,488,12,0,3,1,1,B,L,0,0,\"CHADSTONE VIC 3148\"|";
const std::string kConsignment =
    "C,395,15,0,3,3,3,B,L,0,0,\"O/N\"|C,445,190,0,3,1,1,B,L,0,0,\"SRX0001234567\"|"
    "C,415,220,0,3,1,1,B,L,0,0,\"7.50 KG\"|C,385,220,0,3,1,1,B,L,0,0,\"2 of 3\"|"
    "C,345,15,0,1,1,1,O,L,0,0,\"Date Packed 14/03/24\"|";
const std::string kSender =
    "C,305,12,0,2,1,1,B,L,0,0,\"Acme Apparel Pty Ltd\"|C,289,12,0,1,1,1,O,L,0,0,\"12 Example "
    "Road\"|"
    "C,277,12,0,1,1,1,O,L,0,0,\"DANDENONG SOUTH VIC\"|C,250,115,0,1,1,1,B,L,0,0,\"PO PO778812 REL# "
    "2\"|"
    "C,236,115,0,1,1,1,B,L,0,0,\"SO SO10045\"|C,212,12,0,1,1,1,O,L,0,0,\"\"|"
    "C,198,12,0,1,1,1,O,L,0,0,\"\"|";
const std::string kBottom =
    "C,95,12,0,3,2,2,B,L,0,0,\"3148\"|C,55,12,0,3,1,1,B,L,0,0,\"VIC\"|"
    "C,18,185,0,1,1,1,B,L,0,0,\"OUH00002\"|B,1,8,F,35,179,8,6,100,8,L,0|R,1,\"OUH00002\"|";
const std::string kFrame =
    "Q,175,351,591,385,4,\"11111111\"|Q,470,5,591,345,4,\"11111111\"|Q,330,5,465,345,4,"
    "\"11111111\"|"
    "Q,175,5,325,345,4,\"11111111\"|C,585,357,0,3,1,1,B,L,0,3,\"AUSTRALIAN AIR EXPRESS\"|"
    "C,575,12,0,1,1,1,O,L,0,0,\"AUSTALIAN AIR EXPRESS DELIVER "
    "TO:\"|C,415,150,0,1,1,1,O,L,0,0,\"WEIGHT\"|"
    "C,250,12,0,1,1,1,O,L,0,0,\"SENDER REF: \"|C,445,150,0,1,1,1,O,L,0,0,\"C/N:\"|}";
const std::string kOneLabel = "{B,460,N,1|E,1,0,1,1,0,1|}";
const std::string kSecondCarton = kReceiver + kConsignment + kSender + kBottom + kFrame + kOneLabel;

class AaEGenericTest : public test::LabelFixture {
 protected:
  void SetUp() override {
    LabelFixture::SetUp();
    conNote->fields["Service"] = " OVERNIGHT ";
    second = MakePack(1002, "00093123450000000029");
    second->fields["Weight"] = 7.5;
    test::MemoryHost::Attach(conNote, {pack, second, MakePack(1003, "00093123450000000036")});
    ASSERT_TRUE(label.Init(host.system, "Dock 3"));
  }
  std::string Printed(const Ref<host::Pack>& p) {
    EXPECT_TRUE(label.PrintLabel(p));
    const auto jobs = TakeJobs();
    return jobs.size() == 1 ? jobs[0] : "(" + std::to_string(jobs.size()) + " jobs)";
  }

  clsAaEGenericSCM label;
  std::shared_ptr<test::MemoryObject<host::Pack>> second;
};

TEST_F(AaEGenericTest, EveryLabelCarriesItsWholeFormatAndNothingWaitsOnThePrinter) {
  EXPECT_EQ(spooler->opens, 0);  // Init sent nothing
  EXPECT_EQ(Printed(second), kSecondCarton);
  EXPECT_EQ(label.VPCLIIBatchCommand(), kSecondCarton);

  // A pallet is one label too; a service AaE does not know has no codes.
  carton->fields["Code"] = "PLT01";
  conNote->fields["Service"] = "overnight";
  const std::string pallet = Printed(pack);
  EXPECT_NE(pallet.find("|C,395,15,0,3,3,3,B,L,0,0,\"\"|"), std::string::npos);
  EXPECT_NE(pallet.find("|R,1,\"00001\"|"), std::string::npos);
  EXPECT_TRUE(pallet.ends_with("|}" + kOneLabel));

  // Without an advance shipping notice there is no consignment: no number, no article.
  second->fields["ASNId"] = Var();
  const std::string bare = Printed(second);
  EXPECT_NE(bare.find("|C,445,190,0,3,1,1,B,L,0,0,\"\"|"), std::string::npos);
  EXPECT_NE(bare.find("|R,1,\"\"|"), std::string::npos);
}

TEST_F(AaEGenericTest, HostTextsCannotBreakTheFormatTheyAreWrittenInto) {
  host.Make<host::Receiver>(
      {{"Code", "0555"}, {"PartnerId", 1}, {"Name", "Bob's \"Best\" | {Shop}\r\n2"}});
  second->fields["StoreCode"] = "0555";
  const std::string job = Printed(second);
  EXPECT_TRUE(job.starts_with(
      "{F,460,A,R,E,600,400,\"AAE\"|C,550,12,0,2,1,1,B,L,0,0,\"BOB'S BEST  SHOP  2\"|"))
      << job;
  // Still one format and one batch.
  EXPECT_EQ(std::count(job.begin(), job.end(), '{'), 2);
  EXPECT_EQ(std::count(job.begin(), job.end(), '}'), 2);
}

class AaEDrawnTest : public AaEGenericTest, public ::testing::WithParamInterface<int> {};

TEST_P(AaEDrawnTest, TheFixedBarcodeReadsBack) {
  clsAaEGenericSCM drawn;
  const std::string page = test::DrawnPage(drawn, host.system, second, GetParam());
  EXPECT_EQ(test::ReadCode128Barcodes(page), std::set<std::string>{"OUH00002"});
}

INSTANTIATE_TEST_SUITE_P(Resolutions, AaEDrawnTest, ::testing::Values(203, 300));

}  // namespace
}  // namespace quendal
