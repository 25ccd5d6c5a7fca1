// Ipec's 1250 despatch advice: the day's "T1250_" file (".DAT"), laid out
// by clsIpecDA1250.layout, whose date trailer and end mark each consignment
// moves to the end again.
#pragma once

#include <memory>

#include "carrierfiles/LayoutWriter.h"

namespace quendal {

class clsIpecDA1250 : public LayoutDespatch {
 public:
  clsIpecDA1250();
};

std::unique_ptr<Component> MakeIpecDA1250();

}  // namespace quendal
