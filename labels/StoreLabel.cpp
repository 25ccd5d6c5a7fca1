#include "labels/StoreLabel.h"

#include "frame/VB.h"
#include "frame/host/Read.h"

namespace quendal {

namespace {

using V = const LabelValues&;
bool HasPanel(V v) { return !v.PanelText.empty(); }

// A store's number as the labels print it: four digits.
std::string StoreNumber(const Ref<host::Receiver>& store) {
  return Format(host::Read(store, &host::Receiver::StoreCode), "0000");
}

}  // namespace

const std::array<zpl::Piece, 37> kStoreLabelZpl = {{
    {"^XA^MCY^XZ^XA^SZ2^MMT^MTT~JSN^LT0^MD0^MNY^PRA^PON^PMN^CI0^LRN"},
    {"^FO224,102^A0N,75,68^FD", &LabelValues::LocationNumber},
    // A filled box behind the panel text, only when there is one.
    {"^FO601,390^GB132,0,118^FS", HasPanel},
    {"^FO611,400^A0N,114,117^FR^FD", &LabelValues::PanelText},
    {"^FO412,78^A0N,17,17^FD", &LabelValues::BillOfLading},
    {"^FO412,49^A0N,17,17^FD", &LabelValues::ConNoteNo},
    {"^FO408,7^A0N,33,34^FD", &LabelValues::CarrierName},
    {"^FO328,66^A0N,33,17^FDB/L No:^FS"},
    {"^FO328,36^A0N,33,17^FDCon No:^FS"},
    {"^FO328,3^A0N,33,17^FDCARRIER:^FS"},
    {"^FO90,57^A0N,33,17^FD", [](V v) { return v.FromLine3 + v.FromState; }},
    {"^FO93,18^A0N,33,17^FD", &LabelValues::FromName},
    {"^FO24,18^A0N,33,17^FDFROM:^FS"},
    {"^FO191,518^A0N,49,51^FD", &LabelValues::StoreZoneDept},
    {"^FO191,461^A0N,49,51^FD", &LabelValues::ZoneDeptC},
    {"^FO191,373^A0N,65,51^FDSTORE ZONE/DEPT^FS"},
    {"^FO48,465^A0N,98,51^FD", &LabelValues::ZoneDeptB},
    {"^FO66,367^A0N,98,51^FD", &LabelValues::ZoneDeptA},
    {"^FO24,200^A0N,33,17^FD", &LabelValues::ReceiverPostcode},
    {"^FO24,155^A0N,33,17^FD", &LabelValues::ReceiverLine},
    {"^FO81,102^A0N,49,17^FD", &LabelValues::LocationCode},
    {"^FO24,84^A0N,65,34^FDTO:^FS"},
    // The store's postcode twice on its line.
    {"^FO569,199^A0N,33,17^FD", &LabelValues::ForPostcode},
    {"^FO379,199^A0N,33,17^FD", &LabelValues::ForPostcode},
    {"^FO379,155^A0N,33,17^FD", &LabelValues::ForLine},
    {"^FO459,102^A0N,49,17^FD", &LabelValues::ForName},
    {"^FO379,102^A0N,49,34^FDFOR:^FS"},
    {"^FO45,319^A0N,33,34^FD00", &LabelValues::SSCC},
    {"^FO45,289^A0N,33,34^FDSSCC^FS"},
    {"^FO453,248^A0N,33,17^FD", &LabelValues::PurchaseOrderLine},
    {"^FO379,248^A0N,33,34^FDPO:^FS"},
    {"^FO616,81^A0N,94,68^FD", &LabelValues::StoreText},
    // Barcodes print no interpretation line: the lines above them do.
    {"^FO82,882^A0N,19,34^FV(421)",
     [](V v) { return v.CountryCode + v.ReceiverPostcode + "(90)" + v.StoreText; }},
    {"^BY4,,305^FO45,575^BCN,,N,N,N,N^FV>;>8421",
     [](V v) { return v.CountryCode + v.ReceiverPostcode + ">890" + v.StoreText; }},
    {"^FO82,1166^A0N,19,34^FV(00)", &LabelValues::SSCC},
    {"^BY4,,234^FO42,924^BCN,,N,N,N,N^FV>;>800", &LabelValues::SSCC},
    {"^PQ1,0,0,N^MCN^XZ"},
}};

bool ReadStoreLabelValues(Procedure& proc, const Ref<host::Pack>& pack, LabelValues& v,
                          StoreLabelCuts cuts) {
  using host::Read;
  Ref<host::Receiver> location;
  Ref<host::Despatch> despatch;
  return proc([&] {
           v.ConNoteNo = Left(v.ConNoteNo, 12);
           v.CarrierName = Left(v.CarrierName, 15);
         }) &&
         // Without an advance shipping notice there is no consignment to print.
         proc([&] {
           if (!pack->ASNId().IsNull())
             v.BillOfLading = Left(pack->ConNote()->BillOfLading().Text(), 12);
         }) &&
         proc([&] { location = pack->Receiver(); }) &&
         proc([&] {
           v.LocationNumber = Format(Read(location, &host::Receiver::StoreCode), "0000");
           v.LocationCode = UCase(Left(Trim(Read(location, &host::Receiver::City).Text()),
                                       cuts.locationCode));
           v.ReceiverLine = UCase(Left(Trim(Read(location, &host::Receiver::Name).Text()), 30));
           v.ReceiverPostcode = Left(Read(location, &host::Receiver::Postcode).Text(), 4);
         }) &&
         proc([&] {
           const Ref<host::Receiver> store = pack->ShipTo();
           v.ForName = UCase(Left(Trim(Read(store, &host::Receiver::Name).Text()), cuts.storeName));
           v.ForLine = UCase(Left(Trim(Read(store, &host::Receiver::AddressLine2).Text()), 15));
           v.ForPostcode = Left(Read(store, &host::Receiver::Postcode).Text(), 4);
           v.StoreText = StoreNumber(store);
         }) &&
         proc([&] { despatch = pack->Despatch(); }) &&
         proc([&] {
           v.ZoneDeptA = Read(despatch, &host::Despatch::ZoneDeptA).Text();
           v.ZoneDeptB = Left(Read(despatch, &host::Despatch::ZoneDeptB).Text(), 4);
           v.ZoneDeptC = Left(Read(despatch, &host::Despatch::ZoneDeptC).Text(), 15);
         }) &&
         // The retailer's order number without its release suffix.
         proc([&] {
           std::string number = Read(despatch, &host::Despatch::DespatchNo).Text();
           if (const long release = InStr(number, " REL# "); release > 0) number = Left(number, release - 1);
           v.PurchaseOrderLine = "PO " + Left(number, 22);
         });
}

bool ReadStoreNumber(Procedure& proc, const Ref<host::Pack>& pack, LabelValues& v) {
  return proc([&] { v.StoreText = StoreNumber(pack->ShipTo()); });
}

}  // namespace quendal
