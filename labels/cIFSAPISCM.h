// IFS carton label for any retailer: format "IFSAPI" (750) with the SSCC
// (00) barcode.
#pragma once

#include <memory>

#include "labels/LabelPrinter.h"

namespace quendal {

class clsIFSAPISCM : public LabelPrinter {
 public:
  clsIFSAPISCM();
};

std::unique_ptr<Component> MakeIFSAPISCM();

}  // namespace quendal
