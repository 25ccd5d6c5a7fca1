#include "platform/CairoPrintDocument.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "platform/MemorySpooler.h"
#include "tests/support/PdfText.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using ::testing::HasSubstr;

class CairoPrintDocumentTest : public ::testing::Test {
 protected:
  void SetUp() override {
    fs::create_directories(root / "spool" / "Office Laser");
    previous = SetSpooler(std::make_shared<DirectorySpooler>((root / "spool").string()));
  }
  void TearDown() override {
    SetSpooler(previous);
  }
  std::vector<fs::path> Jobs() const {
    std::vector<fs::path> jobs;
    for (const auto& e : fs::directory_iterator(root / "spool" / "Office Laser"))
      if (e.path().filename().string()[0] != '.') jobs.push_back(e.path());
    return jobs;
  }

  test::TempFolder temp;

  fs::path root{temp.path()};
  std::shared_ptr<Spooler> previous;
};

TEST(TableFormatTest, ReadsAlignmentAndWidths) {
  const auto columns = ParseTableFormat("<+1900|^+200|bad|+300|<+");
  ASSERT_EQ(columns.size(), 3u);
  EXPECT_EQ(columns[0].align, TableColumn::Align::Left);
  EXPECT_EQ(columns[0].width, 1900);
  EXPECT_EQ(columns[1].align, TableColumn::Align::Centre);
  EXPECT_EQ(columns[1].width, 200);
  EXPECT_EQ(columns[2].width, 300);
  EXPECT_EQ(TableCells("a||b"), (TableRow{"a", "", "b"}));
}

TEST_F(CairoPrintDocumentTest, PrintsAPdfJobAndWritesTheHtmlRendering) {
  CairoPrintDocument doc;
  doc.SetPrinter("Office Laser");
  doc.SetOutputFile((root / "summary.html").string());
  doc.BeginDoc("Consignment Summary Print");
  EXPECT_GE(doc.CurrentY(), 1500);
  doc.Paragraph("Goods <fragile> & \"heavy\"", "Arial", 10);
  const double y = doc.CurrentY();
  doc.Rectangle(700, y, 5000, y + 500, kWhite);
  doc.AddTable("<+4000|^+1500", {"Receiver", "Units"}, {{"Smith | Sons", "3"}, {"Ng", "12"}},
               0xE0E0E0);
  EXPECT_GT(doc.CurrentY(), y);
  ASSERT_TRUE(doc.EndDoc());
  EXPECT_EQ(doc.Pages(), 1);

  const auto jobs = Jobs();
  ASSERT_EQ(jobs.size(), 1u);
  EXPECT_EQ(jobs[0].extension(), ".pdf");
  const std::string text = test::PdfWords(jobs[0].string());
  EXPECT_THAT(text, HasSubstr("Consignment Summary Print"));
  EXPECT_THAT(text, HasSubstr("Goods <fragile> & \"heavy\""));
  EXPECT_THAT(text, HasSubstr("Smith | Sons 3"));

  const std::string html = ReadFile((root / "summary.html").string()).value_or("");
  EXPECT_THAT(html, HasSubstr("<h1>Consignment Summary Print</h1>"));
  EXPECT_THAT(html, HasSubstr("Goods &lt;fragile&gt; &amp; &quot;heavy&quot;"));
  EXPECT_THAT(html, HasSubstr("background:#E0E0E0\">Receiver</th>"));
  EXPECT_THAT(html, HasSubstr("text-align:center\">12</td>"));
  EXPECT_THAT(html, HasSubstr(">Smith | Sons</td>"));
}

TEST_F(CairoPrintDocumentTest, ContentThatOverflowsGoesOnNewPages) {
  CairoPrintDocument doc;
  doc.SetPrinter("Office Laser");
  doc.SetOrientation(2);
  doc.BeginDoc("Long");
  for (int i = 0; i < 60; ++i) doc.Paragraph("Line " + std::to_string(i), "Arial", 10);
  std::vector<TableRow> rows(40, TableRow{"row", "x"});
  doc.AddTable("<+3000|<+3000", {}, rows, std::nullopt);
  std::string words;
  for (int i = 0; i < 400; ++i) words += "word" + std::to_string(i) + " ";
  doc.Paragraph(std::string(1500, 'w') + " " + words + "end", "Arial", 10);
  ASSERT_TRUE(doc.EndDoc());
  EXPECT_GE(doc.Pages(), 4);  // 60 lines, 40 rows and a long paragraph on landscape A4
  const std::string text = test::PdfWords(Jobs().at(0).string());
  EXPECT_THAT(text, HasSubstr("Line 0 Line 1"));
  EXPECT_THAT(text, HasSubstr("Line 59"));
  EXPECT_THAT(text, HasSubstr("word398 word399 end"));
}

TEST_F(CairoPrintDocumentTest, UnknownPrinterAndPreview) {
  CairoPrintDocument unknown;
  unknown.SetPrinter("Nowhere");
  unknown.BeginDoc("Doc");
  unknown.Paragraph("text", "Arial", 10);
  EXPECT_FALSE(unknown.EndDoc());

  CairoPrintDocument preview;
  preview.SetPrinter("Office Laser");
  preview.SetPreview(true);
  preview.SetOutputFile((root / "preview.html").string());
  preview.BeginDoc("Doc");
  preview.Paragraph(std::string("bad \xFF utf-8"), "Arial", 10);
  EXPECT_TRUE(preview.EndDoc());
  EXPECT_TRUE(Jobs().empty());
  const std::string shown = preview.Show();
  EXPECT_EQ(shown, (root / "preview.pdf").string());
  EXPECT_THAT(test::PdfWords(shown), HasSubstr("bad"));

  CairoPrintDocument never;
  EXPECT_FALSE(never.EndDoc());
  EXPECT_EQ(never.Show(), "");
}

}  // namespace
}  // namespace quendal
