#include "labels/cTollMYERSCM.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400 between the common top and bottom: the store the goods are
// for first, its number large, then TO the distribution centre; the SSCC,
// order and zone block.
constexpr std::array<Packet, 23> kMiddle = {
    Text{530, 5, 1, 2, 2, 'O', 'L', 0, "FOR:"},
    Field{12, 4, 515, 60, 3, 2, 2, 'B', 'L'},
    Field{11, 30, 530, 170, 1, 1, 2, 'B', 'L'},
    Field{13, 15, 515, 170, 1, 1, 1, 'O', 'L'},
    Field{14, 4, 503, 170, 1, 1, 1, 'O', 'L'},
    Line{495, 2, 495, 398, 2},
    Text{472, 5, 1, 2, 2, 'O', 'L', 0, "TO:"},
    Field{7, 10, 472, 40, 1, 1, 2, 'B', 'L'},
    Field{8, 4, 472, 100, 3, 1, 1, 'B', 'L'},
    Field{9, 30, 472, 170, 1, 1, 1, 'O', 'L'},
    Field{10, 4, 460, 170, 1, 1, 1, 'O', 'L'},
    Line{452, 2, 452, 398, 2},
    Text{437, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{15, 22, 437, 40, 1, 2, 1, 'B', 'L'},
    Text{425, 5, 1, 1, 1, 'O', 'L', 0, "PO:"},
    Field{16, 25, 425, 40, 1, 1, 1, 'B', 'L'},
    Field{17, 4, 412, 330, 3, 1, 2, 'W', 'L'},
    Text{410, 5, 1, 1, 1, 'O', 'L', 0, "STORE ZONE/DEPT"},
    Field{20, 4, 370, 5, 3, 2, 2, 'B', 'L'},
    Field{21, 4, 370, 80, 3, 2, 2, 'B', 'L'},
    Field{18, 15, 395, 200, 1, 1, 1, 'B', 'L'},
    Field{19, 30, 372, 200, 1, 1, 2, 'B', 'L'},
    Line{362, 2, 362, 398, 2},
};
constexpr auto kPackets = StoreLabelFormat(kMiddle);

const LabelLayout kLayout{"650", vpcl::Format{"MYERDC", 600, 400, kPackets}, kStoreLabelBatch, kStoreLabelZpl};

}  // namespace

clsTollMYERSCM::clsTollMYERSCM() : StoreLabelPrinter("clsTollMYERSCM", kLayout, {10, 30}) {}

std::unique_ptr<Component> MakeTollMYERSCM() { return std::make_unique<clsTollMYERSCM>(); }

}  // namespace quendal
