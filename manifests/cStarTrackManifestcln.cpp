#include "manifests/cStarTrackManifestcln.h"

#include <array>

namespace quendal {

namespace {

constexpr std::array<GridColumn, 7> kColumns = {{
    {"ConNote No", 0, 2200},
    {"Partner", 2, 2000},
    {"Delivery Locn", 0, 2000},
    {"Service-Run Code", 0, 2000},
    {"Shipped Date", 0, 2600},
    {"Sheduled Date", 0, 2600},
    {"Result", 0, 3000},
}};

// Every consignment of a manifest goes to the file named after its number,
// even when another file was started today; a consignment without a
// weight says 0.
constexpr StarTrackRowsVariant kManifestRun{
    .className = "clsStarTrackManifestcln",
    .manifestRun = true,
    .columns = kColumns,
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
