#include "labels/cDFESCMsscc.h"

#include <array>

#include "labels/GenericLabel.h"
#include "labels/Gs1.h"

namespace quendal {

namespace {

using namespace vpcl;

// Every DFE SSCC label goes to an Australian address.
constexpr std::string_view kAustralia = "036";

// 600 x 400: destination and consignment large at the top, sender and
// carrier, the receiver, order references and dates, the SSCC's line, the
// ship-to barcode and the SSCC barcode at the bottom.
constexpr std::array<Packet, 3> kTop = {
    Field{28, 34, 577, 5, 3, 1, 1, 'B', 'L'},
    Field{34, 20, 557, 5, 3, 1, 1, 'B', 'L'},
    Field{29, 20, 557, 250, 1, 2, 1, 'B', 'L'},
};
constexpr std::array<Packet, 25> kBelow = {
    Field{30, 40, 508, 230, 1, 1, 1, 'B', 'L'},
    Field{5, 13, 485, 230, 1, 2, 1, 'B', 'L'},
    Line{476, 2, 476, 398, 2},
    Text{463, 5, 1, 2, 1, 'O', 'L', 0, "TO:"},
    Field{6, 40, 449, 5, 1, 2, 1, 'B', 'L'},
    Field{11, 40, 435, 5, 1, 2, 1, 'B', 'L'},
    Field{7, 40, 421, 5, 1, 2, 1, 'B', 'L'},
    Field{8, 50, 407, 5, 1, 2, 1, 'B', 'L'},
    Line{395, 2, 395, 398, 2},
    Field{20, 25, 380, 5, 1, 2, 1, 'B', 'L'},
    Field{21, 25, 362, 5, 1, 2, 1, 'B', 'L'},
    Field{31, 30, 380, 250, 1, 1, 1, 'O', 'L'},
    Field{32, 30, 368, 250, 1, 1, 1, 'O', 'L'},
    Field{33, 30, 356, 250, 1, 1, 1, 'O', 'L'},
    Field{26, 30, 340, 5, 1, 1, 1, 'B', 'L'},
    Field{27, 30, 328, 5, 1, 1, 1, 'B', 'L'},
    Line{318, 2, 318, 398, 2},
    Text{300, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{19, 30, 300, 40, 1, 2, 1, 'B', 'L'},
    Barcode{17, 27, 'V', 200, 40, 4, 80},
    Field{18, 30, 185, 60, 1, 1, 1, 'B', 'L'},
    Barcode{24, 21, 'V', 40, 40, 4, 125},
    Field{25, 30, 22, 60, 1, 1, 1, 'B', 'L'},
    Text{185, 250, 1, 1, 1, 'O', 'L', 0, "SHIP TO"},
    Line{175, 2, 175, 398, 2},
};
constexpr auto kPackets = Join(kTop, generic::SenderBlock(532), kBelow);

using V = const LabelValues&;
constexpr std::array<BatchField, 2> kShipToFields = {{
    {17, [](V v) { return gs1::ShipToData(kAustralia, v.ToPostcode); }},
    {18, [](V v) { return gs1::ShipToText(kAustralia, v.ToPostcode); }},
}};
constexpr auto kBatch = Join(generic::kAddressFields, kShipToFields, generic::kSsccFields,
                             generic::kOrderFields, generic::kTailFields);

constexpr LabelLayout kLayout{"482", vpcl::Format{"DFESSCC", 600, 400, kPackets}, kBatch};

}  // namespace

clsDFESCMsscc::clsDFESCMsscc() : PrintFileLabelPrinter("clsDFESCMsscc", kLayout) {}

std::unique_ptr<Component> MakeDFESCMsscc() { return std::make_unique<clsDFESCMsscc>(); }

}  // namespace quendal
