// Toll carton label for New Zealand: the "Generic" label as StarTrack's
// class prints it, stored under format number 82.
#include "labels/GenericLabel.h"

namespace quendal {

namespace {

constexpr auto kBatch = GenericBatch(elements::ShipTo, elements::ShipToLine);
constexpr LabelLayout kLayout{"82", vpcl::Format{"Generic", 600, 400, kGenericPackets}, kBatch};

}  // namespace

class clsTollNZSCM final : public LabelPrinter {
 public:
  clsTollNZSCM() : LabelPrinter("clsTollNZSCM", kLayout) {}
};

std::unique_ptr<Component> MakeTollNZSCM() { return std::make_unique<clsTollNZSCM>(); }

}  // namespace quendal
