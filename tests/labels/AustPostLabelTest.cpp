// The Australia Post article labels: the graphic and format download, one
// carton's batch, the article of each carton as the eParcel manifest lists
// it, the parcel or express format by the consignment's service level, and
// the drawn label's barcodes.
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <optional>
#include <pugixml.hpp>
#include <set>

#include "frame/Catalogue.h"
#include "labels/AustPostLabel.h"
#include "labels/Graphics.h"
#include "labels/cAustPostDespatchSCM.h"
#include "labels/cAustPostSCM.h"
#include "platform/FileSystem.h"
#include "tests/labels/DrawnPage.h"
#include "tests/labels/LabelFixture.h"
#include "tests/support/Barcodes.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

using Strings = std::vector<std::string>;

const std::string kGraphic = "{G,99,A,R,G,1080,489,0,\"AP\"|1,1,H,2,\"F0F0\"|3,1,H,2,\"0F0F\"|}";
const std::string kParcelHeader = "{F,952,A,R,E,600,400,\"APEP\"|G,99,532,241,0,0|";
const std::string kExpressHeader = "{F,952,A,R,E,600,400,\"APEX\"|G,99,545,243,0,0|";

// The second of three cartons sent to J Smith.
const std::string kSecondCarton =
    "{B,952,N,1|E,1,0,1,1,0,1|1,\"J SMITH\"|2,\"5 SAMPLE STREET\"|3,\"\"|4,\"RICHMOND VIC 3121\"|"
    "5,\"Leave at the side door\"|6,\"SIGNATURE ON DELIVERY REQUIRED\"|7,\"NPP11234567\"|8,\"2 of "
    "3\"|"
    "9,\"3 PC\"|10,\"NPP11234567025024\"|11,\"NPP11234567025024\"|12,\"NPP11234567025024\"|"
    "13,\"SSCC: (00)093123450000000029\"|14,\"~20100093123450000000029\"|15,\"Acme Apparel Pty "
    "Ltd\"|"
    "16,\"12 Example Road\"|17,\"DANDENONG SOUTH VIC\"|18,\"PO PO778812 REL# 2\"|19,\"SO SO10045\"|"
    "20,\"Date Packed 14/03/24\"|}";

class AustPostTest : public test::LabelFixture {
 protected:
  void SetUp() override {
    LabelFixture::SetUp();
    const char* graphics = std::getenv("QUENDAL_GRAPHICS_DIR");
    savedGraphics = graphics ? std::optional<std::string>(graphics) : std::nullopt;
    ::setenv("QUENDAL_GRAPHICS_DIR", graphicsDir.path().c_str(), 1);
    test::WriteText(graphicsDir / std::string(kAustPostGraphicFile),
                    "1,1,H,2,\"F0F0\"|3,1,H,2,\"0F0F\"|");

    // The postal carrier's account and the consignment of three cartons to J Smith.
    vendor->fields["VendorId"] = 1;
    carrier->fields = {{"CarrierId", 2},           {"Name", "Australia Post"},
                       {"Options", "EP"},          {"AccountRef", "NPP1"},
                       {"AccountNumber", "98765"}, {"FileFolder", manifestDir.path() + "/"}};
    order->fields["DeliveryAddress"] = host.Make<host::Address>({{"Name", "J \"Smith\""},
                                                                 {"Line1", "5 Sample Street"},
                                                                 {"Suburb", "Richmond"},
                                                                 {"State", "Vic"},
                                                                 {"Postcode", "3121"}});
    conNote->fields["ConNoteId"] = 102;
    conNote->fields["ConNoteDate"] = DateTime::FromParts(2024, 3, 14, 9, 0);
    conNote->fields["ServiceLevel"] = "STANDARD";
    conNote->fields["DeliveryInstructions"] = "Leave at the side door";
    conNote->fields["Vendor"] = vendor;
    conNote->fields["Carrier"] = carrier;
    conNote->fields["Orders"] = test::MemoryHost::List<host::Order>({order});
    packs = {pack, MakePack(1002, "00093123450000000029"), MakePack(1003, "00093123450000000036")};
    test::MemoryHost::Attach(conNote, packs);
  }
  void TearDown() override {
    if (savedGraphics)
      ::setenv("QUENDAL_GRAPHICS_DIR", savedGraphics->c_str(), 1);
    else
      ::unsetenv("QUENDAL_GRAPHICS_DIR");
    LabelFixture::TearDown();
  }
  std::string Printed(const Ref<host::Pack>& p) {
    EXPECT_TRUE(label.PrintLabel(p));
    const auto jobs = TakeJobs();
    return jobs.size() == 1 ? jobs[0] : "(" + std::to_string(jobs.size()) + " jobs)";
  }
  // The article ids the eParcel manifest lists for the consignment.
  Strings ManifestArticles() {
    host.Make<host::Partner>({{"PartnerId", 1}});
    host.Make<host::EDIDocument>({{"ID", 7},
                                  {"VendorId", 1},
                                  {"PartnerId", 1},
                                  {"CarrierId", 2},
                                  {"OutputFolder", manifestDir.path() + "/"}});
    auto object = CreateObject("Quendal.clseParcelManifestxml").object;
    auto* rows = as<RowInterface>(object);
    Grid columns, grid;
    LogList log;
    EXPECT_TRUE(rows->Init(host.system, 7, columns));
    EXPECT_EQ(rows->Load("", grid), 1);
    EXPECT_EQ(rows->Process(0, log), 102);
    EXPECT_TRUE(rows->Term());
    Strings ids;
    for (const auto& entry : std::filesystem::directory_iterator(manifestDir.path())) {
      pugi::xml_document doc;
      EXPECT_TRUE(doc.load_string(test::ReadText(entry.path().string()).c_str()));
      for (const auto& node : doc.select_nodes("//ArticleNumber"))
        ids.push_back(node.node().child_value());
    }
    return ids;
  }

