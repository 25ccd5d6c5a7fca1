// Hunter's download file: one tab-separated file per account and day,
// "DOWNLOAD_" + account + "_" + date + ".TXT", laid out by clsHunterDA.layout.
#pragma once

#include <memory>

#include "carrierfiles/LayoutWriter.h"

namespace quendal {

class clsHunterDA : public LayoutDespatch {
 public:
  clsHunterDA();
};

std::unique_ptr<Component> MakeHunterDA();

}  // namespace quendal
