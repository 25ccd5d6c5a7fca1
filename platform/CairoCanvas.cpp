#include "platform/CairoCanvas.h"

#include <cairo-pdf.h>
#include <cairo.h>
#include <pango/pangocairo.h>
#include <png.h>

#include <algorithm>
#include <array>
#include <bit>
#include <csetjmp>
#include <vector>
#include <cmath>
#include <numbers>
#include <stdexcept>

namespace quendal {

namespace {

// Arial's proportions, which the metric-compatible faces share: the cell
// (ascent + descent) is 1.117 em and the average character width 0.4414 em.
constexpr double kCellPerEm = 2288.0 / 2048.0;
constexpr double kAverageWidthPerEm = 904.0 / 2048.0;

double Red(Colour c) { return ((c >> 16) & 0xFF) / 255.0; }
double Green(Colour c) { return ((c >> 8) & 0xFF) / 255.0; }
double Blue(Colour c) { return (c & 0xFF) / 255.0; }
bool IsDark(Colour c) { return 0.299 * Red(c) + 0.587 * Green(c) + 0.114 * Blue(c) < 0.5; }

// Byte as Cairo's A1 stores it on this machine (first pixel in the lowest
// bit on little-endian) to a 1-bit grey PNG byte (first pixel in the
// highest bit, 1 = white).
constexpr std::array<unsigned char, 256> MakePngBits() {
  std::array<unsigned char, 256> table{};
  for (int v = 0; v < 256; ++v) {
    unsigned char out = 0;
    for (int bit = 0; bit < 8; ++bit) {
      const bool ink = (std::endian::native == std::endian::little) ? (v >> bit) & 1
                                                                    : (v >> (7 - bit)) & 1;
      if (!ink) out |= static_cast<unsigned char>(0x80 >> bit);
    }
    table[static_cast<std::size_t>(v)] = out;
  }
  return table;
}
constexpr auto kPngBits = MakePngBits();

void AppendToString(png_structp png, png_bytep data, png_size_t length) {
  auto* out = static_cast<std::string*>(png_get_io_ptr(png));
  out->append(reinterpret_cast<const char*>(data), length);
}

cairo_status_t WriteToString(void* closure, const unsigned char* data, unsigned int length) {
  static_cast<std::string*>(closure)->append(reinterpret_cast<const char*>(data), length);
  return CAIRO_STATUS_SUCCESS;
}

}  // namespace

namespace {

// The page rows as PNG rows; everything libpng's error jump may skip over
// lives here, set up before the jump point.
struct PngJob {
  const unsigned char* data;
  int width;
  int height;
  int stride;
  int dpi;
  std::string* out;
  unsigned char* row;
};

bool WritePng(png_structp png, png_infop info, const PngJob& job) {
  if (setjmp(png_jmpbuf(png))) return false;
  png_set_write_fn(png, job.out, AppendToString, nullptr);
  png_set_IHDR(png, info, static_cast<png_uint_32>(job.width), static_cast<png_uint_32>(job.height),
               1, PNG_COLOR_TYPE_GRAY, PNG_INTERLACE_NONE, PNG_COMPRESSION_TYPE_DEFAULT,
               PNG_FILTER_TYPE_DEFAULT);
  const auto perMetre = static_cast<png_uint_32>(std::lround(job.dpi / 0.0254));
  png_set_pHYs(png, info, perMetre, perMetre, PNG_RESOLUTION_METER);
  // 1-bit pages compress well without filters; the fastest level keeps a
  // label page to a millisecond or two.
  png_set_filter(png, 0, PNG_FILTER_NONE);
  png_set_compression_level(png, 1);
  png_write_info(png, info);
  const int bytes = (job.width + 7) / 8;
  for (int y = 0; y < job.height; ++y) {
    const unsigned char* src = job.data + static_cast<std::ptrdiff_t>(y) * job.stride;
    for (int i = 0; i < bytes; ++i) job.row[i] = kPngBits[src[i]];
    png_write_row(png, job.row);
  }
  png_write_end(png, nullptr);
  return true;
}

}  // namespace

std::string EncodeOneBitPng(cairo_surface_t* surface, int dpi) {
  cairo_surface_flush(surface);
  std::string out;
  const int width = cairo_image_surface_get_width(surface);
  std::vector<unsigned char> row(static_cast<std::size_t>((width + 7) / 8) + 1);
  const PngJob job{cairo_image_surface_get_data(surface), width,
                   cairo_image_surface_get_height(surface), cairo_image_surface_get_stride(surface),
                   dpi, &out, row.data()};
  png_structp png = png_create_write_struct(PNG_LIBPNG_VER_STRING, nullptr, nullptr, nullptr);
  png_infop info = png ? png_create_info_struct(png) : nullptr;
  const bool ok = png && info && WritePng(png, info, job);
  png_destroy_write_struct(&png, &info);
  if (!ok) throw std::runtime_error("cannot encode a PNG page");
  return out;
}

CairoCanvas::CairoCanvas(int widthPixels, int heightPixels, int dpi)
    : width_(std::max(1, widthPixels)), height_(std::max(1, heightPixels)), dpi_(std::max(1, dpi)) {}

CairoCanvas::~CairoCanvas() { Finish(); }

void CairoCanvas::Begin(cairo_surface_t* surface, double scale) {
  Finish();
  surface_ = surface;
  cr_ = cairo_create(surface);
  cairo_scale(cr_, scale, scale);
  cairo_set_antialias(cr_, CAIRO_ANTIALIAS_NONE);
}

void CairoCanvas::Finish() {
  if (cr_) cairo_destroy(cr_);
  if (surface_) cairo_surface_destroy(surface_);
  cr_ = nullptr;
  surface_ = nullptr;
}

void CairoCanvas::SetColour(Colour colour) {
  if (oneBit_) {
    cairo_set_operator(cr_, CAIRO_OPERATOR_SOURCE);
    cairo_set_source_rgba(cr_, 0, 0, 0, IsDark(colour) ? 1.0 : 0.0);
  } else {
    cairo_set_operator(cr_, CAIRO_OPERATOR_OVER);
    cairo_set_source_rgb(cr_, Red(colour), Green(colour), Blue(colour));
  }
}

void CairoCanvas::Rectangle(int x1, int y1, int x2, int y2, int penWidth) {
  if (!cr_) return;
  // A pen w pixels wide centred on the outline through the edge pixels:
  // each edge becomes a band w pixels wide starting w/2 before it.
  const int w = std::max(1, penWidth);
  const int before = w / 2;
  const int left = x1 - before;
  const int top = y1 - before;
  const int rightEdge = std::max(x1, x2 - 1) - before;
  const int bottomEdge = std::max(y1, y2 - 1) - before;
  SetColour(kBlack);
  const int spanWidth = rightEdge + w - left;
  const int spanHeight = bottomEdge + w - top;
  cairo_rectangle(cr_, left, top, w, spanHeight);
  if (rightEdge != left) cairo_rectangle(cr_, rightEdge, top, w, spanHeight);
  cairo_rectangle(cr_, left, top, spanWidth, w);
  if (bottomEdge != top) cairo_rectangle(cr_, left, bottomEdge, spanWidth, w);
  cairo_set_fill_rule(cr_, CAIRO_FILL_RULE_WINDING);
  cairo_fill(cr_);
}

PangoLayout* CairoCanvas::Layout(std::string_view utf8, const CanvasFont& font, double& stretch) {
  if (!cr_ || utf8.empty() || font.height <= 0) return nullptr;
  const double em = font.height / kCellPerEm;
  stretch = font.width > 0 ? font.width / (kAverageWidthPerEm * em) : 1.0;
  PangoLayout* layout = pango_cairo_create_layout(cr_);
  PangoFontDescription* desc = pango_font_description_new();
  pango_font_description_set_family(desc, font.face.c_str());
  pango_font_description_set_weight(desc, static_cast<PangoWeight>(std::clamp(font.weight, 100, 1000)));
  pango_font_description_set_absolute_size(desc, em * PANGO_SCALE);
  pango_layout_set_font_description(layout, desc);
  pango_font_description_free(desc);
  // Invalid UTF-8 would make Pango refuse the whole text; show such bytes as "?".
  std::string valid(utf8);
  const gchar* end = nullptr;
  while (!g_utf8_validate(valid.data(), static_cast<gssize>(valid.size()), &end))
    valid[static_cast<std::size_t>(end - valid.data())] = '?';
  pango_layout_set_text(layout, valid.data(), static_cast<int>(valid.size()));
  return layout;
}

void CairoCanvas::Text(int x, int y, std::string_view utf8, const CanvasFont& font, Colour text,
                       Colour background) {
  TurnedText(x, y, utf8, font, 0, text, background);
}

double CairoCanvas::TextWidth(std::string_view utf8, const CanvasFont& font) {
  double stretch = 1;
  PangoLayout* layout = Layout(utf8, font, stretch);
  if (!layout) return 0;
  PangoRectangle logical;
  pango_layout_get_pixel_extents(layout, nullptr, &logical);
  g_object_unref(layout);
  return logical.width * stretch;
}

CanvasBox CairoCanvas::TurnedText(double x, double y, std::string_view utf8, const CanvasFont& font,
                                  int quarterTurns, Colour text, std::optional<Colour> background,
                                  bool invert) {
  double stretch = 1;
  PangoLayout* layout = Layout(utf8, font, stretch);
  if (!layout) return {x, y, x, y};
  PangoRectangle logical;
  pango_layout_get_pixel_extents(layout, nullptr, &logical);
  // The cell is as tall as the font's cell, whatever Pango's line height says.
  const double cellWidth = logical.width;
  const double cellHeight = std::max(logical.height, font.height);
  const int turns = ((quarterTurns % 4) + 4) % 4;
  cairo_save(cr_);
  cairo_translate(cr_, x, y);
  if (turns) cairo_rotate(cr_, turns * std::numbers::pi / 2);
  cairo_scale(cr_, stretch, 1.0);
  if (background) {
    SetColour(*background);
    cairo_rectangle(cr_, 0, 0, cellWidth, cellHeight);
    cairo_fill(cr_);
  }
  if (invert) {
    // Exclusive-or of coverage: ink where there was none, none where there was.
    cairo_set_operator(cr_, CAIRO_OPERATOR_XOR);
    cairo_set_source_rgba(cr_, 0, 0, 0, 1.0);
  } else {
    SetColour(text);
  }
  pango_cairo_show_layout(cr_, layout);
  cairo_restore(cr_);
  g_object_unref(layout);
  // The cell's corners on the page.
  const double w = cellWidth * stretch;
  const double h = cellHeight;
  switch (turns) {
    case 1:
      return {x - h, y, x, y + w};
    case 2:
      return {x - w, y - h, x, y};
    case 3:
      return {x, y - w, x + h, y};
    default:
      return {x, y, x + w, y + h};
  }
}

void CairoCanvas::Fill(double x1, double y1, double x2, double y2) {
  if (!cr_ || x2 <= x1 || y2 <= y1) return;
  SetColour(kBlack);
  cairo_rectangle(cr_, x1, y1, x2 - x1, y2 - y1);
  cairo_fill(cr_);
}

PngCanvas::PngCanvas(int widthPixels, int heightPixels, int dpi)
    : CairoCanvas(widthPixels, heightPixels, dpi) {
  oneBit_ = true;
}

void PngCanvas::StartPage() {
  Begin(cairo_image_surface_create(CAIRO_FORMAT_A1, width_, height_), 1.0);
  cairo_font_options_t* options = cairo_font_options_create();
  cairo_font_options_set_antialias(options, CAIRO_ANTIALIAS_NONE);
  cairo_font_options_set_hint_style(options, CAIRO_HINT_STYLE_FULL);
  cairo_set_font_options(cr_, options);
  cairo_font_options_destroy(options);
}

void PngCanvas::EndPage() {
  if (!surface_) return;
  pages_.push_back(EncodeOneBitPng(surface_, dpi_));
  Finish();
}

PdfCanvas::PdfCanvas(int widthPixels, int heightPixels, int dpi)
    : CairoCanvas(widthPixels, heightPixels, dpi) {
  const double points = 72.0 / dpi_;
  Begin(cairo_pdf_surface_create_for_stream(WriteToString, &bytes_, width_ * points,
                                            height_ * points),
        points);
}

PdfCanvas::~PdfCanvas() { Document(); }

void PdfCanvas::StartPage() {
  pageOpen_ = true;
  if (cr_) {
    cairo_save(cr_);
    SetColour(kWhite);
    cairo_paint(cr_);
    cairo_restore(cr_);
  }
}

void PdfCanvas::EndPage() {
  if (cr_ && pageOpen_) cairo_show_page(cr_);
  pageOpen_ = false;
}

std::string PdfCanvas::Document() {
  if (!finished_) {
    if (pageOpen_) EndPage();
    if (surface_) cairo_surface_finish(surface_);
    Finish();
    finished_ = true;
  }
  return bytes_;
}

}  // namespace quendal
