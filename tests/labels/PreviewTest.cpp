// Pictures of printer jobs: the reference VPCL II label and the ZPL store
// label drawn at the printer's resolution, their barcodes read back by an
// independent reader, every text on the label.
#include "labels/Preview.h"

#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <random>

#include "labels/Separator.h"
#include "labels/cMayneCMLSCM.h"
#include "labels/cStarTrackGenericSCM.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "tests/labels/LabelFixture.h"
#include "tests/support/Barcodes.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;

class PreviewFixture : public test::LabelFixture {
 protected:
  // The label of the fixture's carton as the class would send it: the
  // format its Init downloads, then the batch (or the ZPL label).
  template <class Label>
  std::string Job(Label& label, bool zpl) {
    EXPECT_TRUE(label.Init(host.system));
    EXPECT_TRUE(label.PrintLabel(pack, std::nullopt, true));
    return zpl ? label.PrintZPL() : label.PrintVPCLII() + label.VPCLIIBatchCommand();
  }
  static void ExpectTextsOnTheLabel(const preview::Page& page) {
    for (const auto& t : page.texts) {
      EXPECT_GE(t.box.x1, 0) << t.text;
      EXPECT_GE(t.box.y1, 0) << t.text;
      EXPECT_LE(t.box.x2, page.width) << t.text;
      EXPECT_LE(t.box.y2, page.height) << t.text;
    }
  }
  static bool Shows(const preview::Page& page, const std::string& text) {
    for (const auto& t : page.texts)
      if (t.text == text) return true;
    return false;
  }
};

class PreviewTest : public PreviewFixture, public ::testing::WithParamInterface<int> {};

TEST_P(PreviewTest, ReferenceLabelAsTheThermalPrinterPrintsIt) {
  clsStarTrackGenericSCM label;
  preview::Printer printer({GetParam()});
  const preview::Result result = printer.Print(Job(label, false));
  ASSERT_EQ(result.pages.size(), 1u);
  EXPECT_TRUE(result.notes.empty());
  const preview::Page& page = result.pages[0];
  // 6 x 4 inches, the format's 600 x 400 hundredths.
  EXPECT_EQ(page.width, 4 * GetParam());
  EXPECT_EQ(page.height, 6 * GetParam());
  EXPECT_EQ(test::ReadGs1Barcodes(page.png),
            (std::set<std::string>{"(00)093123450000000012", "(421)0363148"}));
  EXPECT_TRUE(Shows(page, "HARBOUR STORES CHADSTONE"));
  EXPECT_TRUE(Shows(page, "C/N:SRX0001234567"));
  ExpectTextsOnTheLabel(page);
}

TEST_P(PreviewTest, ZplStoreLabelAsTheZebraPrintsIt) {
  clsMayneCMLSCM label;
  preview::Printer printer({GetParam()});
  const preview::Result result = printer.Print(Job(label, true));
  // The stream's leading empty label prints nothing.
  ASSERT_EQ(result.pages.size(), 1u);
  const preview::Page& page = result.pages[0];
  EXPECT_EQ(page.width, std::lround(101.6 / 25.4 * GetParam()));
  EXPECT_EQ(test::ReadGs1Barcodes(page.png),
            (std::set<std::string>{"(00)093123450000000012", "(421)0363029(90)0412"}));
  EXPECT_TRUE(Shows(page, "STORE ZONE/DEPT"));
  ExpectTextsOnTheLabel(page);
}

INSTANTIATE_TEST_SUITE_P(Resolutions, PreviewTest, ::testing::Values(203, 300));

TEST(PreviewJobs, FormatsStayWithThePrinterForLaterJobs) {
  preview::Printer printer;
  const std::string separator = SeparatorJob("Store 0412\r\nChadstone", "1");
  const std::string format = separator.substr(0, separator.find("}{") + 1);
  const std::string batch = separator.substr(format.size());
  // A batch before its format: nothing to draw, and the reason.
  preview::Result result = printer.Print(batch);
  EXPECT_TRUE(result.pages.empty());
  EXPECT_EQ(result.notes, std::vector<std::string>{"a batch for format 9, which was never sent"});
  // The format alone shows its constant texts; the batch then prints the label.
  result = printer.Print(format);
  ASSERT_EQ(result.pages.size(), 1u);
  result = printer.Print(batch);
  ASSERT_EQ(result.pages.size(), 1u);
  // The separator's texts run down the label.
  for (const auto& t : result.pages[0].texts) {
    EXPECT_GT(t.box.y2 - t.box.y1, t.box.x2 - t.box.x1) << t.text;
    EXPECT_LE(t.box.x2, result.pages[0].width) << t.text;
  }
  // The title, the caption and the message's two lines.
  EXPECT_EQ(result.pages[0].texts.size(), 4u);
}

