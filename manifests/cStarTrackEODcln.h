// The StarTrack end-of-day run: today's consignments, written to the day's
// CLN file.
#pragma once

#include <memory>

#include "manifests/StarTrackClnRows.h"

namespace quendal {

class clsStarTrackEODcln : public StarTrackClnRows {
 public:
  clsStarTrackEODcln();
};

std::unique_ptr<Component> MakeStarTrackEODcln();

}  // namespace quendal
