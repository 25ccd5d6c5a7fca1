// Packing-slip work at a portable data terminal, on the label frame: the
// lookup line of a slip line and the pack-line check.
#include <gtest/gtest.h>

#include "labels/cStarTrackGenericSCM.h"
#include "tests/labels/LabelFixture.h"

namespace quendal {
namespace {

using test::MemoryHost;
using test::MemoryObject;

class PackingSlipTest : public test::LabelFixture {
 protected:
  void SetUp() override {
    LabelFixture::SetUp();
    job = host.Make<host::Job>({{"Reference", "WAVE-0314-A"}, {"Customer", "HBS0012345"}});
    tee = host.Make<host::Product>({{"Text1", "CLASSIC TEE, CREW NECK"},
                                    {"Text2", "WHITE"},
                                    {"Text3", "MEDIUM-LONG"},
                                    {"HasComponents", true},
                                    {"ComponentItem", "TEE-WHT-M-1-PACK-OF-3"},
                                    {"ComponentQty", 3}});
    remover = host.Make<host::Product>({{"Text1", "NAIL POLISH REMOVER"}, {"HasComponents", false},
                                        {"ComponentItem", "IGNORED"}});
    // Line 1 is full, line 3 carries the same article with room.
    lines = {Line(1, "9312345000012", 6, 6, tee), Line(2, "9312345000029", 4, 2, remover),
             Line(3, "9312345000012", 10, 4, tee)};
    order->fields["SlipLines"] = MemoryHost::List<host::PSlipLine>({lines[0], lines[1], lines[2]});
    ASSERT_TRUE(label.Init(host.system));
  }
  void TearDown() override {
    // The order lists its lines and each line names its order: undo that.
    order->fields.clear();
    LabelFixture::TearDown();
  }
  std::shared_ptr<MemoryObject<host::PSlipLine>> Line(int no, const char* apn, double qty, double packed,
                                                      std::shared_ptr<MemoryObject<host::Product>> product) {
    return host.Make<host::PSlipLine>(
        {{"LineNo", no}, {"APN", apn}, {"Qty", qty}, {"QtyPacked", packed}, {"Product", product}, {"Order", order}});
  }
  // Checks a pack line and returns the slip line found and System.LastError.
  std::pair<Var, int> Check(const Var& slip, const Var& pack, const char* apn, Var qty = Var(), int line = 0) {
    std::int16_t error = -1;
    const Var found = label.PackLineValid(slip, pack, Var(apn), qty, &error, line);
    EXPECT_EQ(error, host.system->Get("LastError").Whole());
    return {found, error};
  }
  Var Slip(std::size_t i) { return Var(std::shared_ptr<host::Object>(lines[i])); }

