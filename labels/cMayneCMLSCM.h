// Mayne carton label for CML stores through CML's distribution centre:
// format "CMLDC" (10) with the SSCC (00) and ship-to (421)(90) barcodes, or
// the store label in ZPL.
#pragma once

#include <memory>

#include "labels/StoreLabel.h"

namespace quendal {

class clsMayneCMLSCM : public StoreLabelPrinter {
 public:
  clsMayneCMLSCM();
};

std::unique_ptr<Component> MakeMayneCMLSCM();

}  // namespace quendal
