// Separator labels on the label frame (every class prints them the same
// way) and the pack-list run with separators between orders and styles.
#include "labels/Separator.h"

#include <gtest/gtest.h>

#include "frame/VB.h"
#include "labels/cStarTrackGenericSCM.h"
#include "tests/labels/LabelFixture.h"

namespace quendal {
namespace {

const std::string kFormatStart =
    "{F,9,A,R,E,600,400,\"SCMSEP\"|C,580,300,0,3,2,2,W,L,0,3,\"SEPARATOR\"|"
    "C,580,250,0,3,1,1,B,L,0,3,\"NEW STORE/ITEM/LOCATION:\"|";
const std::string kBatch = "{B,9,N,1|E,1,0,1,1,0,1|}";

// The five slots of the separator as the printer receives them.
std::string Slots(const std::string& one, const std::string& two, const std::string& three,
                  const std::string& four) {
  return "C,580,150,0,3,2,2,B,L,0,3,\"" + one + "\"|C,580,110,0,1,2,2,B,L,0,3,\"" + two +
         "\"|C,580,10,0,3,2,2,B,L,0,3,\"" + three + "\"|C,580,55,0,1,2,2,B,L,0,3,\"" + four + "\"|";
}
std::string Fifth(const std::string& five) { return "C,580,83,0,1,2,2,B,L,0,3,\"" + five + "\"|"; }

class SeparatorTest : public test::LabelFixture {
 protected:
  std::string Separated(const std::string& message) {
    EXPECT_TRUE(label.Separator("Dock 3", message));
    EXPECT_EQ(spooler->OpenHandles(), 0u);
    const auto jobs = TakeJobs();
    return jobs.size() == 1 ? jobs[0] : "(" + std::to_string(jobs.size()) + " jobs)";
  }
  void SetUp() override {
    LabelFixture::SetUp();
    ASSERT_TRUE(label.Init(host.system));
  }
  clsStarTrackGenericSCM label;
};

TEST_F(SeparatorTest, FiveLinesFillEverySlot) {
  EXPECT_EQ(Separated("Store 0412\r\nHarbour Stores Chadstone\r\nWomenswear\r\nAisle 4\r\nPallet 2 of 3"),
            kFormatStart + Slots("STORE 0412", "HARBOUR STORES CHADSTONE", "WOMENSWEAR", "AISLE 4") +
                Fifth("PALLET 2 OF 3") + "}" + kBatch);
  EXPECT_EQ(spooler->jobs.size(), 0u);
  EXPECT_TRUE(host.logs.empty());
}

TEST_F(SeparatorTest, FewerLinesStillMakeOneWellFormedFormat) {
  // Four lines: the format ends after the fourth slot.
  EXPECT_EQ(Separated("Store 0412\r\nChadstone\r\nWomenswear\r\nAisle 4"),
            kFormatStart + Slots("STORE 0412", "CHADSTONE", "WOMENSWEAR", "AISLE 4") + "}" + kBatch);
  // One line, or none: the other slots are sent empty.
  EXPECT_EQ(Separated("Store 0412"), kFormatStart + Slots("STORE 0412", "", "", "") + "}" + kBatch);
  EXPECT_EQ(Separated(""), kFormatStart + Slots("", "", "", "") + "}" + kBatch);
  // A line break at the very end opens no fifth line.
  EXPECT_EQ(Separated("a\nb\nc\nd\n"), kFormatStart + Slots("A", "B", "C", "D") + "}" + kBatch);
}

TEST_F(SeparatorTest, LinesAreCutToTheirSlotsAndMadeSafe) {
  const std::string twenty = "abcdefghijklmnopqrst";
  const std::string forty = "abcdefghijklmnopqrstuvwxyz0123456789ABCD";
  // Lines longer than their slots; the fifth takes the rest of the message,
  // its line breaks printed as spaces; quotes, pipes and braces would end a
  // packet or the format, so they go.
  EXPECT_EQ(Separated(forty + "\n" + forty + "\r" + forty + "\r\n" + forty + "\n" + "Line \"5\" | {x}\r\nsix"),
            kFormatStart +
                Slots("ABCDEFGHIJKLMNOPQRST", "ABCDEFGHIJKLMNOPQRSTUVWXYZ0123", "ABCDEFGHIJKLMNOPQRST",
                      "ABCDEFGHIJKLMNOPQRSTUVWXYZ0123") +
                Fifth("LINE 5  X  SIX") + "}" + kBatch);
  EXPECT_EQ(SeparatorJob(twenty + "\n\n\n\n" + forty + forty, "3"),
            kFormatStart + Slots(UCase(twenty), "", "", "") + Fifth(UCase(Left(forty + forty, 35))) +
                "}{B,9,N,1|E,3,0,1,1,0,1|}");
}

TEST_F(SeparatorTest, OnlyVpclPrintersGetOne) {
  for (const char* language : {"VPCL", "ZPL", "Axiohm", "WinPCL"}) {
    host.system->fields["PrinterLanguage"] = language;
    EXPECT_TRUE(label.Separator("Dock 3", "Store 0412")) << language;
    EXPECT_TRUE(spooler->jobs.empty()) << language;
    EXPECT_EQ(spooler->OpenHandles(), 0u);
    // Nothing is drawn either: no empty page comes out of the office printer.
    for (const auto& drawn : spooler->drawnJobs) EXPECT_FALSE(drawn->ended) << language;
  }
  EXPECT_TRUE(host.logs.empty());
}

TEST_F(SeparatorTest, APrinterThatDoesNotOpenTakesNone) {
  EXPECT_FALSE(label.Separator("Dock 9", "Store 0412"));
  EXPECT_EQ(host.LogMessages(), std::vector<std::string>{"Error 1801Unable to open printer Dock 9"});
  host.system->fields["PrinterLanguage"] = "WinPCL";
  EXPECT_FALSE(label.Separator("dock 3", "Store 0412"));
  EXPECT_EQ(host.logs.size(), 1u);
  EXPECT_TRUE(spooler->jobs.empty());
  EXPECT_EQ(spooler->OpenHandles(), 0u);
}

// A class that prints pack lists, on a layout that shows each pack's SSCC.
constexpr std::array<vpcl::Packet, 1> kPackets = {vpcl::Field{1, 18, 300, 20, 1, 1, 1, 'B', 'L'}};
constexpr std::array<BatchField, 1> kSsccField = {{{1, &LabelValues::SSCC}}};
constexpr LabelLayout kListLayout{"20", vpcl::Format{"IFSDJS", 600, 400, kPackets}, kSsccField};

class ListLabels : public PackListLabelPrinter {
 public:
  ListLabels() : PackListLabelPrinter("clsIFSDJsSCM", kListLayout) {}
};

class PackListTest : public test::LabelFixture {
 protected:
  void SetUp() override {
    LabelFixture::SetUp();
    auto second = host.Make<host::Order>({{"OrderNo", "SO10046"}, {"DeliveryAddress", host.Make<host::Address>()}});
    p1 = Styled(MakePack(1, "00093123450000000012"), "TEE-B");
    p1->fields["Attribute:DESCRIPTION"] = "Classic tee";
    p1->fields["Attribute:EAN/UPC"] = "9312345000012";
    p1->fields["Attribute:USER"] = "packer1";
    p1->fields["Attribute:JOBID"] = "J5001";
    p1->fields["Attribute:DELIVERYREF"] = "DR-0412";
    p2 = Styled(MakePack(2, "00093123450000000029"), "");
    p2->fields["Attribute:ITEM_STYLE/STOCKID"] = "TEE-A";
    p3 = Styled(MakePack(3, "00093123450000000036"), "TEE-B");
    p3->fields["Order"] = second;
    test::MemoryHost::Attach(conNote, {p1, p2, p3});
    list = test::MemoryHost::List<host::Pack>({p1, p2, p3});
    ASSERT_TRUE(labels.Init(host.system, "Dock 3"));
    TakeJobs();
  }
  std::shared_ptr<test::MemoryObject<host::Pack>> Styled(std::shared_ptr<test::MemoryObject<host::Pack>> p,
                                                         const std::string& style) {
    if (!style.empty()) p->fields["Attribute:STYLE"] = style;
    return p;
  }
  static std::string Label(const std::string& sscc) {
    return "{B,20,N,1|E,1,0,1,1,0,1|1,\"" + sscc + "\"|}";
  }
  std::string Sep(const std::string& message) { return labels.RatioSeparator(message) + "\r\n"; }

