// A canvas that keeps every primitive, for tests of drawing geometry.
#pragma once

#include <string>
#include <vector>

#include "platform/Canvas.h"

namespace quendal {

class RecordingCanvas : public Canvas {
 public:
  struct Primitive {
    enum Kind { kRectangle, kText } kind;
    int x1 = 0, y1 = 0, x2 = 0, y2 = 0;  // text: x1, y1 = top-left
    int penWidth = 0;
    std::string text;
    CanvasFont font;
    Colour colour = kBlack;
    Colour background = kWhite;
  };

  void StartPage() override { ++pagesStarted; }
  void EndPage() override { ++pagesEnded; }
  void Rectangle(int x1, int y1, int x2, int y2, int penWidth) override {
    primitives.push_back({Primitive::kRectangle, x1, y1, x2, y2, penWidth, {}, {}, kBlack, kWhite});
  }
  void Text(int x, int y, std::string_view utf8, const CanvasFont& font, Colour text,
            Colour background) override {
    primitives.push_back(
        {Primitive::kText, x, y, x, y, 0, std::string(utf8), font, text, background});
  }

  std::vector<Primitive> primitives;
  int pagesStarted = 0;
  int pagesEnded = 0;
};

}  // namespace quendal
