#include "carrierfiles/cMayneDAcl.h"

namespace quendal {

namespace {

// A new file for every call, named after its time.
constexpr LayoutVariant kVariant{
    .className = "clsMayneDAcl",
    .prefix = "CL_",
    .accountInName = false,
    .stampMask = "YYYYMMDDHHMMSS",
    .extension = ".txt",
    .reuseTodaysFile = false,
    .serviceTable = std::nullopt,
    .writesTrailer = true,
};

}  // namespace

clsMayneDAcl::clsMayneDAcl() : LayoutDespatch(kVariant) {}

std::unique_ptr<Component> MakeMayneDAcl() { return std::make_unique<clsMayneDAcl>(); }

}  // namespace quendal
