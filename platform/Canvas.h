// A page to draw on in device pixels, as a printer's device context offers
// it: rectangle outlines stroked with a solid black pen, and text in a font
// cell with a text and a background colour. Back ends: PNG pages and PDF
// (Cairo), and a recording canvas for tests.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "platform/Colour.h"

namespace quendal {


struct CanvasFont {
  int height = 0;  // cell height in pixels
  int width = 0;   // average character width in pixels (0 = the face's own proportions)
  int weight = 400;
  std::string face = "ARIAL";
};

class Canvas {
 public:
  virtual ~Canvas() = default;
  virtual void StartPage() = 0;
  virtual void EndPage() = 0;
  // The outline of the rectangle (x1, y1)-(x2, y2), right and bottom edges
  // exclusive, stroked with a black pen `penWidth` pixels wide centred on
  // the outline (0 draws the thinnest line, one pixel).
  virtual void Rectangle(int x1, int y1, int x2, int y2, int penWidth) = 0;
  // Text whose cell's top-left corner is (x, y), on an opaque background.
  virtual void Text(int x, int y, std::string_view utf8, const CanvasFont& font, Colour text,
                    Colour background) = 0;
};

}  // namespace quendal
