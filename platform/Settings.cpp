#include "platform/Settings.h"

#include <cstdlib>
#include <filesystem>
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
  std::filesystem::path base;
  if (const char* xdg = std::getenv("XDG_CONFIG_HOME"); xdg && *xdg) {
    base = xdg;
  } else if (const char* home = std::getenv("HOME"); home && *home) {
    base = std::filesystem::path(home) / ".config";
  } else {
    base = ".config";
  }
  return (base / std::string(application) / "settings.ini").string();
}

std::string GetSetting(std::string_view application, std::string_view section,
                       std::string_view key, std::string_view fallback) {
  for (const IniLine& line : ReadIni(SettingsPath(application)))
    if (line.section == section && line.key == key) return ValueOf(line.text);
  return std::string(fallback);
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
