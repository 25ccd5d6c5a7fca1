#include "manifests/cStarTrackManifestcln.h"

namespace quendal {

namespace {

// Every consignment of a manifest goes to the file named after its number,
// even when another file was started today; a consignment without a
// weight says 0.
constexpr StarTrackRowsVariant kManifestRun{
    .className = "clsStarTrackManifestcln",
    .manifestRun = true,
    .columns = kManifestColumns,
    .rowColumns = 7,
    .cln =
        {
            .nameFromManifest = true,
            .reuseTodaysFile = false,
            .noWeight = "0",
            .authorityToLeave = true,
            .satchelUnit = true,
            .cubeByItemCount = true,
        },
};

}  // namespace

clsStarTrackManifestcln::clsStarTrackManifestcln() : StarTrackClnRows(kManifestRun) {}

std::unique_ptr<Component> MakeStarTrackManifestcln() {
  return std::make_unique<clsStarTrackManifestcln>();
}

}  // namespace quendal
