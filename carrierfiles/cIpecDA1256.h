// Ipec's 1256 time-slot despatch advice: the day's "T1256_" file (".DAT"),
// laid out by clsIpecDA1256.layout.
#pragma once

#include <memory>

#include "carrierfiles/LayoutWriter.h"

namespace quendal {

class clsIpecDA1256 : public LayoutDespatch {
 public:
  clsIpecDA1256();
};

std::unique_ptr<Component> MakeIpecDA1256();

}  // namespace quendal
