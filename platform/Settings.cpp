#include "platform/Settings.h"

#include <pthread.h>
#include <sys/inotify.h>
#include <sys/stat.h>
#include <sys/statfs.h>
#include <unistd.h>

#include <cerrno>
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

// Folders whose changes the kernel may not report to a watch: changes made
// on another machine (network shares) or by a user-space file system.
bool WatchesAreReliable(const std::string& folder) {
  struct statfs fs {};
  if (::statfs(folder.c_str(), &fs) != 0) return false;
  switch (static_cast<unsigned long>(fs.f_type)) {
    case 0x6969:      // NFS
    case 0x517B:      // SMB
    case 0xFF534D42:  // CIFS
    case 0xFE534D42:  // SMB2
    case 0x65735546:  // FUSE
    case 0x00C36400:  // Ceph
    case 0x5346414F:  // AFS
    case 0x01021997:  // 9P
      return false;
    default:
      return true;
  }
}

// Label classes read their switch for every label, so the parsed file is
// kept, and a change is noticed without asking the file system about the
// file each time: the folder holding it is watched (inotify), and an event
// naming the file (saved, replaced by rename, created, deleted, edited) or
// the folder itself (deleted, moved) marks the parsed copy stale. The kernel
// queues the event before the writer's call returns, so the next read after
// any change sees it. Where a watch can't tell (a network share, a settings
// file that is a symbolic link), the file is stamped on every read instead.
class SettingsCache {
 public:
  std::string Value(const std::string& path, std::string_view section, std::string_view key,
                    std::string_view fallback) {
    std::lock_guard lock(mutex_);
    Drain();
    auto it = entries_.find(path);
    if (it == entries_.end()) it = entries_.emplace(path, Entry{}).first;
    Entry& entry = it->second;
    if (!entry.fresh && !Refresh(path, entry)) return std::string(fallback);
    for (const IniLine& line : entry.lines)
      if (line.section == section && line.key == key) return ValueOf(line.text);
    return std::string(fallback);
  }

  // Held across fork(), so that the child's copy is not left locked.
  void BeforeFork() { mutex_.lock(); }
  void AfterForkInParent() { mutex_.unlock(); }
  // A forked child would share the parent's watch queue: it starts over with its own.
  void AfterForkInChild() {
    if (fd_ >= 0) ::close(fd_);
    fd_ = -1;
    for (auto& [path, entry] : entries_) {
      entry.fresh = false;
      entry.watch = -1;
    }
    mutex_.unlock();
  }

 private:
  struct Entry {
    bool fresh = false;  // lines are the file's content as it stands
    int watch = -1;      // watch on the file's folder
    bool stampOnly = false;  // the folder can't be watched: stamp the file on every read
    FileStamp stamp;
    std::vector<IniLine> lines;
  };

  static constexpr std::uint32_t kFolderEvents =
      IN_MODIFY | IN_ATTRIB | IN_CLOSE_WRITE | IN_CREATE | IN_DELETE | IN_MOVED_FROM |
      IN_MOVED_TO | IN_DELETE_SELF | IN_MOVE_SELF | IN_ONLYDIR;

  // Reads the queued events and marks the entries they concern stale.
  void Drain() {
    if (fd_ < 0) return;
    alignas(struct inotify_event) char buffer[4096];
    for (;;) {
      const ssize_t n = ::read(fd_, buffer, sizeof buffer);
      if (n < 0 && errno == EINTR) continue;
      if (n <= 0) return;  // EAGAIN: nothing more queued
      for (ssize_t at = 0; at < n;) {
        const auto* event = reinterpret_cast<const struct inotify_event*>(buffer + at);
        at += static_cast<ssize_t>(sizeof(struct inotify_event) + event->len);
        MarkStale(*event);
      }
    }
  }

