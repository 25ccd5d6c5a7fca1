#include "platform/FileSystem.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cerrno>
#include <cstdio>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace quendal {

namespace fs = std::filesystem;

namespace {

DateTime LocalDate(std::time_t t) {
  std::tm local{};
  localtime_r(&t, &local);
  return DateTime::FromParts(local.tm_year + 1900, local.tm_mon + 1, local.tm_mday, local.tm_hour,
                             local.tm_min, local.tm_sec);
}

}  // namespace

bool WriteAll(int fd, std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t n = ::write(fd, bytes.data(), bytes.size());
    if (n < 0) {
      if (errno == EINTR) continue;
      return false;
    }
    bytes.remove_prefix(static_cast<std::size_t>(n));
  }
  return true;
}

std::uint64_t Fnv1a(std::string_view bytes) {
  std::uint64_t hash = 14695981039346656037ull;
  for (unsigned char c : bytes) {
    hash ^= c;
    hash *= 1099511628211ull;
  }
  return hash;
}

bool NamesOpenFile(const std::string& path, int fd) {
  struct stat open {};
  struct stat named {};
  return ::fstat(fd, &open) == 0 && ::stat(path.c_str(), &named) == 0 &&
         open.st_dev == named.st_dev && open.st_ino == named.st_ino;
}

std::optional<DateTime> CreationDate(const std::string& path) {
  struct statx sx {};
  if (statx(AT_FDCWD, path.c_str(), 0, STATX_BTIME | STATX_MTIME, &sx) == 0) {
    if (sx.stx_mask & STATX_BTIME) return LocalDate(static_cast<std::time_t>(sx.stx_btime.tv_sec));
    return LocalDate(static_cast<std::time_t>(sx.stx_mtime.tv_sec));
  }
  return std::nullopt;
}

std::optional<std::vector<FileEntry>> ListFiles(const std::string& folder) {
  std::error_code ec;
  fs::directory_iterator it(folder, ec);
  if (ec) return std::nullopt;
  std::vector<FileEntry> files;
  for (const auto& entry : it) {
    std::error_code e2;
    if (!entry.is_regular_file(e2)) continue;
    auto created = CreationDate(entry.path().string());
    files.push_back({entry.path().filename().string(), created.value_or(DateTime())});
  }
  std::sort(files.begin(), files.end(),
            [](const FileEntry& a, const FileEntry& b) { return a.name < b.name; });
  return files;
}

bool FolderExists(const std::string& folder) {
  std::error_code ec;
  return !folder.empty() && fs::is_directory(folder, ec);
}

bool FileExists(const std::string& path) {
  std::error_code ec;
  return fs::is_regular_file(path, ec);
}

bool CreateFolder(const std::string& folder) {
  std::error_code ec;
  fs::create_directories(folder, ec);
  return FolderExists(folder);
}

std::optional<std::string> ReadFile(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return std::nullopt;
  std::ostringstream ss;
  ss << in.rdbuf();
  if (in.bad()) return std::nullopt;
  return ss.str();
}

bool AppendFile(const std::string& path, std::string_view bytes) {
  const int fd = ::open(path.c_str(), O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0644);
  if (fd < 0) return false;
  const bool ok = WriteAll(fd, bytes);
  return ::close(fd) == 0 && ok;
}

bool ReplaceFile(const std::string& path, std::string_view bytes) {
  std::string tmpl = HiddenBeside(path, ".XXXXXX");
  const int fd = ::mkstemp(tmpl.data());
  if (fd < 0) return false;
  const bool ok = WriteAll(fd, bytes) && ::fsync(fd) == 0;
  if (::close(fd) != 0 || !ok) {
    ::unlink(tmpl.c_str());
    return false;
  }
  ::fchmodat(AT_FDCWD, tmpl.c_str(), 0644, 0);
  if (std::rename(tmpl.c_str(), path.c_str()) != 0) {
    ::unlink(tmpl.c_str());
    return false;
  }
  return true;
}

