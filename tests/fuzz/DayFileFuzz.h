// What the targets that reopen a day file share: a carrier folder of the
// process's own under TMPDIR (/dev/shm spares the disk the flushes),
// emptied before each input, the input written into it as
// the day file, and a prompt that counts the error reports instead of
// asking anyone.
#pragma once

#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "frame/FailSafe.h"
#include "platform/FileSystem.h"
#include "tests/fuzz/FuzzInput.h"

namespace quendal::fuzz {

// The folder, with a separator at its end, holding nothing.
inline const std::string& EmptyFolder() {
  static const std::string folder = [] {
    std::string pattern = (std::filesystem::temp_directory_path() / "quendal-dayfile-XXXXXX").string();
    Check(::mkdtemp(pattern.data()) != nullptr);
    static std::string made;
    made = pattern;
    std::atexit([] {
      std::error_code ec;
      std::filesystem::remove_all(made, ec);
    });
    return pattern + "/";
  }();
  std::error_code ec;
  for (const auto& entry : std::filesystem::directory_iterator(folder, ec))
    std::filesystem::remove_all(entry.path(), ec);
  return folder;
}

// Writes the input as the day file; an empty input stands for no file at all.
inline void Lay(const std::string& path, std::string_view bytes) {
  if (!bytes.empty()) Check(AppendFile(path, bytes));
}

// The files a call wrote, with their bytes: every file of the folder but
// hidden ones, the day file only when it no longer holds `before`.
inline std::vector<std::pair<std::string, std::string>> Written(const std::string& folder,
                                                                const std::string& path,
                                                                const std::string& before) {
  std::vector<std::pair<std::string, std::string>> files;
  for (const auto& entry : std::filesystem::directory_iterator(folder)) {
    if (entry.path().filename().string().starts_with(".")) continue;
    std::string bytes = ReadFile(entry.path().string()).value_or("");
    if (entry.path().string() == path && bytes == before) continue;
    files.emplace_back(entry.path().string(), std::move(bytes));
  }
  return files;
}

class CountingPrompt : public ErrorPrompt {
 public:
  Answer Ask(const std::string&, const std::string&) override {
    ++asked;
    return Answer::Abort;
  }
  int asked = 0;
};

// Installs a counting prompt for the whole run and returns it.
inline CountingPrompt& Prompt() {
  static const auto prompt = [] {
    auto p = std::make_shared<CountingPrompt>();
    SetErrorPrompt(p);
    return p;
  }();
  return *prompt;
}

}  // namespace quendal::fuzz
