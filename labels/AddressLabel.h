// The top of the carton labels addressed to a delivery address ("MayneGen",
// "1djscm"): the sender, carrier, consignment and service; under "DELIVER
// TO:" the address, with the number of the store the goods are for large
// beside it. Fields 1-12 are numbered alike in these formats; each format
// lays out the rest of its label from row 445 down.
#pragma once

#include <array>
#include <string>

#include "labels/Elements.h"
#include "labels/StoreLabel.h"

namespace quendal {

namespace address {
using namespace vpcl;
inline constexpr auto kTop = std::to_array<Packet>({
    Text{585, 5, 1, 1, 1, 'O', 'L', 0, "FROM:"},
    Field{1, 25, 585, 45, 1, 1, 1, 'O', 'L'},
    Field{2, 25, 573, 45, 1, 1, 1, 'O', 'L'},
    Field{3, 25, 561, 45, 1, 1, 1, 'O', 'L'},
    Field{4, 3, 561, 170, 1, 1, 1, 'O', 'L'},
    Text{585, 215, 1, 1, 1, 'O', 'L', 0, "CARRIER:"},
    Field{5, 20, 585, 280, 1, 1, 1, 'B', 'L'},
    Text{573, 215, 1, 1, 1, 'O', 'L', 0, "CON NOTE:"},
    Field{6, 13, 573, 280, 1, 1, 1, 'B', 'L'},
    Field{7, 30, 561, 215, 1, 1, 1, 'O', 'L'},
    Line{552, 2, 552, 398, 4},
    Text{535, 5, 1, 1, 1, 'O', 'L', 0, "DELIVER TO:"},
    Field{8, 40, 517, 5, 1, 1, 2, 'B', 'L'},
    Field{9, 40, 497, 5, 1, 1, 2, 'O', 'L'},
    Field{10, 40, 477, 5, 1, 1, 2, 'O', 'L'},
    Field{11, 45, 456, 5, 1, 1, 2, 'B', 'L'},
    Text{535, 290, 1, 1, 1, 'O', 'L', 0, "STORE"},
    Field{12, 4, 478, 290, 3, 2, 3, 'B', 'L'},
    Line{448, 2, 448, 398, 2},
});

using V = const LabelValues&;
inline std::string ToPlace(V v) { return v.ToSuburb + " " + v.ToState + " " + v.ToPostcode; }

inline constexpr auto kTopBatch = std::to_array<BatchField>({
    {1, &LabelValues::FromName},
    {2, &LabelValues::FromLine2},
    {3, &LabelValues::FromLine3},
    {4, &LabelValues::FromState},
    {5, &LabelValues::CarrierName},
    {6, &LabelValues::ConNoteNo},
    {7, &LabelValues::ServiceLine},
    {8, &LabelValues::ToName},
    {9, &LabelValues::ToAddress1},
    {10, &LabelValues::ToAddress2},
    {11, ToPlace},
    {12, &LabelValues::StoreText},
});

}  // namespace address

// An address label format: the common top, then the format's own rows.
template <std::size_t N>
constexpr auto AddressLabelFormat(const std::array<vpcl::Packet, N>& rest) {
  return vpcl::Join(address::kTop, rest);
}
// Its batch: the top's fields 1-12, then the format's own.
template <std::size_t N>
constexpr auto AddressLabelBatch(const std::array<BatchField, N>& rest) {
  return vpcl::Join(address::kTopBatch, rest);
}

// An address label class: the reference values and the store's number.
using AddressLabelPrinter = StoreNumberLabel<>;

}  // namespace quendal