std::optional<std::string> ReadFileHead(const std::string& path, std::size_t maxBytes) {
  RandomAccessFile file;
  if (!file.Open(path, RandomAccessFile::Mode::Existing)) return std::nullopt;
  return file.Read(0, maxBytes);
}

bool SyncFolder(const std::string& folder) {
  const int fd = ::open(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (fd < 0) return false;
  const bool ok = ::fsync(fd) == 0;
  return ::close(fd) == 0 && ok;
}

NewFile WriteNewFile(const std::string& path, std::string_view bytes) {
  const fs::path target(path);
  const std::string folder = target.parent_path().string();
  std::string tmpl = HiddenBeside(path, ".XXXXXX");
  const int fd = ::mkstemp(tmpl.data());
  if (fd < 0) return NewFile::Failed;
  const bool written = WriteAll(fd, bytes) && ::fsync(fd) == 0 && ::fchmod(fd, 0644) == 0;
  if (::close(fd) != 0 || !written) {
    ::unlink(tmpl.c_str());
    return NewFile::Failed;
  }
  // A hard link takes the name only when it is free, and the file appears whole.
  if (::link(tmpl.c_str(), path.c_str()) == 0) {
    ::unlink(tmpl.c_str());
    SyncFolder(folder);
    return NewFile::Written;
  }
  const int linkError = errno;
  ::unlink(tmpl.c_str());
  if (linkError == EEXIST) return NewFile::Exists;
  if (linkError != EPERM && linkError != ENOTSUP && linkError != EOPNOTSUPP && linkError != EXDEV &&
      linkError != EMLINK)
    return NewFile::Failed;
  // File systems without hard links: create the name exclusively and write
  // into it; a failed write takes the file away again.
  const int direct = ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0644);
  if (direct < 0) return errno == EEXIST ? NewFile::Exists : NewFile::Failed;
  const bool ok = WriteAll(direct, bytes) && ::fsync(direct) == 0;
  if (::close(direct) != 0 || !ok) {
    ::unlink(path.c_str());
    return NewFile::Failed;
  }
  return NewFile::Written;
}

bool DeleteFile(const std::string& path) {
  std::error_code ec;
  return fs::remove(path, ec) && !ec;
}

std::optional<std::uintmax_t> FileSize(const std::string& path) {
  std::error_code ec;
  const auto size = fs::file_size(path, ec);
  if (ec) return std::nullopt;
  return size;
}

namespace {

FileStamp StampFrom(const struct stat& st) {
  return FileStamp{static_cast<std::uintmax_t>(st.st_dev), static_cast<std::uintmax_t>(st.st_ino),
                   static_cast<std::uintmax_t>(st.st_size),
                   static_cast<std::int64_t>(st.st_mtim.tv_sec) * 1000000000 + st.st_mtim.tv_nsec};
}

}  // namespace

std::string PathBeside(const std::string& path, int n) {
  const fs::path p(path);
  return (p.parent_path() / (p.stem().string() + "_" + std::to_string(n) + p.extension().string()))
      .string();
}

std::string HiddenBeside(const std::string& path, std::string_view suffix) {
  const fs::path file(path);
  return (file.parent_path() / ("." + file.filename().string() + std::string(suffix))).string();
}

std::optional<FileStamp> StampOf(const std::string& path) {
  struct stat st {};
  if (::stat(path.c_str(), &st) != 0 || !S_ISREG(st.st_mode)) return std::nullopt;
  return StampFrom(st);
}

bool AppendingFile::Open(const std::string& path) {
  Close();
  fd_ = ::open(path.c_str(), O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0644);
  if (fd_ < 0) return false;
  notePath_ = HiddenBeside(path, ".append");
  RepairTornAppend();
  return true;
}

