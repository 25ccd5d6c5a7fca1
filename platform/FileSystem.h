// File helpers for carrier folders: list a folder's files with their
// creation dates, create folders, append, replace a file atomically.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "frame/Var.h"

namespace quendal {

struct FileEntry {
  std::string name;  // without folder
  DateTime created;  // birth time where the file system keeps one, else modification time
};

// The regular files of a folder, sorted by name; nullopt when the folder can't be opened.
std::optional<std::vector<FileEntry>> ListFiles(const std::string& folder);
std::optional<DateTime> CreationDate(const std::string& path);

bool FolderExists(const std::string& folder);
bool FileExists(const std::string& path);
// Creates the folder and its parents; true when it exists afterwards.
bool CreateFolder(const std::string& folder);
std::optional<std::string> ReadFile(const std::string& path);
// Appends bytes, creating the file when missing.
bool AppendFile(const std::string& path, std::string_view bytes);
// Writes bytes to a temporary file beside `path` and renames it over `path`,
// so a failure never leaves a half-written file.
bool ReplaceFile(const std::string& path, std::string_view bytes);
bool DeleteFile(const std::string& path);
// At most `maxBytes` bytes from the start of the file.
std::optional<std::string> ReadFileHead(const std::string& path, std::size_t maxBytes);
// The n-th name beside a file that must be left alone: "name_2.xml",
// "name_3.xml", ... in the same folder, with the same extension.
std::string PathBeside(const std::string& path, int n);
// The hidden file beside `path` that belongs to it: ".<file name><suffix>"
// in the same folder (its journal, lock or append note).
std::string HiddenBeside(const std::string& path, std::string_view suffix);
// Makes the folder's entries (files created, renamed or removed in it) durable.
bool SyncFolder(const std::string& folder);

// Writes a file that must not exist yet, so that it appears whole or not
// at all: the bytes go to a hidden file beside it, which is then linked to
// its name. Never replaces a file that exists.
enum class NewFile { Written, Exists, Failed };
NewFile WriteNewFile(const std::string& path, std::string_view bytes);
std::optional<std::uintmax_t> FileSize(const std::string& path);

// Writes all bytes to an open descriptor, going on after short or interrupted writes.
bool WriteAll(int fd, std::string_view bytes);
// FNV-1a over the bytes: how journals tell a whole record from one a crash tore.
std::uint64_t Fnv1a(std::string_view bytes);
// True while `path` still names the file open as `fd` (it was not removed or replaced).
bool NamesOpenFile(const std::string& path, int fd);

// What tells one state of a file from another: its identity, size and
// modification time. A cache of a file's contents stays valid while the
// stamp is unchanged.
struct FileStamp {
  std::uintmax_t device = 0;
  std::uintmax_t inode = 0;
  std::uintmax_t size = 0;
  std::int64_t modifiedNs = 0;
  bool operator==(const FileStamp&) const = default;
};
std::optional<FileStamp> StampOf(const std::string& path);

// A file opened for appending (created when missing) and closed again when
// the object goes or Close is called.
//
// A process killed while it appends can leave part of what it meant to
// write (the kernel stops a large write at a page when the process dies).
// So each Append first leaves a note beside the file (".name.append": the
// writer's process id, the file's length before and the length to add) and
// removes it once the bytes are in; Open finds a note whose writer is gone
// and cuts the file back to its length before that append, when the file
// still ends in the torn part. A file that grew beyond it since is left
// alone.
class AppendingFile {
 public:
  AppendingFile() = default;
  ~AppendingFile() { Close(); }
  AppendingFile(const AppendingFile&) = delete;
  AppendingFile& operator=(const AppendingFile&) = delete;

  bool Open(const std::string& path);
  bool IsOpen() const { return fd_ >= 0; }
  std::optional<FileStamp> Stamp() const;
  // Writes all bytes at the end of the file. When the write fails part-way
  // the file is cut back to its length before the call, so a reader never
  // finds half of what was meant to go in together.
  bool Append(std::string_view bytes);
  void Close();

 private:
  // Cuts back an append that a dead writer left torn, and drops its note.
  void RepairTornAppend();

  int fd_ = -1;
  std::string notePath_;
};

// A file opened for reading and writing in place, for replacing its end.
class RandomAccessFile {
 public:
  enum class Mode {
    Existing,         // the file must exist
    CreateIfMissing,  // an empty file is created when missing
    CreateEmpty,      // created, or emptied when it exists
  };
  RandomAccessFile() = default;
  ~RandomAccessFile() { Close(); }
  RandomAccessFile(const RandomAccessFile&) = delete;
  RandomAccessFile& operator=(const RandomAccessFile&) = delete;

  bool Open(const std::string& path, Mode mode);
  bool IsOpen() const { return fd_ >= 0; }
  std::optional<std::uint64_t> Size() const;
  std::optional<FileStamp> Stamp() const;
  // The bytes at `offset`; fewer when the file ends before `length`.
  std::optional<std::string> Read(std::uint64_t offset, std::size_t length) const;
  // Cuts the file to `length` bytes.
  bool Cut(std::uint64_t length);
  // Writes all bytes at `offset`.
  bool WriteAt(std::uint64_t offset, std::string_view bytes);
  // Makes the file's data and size durable (fdatasync).
  bool Sync();
  void Close();

 private:
  int fd_ = -1;
};

}  // namespace quendal
