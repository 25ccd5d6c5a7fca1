// The packing station of the label benchmarks: in-memory host objects for
// one carton for a store that goes through its distribution centre, with
// everything the label classes read (the delivery location and the store,
// zones, bill of lading, an authority-to-leave carrier, the consignment's
// packs); a settings folder of its own and the clock fixed.
#pragma once

#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <string>

#include "platform/Clock.h"
#include "tests/support/MemoryHost.h"

namespace quendal::bench {

struct LabelStation {
  explicit LabelStation(const std::string& name) {
    root = std::filesystem::temp_directory_path() / (name + "-" + std::to_string(::getpid()));
    std::filesystem::remove_all(root);
    std::filesystem::create_directories(root / "config");
    ::setenv("XDG_CONFIG_HOME", (root / "config").c_str(), 1);
    SetNow(DateTime::FromParts(2024, 3, 14, 10, 0));
    host.system->fields["SpoolerMode"] = 0;
    host.Make<host::Receiver>({{"Code", "0412"},
                               {"PartnerId", 1},
                               {"Name", "Harbour Stores Chadstone"},
                               {"AddressLine1", "Shop 210"},
                               {"AddressLine2", "1341 Dandenong Road"},
                               {"Suburb", "CHADSTONE"},
                               {"State", "VIC"},
                               {"Postcode", "3148"}});
    auto dc = host.Make<host::Receiver>(
        {{"Name", "Harbour Stores DC"}, {"StoreCode", "0900"}, {"City", "Melbourne"}, {"Postcode", "3029"}});
    auto conNote = host.Make<host::ConNote>({{"ConNoteNo", "SRX0001234567"},
                                             {"BillOfLading", "BOL7781-20240314"},
                                             {"Service", "EXP"},
                                             {"ServiceLevel", "EXP"}});
    pack = host.Make<host::Pack>(
        {{"PackId", 1001},
         {"SSCC", "00093123450000000012"},
         {"StoreCode", "0412"},
         {"PartnerId", 1},
         {"SalesOrderNo", "SO10045"},
         {"ASNId", 1},
         {"CarrierId", 1},
         {"Carrier", host.Make<host::Carrier>({{"Name", "Southern Road Express"},
                                              {"Options", "#%ATL"},
                                              {"AccountRef", "SRX01"},
                                              {"AccountNumber", "10023456"}})},
         {"Vendor", host.Make<host::Vendor>({{"VendorCode", "ACME"},
                                            {"Name", "Acme Apparel Pty Ltd"},
                                            {"AddressLine2", "12 Example Road"},
                                            {"AddressLine3", "DANDENONG SOUTH"},
                                            {"State", "VIC"}})},
         {"Receiver", dc},
         {"ShipTo", host.Make<host::Receiver>({{"Name", "Harbour Stores Chadstone"},
                                              {"AddressLine2", "1 Example Parade"},
                                              {"Postcode", "3148"},
                                              {"StoreCode", "412"},
                                              {"CountryCode", "036"}})},
         {"Order", host.Make<host::Order>({{"OrderNo", "SO10045"},
                                          {"StoreNo", 412},
                                          {"Receiver", dc},
                                          {"DeliveryAddress", host.Make<host::Address>()}})},
         {"Despatch", host.Make<host::Despatch>({{"DespatchNo", "PO778812 REL# 2"},
                                                {"NotBefore", DateTime::FromParts(2024, 3, 15)},
                                                {"NotAfter", DateTime::FromParts(2024, 3, 20)},
                                                {"ZoneDeptA", "12"},
                                                {"ZoneDeptB", "A4-NORTH"},
                                                {"ZoneDeptC", "WOMENSWEAR"}})},
         {"Carton", host.Make<host::Carton>({{"Code", "CTN01"}, {"Weight", 0.45}})},
         {"Weight", 5.2}});
    test::MemoryHost::Attach(conNote, {pack});
  }
  ~LabelStation() {
    SetNow(std::nullopt);
    std::filesystem::remove_all(root);
  }
  LabelStation(const LabelStation&) = delete;
  LabelStation& operator=(const LabelStation&) = delete;

  std::filesystem::path root;
  test::MemoryHost host;
  std::shared_ptr<test::MemoryObject<host::Pack>> pack;
};

}  // namespace quendal::bench
