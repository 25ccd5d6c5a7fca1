#include "platform/CairoPrintDocument.h"

#include <cairo-pdf.h>
#include <cairo.h>
#include <glib.h>
#include <pango/pangocairo.h>

#include <algorithm>
#include <filesystem>
#include <map>
#include <unordered_map>
#include <tuple>

#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "platform/Spooler.h"

namespace quendal {

namespace {

// A4 in twips, and the margins around the printed area.
constexpr double kA4Width = 11906;
constexpr double kA4Height = 16838;
constexpr double kMarginLeft = 700;
constexpr double kMarginRight = 700;
constexpr double kMarginTop = 720;
constexpr double kMarginBottom = 720;
// The title stands in its own band; the body of the first page starts below it.
constexpr double kBodyTop = 1500;
constexpr double kTitlePoints = 14;
// Inner space of a table cell, and the width of lines.
constexpr double kCellPadding = 60;
constexpr double kLineWidth = 10;
constexpr double kTwipsPerPoint = 20;

std::string ValidUtf8(const std::string& text) {
  if (g_utf8_validate(text.data(), static_cast<gssize>(text.size()), nullptr)) return text;
  gchar* valid = g_utf8_make_valid(text.data(), static_cast<gssize>(text.size()));
  std::string out(valid);
  g_free(valid);
  return out;
}

std::string EscapeHtml(std::string_view text) {
  std::string out;
  for (char c : text) {
    switch (c) {
      case '&': out += "&amp;"; break;
      case '<': out += "&lt;"; break;
      case '>': out += "&gt;"; break;
      case '"': out += "&quot;"; break;
      case '\'': out += "&#39;"; break;
      default: out += c;
    }
  }
  return out;
}

std::string HexColour(Colour colour) {
  char text[8];
  std::snprintf(text, sizeof text, "#%06X", colour & 0xFFFFFFu);
  return text;
}

void SetColour(cairo_t* cr, Colour colour) {
  cairo_set_source_rgb(cr, ((colour >> 16) & 0xFF) / 255.0, ((colour >> 8) & 0xFF) / 255.0,
                       (colour & 0xFF) / 255.0);
}

cairo_status_t AppendToString(void* closure, const unsigned char* data, unsigned int length) {
  static_cast<std::string*>(closure)->append(reinterpret_cast<const char*>(data), length);
  return CAIRO_STATUS_SUCCESS;
}

}  // namespace

struct CairoPrintDocument::Impl {
  std::string printer;
  std::string outputFile;
  std::string title;
  int orientation = 1;
  bool preview = false;
  double fontPoints = 10;

  cairo_surface_t* surface = nullptr;
  cairo_t* cr = nullptr;
  PangoContext* context = nullptr;
  std::map<std::tuple<std::string, double, bool>, PangoFontDescription*> fonts;
  int pages = 0;
  double y = 0;
  std::string html;

  double PageWidth() const { return orientation == 2 ? kA4Height : kA4Width; }
  double PageHeight() const { return orientation == 2 ? kA4Width : kA4Height; }
  double Bottom() const { return PageHeight() - kMarginBottom; }
  double TextWidth() const { return PageWidth() - kMarginLeft - kMarginRight; }

  bool Open() const { return cr != nullptr; }

  void Close() {
    ClearCellCache();
    for (auto& [key, description] : fonts) pango_font_description_free(description);
    fonts.clear();
    if (context) g_object_unref(context);
    if (cr) cairo_destroy(cr);
    if (surface) {
      cairo_surface_finish(surface);
      cairo_surface_destroy(surface);
    }
    context = nullptr;
    cr = nullptr;
    surface = nullptr;
  }

  void NewPage() {
    cairo_show_page(cr);
    ++pages;
    y = kMarginTop;
  }

  // Whether `height` fits below the current position; anything fits on an empty page.
  bool Fits(double height) const { return y + height <= Bottom() || y <= kMarginTop; }
  // Starts a new page when `height` does not fit below the current position.
  void Room(double height) {
    if (!Fits(height)) NewPage();
  }

  // The description of a font, made once per document.
  const PangoFontDescription* Font(const std::string& font, double points, bool bold) {
    auto& description = fonts[{font, points, bold}];
    if (!description) {
      description = pango_font_description_from_string(font.c_str());
      pango_font_description_set_absolute_size(description, points * kTwipsPerPoint * PANGO_SCALE);
      if (bold) pango_font_description_set_weight(description, PANGO_WEIGHT_BOLD);
    }
    return description;
  }

