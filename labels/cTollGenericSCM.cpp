// Toll carton label for any retailer: the "Generic" label (440), whose
// ship-to barcode also carries the store's number under (90), printed large
// above the receiver block too.
#include "labels/GenericLabel.h"
#include "labels/StoreLabel.h"

namespace quendal {

namespace {

constexpr auto kBatch = GenericBatch(elements::ShipToStore, elements::ShipToStoreLine);
constexpr LabelLayout kLayout{"440", vpcl::Format{"Generic", 600, 400, kGenericPackets}, kBatch};

}  // namespace

class clsTollGenericSCM final : public StoreNumberLabel<> {
 public:
  clsTollGenericSCM() : StoreNumberLabel("clsTollGenericSCM", kLayout) {}
};

std::unique_ptr<Component> MakeTollGenericSCM() { return std::make_unique<clsTollGenericSCM>(); }

}  // namespace quendal
