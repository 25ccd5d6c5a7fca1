// A fresh folder under the system's temporary folder, removed with its contents at the end.
#pragma once

#include <string>
#include <vector>

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

// Makes a folder (created when missing) the process's working directory
// until the end of the scope, so that a file written where no folder points
// lands where a test can see it.
class WorkingDirectory {
 public:
  explicit WorkingDirectory(const std::string& path);
  ~WorkingDirectory();
  WorkingDirectory(const WorkingDirectory&) = delete;
  WorkingDirectory& operator=(const WorkingDirectory&) = delete;
  // The names of the files and folders in it.
  std::vector<std::string> Entries() const;

 private:
  std::string path_;
  std::string previous_;
};

// The text of a file (empty when it can't be read).
std::string ReadText(const std::string& path);
void WriteText(const std::string& path, const std::string& text);

}  // namespace quendal::test
