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

// The batch of every store label format; the fields are numbered alike in
// all of them: 1-6 sender, carrier, consignment and bill of lading; 7-10 the
// delivery location's code, number, line and postcode; 11-14 the store's
// name, number, line and postcode; 15 the SSCC's line; 16 the purchase
// order; 17 the panel text; 18-21 the zones C and A, B and the store
// zone/department; 22-23 the (421)(90) barcode and its line; 24-29 dates,
// user texts and the sales order; 30-31 the SSCC barcode and its line.
extern const std::array<BatchField, 31> kStoreLabelBatch;

// What every store label format begins with (a line at row 555 under the
// sender and carrier block) and ends with (from row 350 down: the (421)(90)
// barcode, the dates and the SSCC barcode).
inline constexpr std::array<vpcl::Packet, 11> kStoreLabelTop = {
    vpcl::Line{555, 2, 555, 398, 4},
    vpcl::Text{585, 5, 1, 1, 1, 'O', 'L', 0, "FROM:"},
    vpcl::Field{1, 25, 585, 40, 1, 1, 1, 'O', 'L'},
    vpcl::Field{2, 25, 573, 40, 1, 1, 1, 'O', 'L'},
    vpcl::Field{3, 3, 573, 170, 1, 1, 1, 'O', 'L'},
    vpcl::Text{585, 200, 1, 1, 1, 'O', 'L', 0, "CARRIER:"},
    vpcl::Field{4, 15, 585, 250, 1, 1, 1, 'B', 'L'},
    vpcl::Text{573, 200, 1, 1, 1, 'O', 'L', 0, "CON NO:"},
    vpcl::Field{5, 12, 573, 250, 1, 1, 1, 'B', 'L'},
    vpcl::Text{561, 200, 1, 1, 1, 'O', 'L', 0, "B/L NO:"},
    vpcl::Field{6, 12, 561, 250, 1, 1, 1, 'B', 'L'},
};
inline constexpr std::array<vpcl::Packet, 10> kStoreLabelBottom = {
    vpcl::Barcode{22, 30, 'V', 235, 40, 4, 115},
    vpcl::Field{23, 40, 220, 60, 1, 1, 1, 'B', 'L'},
    vpcl::Field{24, 30, 203, 5, 1, 1, 1, 'B', 'L'},
    vpcl::Field{25, 30, 191, 5, 1, 1, 1, 'B', 'L'},
    vpcl::Field{26, 30, 179, 5, 1, 1, 1, 'B', 'L'},
    vpcl::Field{27, 30, 203, 200, 1, 1, 1, 'B', 'L'},
    vpcl::Field{28, 30, 191, 200, 1, 1, 1, 'B', 'L'},
    vpcl::Field{29, 30, 179, 200, 1, 1, 1, 'B', 'L'},
    vpcl::Barcode{30, 21, 'V', 40, 40, 4, 125},
    vpcl::Field{31, 22, 22, 60, 1, 2, 1, 'B', 'L'},
};

// A store label format: the common top, the class's own middle (the TO and
// FOR blocks, the SSCC, order and zones), the common bottom.
template <std::size_t N>
constexpr auto StoreLabelFormat(const std::array<vpcl::Packet, N>& middle) {
  return vpcl::Join(kStoreLabelTop, middle, kStoreLabelBottom);
}

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
