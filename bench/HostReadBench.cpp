// Host reads per second through the SQLite reference host, for the members
// one carton label reads: the pack and what it reaches.
#include <benchmark/benchmark.h>

#include <filesystem>
#include <fstream>
#include <sstream>

#include "mvserver/SqliteHost.h"

namespace {

using namespace quendal;

class HostFixture {
 public:
  HostFixture() {
    path_ = (std::filesystem::temp_directory_path() / "quendal-bench-host.db").string();
    std::filesystem::remove(path_);
    host = mvserver::SqliteHost::Open(path_);
    std::ifstream in(QUENDAL_BENCH_FIXTURE);
    std::ostringstream text;
    text << in.rdbuf();
    host->Import(text.str());
  }
  ~HostFixture() {
    host.reset();
    std::filesystem::remove(path_);
  }
  std::shared_ptr<mvserver::SqliteHost> host;
  const std::string& path() const { return path_; }

 private:
  std::string path_;
};

// The reads of one label; returns how many members it read.
int ReadLabel(const Ref<host::Pack>& pack) {
  int reads = 0;
  auto read = [&](const Var& v) {
    benchmark::DoNotOptimize(v);
    ++reads;
  };
  read(pack->SSCC());
  read(pack->StoreCode());
  read(pack->ASNId());
  read(pack->CarrierId());
  read(pack->Weight());
  read(pack->PackType());
  read(pack->PackId());
  auto conNote = pack->ConNote();
  read(conNote->ConNoteNo());
  read(conNote->ConNoteDate());
  auto order = pack->Order();
  read(order->OrderNo());
  auto address = order->DeliveryAddress();
  read(address->Name());
  read(address->Line1());
  read(address->Suburb());
  read(address->State());
  read(address->Postcode());
  auto despatch = pack->Despatch();
  read(despatch->DespatchNo());
  read(despatch->NotBefore());
  read(despatch->NotAfter());
  read(pack->Carton()->Code());
  auto vendor = pack->Vendor();
  read(vendor->Name());
  read(vendor->AddressLine1());
  read(vendor->Suburb());
  read(vendor->State());
  read(vendor->Postcode());
  auto carrier = pack->Carrier();
  read(carrier->Name());
  read(carrier->Options());
  auto receiver = pack->Receiver();
  read(receiver->Name());
  read(receiver->AddressLine1());
  read(receiver->AddressLine2());
  read(receiver->Suburb());
  read(receiver->State());
  read(receiver->Postcode());
  read(receiver->StoreCode());
  read(pack->ShipTo()->CountryCode());
  for (auto line : *pack->Lines()) read(line->Product()->IsDangerous());
  // Object members count as reads too: ConNote, Order, DeliveryAddress, Despatch, Carton,
  // Vendor, Carrier, Receiver, ShipTo, Lines and each line's Product.
  return reads + 10 + pack->Lines()->Count();
}

void LabelReads(benchmark::State& state) {
  HostFixture fixture;
  int reads = 0;
  for (auto _ : state) {
    auto pack = fixture.host->Find<host::Pack>("Pack", 1001 + static_cast<int>(reads % 3));
    reads += ReadLabel(pack);
  }
  state.SetItemsProcessed(reads);
}
BENCHMARK(LabelReads);

// Each label after this host wrote (as when a class sets System.LastError): objects are
// resolved again, rows not written come from the cache.
void LabelReadsAfterWrite(benchmark::State& state) {
  HostFixture fixture;
  int reads = 0;
  for (auto _ : state) {
    auto pack = fixture.host->Find<host::Pack>("Pack", 1001);
    state.PauseTiming();
    fixture.host->System()->SetLastError(0);
    state.ResumeTiming();
    reads += ReadLabel(pack);
  }
  state.SetItemsProcessed(reads);
}
BENCHMARK(LabelReadsAfterWrite);

// Each label after another process changed the file: nothing read before is trusted.
void LabelReadsCold(benchmark::State& state) {
  HostFixture fixture;
  mvserver::Database other(fixture.path());
  int reads = 0;
  for (auto _ : state) {
    state.PauseTiming();
    other.Exec("UPDATE System SET LastError = LastError + 1");
    state.ResumeTiming();
    auto pack = fixture.host->Find<host::Pack>("Pack", 1001);
    reads += ReadLabel(pack);
  }
  state.SetItemsProcessed(reads);
}
BENCHMARK(LabelReadsCold);

}  // namespace

BENCHMARK_MAIN();
