// Cairo canvases: a page of a given size in pixels at a resolution, drawn
// in black and white. PngCanvas encodes each finished page as a 1-bit PNG;
// PdfCanvas collects the pages into one PDF document.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/Canvas.h"

typedef struct _cairo cairo_t;
typedef struct _cairo_surface cairo_surface_t;
typedef struct _PangoLayout PangoLayout;

namespace quendal {

// A rectangle on the page in pixels, right and bottom edges exclusive.
struct CanvasBox {
  double x1 = 0, y1 = 0, x2 = 0, y2 = 0;
};

class CairoCanvas : public Canvas {
 public:
  ~CairoCanvas() override;
  void Rectangle(int x1, int y1, int x2, int y2, int penWidth) override;
  void Text(int x, int y, std::string_view utf8, const CanvasFont& font, Colour text,
            Colour background) override;

  // A filled black rectangle (x1, y1)-(x2, y2), right and bottom edges exclusive.
  void Fill(double x1, double y1, double x2, double y2);
  // The width in pixels of a text in a font, as the text routines draw it.
  double TextWidth(std::string_view utf8, const CanvasFont& font);
  // A text turned by quarter turns clockwise about (x, y), the top-left
  // corner of its cell. With a background the cell is filled first; with
  // `invert` the text reverses what lies beneath it (black turns white and
  // white black) and its colour is not used. Returns the cell on the page.
  CanvasBox TurnedText(double x, double y, std::string_view utf8, const CanvasFont& font,
                       int quarterTurns, Colour text, std::optional<Colour> background,
                       bool invert = false);

  int WidthPixels() const { return width_; }
  int HeightPixels() const { return height_; }
  int Dpi() const { return dpi_; }

 protected:
  CairoCanvas(int widthPixels, int heightPixels, int dpi);
  // Starts drawing on `surface`, one device pixel being `scale` surface units.
  void Begin(cairo_surface_t* surface, double scale);
  void Finish();
  // Ink for a colour: A1 surfaces paint black and clear to white.
  void SetColour(Colour colour);
  // The text laid out in the font, and the horizontal stretch that gives
  // the font's character width; null without a page. The caller unrefs it.
  PangoLayout* Layout(std::string_view utf8, const CanvasFont& font, double& stretch);

  cairo_t* cr_ = nullptr;
  cairo_surface_t* surface_ = nullptr;
  int width_;
  int height_;
  int dpi_;
  bool oneBit_ = false;
};

class PngCanvas : public CairoCanvas {
 public:
  PngCanvas(int widthPixels, int heightPixels, int dpi);
  void StartPage() override;
  void EndPage() override;
  // The encoded pages, in order.
  const std::vector<std::string>& Pages() const { return pages_; }

 private:
  std::vector<std::string> pages_;
};

class PdfCanvas : public CairoCanvas {
 public:
  PdfCanvas(int widthPixels, int heightPixels, int dpi);
  ~PdfCanvas() override;
  void StartPage() override;
  void EndPage() override;
  // Ends the document and returns its bytes.
  std::string Document();

 private:
  std::string bytes_;
  bool pageOpen_ = false;
  bool finished_ = false;
};

// Encodes a Cairo A1 image surface as a 1-bit grey PNG (ink black, rest white).
std::string EncodeOneBitPng(cairo_surface_t* surface, int dpi);

}  // namespace quendal
