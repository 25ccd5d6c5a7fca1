#include <gtest/gtest.h>

#include <filesystem>

#include "carrierfiles/TailJournal.h"
#include "platform/FileSystem.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using Outcome = TailJournal::Outcome;
using Recovery = TailJournal::Recovery;

// A document that must end in "</Day>\r\n"; the empty file is a new one.
std::optional<std::size_t> ClosingTag(const TailJournal::End& end) {
  if (end.bytes.empty() && end.offset == 0) return 0;
  if (!end.bytes.ends_with("</Day>\r\n")) return std::nullopt;
  return end.bytes.size() - 8;
}

TailJournal::BuildTail Add(std::string element) {
  return [element](std::string_view oldTail) {
    return (oldTail.empty() ? std::string("<Day>\r\n") : std::string()) + element + "</Day>\r\n";
  };
}

class TailJournalTest : public ::testing::Test {
 protected:
  std::string Text() const { return ReadFile(path).value_or("<none>"); }
  bool JournalLeft() const { return fs::exists(journal.JournalPath()); }

  test::TempFolder temp;
  std::string path = temp / "day.xml";
  TailJournal journal{path};
};

TEST_F(TailJournalTest, ReplacesOnlyATailThatIsThere) {
  EXPECT_EQ(journal.Replace(ClosingTag, Add("<A/>\r\n")), Outcome::Replaced);
  EXPECT_EQ(journal.Replace(ClosingTag, Add("<B/>\r\n")), Outcome::Replaced);
  EXPECT_EQ(Text(), "<Day>\r\n<A/>\r\n<B/>\r\n</Day>\r\n");
  EXPECT_FALSE(JournalLeft());
  EXPECT_EQ(fs::path(journal.JournalPath()).filename(), ".day.xml.journal");

  // A file that does not end in its tail is left alone.
  ASSERT_TRUE(AppendFile(path, "<C/>\r\n"));
  EXPECT_EQ(journal.Replace(ClosingTag, Add("<D/>\r\n")), Outcome::NoTail);
  EXPECT_EQ(Text(), "<Day>\r\n<A/>\r\n<B/>\r\n</Day>\r\n<C/>\r\n");
  // A file that can't be opened is reported as such.
  TailJournal folder(temp.path());
  EXPECT_EQ(folder.Replace(ClosingTag, Add("<E/>\r\n")), Outcome::CannotOpen);
}

TEST_F(TailJournalTest, AReplacementInterruptedAfterItsJournalIsCompletedFromAnyState) {
  const std::string before = "<Day>\r\n<A/>\r\n</Day>\r\n";
  const std::string after = "<Day>\r\n<A/>\r\n<B/>\r\n</Day>\r\n";
  const std::uint64_t cut = before.size() - 8;
  // What a crash can leave of the file once the journal is durable: the
  // file untouched, cut at its tail, or cut and partly written.
  const std::vector<std::string> states = {before, before.substr(0, cut),
                                           before.substr(0, cut) + "<B/"};
  for (const std::string& state : states) {
    test::WriteText(path, before);
    const TailJournal::Begun begun = journal.Begin(ClosingTag, Add("<B/>\r\n"));
    ASSERT_TRUE(begun.pending);
    EXPECT_EQ(begun.pending->offset, cut);
    EXPECT_EQ(Text(), before);  // Begin touches only the journal
    ASSERT_TRUE(JournalLeft());
    RandomAccessFile file;
    ASSERT_TRUE(file.Open(path, RandomAccessFile::Mode::Existing));
    ASSERT_TRUE(file.Cut(0) && file.WriteAt(0, state));
    file.Close();

    EXPECT_EQ(journal.Finish(), Recovery::Completed) << state;
    EXPECT_EQ(Text(), after) << state;
    EXPECT_FALSE(JournalLeft());
    EXPECT_EQ(journal.Finish(), Recovery::Nothing);
  }
}

TEST_F(TailJournalTest, ATornOrStrayJournalIsDroppedAndTheFileLeftAlone) {
  const std::string before = "<Day>\r\n<A/>\r\n</Day>\r\n";
  auto leaveJournal = [&] {
    test::WriteText(path, before);
    EXPECT_TRUE(journal.Begin(ClosingTag, Add("<B/>\r\n")).pending);
    return ReadFile(journal.JournalPath()).value_or("");
  };
  // Torn while it was written: short, or with a byte that did not make it.
  std::string whole = leaveJournal();
  test::WriteText(journal.JournalPath(), whole.substr(0, whole.size() - 3));
  EXPECT_EQ(journal.Finish(), Recovery::Dropped);
  EXPECT_EQ(Text(), before);
  whole[whole.size() / 2] ^= 0x20;
  test::WriteText(journal.JournalPath(), whole);
  EXPECT_EQ(journal.Finish(), Recovery::Dropped);
  EXPECT_EQ(Text(), before);

  // The file changed since (another copy put in its place), or is gone.
  leaveJournal();
  const std::string other = "<Day>\r\n<X/>\r\n<Y/>\r\n<Z/>\r\n</Day>\r\n";
  DeleteFile(path);
  test::WriteText(path, other);
  EXPECT_EQ(journal.Finish(), Recovery::Dropped);
  EXPECT_EQ(Text(), other);
  leaveJournal();
  DeleteFile(path);
  EXPECT_EQ(journal.Finish(), Recovery::Dropped);
  EXPECT_FALSE(FileExists(path));
  EXPECT_FALSE(JournalLeft());
}

}  // namespace
}  // namespace quendal
