// TNT carton label for CML stores through CML's distribution centre: the CML
// store label as format "TNTCMLDC" (13).
#include "labels/CmlLabel.h"

namespace quendal {

namespace {

constexpr LabelLayout kLayout{"13", vpcl::Format{"TNTCMLDC", 600, 400, kCmlPackets}, kStoreLabelBatch};

}  // namespace

class clsTNTCMLSCM final : public StoreLabelPrinter {
 public:
  clsTNTCMLSCM() : StoreLabelPrinter("clsTNTCMLSCM", kLayout, kCmlCuts) {}
};

std::unique_ptr<Component> MakeTNTCMLSCM() { return std::make_unique<clsTNTCMLSCM>(); }

}  // namespace quendal
