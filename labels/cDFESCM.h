// DFE carton label for any retailer: format "DFESCM" (480, 800 x 400),
// without barcodes.
#pragma once

#include <memory>

#include "labels/LabelPrinter.h"

namespace quendal {

class clsDFESCM : public LabelPrinter {
 public:
  clsDFESCM();
};

std::unique_ptr<Component> MakeDFESCM();

}  // namespace quendal
