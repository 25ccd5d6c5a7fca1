#include "carrierfiles/cTNTTransactionDAcsv.h"

#include <array>

namespace quendal {

namespace {

using namespace csv;

// The fields a TNT transaction map file may name, in TNT's order, and how
// each is filled for a pack; a field without a filler is written empty.
constexpr std::array kFields = {
    CsvField{"SHIPNOTENO", AsnNo},
    CsvField{"ORDERNO", OrderNo},
    CsvField{"DELREFERENCE", DelReference},
    CsvField{"PARTNERSUPPLIERNO"},
    CsvField{"COMPANYCODE"},
    CsvField{"CONSIGNMENTNOTENO", ConNoteNo},
    CsvField{"CARRIERNAME", CarrierName},
    CsvField{"CARRIERACCOUNTREF", CarrierAccountRef},
    CsvField{"CARRIERSERVICECODE", [](const CsvPack& p) { return p.Of(&host::ConNote::Service); }},
    CsvField{"CARRIERRUNCODE"},
    CsvField{"SENDERNAME", SenderName},
    CsvField{"SENDERADDR1"},
    CsvField{"SENDERADDR2"},
    CsvField{"SENDERTOWN"},
    CsvField{"SENDERSTATE"},
    CsvField{"SENDERPOSTCODE"},
    CsvField{"SENDERCONTACT"},
    CsvField{"RECEIVERNAME", ReceiverName},
    CsvField{"RECEIVERADDR1", ReceiverAddr1},
    CsvField{"RECEIVERADDR2", ReceiverAddr2},
    CsvField{"RECEIVERTOWN", ReceiverTown},
    CsvField{"RECEIVERSTATE", ReceiverState},
    CsvField{"RECEIVERPOSTCODE", ReceiverPostcode},
    CsvField{"RECEIVERCONTACT", ReceiverContact},
    CsvField{"DELIVERYDATE"},
    CsvField{"SCHEDULEDATE"},
    CsvField{"SCHEDULETIME"},
    CsvField{"DATESHIPPED"},
    CsvField{"SHIPTOCODE", ShipToCode},
    CsvField{"PALLETNO"},
    CsvField{"PALLETMARKTYPE"},
    CsvField{"PALLETTYPECODE"},
    CsvField{"CONTAINERNO"},
    CsvField{"SHIPPACKCODE"},
    CsvField{"SHIPMENTWEIGHT", ShipmentWeight},
    CsvField{"SHIPMENTVOLUME", ShipmentVolume},
    CsvField{"SHIPMENTCOUNT", ShipmentCount},
    CsvField{"PACKMARKTYPE"},
    CsvField{"PACKAGETYPECODE"},
    CsvField{"PACKWEIGHT"},
    CsvField{"PACKLENGTH"},
    CsvField{"PACKWIDTH"},
    CsvField{"PACKHEIGHT"},
    CsvField{"BUYSTORECODE"},
    CsvField{"DESCRIPTION", [](const CsvPack&) -> Var { return "CARTON"; }},
    CsvField{"RECEIVERPHONE", [](const CsvPack& p) { return p.Of(&host::Receiver::Extra2); }},
    // The notice's number is the first of TNT's references; the others are unused.
    CsvField{"SPECIALREFERENCE1", AsnNo},
    CsvField{"SPECIALREFERENCE2"},
    CsvField{"SPECIALREFERENCE3"},
    CsvField{"SPECIALREFERENCE4"},
    CsvField{"SPECIALREFERENCE5"},
    CsvField{"SPECIALREFERENCE6"},
    CsvField{"SPECIALREFERENCE7"},
    CsvField{"SPECIALREFERENCE8"},
};
static_assert(kFields.size() == 54);

}  // namespace

clsTNTTransactionDAcsv::clsTNTTransactionDAcsv()
    : MapCsvWriter("clsTNTTransactionDAcsv", "TransactionDA.map", kFields) {}

std::unique_ptr<Component> MakeTNTTransactionDAcsv() {
  return std::make_unique<clsTNTTransactionDAcsv>();
}

}  // namespace quendal
