#include "labels/cDFESCM.h"

#include "labels/DfeLabel.h"

namespace quendal {

namespace {

// The number of the same format in the drawn-label class, so that both
// classes fill one format on a printer; the ship-to barcode stays empty.
constexpr LabelLayout kLayout{kDfeNumber, vpcl::Format{"DFESCM", 800, 400, kDfePackets}, kDfeBatch};

}  // namespace

clsDFESCM::clsDFESCM() : LabelPrinter("clsDFESCM", kLayout) {}

std::unique_ptr<Component> MakeDFESCM() { return std::make_unique<clsDFESCM>(); }

}  // namespace quendal
