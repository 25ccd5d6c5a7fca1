#include "labels/cMayneCMLSCM.h"

#include "labels/CmlLabel.h"

namespace quendal {

namespace {

const LabelLayout kLayout{"10", vpcl::Format{"CMLDC", 600, 400, kCmlPackets}, kStoreLabelBatch, kStoreLabelZpl};

}  // namespace

clsMayneCMLSCM::clsMayneCMLSCM() : StoreLabelPrinter("clsMayneCMLSCM", kLayout, kCmlCuts) {}

std::unique_ptr<Component> MakeMayneCMLSCM() { return std::make_unique<clsMayneCMLSCM>(); }

}  // namespace quendal
