#include "manifests/cIpecDA1250EOD.h"

namespace quendal {

namespace {

// The day's 1250 file as the despatch class keeps it, trailer included.
constexpr Ipec1250RowsVariant kEndOfDay{
    .manifestRun = false,
    .columns = kConsignmentColumns,
    .rowColumns = 6,
    .layout =
        {
            .className = "clsIpecDA1250EOD",
            .prefix = "T1250_",
            .accountInName = true,
            .stampMask = "YYYYMMDDHHMMSS",
            .extension = ".DAT",
            .reuseTodaysFile = true,
            .serviceTable = ServiceTable::Ipec1250,
            .writesTrailer = true,
        },
};

}  // namespace

clsIpecDA1250EOD::clsIpecDA1250EOD() : Ipec1250Rows(kEndOfDay) {}

std::unique_ptr<Component> MakeIpecDA1250EOD() { return std::make_unique<clsIpecDA1250EOD>(); }

}  // namespace quendal
