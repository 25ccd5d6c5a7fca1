// The David Jones carton label "1djscm", shared by the carriers that
// deliver to David Jones stores (and by StarTrack's Spotlight label): 600 x
// 400, the sender and carrier at the top, the delivery address with the
// store's number large beside it, the department, order and dates, the
// ship-to barcode above the SSCC barcode. The classes differ in the
// format's number and in what the ship-to barcode carries: (421)(90),
// (421) or (90).
#pragma once

#include <array>

#include "labels/Elements.h"
#include "labels/StoreLabel.h"

namespace quendal {

namespace djs {
using namespace vpcl;
inline constexpr auto kPackets = std::to_array<Packet>({
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
    Text{430, 5, 1, 1, 1, 'O', 'L', 0, "DEPT:"},
    Field{13, 30, 420, 50, 1, 2, 2, 'B', 'L'},
    Field{14, 25, 395, 5, 1, 1, 2, 'B', 'L'},
    Field{15, 25, 395, 210, 1, 1, 2, 'B', 'L'},
    Field{16, 30, 378, 5, 1, 1, 1, 'B', 'L'},
    Field{17, 30, 366, 5, 1, 1, 1, 'B', 'L'},
    Field{18, 30, 354, 5, 1, 1, 1, 'B', 'L'},
    Field{19, 30, 378, 210, 1, 1, 1, 'B', 'L'},
    Field{20, 30, 366, 210, 1, 1, 1, 'B', 'L'},
    Line{345, 2, 345, 398, 2},
    Barcode{21, 30, 'V', 210, 40, 4, 115},
    Field{22, 40, 193, 60, 1, 1, 1, 'B', 'L'},
    Barcode{23, 21, 'V', 40, 40, 4, 130},
    Field{24, 22, 20, 60, 1, 1, 2, 'B', 'L'},
});

using V = const LabelValues&;
inline std::string ToPlace(V v) { return v.ToSuburb + " " + v.ToState + " " + v.ToPostcode; }
}  // namespace djs

// The "1djscm" batch; shipTo and shipToLine fill the ship-to barcode (21)
// and its line (22).
constexpr auto DjsBatch(BatchField::Data shipTo, BatchField::Data shipToLine) {
  return std::to_array<BatchField>({
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
      {11, djs::ToPlace},
      {12, &LabelValues::StoreText},
      {13, &LabelValues::StoreZoneDept},
      {14, &LabelValues::OrderLine},
      {15, &LabelValues::SalesOrderLine},
      {16, &LabelValues::PackedLine},
      {17, &LabelValues::NotBeforeLine},
      {18, &LabelValues::NotAfterLine},
      {19, &LabelValues::UserText1},
      {20, &LabelValues::UserText2},
      {21, shipTo},
      {22, shipToLine},
      {23, elements::Sscc},
      {24, elements::SsccLine},
  });
}

// A "1djscm" class: the reference values and the store's number.
using DjsLabelPrinter = StoreNumberLabel<>;

}  // namespace quendal
