#include "manifests/ceParcelManifestxml.h"

namespace quendal {

namespace {

constexpr eParcelVariant kManifestRun{
    .className = "clseParcelManifestxml",
    .awaitingManifest = true,
    .orderAddressInGrid = true,
    .manifestRecord = true,
    .scansOutputFolder = true,
    .companyFromAddress = true,
    .articlePerPack = true,
};

}  // namespace

clseParcelManifestxml::clseParcelManifestxml() : eParcelRows(kManifestRun) {}

std::unique_ptr<Component> MakeeParcelManifestxml() {
  return std::make_unique<clseParcelManifestxml>();
}

}  // namespace quendal
