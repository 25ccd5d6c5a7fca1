#include "labels/WinPrint.h"

#include <gtest/gtest.h>

#include <ZXing/ReadBarcode.h>

#include <cstdint>
#include <string>
#include <vector>

#include "labels/AaEServices.h"
#include "labels/Code128.h"
#include "tests/support/MemoryHost.h"

namespace quendal {
namespace {

// The symbol values of a module string, read back 11 modules at a time
// (the last 13 are the stop symbol).
std::vector<int> Symbols(const std::string& modules) {
  std::vector<int> values;
  std::size_t at = 0;
  while (at + code128::kStopModules < modules.size()) {
    const std::string_view symbol(modules.data() + at, code128::kSymbolModules);
    int value = -1;
    for (int v = 0; v < code128::kSymbolCount; ++v)
      if (symbol == std::string_view(code128::kModules[v].data(), code128::kSymbolModules)) value = v;
    values.push_back(value);
    at += code128::kSymbolModules;
  }
  EXPECT_EQ(modules.substr(at), "1100011101011") << "stop symbol";
  return values;
}

TEST(Code128Test, SymbolsOfTheLabelsElementStrings) {
  // Start C, FNC1, ten digit pairs; 105 + 102 + 2*0 + 3*9 + 4*31 + 5*23 + 6*45 + 11*12 = 875 -> 51.
  EXPECT_EQ(Symbols(BarPattern("~20100093123450000000012")),
            (std::vector<int>{105, 102, 0, 9, 31, 23, 45, 0, 0, 0, 0, 12, 51}));
  // An odd digit is left for set A (16 + digit): 105 + 12 + 68 + 3*101 + 4*21 = 572 -> 57.
  EXPECT_EQ(Symbols(BarPattern("12345")), (std::vector<int>{105, 12, 34, 101, 21, 57}));
  // Not four digits and no FNC1: set B throughout: 104 + 17 + 36 + 99 + 136 = 392 -> 83.
  EXPECT_EQ(Symbols(BarPattern("12AB")), (std::vector<int>{104, 17, 18, 33, 34, 83}));
  // Lower case leaves C for B; a capital after it goes to A:
  // 105 + 12 + 68 + 300 + 260 + 505 + 204 = 1454 -> 12.
  EXPECT_EQ(Symbols(BarPattern("1234aB")), (std::vector<int>{105, 12, 34, 100, 65, 101, 34, 12}));
  // Nothing: start B, check 104 mod 103.
  EXPECT_EQ(Symbols(BarPattern("")), (std::vector<int>{104, 1}));
  EXPECT_EQ(BarPattern(""), "11010010000" "11001101100" "1100011101011");
}

TEST(Code128Test, CharactersWithoutAValueAreDropped) {
  EXPECT_EQ(BarPattern("12\xC3\xA9" "4"), BarPattern("124"));   // set B: é has no value
  EXPECT_EQ(BarPattern("AB\r\n"), BarPattern("AB"));            // set B: nor have controls
  EXPECT_EQ(BarPattern("1234\xFF" "5"), BarPattern("12345"));   // from set C
  // From set C, control characters are set A values.
  EXPECT_EQ(Symbols(BarPattern("1234\t")), (std::vector<int>{105, 12, 34, 101, 73, (105 + 12 + 68 + 303 + 292) % 103}));
  const std::string big(5000, 'x');
  EXPECT_EQ(BarPattern(big).size(), (5000u + 2) * 11 + 13);
}

TEST(Code128Test, WidthPatternsAndModules) {
  EXPECT_EQ(GetBars(105), "211214");  // value 104, start B
  EXPECT_EQ(GetBars(107), "2331112");
  EXPECT_EQ(GetBars(0), "");
  EXPECT_EQ(GetBars(108), "");
  EXPECT_EQ(ConvertPattern("211214"), "11010010000");
  // The module string is the width patterns of its symbols, alternating on across them.
  std::string widths;
  for (int value : {105, 102, 0, 9, 31, 23, 45, 0, 0, 0, 0, 12, 51, 106}) widths += GetBars(value + 1);
  EXPECT_EQ(BarPattern("~20100093123450000000012"), ConvertPattern(widths));
}

// Decodes the module string with an independent reader: two pixels a
// module, ten modules of quiet zone on each side, 40 rows.
struct Decoded {
  bool valid;
  std::string symbology;
  std::string text;
};
Decoded Decode(const std::string& modules) {
  constexpr int kScale = 2;
  constexpr int kQuiet = 10;
  constexpr int kHeight = 40;
  const int width = static_cast<int>(modules.size() + 2 * kQuiet) * kScale;
  std::vector<std::uint8_t> pixels(static_cast<std::size_t>(width * kHeight), 255);
  for (int y = 0; y < kHeight; ++y)
    for (std::size_t m = 0; m < modules.size(); ++m)
      if (modules[m] == '1')
        for (int s = 0; s < kScale; ++s)
          pixels[static_cast<std::size_t>(y * width + (kQuiet + static_cast<int>(m)) * kScale + s)] = 0;
  const ZXing::ImageView image(pixels.data(), width, kHeight, ZXing::ImageFormat::Lum);
  const auto result =
      ZXing::ReadBarcode(image, ZXing::DecodeHints().setFormats(ZXing::BarcodeFormat::Code128));
  return {result.isValid(), result.symbologyIdentifier(),
          std::string(result.bytes().begin(), result.bytes().end())};
}

TEST(Code128Test, AnIndependentReaderReadsWhatWasEncoded) {
  struct Case {
    std::string data;
    std::string symbology;  // ]C1: GS1-128, FNC1 first
    std::string text;       // FNC1 between elements reads as the group separator
  };
  const Case cases[] = {
      {"~20100093123450000000012", "]C1", "00093123450000000012"},
      {"~2014210363148~201901234", "]C1", "4210363148\x1d" "901234"},
      {"~201421036AB12", "]C1", "421036AB12"},
      {"12345", "]C0", "12345"},
      {"12AB", "]C0", "12AB"},
      {"1234aB", "]C0", "1234aB"},
      {"C000000003", "]C0", "C000000003"},
  };
  for (const Case& c : cases) {
    const Decoded decoded = Decode(BarPattern(c.data));
    EXPECT_TRUE(decoded.valid) << c.data;
    EXPECT_EQ(decoded.symbology, c.symbology) << c.data;
    EXPECT_EQ(decoded.text, c.text) << c.data;
  }
}

TEST(ArticleIdTest, CheckDigitOverTheConvertedIdentifier) {
  // 1 2 3 4 5 0 1 5 0 2: odd positions from the right 2+5+0+4+2 = 13, even 0+1+5+3+1 = 10;
  // 13 * 3 + 10 = 49, check 1.
  EXPECT_EQ(CreateArticleID("12345", "01502"), "12345015021");
  // Letters in the first three places count as the last digit of their code, but are returned.
  // "ABC" -> 5 6 7: 5 6 7 1 2 0 1 5 0 2 -> odd 2+5+0+1+6 = 14, even 0+1+2+7+5 = 15; 57 -> 3.
  EXPECT_EQ(CreateArticleID("ABC12", "01502"), "ABC1201502" "3");
  EXPECT_EQ(CreateBarcode("ABC12", "01502"), "ABC1201502" "3");
  // A total that is a multiple of ten gives 0, not 10: 0000000 -> total 0.
  EXPECT_EQ(CreateArticleID("000", "0000"), "00000000");
  // Letters after the third place count as 0.
  EXPECT_EQ(CreateArticleID("123X", ""), CreateArticleID("1230", "").replace(3, 1, "X"));
  EXPECT_EQ(CreateArticleID("", ""), "0");
}

TEST(WinPrintTest, RemoveInvalidCharDropsDoubleQuotes) {
  EXPECT_EQ(RemoveInvalidChar("\"Acme\" \"\"Pty\""), "Acme Pty");
}

TEST(AaEServicesTest, ServiceTables) {
  test::MemoryHost host;
  auto conNote = host.Make<host::ConNote>({{"Service", "  OVERNIGHT "}});
  EXPECT_EQ(ServiceCode(conNote), "O/N");
  EXPECT_EQ(ArticleCode(conNote), "OUH");
  conNote->fields["Service"] = "NEXT DAY ECONOMY";
  EXPECT_EQ(ArticleCode(conNote), "NUH");
  conNote->fields["Service"] = "OFF PEAK";
  EXPECT_EQ(ServiceCode(conNote), "O/P");
  for (const Var& other : {Var("overnight"), Var(), Var("EXPRESS")}) {
    conNote->fields["Service"] = other;
    EXPECT_EQ(ServiceCode(conNote), "");
    EXPECT_EQ(ArticleCode(conNote), "");
  }
  // No consignment: reported, and no code.
  auto prompt = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope scope(prompt);
  EXPECT_EQ(ServiceCode(Ref<host::ConNote>()), "");
  ASSERT_EQ(prompt->messages.size(), 1u);
  EXPECT_NE(prompt->messages[0].find("cAaEGenericSCM, Function ServiceCode"), std::string::npos);
}

}  // namespace
}  // namespace quendal