  PangoLayout* Layout(const std::string& text, const std::string& font, double points,
                      double width, PangoAlignment align, bool bold = false) {
    PangoLayout* layout = pango_layout_new(context);
    pango_layout_set_font_description(layout, Font(font, points, bold));
    pango_layout_set_width(layout, static_cast<int>(std::max(width, 1.0) * PANGO_SCALE));
    pango_layout_set_wrap(layout, PANGO_WRAP_WORD_CHAR);
    pango_layout_set_alignment(layout, align);
    // An empty line is as high as a line of text in the same font.
    const std::string valid = text.empty() ? std::string(" ") : ValidUtf8(text);
    pango_layout_set_text(layout, valid.c_str(), static_cast<int>(valid.size()));
    return layout;
  }

  static double Height(PangoLayout* layout) {
    int width = 0, height = 0;
    pango_layout_get_size(layout, &width, &height);
    return static_cast<double>(height) / PANGO_SCALE;
  }

  // Prints a layout line by line from the current position, going on to a
  // new page where a line does not fit.
  void Flow(PangoLayout* layout, double x) {
    PangoLayoutIter* iter = pango_layout_get_iter(layout);
    double top = y;
    double shift = 0;  // how far lines moved down by page breaks
    do {
      PangoRectangle logical;
      pango_layout_iter_get_line_extents(iter, nullptr, &logical);
      const double lineTop = top + shift + static_cast<double>(logical.y) / PANGO_SCALE;
      const double lineHeight = static_cast<double>(logical.height) / PANGO_SCALE;
      if (lineTop + lineHeight > Bottom() && lineTop > kMarginTop) {
        NewPage();
        shift += kMarginTop - lineTop;
      }
      const double baseline =
          top + shift + static_cast<double>(pango_layout_iter_get_baseline(iter)) / PANGO_SCALE;
      cairo_set_source_rgb(cr, 0, 0, 0);
      cairo_move_to(cr, x + static_cast<double>(logical.x) / PANGO_SCALE, baseline);
      pango_cairo_show_layout_line(cr, pango_layout_iter_get_line_readonly(iter));
      y = top + shift + static_cast<double>(logical.y + logical.height) / PANGO_SCALE;
    } while (pango_layout_iter_next_line(iter));
    pango_layout_iter_free(iter);
  }

  // A table row laid out for the columns: one layout per cell and the row's height.
  struct RowLayout {
    std::vector<PangoLayout*> cells;
    double height = 0;
    RowLayout() = default;
    RowLayout(const RowLayout&) = delete;
    RowLayout& operator=(const RowLayout&) = delete;
    ~RowLayout() {
      for (PangoLayout* cell : cells) g_object_unref(cell);
    }
  };

  // Cell texts of the table being drawn, laid out once per column and text:
  // a value that comes back in a column (a town, a count) is not shaped
  // again. A column whose values keep changing starts afresh now and then,
  // so the cache stays small.
  static constexpr std::size_t kCachedCells = 512;
  std::vector<std::unordered_map<std::string, PangoLayout*>> cellCache;

  void ClearCellCache() {
    for (auto& column : cellCache)
      for (auto& [text, layout] : column) g_object_unref(layout);
    cellCache.clear();
  }

  void Measure(const std::vector<TableColumn>& columns, const TableRow& cells, RowLayout& row) {
    if (cellCache.size() < columns.size()) cellCache.resize(columns.size());
    double height = 0;
    for (std::size_t i = 0; i < columns.size(); ++i) {
      static const std::string kEmpty;
      const std::string& text = i < cells.size() ? cells[i] : kEmpty;
      auto& cache = cellCache[i];
      PangoLayout* layout = nullptr;
      if (auto hit = cache.find(text); hit != cache.end()) {
        layout = hit->second;
      } else {
        if (cache.size() >= kCachedCells) {
          for (auto& [cached, old] : cache) g_object_unref(old);
          cache.clear();
        }
        layout = Layout(text, "Arial", fontPoints, columns[i].width - 2 * kCellPadding,
                        columns[i].align == TableColumn::Align::Centre ? PANGO_ALIGN_CENTER
                                                                       : PANGO_ALIGN_LEFT);
        cache.emplace(text, layout);
      }
      g_object_ref(layout);
      height = std::max(height, Height(layout));
      row.cells.push_back(layout);
    }
    row.height = height + 2 * kCellPadding;
  }

  // Draws a measured row's shade and texts at the current position, which
  // it moves below the row. The lines come with the table's grid.
  void Draw(const std::vector<TableColumn>& columns, const RowLayout& row,
            std::optional<Colour> shade) {
    if (shade) {
      double width = 0;
      for (const TableColumn& column : columns) width += column.width;
      SetColour(cr, *shade);
      cairo_rectangle(cr, kMarginLeft, y, width, row.height);
      cairo_fill(cr);
    }
    cairo_set_source_rgb(cr, 0, 0, 0);
    double x = kMarginLeft;
    for (std::size_t i = 0; i < columns.size(); ++i) {
      cairo_move_to(cr, x + kCellPadding, y + kCellPadding);
      pango_cairo_show_layout(cr, row.cells[i]);
      x += columns[i].width;
    }
    y += row.height;
  }

