#include "labels/Zpl.h"

namespace quendal::zpl {

std::string FieldData(std::string_view text) {
  std::string out;
  out.reserve(text.size());
  for (char c : text) {
    const auto u = static_cast<unsigned char>(c);
    if (c == '^' || c == '~') continue;
    out += (u < 0x20 || u == 0x7F) ? ' ' : c;
  }
  return out;
}

std::string Render(Stream stream, const LabelValues& values) {
  std::string out;
  out.reserve(2048);
  for (const Piece& piece : stream) {
    if (piece.sent && !piece.sent(values)) continue;
    out += piece.command;
    if (piece.value) {
      out += FieldData(values.*piece.value);
      out += "^FS";
    } else if (piece.data) {
      out += FieldData(piece.data(values));
      out += "^FS";
    }
  }
  return out;
}

}  // namespace quendal::zpl
