// AaE carton label for any retailer: format "AAE" (460), sent whole with
// every label, the carton's data written into its constant texts, and the
// service's article code with the carton's place in its consignment as a
// barcode fixed in the format. No format waits on the printer.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "labels/LabelPrinter.h"

namespace quendal {

class clsAaEGenericSCM : public LabelPrinter {
 public:
  clsAaEGenericSCM();
  // The label's format followed by a batch of one label.
  std::string VPCLIIBatchCommand() override;

 protected:
  bool FillValues(Procedure& proc) override;
  bool DownloadsFormat(const std::string& language) const override;
  vpcl::Format LabelFormat() override;

 private:
  // What the AaE label prints besides the reference values.
  std::string serviceCode_;
  std::string article_;  // the barcode's data
  std::string weight_;
  std::string place_;   // suburb, state and postcode on one line
  std::string sender_;  // sender's locality and state
  std::vector<vpcl::Packet> packets_;
};

std::unique_ptr<Component> MakeAaEGenericSCM();

}  // namespace quendal
