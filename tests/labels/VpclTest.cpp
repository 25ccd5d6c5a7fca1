#include "labels/Vpcl.h"

#include <gtest/gtest.h>

#include <array>

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

}  // namespace
}  // namespace quendal::vpcl
