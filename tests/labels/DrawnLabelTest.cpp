// The drawn label end to end: the reference label drawn on a plain
// printer's page as a PNG file, read back by an independent barcode reader.
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <set>

#include "labels/cStarTrackGenericSCM.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "tests/labels/LabelFixture.h"
#include "tests/support/Barcodes.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;

class DrawnLabelTest : public test::LabelFixture, public ::testing::WithParamInterface<int> {
 protected:
  void SetUp() override {
    LabelFixture::SetUp();
    fs::create_directories(root / "Office Laser");
    AppendFile((root / "Office Laser/printer.ini").string(),
               "dpi=" + std::to_string(GetParam()) + "\n");
    SetSpooler(std::make_shared<DirectorySpooler>(root.string()));
    host.system->fields["PrinterLanguage"] = "WinPCL";
  }

  test::TempFolder temp;
  fs::path root{temp.path()};
};

TEST_P(DrawnLabelTest, BarcodesReadBackFromThePicture) {
  auto prompt = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope scope(prompt);
  clsStarTrackGenericSCM label;
  ASSERT_TRUE(label.Init(host.system, "Office Laser"));
  ASSERT_TRUE(label.PrintLabel(pack)) << (prompt->messages.empty() ? "" : prompt->messages[0]);
  EXPECT_TRUE(host.logs.empty());
  const auto png = ReadFile((root / "Office Laser/000001-Quendal.clsStarTrackGenericSCM.png").string());
  ASSERT_TRUE(png);
  EXPECT_EQ(test::ReadGs1Barcodes(*png),
            (std::set<std::string>{"(00)093123450000000012", "(421)0363148"}));
}

INSTANTIATE_TEST_SUITE_P(Resolutions, DrawnLabelTest, ::testing::Values(203, 300));

}  // namespace
}  // namespace quendal
