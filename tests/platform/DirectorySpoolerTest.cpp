#include "platform/DirectorySpooler.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <set>

#include "frame/Error.h"
#include "platform/FileSystem.h"
#include "tests/support/KillLoop.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;

class DirectorySpoolerTest : public ::testing::Test {
 protected:
  void SetUp() override {
    fs::create_directories(root / "Dock Zebra");
  }
  test::TempFolder temp;
  fs::path root{temp.path()};
};

TEST_F(DirectorySpoolerTest, OneFilePerJobWithTheBytesAsSent) {
  DirectorySpooler spooler(root.string());
  long error = -1;
  const auto h = spooler.OpenPrinter("Dock Zebra", error);
  ASSERT_NE(h, 0);
  EXPECT_EQ(error, 0);
  EXPECT_EQ(spooler.JobCount(h, 999), 0);
  ASSERT_NE(spooler.StartDoc(h, "Quendal.clsStarTrackGenericSCM"), 0);
  ASSERT_TRUE(spooler.Write(h, "{B,430,N,1|"));
  ASSERT_TRUE(spooler.Write(h, std::string("\xC8}", 2)));
  EXPECT_EQ(spooler.JobCount(h, 999), 0);  // not queued until the document ends
  ASSERT_TRUE(spooler.EndDoc(h));
  ASSERT_NE(spooler.StartDoc(h, "a/../b"), 0);
  ASSERT_TRUE(spooler.EndDoc(h));
  EXPECT_EQ(spooler.JobCount(h, 999), 2);
  EXPECT_EQ(spooler.JobCount(h, 1), 1);
  spooler.ClosePrinter(h);
  EXPECT_EQ(*ReadFile((root / "Dock Zebra/000001-Quendal.clsStarTrackGenericSCM.prn").string()),
            "{B,430,N,1|\xC8}");
  EXPECT_TRUE(FileExists((root / "Dock Zebra/000002-a____b.prn").string()));
  EXPECT_FALSE(spooler.Write(h, "x"));  // closed

  // A title too long for a file name still queues its job.
  const auto again = spooler.OpenPrinter("Dock Zebra", error);
  ASSERT_NE(spooler.StartDoc(again, std::string(10000, 'T')), 0);
  ASSERT_TRUE(spooler.EndDoc(again));
  EXPECT_TRUE(FileExists((root / ("Dock Zebra/000003-" + std::string(100, 'T') + ".prn")).string()));
}

TEST_F(DirectorySpoolerTest, UnknownPrintersAreError1801) {
  DirectorySpooler spooler(root.string());
  for (const char* name : {"Nowhere", "", "../Dock Zebra", "dock zebra"}) {
    long error = 0;
    EXPECT_EQ(spooler.OpenPrinter(name, error), 0) << name;
    EXPECT_EQ(error, err::kUnknownPrinter);
  }
}

TEST_F(DirectorySpoolerTest, InstalledPrintersCarryTheirResolution) {
  fs::create_directories(root / "Office Laser");
  ASSERT_TRUE(AppendFile((root / "Office Laser/printer.ini").string(), "[printer]\r\ndpi=203\r\n"));
  DirectorySpooler spooler(root.string());
  const auto printers = spooler.InstalledPrinters();
  ASSERT_EQ(printers.size(), 2u);
  EXPECT_EQ(printers[0].name, "Dock Zebra");
  EXPECT_DOUBLE_EQ(printers[0].twipsPerPixelX, 4.8);
  EXPECT_EQ(printers[1].name, "Office Laser");
  EXPECT_DOUBLE_EQ(printers[1].twipsPerPixelY, 1440.0 / 203);
}

