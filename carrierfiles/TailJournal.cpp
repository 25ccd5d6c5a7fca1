#include "carrierfiles/TailJournal.h"

#include <algorithm>
#include <filesystem>

#include "platform/FileSystem.h"

namespace quendal {

namespace {

namespace fs = std::filesystem;

// Journal layout, integers as 8 bytes little-endian:
//   "QTJ1", device and inode of the file, offset of the old tail, the file's
//   size before, length of the new bytes, the old tail, the new bytes, and
//   an FNV-1a checksum of everything before it.
// A journal whose length or checksum does not add up was torn by a crash
// while it was written; the file was not touched then.
constexpr std::string_view kMagic = "QTJ1";
constexpr std::size_t kHeader = 4 + 5 * 8;
constexpr std::size_t kChecksum = 8;

void PutNumber(std::string& out, std::uint64_t value) {
  for (int i = 0; i < 8; ++i) out.push_back(static_cast<char>((value >> (8 * i)) & 0xFF));
}

std::uint64_t GetNumber(std::string_view bytes, std::size_t at) {
  std::uint64_t value = 0;
  for (int i = 7; i >= 0; --i)
    value = (value << 8) | static_cast<unsigned char>(bytes[at + static_cast<std::size_t>(i)]);
  return value;
}

struct Entry {
  std::uint64_t device = 0;
  std::uint64_t inode = 0;
  std::uint64_t offset = 0;
  std::uint64_t oldSize = 0;
  std::string oldTail;
  std::string bytes;
};

std::string Encode(const Entry& entry) {
  std::string out(kMagic);
  PutNumber(out, entry.device);
  PutNumber(out, entry.inode);
  PutNumber(out, entry.offset);
  PutNumber(out, entry.oldSize);
  PutNumber(out, entry.bytes.size());
  out += entry.oldTail;
  out += entry.bytes;
  PutNumber(out, Fnv1a(out));
  return out;
}

// The entry, or nothing when the journal is torn.
std::optional<Entry> Decode(std::string_view journal) {
  if (journal.size() < kHeader + kChecksum || journal.substr(0, kMagic.size()) != kMagic)
    return std::nullopt;
  Entry entry;
  entry.device = GetNumber(journal, 4);
  entry.inode = GetNumber(journal, 12);
  entry.offset = GetNumber(journal, 20);
  entry.oldSize = GetNumber(journal, 28);
  const std::uint64_t length = GetNumber(journal, 36);
  if (entry.oldSize < entry.offset) return std::nullopt;
  const std::uint64_t oldLength = entry.oldSize - entry.offset;
  const std::uint64_t body = journal.size() - kHeader - kChecksum;
  if (oldLength > body || length != body - oldLength) return std::nullopt;
  const std::size_t end = journal.size() - kChecksum;
  if (GetNumber(journal, end) != Fnv1a(journal.substr(0, end))) return std::nullopt;
  entry.oldTail = journal.substr(kHeader, static_cast<std::size_t>(oldLength));
  entry.bytes = journal.substr(kHeader + static_cast<std::size_t>(oldLength),
                               static_cast<std::size_t>(length));
  return entry;
}

// Cuts the file where its tail starts and writes what follows in one write,
// then flushes data and size (fdatasync): once this returns true the
// replacement survives a crash.
bool WriteTail(RandomAccessFile& file, std::uint64_t offset, std::string_view bytes) {
  return file.Cut(offset) && file.WriteAt(offset, bytes) && file.Sync();
}

}  // namespace

TailJournal::TailJournal(std::string path, std::size_t window)
    : path_(std::move(path)), window_(std::max<std::size_t>(window, 1)) {
  const fs::path file(path_);
  folder_ = file.parent_path().string();
  journalPath_ = HiddenBeside(path_, ".journal");
}

bool TailJournal::RemoveJournal() { return DeleteFile(journalPath_) || !FileExists(journalPath_); }

TailJournal::Recovery TailJournal::Finish() {
  if (!FileExists(journalPath_)) return Recovery::Nothing;
  const std::optional<std::string> journal = ReadFile(journalPath_);
  if (!journal) return Recovery::Failed;
  const std::optional<Entry> entry = Decode(*journal);
  if (!entry) return RemoveJournal() ? Recovery::Dropped : Recovery::Failed;

  RandomAccessFile file;
  if (!file.Open(path_, RandomAccessFile::Mode::Existing)) {
    // The file is gone (collected by the carrier's transfer, removed by
    // hand): the journal belongs to no file any more.
    if (!FileExists(path_)) return RemoveJournal() ? Recovery::Dropped : Recovery::Failed;
    return Recovery::Failed;
  }
  const std::optional<std::uint64_t> size = file.Size();
  const std::optional<FileStamp> stamp = file.Stamp();
  if (!size || !stamp) return Recovery::Failed;

  // The file must be in one of the states the interrupted replacement can
  // leave: still whole with its old tail, or cut at the offset with any part
  // of the new bytes (or of the old tail, when putting it back was cut
  // short). Anything else means the file changed since, and the journal no
  // longer describes it.
  const std::uint64_t offset = entry->offset;
  const auto readFrom = [&](std::uint64_t length) {
    return file.Read(offset, static_cast<std::size_t>(length)).value_or(std::string());
  };
  bool matches = false;
  if (*size == entry->oldSize && readFrom(*size - offset) == entry->oldTail) matches = true;
  const std::uint64_t longest =
      std::max<std::uint64_t>(entry->oldSize, offset + entry->bytes.size());
  if (!matches && *size >= offset && *size <= longest) {
    const bool sameFile = stamp->device == entry->device && stamp->inode == entry->inode;
    const std::uint64_t written = *size - offset;
    matches = sameFile || (written <= entry->bytes.size() &&
                           readFrom(written) == std::string_view(entry->bytes).substr(0, written));
  }
  if (!matches) return RemoveJournal() ? Recovery::Dropped : Recovery::Failed;
  if (!WriteTail(file, offset, entry->bytes)) return Recovery::Failed;
  file.Close();
  // Left behind, the journal would only be completed again to the same bytes.
  RemoveJournal();
  return Recovery::Completed;
}

TailJournal::Begun TailJournal::Begin(const FindTail& find, const BuildTail& build) {
  Begun begun;
  RandomAccessFile file;
  std::string end;
  std::uint64_t start = 0;
  std::optional<std::size_t> at;
  bool created = false;
  if (file.Open(path_, RandomAccessFile::Mode::Existing)) {
    const std::optional<std::uint64_t> size = file.Size();
    if (!size) return {Outcome::CannotOpen, {}};
    start = *size > window_ ? *size - window_ : 0;
    const std::optional<std::string> bytes =
        file.Read(start, static_cast<std::size_t>(*size - start));
    if (!bytes) return {Outcome::CannotOpen, {}};
    end = *bytes;
    at = find(End{end, start});
  } else {
    if (FileExists(path_)) return {Outcome::CannotOpen, {}};
    // A missing file ends in the empty tail of a new file, when the check says so.
    at = find(End{});
    if (at) {
      if (!file.Open(path_, RandomAccessFile::Mode::CreateIfMissing))
        return {Outcome::CannotOpen, {}};
      created = true;
    }
  }
  if (!at || *at > end.size()) return {Outcome::NoTail, {}};

  Pending pending;
  pending.offset = start + *at;
  pending.oldTail = end.substr(*at);
  pending.bytes = build(pending.oldTail);

  const std::optional<FileStamp> stamp = file.Stamp();
  if (!stamp) return {Outcome::CannotOpen, {}};
  Entry entry{stamp->device,      stamp->inode,    pending.offset,
              start + end.size(), pending.oldTail, pending.bytes};
  file.Close();

  // The journal's data and size are flushed (fdatasync), then the folder
  // (fsync), so that its name survives a crash too: only then may the file
  // be touched.
  RandomAccessFile journal;
  if (!journal.Open(journalPath_, RandomAccessFile::Mode::CreateEmpty)) {
    if (created) DeleteFile(path_);
    return {Outcome::Failed, {}};
  }
  if (!journal.WriteAt(0, Encode(entry)) || !journal.Sync()) {
    journal.Close();
    RemoveJournal();
    if (created) DeleteFile(path_);
    return {Outcome::Failed, {}};
  }
  journal.Close();
  // Some file systems can't flush a folder; the journal's own data is durable there.
  SyncFolder(folder_);
  return {Outcome::Replaced, std::move(pending)};
}

TailJournal::Outcome TailJournal::Commit(const Pending& pending) {
  RandomAccessFile file;
  if (!file.Open(path_, RandomAccessFile::Mode::Existing)) {
    // Nothing touched the file: the journal must not complete it later.
    RemoveJournal();
    return Outcome::CannotOpen;
  }
  if (WriteTail(file, pending.offset, pending.bytes)) {
    file.Close();
    // A journal left behind after this point would only be completed again
    // to the same bytes; removing it needs no flush.
    RemoveJournal();
    return Outcome::Replaced;
  }
  // The write failed part-way (disk full, file size limit): put the old
  // tail back. Only when that succeeds does the journal go; otherwise the
  // next Finish completes the replacement instead.
  if (WriteTail(file, pending.offset, pending.oldTail)) RemoveJournal();
  return Outcome::Failed;
}

TailJournal::Outcome TailJournal::Replace(const FindTail& find, const BuildTail& build) {
  const Recovery recovery = Finish();
  if (recovery == Recovery::Failed) return Outcome::CannotOpen;
  Begun begun = Begin(find, build);
  if (!begun.pending) return begun.outcome;
  return Commit(*begun.pending);
}

}  // namespace quendal
