#include "labels/cMayneCMLSCM.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400 between the common top and bottom: TO the distribution centre
// on the left and FOR the store on the right with its number large; the
// SSCC, order and zone block.
constexpr std::array<Packet, 22> kMiddle = {
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
constexpr auto kPackets = StoreLabelFormat(kMiddle);

const LabelLayout kLayout{"10", vpcl::Format{"CMLDC", 600, 400, kPackets}, kStoreLabelBatch, kStoreLabelZpl};

}  // namespace

clsMayneCMLSCM::clsMayneCMLSCM() : StoreLabelPrinter("clsMayneCMLSCM", kLayout, {7, 15}) {}

std::unique_ptr<Component> MakeMayneCMLSCM() { return std::make_unique<clsMayneCMLSCM>(); }

}  // namespace quendal
