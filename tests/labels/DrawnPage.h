// A label drawn on an ordinary printer ("WinPCL") as the directory spooler
// keeps it: one PNG page, long enough for an 8 x 4 inch label.
#pragma once

#include <string>

#include "frame/Component.h"
#include "tests/support/MemoryHost.h"

namespace quendal::test {

// The page of the pack's label drawn at `dpi`; empty when nothing was drawn.
std::string DrawnPage(LabelInterface& label,
                      const std::shared_ptr<MemoryObject<host::System>>& system,
                      const Ref<host::Pack>& pack, int dpi);

}  // namespace quendal::test
