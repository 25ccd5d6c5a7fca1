#include "labels/cIFSDJsSCM.h"

#include <array>

#include "frame/VB.h"
#include "frame/host/Read.h"
#include "labels/GenericLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400: the store's number large in a box at the top right beside the
// destination, then sender and carrier, the receiver, order references and
// dates, the store zone, and the SSCC barcode at the bottom.
constexpr std::array<Packet, 5> kTop = {
    Text{585, 5, 1, 1, 1, 'O', 'L', 0, "DAVID JONES STORE"},
    Field{28, 34, 560, 5, 3, 1, 1, 'B', 'L'},
    Field{34, 20, 540, 5, 1, 2, 1, 'B', 'L'},
    Box{535, 270, 595, 395, 4, "11111111"},
    Field{9, 4, 545, 280, 3, 2, 2, 'B', 'L'},
};
constexpr std::array<Packet, 23> kBelow = {
    Text{491, 230, 1, 1, 1, 'O', 'L', 0, "CONNOTE:"},
    Field{5, 13, 491, 285, 1, 1, 1, 'B', 'L'},
    Line{481, 2, 481, 398, 2},
    Text{468, 5, 1, 1, 1, 'O', 'L', 0, "TO:"},
    Field{6, 40, 451, 5, 2, 1, 1, 'B', 'L'},
    Field{11, 40, 434, 5, 2, 1, 1, 'B', 'L'},
    Field{7, 40, 417, 5, 2, 1, 1, 'B', 'L'},
    Field{8, 50, 400, 5, 2, 1, 1, 'B', 'L'},
    Line{388, 2, 388, 398, 2},
    Field{20, 25, 373, 5, 1, 2, 1, 'B', 'L'},
    Field{21, 25, 355, 5, 1, 2, 1, 'B', 'L'},
    Field{31, 30, 373, 250, 1, 1, 1, 'O', 'L'},
    Field{32, 30, 361, 250, 1, 1, 1, 'O', 'L'},
    Field{33, 30, 349, 250, 1, 1, 1, 'O', 'L'},
    Text{335, 5, 1, 1, 1, 'O', 'L', 0, "STORE ZONE/DEPT"},
    Field{35, 30, 335, 100, 1, 2, 1, 'B', 'L'},
    Field{26, 30, 320, 5, 1, 1, 1, 'B', 'L'},
    Field{27, 30, 308, 5, 1, 1, 1, 'B', 'L'},
    Line{298, 2, 298, 398, 2},
    Text{280, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{19, 30, 280, 40, 1, 2, 1, 'B', 'L'},
    Barcode{24, 21, 'V', 45, 40, 4, 200},
    Field{25, 30, 25, 60, 1, 1, 1, 'B', 'L'},
};
constexpr auto kPackets = Join(kTop, generic::SenderBlock(515), kBelow);

constexpr std::array<BatchField, 2> kStoreFields = {{
    {9, &LabelValues::StoreText},
    {35, &LabelValues::StoreZoneDept},
}};

constexpr auto kBatch = Join(generic::kAddressFields, kStoreFields, generic::kSsccFields,
                             generic::kOrderFields, generic::kTailFields);

constexpr LabelLayout kLayout{"20", vpcl::Format{"IFSDJS", 600, 400, kPackets}, kBatch};

}  // namespace

clsIFSDJsSCM::clsIFSDJsSCM() : PackListLabelPrinter("clsIFSDJsSCM", kLayout) {}

std::unique_ptr<Component> MakeIFSDJsSCM() { return std::make_unique<clsIFSDJsSCM>(); }

bool clsIFSDJsSCM::FillValues(Procedure& proc) {
  return LabelPrinter::FillValues(proc) && proc([&] {
           values_.StoreText =
               quendal::Format(host::Read(pack_->ShipTo(), &host::Receiver::StoreCode), "0000");
         });
}

}  // namespace quendal
