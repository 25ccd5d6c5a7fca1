// StarTrack carton label for BigW stores through BigW's distribution centre:
// format "BigWDC" (30), the SSCC (00) and ship-to (421)(90) barcodes.
#include "labels/BigWLabel.h"

namespace quendal {

namespace {

constexpr LabelLayout kLayout{"30", vpcl::Format{"BigWDC", 600, 400, kBigWPackets}, kBigWBatch};

}  // namespace

class clsStarTrackBigWSCM final : public BigWLabel<> {
 public:
  clsStarTrackBigWSCM() : BigWLabel("clsStarTrackBigWSCM", kLayout) {}
};

std::unique_ptr<Component> MakeStarTrackBigWSCM() { return std::make_unique<clsStarTrackBigWSCM>(); }

}  // namespace quendal
