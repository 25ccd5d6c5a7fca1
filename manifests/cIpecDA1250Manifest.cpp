#include "manifests/cIpecDA1250Manifest.h"

#include "carrierfiles/cIpecDA1250.h"

namespace quendal {

namespace {

// The day's 1250 file of the output folder; the run adds no trailer, but
// keeps last one the file already ends with.
constexpr Ipec1250RowsVariant kManifestRun{
    .manifestRun = true,
    .columns = kManifestColumns,
    .rowColumns = 7,
    .layout = Ipec1250File("clsIpecDA1250Manifest", false),
};

}  // namespace

clsIpecDA1250Manifest::clsIpecDA1250Manifest() : Ipec1250Rows(kManifestRun) {}

std::unique_ptr<Component> MakeIpecDA1250Manifest() {
  return std::make_unique<clsIpecDA1250Manifest>();
}

}  // namespace quendal
