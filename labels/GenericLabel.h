// What the formats that print the reference values share: the sender and
// carrier block, and the batch fields, numbered as the "Generic" format
// numbers them, in groups. A format joins the pieces it lays out and adds
// its own.
#pragma once

#include <array>

#include "labels/Gs1.h"
#include "labels/LabelPrinter.h"

namespace quendal::generic {

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

using V = const LabelValues&;

// 1-8, 10, 11: sender, carrier, consignment and receiver.
inline constexpr std::array<BatchField, 10> kAddressFields = {{
    {1, &LabelValues::FromName},
    {2, &LabelValues::FromLine3},
    {3, &LabelValues::FromState},
    {4, &LabelValues::CarrierName},
    {5, &LabelValues::ConNoteNo},
    {6, &LabelValues::ToName},
    {7, &LabelValues::ToAddress2},
    {8, [](V v) { return v.ToSuburb + " " + v.ToState + " " + v.ToPostcode; }},
    {10, &LabelValues::FromLine2},
    {11, &LabelValues::ToAddress1},
}};

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
    {19, [](V v) { return gs1::SsccText(v.SSCC); }},
    {24, [](V v) { return gs1::SsccData(v.SSCC); }},
    {25, [](V v) { return gs1::SsccText(v.SSCC); }},
}};

}  // namespace quendal::generic
