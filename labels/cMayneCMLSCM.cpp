#include "labels/cMayneCMLSCM.h"

#include "labels/Gs1.h"

namespace quendal {

namespace {

using namespace vpcl;

// 600 x 400: sender and carrier at the top; TO the distribution centre on
// the left and FOR the store on the right with its number large; the SSCC,
// order and zone block; the (421)(90) barcode, the dates and the SSCC
// barcode at the bottom.
constexpr std::array<Packet, 43> kPackets = {
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
    Text{530, 5, 1, 2, 2, 'O', 'L', 0, "TO:"},
    Field{7, 7, 530, 40, 1, 1, 2, 'B', 'L'},
    Field{8, 4, 515, 110, 3, 1, 2, 'B', 'L'},
    Field{9, 30, 503, 5, 1, 1, 1, 'O', 'L'},
    Field{10, 4, 491, 5, 1, 1, 1, 'O', 'L'},
    Text{530, 200, 1, 2, 2, 'O', 'L', 0, "FOR:"},
    Field{11, 15, 530, 240, 1, 1, 2, 'B', 'L'},
    Field{12, 4, 515, 330, 3, 1, 2, 'B', 'L'},
    Field{13, 15, 503, 200, 1, 1, 1, 'O', 'L'},
    Field{14, 4, 491, 200, 1, 1, 1, 'O', 'L'},
    Line{485, 2, 485, 398, 2},
    Text{470, 5, 1, 1, 1, 'O', 'L', 0, "SSCC"},
    Field{15, 22, 470, 40, 1, 2, 1, 'B', 'L'},
    Text{455, 5, 1, 1, 1, 'O', 'L', 0, "PO:"},
    Field{16, 25, 455, 40, 1, 1, 1, 'B', 'L'},
    Field{17, 4, 445, 340, 3, 1, 2, 'W', 'L'},
    Text{440, 200, 1, 1, 1, 'O', 'L', 0, "STORE ZONE/DEPT"},
    Field{18, 15, 425, 200, 1, 1, 1, 'B', 'L'},
    Field{19, 30, 405, 200, 1, 1, 2, 'B', 'L'},
    Field{20, 4, 400, 5, 3, 2, 2, 'B', 'L'},
    Field{21, 4, 400, 80, 3, 2, 2, 'B', 'L'},
    Line{390, 2, 390, 398, 2},
    Barcode{22, 30, 'V', 260, 40, 4, 120},
    Field{23, 40, 245, 60, 1, 1, 1, 'B', 'L'},
    Field{24, 30, 228, 5, 1, 1, 1, 'B', 'L'},
    Field{25, 30, 216, 5, 1, 1, 1, 'B', 'L'},
    Field{26, 30, 204, 5, 1, 1, 1, 'B', 'L'},
    Field{27, 30, 228, 200, 1, 1, 1, 'B', 'L'},
    Field{28, 30, 216, 200, 1, 1, 1, 'B', 'L'},
    Field{29, 30, 204, 200, 1, 1, 1, 'B', 'L'},
    Barcode{30, 21, 'V', 45, 40, 4, 135},
    Field{31, 22, 25, 60, 1, 2, 1, 'B', 'L'},
};

using V = const LabelValues&;
constexpr std::array<BatchField, 31> kBatch = {{
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
    {15, [](V v) { return gs1::SsccText(v.SSCC); }},
    {16, &LabelValues::PurchaseOrderLine},
    {17, &LabelValues::PanelText},
    {18, &LabelValues::ZoneDeptC},
    {19, &LabelValues::StoreZoneDept},
    {20, &LabelValues::ZoneDeptA},
    {21, &LabelValues::ZoneDeptB},
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

const LabelLayout kLayout{"10", vpcl::Format{"CMLDC", 600, 400, kPackets}, kBatch, kStoreLabelZpl};

}  // namespace

clsMayneCMLSCM::clsMayneCMLSCM() : StoreLabelPrinter("clsMayneCMLSCM", kLayout, {7, 15}) {}

std::unique_ptr<Component> MakeMayneCMLSCM() { return std::make_unique<clsMayneCMLSCM>(); }

}  // namespace quendal
