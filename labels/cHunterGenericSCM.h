// Hunter carton label for any retailer: format "1HUNTER" (530), without
// barcodes: the destination and its postcode large, the consignment, the
// sender, the receiver, order references and dates.
#pragma once

#include <memory>

#include "labels/LabelPrinter.h"

namespace quendal {

class clsHunterGenericSCM : public LabelPrinter {
 public:
  clsHunterGenericSCM();
};

std::unique_ptr<Component> MakeHunterGenericSCM();

}  // namespace quendal
