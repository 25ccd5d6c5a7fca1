// Mayne carton label for CML stores through CML's distribution centre, on
// the long narrow label stock: format "CMLDC" (14), 800 x 300, with the
// same fields as the 600 x 400 store label.
#include "labels/CmlLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// 800 x 300, one block under the other: sender, carrier and consignment;
// TO the distribution centre with its number; FOR the store with its number
// large; SSCC, order and zones; the (421)(90) barcode, the dates and the
// SSCC barcode. The barcodes use a narrower module than on the wider
// labels, so that each fits the 3-inch width with its quiet zones.
constexpr auto kPackets = std::to_array<Packet>({
    Text{785, 5, 1, 1, 1, 'O', 'L', 0, "FROM:"},
    Field{1, 25, 785, 45, 1, 1, 1, 'O', 'L'},
    Field{2, 25, 773, 45, 1, 1, 1, 'O', 'L'},
    Field{3, 3, 773, 170, 1, 1, 1, 'O', 'L'},
    Text{757, 5, 1, 1, 1, 'O', 'L', 0, "CARRIER:"},
    Field{4, 15, 757, 70, 1, 1, 1, 'B', 'L'},
    Text{745, 5, 1, 1, 1, 'O', 'L', 0, "CON NO:"},
    Field{5, 12, 745, 70, 1, 1, 1, 'B', 'L'},
    Text{733, 5, 1, 1, 1, 'O', 'L', 0, "B/L NO:"},
    Field{6, 12, 733, 70, 1, 1, 1, 'B', 'L'},
    Line{725, 2, 725, 298, 4},
    Text{695, 5, 1, 2, 2, 'O', 'L', 0, "TO:"},
    Field{7, 7, 695, 45, 1, 1, 2, 'B', 'L'},
    Field{8, 4, 680, 200, 3, 1, 2, 'B', 'L'},
    Field{9, 30, 668, 5, 1, 1, 1, 'O', 'L'},
    Field{10, 4, 656, 5, 1, 1, 1, 'O', 'L'},
    Line{650, 2, 650, 298, 2},
    Text{622, 5, 1, 2, 2, 'O', 'L', 0, "FOR:"},
    Field{11, 15, 622, 50, 1, 1, 2, 'B', 'L'},
    Field{12, 4, 590, 180, 3, 2, 3, 'B', 'L'},
    Field{13, 15, 600, 5, 1, 1, 1, 'O', 'L'},
    Field{14, 4, 588, 5, 1, 1, 1, 'O', 'L'},
    Line{580, 2, 580, 298, 2},
    Text{562, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{15, 22, 562, 40, 1, 1, 2, 'B', 'L'},
    Text{544, 5, 1, 1, 1, 'O', 'L', 0, "PO:"},
    Field{16, 25, 544, 40, 1, 1, 1, 'B', 'L'},
    Field{17, 4, 508, 230, 3, 1, 2, 'W', 'L'},
    Text{528, 5, 1, 1, 1, 'O', 'L', 0, "STORE ZONE/DEPT"},
    Field{18, 15, 514, 5, 1, 1, 1, 'B', 'L'},
    Field{19, 30, 494, 5, 1, 1, 2, 'B', 'L'},
    Field{20, 4, 452, 5, 3, 2, 2, 'B', 'L'},
    Field{21, 4, 452, 120, 3, 2, 2, 'B', 'L'},
    Line{442, 2, 442, 298, 2},
    Barcode{22, 30, 'V', 305, 30, 6, 120},
    Field{23, 40, 288, 40, 1, 1, 1, 'B', 'L'},
    Field{24, 30, 268, 5, 1, 1, 1, 'B', 'L'},
    Field{25, 30, 256, 5, 1, 1, 1, 'B', 'L'},
    Field{26, 30, 244, 5, 1, 1, 1, 'B', 'L'},
    Field{27, 30, 268, 160, 1, 1, 1, 'B', 'L'},
    Field{28, 30, 256, 160, 1, 1, 1, 'B', 'L'},
    Field{29, 30, 244, 160, 1, 1, 1, 'B', 'L'},
    Barcode{30, 21, 'V', 60, 30, 6, 160},
    Field{31, 22, 38, 40, 1, 1, 2, 'B', 'L'},
});

constexpr LabelLayout kLayout{"14", vpcl::Format{"CMLDC", 800, 300, kPackets}, kStoreLabelBatch};

}  // namespace

class clsMayneCMLSCMLSCP final : public StoreLabelPrinter {
 public:
  clsMayneCMLSCMLSCP() : StoreLabelPrinter("clsMayneCMLSCMLSCP", kLayout, kCmlCuts) {}
};

std::unique_ptr<Component> MakeMayneCMLSCMLSCP() { return std::make_unique<clsMayneCMLSCMLSCP>(); }

}  // namespace quendal
