// The eParcel end-of-day run: every consignment of the current day, written
// to the day's PCMS file under a manifest number taken from the clock.
#pragma once

#include <memory>

#include "manifests/eParcelRows.h"

namespace quendal {

class clseParcelManifestEODxml : public eParcelRows {
 public:
  clseParcelManifestEODxml();
};

std::unique_ptr<Component> MakeeParcelManifestEODxml();

}  // namespace quendal