  // The lines of the part of a table on one page, stroked as one path: a
  // rule at `top` and below each row, and the column edges from top to the
  // last rule.
  void Grid(const std::vector<TableColumn>& columns, double top, const std::vector<double>& rules) {
    if (rules.empty()) return;
    double right = kMarginLeft;
    for (const TableColumn& column : columns) right += column.width;
    cairo_new_path(cr);
    cairo_move_to(cr, kMarginLeft, top);
    cairo_line_to(cr, right, top);
    for (double rule : rules) {
      cairo_move_to(cr, kMarginLeft, rule);
      cairo_line_to(cr, right, rule);
    }
    double x = kMarginLeft;
    for (std::size_t i = 0; i <= columns.size(); ++i) {
      cairo_move_to(cr, x, top);
      cairo_line_to(cr, x, rules.back());
      if (i < columns.size()) x += columns[i].width;
    }
    cairo_set_source_rgb(cr, 0, 0, 0);
    cairo_set_line_width(cr, kLineWidth);
    cairo_set_line_cap(cr, CAIRO_LINE_CAP_SQUARE);
    cairo_stroke(cr);
    cairo_set_line_cap(cr, CAIRO_LINE_CAP_BUTT);
  }

  void HtmlRow(const std::vector<TableColumn>& columns, const TableRow& cells,
               std::optional<Colour> shade, bool header) {
    html += "<tr>";
    for (std::size_t i = 0; i < columns.size(); ++i) {
      const char* tag = header ? "th" : "td";
      html += std::string("<") + tag + " style=\"width:" + std::to_string(columns[i].width / 15) +
              "px;text-align:" +
              (columns[i].align == TableColumn::Align::Centre ? "center" : "left");
      if (shade) html += ";background:" + HexColour(*shade);
      html += "\">" + EscapeHtml(i < cells.size() ? cells[i] : std::string()) + "</" + tag + ">";
    }
    html += "</tr>\n";
  }
};

CairoPrintDocument::CairoPrintDocument() : impl_(std::make_unique<Impl>()) {}
CairoPrintDocument::~CairoPrintDocument() { impl_->Close(); }

void CairoPrintDocument::SetPrinter(const std::string& name) { impl_->printer = name; }
void CairoPrintDocument::SetOrientation(int orientation) {
  if (orientation == 1 || orientation == 2) impl_->orientation = orientation;
}
void CairoPrintDocument::SetPreview(bool preview) { impl_->preview = preview; }
void CairoPrintDocument::SetOutputFile(const std::string& path) { impl_->outputFile = path; }
void CairoPrintDocument::SetFontSize(double points) {
  if (points > 0 && points < 200) impl_->fontPoints = points;
}

void CairoPrintDocument::BeginDoc(const std::string& title) {
  Impl& d = *impl_;
  d.Close();
  pdf_.clear();
  d.title = title;
  d.html.clear();
  d.pages = 0;
  d.surface = cairo_pdf_surface_create_for_stream(AppendToString, &pdf_,
                                                  d.PageWidth() / kTwipsPerPoint,
                                                  d.PageHeight() / kTwipsPerPoint);
  cairo_pdf_surface_set_metadata(d.surface, CAIRO_PDF_METADATA_TITLE, ValidUtf8(title).c_str());
  d.cr = cairo_create(d.surface);
  // Draw in twips.
  cairo_scale(d.cr, 1 / kTwipsPerPoint, 1 / kTwipsPerPoint);
  // Text is measured in the same units, without hinting, whatever the printer.
  d.context = pango_cairo_create_context(d.cr);
  cairo_font_options_t* options = cairo_font_options_create();
  cairo_font_options_set_hint_metrics(options, CAIRO_HINT_METRICS_OFF);
  cairo_font_options_set_hint_style(options, CAIRO_HINT_STYLE_NONE);
  pango_cairo_context_set_font_options(d.context, options);
  cairo_font_options_destroy(options);
  d.pages = 1;
  d.y = kMarginTop;
  PangoLayout* layout =
      d.Layout(title, "Arial", kTitlePoints, d.TextWidth(), PANGO_ALIGN_CENTER, true);
  d.Flow(layout, kMarginLeft);
  g_object_unref(layout);
  d.y = std::max(d.y, kBodyTop);
  d.html = "<h1>" + EscapeHtml(title) + "</h1>\n";
}

void CairoPrintDocument::Paragraph(const std::string& text, const std::string& font,
                                   std::optional<double> points) {
  Impl& d = *impl_;
  if (!d.Open()) return;
  const double size = points && *points > 0 && *points < 200 ? *points : d.fontPoints;
  PangoLayout* layout = d.Layout(text, font.empty() ? "Arial" : font, size, d.TextWidth(),
                                 PANGO_ALIGN_LEFT);
  d.Flow(layout, kMarginLeft);
  g_object_unref(layout);
  d.html += "<p style=\"font-family:'" + EscapeHtml(font) + "';font-size:" +
            std::to_string(static_cast<int>(size)) + "pt\">" +
            (text.empty() ? std::string("&nbsp;") : EscapeHtml(text)) + "</p>\n";
}

double CairoPrintDocument::CurrentX() const { return kMarginLeft; }
double CairoPrintDocument::CurrentY() const { return impl_->y; }

void CairoPrintDocument::SetCurrentY(double y) {
  Impl& d = *impl_;
  if (!d.Open()) return;
  d.y = std::clamp(y, kMarginTop, d.Bottom());
}

void CairoPrintDocument::Rectangle(double left, double top, double right, double bottom,
                                   Colour fill) {
  Impl& d = *impl_;
  if (!d.Open()) return;
  cairo_rectangle(d.cr, left, top, right - left, bottom - top);
  SetColour(d.cr, fill);
  cairo_fill_preserve(d.cr);
  cairo_set_source_rgb(d.cr, 0, 0, 0);
  cairo_set_line_width(d.cr, kLineWidth);
  cairo_stroke(d.cr);
}

void CairoPrintDocument::AddTable(std::string_view format, const TableRow& header,
                                  const std::vector<TableRow>& body,
                                  std::optional<Colour> headerShade) {
  Impl& d = *impl_;
  if (!d.Open()) return;
  const std::vector<TableColumn> columns = ParseTableFormat(format);
  if (columns.empty()) return;
  d.html += "<table style=\"border-collapse:collapse\" border=\"1\">\n";
  // The header row stays with the first body row, and stands again at the
  // top of every page the table runs on to.
  Impl::RowLayout headerRow;
  if (!header.empty()) {
    d.Measure(columns, header, headerRow);
    d.HtmlRow(columns, header, headerShade, true);
  }
  double keep = headerRow.height;
  if (!body.empty()) {
    Impl::RowLayout first;
    d.Measure(columns, body.front(), first);
    keep += first.height;
  }
  d.Room(keep);
  double top = d.y;
  std::vector<double> rules;  // below each row of the table's part on this page
  auto startPart = [&] {
    top = d.y;
    rules.clear();
    if (header.empty()) return;
    d.Draw(columns, headerRow, headerShade);
    rules.push_back(d.y);
  };
  startPart();
  for (const TableRow& cells : body) {
    Impl::RowLayout row;
    d.Measure(columns, cells, row);
    if (!d.Fits(row.height)) {
      d.Grid(columns, top, rules);
      d.NewPage();
      startPart();
    }
    d.Draw(columns, row, std::nullopt);
    rules.push_back(d.y);
    d.HtmlRow(columns, cells, std::nullopt, false);
  }
  d.Grid(columns, top, rules);
  d.ClearCellCache();
  d.html += "</table>\n";
}

bool CairoPrintDocument::EndDoc() {
  Impl& d = *impl_;
  if (!d.Open()) return false;
  bool ok = cairo_status(d.cr) == CAIRO_STATUS_SUCCESS;
  d.Close();
  if (!ok || pdf_.empty()) return false;
  if (!d.outputFile.empty()) {
    const std::string page = "<!DOCTYPE html>\n<html><head><meta charset=\"utf-8\"><title>" +
                             EscapeHtml(d.title) + "</title></head>\n<body>\n" + d.html +
                             "</body></html>\n";
    ok = ReplaceFile(d.outputFile, page);
  }
  if (d.preview) return ok;
  Spooler& spooler = CurrentSpooler();
  long error = 0;
  const std::int32_t handle = spooler.OpenPrinter(d.printer, error);
  if (handle == 0) return false;
  const bool printed = spooler.StartDoc(handle, d.title + ".pdf") != 0 &&
                       spooler.Write(handle, pdf_) && spooler.EndDoc(handle);
  spooler.ClosePrinter(handle);
  return printed && ok;
}

std::string CairoPrintDocument::Show() {
  if (pdf_.empty()) return {};
  namespace fs = std::filesystem;
  std::string path;
  if (!impl_->outputFile.empty()) {
    path = fs::path(impl_->outputFile).replace_extension(".pdf").string();
  } else {
    std::error_code ec;
    path = (fs::temp_directory_path(ec) / ("quendal-" + TitleForFileName(impl_->title) + ".pdf")).string();
  }
  return ReplaceFile(path, pdf_) ? path : std::string();
}

int CairoPrintDocument::Pages() const { return impl_->pages; }

std::unique_ptr<PrintDocument> NewPrintDocument() { return std::make_unique<CairoPrintDocument>(); }

}  // namespace quendal
