#include "labels/WinPrintDraw.h"

#include <algorithm>
#include <cmath>

#include "frame/FailSafe.h"
#include "frame/VB.h"
#include "labels/WinPrint.h"

namespace quendal {

namespace {

constexpr float kTwipsPerUnit = 56.0f;
// The drawing routines report a failure as their own, not the label class's.
constexpr std::string_view kModule = "mWinPrint";

// Units to pixels in single precision, as the device's twips per pixel are
// kept: 114 units at 4.8 twips per pixel are 1330 pixels, not 1329.99994.
float Factor(float twipsPerPixel) { return kTwipsPerUnit / (twipsPerPixel > 0 ? twipsPerPixel : 1.0f); }

// Label units to whole device pixels, rounded down.
int Pixels(double units, float twipsPerPixel) {
  const float px = std::floor(static_cast<float>(units) * kTwipsPerUnit /
                              (twipsPerPixel > 0 ? twipsPerPixel : 1.0f));
  return static_cast<int>(std::clamp(px, -1e7f, 1e7f));
}

}  // namespace

void PrintText(Canvas& canvas, float twipsPerPixelX, float twipsPerPixelY, std::string_view text,
               int x, int y, int width, int height, int /*charset*/, int weight,
               std::string_view face, Colour textColour, Colour backColour) {
  Procedure proc(Procedure::Lasting{}, kModule, "Sub PrintText");
  proc([&] {
    CanvasFont font;
    font.width = Pixels(width, twipsPerPixelX);
    font.height = Pixels(height, twipsPerPixelY);
    font.weight = weight;
    font.face = std::string(face);
    canvas.Text(Pixels(x, twipsPerPixelX), Pixels(y, twipsPerPixelY), text, font, textColour,
                backColour);
  });
}

void PrintLine(Canvas& canvas, float twipsPerPixelX, float twipsPerPixelY, int x1, int y1, int x2,
               int y2, float width) {
  Procedure proc(Procedure::Lasting{}, kModule, "Sub PrintLine");
  proc([&] {
    const int pen = Pixels(width, twipsPerPixelX);
    canvas.Rectangle(Pixels(x1, twipsPerPixelX), Pixels(y1, twipsPerPixelY),
                     Pixels(x2, twipsPerPixelX) + 1, Pixels(y2, twipsPerPixelY) + 1, pen);
  });
}

void EAN128Barcode(Canvas& canvas, float twipsPerPixelX, float twipsPerPixelY,
                   std::string_view data, int x, int y, int height, float moduleWidth) {
  Procedure proc(Procedure::Lasting{}, kModule, "Sub EAN128Barcode");
  const int module = static_cast<int>(RoundHalfEven(moduleWidth * Factor(twipsPerPixelX)));
  int px = Pixels(x, twipsPerPixelX);
  const int top = Pixels(y, twipsPerPixelY);
  const int bottom = top + Pixels(height, twipsPerPixelY);
  std::string modules;
  if (!proc([&] { modules = BarPattern(data); })) return;
  // Each bar module is a stroke as wide as a module; a bar of n modules is n strokes.
  proc([&] {
    for (char m : modules) {
      if (m == '1') canvas.Rectangle(px - 1, top, px, bottom, module);
      px += module;
    }
  });
}

void DrawLabel(Canvas& canvas, float twipsPerPixelX, float twipsPerPixelY,
               const LabelDrawing& drawing) {
  for (const LabelItem& item : drawing.items) {
    if (const auto* t = std::get_if<LabelText>(&item)) {
      PrintText(canvas, twipsPerPixelX, twipsPerPixelY, t->text, t->x, t->y, t->width, t->height,
                0, t->weight, "ARIAL", t->reversed ? kWhite : kBlack,
                t->reversed ? kBlack : kWhite);
    } else if (const auto* l = std::get_if<LabelLine>(&item)) {
      PrintLine(canvas, twipsPerPixelX, twipsPerPixelY, l->x1, l->y1, l->x2, l->y2,
                static_cast<float>(l->width));
    } else if (const auto* b = std::get_if<LabelBarcode>(&item)) {
      EAN128Barcode(canvas, twipsPerPixelX, twipsPerPixelY, b->data, b->left, b->top, b->height,
                    static_cast<float>(b->module));
    }
  }
}

}  // namespace quendal