  test::TempFolder graphicsDir;
  test::TempFolder manifestDir;
  std::optional<std::string> savedGraphics;
  std::vector<std::shared_ptr<test::MemoryObject<host::Pack>>> packs;
  clsAustPostSCM label;
};

TEST_F(AustPostTest, InitSendsTheGraphicAsStoredThenTheParcelFormat) {
  ASSERT_TRUE(label.Init(host.system, "Dock 3"));
  const auto jobs = TakeJobs();
  ASSERT_EQ(jobs.size(), 1u);
  EXPECT_TRUE(jobs[0].starts_with(kGraphic + kParcelHeader)) << jobs[0];
  EXPECT_EQ(jobs[0], kGraphic + label.PrintVPCLII());
  EXPECT_TRUE(host.logs.empty());
  // The labels that follow are batches alone.
  EXPECT_EQ(Printed(packs[1]), kSecondCarton);
}

TEST_F(AustPostTest, WithoutItsGraphicFileTheFormatStillGoesAndTheOperatorIsTold) {
  std::filesystem::remove(graphicsDir / std::string(kAustPostGraphicFile));
  ASSERT_TRUE(label.Init(host.system, "Dock 3"));
  const auto jobs = TakeJobs();
  ASSERT_EQ(jobs.size(), 1u);
  EXPECT_TRUE(jobs[0].starts_with(kParcelHeader));
  EXPECT_EQ(host.LogMessages(), Strings{"Graphic 99 not sent: cannot read " +
                                        graphicsDir / std::string(kAustPostGraphicFile)});
  // The graphic installed with the library is found where the library was built.
  ::unsetenv("QUENDAL_GRAPHICS_DIR");
  EXPECT_TRUE(ReadGraphic(GraphicPath(kAustPostGraphicFile)));
}

TEST_F(AustPostTest, EachCartonCarriesTheArticleTheManifestListsForIt) {
  ASSERT_TRUE(label.Init(host.system, "Dock 3"));
  TakeJobs();
  Strings printed;
  for (const auto& p : packs) {
    const std::string job = Printed(p);
    const std::size_t at = job.find("|11,\"") + 5;
    printed.push_back(job.substr(at, job.find('"', at) - at));
  }
  EXPECT_EQ(printed, ManifestArticles());
  EXPECT_EQ(printed, (Strings{"NPP11234567015025", "NPP11234567025024", "NPP11234567035023"}));

  // A carton its consignment does not list yet joins it last.
  auto stray = MakePack(1004, "00093123450000000043");
  stray->fields["ConNote"] = conNote;
  const std::string job = Printed(stray);
  EXPECT_NE(job.find("|8,\"4 of 4\"|9,\"4 PC\"|10,\"NPP11234567045022\"|"), std::string::npos)
      << job;
}

TEST_F(AustPostTest, ExpressParcelsTakeTheExpressFormatAndEachLabelFindsItsFormatOnThePrinter) {
  ASSERT_TRUE(label.Init(host.system, "Dock 3"));
  TakeJobs();
  conNote->fields["ServiceLevel"] = "EXPRESS";
  // The printer holds the parcel format under the same number: the express
  // format goes along with the first express label only.
  std::string job = Printed(packs[0]);
  ASSERT_TRUE(job.starts_with(kExpressHeader)) << job;
  EXPECT_EQ(job, label.PrintVPCLII() + label.VPCLIIBatchCommand());
  EXPECT_TRUE(Printed(packs[1]).starts_with("{B,952,N,1|"));
  conNote->fields["ServiceLevel"] = "Express";  // not express
  EXPECT_TRUE(Printed(packs[2]).starts_with(kParcelHeader));
  EXPECT_TRUE(Printed(packs[2]).starts_with("{B,952,N,1|"));
}

TEST_F(AustPostTest, APrinterThatMissedTheDownloadGetsGraphicAndFormatWithTheFirstLabel) {
  EXPECT_TRUE(label.Init(host.system, "Dock 9"));  // not there: nothing sent
  spooler->AddPrinter("Dock 9");
  const std::string job = Printed(packs[1]);
  EXPECT_EQ(job, kGraphic + label.PrintVPCLII() + kSecondCarton);
  EXPECT_EQ(Printed(packs[1]), kSecondCarton);
}

class AustPostDrawnTest : public AustPostTest, public ::testing::WithParamInterface<int> {};

TEST_P(AustPostDrawnTest, TheSsccAndTheArticleReadBack) {
  clsAustPostDespatchSCM drawn;
  const std::string page = test::DrawnPage(drawn, host.system, packs[1], GetParam());
  EXPECT_EQ(test::ReadCode128Barcodes(page),
            (std::set<std::string>{"(00)093123450000000029", "NPP11234567025024"}));
}

INSTANTIATE_TEST_SUITE_P(Resolutions, AustPostDrawnTest, ::testing::Values(203, 300));

}  // namespace
}  // namespace quendal
