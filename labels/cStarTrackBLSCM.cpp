// StarTrack carton label for BL stores through BL's distribution centre:
// format "STBLDC" (117), the SSCC (00) and ship-to (421)(90) barcodes.
#include "labels/StoreLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400 between the common top and bottom: the store first, its number
// large on the right; the distribution centre it goes through; the SSCC,
// order, department and zone block.
constexpr auto kMiddle = std::to_array<Packet>({
    Text{530, 5, 1, 2, 2, 'O', 'L', 0, "STORE:"},
    Field{11, 30, 530, 70, 1, 1, 2, 'B', 'L'},
    Field{13, 15, 510, 70, 1, 1, 1, 'O', 'L'},
    Field{14, 4, 498, 70, 1, 1, 1, 'O', 'L'},
    Field{12, 4, 478, 290, 3, 2, 3, 'B', 'L'},
    Field{17, 4, 478, 215, 3, 1, 2, 'W', 'L'},
    Line{470, 2, 470, 398, 2},
    Text{455, 5, 1, 1, 1, 'O', 'L', 0, "VIA DC:"},
    Field{7, 10, 455, 50, 1, 1, 1, 'B', 'L'},
    Field{8, 4, 455, 110, 1, 1, 1, 'B', 'L'},
    Field{9, 30, 443, 50, 1, 1, 1, 'O', 'L'},
    Field{10, 4, 443, 200, 1, 1, 1, 'O', 'L'},
    Line{435, 2, 435, 398, 2},
    Text{418, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{15, 22, 418, 40, 1, 1, 2, 'B', 'L'},
    Text{398, 5, 1, 1, 1, 'O', 'L', 0, "PO:"},
    Field{16, 25, 398, 40, 1, 1, 2, 'B', 'L'},
    Field{18, 15, 378, 5, 1, 1, 1, 'B', 'L'},
    Field{19, 30, 366, 5, 1, 1, 1, 'B', 'L'},
    Text{424, 250, 1, 1, 1, 'O', 'L', 0, "DEPT"},
    Field{20, 4, 374, 250, 3, 1, 2, 'B', 'L'},
    Field{21, 4, 374, 310, 3, 1, 2, 'B', 'L'},
    Line{358, 2, 358, 398, 2},
});
constexpr auto kPackets = StoreLabelFormat(kMiddle);

constexpr LabelLayout kLayout{"117", vpcl::Format{"STBLDC", 600, 400, kPackets}, kStoreLabelBatch};

}  // namespace

class clsStarTrackBLSCM final : public StoreLabelPrinter {
 public:
  clsStarTrackBLSCM() : StoreLabelPrinter("clsStarTrackBLSCM", kLayout, {10, 30}) {}
};

std::unique_ptr<Component> MakeStarTrackBLSCM() { return std::make_unique<clsStarTrackBLSCM>(); }

}  // namespace quendal
