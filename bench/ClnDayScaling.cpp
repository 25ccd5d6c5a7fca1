// A busy day in one StarTrack consignment file: 10,000 consignments
// appended to the same ".CLN" file, every 500th number sent twice (the
// repeat must be refused). Reports the time of each block of 1,000 for the
// indexed duplicate check and for reading the whole file each time, and
// checks that both leave byte-identical files.
//
//   ClnDayScaling [consignments]
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

#include "carrierfiles/cStarTrackDAcln.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"

namespace {

using namespace quendal;
namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;

struct Run {
  std::vector<double> blockSeconds;
  std::string file;
};

Run Day(const fs::path& folder, int consignments, bool indexed) {
  test::MemoryHost host;
  fs::remove_all(folder);
  fs::create_directories(folder);
  auto carrier = host.Make<host::Carrier>({{"FileFolder", folder.string() + "/"},
                                           {"AccountRef", "SRX"},
                                           {"AccountNumber", "10293847"},
                                           {"Options", "#%ATL"}});
  auto receiver = host.Make<host::Receiver>({{"Name", "Harbour Retail DC"},
                                             {"AddressLine1", "12 Wharf Road"},
                                             {"Suburb", "PORT MELBOURNE"},
                                             {"State", "VIC"},
                                             {"Postcode", "3207"}});
  auto asn = host.Make<host::ASN>({{"ID", 501}, {"ASNNo", "ASN-000501"}, {"ASNNumber", 4500501}});
  auto despatch = host.Make<host::Despatch>(
      {{"DespatchNo", "DSP778812"}, {"NotBefore", DateTime::FromParts(2024, 3, 15, 7, 0, 0)}});

  clsStarTrackDAcln cls;
  cls.SetDuplicateIndex(indexed);
  Run run;
  auto blockStart = Clock::now();
  int sent = 0;
  for (int i = 0; i < consignments; ++i) {
    // Every 500th consignment is sent a second time right after.
    for (int copy = 0; copy < (i % 500 == 499 ? 2 : 1); ++copy) {
      char number[32];
      std::snprintf(number, sizeof number, "SRXZ%08d", i);
      auto conNote = host.Make<host::ConNote>({{"ConNoteNo", number},
                                               {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 8, 0, 0)},
                                               {"Weight", 4.5},
                                               {"Volume", 0.02},
                                               {"Carrier", carrier},
                                               {"Receiver", receiver}});
      char sscc[32];
      std::snprintf(sscc, sizeof sscc, "000931234500%08d", i);
      auto pack = host.Make<host::Pack>({{"SSCC", sscc}, {"ASNId", 501}, {"Despatch", despatch}});
      test::MemoryHost::Attach(conNote, {pack});
      LogList log;
      cls.Process(host.system, conNote, asn, host::Object::As<host::PackList>(conNote->Get("Packs")),
                  log);
      ++sent;
    }
    if ((i + 1) % 1000 == 0) {
      const auto now = Clock::now();
      run.blockSeconds.push_back(std::chrono::duration<double>(now - blockStart).count());
      blockStart = now;
    }
  }
  for (const auto& entry : fs::directory_iterator(folder))
    run.file = ReadFile(entry.path().string()).value_or("");
  fs::remove_all(folder);
  return run;
}

void Report(const char* name, const Run& run) {
  std::printf("%-22s", name);
  for (double s : run.blockSeconds) std::printf(" %7.3f", s);
  if (!run.blockSeconds.empty())
    std::printf("   last/first %.2f\n", run.blockSeconds.back() / run.blockSeconds.front());
}

}  // namespace

int main(int argc, char** argv) {
  const int consignments = argc > 1 ? std::atoi(argv[1]) : 10000;
  SetNow(DateTime::FromParts(2024, 3, 14, 9, 0, 0));
  const fs::path root = fs::temp_directory_path() / ("quendal-cln-day-" + std::to_string(::getpid()));

  std::printf("%d consignments to one day's file; seconds per block of 1,000\n", consignments);
  const Run indexed = Day(root / "indexed", consignments, true);
  Report("indexed check", indexed);
  const Run scanned = Day(root / "scanned", consignments, false);
  Report("whole-file check", scanned);
  fs::remove_all(root);

  const bool same = indexed.file == scanned.file;
  std::printf("file: %zu bytes, identical: %s\n", indexed.file.size(), same ? "yes" : "NO");
  const bool onTarget = !indexed.blockSeconds.empty() &&
                        indexed.blockSeconds.back() <= 1.5 * indexed.blockSeconds.front();
  std::printf("target (last block at most 1.5 x the first, indexed): %s\n", onTarget ? "met" : "MISSED");
  return same && onTarget ? 0 : 1;
}