void AppendingFile::RepairTornAppend() {
  std::ifstream in(notePath_, std::ios::binary);
  if (!in) return;
  long long pid = 0;
  long long before = -1;
  long long length = -1;
  in >> pid >> before >> length;
  const bool whole = !in.fail();
  in.close();
  // A writer that is still at work (another station) finishes its own append.
  if (whole && pid > 0 && pid != ::getpid() && ::kill(static_cast<pid_t>(pid), 0) == 0) return;
  struct stat st {};
  if (whole && before >= 0 && length > 0 && ::fstat(fd_, &st) == 0 && st.st_size > before &&
      st.st_size < before + length) {
    if (::ftruncate(fd_, before) != 0) return;  // keep the note for the next call
  }
  ::unlink(notePath_.c_str());
}

std::optional<FileStamp> AppendingFile::Stamp() const {
  struct stat st {};
  if (fd_ < 0 || ::fstat(fd_, &st) != 0) return std::nullopt;
  return StampFrom(st);
}

bool AppendingFile::Append(std::string_view bytes) {
  if (fd_ < 0) return false;
  struct stat st {};
  if (::fstat(fd_, &st) != 0) return false;
  const std::string note = std::to_string(::getpid()) + " " + std::to_string(st.st_size) + " " +
                           std::to_string(bytes.size()) + "\n";
  // A note cut short by a kill was written before any of the bytes, and is dropped.
  bool noted = false;
  if (const int fd = ::open(notePath_.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
      fd >= 0) {
    noted = WriteAll(fd, note);
    noted = ::close(fd) == 0 && noted;
  }
  const bool written = WriteAll(fd_, bytes);
  if (noted) ::unlink(notePath_.c_str());
  if (written) return true;
  // Take back what the failed write left behind.
  const int cut = ::ftruncate(fd_, st.st_size);
  static_cast<void>(cut);
  return false;
}

void AppendingFile::Close() {
  if (fd_ >= 0) ::close(fd_);
  fd_ = -1;
}

bool RandomAccessFile::Open(const std::string& path, Mode mode) {
  Close();
  int flags = O_RDWR | O_CLOEXEC;
  if (mode != Mode::Existing) flags |= O_CREAT;
  if (mode == Mode::CreateEmpty) flags |= O_TRUNC;
  fd_ = ::open(path.c_str(), flags, 0644);
  return fd_ >= 0;
}

std::optional<std::uint64_t> RandomAccessFile::Size() const {
  struct stat st {};
  if (fd_ < 0 || ::fstat(fd_, &st) != 0) return std::nullopt;
  return static_cast<std::uint64_t>(st.st_size);
}

std::optional<FileStamp> RandomAccessFile::Stamp() const {
  struct stat st {};
  if (fd_ < 0 || ::fstat(fd_, &st) != 0) return std::nullopt;
  return StampFrom(st);
}

std::optional<std::string> RandomAccessFile::Read(std::uint64_t offset, std::size_t length) const {
  if (fd_ < 0) return std::nullopt;
  std::string bytes(length, '\0');
  std::size_t got = 0;
  while (got < length) {
    const ssize_t n = ::pread(fd_, bytes.data() + got, length - got, static_cast<off_t>(offset + got));
    if (n < 0) {
      if (errno == EINTR) continue;
      return std::nullopt;
    }
    if (n == 0) break;
    got += static_cast<std::size_t>(n);
  }
  bytes.resize(got);
  return bytes;
}

bool RandomAccessFile::Cut(std::uint64_t length) {
  return fd_ >= 0 && ::ftruncate(fd_, static_cast<off_t>(length)) == 0;
}

bool RandomAccessFile::WriteAt(std::uint64_t offset, std::string_view bytes) {
  if (fd_ < 0) return false;
  while (!bytes.empty()) {
    const ssize_t n = ::pwrite(fd_, bytes.data(), bytes.size(), static_cast<off_t>(offset));
    if (n < 0) {
      if (errno == EINTR) continue;
      return false;
    }
    bytes.remove_prefix(static_cast<std::size_t>(n));
    offset += static_cast<std::uint64_t>(n);
  }
  return true;
}

bool RandomAccessFile::Sync() { return fd_ >= 0 && ::fdatasync(fd_) == 0; }

void RandomAccessFile::Close() {
  if (fd_ >= 0) ::close(fd_);
  fd_ = -1;
}

}  // namespace quendal