  clsStarTrackGenericSCM label;
  std::shared_ptr<MemoryObject<host::Job>> job;
  std::shared_ptr<MemoryObject<host::Product>> tee, remover;
  std::vector<std::shared_ptr<MemoryObject<host::PSlipLine>>> lines;
};

TEST_F(PackingSlipTest, FieldLengthsDescribeTheDensoLine) {
  EXPECT_EQ(label.PDTFieldLength(), "7,6,10,22,20,13,20,13,20,20,10,6,6,1,16,6");
}

TEST_F(PackingSlipTest, DensoLineIsFixedWidthAndAlways244Characters) {
  const std::string fields =
      "556677 "                  // vendor code of the slip line's order
      "HBS001"                   // the job's customer, cut
      "1         "               // line number
      "SO10045               "   // order number
      "WAVE-0314-A         "     // the job's reference
      "0412         "            // store number
      "Harbour Stores DC   "     // the order's receiver
      "9312345000012"            // APN
      "CLASSIC TEE, CREW NE"     // product texts, cut
      "WHITE               "
      "MEDIUM-LON"
      "6     "                   // quantity
      "      0"                  // spaces, then 0
      "TEE-WHT-M-1-PACK"         // component item and quantity
      "3     ";
  EXPECT_EQ(label.PDTLookupLine(job, lines[0]), fields + std::string(244 - 196, ' '));
  // Without components the last two fields are empty; a line break in a
  // host text would split the terminal's record, so it prints as a space.
  remover->fields["Text2"] = "100ML\r\nBOTTLE";
  const std::string second = label.PDTLookupLine(job, lines[1]);
  ASSERT_EQ(second.size(), 244u);
  EXPECT_EQ(second.substr(111, 60), "NAIL POLISH REMOVER 100ML  BOTTLE       " + std::string(10, ' ') + "4     " +
                                        std::string(4, ' '));
  EXPECT_EQ(second.substr(173, 71), "0" + std::string(70, ' '));
}

TEST_F(PackingSlipTest, DensoLineOfASlipLineWithoutOrderUsesItsDespatch) {
  auto loose = host.Make<host::PSlipLine>(
      {{"LineNo", 7}, {"APN", "9312345000029"}, {"Qty", 2}, {"Product", remover}, {"Despatch", despatch}});
  const std::string line = label.PDTLookupLine(job, loose);
  EXPECT_EQ(line.substr(0, 98),
            "ACME   HBS0017         PO778812 REL# 2       WAVE-0314-A         0900         Harbour Stores DC   ");
}

TEST_F(PackingSlipTest, VeltrinLineIsCommaSeparated) {
  host.system->fields["PDTType"] = "Veltrin6030";
  lines[0]->fields["APN"] = " 9312345000012 ";
  // A comma inside a value would shift every later value: it prints as a space.
  EXPECT_EQ(label.PDTLookupLine(job, lines[0]),
            "556677,1,HBS0012345,SO10045,WAVE-0314-A,0412,9312345000012,6,CLASSIC TEE  CREW NECK,"
            "TEE-WHT-M-1-PACK,3");
  EXPECT_EQ(label.PDTLookupLine(job, lines[1]),
            "556677,2,HBS0012345,SO10045,WAVE-0314-A,0412,9312345000029,4,NAIL POLISH REMOVER,,");
}

TEST_F(PackingSlipTest, OtherTerminalsGetNothing) {
  for (const Var& type : {Var("Symbol"), Var("denso"), Var()}) {
    host.system->fields["PDTType"] = type;
    EXPECT_EQ(label.PDTLookupLine(job, lines[0]), "");
  }
  EXPECT_TRUE(host.logs.empty());
}

TEST_F(PackingSlipTest, AnArticleOnTwoLinesFillsTheFirstWithRoom) {
  auto [found, error] = Check(Var(std::shared_ptr<host::Object>(order)), Var(pack), "9312345000012", Var(2));
  EXPECT_EQ(found, Slip(2));
  EXPECT_EQ(error, 0);
  // Asked by order number and pack number, the answer is the line's number.
  std::tie(found, error) = Check(Var("SO10045"), Var(1001), "9312345000012");
  EXPECT_EQ(found, Var(3));
  EXPECT_EQ(error, 0);
  // No pack to check against.
  std::tie(found, error) = Check(Var("SO10045"), Var(), "9312345000029", Var(2));
  EXPECT_EQ(found, Var(2));
  EXPECT_EQ(error, 0);
}

TEST_F(PackingSlipTest, EachReasonForRefusingIsInLastError) {
  const Var byObject{std::shared_ptr<host::Object>(order)};
  // Every line of the article would overflow.
  EXPECT_EQ(Check(byObject, Var(pack), "9312345000012", Var(7)), std::make_pair(Var(), 8103));
  // No line carries the article.
  EXPECT_EQ(Check(byObject, Var(pack), "9300000000000"), std::make_pair(Var(), 8102));
  EXPECT_EQ(Check(Var("SO10045"), Var(1001), "9300000000000"), std::make_pair(Var(0), 8102));
  // The pack belongs to another order, or to none that is known.
  auto other = MakePack(2002, "00093123450000000029");
  other->fields["Order"] = host.Make<host::Order>({{"OrderNo", "SO10046"}});
  EXPECT_EQ(Check(byObject, Var(other), "9312345000012"), std::make_pair(Var(), 8106));
  EXPECT_EQ(Check(Var("SO10045"), Var(9999), "9312345000012"), std::make_pair(Var(0), 8106));
  other->fields["Order"] = Var();
  EXPECT_EQ(Check(byObject, Var(other), "9312345000012"), std::make_pair(Var(), 8106));
  // The slip can't be found.
  EXPECT_EQ(Check(Var("SO99999"), Var(1001), "9312345000012"), std::make_pair(Var(0), 8101));
  EXPECT_TRUE(host.logs.empty());
}

TEST_F(PackingSlipTest, ALineIdLimitsTheMatchToThatLine) {
  const Var byNumber("SO10045");
  EXPECT_EQ(Check(byNumber, Var(1001), "9312345000012", Var(1), 3), std::make_pair(Var(3), 0));
  EXPECT_EQ(Check(byNumber, Var(1001), "9312345000012", Var(1), 1), std::make_pair(Var(0), 8103));
  EXPECT_EQ(Check(byNumber, Var(1001), "9312345000012", Var(1), 2), std::make_pair(Var(0), 8102));
  // Without aError the answer is the same.
  EXPECT_EQ(label.PackLineValid(byNumber, Var(1001), Var("9312345000029"), Var(2)), Var(2));
}

}  // namespace
}  // namespace quendal
