// PrintLabel of every built label class of the catalogue, one carton at a
// time to the in-memory spooler, over in-memory host objects: labels per
// second per class, and each class's cost against the reference class
// (clsStarTrackGenericSCM). Classes are taken from the catalogue, so a class
// built later is measured without a change here.
//
// The target: no class costs more than 1.5 times the reference class per
// label. The program prints a table of the classes and exits with status 1
// when one misses it. Each class is measured nine times, the runs of all
// classes interleaved at random so that a machine busy with other work
// weighs on every class alike, and the medians are compared. Google
// Benchmark's options apply and override these (--benchmark_repetitions=1,
// --benchmark_filter=BigW to measure some classes only, with the reference
// class among them).
#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <map>
#include <string>
#include <vector>
#include <unistd.h>

#include "frame/Catalogue.h"
#include "platform/Clock.h"
#include "platform/MemorySpooler.h"
#include "tests/support/MemoryHost.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;

constexpr std::string_view kReference = "clsStarTrackGenericSCM";
constexpr double kTarget = 1.5;

// One packing station: a carton for a store that goes through its
// distribution centre, with everything the label classes read (the
// delivery location and the store, zones, bill of lading, the consignment's
// packs); the settings folder its own and the clock fixed.
struct Station {
  Station() {
    root = fs::temp_directory_path() / ("quendal-catalogue-bench-" + std::to_string(::getpid()));
    fs::remove_all(root);
    fs::create_directories(root);
    ::setenv("XDG_CONFIG_HOME", root.c_str(), 1);
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
  ~Station() {
    SetNow(std::nullopt);
    fs::remove_all(root);
  }
  fs::path root;
  test::MemoryHost host;
  std::shared_ptr<test::MemoryObject<host::Pack>> pack;
};

Station* station = nullptr;

void BM_PrintLabel(benchmark::State& state, const CatalogueEntry* entry) {
  auto spooler = std::make_shared<MemorySpooler>();
  spooler->AddPrinter("Dock 3");
  spooler->queueLength = [](const std::string&) { return 3; };
  auto previous = SetSpooler(spooler);
  Created created = CreateObject(entry->Identifier());
  auto* label = as<LabelInterface>(created.object);
  if (!label || !label->Init(station->host.system, "Dock 3")) state.SkipWithError("Init failed");
  Ref<host::Pack> pack = station->pack;
  for (auto _ : state) {
    if (!label->PrintLabel(pack)) state.SkipWithError("PrintLabel failed");
    if (spooler->jobs.size() >= 1024) spooler->jobs.clear();
  }
  state.SetItemsProcessed(state.iterations());
  SetSpooler(previous);
}

// Prints as the console reporter does and keeps each class's CPU time per
// label (the median when runs are repeated).
class Collector : public benchmark::ConsoleReporter {
 public:
  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs) {
      if (run.error_occurred) continue;
      const bool median = run.run_type == Run::RT_Aggregate && run.aggregate_name == "median";
      if (run.run_type == Run::RT_Aggregate && !median) continue;
      std::string name = run.run_name.function_name;
      name = name.substr(name.find('/') + 1);
      if (median || !seconds.contains(name))
        seconds[name] = run.GetAdjustedCPUTime() / benchmark::GetTimeUnitMultiplier(run.time_unit);
    }
  }
  std::map<std::string, double> seconds;  // CPU seconds per label, by class
};

}  // namespace
}  // namespace quendal

int main(int argc, char** argv) {
  using namespace quendal;
  std::vector<char*> args{argv[0]};
  std::string defaults[] = {"--benchmark_repetitions=9", "--benchmark_min_time=0.2",
                            "--benchmark_enable_random_interleaving=true",
                            "--benchmark_report_aggregates_only=true"};
  for (std::string& option : defaults) args.push_back(option.data());
  args.insert(args.end(), argv + 1, argv + argc);
  argc = static_cast<int>(args.size());
  argv = args.data();
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  Station here;
  station = &here;
  for (const CatalogueEntry& entry : Catalogue())
    if (entry.family == Family::Label && entry.factory)
      benchmark::RegisterBenchmark(("PrintLabel/" + std::string(entry.className)).c_str(), BM_PrintLabel,
                                   &entry)
          ->Unit(benchmark::kMicrosecond);
  Collector collector;
  benchmark::RunSpecifiedBenchmarks(&collector);
  benchmark::Shutdown();

  const auto reference = collector.seconds.find(std::string(kReference));
  if (reference == collector.seconds.end()) {
    std::printf("\nThe reference class %s was not measured: no comparison.\n", kReference.data());
    return 0;
  }
  std::printf("\n%-28s %14s %12s  %s\n", "Class", "labels/s", "cost ratio", "within 1.5");
  int missed = 0;
  for (const auto& [name, seconds] : collector.seconds) {
    const double ratio = seconds / reference->second;
    const bool met = ratio <= kTarget;
    missed += met ? 0 : 1;
    std::printf("%-28s %14.0f %12.2f  %s\n", name.c_str(), 1 / seconds, ratio, met ? "yes" : "NO");
  }
  std::printf("%zu classes; %d over %.1f times the reference's cost per label\n", collector.seconds.size(),
              missed, kTarget);
  return missed ? 1 : 0;
}
