#include "manifests/cIpecDA1250Manifest.h"

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

// The day's 1250 file of the output folder; the run adds no trailer, but
// keeps last one the file already ends with.
constexpr Ipec1250RowsVariant kManifestRun{
    .manifestRun = true,
    .columns = kColumns,
    .rowColumns = 7,
    .layout =
        {
            .className = "clsIpecDA1250Manifest",
            .prefix = "T1250_",
            .accountInName = true,
            .stampMask = "YYYYMMDDHHMMSS",
            .extension = ".DAT",
            .reuseTodaysFile = true,
            .serviceTable = ServiceTable::Ipec1250,
            .writesTrailer = false,
        },
};

}  // namespace

clsIpecDA1250Manifest::clsIpecDA1250Manifest() : Ipec1250Rows(kManifestRun) {}

std::unique_ptr<Component> MakeIpecDA1250Manifest() {
  return std::make_unique<clsIpecDA1250Manifest>();
}

}  // namespace quendal
