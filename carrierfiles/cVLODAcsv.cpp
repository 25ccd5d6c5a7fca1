#include "carrierfiles/cVLODAcsv.h"

#include <array>

#include "frame/VB.h"
#include "frame/host/Read.h"

namespace quendal {

namespace {

using namespace csv;

Var ScheduledDay(const CsvPack& p) {
  return Format(p.Of(&host::ConNote::ScheduledDate), "yyyymmdd");
}

// The fields a VLO map file may name, in VLO's order, and how each is
// filled for a pack; a field without a filler is written empty.
constexpr std::array kFields = {
    CsvField{"SUPPLIERNO"},
    CsvField{"CUSTOMERCODE"},
    CsvField{"SHIPNOTENO", AsnNo},
    CsvField{"SHIPNOTEDATE",
             [](const CsvPack& p) -> Var { return Format(p.Of(&host::ASN::ASNDate), "yyyymmdd"); }},
    CsvField{"SHIPNOTETIME",
             [](const CsvPack& p) -> Var { return Format(p.Of(&host::ASN::ASNDate), "hhmm"); }},
    CsvField{"SHIPNOTETYPECODE", [](const CsvPack&) -> Var { return "00"; }},
    // Complete ("CC") when this consignment carries every pack of the
    // pack's order, else a part ("PR").
    CsvField{"SHIPNOTESTATUS",
             [](const CsvPack& p) -> Var {
               return p.system->OrderPackCount(p.pack) == p.system->ConNotePackCount(p.conNote)
                          ? "CC"
                          : "PR";
             }},
    CsvField{"BILLOFLADING", [](const CsvPack& p) { return p.Of(&host::ConNote::BillOfLading); }},
    CsvField{"BOOKINGNO", [](const CsvPack& p) { return p.Of(&host::ConNote::BookingNo); }},
    CsvField{"ORDERNO", OrderNo},
    CsvField{"ORDERDATE", [](const CsvPack& p) { return p.Of(&host::Despatch::OrderDate); }},
    CsvField{"ORDERSTATUSCODE",
             [](const CsvPack& p) -> Var {
               return host::IsTrue(p.Of(&host::ConNote::OrderStatusFlag)) ? "CC" : "SS";
             }},
    CsvField{"POVERSIONNO", [](const CsvPack& p) { return p.Of(&host::Despatch::SupplierNo); }},
    CsvField{"INVOICENO"},
    CsvField{"DELREFERENCE", DelReference},
    // The despatch's supplier number, or the trading partner's when the despatch has none.
    CsvField{"PARTNERSUPPLIERNO",
             [](const CsvPack& p) {
               const Var despatch = p.Of(&host::Despatch::SupplierNo);
               return Trim(despatch.Text()).empty() ? p.Of(&host::Partner::SupplierNo) : despatch;
             }},
    CsvField{"COMPANYCODE", [](const CsvPack& p) { return p.Of(&host::Despatch::CompanyCode); }},
    CsvField{"CONSIGNMENTNOTENO", ConNoteNo},
    CsvField{"CARRIERNAME", CarrierName},
    CsvField{"CARRIERACCOUNTREF", CarrierAccountRef},
    CsvField{"CARRIERSERVICECODE",
             [](const CsvPack& p) { return p.Of(&host::Receiver::CarrierServiceCode); }},
    CsvField{"CARRIERRUNCODE", [](const CsvPack& p) { return p.Of(&host::Receiver::City); }},
    CsvField{"SENDERNAME", SenderName},
    CsvField{"SENDERADDR1", [](const CsvPack& p) { return p.Of(&host::Vendor::AddressLine1); }},
    CsvField{"SENDERADDR2", [](const CsvPack& p) { return p.Of(&host::Vendor::AddressLine2); }},
    CsvField{"SENDERTOWN", [](const CsvPack& p) { return p.Of(&host::Vendor::AddressLine3); }},
    CsvField{"SENDERSTATE", [](const CsvPack& p) { return p.Of(&host::Vendor::State); }},
    CsvField{"SENDERPOSTCODE", [](const CsvPack& p) { return p.Of(&host::Vendor::Postcode); }},
    CsvField{"SENDERCONTACT"},
    CsvField{"RECEIVERNAME", ReceiverName},
    CsvField{"RECEIVERADDR1", ReceiverAddr1},
    CsvField{"RECEIVERADDR2", ReceiverAddr2},
    CsvField{"RECEIVERTOWN", ReceiverTown},
    CsvField{"RECEIVERSTATE", ReceiverState},
    CsvField{"RECEIVERPOSTCODE", ReceiverPostcode},
    CsvField{"RECEIVERCONTACT", ReceiverContact},
    // The day the consignment is booked for is also the day it is to be delivered.
    CsvField{"DELIVERYDATE", ScheduledDay},
    CsvField{"SCHEDULEDATE", ScheduledDay},
    CsvField{"SCHEDULETIME",
             [](const CsvPack& p) -> Var {
               return Format(p.Of(&host::ConNote::ScheduledDate), "HHMM");
             }},
    CsvField{"DATESHIPPED",
             [](const CsvPack& p) -> Var {
               return Format(p.Of(&host::ConNote::ConNoteDate), "yyyymmdd");
             }},
    CsvField{"SHIPTOCODE", ShipToCode},
    CsvField{"PALLETNO"},
    CsvField{"PALLETMARKTYPE"},
    CsvField{"PALLETTYPECODE"},
    CsvField{"CONTAINERNO", [](const CsvPack& p) { return p.Of(&host::Pack::SSCC); }},
    // A pack of no stated type goes as the standard carton.
    CsvField{"SHIPPACKCODE",
             [](const CsvPack& p) -> Var {
               return p.Of(&host::Pack::PackType).IsNull() ? Var("CTN25")
                                                           : p.Of(&host::Carton::Code);
             }},
    CsvField{"SHIPMENTWEIGHT", ShipmentWeight},
    CsvField{"SHIPMENTVOLUME", ShipmentVolume},
    CsvField{"SHIPMENTCOUNT", ShipmentCount},
    CsvField{"PACKMARKTYPE", [](const CsvPack&) -> Var { return "GM"; }},
    // Pallet ("09") or carton ("CT").
    CsvField{"PACKAGETYPECODE",
             [](const CsvPack& p) -> Var {
               return Left(p.Of(&host::Carton::Code).Text(), 3) == "PLT" ? "09" : "CT";
             }},
    CsvField{"PACKWEIGHT",
             [](const CsvPack& p) -> Var { return Format(p.Of(&host::Pack::Weight), "####0.0#"); }},
    CsvField{"PACKLENGTH", [](const CsvPack& p) { return p.Of(&host::Carton::Length); }},
    CsvField{"PACKWIDTH", [](const CsvPack& p) { return p.Of(&host::Carton::Width); }},
    CsvField{"PACKHEIGHT", [](const CsvPack& p) { return p.Of(&host::Carton::Height); }},
    CsvField{"BUYSTORECODE", [](const CsvPack& p) { return p.Of(&host::Pack::BuyStoreCode); }},
};
static_assert(kFields.size() == 56);

}  // namespace

clsVLODAcsv::clsVLODAcsv() : MapCsvWriter("clsVLODAcsv", "VLODA.map", kFields) {}

std::unique_ptr<Component> MakeVLODAcsv() { return std::make_unique<clsVLODAcsv>(); }

}  // namespace quendal
