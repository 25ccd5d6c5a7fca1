// ZPL II label streams. A label is one self-contained stream ("^XA" ...
// "^XZ") declared as data, a list of pieces: a command text, then, for the
// pieces that end in "^FD" or "^FV", the field data from the label's
// values and "^FS".
#pragma once

#include <span>
#include <string>
#include <string_view>

#include "labels/LabelValues.h"

namespace quendal::zpl {

struct Piece {
  using Value = std::string LabelValues::*;
  using Data = std::string (*)(const LabelValues&);
  using Sent = bool (*)(const LabelValues&);

  // A piece sent as it stands (set-up, captions, the end of the label).
  constexpr Piece(std::string_view command, Sent sent = nullptr) : command(command), sent(sent) {}
  // A field: the command, the data, "^FS".
  constexpr Piece(std::string_view command, Value value, Sent sent = nullptr)
      : command(command), value(value), sent(sent) {}
  constexpr Piece(std::string_view command, Data data, Sent sent = nullptr)
      : command(command), data(data), sent(sent) {}

  std::string_view command;
  Value value = nullptr;
  Data data = nullptr;
  Sent sent = nullptr;  // null: always sent
};

using Stream = std::span<const Piece>;

// The label's stream for these values: every piece that is sent, in order.
std::string Render(Stream stream, const LabelValues& values);

// Field data made safe for a stream: "^" and "~" would start a printer
// command inside the data (a name "A^XZ" would end the label early), so
// they are removed; control characters (line breaks, tabs) become spaces.
std::string FieldData(std::string_view text);

}  // namespace quendal::zpl
