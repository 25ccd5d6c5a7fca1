// IFS carton label for David Jones stores: format "IFSDJS" (20) with the
// store's number large and the SSCC (00) barcode; also prints a whole pack
// list as one job, with separators between orders or styles.
#pragma once

#include <memory>

#include "labels/LabelPrinter.h"

namespace quendal {

class clsIFSDJsSCM : public PackListLabelPrinter {
 public:
  clsIFSDJsSCM();

 protected:
  // The reference values and the number of the store the goods are for.
  bool FillValues(Procedure& proc) override;
};

std::unique_ptr<Component> MakeIFSDJsSCM();

}  // namespace quendal
