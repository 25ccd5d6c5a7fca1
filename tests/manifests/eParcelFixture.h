// Host data for the eParcel runs: one vendor, the postal carrier, an EDI
// document naming them, and consignments made one call each.
#pragma once

#include <gtest/gtest.h>
#include <unistd.h>

#include <chrono>
#include <ctime>
#include <filesystem>
#include <string>
#include <vector>

#include "frame/Catalogue.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"

namespace quendal::test {

namespace fs = std::filesystem;

// The text with every line ended by CR LF.
inline std::string Crlf(std::string_view text) {
  std::string out;
  for (char c : text) {
    if (c == '\n') out += '\r';
    out += c;
  }
  return out;
}

class eParcelFixture : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 16, 30, 0));
    const auto* info = ::testing::UnitTest::GetInstance()->current_test_info();
    dir = fs::temp_directory_path() /
          ("quendal-eparcel-" + std::to_string(::getpid()) + "-" + info->name());
    fs::remove_all(dir);
    fs::create_directories(dir);
    folder = dir.string() + "/";
    vendor = host.Make<host::Vendor>({{"VendorId", 1},
                                      {"VendorCode", "ACME"},
                                      {"Name", "Acme Apparel Pty Ltd"},
                                      {"AddressLine1", "Unit 4"},
                                      {"Suburb", "DANDENONG SOUTH"},
                                      {"State", "VIC"},
                                      {"Postcode", "3175"},
                                      {"Country", "Australia"}});
    carrier = host.Make<host::Carrier>({{"CarrierId", 2},
                                        {"CarrierCode", "NPP"},
                                        {"Options", "EP"},
                                        {"NotifyOptions", "#%noemail"},
                                        {"AccountRef", "NPP1"},
                                        {"AccountNumber", "98765"},
                                        {"FileFolder", folder}});
    host.Make<host::Partner>({{"PartnerId", 1}, {"Code", "HBS"}});
    host.Make<host::EDIDocument>({{"ID", 7},
                                  {"VendorId", 1},
                                  {"PartnerId", 1},
                                  {"CarrierId", 2},
                                  {"OutputFolder", folder}});
    despatch = host.Make<host::Despatch>({{"DespatchNo", "PO778812"}});
    carton = host.Make<host::Carton>({{"Length", 0.40}, {"Width", 0.30}, {"Height", 0.25}});
    auto customerAddress = host.Make<host::Address>({{"Company", "Harbour Stores Ltd"}});
    customer = host.Make<host::Customer>(
        {{"Name", "Harbour Stores Online"}, {"Address", customerAddress}});
  }

  void TearDown() override {
    SetNow(std::nullopt);
    fs::remove_all(dir);
  }

  // Sets the clock to the real date (the date new files are created on) at a fixed time.
  static void ClockOnRealDate() {
    const std::time_t t = std::chrono::system_clock::to_time_t(std::chrono::system_clock::now());
    std::tm local{};
    localtime_r(&t, &local);
    SetNow(DateTime::FromParts(local.tm_year + 1900, local.tm_mon + 1, local.tm_mday, 16, 30, 0));
  }

  std::shared_ptr<MemoryObject<host::Order>> MakeOrder(const Fields& address, bool withSlipLine) {
    std::vector<std::shared_ptr<host::PSlipLine>> lines;
    if (withSlipLine) lines.push_back(host.Make<host::PSlipLine>({{"Customer", customer}}));
    return host.Make<host::Order>({{"DeliveryAddress", host.Make<host::Address>(address)},
                                   {"SlipLines", MemoryHost::List(lines)}});
  }

  // A consignment of `packs` packs of one order, awaiting a manifest, dated today.
  std::shared_ptr<MemoryObject<host::ConNote>> AddConNote(
      std::int32_t id, const std::string& number, int packs,
      const std::shared_ptr<MemoryObject<host::Order>>& order, const Fields& fields = {}) {
    auto conNote = host.Make<host::ConNote>({{"ConNoteId", id},
                                             {"ConNoteNo", number},
                                             {"ConNoteDate", Now()},
                                             {"Service", "EPARCEL"},
                                             {"ServiceLevel", "STANDARD"},
                                             {"Weight", 2.5},
                                             {"PartnerCode", "HBS"},
                                             {"DeliveryLocation", "RICHMOND"},
                                             {"ManifestId", Var()},
                                             {"Vendor", vendor},
                                             {"Carrier", carrier},
                                             {"Orders", MemoryHost::List<host::Order>({order})}});
    for (const auto& [name, value] : fields) conNote->fields[name] = value;
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> list;
    for (int i = 0; i < packs; ++i)
      list.push_back(host.Make<host::Pack>(
          {{"Order", order}, {"Despatch", despatch}, {"Carton", carton}}));
    MemoryHost::Attach(conNote, list);
    return conNote;
  }

  // Creates the class, runs Init and Load, and returns it.
  std::unique_ptr<Component> Start(std::string_view identifier, std::int32_t* rows = nullptr) {
    auto object = CreateObject(identifier).object;
    auto* rowsInterface = as<RowInterface>(object);
    Grid columns;
    EXPECT_TRUE(rowsInterface->Init(host.system, 7, columns));
    Grid grid;
    const std::int32_t count = rowsInterface->Load("", grid);
    if (rows) *rows = count;
    return object;
  }

  std::vector<std::string> FilesInFolder() const {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(dir)) names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }

  std::string FileText(const std::string& name) const {
    return ReadFile(folder + name).value_or("<missing>");
  }

  MemoryHost host;
  fs::path dir;
  std::string folder;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
  std::shared_ptr<MemoryObject<host::Carton>> carton;
  std::shared_ptr<MemoryObject<host::Customer>> customer;
};

}  // namespace quendal::test
