#include "labels/Vpcl.h"

#include <gtest/gtest.h>

#include <array>
#include <string>

namespace quendal::vpcl {
namespace {

TEST(VpclTest, EveryPacketKind) {
  constexpr std::array<Packet, 4> packets = {
      Box{175, 351, 591, 385, 4, "11111111"},
      Barcode{1, 8, 'F', 35, 179, 6, 100},
      FixedData{1, "0123"},
      Graphic{99, 532, 241},
  };
  EXPECT_EQ(RenderFormat("460", Format{"AAE", 2000, 1016, packets, 'M'}),
            "{F,460,A,R,M,2000,1016,\"AAE\"|Q,175,351,591,385,4,\"11111111\"|"
            "B,1,8,F,35,179,8,6,100,8,L,0|R,1,\"0123\"|G,99,532,241,0,0|}");
}

TEST(VpclTest, HeaderTextsAreMadeSafeLikeFieldData) {
  EXPECT_EQ(std::move(Batch("4|3", 1, "1\"}")).Finish(), "{B,43,N,1|E,1,0,1,1,0,1|}");
  EXPECT_EQ(FieldData("~201421036\x7F"), "~201421036 ");
}

// Plain text is scanned a word at a time: a character needing treatment
// is found at every position of a word, and bytes of other characters
// (UTF-8, DEL's neighbours) are kept.
TEST(VpclTest, FieldDataTreatsEveryPositionOfLongTexts) {
  const std::string plain = "ABCDEFGHIJKLMNOPQRSTUVWX";  // three words
  for (std::size_t at = 0; at < plain.size(); ++at) {
    for (const char c : {'"', '|', '{', '}', '\x7F', '\n', '\0', '\x1F'}) {
      std::string text = plain;
      text[at] = c;
      std::string expected = plain;
      if (c == '\x7F' || static_cast<unsigned char>(c) < 0x20) expected[at] = ' ';
      else expected.erase(at, 1);
      EXPECT_EQ(FieldData(text), expected) << at << " " << static_cast<int>(c);
    }
  }
  const std::string kept = "Caf\xC3\xA9 ~ ! ` \x80\xFE\x7E\x20 Z";
  EXPECT_EQ(FieldData(kept), kept);
  std::string batch = std::move(Batch("430", 1, "1").Field(8, "CHADSTONE VIC \"3148\"")).Finish();
  EXPECT_EQ(batch, "{B,430,N,1|E,1,0,1,1,0,1|8,\"CHADSTONE VIC 3148\"|}");
}

}  // namespace
}  // namespace quendal::vpcl
