// The Australia Post article labels: format "APEP" (952) for parcels sent
// standard and "APEX" (952) for express ones, the carrier's graphic 99
// kept on the printer beside them, the delivery address, the consignment
// and the carton's article identifier as the eParcel manifest lists them,
// "k of N", and the SSCC (00) barcode.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "labels/LabelPrinter.h"

namespace quendal {

// The file the graphic's rows are read from (GraphicPath finds it).
inline constexpr std::string_view kAustPostGraphicFile = "AP99.graphic";

class AustPostLabelPrinter : public LabelPrinter {
 protected:
  explicit AustPostLabelPrinter(std::string_view className);

  // The reference values with the address freed of double quotes, then the
  // consignment number, the article identifier and the carton's place, as
  // the manifest gives them.
  bool FillValues(Procedure& proc) override;
  vpcl::Format LabelFormat() override;
  // The graphic, then the format.
  std::string FormatDownload() override;
  // The batch, after the format when the printer holds the other one (both
  // formats share a number) or nothing yet from this object.
  std::string LabelJob() override;

 private:
  bool express_ = false;
  // The format this object last sent to its printer; empty before the first.
  std::string_view held_;
};

}  // namespace quendal
