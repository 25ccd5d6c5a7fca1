#include "platform/Settings.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "platform/FileSystem.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;

class SettingsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    dir = fs::temp_directory_path() / ("quendal-settings-" + std::to_string(::getpid()));
    fs::remove_all(dir);
    const char* old = std::getenv("XDG_CONFIG_HOME");
    saved = old ? old : "";
    had = old != nullptr;
    ::setenv("XDG_CONFIG_HOME", dir.c_str(), 1);
  }
  void TearDown() override {
    if (had) ::setenv("XDG_CONFIG_HOME", saved.c_str(), 1);
    else ::unsetenv("XDG_CONFIG_HOME");
    fs::remove_all(dir);
  }
  fs::path dir;
  std::string saved;
  bool had = false;
};

TEST_F(SettingsTest, DefaultWhenMissingThenStoredValues) {
  EXPECT_EQ(SettingsPath("Merivane"), (dir / "Merivane/settings.ini").string());
  EXPECT_EQ(GetSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "True"), "True");
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "False"));
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "clsTollMYERSCM", "0"));
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "True"));
  EXPECT_EQ(GetSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "x"), "True");
  EXPECT_EQ(GetSetting("Merivane", "Settings", "clsTollMYERSCM", "x"), "0");
  EXPECT_EQ(GetSetting("Merivane", "Other", "clsTollMYERSCM", "x"), "x");
  EXPECT_EQ(*ReadFile(SettingsPath("Merivane")),
            "[Settings]\nclsStarTrackGenericSCM=True\nclsTollMYERSCM=0\n");
}

TEST_F(SettingsTest, KeepsOtherSectionsAndComments) {
  fs::create_directories(dir / "Merivane");
  ASSERT_TRUE(AppendFile((dir / "Merivane/settings.ini").string(),
                         "; host settings\r\n[Window]\r\nLeft = 10\r\n[Settings]\r\nA=1\r\n"));
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "B", "2"));
  EXPECT_EQ(GetSetting("Merivane", "Window", "Left", ""), "10");
  EXPECT_EQ(*ReadFile(SettingsPath("Merivane")),
            "; host settings\n[Window]\nLeft = 10\n[Settings]\nA=1\nB=2\n");
}

TEST_F(SettingsTest, AChangeByAnotherWriterIsReadAtOnce) {
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "True"));
  const std::string path = SettingsPath("Merivane");
  EXPECT_EQ(GetSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "x"), "True");
  // Same size, replaced by rename, as an editor or the host would.
  ASSERT_TRUE(ReplaceFile(path, "[Settings]\nclsStarTrackGenericSCM=Fals\n"));
  EXPECT_EQ(GetSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "x"), "Fals");
  fs::remove(path);
  EXPECT_EQ(GetSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "x"), "x");
}

// Each change made behind the reader's back is seen by the very next read.
TEST_F(SettingsTest, EveryKindOfChangeIsReadAtOnce) {
  const auto get = [] { return GetSetting("Merivane", "Settings", "A", "none"); };
  const fs::path folder = dir / "Merivane";
  const fs::path file = folder / "settings.ini";
  // No folder yet, then a folder without the file, then the file created.
  EXPECT_EQ(get(), "none");
  fs::create_directories(folder);
  EXPECT_EQ(get(), "none");
  ASSERT_TRUE(AppendFile(file.string(), "[Settings]\nA=1\n"));
  EXPECT_EQ(get(), "1");
  // Edited in place, and a line added at the end.
  { std::ofstream(file, std::ios::in | std::ios::out) << "[Settings]\nA=2\n"; }
  EXPECT_EQ(get(), "2");
  ASSERT_TRUE(AppendFile(file.string(), "A=3\n"));
  EXPECT_EQ(get(), "2");  // the first entry counts
  // Another file of the folder changes: the value stands.
  ASSERT_TRUE(AppendFile((folder / "other.ini").string(), "[Settings]\nA=9\n"));
  EXPECT_EQ(get(), "2");
  // Moved away, then another moved in by rename.
  fs::rename(file, folder / "old.ini");
  EXPECT_EQ(get(), "none");
  ASSERT_TRUE(AppendFile((folder / "new.ini").string(), "[Settings]\nA=4\n"));
  fs::rename(folder / "new.ini", file);
  EXPECT_EQ(get(), "4");
  // The whole folder moved away, and a new one made in its place.
  fs::rename(folder, dir / "Moved");
  EXPECT_EQ(get(), "none");
  fs::create_directories(folder);
  ASSERT_TRUE(AppendFile(file.string(), "[Settings]\nA=5\n"));
  EXPECT_EQ(get(), "5");
  ASSERT_TRUE(AppendFile((dir / "Moved/settings.ini").string(), "A=6\n"));
  EXPECT_EQ(get(), "5");
  // The folder deleted, then saved again.
  fs::remove_all(folder);
  EXPECT_EQ(get(), "none");
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "A", "7"));
  EXPECT_EQ(get(), "7");
  // Replaced by a link to a file elsewhere, which is then edited.
  fs::remove(file);
  fs::create_symlink(dir / "Moved/settings.ini", file);
  EXPECT_EQ(get(), "4");
  { std::ofstream(dir / "Moved/settings.ini", std::ios::in | std::ios::out) << "[Settings]\nA=8"; }
  EXPECT_EQ(get(), "8");
}

}  // namespace
}  // namespace quendal
