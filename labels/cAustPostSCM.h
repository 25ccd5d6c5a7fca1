// Australia Post article label: the eParcel "APEP" and express "APEX"
// formats (952) with the carrier's graphic, the article identifier the
// eParcel manifest lists for the carton, and the SSCC (00).
#pragma once

#include <memory>

#include "labels/AustPostLabel.h"

namespace quendal {

class clsAustPostSCM : public AustPostLabelPrinter {
 public:
  clsAustPostSCM();
};

std::unique_ptr<Component> MakeAustPostSCM();

}  // namespace quendal
