// A StarTrack manifest run at warehouse scale through the SQLite reference
// host: Init and Load, Process of every row (each consignment written to
// the manifest's CLN file and stamped), then Term with its consignment
// summary. Reports the time per row by blocks of 500 rows and the time of
// Term, for runs of 500 up to 5,000 consignments.
//
//   StarTrackManifestScaling [--disk] [consignments ...]
//
// The database lies in /dev/shm when there is one, so the figures are the
// library's and the host's work rather than the disk's: every host write is
// a transaction of its own, and on a disk each costs a sync. --disk puts
// it in the temporary folder instead.
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "frame/Catalogue.h"
#include "mvserver/SqliteHost.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"

namespace {

using namespace quendal;
namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;
using nlohmann::json;

constexpr int kBlock = 500;

double Seconds(Clock::time_point from, Clock::time_point to) {
  return std::chrono::duration<double>(to - from).count();
}

// A day of `count` consignments awaiting a manifest, of one to three packs each.
json Day(int count, const std::string& folder) {
  json day = {
      {"System", {{"DocumentPrinter", "Office Laser"}, {"UserName", "bench"}, {"NextManifestNumber", 1000001}}},
      {"Vendors", {{{"VendorId", 1}, {"VendorCode", "ALP"}, {"Name", "Alpine Cosmetics"},
                    {"AddressLine2", "88 Factory Lane"}, {"AddressLine3", "DANDENONG"}, {"State", "VIC"},
                    {"Postcode", "3175"}}}},
      {"Carriers", {{{"CarrierId", 1}, {"CarrierCode", "STE"}, {"Name", "StarTrack Express"},
                     {"Options", "#%ATL"}, {"AccountRef", "SRX"}, {"AccountNumber", "10293847"},
                     {"FileFolder", folder}}}},
      {"Partners", {{{"PartnerId", 1}, {"Code", "HBS"}}}},
      {"Receivers", {{{"ReceiverId", 1}, {"Code", "0900"}, {"PartnerId", 1}, {"Name", "Harbour Retail DC"},
                      {"AddressLine1", "12 Wharf Road"}, {"Suburb", "PORT MELBOURNE"}, {"State", "VIC"},
                      {"Postcode", "3207"}, {"CarrierId", 1}}}},
      {"Cartons", {{{"CartonId", 1}, {"Code", "CTN01"}, {"Weight", 0.45}}}},
      {"EDIDocuments", {{{"ID", 7}, {"VendorId", 1}, {"PartnerId", 1}, {"CarrierId", 1}, {"OutputFolder", folder}}}},
      {"Despatches", json::array()}, {"Orders", json::array()}, {"ASNs", json::array()},
      {"ConNotes", json::array()}, {"Packs", json::array()}};
  int packId = 1;
  for (int i = 1; i <= count; ++i) {
    day["Despatches"].push_back({{"DespatchId", i}, {"DespatchNo", "PO" + std::to_string(700000 + i)},
                                 {"NotBefore", "2024-03-15T07:00:00"}, {"NotAfter", "2024-03-18T17:30:00"}});
    day["Orders"].push_back({{"OrderId", i}, {"OrderNo", "SO" + std::to_string(20000 + i)}, {"ReceiverId", 1}});
    day["ASNs"].push_back({{"ID", i}, {"ASNNo", "ASN" + std::to_string(4500000 + i)}, {"ASNNumber", 4500000 + i}});
    day["ConNotes"].push_back({{"ConNoteId", i}, {"ConNoteNo", "SRXZ" + std::to_string(10000000 + i)},
                               {"ConNoteDate", "2024-03-14T08:00:00"}, {"Service", "EXP"}, {"Weight", 4.5 + i % 7},
                               {"Volume", 0.02}, {"DeliveryInstructions", "Rear loading bay"},
                               {"PartnerCode", "HBS"}, {"DeliveryLocation", "0900 PORT MELBOURNE"},
                               {"CarrierId", 1}, {"ReceiverId", 1}, {"VendorId", 1}, {"PartnerId", 1}});
    for (int p = 0; p < 1 + i % 3; ++p, ++packId) {
      char sscc[24];
      std::snprintf(sscc, sizeof sscc, "000931234500%08d", packId);
      day["Packs"].push_back({{"PackId", packId}, {"ConNoteId", i}, {"ASNId", i}, {"CarrierId", 1},
                              {"VendorId", 1}, {"ReceiverId", 1}, {"OrderId", i}, {"DespatchId", i},
                              {"CartonId", 1}, {"SSCC", sscc}, {"PackType", "CARTON"}, {"ItemCount", 5 + p * 20}});
    }
  }
  return day;
}

struct Run {
  std::vector<double> blockSeconds;  // per block of 500 rows
  double rows = 0;                   // every Process
  double term = 0;                   // Term, with its summary
  int written = 0;
};

Run ManifestRun(int count, const fs::path& work, const fs::path& dbFolder) {
  fs::remove_all(work);
  fs::create_directories(work / "carrier");
  fs::create_directories(work / "spool" / "Office Laser");
  const fs::path db = dbFolder / ("quendal-manifest-bench-" + std::to_string(::getpid()) + ".db");
  fs::remove(db);
  Run run;
  {
    auto host = mvserver::SqliteHost::Open(db.string());
    host->Import(Day(count, (work / "carrier").string() + "/").dump());
    auto previousLibrary = host::RegisterLibrary(host);
    auto previousSpooler = SetSpooler(std::make_shared<DirectorySpooler>((work / "spool").string()));

    auto object = CreateObject("Quendal.clsStarTrackManifestcln").object;
    auto* rows = as<RowInterface>(object);
    Grid columns, grid;
    rows->Init(host->System(), 7, columns);
    const std::int32_t loaded = rows->Load("", grid);
    LogList log;
    const auto start = Clock::now();
    auto blockStart = start;
    for (std::int32_t row = 0; row < loaded; ++row) {
      run.written += rows->Process(row, log) != 0;
      if ((row + 1) % kBlock == 0) {
        const auto now = Clock::now();
        run.blockSeconds.push_back(Seconds(blockStart, now));
        blockStart = now;
      }
    }
    const auto processed = Clock::now();
    rows->Term();
    run.term = Seconds(processed, Clock::now());
    run.rows = Seconds(start, processed);

    SetSpooler(previousSpooler);
    host::RegisterLibrary(previousLibrary);
  }
  fs::remove(db);
  fs::remove_all(work);
  return run;
}

}  // namespace

