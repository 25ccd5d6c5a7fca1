// Labels of goods for a retailer's store that travel through the retailer's
// distribution centre: TO the delivery location (the pack's receiver), FOR
// the store (the pack's ship-to), the store's number large and under (90)
// after the delivery location's postcode in the ship-to barcode, the store
// zone and department, and the consignment's bill of lading. Some of these
// classes also drive ZPL printers with one declared ZPL label.
#pragma once

#include <array>
#include <string_view>

#include "labels/LabelPrinter.h"

namespace quendal {

// How much of the location's code and the store's name a class prints.
struct StoreLabelCuts {
  int locationCode;
  int storeName;
};

// The ZPL label of the store-label classes, in dots of a 203 dpi printer
// on a 4 x 6 inch label: the set-up, the sender, carrier and consignment,
// TO and FOR blocks, zone and department, the SSCC, the purchase order,
// the (421)(90) and (00) barcodes, one copy.
extern const std::array<zpl::Piece, 37> kStoreLabelZpl;

class StoreLabelPrinter : public LabelPrinter {
 protected:
  StoreLabelPrinter(std::string_view className, const LabelLayout& layout, StoreLabelCuts cuts);
  // The reference values, then the consignment's bill of lading, the
  // delivery location, the store and the despatch's zones; the consignment
  // number cut to 12 and the carrier's name to 15 characters.
  bool FillValues(Procedure& proc) override;

 private:
  StoreLabelCuts cuts_;
};

}  // namespace quendal
