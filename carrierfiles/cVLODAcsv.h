// VLO's despatch advice: one comma-separated line per pack, in the columns
// that "VLODA.map" in the carrier's folder lists.
#pragma once

#include <memory>

#include "carrierfiles/MapCsvWriter.h"

namespace quendal {

class clsVLODAcsv : public MapCsvWriter {
 public:
  clsVLODAcsv();
};

std::unique_ptr<Component> MakeVLODAcsv();

}  // namespace quendal
