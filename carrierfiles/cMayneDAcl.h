// Mayne's CL despatch advice: one file "CL_" + timestamp + ".txt" per
// consignment, laid out by clsMayneDAcl.layout.
#pragma once

#include <memory>

#include "carrierfiles/LayoutWriter.h"

namespace quendal {

class clsMayneDAcl : public LayoutDespatch {
 public:
  clsMayneDAcl();
};

std::unique_ptr<Component> MakeMayneDAcl();

}  // namespace quendal
