// A printed document built from paragraphs, rectangles and tables: the
// dangerous goods declaration and the consignment summary. Positions and
// sizes are in twips (1440 to the inch) from the top left corner of the
// page. The document goes to the printer given by name when it ends; when
// an output file name is given, an HTML rendering of the same document is
// written there as well.
//
//   auto doc = NewPrintDocument();
//   doc->SetPrinter(system->DocumentPrinter().Text());
//   doc->BeginDoc("DANGEROUS GOODS SHIPPING/TRANSPORT DOCUMENT");
//   doc->Paragraph("NOTE:", "Arial", 10);
//   doc->AddTable("<+4000|<+6000", {"SENDER:", "RECEIVER"}, {{"A", "B"}}, 0xE0E0E0);
//   bool printed = doc->EndDoc();
#pragma once

#include "platform/Colour.h"

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace quendal {

using TableRow = std::vector<std::string>;

// One column of a table format: "<+4000" is a column 4000 twips wide, left
// aligned; "^+1500" centred. Columns are separated by "|".
struct TableColumn {
  enum class Align { Left, Centre } align = Align::Left;
  int width = 0;
};
// The columns of a format; entries that don't read as a column are left out.
std::vector<TableColumn> ParseTableFormat(std::string_view format);
// The cells of a "|"-separated text.
TableRow TableCells(std::string_view text);

class PrintDocument {
 public:
  virtual ~PrintDocument() = default;

  // Before BeginDoc.
  virtual void SetPrinter(const std::string& name) = 0;
  // 1 portrait (the default), 2 landscape.
  virtual void SetOrientation(int orientation) = 0;
  // With preview on, EndDoc keeps the document for Show instead of printing it.
  virtual void SetPreview(bool preview) = 0;
  // An HTML rendering of the document is written to this file when it ends.
  virtual void SetOutputFile(const std::string& path) = 0;

  virtual void BeginDoc(const std::string& title) = 0;
  // The size of paragraphs printed without one.
  virtual void SetFontSize(double points) = 0;
  // A paragraph, wrapped to the page width; an empty text is an empty line.
  virtual void Paragraph(const std::string& text, const std::string& font = "Arial",
                         std::optional<double> points = std::nullopt) = 0;
  virtual double CurrentX() const = 0;
  virtual double CurrentY() const = 0;
  virtual void SetCurrentY(double y) = 0;
  // A rectangle with a thin black outline, filled with the colour.
  virtual void Rectangle(double left, double top, double right, double bottom, Colour fill) = 0;
  // A table: the header row shaded (when a shade is given), then the body
  // rows. Cells are given one by one, so a "|" in a text stays text.
  virtual void AddTable(std::string_view format, const TableRow& header,
                        const std::vector<TableRow>& body, std::optional<Colour> headerShade) = 0;
  // Ends the document and sends it to the printer (unless previewing);
  // false when the printer is unknown or the job or the output file could
  // not be written.
  virtual bool EndDoc() = 0;
  // Writes the finished document (PDF) where the user can open it and
  // returns that path: the output file name with ".pdf", or a file in the
  // temporary folder. Empty when there is no finished document.
  virtual std::string Show() = 0;
};

// The process's print document: Pango and Cairo laying out A4 pages as PDF.
std::unique_ptr<PrintDocument> NewPrintDocument();

}  // namespace quendal
