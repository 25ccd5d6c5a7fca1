// quendal gallery: one picture per built label class, of the first carton of
// the class's carrier in the database (the demo day's), as the class's
// label printer prints it; optionally the table of those pictures in a
// Markdown file (the README's gallery).
#pragma once

#include <iosfwd>
#include <string>

#include "cli/Cli.h"

namespace quendal::mvserver {
class SqliteHost;
}

namespace quendal::cli {

struct GalleryOptions {
  std::string out = "docs/gallery";  // a folder; one <class>.png each
  int dpi = 203;
  std::string readme;  // when set, the table goes between its gallery marks
};

// The marks that enclose the gallery table in a Markdown file.
inline constexpr const char* kGalleryStart = "<!-- gallery -->";
inline constexpr const char* kGalleryEnd = "<!-- /gallery -->";

int RunGallery(mvserver::SqliteHost& host, const GalleryOptions& options, std::ostream& cout,
               bool asJson);

}  // namespace quendal::cli
