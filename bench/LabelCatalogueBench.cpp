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
#include <map>
#include <string>
#include <vector>

#include "bench/LabelStation.h"
#include "frame/Catalogue.h"
#include "platform/MemorySpooler.h"

namespace quendal {
namespace {

constexpr std::string_view kReference = "clsStarTrackGenericSCM";
constexpr double kTarget = 1.5;

bench::LabelStation* station = nullptr;

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
  bench::LabelStation here("quendal-catalogue-bench");
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
