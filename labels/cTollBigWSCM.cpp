// Toll carton label for BigW stores through BigW's distribution centre: format
// "BigWDC" (30), the SSCC (00) and ship-to (421)(90) barcodes.
#include "labels/BigWLabel.h"

namespace quendal {

namespace {

constexpr LabelLayout kLayout{"30", vpcl::Format{"BigWDC", 600, 400, kBigWPackets}, kBigWBatch};

}  // namespace

class clsTollBigWSCM final : public BigWLabel<> {
 public:
  clsTollBigWSCM() : BigWLabel("clsTollBigWSCM", kLayout) {}
};

std::unique_ptr<Component> MakeTollBigWSCM() { return std::make_unique<clsTollBigWSCM>(); }

}  // namespace quendal
