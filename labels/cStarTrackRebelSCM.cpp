// StarTrack carton label for Rebel stores through Rebel's distribution
// centre: format "RebelDC" (60), the SSCC (00) and ship-to (421)(90)
// barcodes; a format and batch handed over as text print too (PrintFile).
#include "labels/StoreLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400 between the common top and bottom: the store's number large on
// the left with its name beside it; the distribution centre; the SSCC,
// order, zone and store zone/department block.
constexpr auto kMiddle = std::to_array<Packet>({
    Text{538, 5, 1, 1, 1, 'O', 'L', 0, "STORE"},
    Field{12, 4, 480, 5, 3, 2, 3, 'B', 'L'},
    Field{11, 15, 525, 120, 1, 2, 2, 'B', 'L'},
    Field{13, 15, 505, 120, 1, 1, 1, 'O', 'L'},
    Field{14, 4, 493, 120, 1, 1, 1, 'O', 'L'},
    Field{17, 4, 480, 330, 3, 1, 2, 'W', 'L'},
    Line{472, 2, 472, 398, 2},
    Text{457, 5, 1, 1, 1, 'O', 'L', 0, "VIA:"},
    Field{7, 7, 457, 40, 1, 1, 1, 'B', 'L'},
    Field{8, 4, 457, 90, 1, 1, 1, 'B', 'L'},
    Field{9, 30, 445, 40, 1, 1, 1, 'O', 'L'},
    Field{10, 4, 445, 200, 1, 1, 1, 'O', 'L'},
    Line{437, 2, 437, 398, 2},
    Text{420, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{15, 22, 420, 40, 1, 1, 2, 'B', 'L'},
    Text{400, 5, 1, 1, 1, 'O', 'L', 0, "PO:"},
    Field{16, 25, 400, 40, 1, 1, 2, 'B', 'L'},
    Field{18, 15, 378, 5, 1, 1, 1, 'B', 'L'},
    Field{19, 30, 366, 5, 1, 1, 1, 'B', 'L'},
    Text{424, 260, 1, 1, 1, 'O', 'L', 0, "ZONE"},
    Field{20, 4, 374, 260, 3, 1, 2, 'B', 'L'},
    Field{21, 4, 374, 320, 3, 1, 2, 'B', 'L'},
    Line{358, 2, 358, 398, 2},
});
constexpr auto kPackets = StoreLabelFormat(kMiddle);

constexpr LabelLayout kLayout{"60", vpcl::Format{"RebelDC", 600, 400, kPackets}, kStoreLabelBatch};

}  // namespace

class clsStarTrackRebelSCM final : public StoreLabel<PrintFileLabelPrinter> {
 public:
  clsStarTrackRebelSCM() : StoreLabel("clsStarTrackRebelSCM", kLayout, {7, 15}) {}
};

std::unique_ptr<Component> MakeStarTrackRebelSCM() { return std::make_unique<clsStarTrackRebelSCM>(); }

}  // namespace quendal
