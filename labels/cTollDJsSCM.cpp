// Toll carton label for David Jones stores: "1djscm" (22), the ship-to barcode
// (421) alone.
#include "labels/DjsLabel.h"

namespace quendal {

namespace {

constexpr auto kBatch = DjsBatch(elements::ShipTo, elements::ShipToLine);
constexpr LabelLayout kLayout{"22", vpcl::Format{"1djscm", 600, 400, kDjsPackets}, kBatch};

}  // namespace

class clsTollDJsSCM final : public AddressLabelPrinter {
 public:
  clsTollDJsSCM() : AddressLabelPrinter("clsTollDJsSCM", kLayout) {}
};

std::unique_ptr<Component> MakeTollDJsSCM() { return std::make_unique<clsTollDJsSCM>(); }

}  // namespace quendal
