#include "carrierfiles/cIpecDA1250.h"

namespace quendal {

namespace {

constexpr LayoutVariant kVariant = Ipec1250File("clsIpecDA1250", true);

}  // namespace

clsIpecDA1250::clsIpecDA1250() : LayoutDespatch(kVariant) {}

std::unique_ptr<Component> MakeIpecDA1250() { return std::make_unique<clsIpecDA1250>(); }

}  // namespace quendal
