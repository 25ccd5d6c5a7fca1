#include "labels/cStarTrackGenericSCM.h"

#include "labels/GenericLabel.h"

namespace quendal {

namespace {

constexpr auto kBatch = GenericBatch(elements::ShipTo, elements::ShipToLine);
constexpr LabelLayout kLayout{"430", vpcl::Format{"Generic", 600, 400, kGenericPackets}, kBatch};

}  // namespace

clsStarTrackGenericSCM::clsStarTrackGenericSCM() : LabelPrinter("clsStarTrackGenericSCM", kLayout) {}

std::unique_ptr<Component> MakeStarTrackGenericSCM() {
  return std::make_unique<clsStarTrackGenericSCM>();
}

}  // namespace quendal
