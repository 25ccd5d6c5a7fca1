#include "tests/support/Barcodes.h"

#include <cairo.h>

#include <ZXing/ReadBarcode.h>

#include <algorithm>
#include <cstdint>
#include <string_view>
#include <vector>

namespace quendal::test {

std::string HumanReadable(const std::string& text) {
  std::string out;
  std::size_t at = 0;
  while (at < text.size()) {
    std::size_t length = std::string::npos;
    std::string ai;
    if (text.compare(at, 2, "00") == 0) {
      ai = "00";
      length = 18;
    } else if (text.compare(at, 3, "421") == 0) {
      ai = "421";
    } else if (text.compare(at, 2, "90") == 0) {
      ai = "90";
    } else {
      return out + "?" + text.substr(at);
    }
    at += ai.size();
    std::size_t end = length == std::string::npos ? text.find('\x1d', at) : at + length;
    if (end == std::string::npos || end > text.size()) end = text.size();
    out += "(" + ai + ")" + text.substr(at, end - at);
    at = end < text.size() && text[end] == '\x1d' ? end + 1 : end;
  }
  return out;
}

namespace {

cairo_status_t ReadFromString(void* closure, unsigned char* data, unsigned int length) {
  auto* source = static_cast<std::string_view*>(closure);
  if (source->size() < length) return CAIRO_STATUS_READ_ERROR;
  std::copy_n(source->data(), length, data);
  source->remove_prefix(length);
  return CAIRO_STATUS_SUCCESS;
}

}  // namespace

namespace {

std::set<std::string> ReadBarcodes(const std::string& png, bool gs1Only) {
  std::string_view source(png);
  cairo_surface_t* image = cairo_image_surface_create_from_png_stream(ReadFromString, &source);
  std::set<std::string> found;
  if (cairo_surface_status(image) == CAIRO_STATUS_SUCCESS) {
    cairo_surface_flush(image);
    const int width = cairo_image_surface_get_width(image);
    const int height = cairo_image_surface_get_height(image);
    const int stride = cairo_image_surface_get_stride(image);
    const unsigned char* data = cairo_image_surface_get_data(image);
    std::vector<std::uint8_t> lum(static_cast<std::size_t>(width * height));
    for (int y = 0; y < height; ++y)
      for (int x = 0; x < width; ++x) {
        // RGB24 (or ARGB32): the green byte of each little-endian pixel stands for grey.
        lum[static_cast<std::size_t>(y * width + x)] = data[y * stride + x * 4 + 1];
      }
    // Band by band down the page, so that each look sees one row of symbols.
    constexpr int kBand = 60;
    for (int top = 0; top + kBand <= height; top += kBand / 2) {
      const ZXing::ImageView band(lum.data() + static_cast<std::ptrdiff_t>(top) * width, width,
                                  kBand, ZXing::ImageFormat::Lum);
      const auto result = ZXing::ReadBarcode(
          band, ZXing::DecodeHints().setFormats(ZXing::BarcodeFormat::Code128).setTryRotate(false));
      if (!result.isValid()) continue;
      if (result.symbologyIdentifier() == "]C1")
        found.insert(HumanReadable(result.text()));
      else if (!gs1Only)
        found.insert(result.text());
    }
  }
  cairo_surface_destroy(image);
  return found;
}

}  // namespace

std::set<std::string> ReadGs1Barcodes(const std::string& png) { return ReadBarcodes(png, true); }

std::set<std::string> ReadCode128Barcodes(const std::string& png) { return ReadBarcodes(png, false); }

}  // namespace quendal::test
