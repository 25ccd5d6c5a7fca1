// The store label for BigW stores through BigW's distribution centre,
// "BigWDC", shared by three classes that differ in the format's number and
// their element strings. BigW labels print no store zone/department, and
// the classes keep the host's ASNRequiredForSSCC setting.
#pragma once

#include <array>
#include <string>

#include "frame/Error.h"
#include "labels/StoreLabel.h"

namespace quendal {

namespace bigw {
using namespace vpcl;
// 600 x 400 between the common top and bottom: the store's number large on
// the left with its name and address beside it; the distribution centre;
// the SSCC, order and the despatch's zones.
inline constexpr auto kMiddle = std::to_array<Packet>({
    Text{538, 5, 1, 1, 1, 'O', 'L', 0, "STORE"},
    Field{12, 4, 480, 5, 3, 3, 3, 'B', 'L'},
    Field{11, 25, 530, 170, 1, 1, 2, 'B', 'L'},
    Field{13, 15, 512, 170, 1, 1, 1, 'O', 'L'},
    Field{14, 4, 500, 170, 1, 1, 1, 'O', 'L'},
    Field{17, 4, 480, 330, 3, 1, 2, 'W', 'L'},
    Line{470, 2, 470, 398, 2},
    Text{455, 5, 1, 1, 1, 'O', 'L', 0, "DELIVER TO DC:"},
    Field{7, 10, 455, 85, 1, 1, 1, 'B', 'L'},
    Field{8, 4, 455, 150, 1, 1, 1, 'B', 'L'},
    Field{9, 30, 443, 5, 1, 1, 1, 'O', 'L'},
    Field{10, 4, 443, 170, 1, 1, 1, 'O', 'L'},
    Line{435, 2, 435, 398, 2},
    Text{418, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{15, 22, 418, 50, 1, 1, 2, 'B', 'L'},
    Text{398, 5, 1, 1, 1, 'O', 'L', 0, "ORDER"},
    Field{16, 25, 398, 50, 1, 1, 2, 'B', 'L'},
    Field{18, 15, 375, 5, 1, 1, 1, 'B', 'L'},
    Text{424, 250, 1, 1, 1, 'O', 'L', 0, "DEPT"},
    Field{20, 4, 374, 250, 3, 1, 2, 'B', 'L'},
    Field{21, 4, 374, 310, 3, 1, 2, 'B', 'L'},
    Line{362, 2, 362, 398, 2},
});
}  // namespace bigw

inline constexpr auto kBigWPackets = StoreLabelFormat(bigw::kMiddle);
// The store label batch without the store zone/department (19).
inline constexpr auto kBigWBatch = BatchWithout(kStoreLabelBatch, std::array{19});
// The distribution centre's code to 10 characters, the store's name to 25.
inline constexpr StoreLabelCuts kBigWCuts{10, 25};

template <class Base = LabelPrinter>
class BigWLabel : public StoreLabel<Base>, public AsnRequiredInterface {
 public:
  bool ASNRequiredForSSCC() const override { return asnRequired_; }
  void SetASNRequiredForSSCC(bool value) override { asnRequired_ = value; }
  // A BigW label object has no store zone/department: setting one is the
  // error of a member the object does not support, and nothing is kept.
  void SetStoreZoneDept(const std::string&) override {
    this->Guard("Property (Let) StoreZoneDept")([] { throw Error(err::kNoSuchMember); });
  }

 protected:
  BigWLabel(std::string_view className, const LabelLayout& layout)
      : StoreLabel<Base>(className, layout, kBigWCuts) {}

 private:
  bool asnRequired_ = false;
};

}  // namespace quendal