  void MarkStale(const struct inotify_event& event) {
    const bool everything = (event.mask & IN_Q_OVERFLOW) != 0;
    const bool folder =
        (event.mask & (IN_DELETE_SELF | IN_MOVE_SELF | IN_IGNORED | IN_UNMOUNT)) != 0;
    const std::string_view name = event.len ? std::string_view(event.name) : std::string_view();
    for (auto& [path, entry] : entries_) {
      if (!everything && entry.watch != event.wd) continue;
      if (everything || folder || FileName(path) == name) {
        entry.fresh = false;
        // The folder is gone or elsewhere: watch the path afresh next time.
        if (everything || folder) DropWatch(entry);
      }
    }
  }

  void DropWatch(Entry& entry) {
    const int watch = entry.watch;
    entry.watch = -1;
    if (watch < 0 || fd_ < 0) return;
    for (const auto& [path, other] : entries_)
      if (other.watch == watch) return;  // still wanted for another file of the folder
    ::inotify_rm_watch(fd_, watch);
  }

  static bool IsLink(const std::string& path) {
    struct stat st {};
    return ::lstat(path.c_str(), &st) == 0 && S_ISLNK(st.st_mode);
  }

  static std::string_view FileName(std::string_view path) {
    const std::size_t slash = path.rfind('/');
    return slash == std::string_view::npos ? path : path.substr(slash + 1);
  }

  // Reads the file again; false when it does not exist.
  bool Refresh(const std::string& path, Entry& entry) {
    if (entry.watch < 0 && !entry.stampOnly) {
      const WatchResult result = Watch(path);
      if (result.noFolder) return false;  // nothing to read yet; watched once the folder exists
      entry.watch = result.watch;
      entry.stampOnly = result.watch < 0;
    }
    if (entry.watch >= 0 && IsLink(path)) {
      // The folder's events don't tell of changes to the file linked to.
      DropWatch(entry);
      entry.stampOnly = true;
    }
    if (entry.watch >= 0) {
      // Watched before reading: a change from here on leaves an event.
      entry.fresh = true;
      entry.lines = ReadIni(path);
      return true;
    }
    const auto stamp = Stamp(path);
    if (!stamp) {
      entry.stamp = FileStamp{};
      entry.lines.clear();
      return false;
    }
    if (entry.stamp == *stamp) return true;
    entry.lines = ReadIni(path);
    // Stamp again after reading: a file replaced meanwhile is read next time.
    entry.stamp = Stamp(path) == stamp ? *stamp : FileStamp{};
    return true;
  }

  struct WatchResult {
    int watch = -1;         // -1: changes can't be watched, stamp the file instead
    bool noFolder = false;  // the folder does not exist (so neither does the file)
  };

  WatchResult Watch(const std::string& path) {
    const std::size_t slash = path.rfind('/');
    const std::string folder = slash == std::string::npos ? "." : path.substr(0, slash + 1);
    if (fd_ < 0) {
      fd_ = ::inotify_init1(IN_NONBLOCK | IN_CLOEXEC);
      if (fd_ < 0) return {};
    }
    const int watch = ::inotify_add_watch(fd_, folder.c_str(), kFolderEvents);
    if (watch < 0) return {-1, errno == ENOENT || errno == ENOTDIR};
    if (!WatchesAreReliable(folder)) {
      DropUnused(watch);
      return {};
    }
    return {watch, false};
  }

  void DropUnused(int watch) {
    for (const auto& [path, entry] : entries_)
      if (entry.watch == watch) return;
    ::inotify_rm_watch(fd_, watch);
  }

  std::mutex mutex_;
  int fd_ = -1;
  std::map<std::string, Entry, std::less<>> entries_;
};

SettingsCache& Cache() {
  static SettingsCache* cache = [] {
    auto* c = new SettingsCache;  // never destroyed: settings may be read during shutdown
    ::pthread_atfork([] { Cache().BeforeFork(); }, [] { Cache().AfterForkInParent(); },
                     [] { Cache().AfterForkInChild(); });
    return c;
  }();
  return *cache;
}

std::string CachedValue(const std::string& path, std::string_view section, std::string_view key,
                        std::string_view fallback) {
  return Cache().Value(path, section, key, fallback);
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
