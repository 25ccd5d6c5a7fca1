// A VPCL II format and batch read back into a label model, and the model
// laid out in label units (56 twips, about a millimetre) for drawing on an
// ordinary printer. One layout definition thus serves thermal printers and
// plain printers alike.
#pragma once

#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace quendal {

struct VpclElement {
  std::string kind;                 // packet letter: "C", "T", "B", "L", "Q", "G", ...
  std::vector<std::string> params;  // in packet order, the letter first; quotes removed
  std::string data;                 // a constant text's own text, or the batch data of its field
};

struct VpclLabel {
  std::string name;
  std::string storage;  // the header's letter after "A,R" ("E" on most formats)
  double length = 0;  // header length and width in VPCL units
  double width = 0;
  std::vector<VpclElement> elements;
};

// Reads a format ("{F,...|...|}") and a batch ("{B,...|E,...|n,"data"|...}").
// Never fails: malformed packets are kept as they read or skipped.
VpclLabel ReadVpclLabel(std::string_view format, std::string_view batch);

struct LabelText {
  int x = 0, y = 0;          // top-left, label units
  int width = 0, height = 0; // character cell, label units
  int weight = 400;
  bool reversed = false;     // white on black
  std::string text;
};
struct LabelLine {
  int x1 = 0, y1 = 0, x2 = 0, y2 = 0;
  double width = 0;  // label units; 0 draws the thinnest line
};
struct LabelBarcode {
  int left = 0, top = 0, height = 0;
  double bottom = 0;  // bottom edge before rounding, label units from the top
  double module = 0;  // module width, label units
  std::string data;   // element string, "~201" for FNC1
};
using LabelItem = std::variant<LabelText, LabelLine, LabelBarcode>;

struct LabelDrawing {
  double height = 0;  // label units
  double width = 0;
  std::vector<LabelItem> items;
};

// Positions, fonts, pens and barcodes of a label in label units: a VPCL
// value v is v / 4 units; rows count up from the bottom edge.
LabelDrawing LayOutLabel(const VpclLabel& label);

}  // namespace quendal
