#include "labels/cAustPostSCM.h"

namespace quendal {

clsAustPostSCM::clsAustPostSCM() : AustPostLabelPrinter("clsAustPostSCM") {}

std::unique_ptr<Component> MakeAustPostSCM() { return std::make_unique<clsAustPostSCM>(); }

}  // namespace quendal
