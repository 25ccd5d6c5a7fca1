// Graphics a label class keeps on its printers (a carrier's logo), as files
// installed with the library that a site may replace with its own. A file
// holds the graphic's rows in the printer's own form; they are sent as they
// are stored.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace quendal {

// Where the graphic file of this name is read from: the folder named by
// QUENDAL_GRAPHICS_DIR when it is set, else the folder the library installs
// its graphics in, else share/quendal/graphics beside the folder of the
// library (or the program it is linked into), else (a library used where it
// was built) the graphics of its sources.
std::string GraphicPath(std::string_view fileName);

// The rows of a graphic file; nothing when the file cannot be read, is
// empty, or is too large to be a label graphic.
std::optional<std::string> ReadGraphic(const std::string& path);

}  // namespace quendal
