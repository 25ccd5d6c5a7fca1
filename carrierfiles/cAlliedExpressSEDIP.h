// Allied Express's SEDIP transfer file: each Process writes one consignment
// as a file of its own, "#" control lines around a consignment header
// ("|H|"), a pickup record ("|P|") and one delivery record ("|D|") per pack.
#pragma once

#include <memory>

#include "carrierfiles/ConsignmentWriter.h"

namespace quendal {

class clsAlliedExpressSEDIP : public ConsignmentWriter {
 public:
  clsAlliedExpressSEDIP();

 protected:
  void Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
               const Ref<host::PackList>& lstPacks) override;
};

std::unique_ptr<Component> MakeAlliedExpressSEDIP();

}  // namespace quendal
