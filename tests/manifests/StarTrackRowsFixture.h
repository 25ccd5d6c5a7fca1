// Host data for the StarTrack manifest and end-of-day runs: one vendor,
// the carrier with its folder, an EDI document naming them, a document
// printer in a directory spooler, and consignments made one call each.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

#include "frame/Catalogue.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/PdfText.h"
#include "tests/support/Records.h"
#include "tests/support/TempFolder.h"

namespace quendal::test {

class StarTrackRowsFixture : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 9, 0, 0));
    std::filesystem::create_directories(root / "carrier");
    std::filesystem::create_directories(root / "spool" / "Office Laser");
    folder = (root / "carrier").string() + "/";
    previousSpooler = SetSpooler(std::make_shared<DirectorySpooler>((root / "spool").string()));
    host.system->fields["DocumentPrinter"] = "Office Laser";
    host.nextManifestNumber = 1234567;

    vendor = host.Make<host::Vendor>({{"VendorId", 1},
                                      {"VendorCode", "ALP"},
                                      {"Name", "Alpine Cosmetics"},
                                      {"AddressLine2", "88 Factory Lane"},
                                      {"AddressLine3", "DANDENONG"},
                                      {"State", "VIC"},
                                      {"Postcode", "3175"}});
    carrier = MakeCarrier("");
    host.Make<host::Partner>({{"PartnerId", 1}});
    host.Make<host::EDIDocument>(
        {{"ID", 7}, {"VendorId", 1}, {"PartnerId", 1}, {"CarrierId", 3}, {"OutputFolder", folder}});
    receiver = host.Make<host::Receiver>({{"Name", "Harbour Retail DC"},
                                          {"AddressLine1", "12 Wharf Road"},
                                          {"Suburb", "PORT MELBOURNE"},
                                          {"State", "VIC"},
                                          {"Postcode", "3207"}});
    auto address = host.Make<host::Address>({{"Name", "Myer Chadstone"},
                                             {"Line1", "1341 Dandenong Road"},
                                             {"Line2", "Loading Dock 3"},
                                             {"Suburb", "CHADSTONE"},
                                             {"State", "VIC"},
                                             {"Postcode", "3148"}});
    order = host.Make<host::Order>({{"OrderNo", "PO-88120"}, {"DeliveryAddress", address}});
    despatch = host.Make<host::Despatch>(
        {{"DespatchNo", "DSP778812"},
         {"NotBefore", DateTime::FromParts(2024, 3, 15, 7, 0, 0)},
         {"NotAfter", DateTime::FromParts(2024, 3, 18, 17, 30, 0)}});
    asn = host.Make<host::ASN>({{"ID", 501}, {"ASNNo", "ASN-000501"}, {"ASNNumber", 4500501}});
  }
  void TearDown() override {
    SetSpooler(previousSpooler);
    SetNow(std::nullopt);
  }

  // The clock on the real date (the date new files are created on), at 09:00.
  static void ClockOnRealDate() {
    SetNow(std::nullopt);
    SetNow(Now().DateOnly().AddSeconds(9 * 3600));
  }

  // The StarTrack carrier (id 3) with the given options.
  std::shared_ptr<MemoryObject<host::Carrier>> MakeCarrier(std::string_view options) {
    return host.Make<host::Carrier>({{"CarrierId", 3},
                                     {"CarrierCode", "STE"},
                                     {"Name", "StarTrack Express"},
                                     {"FileFolder", folder},
                                     {"AccountRef", "SRX"},
                                     {"AccountNumber", "10293847"},
                                     {"Options", options}});
  }

  std::shared_ptr<MemoryObject<host::Pack>> Pack(std::string_view sscc, int itemCount,
                                                  std::string_view cartonCode = "CTN01") {
    return host.Make<host::Pack>({{"SSCC", sscc},
                                  {"ASNId", 501},
                                  {"ASN", asn},
                                  {"PackType", "CARTON"},
                                  {"ItemCount", itemCount},
                                  {"Carton", host.Make<host::Carton>({{"Code", cartonCode}})},
                                  {"Order", order},
                                  {"Despatch", despatch}});
  }

  // A consignment of the packs, awaiting a manifest, dated now.
  std::shared_ptr<MemoryObject<host::ConNote>> AddConNote(
      std::int32_t id, std::string_view number,
      const std::vector<std::shared_ptr<MemoryObject<host::Pack>>>& packs,
      const Fields& fields = {}) {
    auto conNote = host.Make<host::ConNote>({{"ConNoteId", id},
                                             {"ConNoteNo", number},
                                             {"ConNoteDate", Now()},
                                             {"Service", ""},
                                             {"ServiceLevel", "ROAD"},
                                             {"Weight", 12.5},
                                             {"Volume", 0.035},
                                             {"DeliveryInstructions", "Leave at the loading dock"},
                                             {"PartnerCode", "HBS"},
                                             {"DeliveryLocation", "0412 CHADSTONE"},
                                             {"ScheduledDate", DateTime::FromParts(2024, 3, 15)},
                                             {"Vendor", vendor},
                                             {"Carrier", carrier},
                                             {"Receiver", receiver}});
    for (const auto& [name, value] : fields) conNote->fields[name] = value;
    MemoryHost::Attach(conNote, packs);
    return conNote;
  }

  // A consignment of `count` cartons of 12 items.
  std::shared_ptr<MemoryObject<host::ConNote>> AddCartons(std::int32_t id, std::string_view number,
                                                          int count, const Fields& fields = {}) {
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> packs;
    for (int i = 0; i < count; ++i) packs.push_back(Pack(Sscc(id * 10 + i), 12));
    return AddConNote(id, number, packs, fields);
  }

  // An SSCC: "00", the extension digit, the company prefix and the serial.
  static std::string Sscc(int serial) {
    char text[24];
    std::snprintf(text, sizeof text, "000931234500%08d", serial);
    return text;
  }

  struct Run {
    std::unique_ptr<Component> object;
    RowInterface* rows = nullptr;
    Grid columns;
    Grid grid;
    std::int32_t loaded = 0;
    LogList log;
  };
  // Init and Load of a run.
  Run Start(std::string_view identifier) {
    Run run;
    run.object = CreateObject(identifier).object;
    run.rows = as<RowInterface>(run.object);
    EXPECT_TRUE(run.rows->Init(host.system, 7, run.columns));
    run.loaded = run.rows->Load("", run.grid);
    return run;
  }
  // Init, Load, Process of every row and Term; the results of each Process.
  std::vector<std::int32_t> RunAll(std::string_view identifier) {
    Run run = Start(identifier);
    std::vector<std::int32_t> results;
    for (std::int32_t row = 0; row < run.loaded; ++row)
      results.push_back(run.rows->Process(row, run.log));
    EXPECT_TRUE(run.rows->Term());
    return results;
  }

  std::vector<std::string> FilesInFolder() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(root / "carrier"))
      names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }
  std::vector<std::string> Lines(const std::string& name) const {
    return CrLfLines(ReadFile(folder + name).value_or(""));
  }
  // The consignment record "10" of a number in the file.
  std::string RecordOf(const std::string& name, std::string_view number) const {
    for (const std::string& line : Lines(name))
      if (line.starts_with("10" + Pad(number, 20))) return line;
    return "<none>";
  }
  // The printed jobs of the document printer, in order.
  std::vector<std::string> Jobs() const {
    std::vector<std::string> jobs;
    for (const auto& entry : std::filesystem::directory_iterator(root / "spool" / "Office Laser"))
      if (entry.path().extension() == ".pdf") jobs.push_back(entry.path().string());
    std::sort(jobs.begin(), jobs.end());
    return jobs;
  }
  std::vector<std::string> SummaryJobs() const {
    std::vector<std::string> jobs;
    for (const std::string& job : Jobs())
      if (job.find("Consignment Summary Print") != std::string::npos) jobs.push_back(job);
    return jobs;
  }

  MemoryHost host;
  TempFolder temp;
  std::filesystem::path root{temp.path()};
  std::string folder;
  std::shared_ptr<Spooler> previousSpooler;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Receiver>> receiver;
  std::shared_ptr<MemoryObject<host::Order>> order;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
  std::shared_ptr<MemoryObject<host::ASN>> asn;
};

}  // namespace quendal::test
