#include "manifests/cStarTrackEODcln.h"

namespace quendal {

namespace {

// The day's file as the despatch class keeps it; a consignment without a
// weight says 1, nothing is left without a signature, and every pack
// travels as a carton.
constexpr StarTrackRowsVariant kEndOfDay{
    .className = "clsStarTrackEODcln",
    .manifestRun = false,
    .columns = kConsignmentColumns,
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
