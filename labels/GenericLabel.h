// The "Generic" carton label, shared by StarTrack's and Toll's classes for
// any retailer: 600 x 400, the sender and carrier at the top, the receiver
// block under "TO:" with the store's reference large above it, order and
// date blocks in the middle, the ATL and ship-to barcodes above the SSCC
// barcode at the bottom. The classes differ in the format's number and in
// what the ship-to barcode carries. Other formats borrow its pieces.
#pragma once

#include <array>

#include "labels/Elements.h"
#include "labels/LabelPrinter.h"

namespace quendal {

inline constexpr std::array<vpcl::Packet, 34> kGenericPackets = {
    vpcl::Line{547, 2, 547, 390, 6},
    vpcl::Text{533, 5, 1, 1, 1, 'O', 'L', 0, "FROM:"},
    vpcl::Field{1, 50, 532, 48, 1, 1, 1, 'O', 'L'},
    vpcl::Field{10, 50, 520, 5, 1, 1, 1, 'O', 'L'},
    vpcl::Field{2, 50, 508, 5, 1, 1, 1, 'O', 'L'},
    vpcl::Field{3, 50, 508, 130, 1, 1, 1, 'O', 'L'},
    vpcl::Text{528, 250, 1, 1, 1, 'O', 'L', 0, "CARRIER:"},
    vpcl::Field{4, 50, 512, 250, 1, 1, 1, 'O', 'L'},
    vpcl::Text{493, 250, 1, 1, 1, 'O', 'L', 0, "CONNOTE:"},
    vpcl::Field{5, 50, 469, 250, 1, 2, 1, 'O', 'L'},
    vpcl::Text{483, 5, 1, 2, 1, 'O', 'L', 0, "TO:"},
    vpcl::Field{6, 50, 458, 5, 1, 2, 1, 'O', 'L'},
    vpcl::Field{11, 50, 438, 5, 1, 2, 1, 'O', 'L'},
    vpcl::Field{7, 50, 418, 5, 1, 2, 1, 'O', 'L'},
    vpcl::Field{8, 50, 398, 5, 1, 2, 1, 'O', 'L'},
    vpcl::Field{9, 50, 476, 55, 1, 3, 1, 'O', 'L'},
    vpcl::Barcode{15, 27, 'V', 262, 40, 4, 60},
    vpcl::Field{16, 50, 247, 50, 1, 1, 1, 'B', 'L'},
    vpcl::Barcode{17, 27, 'V', 182, 40, 4, 60},
    vpcl::Field{18, 50, 167, 50, 1, 1, 1, 'B', 'L'},
    vpcl::Field{19, 50, 336, 180, 1, 2, 1, 'B', 'L'},
    vpcl::Field{20, 25, 380, 160, 1, 2, 1, 'B', 'R'},
    vpcl::Field{21, 25, 360, 160, 1, 2, 1, 'B', 'R'},
    vpcl::Barcode{24, 21, 'V', 25, 40, 4, 135},
    vpcl::Field{25, 50, 10, 50, 1, 1, 1, 'B', 'L'},
    vpcl::Field{26, 50, 353, 20, 1, 2, 1, 'B', 'L'},
    vpcl::Field{27, 50, 333, 20, 1, 2, 1, 'B', 'L'},
    vpcl::Field{28, 50, 577, 5, 3, 1, 1, 'B', 'L'},
    vpcl::Field{29, 50, 577, 270, 3, 1, 1, 'B', 'L'},
    vpcl::Field{30, 50, 557, 230, 3, 1, 1, 'B', 'L'},
    vpcl::Field{31, 50, 370, 5, 1, 1, 1, 'B', 'L'},
    vpcl::Field{32, 50, 355, 5, 1, 1, 1, 'B', 'L'},
    vpcl::Field{33, 50, 340, 5, 1, 1, 1, 'B', 'L'},
    vpcl::Field{34, 50, 557, 5, 3, 1, 1, 'B', 'L'},
};

namespace generic {
using V = const LabelValues&;
constexpr bool AuthorityToLeave(V v) { return v.AuthorityToLeave; }

// The pieces of the "Generic" label that other formats lay out too: the
// sender and carrier block, and batch fields numbered as "Generic" numbers
// them, in groups. A format joins the pieces it lays out and adds its own.
// Under a heavy line, the sender on the left (FROM: and fields 1, 10, 2, 3)
// and the carrier on the right (CARRIER: and field 4); `row` is the row of
// the captions, the lines below follow 12 rows apart.
constexpr std::array<vpcl::Packet, 8> SenderBlock(int row) {
  return {{
      vpcl::Line{row + 13, 2, row + 13, 398, 6},
      vpcl::Text{row, 5, 1, 1, 1, 'O', 'L', 0, "FROM:"},
      vpcl::Field{1, 25, row, 48, 1, 1, 1, 'O', 'L'},
      vpcl::Field{10, 25, row - 12, 5, 1, 1, 1, 'O', 'L'},
      vpcl::Field{2, 25, row - 24, 5, 1, 1, 1, 'O', 'L'},
      vpcl::Field{3, 3, row - 24, 150, 1, 1, 1, 'O', 'L'},
      vpcl::Text{row, 230, 1, 1, 1, 'O', 'L', 0, "CARRIER:"},
      vpcl::Field{4, 20, row - 12, 230, 1, 1, 1, 'B', 'L'},
  }};
}

// 1-8: sender, carrier, consignment and receiver.
inline constexpr std::array<BatchField, 8> kPartyFields = {{
    {1, &LabelValues::FromName},
    {2, &LabelValues::FromLine3},
    {3, &LabelValues::FromState},
    {4, &LabelValues::CarrierName},
    {5, &LabelValues::ConNoteNo},
    {6, &LabelValues::ToName},
    {7, &LabelValues::ToAddress2},
    {8, [](V v) { return v.ToSuburb + " " + v.ToState + " " + v.ToPostcode; }},
}};
// 10, 11: the sender's and the receiver's first address lines.
inline constexpr std::array<BatchField, 2> kFirstLineFields = {{
    {10, &LabelValues::FromLine2},
    {11, &LabelValues::ToAddress1},
}};
// 1-8, 10, 11.
inline constexpr auto kAddressFields = vpcl::Join(kPartyFields, kFirstLineFields);

// 12, 13: the receiver's postcode and state, printed large.
inline constexpr std::array<BatchField, 2> kPostcodeFields = {{
    {12, &LabelValues::ToPostcode},
    {13, &LabelValues::ToState},
}};

// 20, 21: the purchase and sales order lines.
inline constexpr std::array<BatchField, 2> kOrderFields = {{
    {20, &LabelValues::OrderLine},
    {21, &LabelValues::SalesOrderLine},
}};

// 26-34: free lines, the destination and service lines, dates, "C/N:".
inline constexpr std::array<BatchField, 9> kTailFields = {{
    {26, &LabelValues::UserText1},
    {27, &LabelValues::UserText2},
    {28, &LabelValues::ToSuburbUpper},
    {29, &LabelValues::PostcodeServiceLine},
    {30, &LabelValues::ServiceLine},
    {31, &LabelValues::PackedLine},
    {32, &LabelValues::NotBeforeLine},
    {33, &LabelValues::NotAfterLine},
    {34, [](V v) { return "C/N:" + v.ConNoteNo; }},
}};

// 19, 24, 25: the SSCC's line, its (00) barcode and the line under it.
inline constexpr std::array<BatchField, 3> kSsccFields = {{
    {19, elements::SsccLine},
    {24, elements::Sscc},
    {25, elements::SsccLine},
}};
}  // namespace generic

// The "Generic" batch: the ship-to barcode (17) and its line (18) carry
// what the class's element strings say; the ATL barcode (15, 16) goes only
// with authority-to-leave consignments.
constexpr std::array<BatchField, 29> GenericBatch(BatchField::Data shipTo,
                                                  BatchField::Data shipToLine) {
  using generic::V;
  const std::array<BatchField, 1> store = {{{9, &LabelValues::StoreText}}};
  const std::array<BatchField, 5> barcodes = {{
      {15, &LabelValues::ATLNumber, generic::AuthorityToLeave},
      {16, [](V v) { return v.ATLNumber + "     ATL"; }, generic::AuthorityToLeave},
      {17, shipTo},
      {18, shipToLine},
      {19, elements::SsccLine},
  }};
  const std::array<BatchField, 2> sscc = {{{24, elements::Sscc}, {25, elements::SsccLine}}};
  return vpcl::Join(generic::kPartyFields, store, generic::kFirstLineFields, barcodes,
                    generic::kOrderFields, sscc, generic::kTailFields);
}

}  // namespace quendal
