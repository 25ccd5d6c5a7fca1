// A busy day in one carrier file, 10,000 consignments by default. Reports
// the time of each block of 1,000 and checks that the day costs no more at
// its end than at its start (the last block at most 1.5 times the first).
//
//  - StarTrack ".CLN": every 500th number is sent twice (the repeat must be
//    refused); the indexed duplicate check against reading the whole file
//    each time.
//  - TNT ET11: the trailer replaced in place through the journal against
//    rewriting the whole file without its trailer for every consignment.
//  - DFE XML: each consignment's elements put in before the closing root
//    tag through the journal against reading, extending and writing the
//    whole document for every consignment.
//
// Each pair must leave byte-identical files. The files lie in TMPDIR (a
// tmpfs such as /dev/shm takes the cost of flushing to disk out of the
// figures). --no-reference skips the slow method of each pair.
//
//   DayScaling [cln|et11|dfe|all] [consignments] [--no-reference]
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "carrierfiles/cDFEDAxml.h"
#include "carrierfiles/cStarTrackDAcln.h"
#include "carrierfiles/cTNTDAet11.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"

namespace {

using namespace quendal;
namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;

struct Run {
  std::vector<double> blockSeconds;
  std::vector<double> blockCpuSeconds;  // without the waits for the disk
  std::string file;
};

// Times each block of 1,000 consignments on the clock on the wall and in processor time.
class Blocks {
 public:
  void Done(int consignments, Run& run) {
    if (consignments % 1000 != 0) return;
    const auto now = Clock::now();
    run.blockSeconds.push_back(std::chrono::duration<double>(now - wall_).count());
    const std::clock_t cpu = std::clock();
    run.blockCpuSeconds.push_back(static_cast<double>(cpu - cpu_) / CLOCKS_PER_SEC);
    wall_ = now;
    cpu_ = cpu;
  }

