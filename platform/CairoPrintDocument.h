// The print document laid out with Pango and drawn with Cairo into a PDF of
// A4 pages; a row or line that does not fit on the page starts a new one.
// The PDF goes to the printer through the process's spooler as one job.
#pragma once

#include <memory>
#include <string>

#include "platform/PrintDocument.h"

namespace quendal {

class CairoPrintDocument : public PrintDocument {
 public:
  CairoPrintDocument();
  ~CairoPrintDocument() override;
  CairoPrintDocument(const CairoPrintDocument&) = delete;
  CairoPrintDocument& operator=(const CairoPrintDocument&) = delete;

  void SetPrinter(const std::string& name) override;
  void SetOrientation(int orientation) override;
  void SetPreview(bool preview) override;
  void SetOutputFile(const std::string& path) override;
  void BeginDoc(const std::string& title) override;
  void SetFontSize(double points) override;
  void Paragraph(const std::string& text, const std::string& font,
                 std::optional<double> points) override;
  double CurrentX() const override;
  double CurrentY() const override;
  void SetCurrentY(double y) override;
  void Rectangle(double left, double top, double right, double bottom, Colour fill) override;
  void AddTable(std::string_view format, const TableRow& header, const std::vector<TableRow>& body,
                std::optional<Colour> headerShade) override;
  bool EndDoc() override;
  std::string Show() override;

  // The finished PDF (empty before EndDoc); the number of pages.
  const std::string& Pdf() const { return pdf_; }
  int Pages() const;

 private:
  struct Impl;
  std::unique_ptr<Impl> impl_;
  std::string pdf_;
};

}  // namespace quendal
