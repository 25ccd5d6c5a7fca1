#include "platform/Settings.h"

#include <sys/stat.h>

#include <cstdlib>
#include <filesystem>
#include <map>
#include <mutex>
#include <sstream>
#include <vector>

#include "frame/VB.h"
#include "platform/FileSystem.h"

namespace quendal {

namespace {

struct IniLine {
  std::string section;  // section the line belongs to
  std::string key;      // empty for headers, comments and blank lines
  std::string text;     // the line as read
};

std::vector<IniLine> ReadIni(const std::string& path) {
  std::vector<IniLine> lines;
  const auto content = ReadFile(path);
  if (!content) return lines;
  std::istringstream in(*content);
  std::string line;
  std::string section;
  while (std::getline(in, line)) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
    const std::string t = Trim(line);
    IniLine entry{section, {}, line};
    if (t.size() >= 2 && t.front() == '[' && t.back() == ']') {
      section = t.substr(1, t.size() - 2);
      entry.section = section;
    } else if (!t.empty() && t[0] != ';' && t[0] != '#') {
      const std::size_t eq = t.find('=');
      if (eq != std::string::npos) entry.key = Trim(t.substr(0, eq));
    }
    lines.push_back(entry);
  }
  return lines;
}

std::string ValueOf(const std::string& line) {
  return Trim(line.substr(line.find('=') + 1));
}

}  // namespace

std::string SettingsPath(std::string_view application) {
  // Built as text: it is asked for every label.
  std::string path;
  if (const char* xdg = std::getenv("XDG_CONFIG_HOME"); xdg && *xdg) {
    path = xdg;
  } else if (const char* home = std::getenv("HOME"); home && *home) {
    path = home;
    if (path.back() != '/') path += '/';
    path += ".config";
  } else {
    path = ".config";
  }
  if (path.back() != '/') path += '/';
  path += application;
  path += "/settings.ini";
  return path;
}

namespace {

// Which version of a settings file was read: any save (ours replaces the
// file, giving it a new inode) or edit in place changes one of these.
struct FileStamp {
  dev_t device = 0;
  ino_t inode = 0;
  off_t size = 0;
  std::int64_t modified = 0;  // nanoseconds
  std::int64_t changed = 0;

  bool operator==(const FileStamp&) const = default;
};

std::optional<FileStamp> Stamp(const std::string& path) {
  struct stat st {};
  if (::stat(path.c_str(), &st) != 0) return std::nullopt;
  return FileStamp{st.st_dev, st.st_ino, st.st_size,
                   st.st_mtim.tv_sec * 1000000000LL + st.st_mtim.tv_nsec,
                   st.st_ctim.tv_sec * 1000000000LL + st.st_ctim.tv_nsec};
}

// Label classes read their switch for every label: the parsed file is kept
// and read again only when the file changed.
std::string CachedValue(const std::string& path, std::string_view section, std::string_view key,
                        std::string_view fallback) {
  struct Parsed {
    FileStamp stamp;
    std::vector<IniLine> lines;
  };
  static std::mutex mutex;
  static std::map<std::string, Parsed, std::less<>> cache;
  const auto stamp = Stamp(path);
  if (!stamp) return std::string(fallback);
  std::lock_guard lock(mutex);
  auto it = cache.find(path);
  if (it == cache.end() || !(it->second.stamp == *stamp)) {
    // Stamp again after reading: a file replaced meanwhile is read next time.
    Parsed parsed{*stamp, ReadIni(path)};
    if (Stamp(path) != stamp) parsed.stamp = FileStamp{};
    it = cache.insert_or_assign(path, std::move(parsed)).first;
  }
  for (const IniLine& line : it->second.lines)
    if (line.section == section && line.key == key) return ValueOf(line.text);
  return std::string(fallback);
}

}  // namespace

std::string GetSetting(std::string_view application, std::string_view section,
                       std::string_view key, std::string_view fallback) {
  return CachedValue(SettingsPath(application), section, key, fallback);
}

bool SaveSetting(std::string_view application, std::string_view section, std::string_view key,
                 std::string_view value) {
  const std::string path = SettingsPath(application);
  std::vector<IniLine> lines = ReadIni(path);
  const std::string entry = std::string(key) + "=" + std::string(value);
  bool done = false;
  std::size_t lastInSection = std::string::npos;
  for (std::size_t i = 0; i < lines.size(); ++i) {
    if (lines[i].section != section) continue;
    lastInSection = i;
    if (lines[i].key == key) {
      lines[i].text = entry;
      done = true;
    }
  }
  std::string out;
  for (std::size_t i = 0; i < lines.size(); ++i) {
    out += lines[i].text + "\n";
    if (!done && i == lastInSection) {
      out += entry + "\n";
      done = true;
    }
  }
  if (!done) out += "[" + std::string(section) + "]\n" + entry + "\n";
  if (!CreateFolder(std::filesystem::path(path).parent_path().string())) return false;
  return ReplaceFile(path, out);
}

}  // namespace quendal
