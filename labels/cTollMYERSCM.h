// Toll carton label for Myer stores through Myer's distribution centre:
// format "MYERDC" (650) with the SSCC (00) and ship-to (421)(90) barcodes, or
// the store label in ZPL.
#pragma once

#include <memory>

#include "labels/StoreLabel.h"

namespace quendal {

class clsTollMYERSCM : public StoreLabelPrinter {
 public:
  clsTollMYERSCM();
};

std::unique_ptr<Component> MakeTollMYERSCM();

}  // namespace quendal
