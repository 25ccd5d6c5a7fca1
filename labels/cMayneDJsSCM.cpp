// Mayne carton label for David Jones stores: "1djscm" (16), the store's number
// (90) alone in the ship-to barcode.
#include "labels/DjsLabel.h"

namespace quendal {

namespace {

constexpr auto kBatch = DjsBatch(elements::Store, elements::StoreLine);
constexpr LabelLayout kLayout{"16", vpcl::Format{"1djscm", 600, 400, kDjsPackets}, kBatch};

}  // namespace

class clsMayneDJsSCM final : public AddressLabelPrinter {
 public:
  clsMayneDJsSCM() : AddressLabelPrinter("clsMayneDJsSCM", kLayout) {}
};

std::unique_ptr<Component> MakeMayneDJsSCM() { return std::make_unique<clsMayneDJsSCM>(); }

}  // namespace quendal
