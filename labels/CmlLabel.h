// The store label for CML stores through CML's distribution centre, as
// each carrier that delivers there stores it under its own format name
// and number: 600 x 400, between the common top and bottom TO the
// distribution centre on the left and FOR the store on the right with its
// number large; the SSCC, order and zone block.
#pragma once

#include "labels/StoreLabel.h"

namespace quendal {

namespace cml {
using namespace vpcl;
inline constexpr std::array<Packet, 22> kMiddle = {
    Text{530, 5, 1, 2, 2, 'O', 'L', 0, "TO:"},
    Field{7, 7, 530, 40, 1, 1, 2, 'B', 'L'},
    Field{8, 4, 515, 110, 3, 1, 2, 'B', 'L'},
    Field{9, 30, 503, 5, 1, 1, 1, 'O', 'L'},
    Field{10, 4, 491, 5, 1, 1, 1, 'O', 'L'},
    Text{530, 200, 1, 2, 2, 'O', 'L', 0, "FOR:"},
    Field{11, 15, 530, 240, 1, 1, 2, 'B', 'L'},
    Field{12, 4, 515, 330, 3, 1, 2, 'B', 'L'},
    Field{13, 15, 503, 200, 1, 1, 1, 'O', 'L'},
    Field{14, 4, 491, 200, 1, 1, 1, 'O', 'L'},
    Line{485, 2, 485, 398, 2},
    Text{470, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{15, 22, 470, 40, 1, 2, 1, 'B', 'L'},
    Text{455, 5, 1, 1, 1, 'O', 'L', 0, "PO:"},
    Field{16, 25, 455, 40, 1, 1, 1, 'B', 'L'},
    Field{17, 4, 445, 340, 3, 1, 2, 'W', 'L'},
    Text{440, 200, 1, 1, 1, 'O', 'L', 0, "STORE ZONE/DEPT"},
    Field{18, 15, 425, 200, 1, 1, 1, 'B', 'L'},
    Field{19, 30, 405, 200, 1, 1, 2, 'B', 'L'},
    Field{20, 4, 400, 5, 3, 2, 2, 'B', 'L'},
    Field{21, 4, 400, 80, 3, 2, 2, 'B', 'L'},
    Line{390, 2, 390, 398, 2},
};
}  // namespace cml

inline constexpr auto kCmlPackets = StoreLabelFormat(cml::kMiddle);
// The distribution centre's code to 7 characters, the store's name to 15.
inline constexpr StoreLabelCuts kCmlCuts{7, 15};

}  // namespace quendal
