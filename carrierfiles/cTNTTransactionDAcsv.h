// TNT's transaction despatch advice: one comma-separated line per pack, in
// the columns that "TransactionDA.map" in the carrier's folder lists.
#pragma once

#include <memory>

#include "carrierfiles/MapCsvWriter.h"

namespace quendal {

class clsTNTTransactionDAcsv : public MapCsvWriter {
 public:
  clsTNTTransactionDAcsv();
};

std::unique_ptr<Component> MakeTNTTransactionDAcsv();

}  // namespace quendal
