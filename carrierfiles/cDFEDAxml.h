// DFE's despatch advice: each Process adds one consignment (its table, its
// carton line and a label line per pack) to the day's XML document of the
// carrier account, in the carrier's folder. A consignment with dangerous
// goods also gets two printed declarations in DFE's form.
#pragma once

#include <memory>
#include <string>

#include "carrierfiles/ConsignmentWriter.h"
#include "carrierfiles/DfeWriter.h"

namespace quendal {

class clsDFEDAxml : public ConsignmentWriter, public DfeWriter, private DfeWriter::Owner {
 public:
  clsDFEDAxml();

  // Prints the consignment's dangerous goods declaration on the System's
  // document printer; false when it could not be printed.
  bool DangerouseGoodsDeclaration(const Ref<host::ConNote>& aConnote) override;

 protected:
  void Compile(const Ref<host::ConNote>& objConNote, const Ref<host::ASN>& objASN,
               const Ref<host::PackList>& lstPacks) override;

 private:
  void LogLine(long errorNumber, std::string_view procedure, std::string_view message) override {
    ConsignmentWriter::LogLine(errorNumber, procedure, message);
  }
};

std::unique_ptr<Component> MakeDFEDAxml();

}  // namespace quendal
