#include "labels/VpclLabel.h"

#include <gtest/gtest.h>

namespace quendal {
namespace {

// The "Generic" format as the reference label class downloads it.
constexpr std::string_view kGeneric =
    "{F,430,A,R,E,600,400,\"Generic\"|L,S,547,2,547,390,6,\"11111111\"|"
    "C,533,5,0,1,1,1,O,L,0,0,\"FROM:\"|T,1,50,V,532,48,0,1,1,1,O,L,0,0,0|"
    "T,10,50,V,520,5,0,1,1,1,O,L,0,0,0|T,2,50,V,508,5,0,1,1,1,O,L,0,0,0|"
    "T,3,50,V,508,130,0,1,1,1,O,L,0,0,0|C,528,250,0,1,1,1,O,L,0,0,\"CARRIER:\"|"
    "T,4,50,V,512,250,0,1,1,1,O,L,0,0,0|C,493,250,0,1,1,1,O,L,0,0,\"CONNOTE:\"|"
    "T,5,50,V,469,250,0,1,2,1,O,L,0,0,0|C,483,5,0,1,2,1,O,L,0,0,\"TO:\"|"
    "T,6,50,V,458,5,0,1,2,1,O,L,0,0,0|T,11,50,V,438,5,0,1,2,1,O,L,0,0,0|"
    "T,7,50,V,418,5,0,1,2,1,O,L,0,0,0|T,8,50,V,398,5,0,1,2,1,O,L,0,0,0|"
    "T,9,50,V,476,55,0,1,3,1,O,L,0,0,0|B,15,27,V,262,40,8,4,60,8,L,0|"
    "T,16,50,V,247,50,0,1,1,1,B,L,0,0,0|B,17,27,V,182,40,8,4,60,8,L,0|"
    "T,18,50,V,167,50,0,1,1,1,B,L,0,0,0|T,19,50,V,336,180,0,1,2,1,B,L,0,0,0|"
    "T,20,25,V,380,160,0,1,2,1,B,R,0,0,0|T,21,25,V,360,160,0,1,2,1,B,R,0,0,0|"
    "B,24,21,V,25,40,8,4,135,8,L,0|T,25,50,V,10,50,0,1,1,1,B,L,0,0,0|"
    "T,26,50,V,353,20,0,1,2,1,B,L,0,0,0|T,27,50,V,333,20,0,1,2,1,B,L,0,0,0|"
    "T,28,50,V,577,5,0,3,1,1,B,L,0,0,0|T,29,50,V,577,270,0,3,1,1,B,L,0,0,0|"
    "T,30,50,V,557,230,0,3,1,1,B,L,0,0,0|T,31,50,V,370,5,0,1,1,1,B,L,0,0,0|"
    "T,32,50,V,355,5,0,1,1,1,B,L,0,0,0|T,33,50,V,340,5,0,1,1,1,B,L,0,0,0|"
    "T,34,50,V,557,5,0,3,1,1,B,L,0,0,0|}";

template <class T>
std::vector<T> ItemsOf(const LabelDrawing& d) {
  std::vector<T> out;
  for (const auto& item : d.items)
    if (const auto* t = std::get_if<T>(&item)) out.push_back(*t);
  return out;
}

TEST(VpclLabelTest, ReadsTheFormatAndAppliesTheBatch) {
  const VpclLabel label = ReadVpclLabel(
      kGeneric, "{B,430,N,1|E,1,0,1,1,0,1|1,\"ACME APPAREL\"|28,\"TRUGANINA\"|24,\"~20100093123450000000012\"|}");
  EXPECT_EQ(label.name, "Generic");
  EXPECT_EQ(label.length, 600);
  EXPECT_EQ(label.width, 400);
  ASSERT_EQ(label.elements.size(), 34u);
  EXPECT_EQ(label.elements[0].kind, "L");
  EXPECT_EQ(label.elements[1].data, "FROM:");
  EXPECT_EQ(label.elements[2].data, "ACME APPAREL");
  EXPECT_EQ(label.elements[3].data, "");  // field 10 received nothing
}

TEST(VpclLabelTest, GeometryInLabelUnits) {
  const LabelDrawing d = LayOutLabel(ReadVpclLabel(
      kGeneric, "{B,430,N,1|E,1,0,1,1,0,1|28,\"TRUGANINA\"|24,\"~20100093123450000000012\"|}"));
  EXPECT_EQ(d.height, 150);  // a 600-long format is 150 units tall
  EXPECT_EQ(d.width, 100);

  const auto texts = ItemsOf<LabelText>(d);
  // Constant captions and field 28 only: fields without batch data draw nothing.
  ASSERT_EQ(texts.size(), 5u);
  const LabelText& suburb = texts.back();
  EXPECT_EQ(suburb.text, "TRUGANINA");
  EXPECT_EQ(suburb.y, 6);  // row 577: 150 - 144.25 = 5.75 units below the top, rounded
  EXPECT_EQ(suburb.x, 1);  // column 5: 1.25
  EXPECT_EQ(suburb.width, 3);  // font 3: both factors tripled, bold
  EXPECT_EQ(suburb.height, 3);
  EXPECT_EQ(suburb.weight, 700);
  EXPECT_EQ(texts[0].text, "FROM:");  // font 1: width 2 x f1, height 2 x f2
  EXPECT_EQ(texts[0].width, 2);
  EXPECT_EQ(texts[0].height, 2);
  EXPECT_EQ(texts[3].text, "TO:");  // first factor 2: twice as wide
  EXPECT_EQ(texts[3].width, 4);

  const auto lines = ItemsOf<LabelLine>(d);
  ASSERT_EQ(lines.size(), 1u);
  EXPECT_EQ(lines[0].width, 2);  // thickness 6 gives a pen 2 units wide
  EXPECT_EQ(lines[0].y1, 16);    // row 547 lowered by 3: 150 - (136.75 - 3) = 16.25
  EXPECT_EQ(lines[0].x2, 98);

  const auto bars = ItemsOf<LabelBarcode>(d);
  ASSERT_EQ(bars.size(), 1u);  // barcodes 15 and 17 got no data
  EXPECT_EQ(bars[0].module, 0.5);
  EXPECT_EQ(bars[0].height, 34);
  EXPECT_EQ(bars[0].left, 10);
  EXPECT_DOUBLE_EQ(bars[0].bottom, 147.75);
  EXPECT_EQ(bars[0].top, 114);
  EXPECT_EQ(bars[0].data, "~20100093123450000000012");
}

TEST(VpclLabelTest, ThinLinesReversedTextAndOtherDensities) {
  const LabelDrawing d = LayOutLabel(ReadVpclLabel(
      "{F,9,A,R,E,600,400,\"X\"|L,S,10,2,10,390,2,\"11111111\"|L,S,10,2,10,390,4,\"11111111\"|"
      "C,580,300,0,3,2,2,W,L,0,3,\"SEPARATOR\"|B,1,8,V,100,40,8,8,100,8,L,0|B,2,8,V,100,40,8,6,"
      "100,8,L,0|Q,1,2,3,4,4,\"\"|}",
      "{B,9,N,1|E,1,0,1,1,0,1|1,\"A1\"|2,\"A2\"|}"));
  const auto lines = ItemsOf<LabelLine>(d);
  ASSERT_EQ(lines.size(), 2u);
  EXPECT_EQ(lines[0].width, 0);  // thickness 2: halves to even, the thinnest pen
  EXPECT_EQ(lines[1].width, 1);
  const auto texts = ItemsOf<LabelText>(d);
  ASSERT_EQ(texts.size(), 1u);
  EXPECT_TRUE(texts[0].reversed);
  const auto bars = ItemsOf<LabelBarcode>(d);
  ASSERT_EQ(bars.size(), 2u);
  EXPECT_EQ(bars[0].module, 0.3);
  EXPECT_EQ(bars[1].module, 0.4);
}

TEST(VpclLabelTest, MalformedStreamsNeverFail) {
  for (std::string_view format :
       {"", "{", "}", "|||", "{F", "{F,1,A,R,E,x,y,\"", "T,1|B,1|L|C", "{F,1,A,R,E,1e308,-1e308,\"n\"|L,S,1e999,nan,inf,,,|}",
        "C,\"unterminated|T,5,50,V"}) {
    for (std::string_view batch : {"", "{B|E|5,\"x\"|}", "|5|\"\"|,,,,", "5,\"a|b\"|"}) {
      const LabelDrawing d = LayOutLabel(ReadVpclLabel(format, batch));
      EXPECT_LE(d.items.size(), 8u);
    }
  }
  // A quoted "|" stays inside its field.
  const VpclLabel label = ReadVpclLabel("{F,1,A,R,E,600,400,\"n\"|T,5,50,V,1,1,0,1,1,1,O,L,0,0,0|}",
                                        "{B,1,N,1|E,1|5,\"a|b\"|}");
  ASSERT_EQ(label.elements.size(), 1u);
  EXPECT_EQ(label.elements[0].data, "a|b");
}

}  // namespace
}  // namespace quendal
