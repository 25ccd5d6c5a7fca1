// DFE carton label made for drawing on an ordinary printer: format
// "DFESCM" (480, 800 x 400) with the ship-to (421) barcode.
#pragma once

#include <memory>

#include "labels/LabelPrinter.h"

namespace quendal {

class clsDFESCMWinPCL : public LabelPrinter {
 public:
  clsDFESCMWinPCL();
};

std::unique_ptr<Component> MakeDFESCMWinPCL();

}  // namespace quendal
