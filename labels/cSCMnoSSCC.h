// Carton label without an SSCC: the DFE label "DFESCM" (480) measured in
// tenths of a millimetre (2000 x 1016), without barcodes.
#pragma once

#include <memory>

#include "labels/LabelPrinter.h"

namespace quendal {

class clsSCMnoSSCC : public LabelPrinter {
 public:
  clsSCMnoSSCC();
};

std::unique_ptr<Component> MakeSCMnoSSCC();

}  // namespace quendal
