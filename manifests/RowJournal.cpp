#include "manifests/RowJournal.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdint>
#include <cstdlib>
#include <filesystem>

#include "platform/FileSystem.h"

namespace quendal {

namespace {

namespace fs = std::filesystem;

// A record: its length (8 bytes little-endian), its bytes, and an FNV-1a
// checksum of both (8 bytes little-endian).
constexpr std::size_t kNumber = 8;
constexpr std::string_view kSuffix = ".pending";

void PutNumber(std::string& out, std::uint64_t value) {
  for (std::size_t i = 0; i < kNumber; ++i)
    out.push_back(static_cast<char>((value >> (8 * i)) & 0xFF));
}

std::uint64_t GetNumber(std::string_view bytes, std::size_t at) {
  std::uint64_t value = 0;
  for (std::size_t i = kNumber; i-- > 0;)
    value = (value << 8) | static_cast<unsigned char>(bytes[at + i]);
  return value;
}

std::string Frame(std::string_view record) {
  std::string out;
  PutNumber(out, record.size());
  out += record;
  PutNumber(out, Fnv1a(out));
  return out;
}

// Takes the journal's lock: waiting for it (the run's own journal) or only
// when it is free (a journal left behind). The lock belongs to the open file,
// so a live run's journal is held against every other object and process.
bool LockJournal(int fd, bool wait) {
#ifdef F_OFD_SETLK
  struct flock whole {};
  whole.l_type = F_WRLCK;
  whole.l_whence = SEEK_SET;
  for (;;) {
    if (::fcntl(fd, wait ? F_OFD_SETLKW : F_OFD_SETLK, &whole) == 0) return true;
    if (errno != EINTR) return false;
  }
#else
  static_cast<void>(fd);
  static_cast<void>(wait);
  return false;  // without per-file locks no journal can be told abandoned
#endif
}

std::string Prefix(const std::string& kind) { return "." + kind + "-"; }

}  // namespace

RowJournal::RowJournal(std::string folder, std::string kind)
    : folder_(std::move(folder)), kind_(std::move(kind)) {}

RowJournal::~RowJournal() {
  if (fd_ >= 0) ::close(fd_);
}

bool RowJournal::Add(std::string_view record) {
  bool created = false;
  for (int attempt = 0; fd_ < 0; ++attempt) {
    if (attempt == 3) return false;
    std::string name = (fs::path(folder_) / (Prefix(kind_) + "XXXXXX" + std::string(kSuffix))).string();
    const int fd = ::mkostemps(name.data(), static_cast<int>(kSuffix.size()), O_CLOEXEC);
    if (fd < 0) return false;
    if (!LockJournal(fd, true)) {
      ::close(fd);
      ::unlink(name.c_str());
      return false;
    }
    // Until it is locked, a new empty journal looks abandoned to another
    // run, which may remove it: then it is made again.
    if (!NamesOpenFile(name, fd)) {
      ::close(fd);
      continue;
    }
    fd_ = fd;
    path_ = name;
    created = true;
  }
  struct stat st {};
  if (::fstat(fd_, &st) != 0) return false;
  if (WriteAll(fd_, Frame(record)) && ::fdatasync(fd_) == 0) {
    // The journal's name must survive a crash as well as its bytes.
    if (created) SyncFolder(folder_);
    return true;
  }
  // Take back what the failed write left, so the next record follows a whole one.
  const int cut = ::ftruncate(fd_, st.st_size);
  static_cast<void>(cut);
  if (created) Clear();
  return false;
}

void RowJournal::Clear() {
  if (fd_ < 0) return;
  ::unlink(path_.c_str());
  ::close(fd_);
  fd_ = -1;
  path_.clear();
}

std::vector<std::string> RowJournal::Records(std::string_view bytes) {
  std::vector<std::string> records;
  std::size_t at = 0;
  while (bytes.size() - at >= 2 * kNumber) {
    const std::uint64_t length = GetNumber(bytes, at);
    if (length > bytes.size() - at - 2 * kNumber) break;
    const std::size_t end = at + kNumber + static_cast<std::size_t>(length);
    if (GetNumber(bytes, end) != Fnv1a(bytes.substr(at, end - at))) break;
    records.emplace_back(bytes.substr(at + kNumber, static_cast<std::size_t>(length)));
    at = end + kNumber;
  }
  return records;
}

int RowJournal::TakeAbandoned(const std::string& folder, const std::string& kind,
                              const MoveIn& moveIn) {
  const auto files = ListFiles(folder);
  if (!files) return 0;
  const std::string prefix = Prefix(kind);
  int taken = 0;
  for (const FileEntry& file : *files) {
    if (!file.name.starts_with(prefix) || !file.name.ends_with(kSuffix)) continue;
    const std::string path = (fs::path(folder) / file.name).string();
    const int fd = ::open(path.c_str(), O_RDWR | O_CLOEXEC);
    if (fd < 0) continue;
    // A run that holds its journal is alive; the journal is still its own.
    // Once locked here, the name must still be this file: another run may
    // have moved it in and removed it meanwhile.
    if (LockJournal(fd, false) && NamesOpenFile(path, fd)) {
      const std::optional<std::string> bytes = ReadFile(path);
      if (bytes) {
        const std::vector<std::string> records = Records(*bytes);
        if (records.empty() || moveIn(records)) {
          ::unlink(path.c_str());
          ++taken;
        }
      }
    }
    ::close(fd);
  }
  return taken;
}

}  // namespace quendal