 private:
  Clock::time_point wall_ = Clock::now();
  std::clock_t cpu_ = std::clock();
};

// The day's file (the one with the extension) of a run, and the run's folder removed.
std::string TakeFile(const fs::path& folder, const std::string& extension) {
  std::string file;
  for (const auto& entry : fs::directory_iterator(folder))
    if (entry.path().extension() == extension) file = ReadFile(entry.path().string()).value_or("");
  fs::remove_all(folder);
  return file;
}

Run ClnDay(const fs::path& folder, int consignments, bool indexed) {
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
  Blocks blocks;
  int sent = 0;
  for (int i = 0; i < consignments; ++i) {
    // Every 500th consignment is sent a second time right after.
    for (int copy = 0; copy < (i % 500 == 499 ? 2 : 1); ++copy) {
      char number[32];
      std::snprintf(number, sizeof number, "SRXZ%08d", i);
      auto conNote =
          host.Make<host::ConNote>({{"ConNoteNo", number},
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
      cls.Process(host.system, conNote, asn,
                  host::Object::As<host::PackList>(conNote->Get("Packs")), log);
      ++sent;
    }
    blocks.Done(i + 1, run);
  }
  run.file = TakeFile(folder, ".CLN");
  return run;
}

// Consignments of two to nine packs appended to one day's ET11 file.
Run Et11Day(const fs::path& folder, int consignments, bool inPlace) {
  test::MemoryHost host;
  fs::remove_all(folder);
  fs::create_directories(folder);
  auto carrier = host.Make<host::Carrier>({{"FileFolder", folder.string() + "/"},
                                           {"AccountRef", "TNT01"},
                                           {"AccountNumber", "30012345"}});
  auto vendor = host.Make<host::Vendor>({{"Name", "Kestrel Apparel Pty Ltd"}, {"State", "VIC"}});
  auto receiver = host.Make<host::Receiver>({{"Name", "Harbour Stores Chadstone"},
                                             {"AddressLine2", "Rear loading dock"},
                                             {"Suburb", "CHADSTONE"},
                                             {"State", "VIC"},
                                             {"Postcode", "3148"}});
  auto asn = host.Make<host::ASN>({{"ID", 501}, {"ASNNo", "ASN0004501"}, {"OriginCode", "MEL"}});
  auto despatch =
      host.Make<host::Despatch>({{"NotAfter", DateTime::FromParts(2024, 3, 19, 17, 0, 0)}});

  clsTNTDAet11 cls;
  cls.SetTailReplacement(inPlace);
  Run run;
  Blocks blocks;
  for (int i = 0; i < consignments; ++i) {
    char number[32];
    std::snprintf(number, sizeof number, "TNT%08d", i);
    auto conNote =
        host.Make<host::ConNote>({{"ConNoteId", 100000 + i},
                                  {"ConNoteNo", number},
                                  {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 8, 0, 0)},
                                  {"Service", "EXPRESS"},
                                  {"CarrierPrefix", "TNT"},
                                  {"Weight", 4.5},
                                  {"Volume", 0.02},
                                  {"Carrier", carrier},
                                  {"Receiver", receiver},
                                  {"Vendor", vendor}});
    std::vector<std::shared_ptr<test::MemoryObject<host::Pack>>> packs;
    for (int p = 0; p < 2 + i % 8; ++p) {
      char sscc[32];
      std::snprintf(sscc, sizeof sscc, "0009312345%08d%02d", i, p);
      packs.push_back(
          host.Make<host::Pack>({{"SSCC", sscc}, {"PackType", "CARTON"}, {"Despatch", despatch}}));
    }
    test::MemoryHost::Attach(conNote, packs);
    LogList log;
    cls.Process(host.system, conNote, asn, host::Object::As<host::PackList>(conNote->Get("Packs")),
                log);
    blocks.Done(i + 1, run);
  }
  run.file = TakeFile(folder, ".TXT");
  return run;
}

// Consignments of one to three packs added to one day's DFE despatch advice.
Run DfeDay(const fs::path& folder, int consignments, bool inPlace) {
  test::MemoryHost host;
  fs::remove_all(folder);
  fs::create_directories(folder);
  auto carrier =
      host.Make<host::Carrier>({{"FileFolder", folder.string() + "/"}, {"AccountNumber", "40217"}});
  auto address = host.Make<host::Address>({{"Name", "Harbour Stores Chadstone"},
                                           {"Line1", "Shop 210"},
                                           {"Line2", "Rear loading dock"},
                                           {"Suburb", "CHADSTONE"},
                                           {"State", "VIC"},
                                           {"Postcode", "3148"}});
  auto order = host.Make<host::Order>({{"DeliveryAddress", address}});
  auto asn = host.Make<host::ASN>({{"ID", 501}, {"ASNNo", "ASN0004501"}});
  auto despatch =
      host.Make<host::Despatch>({{"DespatchNo", "DSP778812"},
                                 {"NotBefore", DateTime::FromParts(2024, 3, 15, 7, 0, 0)},
                                 {"NotAfter", DateTime::FromParts(2024, 3, 19, 17, 0, 0)}});

  clsDFEDAxml cls;
  cls.SetTailReplacement(inPlace);
  Run run;
  Blocks blocks;
  for (int i = 0; i < consignments; ++i) {
    char number[32];
    std::snprintf(number, sizeof number, "DFE%08d", i);
    auto conNote =
        host.Make<host::ConNote>({{"ConNoteId", 100000 + i},
                                  {"ConNoteNo", number},
                                  {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 8, 0, 0)},
                                  {"Weight", 4.5 + i % 7},
                                  {"Carrier", carrier}});
    std::vector<std::shared_ptr<test::MemoryObject<host::Pack>>> packs;
    for (int p = 0; p < 1 + i % 3; ++p) {
      char sscc[32];
      std::snprintf(sscc, sizeof sscc, "0009312345%08d%02d", i, p);
      packs.push_back(
          host.Make<host::Pack>({{"SSCC", sscc},
                                 {"PackType", i % 10 == 9 && p == 0 ? "PALLET" : "CARTON"},
                                 {"ASN", asn},
                                 {"Order", order},
                                 {"Despatch", despatch}}));
    }
    test::MemoryHost::Attach(conNote, packs);
    LogList log;
    cls.Process(host.system, conNote, asn, host::Object::As<host::PackList>(conNote->Get("Packs")),
                log);
    blocks.Done(i + 1, run);
  }
  run.file = TakeFile(folder, ".XML");
  return run;
}

void Report(const char* name, const Run& run) {
  const auto line = [](const std::string& label, const std::vector<double>& blocks) {
    std::printf("%-24s", label.c_str());
    for (double s : blocks) std::printf(" %7.3f", s);
    if (!blocks.empty()) std::printf("   last/first %.2f", blocks.back() / blocks.front());
    std::printf("\n");
  };
  line(name, run.blockSeconds);
  line(std::string("  cpu"), run.blockCpuSeconds);
}

// Both methods leave the same file; the first method keeps to its target.
bool Compare(const char* what, const Run& fast, const std::optional<Run>& reference) {
  const bool same = !reference || fast.file == reference->file;
  if (!reference)
    std::printf("%s file: %zu bytes, not compared\n", what, fast.file.size());
  else
    std::printf("%s file: %zu bytes, identical: %s\n", what, fast.file.size(), same ? "yes" : "NO");
  const bool onTarget =
      !fast.blockSeconds.empty() && fast.blockSeconds.back() <= 1.5 * fast.blockSeconds.front();
  std::printf("%s target (last block at most 1.5 x the first): %s\n\n", what,
              onTarget ? "met" : "MISSED");
  return same && onTarget;
}

}  // namespace

