// StarTrack carton label for HS stores through HS's distribution centre:
// format "HSDC" (640), the SSCC (00) and ship-to (421)(90) barcodes; a
// format and batch handed over as text print too (PrintFile).
#include "labels/StoreLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400 between the common top and bottom: the distribution centre on
// the left, the store on the right with its number large; the SSCC and
// order, the store zone/department and the despatch's zones.
constexpr auto kMiddle = std::to_array<Packet>({
    Text{535, 5, 1, 1, 1, 'O', 'L', 0, "TO DC:"},
    Field{7, 7, 518, 5, 1, 1, 2, 'B', 'L'},
    Field{8, 4, 518, 100, 1, 1, 2, 'B', 'L'},
    Field{9, 30, 503, 5, 1, 1, 1, 'O', 'L'},
    Field{10, 4, 491, 5, 1, 1, 1, 'O', 'L'},
    Text{535, 200, 1, 1, 1, 'O', 'L', 0, "FOR STORE:"},
    Field{12, 4, 503, 200, 3, 2, 2, 'B', 'L'},
    Field{17, 4, 503, 320, 3, 1, 2, 'W', 'L'},
    Field{11, 15, 491, 200, 1, 1, 1, 'B', 'L'},
    Field{13, 15, 479, 200, 1, 1, 1, 'O', 'L'},
    Field{14, 4, 467, 200, 1, 1, 1, 'O', 'L'},
    Line{460, 2, 460, 398, 2},
    Text{438, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{15, 22, 438, 40, 1, 1, 2, 'B', 'L'},
    Text{416, 5, 1, 1, 1, 'O', 'L', 0, "PO:"},
    Field{16, 25, 416, 40, 1, 1, 2, 'B', 'L'},
    Text{442, 250, 1, 1, 1, 'O', 'L', 0, "STORE ZONE/DEPT"},
    Field{19, 30, 428, 250, 1, 1, 1, 'B', 'L'},
    Field{18, 15, 416, 250, 1, 1, 1, 'B', 'L'},
    Field{20, 4, 370, 5, 3, 2, 2, 'B', 'L'},
    Field{21, 4, 370, 120, 3, 2, 2, 'B', 'L'},
    Line{362, 2, 362, 398, 2},
});
constexpr auto kPackets = StoreLabelFormat(kMiddle);

constexpr LabelLayout kLayout{"640", vpcl::Format{"HSDC", 600, 400, kPackets}, kStoreLabelBatch};

}  // namespace

class clsStarTrackHSSCM final : public StoreLabel<PrintFileLabelPrinter> {
 public:
  clsStarTrackHSSCM() : StoreLabel("clsStarTrackHSSCM", kLayout, {7, 15}) {}
};

std::unique_ptr<Component> MakeStarTrackHSSCM() { return std::make_unique<clsStarTrackHSSCM>(); }

}  // namespace quendal
