#include "platform/FileSystem.h"

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>

#include "platform/Clock.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;

class FileSystemTest : public ::testing::Test {
 protected:
  void SetUp() override {
    fs::create_directories(dir);
  }
  std::string Path(const std::string& name) const { return (dir / name).string(); }
  test::TempFolder temp;
  fs::path dir{temp.path()};
};

TEST_F(FileSystemTest, ListsFilesByNameWithCreationDates) {
  ASSERT_TRUE(AppendFile(Path("B.CLN"), "x"));
  ASSERT_TRUE(AppendFile(Path("a.cln"), "y"));
  fs::create_directories(dir / "2024-03-15");
  const auto files = ListFiles(dir.string());
  ASSERT_TRUE(files);
  ASSERT_EQ(files->size(), 2u);  // folders are not files
  EXPECT_EQ((*files)[0].name, "B.CLN");
  EXPECT_EQ((*files)[1].name, "a.cln");
  // Created just now, read back through the file system.
  const DateTime today = Today();
  EXPECT_EQ((*files)[0].created.DateOnly(), today);
  EXPECT_FALSE(ListFiles(Path("missing")));
}

TEST_F(FileSystemTest, AppendCreatesThenExtends) {
  ASSERT_TRUE(AppendFile(Path("f.txt"), "one\r\n"));
  ASSERT_TRUE(AppendFile(Path("f.txt"), "two\r\n"));
  EXPECT_EQ(*ReadFile(Path("f.txt")), "one\r\ntwo\r\n");
  EXPECT_EQ(*FileSize(Path("f.txt")), 10u);
  EXPECT_FALSE(AppendFile(Path("no/such/folder/f.txt"), "x"));
}

TEST_F(FileSystemTest, ReplaceIsAtomicAndLeavesNoTemporaryFile) {
  ASSERT_TRUE(AppendFile(Path("day.xml"), "old"));
  ASSERT_TRUE(ReplaceFile(Path("day.xml"), "new"));
  EXPECT_EQ(*ReadFile(Path("day.xml")), "new");
  EXPECT_EQ(ListFiles(dir.string())->size(), 1u);
  // A target in a missing folder fails and the original folder is untouched.
  EXPECT_FALSE(ReplaceFile(Path("missing/day.xml"), "x"));
}

TEST_F(FileSystemTest, FoldersAndDeletion) {
  EXPECT_TRUE(CreateFolder(Path("a/b/c")));
  EXPECT_TRUE(FolderExists(Path("a/b/c")));
  EXPECT_FALSE(FolderExists(""));
  ASSERT_TRUE(AppendFile(Path("gone"), "x"));
  EXPECT_TRUE(DeleteFile(Path("gone")));
  EXPECT_FALSE(FileExists(Path("gone")));
  EXPECT_FALSE(DeleteFile(Path("gone")));
}

}  // namespace
// What a writer killed in the middle of an append leaves: the note beside
// the file and part of the bytes. Opening the file again cuts the torn part
// off, unless its writer is still at work or the file has grown past it.
TEST_F(FileSystemTest, AnAppendTornByADeadWriterIsCutBackWhenTheFileIsOpened) {
  const std::string path = temp / "day.CLN";
  const std::string note = temp / ".day.CLN.append";
  const pid_t dead = fork();
  if (dead == 0) _exit(0);
  waitpid(dead, nullptr, 0);
  const auto leave = [&](pid_t writer, const std::string& file) {
    test::WriteText(path, file);
    test::WriteText(note, std::to_string(writer) + " 6 10\n");
  };
  AppendingFile appending;
  leave(dead, "whole\nhalf");
  ASSERT_TRUE(appending.Open(path));
  EXPECT_EQ(test::ReadText(path), "whole\n");
  EXPECT_FALSE(fs::exists(note));
  ASSERT_TRUE(appending.Append("next\n"));
  EXPECT_EQ(test::ReadText(path), "whole\nnext\n");
  EXPECT_FALSE(fs::exists(note));
  appending.Close();

  // A whole append, or a file another writer extended since: nothing is cut.
  for (const std::string file : {"whole\nfour more\n", "whole\nfour more\nand more\n"}) {
    leave(dead, file);
    ASSERT_TRUE(appending.Open(path));
    EXPECT_EQ(test::ReadText(path), file);
    EXPECT_FALSE(fs::exists(note));
    appending.Close();
  }
  // A writer still at work keeps its note and its bytes.
  leave(getppid(), "whole\nhalf");
  ASSERT_TRUE(appending.Open(path));
  EXPECT_EQ(test::ReadText(path), "whole\nhalf");
  EXPECT_TRUE(fs::exists(note));
}

}  // namespace quendal
