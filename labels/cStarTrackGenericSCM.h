// StarTrack carton label for any retailer: format "Generic" (430), with the
// SSCC (00) and ship-to (421) barcodes and, for authority-to-leave
// consignments, the ATL number barcode.
#pragma once

#include <memory>

#include "labels/LabelPrinter.h"

namespace quendal {

class clsStarTrackGenericSCM : public LabelPrinter {
 public:
  clsStarTrackGenericSCM();
};

std::unique_ptr<Component> MakeStarTrackGenericSCM();

}  // namespace quendal
