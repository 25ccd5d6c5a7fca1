#include "labels/cStarTrackGenericSCM.h"

#include <array>

#include "frame/VB.h"
#include "labels/Gs1.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400: sender and carrier at the top, the receiver block under "TO:",
// order and date blocks in the middle, the ATL and ship-to barcodes above
// the SSCC barcode at the bottom.
constexpr std::array<Packet, 34> kPackets = {
    Line{547, 2, 547, 390, 6},
    Text{533, 5, 1, 1, 1, 'O', 'L', 0, "FROM:"},
    Field{1, 50, 532, 48, 1, 1, 1, 'O', 'L'},
    Field{10, 50, 520, 5, 1, 1, 1, 'O', 'L'},
    Field{2, 50, 508, 5, 1, 1, 1, 'O', 'L'},
    Field{3, 50, 508, 130, 1, 1, 1, 'O', 'L'},
    Text{528, 250, 1, 1, 1, 'O', 'L', 0, "CARRIER:"},
    Field{4, 50, 512, 250, 1, 1, 1, 'O', 'L'},
    Text{493, 250, 1, 1, 1, 'O', 'L', 0, "CONNOTE:"},
    Field{5, 50, 469, 250, 1, 2, 1, 'O', 'L'},
    Text{483, 5, 1, 2, 1, 'O', 'L', 0, "TO:"},
    Field{6, 50, 458, 5, 1, 2, 1, 'O', 'L'},
    Field{11, 50, 438, 5, 1, 2, 1, 'O', 'L'},
    Field{7, 50, 418, 5, 1, 2, 1, 'O', 'L'},
    Field{8, 50, 398, 5, 1, 2, 1, 'O', 'L'},
    Field{9, 50, 476, 55, 1, 3, 1, 'O', 'L'},
    Barcode{15, 27, 'V', 262, 40, 4, 60},
    Field{16, 50, 247, 50, 1, 1, 1, 'B', 'L'},
    Barcode{17, 27, 'V', 182, 40, 4, 60},
    Field{18, 50, 167, 50, 1, 1, 1, 'B', 'L'},
    Field{19, 50, 336, 180, 1, 2, 1, 'B', 'L'},
    Field{20, 25, 380, 160, 1, 2, 1, 'B', 'R'},
    Field{21, 25, 360, 160, 1, 2, 1, 'B', 'R'},
    Barcode{24, 21, 'V', 25, 40, 4, 135},
    Field{25, 50, 10, 50, 1, 1, 1, 'B', 'L'},
    Field{26, 50, 353, 20, 1, 2, 1, 'B', 'L'},
    Field{27, 50, 333, 20, 1, 2, 1, 'B', 'L'},
    Field{28, 50, 577, 5, 3, 1, 1, 'B', 'L'},
    Field{29, 50, 577, 270, 3, 1, 1, 'B', 'L'},
    Field{30, 50, 557, 230, 3, 1, 1, 'B', 'L'},
    Field{31, 50, 370, 5, 1, 1, 1, 'B', 'L'},
    Field{32, 50, 355, 5, 1, 1, 1, 'B', 'L'},
    Field{33, 50, 340, 5, 1, 1, 1, 'B', 'L'},
    Field{34, 50, 557, 5, 3, 1, 1, 'B', 'L'},
};

constexpr bool AuthorityToLeave(const LabelValues& v) { return v.AuthorityToLeave; }

using V = const LabelValues&;
constexpr std::array<BatchField, 29> kBatch = {{
    {1, &LabelValues::FromName},
    {2, &LabelValues::FromLine3},
    {3, &LabelValues::FromState},
    {4, &LabelValues::CarrierName},
    {5, &LabelValues::ConNoteNo},
    {6, &LabelValues::ToName},
    {7, &LabelValues::ToAddress2},
    {8, [](V v) { return v.ToSuburb + " " + v.ToState + " " + v.ToPostcode; }},
    {9, &LabelValues::StoreText},
    {10, &LabelValues::FromLine2},
    {11, &LabelValues::ToAddress1},
    {15, &LabelValues::ATLNumber, AuthorityToLeave},
    {16, [](V v) { return v.ATLNumber + "     ATL"; }, AuthorityToLeave},
    {17, [](V v) { return gs1::ShipToData(v.CountryCode, v.ToPostcode); }},
    {18, [](V v) { return gs1::ShipToText(v.CountryCode, v.ToPostcode); }},
    {19, [](V v) { return gs1::SsccText(v.SSCC); }},
    {20, &LabelValues::OrderLine},
    {21, &LabelValues::SalesOrderLine},
    {24, [](V v) { return gs1::SsccData(v.SSCC); }},
    {25, [](V v) { return gs1::SsccText(v.SSCC); }},
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

constexpr LabelLayout kLayout{"430", vpcl::Format{"Generic", 600, 400, kPackets}, kBatch};

}  // namespace

clsStarTrackGenericSCM::clsStarTrackGenericSCM() : LabelPrinter("clsStarTrackGenericSCM", kLayout) {}

std::unique_ptr<Component> MakeStarTrackGenericSCM() {
  return std::make_unique<clsStarTrackGenericSCM>();
}

}  // namespace quendal
