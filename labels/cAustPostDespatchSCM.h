// Australia Post article label of the despatch office, the same label as
// clsAustPostSCM: the eParcel "APEP" and express "APEX" formats (952) with
// the carrier's graphic, the article identifier the eParcel manifest lists
// for the carton, and the SSCC (00).
#pragma once

#include <memory>

#include "labels/AustPostLabel.h"

namespace quendal {

class clsAustPostDespatchSCM : public AustPostLabelPrinter {
 public:
  clsAustPostDespatchSCM();
};

std::unique_ptr<Component> MakeAustPostDespatchSCM();

}  // namespace quendal
