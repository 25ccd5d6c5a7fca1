// The drawn label end to end: the reference label drawn on a plain
// printer's page as a PNG file, read back by an independent barcode reader.
#include <cairo.h>
#include <gtest/gtest.h>

#include <ZXing/ReadBarcode.h>

#include <cstdlib>
#include <filesystem>
#include <set>

#include "labels/cStarTrackGenericSCM.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::MemoryHost;

// A GS1-128 reading as its human-readable element strings: AI 00 is 18
// digits; 421 and 90 run to the next group separator.
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

cairo_status_t ReadFromString(void* closure, unsigned char* data, unsigned int length) {
  auto* source = static_cast<std::string_view*>(closure);
  if (source->size() < length) return CAIRO_STATUS_READ_ERROR;
  std::copy_n(source->data(), length, data);
  source->remove_prefix(length);
  return CAIRO_STATUS_SUCCESS;
}

// Every Code 128 symbol on a PNG page, as GS1 human-readable text.
std::set<std::string> ReadGs1Barcodes(const std::string& png) {
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
      if (result.isValid() && result.symbologyIdentifier() == "]C1")
        found.insert(HumanReadable(result.text()));
    }
  }
  cairo_surface_destroy(image);
  return found;
}

class DrawnLabelTest : public ::testing::TestWithParam<int> {
 protected:
  void SetUp() override {
    fs::create_directories(root / "Office Laser");
    AppendFile((root / "Office Laser/printer.ini").string(),
               "dpi=" + std::to_string(GetParam()) + "\n");
    previous = SetSpooler(std::make_shared<DirectorySpooler>(root.string()));
    SetNow(DateTime::FromParts(2024, 3, 14, 10, 0));
    host.system->fields["PrinterLanguage"] = "WinPCL";
  }
  void TearDown() override {
    SetSpooler(previous);
    SetNow(std::nullopt);
  }

  test::TempFolder temp;
  fs::path root{temp.path()};
  std::shared_ptr<Spooler> previous;
  MemoryHost host;
};

TEST_P(DrawnLabelTest, BarcodesReadBackFromThePicture) {
  host.Make<host::Receiver>({{"Code", "0412"},
                             {"PartnerId", 1},
                             {"Name", "Harbour Stores Chadstone"},
                             {"AddressLine1", "Shop 210"},
                             {"Suburb", "CHADSTONE"},
                             {"State", "VIC"},
                             {"Postcode", "3148"}});
  auto conNote = host.Make<host::ConNote>({{"ConNoteNo", "SRX00012345"}, {"Service", "EXP"}});
  auto pack = host.Make<host::Pack>(
      {{"PackId", 1001},
       {"SSCC", "00093123450000000012"},
       {"StoreCode", "0412"},
       {"PartnerId", 1},
       {"ASNId", 1},
       {"CarrierId", 1},
       {"Carrier", host.Make<host::Carrier>({{"Name", "Southern Road Express"}})},
       {"Vendor", host.Make<host::Vendor>({{"Name", "Acme Apparel Pty Ltd"}})},
       {"Receiver", host.Make<host::Receiver>({{"StoreCode", "0900"}})},
       {"ShipTo", host.Make<host::Receiver>({{"CountryCode", "036"}})},
       {"Order", host.Make<host::Order>({{"DeliveryAddress", host.Make<host::Address>()}})},
       {"Despatch", host.Make<host::Despatch>({{"DespatchNo", "PO778812"}})},
       {"Carton", host.Make<host::Carton>({{"Code", "CTN01"}})}});
  MemoryHost::Attach(conNote, {pack});

  auto prompt = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope scope(prompt);
  clsStarTrackGenericSCM label;
  ASSERT_TRUE(label.Init(host.system, "Office Laser"));
  ASSERT_TRUE(label.PrintLabel(pack)) << (prompt->messages.empty() ? "" : prompt->messages[0]);
  EXPECT_TRUE(host.logs.empty());
  const auto png = ReadFile((root / "Office Laser/000001-Quendal.clsStarTrackGenericSCM.png").string());
  ASSERT_TRUE(png);
  EXPECT_EQ(ReadGs1Barcodes(*png),
            (std::set<std::string>{"(00)093123450000000012", "(421)0363148"}));
}

INSTANTIATE_TEST_SUITE_P(Resolutions, DrawnLabelTest, ::testing::Values(203, 300));

}  // namespace
}  // namespace quendal
