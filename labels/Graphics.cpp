#include "labels/Graphics.h"

#include <cstdlib>
#include <filesystem>

#include "frame/FailSafe.h"
#include "platform/FileSystem.h"

namespace quendal {

namespace {

namespace fs = std::filesystem;

// A label graphic is a few kilobytes; anything this large is not one.
constexpr std::size_t kLargestGraphic = 1 << 20;

std::string InFolder(std::string_view folder, std::string_view fileName) {
  std::string path(folder);
  if (!path.empty() && path.back() != '/') path += '/';
  return path.append(fileName);
}

}  // namespace

std::string GraphicPath(std::string_view fileName) {
  if (const char* folder = std::getenv("QUENDAL_GRAPHICS_DIR"); folder && *folder)
    return InFolder(folder, fileName);
  const std::string installed = InFolder(QUENDAL_INSTALLED_GRAPHICS, fileName);
  if (FileExists(installed)) return installed;
  // Installed under another prefix: beside the library's (or the program's) folder.
  const fs::path binary(LibraryPath());
  if (binary.has_parent_path()) {
    const std::string moved =
        (binary.parent_path().parent_path() / "share/quendal/graphics" / fileName).string();
    if (FileExists(moved)) return moved;
  }
  return InFolder(QUENDAL_SOURCE_GRAPHICS, fileName);
}

std::optional<std::string> ReadGraphic(const std::string& path) {
  const std::optional<std::uintmax_t> size = FileSize(path);
  if (!size || *size == 0 || *size > kLargestGraphic) return std::nullopt;
  std::optional<std::string> rows = ReadFile(path);
  if (!rows || rows->empty()) return std::nullopt;
  return rows;
}

}  // namespace quendal
