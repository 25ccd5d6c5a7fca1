// Ipec's 1250 despatch advice: the day's "T1250_" file (".DAT"), laid out
// by clsIpecDA1250.layout, whose date trailer and end mark each consignment
// moves to the end again.
#pragma once

#include <memory>
#include <string_view>

#include "carrierfiles/LayoutWriter.h"

namespace quendal {

// Ipec's 1250 file as the despatch, manifest and end-of-day classes write
// it: the first T1250 file of the folder created today takes the
// consignment, else a new one named after the account and the time.
constexpr LayoutVariant Ipec1250File(std::string_view className, bool writesTrailer) {
  return {
      .className = className,
      .prefix = "T1250_",
      .accountInName = true,
      .stampMask = "YYYYMMDDHHMMSS",
      .extension = ".DAT",
      .reuseTodaysFile = true,
      .serviceTable = ServiceTable::Ipec1250,
      .writesTrailer = writesTrailer,
  };
}

class clsIpecDA1250 : public LayoutDespatch {
 public:
  clsIpecDA1250();
};

std::unique_ptr<Component> MakeIpecDA1250();

}  // namespace quendal
