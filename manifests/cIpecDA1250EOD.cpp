#include "manifests/cIpecDA1250EOD.h"

#include "carrierfiles/cIpecDA1250.h"

namespace quendal {

namespace {

// The day's 1250 file as the despatch class keeps it, trailer included.
constexpr Ipec1250RowsVariant kEndOfDay{
    .manifestRun = false,
    .columns = kConsignmentColumns,
    .rowColumns = 6,
    .layout = Ipec1250File("clsIpecDA1250EOD", true),
};

}  // namespace

clsIpecDA1250EOD::clsIpecDA1250EOD() : Ipec1250Rows(kEndOfDay) {}

std::unique_ptr<Component> MakeIpecDA1250EOD() { return std::make_unique<clsIpecDA1250EOD>(); }

}  // namespace quendal
