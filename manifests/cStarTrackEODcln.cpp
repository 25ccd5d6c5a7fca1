#include "manifests/cStarTrackEODcln.h"

#include <array>

namespace quendal {

namespace {

constexpr std::array<GridColumn, 5> kColumns = {{
    {"ConNote No", 0, 1500},
    {"Partner", 2, 1000},
    {"Delivery Locn", 0, 2000},
    {"Order No", 0, 2600},
    {"Result", 0, 3000},
}};

// The day's file as the despatch class keeps it; a consignment without a
// weight says 1, nothing is left without a signature, and every pack
// travels as a carton.
constexpr StarTrackRowsVariant kEndOfDay{
    .className = "clsStarTrackEODcln",
    .manifestRun = false,
    .columns = kColumns,
    .rowColumns = 6,
    .cln =
        {
            .nameFromManifest = false,
            .reuseTodaysFile = true,
            .noWeight = "1",
            .authorityToLeave = false,
            .satchelUnit = false,
            .cubeByItemCount = true,
        },
};

}  // namespace

clsStarTrackEODcln::clsStarTrackEODcln() : StarTrackClnRows(kEndOfDay) {}

std::unique_ptr<Component> MakeStarTrackEODcln() { return std::make_unique<clsStarTrackEODcln>(); }

}  // namespace quendal
