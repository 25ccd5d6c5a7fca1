// Mayne carton label for any retailer: format "MayneGen" (380), the SSCC
// (00) and the store's number (90) barcodes.
#include "labels/Elements.h"
#include "labels/StoreLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400: sender and carrier at the top; the delivery address under
// "DELIVER TO:" with the store's number large on the right; order, user
// texts and dates; the store barcode with the postcode and service level
// beside it, above the SSCC barcode.
constexpr auto kPackets = std::to_array<Packet>({
    Text{583, 5, 1, 1, 1, 'O', 'L', 0, "FROM:"},
    Field{1, 25, 583, 45, 1, 1, 1, 'O', 'L'},
    Field{2, 25, 571, 45, 1, 1, 1, 'O', 'L'},
    Field{3, 25, 559, 45, 1, 1, 1, 'O', 'L'},
    Field{4, 3, 559, 170, 1, 1, 1, 'O', 'L'},
    Text{583, 215, 1, 1, 1, 'O', 'L', 0, "CARRIER:"},
    Field{5, 20, 583, 275, 1, 1, 1, 'B', 'L'},
    Text{571, 215, 1, 1, 1, 'O', 'L', 0, "CON NOTE:"},
    Field{6, 13, 571, 275, 1, 1, 1, 'B', 'L'},
    Field{7, 30, 559, 215, 1, 1, 1, 'O', 'L'},
    Line{550, 2, 550, 398, 4},
    Text{530, 5, 1, 1, 1, 'O', 'L', 0, "DELIVER TO:"},
    Field{8, 40, 512, 5, 1, 1, 2, 'B', 'L'},
    Field{9, 40, 492, 5, 1, 1, 2, 'O', 'L'},
    Field{10, 40, 472, 5, 1, 1, 2, 'O', 'L'},
    Field{11, 45, 452, 5, 1, 1, 2, 'B', 'L'},
    Text{530, 290, 1, 1, 1, 'O', 'L', 0, "STORE"},
    Field{12, 4, 472, 290, 3, 2, 3, 'B', 'L'},
    Line{442, 2, 442, 398, 2},
    Field{13, 25, 418, 5, 1, 1, 2, 'B', 'L'},
    Field{14, 25, 420, 250, 1, 1, 1, 'B', 'L'},
    Field{15, 30, 405, 5, 1, 1, 1, 'B', 'L'},
    Field{16, 30, 393, 5, 1, 1, 1, 'B', 'L'},
    Field{17, 25, 405, 250, 1, 1, 1, 'B', 'L'},
    Field{18, 25, 393, 250, 1, 1, 1, 'B', 'L'},
    Field{19, 25, 381, 250, 1, 1, 1, 'B', 'L'},
    Line{372, 2, 372, 398, 2},
    Barcode{20, 30, 'V', 235, 40, 4, 115},
    Field{21, 30, 218, 60, 1, 1, 1, 'B', 'L'},
    Line{205, 2, 205, 398, 2},
    Text{190, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Barcode{22, 21, 'V', 40, 40, 4, 135},
    Field{23, 22, 20, 60, 1, 1, 2, 'B', 'L'},
    Field{24, 20, 290, 215, 1, 2, 2, 'B', 'L'},
});

using V = const LabelValues&;
constexpr auto kBatch = std::to_array<BatchField>({
    {1, &LabelValues::FromName},
    {2, &LabelValues::FromLine2},
    {3, &LabelValues::FromLine3},
    {4, &LabelValues::FromState},
    {5, &LabelValues::CarrierName},
    {6, &LabelValues::ConNoteNo},
    {7, &LabelValues::ServiceLine},
    {8, &LabelValues::ToName},
    {9, &LabelValues::ToAddress1},
    {10, &LabelValues::ToAddress2},
    {11, [](V v) { return v.ToSuburb + " " + v.ToState + " " + v.ToPostcode; }},
    {12, &LabelValues::StoreText},
    {13, &LabelValues::OrderLine},
    {14, &LabelValues::SalesOrderLine},
    {15, &LabelValues::UserText1},
    {16, &LabelValues::UserText2},
    {17, &LabelValues::PackedLine},
    {18, &LabelValues::NotBeforeLine},
    {19, &LabelValues::NotAfterLine},
    {20, elements::Store},
    {21, elements::StoreLine},
    {22, elements::Sscc},
    {23, elements::SsccLine},
    {24, &LabelValues::PostcodeServiceLine},
});

constexpr LabelLayout kLayout{"380", vpcl::Format{"MayneGen", 600, 400, kPackets}, kBatch};

}  // namespace

class clsMayneGenericSCM final : public StoreNumberLabel<> {
 public:
  clsMayneGenericSCM() : StoreNumberLabel("clsMayneGenericSCM", kLayout) {}
};

std::unique_ptr<Component> MakeMayneGenericSCM() { return std::make_unique<clsMayneGenericSCM>(); }

}  // namespace quendal
