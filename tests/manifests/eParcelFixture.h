// Host data for the eParcel runs: one vendor, the postal carrier, an EDI
// document naming them, consignments made one call each, and a run made one
// call too.
#pragma once

#include <gtest/gtest.h>
#include <unistd.h>

#include <chrono>
#include <ctime>
#include <filesystem>
#include <pugixml.hpp>
#include <string>
#include <vector>

#include "frame/Catalogue.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/TempFolder.h"

namespace quendal::test {

class eParcelFixture : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 16, 30, 0));
    std::filesystem::create_directories(dir);
    folder = dir.string() + "/";
    vendor = host.Make<host::Vendor>({{"VendorId", 1},
                                      {"Name", "Acme Apparel Pty Ltd"},
                                      {"AddressLine1", "Unit 4"},
                                      {"Suburb", "DANDENONG SOUTH"},
                                      {"State", "VIC"},
                                      {"Postcode", "3175"},
                                      {"Country", "Australia"}});
    carrier = host.Make<host::Carrier>({{"CarrierId", 2},
                                        {"Options", "EP"},
                                        {"NotifyOptions", "#%noemail"},
                                        {"AccountRef", "NPP1"},
                                        {"AccountNumber", "98765"},
                                        {"FileFolder", folder}});
    host.Make<host::Partner>({{"PartnerId", 1}});
    host.Make<host::EDIDocument>(
        {{"ID", 7}, {"VendorId", 1}, {"PartnerId", 1}, {"CarrierId", 2}, {"OutputFolder", folder}});
    despatch = host.Make<host::Despatch>({{"DespatchNo", "PO778812"}});
    carton = host.Make<host::Carton>({{"Length", 0.40}, {"Width", 0.30}, {"Height", 0.25}});
    customer = host.Make<host::Customer>(
        {{"Name", "Harbour Stores Online"},
         {"Address", host.Make<host::Address>({{"Company", "Harbour Stores Ltd"}})}});
  }
  void TearDown() override {
    SetNow(std::nullopt);
  }

  // The clock on the real date (the date new files are created on), at a fixed time.
  static void ClockOnRealDate() {
    const std::time_t t = std::chrono::system_clock::to_time_t(std::chrono::system_clock::now());
    std::tm local{};
    localtime_r(&t, &local);
    SetNow(DateTime::FromParts(local.tm_year + 1900, local.tm_mon + 1, local.tm_mday, 16, 30, 0));
  }

  std::shared_ptr<MemoryObject<host::Order>> MakeOrder(const Fields& address,
                                                       bool withSlipLine = true) {
    std::vector<std::shared_ptr<host::PSlipLine>> lines;
    if (withSlipLine) lines.push_back(host.Make<host::PSlipLine>({{"Customer", customer}}));
    return host.Make<host::Order>({{"DeliveryAddress", host.Make<host::Address>(address)},
                                   {"SlipLines", MemoryHost::List(lines)}});
  }

  // A consignment of `packs` packs of one order, awaiting a manifest, dated now.
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
                                             {"Vendor", vendor},
                                             {"Carrier", carrier},
                                             {"Orders", MemoryHost::List<host::Order>({order})}});
    for (const auto& [name, value] : fields) conNote->fields[name] = value;
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> list;
    for (int i = 0; i < packs; ++i)
      list.push_back(
          host.Make<host::Pack>({{"Order", order}, {"Despatch", despatch}, {"Carton", carton}}));
    MemoryHost::Attach(conNote, list);
    return conNote;
  }

  // Init, Load, Process of the given rows and Term; the results of Load and of each Process.
  std::vector<std::int32_t> Run(std::string_view identifier,
                                std::initializer_list<std::int32_t> rows) {
    auto object = CreateObject(identifier).object;
    auto* run = as<RowInterface>(object);
    Grid columns, grid;
    run->Init(host.system, 7, columns);
    std::vector<std::int32_t> results = {run->Load("", grid)};
    LogList log;
    for (std::int32_t row : rows) results.push_back(run->Process(row, log));
    EXPECT_TRUE(run->Term());
    return results;
  }

  std::vector<std::string> FilesInFolder() const {
    std::vector<std::string> names;
    // Hidden files (locks, journals) are no carrier files.
    for (const auto& entry : std::filesystem::directory_iterator(dir))
      if (!entry.path().filename().string().starts_with("."))
        names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }
  std::string FileText(const std::string& name) const {
    return ReadFile(folder + name).value_or("");
  }
  // The texts of the nodes the path selects in the written file.
  std::vector<std::string> Values(const std::string& name, const char* path) const {
    pugi::xml_document doc;
    EXPECT_TRUE(doc.load_string(FileText(name).c_str())) << name;
    std::vector<std::string> values;
    for (const auto& node : doc.select_nodes(path)) values.push_back(node.node().child_value());
    return values;
  }

  MemoryHost host;
  test::TempFolder temp;
  std::filesystem::path dir{temp.path()};
  std::string folder;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
  std::shared_ptr<MemoryObject<host::Carton>> carton;
  std::shared_ptr<MemoryObject<host::Customer>> customer;
};

}  // namespace quendal::test
