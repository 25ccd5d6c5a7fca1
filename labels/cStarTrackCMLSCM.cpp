// StarTrack carton label for CML stores through CML's distribution centre: the
// CML store label as format "DFECMLDC" (12).
#include "labels/CmlLabel.h"

namespace quendal {

namespace {

constexpr LabelLayout kLayout{"12", vpcl::Format{"DFECMLDC", 600, 400, kCmlPackets}, kStoreLabelBatch};

}  // namespace

class clsStarTrackCMLSCM final : public StoreLabelPrinter {
 public:
  clsStarTrackCMLSCM() : StoreLabelPrinter("clsStarTrackCMLSCM", kLayout, kCmlCuts) {}
};

std::unique_ptr<Component> MakeStarTrackCMLSCM() { return std::make_unique<clsStarTrackCMLSCM>(); }

}  // namespace quendal
