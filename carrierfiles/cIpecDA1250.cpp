#include "carrierfiles/cIpecDA1250.h"

namespace quendal {

namespace {

// The first T1250 file created today takes the consignment, else a new one
// named after the account and the time.
constexpr LayoutVariant kVariant{
    .className = "clsIpecDA1250",
    .prefix = "T1250_",
    .accountInName = true,
    .stampMask = "YYYYMMDDHHMMSS",
    .extension = ".DAT",
    .reuseTodaysFile = true,
    .serviceTable = ServiceTable::Ipec1250,
    .writesTrailer = true,
};

}  // namespace

clsIpecDA1250::clsIpecDA1250() : LayoutDespatch(kVariant) {}

std::unique_ptr<Component> MakeIpecDA1250() { return std::make_unique<clsIpecDA1250>(); }

}  // namespace quendal
