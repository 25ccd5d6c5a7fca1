// The eParcel manifest run: consignments awaiting a manifest, attached to
// one host manifest record per run and written to the day's PCMS file.
#pragma once

#include <memory>

#include "manifests/eParcelRows.h"

namespace quendal {

class clseParcelManifestxml : public eParcelRows {
 public:
  clseParcelManifestxml();
};

std::unique_ptr<Component> MakeeParcelManifestxml();

}  // namespace quendal