TEST_F(DirectorySpoolerTest, DrawnJobsArePngPagesAtThePrintersResolution) {
  ASSERT_TRUE(AppendFile((root / "Dock Zebra/printer.ini").string(),
                         "dpi=203\nwidth_mm=50.8\nheight_mm=25.4\n"));
  DirectorySpooler spooler(root.string());
  long error = 0;
  EXPECT_FALSE(spooler.CreateDC("dock zebra", error));  // names are exact
  EXPECT_EQ(error, 1801);
  auto dc = spooler.CreateDC("Dock Zebra", error);
  ASSERT_TRUE(dc);
  ASSERT_TRUE(dc->StartDoc("Quendal.clsStarTrackGenericSCM"));
  for (int page = 0; page < 2; ++page) {
    dc->StartPage();
    dc->Rectangle(10, 10, 50, 50, 2);
    dc->EndPage();
  }
  ASSERT_TRUE(dc->EndDoc());
  const auto h = spooler.OpenPrinter("Dock Zebra", error);
  EXPECT_EQ(spooler.JobCount(h, 999), 2);
  const auto png = ReadFile((root / "Dock Zebra/000002-Quendal.clsStarTrackGenericSCM.png").string());
  ASSERT_TRUE(png);
  // 2 x 1 inches at 203 dpi.
  EXPECT_EQ(static_cast<unsigned char>((*png)[19]), 406 % 256);
  EXPECT_EQ(static_cast<unsigned char>((*png)[18]), 406 / 256);
  EXPECT_EQ(static_cast<unsigned char>((*png)[23]), 203);
}

TEST(SafeFileNameTest, KeepsNamesInsideTheFolder) {
  EXPECT_EQ(SafeFileName("SRX04521.CLN"), "SRX04521.CLN");
  EXPECT_EQ(SafeFileName("../../etc/passwd"), "______etc_passwd");
  EXPECT_EQ(SafeFileName("a\\b:c"), "a_b_c");
  EXPECT_EQ(SafeFileName(""), "_");
  // A title only names the file for people: it is cut to whole characters.
  EXPECT_EQ(TitleForFileName("Label a/b"), "Label a_b");
  EXPECT_EQ(TitleForFileName(std::string(99, 'x') + "é" + "tail"), std::string(99, 'x'));
  EXPECT_EQ(TitleForFileName(std::string(10000, 'x')), std::string(100, 'x'));
}

// A process killed at any moment while it prints leaves only whole jobs,
// each under a number of its own, and the next job still goes in.
TEST_F(DirectorySpoolerTest, KilledAtAnyMomentTheQueueHoldsOnlyWholeJobs) {
  // A label of a few kilobytes that names its unit throughout.
  const auto label = [](int n) {
    std::string bytes;
    for (int i = 0; i < 200; ++i) bytes += "{B,430,N,1|" + std::to_string(n) + "|}\r\n";
    return bytes;
  };
  DirectorySpooler spooler(root.string());
  test::KillLoop loop;
  loop.write = [&](int n) {
    long error = 0;
    const auto h = spooler.OpenPrinter("Dock Zebra", error);
    if (h == 0) return false;
    const bool ok = spooler.StartDoc(h, "label-" + std::to_string(n)) != 0 &&
                    spooler.Write(h, label(n)) && spooler.EndDoc(h);
    spooler.ClosePrinter(h);
    return ok;
  };
  loop.read = [&] {
    std::vector<int> units;
    std::set<std::string> jobNumbers;
    for (const auto& entry : fs::directory_iterator(root / "Dock Zebra")) {
      const std::string name = entry.path().filename().string();
      if (name.starts_with(".")) continue;  // the counter, and what a kill left of a job unqueued
      EXPECT_EQ(name.substr(6, 7), "-label-") << name;
      EXPECT_TRUE(name.ends_with(".prn")) << name;
      EXPECT_TRUE(jobNumbers.insert(name.substr(0, 6)).second) << name;
      const int n = std::stoi(name.substr(13));
      EXPECT_EQ(ReadFile(entry.path().string()), label(n)) << name;
      units.push_back(n);
    }
    return units;
  };
  test::RunKillLoop(loop);
}

}  // namespace
}  // namespace quendal
