// Host data for the map-driven despatch advice: a consignment of a pallet
// and two cartons for one order, with the clock fixed so that the day's
// file is "<base>_1403240930.txt".
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "carrierfiles/MapCsvWriter.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/TempFolder.h"

namespace quendal::test {

inline const char* const kCsvSscc[] = {"00093123450000100016", "00093123450000100023",
                                       "00093123450000100030"};

class MapCsvFixture : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 9, 7, 30));
    folder = temp.path() + "/";
    carrier =
        host.Make<host::Carrier>({{"FileFolder", folder + "VLO"}, {"AccountNumber", "70067890"}});
    receiver = host.Make<host::Receiver>({{"Name", "Harbour Stores DC"},
                                          {"AddressLine1", "1 Distribution Way"},
                                          {"Suburb", "TRUGANINA"},
                                          {"City", "MEL"},
                                          {"State", "VIC"},
                                          {"Postcode", "3029"},
                                          {"CarrierServiceCode", "EXP"},
                                          {"Extra1", "Dock Manager"},
                                          {"Extra2", "03 9000 0900"}});
    vendor = host.Make<host::Vendor>({{"Name", "Kestrel Apparel Pty Ltd"},
                                      {"AddressLine1", "Unit 7"},
                                      {"AddressLine2", "40 Industry Drive"},
                                      {"AddressLine3", "DANDENONG SOUTH"},
                                      {"State", "VIC"},
                                      {"Postcode", "3175"}});
    partner = host.Make<host::Partner>({{"SupplierNo", "889900"}});
    order = host.Make<host::Order>({{"OrderNo", "SO20045"}});
    despatch = host.Make<host::Despatch>({{"DespatchNo", "PO778800"},
                                          {"OrderDate", DateTime::FromParts(2024, 3, 10)},
                                          {"CompanyCode", "HBS01"},
                                          {"SupplierNo", "556677"}});
    asn = host.Make<host::ASN>(
        {{"ASNNo", "ASN0004500"}, {"ASNDate", DateTime::FromParts(2024, 3, 14, 7, 45, 0)}});
  }
  void TearDown() override { SetNow(std::nullopt); }

  std::shared_ptr<MemoryObject<host::Pack>> Pack(std::string_view sscc, std::string_view carton,
                                                 const Var& packType, double weight) {
    const bool pallet = carton == "PLT01";
    auto c = host.Make<host::Carton>({{"Code", carton},
                                      {"Length", pallet ? 1.2 : 0.4},
                                      {"Width", pallet ? 1.0 : 0.3},
                                      {"Height", pallet ? 1.4 : 0.25}});
    return host.Make<host::Pack>({{"SSCC", sscc},
                                  {"StoreCode", "0412"},
                                  {"SalesOrderNo", "SO20045"},
                                  {"BuyStoreCode", "0412"},
                                  {"PackType", packType},
                                  {"Weight", weight},
                                  {"Carton", c},
                                  {"Order", order},
                                  {"Despatch", despatch},
                                  {"Receiver", receiver},
                                  {"Vendor", vendor},
                                  {"Partner", partner}});
  }

  // A pallet, a carton of no stated type and a carton; `count` of them.
  std::shared_ptr<MemoryObject<host::ConNote>> ConNote(std::string_view no = "VLO00012345",
                                                       int count = 3) {
    auto conNote =
        host.Make<host::ConNote>({{"ConNoteNo", no},
                                  {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 8, 30, 0)},
                                  {"Service", "EXPRESS"},
                                  {"CarrierPrefix", "VLO"},
                                  {"Weight", 27.456},
                                  {"Volume", 0.125},
                                  {"BillOfLading", "BOL7700"},
                                  {"BookingNo", "BK2200"},
                                  {"ScheduledDate", DateTime::FromParts(2024, 3, 15, 9, 5, 0)},
                                  {"OrderStatusFlag", true},
                                  {"Carrier", carrier}});
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> packs = {
        Pack(kCsvSscc[0], "PLT01", "PALLET", 310.5), Pack(kCsvSscc[1], "CTN01", Var(), 8.125),
        Pack(kCsvSscc[2], "CTN01", "CARTON", 12)};
    packs.resize(static_cast<std::size_t>(count));
    MemoryHost::Attach(conNote, packs);
    return conNote;
  }

  // Process with the consignment's own packs; the log list it hands back.
  LogList Process(MapCsvWriter& writer, const std::shared_ptr<MemoryObject<host::ConNote>>& c,
                  LogList log = {}) {
    writer.Process(host.system, c, asn, host::Object::As<host::PackList>(c->fields["Packs"]), log);
    return log;
  }

  void Map(const std::string& name, const std::string& text) { WriteText(folder + name, text); }
  std::string Output(const std::string& base = "VLO") const {
    return ReadFile(folder + base + "_1403240930.txt").value_or("<none>");
  }

  MemoryHost host;
  TempFolder temp;
  std::string folder;
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Receiver>> receiver;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::Partner>> partner;
  std::shared_ptr<MemoryObject<host::Order>> order;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
  std::shared_ptr<MemoryObject<host::ASN>> asn;
};

// One map line per name.
inline std::string MapText(const std::vector<std::string>& names) {
  std::string text;
  for (const auto& name : names) text += name + "\r\n";
  return text;
}

// Comma-joined values ended by CR LF.
inline std::string CsvLine(const std::vector<std::string>& values) {
  std::string line;
  for (std::size_t i = 0; i < values.size(); ++i) line += (i ? "," : "") + values[i];
  return line + "\r\n";
}

}  // namespace quendal::test
