// Carton labels per second through PrintLabel (in-memory host objects) to
// the in-memory and the directory spooler, and Code 128 encoding of the
// SSCC element string.
#include <benchmark/benchmark.h>

#include <filesystem>
#include <fstream>

#include "bench/LabelStation.h"
#include "labels/WinPrint.h"
#include "labels/cStarTrackGenericSCM.h"
#include "platform/DirectorySpooler.h"
#include "platform/MemorySpooler.h"
#include "platform/Settings.h"

#ifdef QUENDAL_BENCH_ZINT
#include <zint.h>
#endif

namespace quendal {
namespace {

namespace fs = std::filesystem;

// One packing station with a directory spooler's printer folder and the
// printing switches in its settings file.
struct Station : bench::LabelStation {
  Station() : LabelStation("quendal-bench") {
    fs::create_directories(root / "spool" / "Dock 3");
    SaveSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "True");
    SaveSetting("Merivane", "Settings", "clsTollGenericSCM", "False");
  }
};

void BM_PrintLabelToMemorySpooler(benchmark::State& state) {
  Station station;
  auto spooler = std::make_shared<MemorySpooler>();
  spooler->AddPrinter("Dock 3");
  spooler->queueLength = [](const std::string&) { return 3; };
  auto previous = SetSpooler(spooler);
  clsStarTrackGenericSCM label;
  label.Init(station.host.system, "Dock 3");
  Ref<host::Pack> pack = station.pack;
  std::int64_t bytes = 0;
  for (auto _ : state) {
    if (!label.PrintLabel(pack)) state.SkipWithError("PrintLabel failed");
    bytes += static_cast<std::int64_t>(spooler->jobs.back().bytes.size());
    if (spooler->jobs.size() >= 1024) spooler->jobs.clear();
  }
  state.SetItemsProcessed(state.iterations());
  state.SetBytesProcessed(bytes);
  SetSpooler(previous);
}
BENCHMARK(BM_PrintLabelToMemorySpooler);

void BM_PrintLabelToDirectorySpooler(benchmark::State& state) {
  Station station;
  const fs::path folder = station.root / "spool" / "Dock 3";
  auto previous = SetSpooler(std::make_shared<DirectorySpooler>((station.root / "spool").string()));
  clsStarTrackGenericSCM label;
  label.Init(station.host.system, "Dock 3");
  Ref<host::Pack> pack = station.pack;
  std::int64_t printed = 0;
  for (auto _ : state) {
    if (!label.PrintLabel(pack)) state.SkipWithError("PrintLabel failed");
    // The printer takes its jobs away now and then.
    if (++printed % 200 == 0) {
      state.PauseTiming();
      for (const auto& entry : fs::directory_iterator(folder))
        if (entry.path().extension() == ".prn") fs::remove(entry.path());
      state.ResumeTiming();
    }
  }
  state.SetItemsProcessed(state.iterations());
  SetSpooler(previous);
}
BENCHMARK(BM_PrintLabelToDirectorySpooler);

// A drawn label on an ordinary printer at 300 dpi: the label's format and
// batch read back, laid out, drawn with Cairo and written as a 1-bit PNG
// page file (100 x 150 mm, 1181 x 1772 pixels).
void BM_DrawnLabelToPngAt300Dpi(benchmark::State& state) {
  Station station;
  const fs::path folder = station.root / "spool" / "Office Laser";
  fs::create_directories(folder);
  std::ofstream(folder / "printer.ini") << "dpi=300\n";
  station.host.system->fields["PrinterLanguage"] = "WinPCL";
  auto previous = SetSpooler(std::make_shared<DirectorySpooler>((station.root / "spool").string()));
  clsStarTrackGenericSCM label;
  label.Init(station.host.system, "Office Laser");
  Ref<host::Pack> pack = station.pack;
  std::int64_t printed = 0;
  for (auto _ : state) {
    if (!label.PrintLabel(pack)) state.SkipWithError("PrintLabel failed");
    if (++printed % 100 == 0) {
      state.PauseTiming();
      for (const auto& entry : fs::directory_iterator(folder))
        if (entry.path().extension() == ".png") fs::remove(entry.path());
      state.ResumeTiming();
    }
  }
  state.SetItemsProcessed(state.iterations());
  SetSpooler(previous);
}
BENCHMARK(BM_DrawnLabelToPngAt300Dpi)->Unit(benchmark::kMillisecond);

void BM_BarPatternSscc(benchmark::State& state) {
  const std::string data = "~20100093123450000000012";
  for (auto _ : state) benchmark::DoNotOptimize(BarPattern(data));
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_BarPatternSscc);

#ifdef QUENDAL_BENCH_ZINT
// For comparison: Zint encoding the same element string as GS1-128.
void BM_ZintGs1128Sscc(benchmark::State& state) {
  zint_symbol* symbol = ZBarcode_Create();
  const std::string data = "[00]093123450000000012";
  for (auto _ : state) {
    ZBarcode_Clear(symbol);
    symbol->symbology = BARCODE_GS1_128;
    symbol->input_mode = GS1_MODE;
    if (ZBarcode_Encode(symbol, reinterpret_cast<const unsigned char*>(data.data()),
                        static_cast<int>(data.size())) >= ZINT_ERROR)
      state.SkipWithError(symbol->errtxt);
    benchmark::DoNotOptimize(symbol->encoded_data);
  }
  ZBarcode_Delete(symbol);
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_ZintGs1128Sscc);
#endif

}  // namespace
}  // namespace quendal

BENCHMARK_MAIN();
