// What a consignment procedure written once for a carrier's classes (its
// despatch class and its manifest and end-of-day runs) needs of the class
// it writes for.
#pragma once

#include <string_view>

#include "frame/host/Host.h"

namespace quendal {

class ConsignmentOwner {
 public:
  virtual ~ConsignmentOwner() = default;
  // Writes one host log entry and hands its id to the caller.
  virtual void LogLine(long errorNumber, std::string_view procedure, std::string_view message) = 0;
  // Prints the consignment's dangerous goods declaration; false when it could not.
  virtual bool DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) = 0;
};

}  // namespace quendal
