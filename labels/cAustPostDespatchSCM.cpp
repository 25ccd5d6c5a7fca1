#include "labels/cAustPostDespatchSCM.h"

namespace quendal {

clsAustPostDespatchSCM::clsAustPostDespatchSCM() : AustPostLabelPrinter("clsAustPostDespatchSCM") {}

std::unique_ptr<Component> MakeAustPostDespatchSCM() {
  return std::make_unique<clsAustPostDespatchSCM>();
}

}  // namespace quendal
