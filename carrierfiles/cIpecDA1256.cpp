#include "carrierfiles/cIpecDA1256.h"

namespace quendal {

namespace {

// The first T1256 file created today takes the consignment, else a new one
// named after the account and the time.
constexpr LayoutVariant kVariant{
    .className = "clsIpecDA1256",
    .prefix = "T1256_",
    .accountInName = true,
    .stampMask = "YYYYMMDDHHMMSS",
    .extension = ".DAT",
    .reuseTodaysFile = true,
    .serviceTable = ServiceTable::Ipec1256,
    .writesTrailer = true,
};

}  // namespace

clsIpecDA1256::clsIpecDA1256() : LayoutDespatch(kVariant) {}

std::unique_ptr<Component> MakeIpecDA1256() { return std::make_unique<clsIpecDA1256>(); }

}  // namespace quendal
