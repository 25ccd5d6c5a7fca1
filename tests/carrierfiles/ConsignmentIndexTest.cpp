#include "carrierfiles/ConsignmentIndex.h"

#include <gtest/gtest.h>

#include <filesystem>
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;

std::string Key(std::string_view number) {
  std::string key(number);
  key.resize(std::max<std::size_t>(key.size(), 20), ' ');
  return key;
}

class ConsignmentIndexTest : public ::testing::Test {
 protected:
  void SetUp() override {
    fs::create_directories(dir);
    path = (dir / "DAY.CLN").string();
  }

  // Appends as the class does: open, one write, close; the index follows.
  void OurAppend(const std::string& bytes) {
    AppendingFile file;
    ASSERT_TRUE(file.Open(path));
    const auto before = file.Stamp();
    ASSERT_TRUE(file.Append(bytes));
    index.Appended(path, bytes, before, file.Stamp());
  }

  test::TempFolder temp;

  fs::path dir{temp.path()};
  std::string path;
  ConsignmentIndex index{"10", 20};
};

TEST_F(ConsignmentIndexTest, OwnAppendsAreAnsweredWithoutReadingAgain) {
  EXPECT_FALSE(index.Holds(path, Key("CN1")));
  OurAppend("00N header\r\n10" + Key("CN1") + "rest\r\n20" + Key("CN1") + "SSCC\r\n");
  OurAppend("10" + Key("CN2") + "rest\r\n");
  EXPECT_TRUE(index.Holds(path, Key("CN1")));
  EXPECT_TRUE(index.Holds(path, Key("CN2")));
  EXPECT_FALSE(index.Holds(path, Key("CN3")));
  EXPECT_EQ(index.Reads(), 0u);
  // The answers are those of reading the lines.
  EXPECT_TRUE(HoldsRecord(path, "10" + Key("CN2")));
  EXPECT_FALSE(HoldsRecord(path, "10" + Key("CN3")));
}

TEST_F(ConsignmentIndexTest, AChangeByAnotherWriterIsNoticed) {
  OurAppend("10" + Key("CN1") + "rest\r\n");
  ASSERT_TRUE(AppendFile(path, "10" + Key("OTHER") + "rest\r\n"));
  EXPECT_TRUE(index.Holds(path, Key("OTHER")));
  EXPECT_EQ(index.Reads(), 1u);
  // Replaced by a file of the same length: read again.
  ASSERT_TRUE(ReplaceFile(path, "10" + Key("CN9") + "rest\r\n10" + Key("OTHER") + "rest\r\n"));
  EXPECT_FALSE(index.Holds(path, Key("CN1")));
  EXPECT_TRUE(index.Holds(path, Key("CN9")));
  // Deleted, then written anew.
  ASSERT_TRUE(DeleteFile(path));
  EXPECT_FALSE(index.Holds(path, Key("CN9")));
  OurAppend("10" + Key("CN5") + "\r\n");
  EXPECT_TRUE(index.Holds(path, Key("CN5")));
  EXPECT_FALSE(index.Holds(path, Key("CN9")));
}

TEST_F(ConsignmentIndexTest, KeysMatchWhereTheLinesWould) {
  OurAppend("10" + Key("CN1") + "\r\n" + "xx10" + std::string(25, 'L') + "X\r\n" + "10SHORT\r\n");
  // Anywhere in a line, but never across a line end.
  EXPECT_TRUE(index.Holds(path, std::string(20, 'L')));
  EXPECT_FALSE(index.Holds(path, Key("SHORT")));
  // A number longer than its field: its first 20 characters match, the rest must too.
  EXPECT_TRUE(index.Holds(path, std::string(25, 'L') + "X"));
  EXPECT_FALSE(index.Holds(path, std::string(25, 'L') + "Y"));
  // A file that ended inside a line: the next append joins that line.
  ASSERT_TRUE(AppendFile(path, "10" + std::string(10, 'P')));
  EXPECT_FALSE(index.Holds(path, std::string(10, 'P') + std::string(10, 'Q')));
  OurAppend(std::string(10, 'Q') + "\r\n");
  EXPECT_TRUE(index.Holds(path, std::string(10, 'P') + std::string(10, 'Q')));
}

}  // namespace
}  // namespace quendal
