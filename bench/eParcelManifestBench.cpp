// The eParcel manifest run at warehouse scale: 5,000 consignments processed
// row by row and written at Term, and a later run that reopens that day's
// file to add one consignment.
#include <benchmark/benchmark.h>
#include <unistd.h>

#include <filesystem>

#include "frame/Catalogue.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::MemoryHost;

constexpr int kConsignments = 5000;

class Warehouse {
 public:
  Warehouse() {
    dir_ = fs::temp_directory_path() / ("quendal-eparcel-bench-" + std::to_string(::getpid()));
    fs::remove_all(dir_);
    fs::create_directories(dir_);
    folder = dir_.string() + "/";
    vendor_ = host.Make<host::Vendor>({{"VendorId", 1},
                                       {"Name", "Acme Apparel Pty Ltd"},
                                       {"AddressLine1", "Unit 4"},
                                       {"Suburb", "DANDENONG SOUTH"},
                                       {"State", "VIC"},
                                       {"Postcode", "3175"},
                                       {"Country", "Australia"}});
    carrier_ = host.Make<host::Carrier>({{"CarrierId", 2},
                                         {"Options", "EP"},
                                         {"AccountRef", "NPP1"},
                                         {"AccountNumber", "98765"},
                                         {"FileFolder", folder}});
    host.Make<host::Partner>({{"PartnerId", 1}});
    host.Make<host::EDIDocument>(
        {{"ID", 7}, {"VendorId", 1}, {"PartnerId", 1}, {"CarrierId", 2}, {"OutputFolder", folder}});
    despatch_ = host.Make<host::Despatch>({{"DespatchNo", "PO778812"}});
    carton_ = host.Make<host::Carton>({{"Length", 0.40}, {"Width", 0.30}, {"Height", 0.25}});
    auto address = host.Make<host::Address>({{"Company", "Harbour Stores Ltd"}});
    customer_ =
        host.Make<host::Customer>({{"Name", "Harbour Stores Online"}, {"Address", address}});
  }
  ~Warehouse() { fs::remove_all(dir_); }

  void AddConNotes(int count) {
    for (int i = 0; i < count; ++i) {
      const int id = static_cast<int>(host.conNotes.size()) + 1;
      auto order = host.Make<host::Order>(
          {{"DeliveryAddress",
            host.Make<host::Address>({{"Name", "Customer " + std::to_string(id)},
                                      {"Line1", std::to_string(id) + " Sample Street"},
                                      {"Suburb", "RICHMOND"},
                                      {"State", "VIC"},
                                      {"Postcode", "3121"},
                                      {"Phone", "0400 000 000"},
                                      {"Email", "customer@example.com"},
                                      {"Reference", "WEB-" + std::to_string(id)}})},
           {"SlipLines", MemoryHost::List<host::PSlipLine>(
                             {host.Make<host::PSlipLine>({{"Customer", customer_}})})}});
      char number[16];
      std::snprintf(number, sizeof number, "NPP%07d", id);
      auto conNote = host.Make<host::ConNote>({{"ConNoteId", id},
                                               {"ConNoteNo", number},
                                               {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 9)},
                                               {"ServiceLevel", "STANDARD"},
                                               {"Weight", 2.5},
                                               {"Vendor", vendor_},
                                               {"Carrier", carrier_},
                                               {"Orders", MemoryHost::List<host::Order>({order})}});
      MemoryHost::Attach(conNote,
                         {host.Make<host::Pack>(
                             {{"Order", order}, {"Despatch", despatch_}, {"Carton", carton_}})});
    }
  }

  // Every consignment back to awaiting a manifest, the folder and the log emptied.
  void Reset() {
    for (const auto& c : host.conNotes) c->fields["ManifestId"] = Var();
    for (const auto& entry : fs::directory_iterator(dir_)) fs::remove(entry.path());
    host.logs.clear();
  }

  // Init and Load of a manifest run; the row count through `rows`.
  std::unique_ptr<Component> Start(std::int32_t& rows) {
    auto object = CreateObject("Quendal.clseParcelManifestxml").object;
    Grid columns;
    Grid grid;
    as<RowInterface>(object)->Init(host.system, 7, columns);
    rows = as<RowInterface>(object)->Load("", grid);
    return object;
  }

  std::string DayFile() const {
    for (const auto& entry : fs::directory_iterator(dir_)) return entry.path().string();
    return {};
  }

  MemoryHost host;
  std::string folder;

 private:
  fs::path dir_;
  std::shared_ptr<test::MemoryObject<host::Vendor>> vendor_;
  std::shared_ptr<test::MemoryObject<host::Carrier>> carrier_;
  std::shared_ptr<test::MemoryObject<host::Despatch>> despatch_;
  std::shared_ptr<test::MemoryObject<host::Carton>> carton_;
  std::shared_ptr<test::MemoryObject<host::Customer>> customer_;
};

void ManifestRunOf5000(benchmark::State& state) {
  Warehouse warehouse;
  warehouse.AddConNotes(kConsignments);
  for (auto _ : state) {
    state.PauseTiming();
    warehouse.Reset();
    std::int32_t rows = 0;
    auto object = warehouse.Start(rows);
    auto* run = as<RowInterface>(object);
    state.ResumeTiming();
    LogList log;
    for (std::int32_t row = 0; row < rows; ++row) benchmark::DoNotOptimize(run->Process(row, log));
    benchmark::DoNotOptimize(run->Term());
  }
  state.counters["consignments"] = kConsignments;
}
BENCHMARK(ManifestRunOf5000)->Unit(benchmark::kMillisecond);

void ReopenDayFileOf5000AndAddOne(benchmark::State& state) {
  Warehouse warehouse;
  warehouse.AddConNotes(kConsignments);
  std::int32_t rows = 0;
  {
    auto first = warehouse.Start(rows);
    LogList log;
    for (std::int32_t row = 0; row < rows; ++row) as<RowInterface>(first)->Process(row, log);
    as<RowInterface>(first)->Term();
  }
  const std::string path = warehouse.DayFile();
  const std::string day = ReadFile(path).value_or("");
  warehouse.AddConNotes(1);
  auto added = warehouse.host.conNotes.back();
  for (auto _ : state) {
    state.PauseTiming();
    ReplaceFile(path, day);
    added->fields["ManifestId"] = Var();
    auto object = warehouse.Start(rows);
    state.ResumeTiming();
    LogList log;
    benchmark::DoNotOptimize(as<RowInterface>(object)->Process(0, log));
    benchmark::DoNotOptimize(as<RowInterface>(object)->Term());
  }
  state.counters["file_bytes"] = static_cast<double>(day.size());
}
BENCHMARK(ReopenDayFileOf5000AndAddOne)->Unit(benchmark::kMillisecond);

}  // namespace
}  // namespace quendal

BENCHMARK_MAIN();
