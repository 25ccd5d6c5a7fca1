// Crash-safe replacement of the end of a carrier file whose last part must
// stay last: a trailer record that counts the lines, a closing root tag, an
// end-of-file mark. Each addition replaces that tail in place, so its cost
// does not grow with the file, and a redo journal beside the file makes the
// replacement all or nothing:
//
//   1. the journal (where the old tail starts, the old tail, the new bytes,
//      lengths and a checksum) is written beside the file and made durable;
//   2. the file is cut where its tail starts and the new bytes (new content
//      followed by the new tail) are written in one write and made durable;
//   3. the journal is removed.
//
// A crash before the journal is whole leaves the file untouched and a torn
// journal that Finish recognises by its checksum and drops; a crash after
// it leaves a journal that Finish completes. So whoever opens the file
// calls Finish before reading or writing it, and finds the file either as
// it was or with the whole addition, never cut short.
//
//   TailJournal journal(path);
//   journal.Finish();
//   journal.Replace(
//       [](const TailJournal::End& end) { return StartOfClosingTag(end.bytes); },
//       [&](std::string_view oldTail) { return element + "</Root>\r\n"; });
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>

namespace quendal {

class TailJournal {
 public:
  // The end of the file as the tail check sees it: its last bytes (at most
  // the window) and the file offset of the first of them. An empty or
  // missing file has empty bytes at offset 0.
  struct End {
    std::string_view bytes;
    std::uint64_t offset = 0;
  };
  // Where the tail starts within End::bytes, or nullopt when the file does
  // not end in its tail (then nothing is written).
  using FindTail = std::function<std::optional<std::size_t>(const End& end)>;
  // The bytes that replace the tail found: the new content and the new tail.
  using BuildTail = std::function<std::string(std::string_view oldTail)>;

  enum class Outcome {
    Replaced,    // the file ends in the new bytes
    NoTail,      // the file does not end in its tail; nothing was written
    CannotOpen,  // the file (or a journal left beside it) can't be opened
    Failed,      // a write failed; the file is as it was before the call
  };
  enum class Recovery {
    Nothing,    // no journal was left beside the file
    Completed,  // an interrupted replacement was completed
    Dropped,    // a torn journal, or one the file no longer matches, was removed
    Failed,     // a journal is there but could not be completed; the file must not be touched
  };

  // `window`: how many of the file's last bytes the tail check may look at.
  explicit TailJournal(std::string path, std::size_t window = 4096);

  const std::string& Path() const { return path_; }
  // The journal beside the file: hidden, and never named like a carrier file.
  const std::string& JournalPath() const { return journalPath_; }

  // Completes or drops a journal that an interrupted replacement left.
  Recovery Finish();

  // Finish, then replace the file's tail. A missing file is created when
  // the check accepts the empty end.
  Outcome Replace(const FindTail& find, const BuildTail& build);

  // Replace in its two steps. Begin finds the tail, builds the new bytes
  // and makes the journal durable without touching the file; Commit writes
  // the file and removes the journal. Between the two the file is as it
  // was, and Finish would complete the replacement.
  struct Pending {
    std::uint64_t offset = 0;  // where the old tail starts
    std::string oldTail;
    std::string bytes;  // what replaces it
  };
  struct Begun {
    Outcome outcome = Outcome::Failed;
    std::optional<Pending> pending;  // set when outcome is Replaced
  };
  Begun Begin(const FindTail& find, const BuildTail& build);
  Outcome Commit(const Pending& pending);

 private:
  bool RemoveJournal();

  std::string path_;
  std::string journalPath_;
  std::string folder_;
  std::size_t window_;
};

}  // namespace quendal
