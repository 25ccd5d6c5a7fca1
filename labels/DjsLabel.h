// The David Jones carton label "1djscm", shared by the carriers that
// deliver to David Jones stores (and by StarTrack's Spotlight label): 600 x
// 400, the address label's top; the department, order and dates; the
// ship-to barcode above the SSCC barcode. The classes differ in the
// format's number and in what the ship-to barcode carries: (421)(90),
// (421) or (90).
#pragma once

#include "labels/AddressLabel.h"

namespace quendal {

namespace djs {
using namespace vpcl;
inline constexpr auto kRest = std::to_array<Packet>({
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
}  // namespace djs

inline constexpr auto kDjsPackets = AddressLabelFormat(djs::kRest);

// The "1djscm" batch; shipTo and shipToLine fill the ship-to barcode (21)
// and its line (22).
constexpr auto DjsBatch(BatchField::Data shipTo, BatchField::Data shipToLine) {
  return AddressLabelBatch(std::to_array<BatchField>({
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
  }));
}

}  // namespace quendal
