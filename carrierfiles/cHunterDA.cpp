#include "carrierfiles/cHunterDA.h"

namespace quendal {

namespace {

// One file per account and day.
constexpr LayoutVariant kVariant{
    .className = "clsHunterDA",
    .prefix = "DOWNLOAD_",
    .accountInName = true,
    .stampMask = "YYYYMMDD",
    .extension = ".TXT",
    .reuseTodaysFile = false,
    .serviceTable = ServiceTable::Hunter,
    .writesTrailer = true,
};

}  // namespace

clsHunterDA::clsHunterDA() : LayoutDespatch(kVariant) {}

std::unique_ptr<Component> MakeHunterDA() { return std::make_unique<clsHunterDA>(); }

}  // namespace quendal
