// StarTrack carton label for BigW printed a pack list at a time: format
// "BigWDC" (660) with the SSCC (00) barcode only; a whole pack list prints
// as one job, with separators between orders or styles.
#include "labels/BigWLabel.h"

namespace quendal {

namespace {

// No ship-to barcode: its field stays empty on these labels.
constexpr auto kBatch = BatchWithout(kBigWBatch, std::array{22, 23});
constexpr LabelLayout kLayout{"660", vpcl::Format{"BigWDC", 600, 400, kBigWPackets}, kBatch};

}  // namespace

class clsStarTrackBigWERSCM final : public BigWLabel<PackListLabelPrinter> {
 public:
  clsStarTrackBigWERSCM() : BigWLabel("clsStarTrackBigWERSCM", kLayout) {}
};

std::unique_ptr<Component> MakeStarTrackBigWERSCM() {
  return std::make_unique<clsStarTrackBigWERSCM>();
}

}  // namespace quendal
