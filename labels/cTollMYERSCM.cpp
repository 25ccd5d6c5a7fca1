#include "labels/cTollMYERSCM.h"

#include "labels/Gs1.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400: sender and carrier at the top; the store the goods are for
// first, its number large, then TO the distribution centre; the SSCC, order
// and zone block; the (421)(90) barcode, the dates and the SSCC barcode at
// the bottom.
constexpr std::array<Packet, 44> kPackets = {
    Line{555, 2, 555, 398, 4},
    Text{585, 5, 1, 1, 1, 'O', 'L', 0, "FROM:"},
    Field{1, 25, 585, 40, 1, 1, 1, 'O', 'L'},
    Field{2, 25, 573, 40, 1, 1, 1, 'O', 'L'},
    Field{3, 3, 573, 170, 1, 1, 1, 'O', 'L'},
    Text{585, 200, 1, 1, 1, 'O', 'L', 0, "CARRIER:"},
    Field{4, 15, 585, 250, 1, 1, 1, 'B', 'L'},
    Text{573, 200, 1, 1, 1, 'O', 'L', 0, "CON NO:"},
    Field{5, 12, 573, 250, 1, 1, 1, 'B', 'L'},
    Text{561, 200, 1, 1, 1, 'O', 'L', 0, "B/L NO:"},
    Field{6, 12, 561, 250, 1, 1, 1, 'B', 'L'},
    Text{530, 5, 1, 2, 2, 'O', 'L', 0, "FOR:"},
    Field{7, 4, 515, 60, 3, 2, 2, 'B', 'L'},
    Field{8, 30, 530, 170, 1, 1, 2, 'B', 'L'},
    Field{9, 15, 515, 170, 1, 1, 1, 'O', 'L'},
    Field{10, 4, 503, 170, 1, 1, 1, 'O', 'L'},
    Line{495, 2, 495, 398, 2},
    Text{472, 5, 1, 2, 2, 'O', 'L', 0, "TO:"},
    Field{11, 10, 472, 40, 1, 1, 2, 'B', 'L'},
    Field{12, 4, 472, 100, 3, 1, 1, 'B', 'L'},
    Field{13, 30, 472, 170, 1, 1, 1, 'O', 'L'},
    Field{14, 4, 460, 170, 1, 1, 1, 'O', 'L'},
    Line{452, 2, 452, 398, 2},
    Text{437, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{15, 22, 437, 40, 1, 2, 1, 'B', 'L'},
    Text{425, 5, 1, 1, 1, 'O', 'L', 0, "PO:"},
    Field{16, 25, 425, 40, 1, 1, 1, 'B', 'L'},
    Field{17, 4, 412, 330, 3, 1, 2, 'W', 'L'},
    Text{410, 5, 1, 1, 1, 'O', 'L', 0, "STORE ZONE/DEPT"},
    Field{18, 4, 370, 5, 3, 2, 2, 'B', 'L'},
    Field{19, 4, 370, 80, 3, 2, 2, 'B', 'L'},
    Field{20, 15, 395, 200, 1, 1, 1, 'B', 'L'},
    Field{21, 30, 372, 200, 1, 1, 2, 'B', 'L'},
    Line{362, 2, 362, 398, 2},
    Barcode{22, 30, 'V', 235, 40, 4, 115},
    Field{23, 40, 220, 60, 1, 1, 1, 'B', 'L'},
    Field{24, 30, 203, 5, 1, 1, 1, 'B', 'L'},
    Field{25, 30, 191, 5, 1, 1, 1, 'B', 'L'},
    Field{26, 30, 179, 5, 1, 1, 1, 'B', 'L'},
    Field{27, 30, 203, 200, 1, 1, 1, 'B', 'L'},
    Field{28, 30, 191, 200, 1, 1, 1, 'B', 'L'},
    Field{29, 30, 179, 200, 1, 1, 1, 'B', 'L'},
    Barcode{30, 21, 'V', 40, 40, 4, 125},
    Field{31, 22, 22, 60, 1, 2, 1, 'B', 'L'},
};

using V = const LabelValues&;
constexpr std::array<BatchField, 31> kBatch = {{
    {1, &LabelValues::FromName},
    {2, &LabelValues::FromLine3},
    {3, &LabelValues::FromState},
    {4, &LabelValues::CarrierName},
    {5, &LabelValues::ConNoteNo},
    {6, &LabelValues::BillOfLading},
    {7, &LabelValues::StoreText},
    {8, &LabelValues::ForName},
    {9, &LabelValues::ForLine},
    {10, &LabelValues::ForPostcode},
    {11, &LabelValues::LocationCode},
    {12, &LabelValues::LocationNumber},
    {13, &LabelValues::ReceiverLine},
    {14, &LabelValues::ReceiverPostcode},
    {15, [](V v) { return gs1::SsccText(v.SSCC); }},
    {16, &LabelValues::PurchaseOrderLine},
    {17, &LabelValues::PanelText},
    {18, &LabelValues::ZoneDeptA},
    {19, &LabelValues::ZoneDeptB},
    {20, &LabelValues::ZoneDeptC},
    {21, &LabelValues::StoreZoneDept},
    {22, [](V v) { return gs1::ShipToReferenceData(v.CountryCode, v.ReceiverPostcode, v.StoreText); }},
    {23, [](V v) { return gs1::ShipToReferenceText(v.CountryCode, v.ReceiverPostcode, v.StoreText); }},
    {24, &LabelValues::PackedLine},
    {25, &LabelValues::NotBeforeLine},
    {26, &LabelValues::NotAfterLine},
    {27, &LabelValues::UserText1},
    {28, &LabelValues::UserText2},
    {29, &LabelValues::SalesOrderLine},
    {30, [](V v) { return gs1::SsccData(v.SSCC); }},
    {31, [](V v) { return gs1::SsccText(v.SSCC); }},
}};

const LabelLayout kLayout{"650", vpcl::Format{"MYERDC", 600, 400, kPackets}, kBatch, kStoreLabelZpl};

}  // namespace

clsTollMYERSCM::clsTollMYERSCM() : StoreLabelPrinter("clsTollMYERSCM", kLayout, {10, 30}) {}

std::unique_ptr<Component> MakeTollMYERSCM() { return std::make_unique<clsTollMYERSCM>(); }

}  // namespace quendal