TEST(PreviewJobs, BadJobsDrawWhatTheyCanAndNeverFail) {
  preview::Printer printer;
  for (const std::string& job :
       {std::string(), std::string("hello"), std::string("{F,1,A,R,E,99999999,-5,\"X\"|C,1e300,x|}{B,1,N,1|"),
        std::string("{F,2,A,R,E,600,400,\"Y\"|T,1,999999999,V,10,10,0,1,1000000,1000000,W,R,0,0,0|"
                    "B,2,5,V,10,10,8,4,99999999,8,L,0|Q,1,1,2|L,S,5|}{B,2,N,1|1,\"x\"|2,\"~201\xff\"|}"),
        std::string("^XA^FO-99999,99999999^A0R,99999999,0^FDx^FS^GB-5,0,0^FS^BY0^BCN^FV>8>;^FS^XZ^XA^FDy"),
        std::string("^XA^PW5^LL5^FO1,1^A0I,20,20^FR^FDturned^FS^XZ~JA^")}) {
    const preview::Result result = printer.Print(job);
    for (const auto& page : result.pages) {
      EXPECT_GT(page.width, 0);
      EXPECT_FALSE(page.png.empty());
    }
  }
  EXPECT_EQ(printer.Print("hello").notes,
            std::vector<std::string>{"no VPCL II format or batch and no ZPL label in the job"});
}

TEST_F(PreviewFixture, DamagedJobsNeverFail) {
  clsMayneCMLSCM label;
  const std::string zpl = Job(label, true);
  const std::string vpcl = label.PrintVPCLII() + label.VPCLIIBatchCommand();
  // Bytes overwritten, cut short or repeated, the same way each run.
  std::mt19937 random(15);
  for (const std::string* job : {&zpl, &vpcl}) {
    for (int round = 0; round < 40; ++round) {
      std::string damaged = *job;
      for (int i = 0; i < 8; ++i)
        damaged[random() % damaged.size()] = static_cast<char>("^~{}|\",,9-\xff"[random() % 11]);
      if (round % 4 == 0) damaged.resize(random() % damaged.size());
      if (round % 4 == 1) damaged += damaged;
      preview::Printer printer;
      for (const auto& page : printer.Print(damaged).pages) EXPECT_FALSE(page.png.empty());
    }
  }
}

class SpoolerPreviewTest : public test::LabelFixture {};

TEST_F(SpoolerPreviewTest, PrintersThatAskForItGetAPictureBesideEachJob) {
  const fs::path root = config.path();
  fs::create_directories(root / "Dock 3");
  fs::create_directories(root / "Dock 4");
  test::WriteText((root / "Dock 3/printer.ini").string(), "dpi=203\npreview=yes\n");
  auto directory = std::make_shared<DirectorySpooler>(root.string());
  directory->SetPreviewer(preview::MakePreviewer);
  SetSpooler(directory);
  for (const char* printer : {"Dock 3", "Dock 4"}) {
    clsStarTrackGenericSCM label;
    ASSERT_TRUE(label.Init(host.system, printer));
    ASSERT_TRUE(label.PrintLabel(pack));
  }
  const auto png = ReadFile((root / "Dock 3/preview-000002-Quendal.clsStarTrackGenericSCM.png").string());
  ASSERT_TRUE(png);
  EXPECT_EQ(test::ReadGs1Barcodes(*png), (std::set<std::string>{"(00)093123450000000012", "(421)0363148"}));
  // The format download shows the empty layout; pictures are not jobs.
  EXPECT_TRUE(FileExists((root / "Dock 3/preview-000001-Quendal.clsStarTrackGenericSCM.png").string()));
  long error = 0;
  const std::int32_t handle = directory->OpenPrinter("Dock 3", error);
  EXPECT_EQ(directory->JobCount(handle, 999), 2);
  directory->ClosePrinter(handle);
  // A printer that does not ask gets none.
  for (const auto& entry : fs::directory_iterator(root / "Dock 4"))
    EXPECT_FALSE(entry.path().filename().string().starts_with("preview-"));
}

}  // namespace
}  // namespace quendal
