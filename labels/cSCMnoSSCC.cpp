#include "labels/cSCMnoSSCC.h"

#include <variant>

#include "labels/DfeLabel.h"

namespace quendal {

namespace {

using namespace vpcl;

// Hundredths of an inch in tenths of a millimetre.
constexpr int Metric(int v) { return (v * 254 + 50) / 100; }

struct ToMetric {
  constexpr Packet operator()(Line p) const {
    return Line{Metric(p.row1), Metric(p.column1), Metric(p.row2), Metric(p.column2),
                Metric(p.thickness)};
  }
  constexpr Packet operator()(Box p) const {
    return Box{Metric(p.row1),    Metric(p.column1),   Metric(p.row2),
               Metric(p.column2), Metric(p.thickness), p.pattern};
  }
  constexpr Packet operator()(Text p) const {
    p.row = Metric(p.row);
    p.column = Metric(p.column);
    return p;
  }
  constexpr Packet operator()(Field p) const {
    p.row = Metric(p.row);
    p.column = Metric(p.column);
    return p;
  }
  constexpr Packet operator()(Barcode p) const {
    p.row = Metric(p.row);
    p.column = Metric(p.column);
    p.height = Metric(p.height);
    return p;
  }
  constexpr Packet operator()(FixedData p) const { return p; }
  constexpr Packet operator()(Graphic p) const {
    return Graphic{p.number, Metric(p.row), Metric(p.column)};
  }
};

template <std::size_t N, std::size_t... I>
constexpr std::array<Packet, N> InMetric(const std::array<Packet, N>& packets,
                                         std::index_sequence<I...>) {
  return {{std::visit(ToMetric{}, packets[I])...}};
}

// The DFE label's body measured in millimetres, for the same 8 x 4 inch
// stock; its header carries the metric unit letter.
constexpr auto kPackets = InMetric(kDfeBody, std::make_index_sequence<kDfeBody.size()>());

constexpr LabelLayout kLayout{kDfeNumber, vpcl::Format{"DFESCM", 2000, 1016, kPackets, 'M'},
                              kDfeBatch};

}  // namespace

clsSCMnoSSCC::clsSCMnoSSCC() : LabelPrinter("clsSCMnoSSCC", kLayout) {}

std::unique_ptr<Component> MakeSCMnoSSCC() { return std::make_unique<clsSCMnoSSCC>(); }

}  // namespace quendal
