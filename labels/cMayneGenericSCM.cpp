// Mayne carton label for any retailer: format "MayneGen" (380), the SSCC
// (00) and the store's number (90) barcodes.
#include "labels/AddressLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400: the address label's top; order, user texts and dates; the
// store barcode with the postcode and service level beside it, above the
// SSCC barcode.
constexpr auto kRest = std::to_array<Packet>({
    Field{13, 25, 425, 5, 1, 1, 2, 'B', 'L'},
    Field{14, 25, 427, 250, 1, 1, 1, 'B', 'L'},
    Field{15, 30, 408, 5, 1, 1, 1, 'B', 'L'},
    Field{16, 30, 396, 5, 1, 1, 1, 'B', 'L'},
    Field{17, 25, 408, 250, 1, 1, 1, 'B', 'L'},
    Field{18, 25, 396, 250, 1, 1, 1, 'B', 'L'},
    Field{19, 25, 384, 250, 1, 1, 1, 'B', 'L'},
    Line{372, 2, 372, 398, 2},
    Barcode{20, 30, 'V', 235, 40, 4, 115},
    Field{21, 30, 218, 60, 1, 1, 1, 'B', 'L'},
    Field{24, 20, 290, 215, 1, 2, 2, 'B', 'L'},
    Line{205, 2, 205, 398, 2},
    Text{190, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Barcode{22, 21, 'V', 40, 40, 4, 135},
    Field{23, 22, 20, 60, 1, 1, 2, 'B', 'L'},
});

constexpr auto kBatch = AddressLabelBatch(std::to_array<BatchField>({
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
}));

constexpr auto kPackets = AddressLabelFormat(kRest);
constexpr LabelLayout kLayout{"380", vpcl::Format{"MayneGen", 600, 400, kPackets}, kBatch};

}  // namespace

class clsMayneGenericSCM final : public AddressLabelPrinter {
 public:
  clsMayneGenericSCM() : AddressLabelPrinter("clsMayneGenericSCM", kLayout) {}
};

std::unique_ptr<Component> MakeMayneGenericSCM() { return std::make_unique<clsMayneGenericSCM>(); }

}  // namespace quendal
