#include "manifests/ceParcelManifestEODxml.h"

namespace quendal {

namespace {

constexpr eParcelVariant kEndOfDayRun{
    .className = "clseParcelManifestEODxml",
    .awaitingManifest = false,
    .orderAddressInGrid = false,
    .manifestRecord = false,
    .scansOutputFolder = false,
    .companyFromAddress = false,
    .articlePerPack = false,
};

}  // namespace

clseParcelManifestEODxml::clseParcelManifestEODxml() : eParcelRows(kEndOfDayRun) {}

std::unique_ptr<Component> MakeeParcelManifestEODxml() {
  return std::make_unique<clseParcelManifestEODxml>();
}

}  // namespace quendal
