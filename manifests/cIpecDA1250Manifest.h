// The Ipec 1250 manifest run: consignments awaiting a manifest, attached to
// one host manifest record per run and written to the 1250 file of the EDI
// document's output folder, laid out by clsIpecDA1250Manifest.layout.
#pragma once

#include <memory>

#include "manifests/Ipec1250Rows.h"

namespace quendal {

class clsIpecDA1250Manifest : public Ipec1250Rows {
 public:
  clsIpecDA1250Manifest();
};

std::unique_ptr<Component> MakeIpecDA1250Manifest();

}  // namespace quendal
