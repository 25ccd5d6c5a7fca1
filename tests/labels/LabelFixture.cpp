#include "tests/labels/LabelFixture.h"

#include <cstdlib>

namespace quendal::test {

void LabelFixture::SetUp() {
  const char* xdg = std::getenv("XDG_CONFIG_HOME");
  savedXdg = xdg ? std::optional<std::string>(xdg) : std::nullopt;
  ::setenv("XDG_CONFIG_HOME", config.path().c_str(), 1);
  SetNow(DateTime::FromParts(2024, 3, 14, 10, 0));
  spooler->AddPrinter("Dock 3");
  previousSpooler = SetSpooler(spooler);
  host.system->fields["PDTType"] = "Denso";

  vendor = host.Make<host::Vendor>({{"VendorCode", "ACME"},
                                    {"Name", "Acme Apparel Pty Ltd"},
                                    {"AddressLine2", "12 Example Road"},
                                    {"AddressLine3", "DANDENONG SOUTH"},
                                    {"State", "VIC"}});
  carrier = host.Make<host::Carrier>({{"Name", "Southern Road Express"}, {"Options", "EP"}});
  dc = host.Make<host::Receiver>({{"Name", "Harbour Stores DC"},
                                  {"StoreCode", "0900"},
                                  {"City", "Melbourne"},
                                  {"Postcode", "3029"}});
  store = host.Make<host::Receiver>({{"Name", "Harbour Stores Chadstone"},
                                     {"AddressLine2", "1 Example Parade"},
                                     {"Postcode", "3148"},
                                     {"StoreCode", "412"},
                                     {"CountryCode", "036"}});
  // The addressed store the label looks up by code.
  host.Make<host::Receiver>({{"Code", "0412"},
                             {"PartnerId", 1},
                             {"Name", "Harbour Stores Chadstone"},
                             {"AddressLine1", "Shop 210"},
                             {"Suburb", "CHADSTONE"},
                             {"State", "VIC"},
                             {"Postcode", "3148"}});
  order = host.Make<host::Order>({{"OrderNo", "SO10045"},
                                  {"StoreNo", 412},
                                  {"VendorCode", "556677"},
                                  {"Receiver", dc},
                                  {"DeliveryAddress", host.Make<host::Address>()}});
  despatch = host.Make<host::Despatch>({{"DespatchNo", "PO778812 REL# 2"},
                                        {"NotBefore", DateTime::FromParts(2024, 3, 15)},
                                        {"NotAfter", DateTime::FromParts(2024, 3, 20)},
                                        {"ZoneDeptA", "12"},
                                        {"ZoneDeptB", "A4-NORTH"},
                                        {"ZoneDeptC", "WOMENSWEAR AND ACCESSORIES"},
                                        {"Vendor", vendor},
                                        {"Receiver", dc}});
  carton = host.Make<host::Carton>({{"Code", "CTN01"}});
  conNote = host.Make<host::ConNote>({{"ConNoteNo", "SRX0001234567"},
                                      {"BillOfLading", "BOL7781-20240314"},
                                      {"Service", "EXP"},
                                      {"ServiceLevel", "EXP"}});
  pack = MakePack(1001, "00093123450000000012");
  MemoryHost::Attach(conNote, {pack});
}

void LabelFixture::TearDown() {
  SetSpooler(previousSpooler);
  SetNow(std::nullopt);
  if (savedXdg)
    ::setenv("XDG_CONFIG_HOME", savedXdg->c_str(), 1);
  else
    ::unsetenv("XDG_CONFIG_HOME");
}

std::shared_ptr<MemoryObject<host::Pack>> LabelFixture::MakePack(int id, const std::string& sscc) {
  return host.Make<host::Pack>({{"PackId", id},
                                {"SSCC", sscc},
                                {"StoreCode", "0412"},
                                {"PartnerId", 1},
                                {"SalesOrderNo", "SO10045"},
                                {"ASNId", 1},
                                {"CarrierId", 1},
                                {"Carrier", carrier},
                                {"Vendor", vendor},
                                {"Receiver", dc},
                                {"ShipTo", store},
                                {"Order", order},
                                {"Despatch", despatch},
                                {"Carton", carton}});
}

std::vector<std::string> LabelFixture::TakeJobs() {
  std::vector<std::string> bytes;
  for (const auto& job : spooler->jobs) bytes.push_back(job.bytes);
  spooler->jobs.clear();
  return bytes;
}

}  // namespace quendal::test
