#include "labels/cDFESCMWinPCL.h"

#include "labels/DfeLabel.h"

namespace quendal {

namespace {

constexpr LabelLayout kLayout{kDfeNumber, vpcl::Format{"DFESCM", 800, 400, kDfePackets},
                              kDfeShipToBatch};

}  // namespace

clsDFESCMWinPCL::clsDFESCMWinPCL() : LabelPrinter("clsDFESCMWinPCL", kLayout) {}

std::unique_ptr<Component> MakeDFESCMWinPCL() { return std::make_unique<clsDFESCMWinPCL>(); }

}  // namespace quendal
