// Drawing a label on an ordinary printer's page: text, lines and Code 128
// symbols placed in label units (56 twips, about a millimetre) and
// converted to the device's pixels with its twips per pixel.
#pragma once

#include <string_view>

#include "labels/VpclLabel.h"
#include "platform/Canvas.h"

namespace quendal {

// A text at (x, y) with a character cell of width x height label units.
void PrintText(Canvas& canvas, float twipsPerPixelX, float twipsPerPixelY, std::string_view text,
               int x, int y, int width, int height, int charset, int weight,
               std::string_view face, Colour textColour, Colour backColour);

// A line between two points, `width` label units wide.
void PrintLine(Canvas& canvas, float twipsPerPixelX, float twipsPerPixelY, int x1, int y1, int x2,
               int y2, float width);

// The Code 128 symbol of `data` ("~201" = FNC1): bars from the left edge x
// and the top edge y, `height` tall, modules `moduleWidth` wide. No quiet
// zone and no text are added.
void EAN128Barcode(Canvas& canvas, float twipsPerPixelX, float twipsPerPixelY,
                   std::string_view data, int x, int y, int height, float moduleWidth);

// Every item of a laid-out label, in order.
void DrawLabel(Canvas& canvas, float twipsPerPixelX, float twipsPerPixelY,
               const LabelDrawing& drawing);

}  // namespace quendal