  ListLabels labels;
  std::shared_ptr<test::MemoryObject<host::Pack>> p1, p2, p3;
  std::shared_ptr<test::MemoryCollection<host::Collection<host::Pack>>> list;
};

TEST_F(PackListTest, RatioSeparatorIsTheSeparatorAsText) {
  EXPECT_EQ(labels.RatioSeparator("Store 0412\r\nChadstone"),
            kFormatStart + Slots("STORE 0412", "CHADSTONE", "", "") + "}" + kBatch);
  EXPECT_TRUE(TakeJobs().empty());
}

TEST_F(PackListTest, OneJobWithASeparatorBeforeEachOrder) {
  ASSERT_TRUE(labels.PrintAllLabels(list, true, false));
  const auto jobs = TakeJobs();
  ASSERT_EQ(jobs.size(), 1u);
  // The first pack's attributes, one line each; the fifth slot takes the rest.
  const std::string first = kFormatStart +
                            Slots("PACK ID 1", "STYLE TEE-B", "ITEM ID CLASSIC TEE", "APN 9312345000012") +
                            Fifth("USER ID PACKER1  JOB ID J5001  REFE") + "}" + kBatch + "\r\n";
  EXPECT_EQ(jobs[0], first + Label("093123450000000012") + Label("093123450000000029") +
                         Sep("PACK ID 3\r\nSTYLE TEE-B") + Label("093123450000000036"));
  EXPECT_EQ(spooler->OpenHandles(), 0u);

  ASSERT_TRUE(labels.PrintAllLabels(list, false, false));
  EXPECT_EQ(TakeJobs(), std::vector<std::string>{Label("093123450000000012") + Label("093123450000000029") +
                                                 Label("093123450000000036")});
}

TEST_F(PackListTest, StyleSortedRunsSeparateStylesAndEndWithOne) {
  ASSERT_TRUE(labels.PrintAllLabels(list, true, true));
  const auto jobs = TakeJobs();
  ASSERT_EQ(jobs.size(), 1u);
  const std::string two = Sep("PACK ID 2\r\nSTYLE TEE-A");
  const std::string three = Sep("PACK ID 3\r\nSTYLE TEE-B");
  const std::string one = Sep("PACK ID 1\r\nSTYLE TEE-B\r\nITEM ID Classic tee\r\nAPN 9312345000012\r\n"
                              "USER ID packer1\r\nJOB ID J5001\r\nREFER DR-0412");
  EXPECT_EQ(jobs[0], two + Label("093123450000000029") + one + Label("093123450000000012") + three +
                         Label("093123450000000036") + three);
}

TEST_F(PackListTest, APrinterThatDoesNotOpenPrintsNothing) {
  ASSERT_TRUE(labels.Init(host.system, "Dock 9"));
  host.logs.clear();
  EXPECT_FALSE(labels.PrintAllLabels(list, true, false));
  EXPECT_TRUE(TakeJobs().empty());
  EXPECT_EQ(host.logs.size(), 1u);
}

}  // namespace
}  // namespace quendal
