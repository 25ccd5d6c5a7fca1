// Labels of goods for a retailer's store that travel through the retailer's
// distribution centre: TO the delivery location (the pack's receiver), FOR
// the store (the pack's ship-to), the store's number large and under (90)
// after the delivery location's postcode in the ship-to barcode, the store
// zone and department, and the consignment's bill of lading. Some of these
// classes also drive ZPL printers with one declared ZPL label.
#pragma once

#include <array>
#include <string>
#include <string_view>

#include "labels/Elements.h"
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
// order; 17 the panel text; 18 zone C; 19 the store zone/department; 20-21
// zones A and B; 22-23 the (421)(90) barcode and its line; 24-29 dates,
// user texts and the sales order; 30-31 the SSCC barcode and its line.
inline constexpr std::array<BatchField, 31> kStoreLabelBatch = {{
    {1, &LabelValues::FromName},
    {2, &LabelValues::FromLine3},
    {3, &LabelValues::FromState},
    {4, &LabelValues::CarrierName},
    {5, &LabelValues::ConNoteNo},
    {6, &LabelValues::BillOfLading},
    {7, &LabelValues::LocationCode},
    {8, &LabelValues::LocationNumber},
    {9, &LabelValues::ReceiverLine},
    {10, &LabelValues::ReceiverPostcode},
    {11, &LabelValues::ForName},
    {12, &LabelValues::StoreText},
    {13, &LabelValues::ForLine},
    {14, &LabelValues::ForPostcode},
    {15, elements::SsccLine},
    {16, &LabelValues::PurchaseOrderLine},
    {17, &LabelValues::PanelText},
    {18, &LabelValues::ZoneDeptC},
    {19, &LabelValues::StoreZoneDept},
    {20, &LabelValues::ZoneDeptA},
    {21, &LabelValues::ZoneDeptB},
    {22, elements::CentreStore},
    {23, elements::CentreStoreLine},
    {24, &LabelValues::PackedLine},
    {25, &LabelValues::NotBeforeLine},
    {26, &LabelValues::NotAfterLine},
    {27, &LabelValues::UserText1},
    {28, &LabelValues::UserText2},
    {29, &LabelValues::SalesOrderLine},
    {30, elements::Sscc},
    {31, elements::SsccLine},
}};

// A batch without the fields a format leaves out, in the same order.
template <std::size_t Drop, std::size_t N>
constexpr std::array<BatchField, N - Drop> BatchWithout(const std::array<BatchField, N>& batch,
                                                       const std::array<int, Drop>& numbers) {
  const auto kept = [&](std::size_t k) {
    for (const BatchField& field : batch) {
      bool dropped = false;
      for (int number : numbers) dropped = dropped || field.number == number;
      if (!dropped && k-- == 0) return field;
    }
    return batch[0];  // not reached: N - Drop fields are kept
  };
  return [&]<std::size_t... I>(std::index_sequence<I...>) {
    return std::array<BatchField, N - Drop>{{kept(I)...}};
  }(std::make_index_sequence<N - Drop>());
}

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

// The store label's values, after the reference values: the consignment's
// bill of lading, the delivery location, the store and the despatch's
// zones; the consignment number cut to 12 and the carrier's name to 15
// characters. Each read is a step of the caller's procedure.
bool ReadStoreLabelValues(Procedure& proc, const Ref<host::Pack>& pack, LabelValues& values,
                          StoreLabelCuts cuts);
// The number of the store the goods are for (the pack's ship-to), four
// digits, as StoreText.
bool ReadStoreNumber(Procedure& proc, const Ref<host::Pack>& pack, LabelValues& values);

// A store label class on the frame or on one of its extended forms
// (PrintFileLabelPrinter, PackListLabelPrinter).
template <class Base = LabelPrinter>
class StoreLabel : public Base {
 protected:
  StoreLabel(std::string_view className, const LabelLayout& layout, StoreLabelCuts cuts)
      : Base(className, layout), cuts_(cuts) {}
  bool FillValues(Procedure& proc) override {
    return Base::FillValues(proc) && ReadStoreLabelValues(proc, this->pack_, this->values_, cuts_);
  }

 private:
  StoreLabelCuts cuts_;
};
using StoreLabelPrinter = StoreLabel<>;

// A carton label addressed as the reference label is, which also prints
// the number of the store the goods are for (large, and under (90)).
template <class Base = LabelPrinter>
class StoreNumberLabel : public Base {
 protected:
  using Base::Base;
  bool FillValues(Procedure& proc) override {
    return Base::FillValues(proc) && ReadStoreNumber(proc, this->pack_, this->values_);
  }
};

}  // namespace quendal
