// A fresh folder under the system's temporary folder, removed with its contents at the end.
#pragma once

#include <string>

namespace quendal::test {

class TempFolder {
 public:
  TempFolder();
  ~TempFolder();
  TempFolder(const TempFolder&) = delete;
  TempFolder& operator=(const TempFolder&) = delete;
  const std::string& path() const { return path_; }
  std::string operator/(const std::string& name) const { return path_ + "/" + name; }

 private:
  std::string path_;
};

// The text of a file (empty when it can't be read).
std::string ReadText(const std::string& path);
void WriteText(const std::string& path, const std::string& text);

}  // namespace quendal::test
