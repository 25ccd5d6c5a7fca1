// The StarTrack manifest run: consignments awaiting a manifest, attached to
// one host manifest record per run and written to that manifest's CLN file.
#pragma once

#include <memory>

#include "manifests/StarTrackClnRows.h"

namespace quendal {

class clsStarTrackManifestcln : public StarTrackClnRows {
 public:
  clsStarTrackManifestcln();
};

std::unique_ptr<Component> MakeStarTrackManifestcln();

}  // namespace quendal