int main(int argc, char** argv) {
  const std::string which = argc > 1 ? argv[1] : "all";
  const int consignments = argc > 2 ? std::atoi(argv[2]) : 10000;
  const bool reference = !(argc > 3 && std::string(argv[3]) == "--no-reference");
  if ((which != "cln" && which != "et11" && which != "dfe" && which != "all") ||
      consignments < 1000) {
    std::fprintf(
        stderr,
        "usage: DayScaling [cln|et11|dfe|all] [consignments, at least 1000] [--no-reference]\n");
    return 2;
  }
  SetNow(DateTime::FromParts(2024, 3, 14, 9, 0, 0));
  const fs::path root = fs::temp_directory_path() / ("quendal-day-" + std::to_string(::getpid()));
  std::printf("%d consignments to one day's file; seconds per block of 1,000\n", consignments);
  bool ok = true;
  if (which == "cln" || which == "all") {
    const Run indexed = ClnDay(root / "indexed", consignments, true);
    Report("CLN indexed check", indexed);
    std::optional<Run> scanned;
    if (reference)
      Report("CLN whole-file check", *(scanned = ClnDay(root / "scanned", consignments, false)));
    ok = Compare("CLN", indexed, scanned) && ok;
  }
  if (which == "et11" || which == "all") {
    const Run inPlace = Et11Day(root / "in-place", consignments, true);
    Report("ET11 tail in place", inPlace);
    std::optional<Run> rewritten;
    if (reference)
      Report("ET11 whole rewrite", *(rewritten = Et11Day(root / "rewritten", consignments, false)));
    ok = Compare("ET11", inPlace, rewritten) && ok;
  }
  if (which == "dfe" || which == "all") {
    const Run inPlace = DfeDay(root / "dfe-in-place", consignments, true);
    Report("DFE elements in place", inPlace);
    std::optional<Run> rewritten;
    if (reference)
      Report("DFE whole rewrite",
             *(rewritten = DfeDay(root / "dfe-rewritten", consignments, false)));
    ok = Compare("DFE", inPlace, rewritten) && ok;
  }
  fs::remove_all(root);
  return ok ? 0 : 1;
}
