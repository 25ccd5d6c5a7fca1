#include "platform/CairoCanvas.h"

#include <gtest/gtest.h>


namespace quendal {
namespace {

TEST(CairoCanvasTest, PngPagesAreOneBitWithTheResolution) {
  PngCanvas canvas(200, 100, 203);
  canvas.StartPage();
  canvas.Rectangle(10, 10, 20, 20, 0);
  canvas.Text(30, 30, "ABC", CanvasFont{20, 8, 400, "ARIAL"}, kBlack, kWhite);
  canvas.EndPage();
  canvas.StartPage();
  canvas.EndPage();
  ASSERT_EQ(canvas.Pages().size(), 2u);
  const std::string& png = canvas.Pages()[0];
  ASSERT_GT(png.size(), 33u);
  EXPECT_EQ(png.substr(1, 3), "PNG");
  // IHDR: width 200, height 100, bit depth 1, colour type 0 (grey).
  EXPECT_EQ(static_cast<unsigned char>(png[19]), 200);
  EXPECT_EQ(static_cast<unsigned char>(png[23]), 100);
  EXPECT_EQ(png[24], 1);
  EXPECT_EQ(png[25], 0);
  EXPECT_NE(png.find("pHYs"), std::string::npos);
}

TEST(CairoCanvasTest, PdfDocumentHasOnePagePerPage) {
  PdfCanvas canvas(1181, 1772, 300);
  for (int i = 0; i < 3; ++i) {
    canvas.StartPage();
    canvas.Rectangle(100, 100, 400, 300, 4);
    canvas.Text(100, 500, "CRÈME \xFF bad byte", CanvasFont{40, 0, 700, "ARIAL"}, kWhite, kBlack);
    canvas.EndPage();
  }
  const std::string pdf = canvas.Document();
  ASSERT_TRUE(pdf.starts_with("%PDF-"));
  std::size_t pages = 0;
  for (std::size_t at = 0; (at = pdf.find("/Type /Page\n", at)) != std::string::npos; ++at) ++pages;
  std::size_t pages2 = 0;
  for (std::size_t at = 0; (at = pdf.find("/Type /Page ", at)) != std::string::npos; ++at) ++pages2;
  EXPECT_EQ(pages + pages2, 3u);
}

}  // namespace
}  // namespace quendal
