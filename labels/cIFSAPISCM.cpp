#include "labels/cIFSAPISCM.h"

#include <array>

#include "labels/GenericLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400: destination, service and consignment at the top, sender and
// carrier, the receiver, order references and dates, then the SSCC large
// with its barcode filling the bottom.
constexpr std::array<Packet, 3> kTop = {
    Field{28, 34, 577, 5, 3, 1, 1, 'B', 'L'},
    Field{29, 20, 557, 5, 1, 2, 1, 'B', 'L'},
    Field{34, 20, 557, 200, 1, 2, 1, 'B', 'L'},
};
constexpr std::array<Packet, 22> kBelow = {
    Text{508, 230, 1, 1, 1, 'O', 'L', 0, "CONNOTE:"},
    Field{5, 13, 508, 285, 1, 1, 1, 'B', 'L'},
    Line{498, 2, 498, 398, 2},
    Text{485, 5, 1, 1, 1, 'O', 'L', 0, "TO:"},
    Field{6, 40, 468, 5, 2, 1, 1, 'B', 'L'},
    Field{11, 40, 451, 5, 2, 1, 1, 'B', 'L'},
    Field{7, 40, 434, 5, 2, 1, 1, 'B', 'L'},
    Field{8, 50, 417, 5, 2, 1, 1, 'B', 'L'},
    Line{405, 2, 405, 398, 2},
    Field{20, 25, 390, 5, 1, 1, 1, 'B', 'L'},
    Field{21, 25, 378, 5, 1, 1, 1, 'B', 'L'},
    Field{26, 30, 366, 5, 1, 1, 1, 'B', 'L'},
    Field{27, 30, 354, 5, 1, 1, 1, 'B', 'L'},
    Field{30, 40, 390, 230, 1, 1, 1, 'B', 'L'},
    Field{31, 30, 378, 230, 1, 1, 1, 'O', 'L'},
    Field{32, 30, 366, 230, 1, 1, 1, 'O', 'L'},
    Field{33, 30, 354, 230, 1, 1, 1, 'O', 'L'},
    Line{343, 2, 343, 398, 2},
    Text{325, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{19, 30, 325, 40, 1, 2, 1, 'B', 'L'},
    Barcode{24, 21, 'V', 45, 40, 4, 250},
    Field{25, 30, 25, 60, 1, 1, 1, 'B', 'L'},
};
constexpr auto kPackets = Join(kTop, generic::SenderBlock(532), kBelow);

constexpr auto kBatch = Join(generic::kAddressFields, generic::kSsccFields, generic::kOrderFields,
                             generic::kTailFields);

constexpr LabelLayout kLayout{"750", vpcl::Format{"IFSAPI", 600, 400, kPackets}, kBatch};

}  // namespace

clsIFSAPISCM::clsIFSAPISCM() : LabelPrinter("clsIFSAPISCM", kLayout) {}

std::unique_ptr<Component> MakeIFSAPISCM() { return std::make_unique<clsIFSAPISCM>(); }

}  // namespace quendal
