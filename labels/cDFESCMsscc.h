// DFE carton label with the SSCC: format "DFESSCC" (482) with the SSCC
// (00) barcode and the ship-to barcode for Australia, "(421)036" and the
// postcode; also prints a format and batch handed over as text.
#pragma once

#include <memory>

#include "labels/LabelPrinter.h"

namespace quendal {

class clsDFESCMsscc : public PrintFileLabelPrinter {
 public:
  clsDFESCMsscc();
};

std::unique_ptr<Component> MakeDFESCMsscc();

}  // namespace quendal
