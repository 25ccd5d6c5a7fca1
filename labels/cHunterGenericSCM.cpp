#include "labels/cHunterGenericSCM.h"

#include <array>

#include "labels/GenericLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400: the destination and the consignment in the top block, the
// carrier and service beside the consignment, the receiver under "TO:",
// the sender, order and dates, and the postcode and state large at the
// bottom for sorting by hand.
constexpr std::array<Packet, 35> kPackets = {
    Field{28, 34, 560, 5, 3, 1, 2, 'B', 'L'},
    Field{34, 20, 537, 5, 3, 1, 1, 'B', 'L'},
    Line{528, 2, 528, 398, 6},
    Text{513, 5, 1, 1, 1, 'O', 'L', 0, "CONNOTE:"},
    Field{5, 13, 490, 5, 3, 1, 1, 'B', 'L'},
    Text{513, 220, 1, 1, 1, 'O', 'L', 0, "CARRIER:"},
    Field{4, 20, 501, 220, 1, 1, 1, 'B', 'L'},
    Field{30, 40, 489, 220, 1, 1, 1, 'B', 'L'},
    Line{478, 2, 478, 398, 2},
    Text{463, 5, 1, 2, 1, 'O', 'L', 0, "TO:"},
    Field{6, 40, 441, 5, 1, 2, 1, 'B', 'L'},
    Field{11, 40, 423, 5, 1, 2, 1, 'B', 'L'},
    Field{7, 40, 405, 5, 1, 2, 1, 'B', 'L'},
    Field{8, 50, 387, 5, 1, 2, 1, 'B', 'L'},
    Line{375, 2, 375, 398, 2},
    Text{360, 5, 1, 1, 1, 'O', 'L', 0, "FROM:"},
    Field{1, 25, 360, 48, 1, 1, 1, 'O', 'L'},
    Field{10, 25, 348, 5, 1, 1, 1, 'O', 'L'},
    Field{2, 25, 336, 5, 1, 1, 1, 'O', 'L'},
    Field{3, 3, 336, 150, 1, 1, 1, 'O', 'L'},
    Field{20, 25, 360, 220, 1, 1, 1, 'B', 'L'},
    Field{21, 25, 348, 220, 1, 1, 1, 'B', 'L'},
    Line{325, 2, 325, 398, 2},
    Field{31, 30, 310, 5, 1, 1, 1, 'O', 'L'},
    Field{32, 30, 298, 5, 1, 1, 1, 'O', 'L'},
    Field{33, 30, 286, 5, 1, 1, 1, 'O', 'L'},
    Field{26, 30, 310, 200, 1, 1, 1, 'B', 'L'},
    Field{27, 30, 298, 200, 1, 1, 1, 'B', 'L'},
    Line{275, 2, 275, 398, 2},
    Text{260, 5, 1, 1, 1, 'O', 'L', 0, "POSTCODE"},
    Field{12, 4, 150, 5, 3, 4, 5, 'B', 'L'},
    Text{260, 250, 1, 1, 1, 'O', 'L', 0, "STATE"},
    Field{13, 3, 150, 250, 3, 3, 5, 'B', 'L'},
    Line{130, 2, 130, 398, 2},
    Field{29, 20, 105, 5, 3, 1, 1, 'B', 'L'},
};

constexpr auto kBatch = Join(generic::kAddressFields, generic::kPostcodeFields,
                             generic::kOrderFields, generic::kTailFields);

constexpr LabelLayout kLayout{"530", vpcl::Format{"1HUNTER", 600, 400, kPackets}, kBatch};

}  // namespace

clsHunterGenericSCM::clsHunterGenericSCM() : LabelPrinter("clsHunterGenericSCM", kLayout) {}

std::unique_ptr<Component> MakeHunterGenericSCM() {
  return std::make_unique<clsHunterGenericSCM>();
}

}  // namespace quendal