int main(int argc, char** argv) {
  bool disk = false;
  std::vector<int> sizes;
  for (int i = 1; i < argc; ++i) {
    if (std::string(argv[i]) == "--disk")
      disk = true;
    else
      sizes.push_back(std::atoi(argv[i]));
  }
  if (sizes.empty()) sizes = {500, 1000, 2000, 5000};
  SetNow(DateTime::FromParts(2024, 3, 14, 16, 0, 0));
  const fs::path work = fs::temp_directory_path() / ("quendal-manifest-bench-" + std::to_string(::getpid()));
  const fs::path dbFolder = !disk && fs::is_directory("/dev/shm") ? fs::path("/dev/shm") : fs::temp_directory_path();

  std::printf("StarTrack manifest run through the SQLite host (database in %s)\n", dbFolder.c_str());
  std::printf("%8s %9s %12s %12s %12s %10s\n", "rows", "rows s", "first ms/row", "last ms/row",
              "last/first", "Term s");
  bool onTarget = true;
  for (int count : sizes) {
    const Run run = ManifestRun(count, work, dbFolder);
    const double first = run.blockSeconds.empty() ? 0 : run.blockSeconds.front() / kBlock * 1000;
    const double last = run.blockSeconds.empty() ? 0 : run.blockSeconds.back() / kBlock * 1000;
    const double ratio = first > 0 ? last / first : 0;
    std::printf("%8d %9.3f %12.3f %12.3f %12.2f %10.3f\n", count, run.rows, first, last, ratio, run.term);
    if (run.written != count) {
      std::printf("  only %d of %d rows written\n", run.written, count);
      onTarget = false;
    }
    if (count >= 5000) onTarget = onTarget && ratio <= 1.5 && run.term <= 2.0;
  }
  std::printf("targets (5,000 rows: last block per row at most 1.5 x the first, Term at most 2 s): %s\n",
              onTarget ? "met" : "MISSED");
  return onTarget ? 0 : 1;
}
