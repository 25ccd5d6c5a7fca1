// The label classes that print the reference values in a format of their
// own (DFE, Hunter, IFS): each downloads its format once at Init and sends
// one batch per carton; drawn on an ordinary printer, each barcode reads
// back as its element string.
#include <gtest/gtest.h>

#include <cmath>
#include <set>
#include <tuple>

#include "frame/Catalogue.h"
#include "labels/Preview.h"
#include "labels/VpclLabel.h"
#include "tests/labels/DrawnPage.h"
#include "tests/labels/LabelFixture.h"
#include "tests/support/Barcodes.h"

namespace quendal {
namespace {

// The fixture's carton, field group by field group.
const std::string kAddress =
    "1,\"Acme Apparel Pty Ltd\"|2,\"DANDENONG SOUTH\"|3,\"VIC\"|4,\"Southern Road Expres\"|"
    "5,\"SRX0001234567\"|6,\"HARBOUR STORES CHADSTONE\"|7,\"\"|8,\"CHADSTONE VIC 3148\"|"
    "10,\"12 Example Road\"|11,\"SHOP 210\"|";
const std::string kPostcode = "12,\"3148\"|13,\"VIC\"|";
const std::string kOrder = "20,\"PO PO778812 REL# 2\"|21,\"SO SO10045\"|";
const std::string kTail =
    "26,\"\"|27,\"\"|28,\"CHADSTONE\"|29,\"3148 EXP\"|30,\"SERVICE:EXP\"|31,\"Date Packed "
    "14/03/24\"|"
    "32,\"Not Before  15/03/24\"|33,\"Not After   20/03/24\"|34,\"C/N:SRX0001234567\"|";
const std::string kSscc =
    "19,\"(00)093123450000000012\"|24,\"~20100093123450000000012\"|25,\"(00)093123450000000012\"|";
const std::string kShipTo = "17,\"~2014210363148\"|18,\"(421)0363148\"|";

std::string Batch(const std::string& number, const std::string& fields) {
  return "{B," + number + ",N,1|E,1,0,1,1,0,1|" + fields + "}";
}

struct Case {
  const char* className;
  std::string header;
  std::string batch;
  std::set<std::string> barcodes;  // read back from the drawn label
};

const std::string kSsccText = "(00)093123450000000012";
const std::string kShipToText = "(421)0363148";

const Case kCases[] = {
    {"clsDFESCM",
     "{F,480,A,R,E,800,400,\"DFESCM\"|",
     Batch("480", kAddress + kPostcode + kOrder + kTail),
     {}},
    {"clsDFESCMWinPCL",
     "{F,480,A,R,E,800,400,\"DFESCM\"|",
     Batch("480", kAddress + kPostcode + kOrder + kTail + kShipTo),
     {kShipToText}},
    {"clsDFESCMsscc",
     "{F,482,A,R,E,600,400,\"DFESSCC\"|",
     Batch("482", kAddress + kShipTo + kSscc + kOrder + kTail),
     {kSsccText, kShipToText}},
    {"clsSCMnoSSCC",
     "{F,480,A,R,M,2000,1016,\"DFESCM\"|",
     Batch("480", kAddress + kPostcode + kOrder + kTail),
     {}},
    {"clsHunterGenericSCM",
     "{F,530,A,R,E,600,400,\"1HUNTER\"|",
     Batch("530", kAddress + kPostcode + kOrder + kTail),
     {}},
    {"clsIFSDJsSCM",
     "{F,20,A,R,E,600,400,\"IFSDJS\"|",
     Batch("20", kAddress + "9,\"0412\"|35,\"LEVEL 2\"|" + kSscc + kOrder + kTail),
     {kSsccText}},
    {"clsIFSAPISCM",
     "{F,750,A,R,E,600,400,\"IFSAPI\"|",
     Batch("750", kAddress + kSscc + kOrder + kTail),
     {kSsccText}},
};

class PlainLabelTest : public test::LabelFixture {
 protected:
  // A new object of the class, with the store zone the fixture's despatch names.
  std::unique_ptr<Component> Make(const std::string& className) {
    auto object = CreateObject("Quendal." + className).object;
    if (auto* label = as<LabelInterface>(object)) label->SetStoreZoneDept("LEVEL 2");
    return object;
  }
};

class EachPlainLabel : public PlainLabelTest, public ::testing::WithParamInterface<Case> {};

TEST_P(EachPlainLabel, InitSendsTheFormatAndEachCartonItsBatch) {
  const Case& c = GetParam();
  auto object = Make(c.className);
  auto* label = as<LabelInterface>(object);
  ASSERT_NE(label, nullptr);
  ASSERT_TRUE(label->Init(host.system, "Dock 3"));
  const auto formats = TakeJobs();
  ASSERT_EQ(formats.size(), 1u);
  EXPECT_TRUE(formats[0].starts_with(c.header)) << formats[0];
  EXPECT_TRUE(formats[0].ends_with("|}"));
  EXPECT_EQ(label->PrintVPCLII(), formats[0]);
  EXPECT_TRUE(label->PrintLabel(pack));
  EXPECT_EQ(TakeJobs(), std::vector<std::string>{c.batch});
}

INSTANTIATE_TEST_SUITE_P(Classes, EachPlainLabel, ::testing::ValuesIn(kCases),
                         [](const auto& info) { return std::string(info.param.className); });

class EachPlainLabelDrawn : public PlainLabelTest,
                            public ::testing::WithParamInterface<std::tuple<Case, int>> {};

TEST_P(EachPlainLabelDrawn, BarcodesReadBackAsTheirElementStrings) {
  const auto& [c, dpi] = GetParam();
  auto object = Make(c.className);
  const std::string page = test::DrawnPage(*as<LabelInterface>(object), host.system, pack, dpi);
  ASSERT_FALSE(page.empty());
  EXPECT_EQ(test::ReadCode128Barcodes(page), c.barcodes);
  EXPECT_TRUE(host.logs.empty());
}

INSTANTIATE_TEST_SUITE_P(Classes, EachPlainLabelDrawn,
                         ::testing::Combine(::testing::ValuesIn(kCases),
                                            ::testing::Values(203, 300)),
                         [](const auto& info) {
                           return std::string(std::get<0>(info.param).className) + "_" +
                                  std::to_string(std::get<1>(info.param));
                         });

// The DFE label, 800 x 400, whole.
const std::string kDfeFormat =
    "{F,480,A,R,E,800,400,\"DFESCM\"|T,28,34,V,762,5,0,3,1,2,B,L,0,0,0|T,29,20,V,738,5,0,3,1,1,B,L,"
    "0,0,0|"
    "T,34,30,V,738,190,0,3,1,1,B,L,0,0,0|L,S,723,2,723,398,6,\"11111111\"|"
    "C,710,5,0,1,1,1,O,L,0,0,\"FROM:\"|T,1,25,V,710,48,0,1,1,1,O,L,0,0,0|"
    "T,10,25,V,698,5,0,1,1,1,O,L,0,0,0|T,2,25,V,686,5,0,1,1,1,O,L,0,0,0|"
    "T,3,3,V,686,150,0,1,1,1,O,L,0,0,0|C,710,230,0,1,1,1,O,L,0,0,\"CARRIER:\"|"
    "T,4,20,V,698,230,0,1,1,1,B,L,0,0,0|T,30,40,V,686,230,0,1,1,1,B,L,0,0,0|"
    "L,S,675,2,675,398,2,\"11111111\"|C,660,5,0,1,2,1,O,L,0,0,\"TO:\"|"
    "T,6,40,V,636,5,0,1,2,1,B,L,0,0,0|T,11,40,V,616,5,0,1,2,1,B,L,0,0,0|"
    "T,7,40,V,596,5,0,1,2,1,B,L,0,0,0|T,8,50,V,576,5,0,1,2,1,B,L,0,0,0|"
    "L,S,560,2,560,398,2,\"11111111\"|C,545,5,0,1,1,1,O,L,0,0,\"CONNOTE:\"|"
    "T,5,13,V,510,5,0,3,2,2,B,L,0,0,0|L,S,495,2,495,398,2,\"11111111\"|"
    "T,20,25,V,480,5,0,1,2,1,B,L,0,0,0|T,21,25,V,460,5,0,1,2,1,B,L,0,0,0|"
    "T,31,30,V,480,250,0,1,1,1,O,L,0,0,0|T,32,30,V,468,250,0,1,1,1,O,L,0,0,0|"
    "T,33,30,V,456,250,0,1,1,1,O,L,0,0,0|T,26,30,V,435,5,0,1,2,1,B,L,0,0,0|"
    "T,27,30,V,415,5,0,1,2,1,B,L,0,0,0|L,S,400,2,400,398,2,\"11111111\"|"
    "C,385,5,0,1,1,1,O,L,0,0,\"POSTCODE\"|T,12,4,V,290,5,0,3,4,4,B,L,0,0,0|"
    "C,385,230,0,1,1,1,O,L,0,0,\"STATE\"|T,13,3,V,290,230,0,3,3,4,B,L,0,0,0|"
    "L,S,235,2,235,398,2,\"11111111\"|B,17,27,V,80,40,8,4,130,8,L,0|T,18,30,V,60,60,0,1,1,1,B,L,0,"
    "0,0|}";

TEST_F(PlainLabelTest, BothDfeClassesFillOneFormat) {
  for (const char* className : {"clsDFESCM", "clsDFESCMWinPCL"})
    EXPECT_EQ(as<LabelInterface>(Make(className))->PrintVPCLII(), kDfeFormat) << className;
}

// The label without an SSCC is the DFE label measured in tenths of a
// millimetre: drawn or previewed, it comes out the size of the same label
// in inches, its texts as large.
TEST_F(PlainLabelTest, TheMetricLabelKeepsItsSize) {
  auto inches = Make("clsDFESCM");
  auto metric = Make("clsSCMnoSSCC");
  const auto Drawing = [&](const std::unique_ptr<Component>& object) {
    auto* label = as<LabelInterface>(object);
    label->Init(host.system);
    label->PrintLabel(pack, std::nullopt, true);
    return LayOutLabel(ReadVpclLabel(label->PrintVPCLII(), label->VPCLIIBatchCommand()));
  };
  const LabelDrawing a = Drawing(inches);
  const LabelDrawing b = Drawing(metric);
  EXPECT_NEAR(a.height, 200, 1);
  EXPECT_NEAR(b.height, a.height, 4);  // 200 mm against 8 inches
  EXPECT_NEAR(b.width, a.width, 1);
  const auto Connote = [](const LabelDrawing& d) {
    for (const LabelItem& item : d.items)
      if (const auto* t = std::get_if<LabelText>(&item); t && t->text == "SRX0001234567") return *t;
    return LabelText{};
  };
  // Rows count from the bottom edge.
  EXPECT_NEAR(b.height - Connote(b).y, a.height - Connote(a).y, 1);
  EXPECT_EQ(Connote(b).height, Connote(a).height);

  const auto Preview = [&](const std::unique_ptr<Component>& object) {
    auto* label = as<LabelInterface>(object);
    return preview::Printer().Print(label->PrintVPCLII() + label->VPCLIIBatchCommand());
  };
  const auto p = Preview(inches);
  const auto q = Preview(metric);
  ASSERT_EQ(p.pages.size(), 1u);
  ASSERT_EQ(q.pages.size(), 1u);
  const auto Box = [](const preview::Page& page) {
    for (const auto& t : page.texts)
      if (t.text == "SRX0001234567") return t.box;
    return CanvasBox{};
  };
  const CanvasBox in = Box(p.pages[0]);
  const CanvasBox mm = Box(q.pages[0]);
  EXPECT_GT(in.y2 - in.y1, 20);
  EXPECT_NEAR(mm.y2 - mm.y1, in.y2 - in.y1, 1);
  EXPECT_NEAR(mm.x2 - mm.x1, in.x2 - in.x1, 1);
  EXPECT_NEAR(q.pages[0].height - mm.y1, p.pages[0].height - in.y1, 2);
}

TEST_F(PlainLabelTest, TheDfeSsccLabelShipsToAustraliaWhateverTheCountryCode) {
  store->fields["CountryCode"] = "554";
  auto object = Make("clsDFESCMsscc");
  auto* label = as<LabelInterface>(object);
  ASSERT_TRUE(label->Init(host.system));
  ASSERT_TRUE(label->PrintLabel(pack, std::nullopt, true));
  EXPECT_NE(label->VPCLIIBatchCommand().find("|" + kShipTo), std::string::npos);
  // It also prints what the host hands over as text.
  EXPECT_NE(as<PrintFileInterface>(object), nullptr);
}

TEST_F(PlainLabelTest, TheDavidJonesLabelPrintsAPackListWithSeparators) {
  auto second = MakePack(1002, "00093123450000000029");
  auto otherOrder = host.Make<host::Order>(
      {{"OrderNo", "SO10046"}, {"DeliveryAddress", host.Make<host::Address>()}});
  second->fields["Order"] = otherOrder;
  test::MemoryHost::Attach(conNote, {pack, second});
  auto object = Make("clsIFSDJsSCM");
  auto* packs = as<PackListInterface>(object);
  ASSERT_NE(packs, nullptr);
  ASSERT_TRUE(as<LabelInterface>(object)->Init(host.system, "Dock 3"));
  TakeJobs();
  ASSERT_TRUE(
      packs->PrintAllLabels(test::MemoryHost::List<host::Pack>({pack, second}), true, false));
  // A separator before each order's cartons, each carton's batch with its store.
  const auto jobs = TakeJobs();
  ASSERT_EQ(jobs.size(), 1u);
  EXPECT_TRUE(jobs[0].starts_with(packs->RatioSeparator("PACK ID 1001") + "\r\n{B,20,N,1|"))
      << jobs[0];
  EXPECT_NE(jobs[0].find("|}" + packs->RatioSeparator("PACK ID 1002") + "\r\n{B,20,N,1|"),
            std::string::npos);
  EXPECT_NE(jobs[0].find("|9,\"0412\"|35,\"LEVEL 2\"|19,\"(00)093123450000000029\"|"),
            std::string::npos);
}

}  // namespace
}  // namespace quendal
