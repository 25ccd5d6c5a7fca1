// File helpers for carrier folders: list a folder's files with their
// creation dates, create folders, append, replace a file atomically.
#pragma once

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
std::optional<std::uintmax_t> FileSize(const std::string& path);

}  // namespace quendal
