// StarTrack carton label for Spotlight stores: the David Jones layout "1djscm"
// (135), the ship-to barcode (421) with the store's number (90).
#include "labels/DjsLabel.h"

namespace quendal {

namespace {

constexpr auto kBatch = DjsBatch(elements::ShipToStore, elements::ShipToStoreLine);
constexpr LabelLayout kLayout{"135", vpcl::Format{"1djscm", 600, 400, kDjsPackets}, kBatch};

}  // namespace

class clsStarTrackSpotlightSCM final : public AddressLabelPrinter {
 public:
  clsStarTrackSpotlightSCM() : AddressLabelPrinter("clsStarTrackSpotlightSCM", kLayout) {}
};

std::unique_ptr<Component> MakeStarTrackSpotlightSCM() { return std::make_unique<clsStarTrackSpotlightSCM>(); }

}  // namespace quendal
