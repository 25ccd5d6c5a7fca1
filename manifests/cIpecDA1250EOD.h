// The Ipec 1250 end-of-day run: today's consignments, written to the day's
// 1250 file of the carrier's folder, laid out by clsIpecDA1250EOD.layout;
// Term prints the day's consolidated manifest.
#pragma once

#include <memory>

#include "manifests/Ipec1250Rows.h"

namespace quendal {

class clsIpecDA1250EOD : public Ipec1250Rows {
 public:
  clsIpecDA1250EOD();
};

std::unique_ptr<Component> MakeIpecDA1250EOD();

}  // namespace quendal
