// VicExpress's consignment file: the day's ".CTN" file in StarTrack's
// consignment record grammar, to which each Process appends one
// consignment (consignment, two reference records and one item record per
// pack of the notice).
#pragma once

#include <memory>
#include <string>

#include "carrierfiles/ConsignmentWriter.h"

namespace quendal {

class clsVicExpressDAcln : public ConsignmentWriter {
 public:
  clsVicExpressDAcln();

 protected:
  void Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
               const Ref<host::PackList>& lstPacks) override;
};

std::unique_ptr<Component> MakeVicExpressDAcln();

}  // namespace quendal
