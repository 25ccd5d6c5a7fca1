#include "carrierfiles/cTNTTransactionDAcsv.h"

#include "tests/carrierfiles/MapCsvFixture.h"

namespace quendal {
namespace {

using test::MapText;

const std::vector<std::string> kTntNames = {
    "SHIPNOTENO",         "ORDERNO",           "DELREFERENCE",      "PARTNERSUPPLIERNO",
    "COMPANYCODE",        "CONSIGNMENTNOTENO", "CARRIERNAME",       "CARRIERACCOUNTREF",
    "CARRIERSERVICECODE", "CARRIERRUNCODE",    "SENDERNAME",        "SENDERADDR1",
    "SENDERADDR2",        "SENDERTOWN",        "SENDERSTATE",       "SENDERPOSTCODE",
    "SENDERCONTACT",      "RECEIVERNAME",      "RECEIVERADDR1",     "RECEIVERADDR2",
    "RECEIVERTOWN",       "RECEIVERSTATE",     "RECEIVERPOSTCODE",  "RECEIVERCONTACT",
    "DELIVERYDATE",       "SCHEDULEDATE",      "SCHEDULETIME",      "DATESHIPPED",
    "SHIPTOCODE",         "PALLETNO",          "PALLETMARKTYPE",    "PALLETTYPECODE",
    "CONTAINERNO",        "SHIPPACKCODE",      "SHIPMENTWEIGHT",    "SHIPMENTVOLUME",
    "SHIPMENTCOUNT",      "PACKMARKTYPE",      "PACKAGETYPECODE",   "PACKWEIGHT",
    "PACKLENGTH",         "PACKWIDTH",         "PACKHEIGHT",        "BUYSTORECODE",
    "DESCRIPTION",        "RECEIVERPHONE",     "SPECIALREFERENCE1", "SPECIALREFERENCE2",
    "SPECIALREFERENCE3",  "SPECIALREFERENCE4", "SPECIALREFERENCE5", "SPECIALREFERENCE6",
    "SPECIALREFERENCE7",  "SPECIALREFERENCE8"};

class TNTTransactionDAcsvTest : public test::MapCsvFixture {
 protected:
  clsTNTTransactionDAcsv tnt;
};

TEST_F(TNTTransactionDAcsvTest, MapOfEveryFieldWritesTheWholeCatalogue) {
  carrier->fields["FileFolder"] = folder + "TNT";
  Map("TransactionDA.map", MapText(kTntNames));
  Process(tnt, ConNote());
  // The transaction file carries no per-pack values: every pack's line is the same.
  const std::string line =
      "ASN0004500,PO778800,SO20045,,,VLO00012345,VLO,70067890,EXPRESS,,Kestrel Apparel Pty Ltd,"
      ",,,,,,Harbour Stores DC,1 Distribution Way,,TRUGANINA,VIC,3029,Dock Manager,,,,,0412,"
      ",,,,,27.46,0.125,3,,,,,,,,CARTON,03 9000 0900,ASN0004500,,,,,,,\r\n";
  EXPECT_EQ(Output("TNT"), line + line + line);
  // Both classes close a consignment with the same words.
  EXPECT_EQ(host.LogMessages().back(), "ASN ASN0004500 VLO DA compile completed. 3 packs added.");
  EXPECT_EQ(host.logs.back().at("Source").Text(), "Quendal.clsTNTTransactionDAcsv");
}

}  // namespace
}  // namespace quendal
