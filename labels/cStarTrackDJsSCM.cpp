// StarTrack carton label for David Jones stores: "1djscm" (22), the ship-to
// barcode (421) with the store's number (90).
#include "labels/DjsLabel.h"

namespace quendal {

namespace {

constexpr auto kBatch = DjsBatch(elements::ShipToStore, elements::ShipToStoreLine);
constexpr LabelLayout kLayout{"22", vpcl::Format{"1djscm", 600, 400, kDjsPackets}, kBatch};

}  // namespace

class clsStarTrackDJsSCM final : public AddressLabelPrinter {
 public:
  clsStarTrackDJsSCM() : AddressLabelPrinter("clsStarTrackDJsSCM", kLayout) {}
};

std::unique_ptr<Component> MakeStarTrackDJsSCM() { return std::make_unique<clsStarTrackDJsSCM>(); }

}  // namespace quendal
