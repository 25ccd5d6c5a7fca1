#include "labels/WinPrintDraw.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "labels/WinPrint.h"
#include "platform/RecordingCanvas.h"
#include "tests/support/MemoryHost.h"

namespace quendal {
namespace {

using Primitive = RecordingCanvas::Primitive;

TEST(WinPrintDrawTest, BarcodeModulesAreStrokesOneModuleWide) {
  RecordingCanvas canvas;
  const std::string data = "~20100093123450000000012";
  // The reference SSCC barcode at 300 dpi: modules 0.5 units = 5.83 -> 6 pixels.
  EAN128Barcode(canvas, 4.8f, 4.8f, data, 10, 114, 34, 0.5f);
  const std::string modules = BarPattern(data);
  ASSERT_EQ(canvas.primitives.size(),
            static_cast<std::size_t>(std::count(modules.begin(), modules.end(), '1')));
  const Primitive& first = canvas.primitives.front();
  EXPECT_EQ(first.kind, Primitive::kRectangle);
  // Left edge 10 units = 116.67 -> 116 pixels; the stroke is drawn at x - 1.
  EXPECT_EQ(first.x1, 115);
  EXPECT_EQ(first.x2, 116);
  EXPECT_EQ(first.y1, 1330);         // 114 units
  EXPECT_EQ(first.y2, 1330 + 396);   // 34 units tall
  EXPECT_EQ(first.penWidth, 6);
  // The second module of Start C (11010011100) is a bar too: one module to the right.
  EXPECT_EQ(canvas.primitives[1].x1, 121);
  // The last bar ends the stop pattern: the symbol is modules x 6 pixels wide.
  EXPECT_EQ(canvas.primitives.back().x1, 115 + 6 * static_cast<int>(modules.size() - 1));
}

// A page whose drawing fails, as a device that has gone away would.
class FailingCanvas : public RecordingCanvas {
 public:
  void Text(int, int, std::string_view, const CanvasFont&, Colour, Colour) override {
    throw std::runtime_error("device lost");
  }
  void Rectangle(int, int, int, int, int) override { throw std::runtime_error("device lost"); }
};

TEST(WinPrintDrawTest, FailuresAreReportedByTheDrawingRoutines) {
  auto prompt = std::make_shared<test::ScriptedPrompt>(
      std::deque<Answer>{Answer::Ignore, Answer::Ignore, Answer::Ignore});
  test::PromptScope scope(prompt);
  FailingCanvas canvas;
  PrintText(canvas, 4.8f, 4.8f, "TO:", 5, 5, 3, 3, 0, 400, "ARIAL", kBlack, kWhite);
  PrintLine(canvas, 4.8f, 4.8f, 0, 16, 98, 16, 2.0f);
  EAN128Barcode(canvas, 4.8f, 4.8f, "~20100093123450000000012", 10, 114, 34, 0.5f);
  ASSERT_EQ(prompt->messages.size(), 3u);
  EXPECT_NE(prompt->messages[0].find("occured in module mWinPrint, Sub PrintText, line 1."),
            std::string::npos);
  EXPECT_NE(prompt->messages[1].find("occured in module mWinPrint, Sub PrintLine, line 1."),
            std::string::npos);
  EXPECT_NE(prompt->messages[2].find("occured in module mWinPrint, Sub EAN128Barcode, line 2."),
            std::string::npos);
}

TEST(WinPrintDrawTest, LinesAndTexts) {
  RecordingCanvas canvas;
  PrintLine(canvas, 4.8f, 4.8f, 0, 16, 98, 16, 0.0f);  // thickness 2: the thinnest pen
  PrintLine(canvas, 4.8f, 4.8f, 0, 16, 98, 16, 2.0f);  // thickness 6: two units
  PrintText(canvas, 4.8f, 4.8f, "SEPARATOR", 75, 5, 6, 6, 0, 700, "ARIAL", kWhite, kBlack);
  PrintText(canvas, 0.0f, -3.0f, "X", 2, 3, 1, 1, 0, 400, "ARIAL", kBlack, kWhite);
  ASSERT_EQ(canvas.primitives.size(), 4u);
  EXPECT_EQ(canvas.primitives[0].penWidth, 0);
  EXPECT_EQ(canvas.primitives[0].x2, 1143 + 1);  // 98 units = 1143.33 pixels, one past the end
  EXPECT_EQ(canvas.primitives[0].y1, 186);
  EXPECT_EQ(canvas.primitives[0].y2, 187);
  EXPECT_EQ(canvas.primitives[1].penWidth, 23);  // 2 units = 23.33 pixels
  const Primitive& text = canvas.primitives[2];
  // 75 units at a single-precision 4.8 twips per pixel come to 874.99994 pixels.
  EXPECT_EQ(text.x1, 874);
  EXPECT_EQ(text.y1, 58);
  EXPECT_EQ(text.font.height, 70);
  EXPECT_EQ(text.font.width, 70);
  EXPECT_EQ(text.font.weight, 700);
  EXPECT_EQ(text.font.face, "ARIAL");
  EXPECT_EQ(text.colour, kWhite);  // white on black
  EXPECT_EQ(text.background, kBlack);
  // A twips-per-pixel that is not positive counts as 1.
  EXPECT_EQ(canvas.primitives[3].x1, 112);
  EXPECT_EQ(canvas.primitives[3].y1, 168);
}

TEST(WinPrintDrawTest, DrawLabelDrawsEveryItemInOrder) {
  LabelDrawing drawing;
  drawing.items.emplace_back(LabelText{1, 6, 3, 3, 700, true, "CHADSTONE"});
  drawing.items.emplace_back(LabelLine{0, 16, 98, 16, 2});
  drawing.items.emplace_back(LabelBarcode{10, 114, 34, 147.75, 0.5, "12"});
  RecordingCanvas canvas;
  DrawLabel(canvas, 4.8f, 4.8f, drawing);
  ASSERT_GE(canvas.primitives.size(), 3u);
  EXPECT_EQ(canvas.primitives[0].text, "CHADSTONE");
  EXPECT_EQ(canvas.primitives[0].colour, kWhite);
  EXPECT_EQ(canvas.primitives[1].penWidth, 23);
  EXPECT_EQ(canvas.primitives[2].penWidth, 6);
}

}  // namespace
}  // namespace quendal
