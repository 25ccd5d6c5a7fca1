#include "platform/CupsSpooler.h"

#include <gtest/gtest.h>

#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <thread>

#include "frame/Error.h"
#include "labels/cStarTrackGenericSCM.h"
#include "platform/Clock.h"
#include "platform/CodePage.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;

// Runs against the private CUPS server that scripts/test starts: a queue
// whose device is a file. CI must run it; elsewhere it is skipped when no
// server is configured.
class CupsSpoolerTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const char* server = std::getenv("CUPS_SERVER");
    const char* q = std::getenv("QUENDAL_CUPS_QUEUE");
    const char* f = std::getenv("QUENDAL_CUPS_FILE");
    if (!server || !q || !f) {
      const char* ci = std::getenv("CI");
      if (ci && std::string(ci) == "true")
        FAIL() << "CUPS_SERVER, QUENDAL_CUPS_QUEUE and QUENDAL_CUPS_FILE must be set in CI";
      GTEST_SKIP() << "no private CUPS server (scripts/test starts one)";
    }
    queue = q;
    file = f;
    previous = SetSpooler(spooler);
  }
  void TearDown() override {
    if (spooler) SetSpooler(previous);
  }

  // The bytes the queue's device received once the queue is empty.
  std::string Delivered(std::size_t expectedSize) {
    long error = 0;
    const auto handle = spooler->OpenPrinter(queue, error);
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    std::string bytes;
    while (std::chrono::steady_clock::now() < deadline) {
      if (spooler->JobCount(handle, 999) == 0) {
        if (auto content = ReadFile(file); content && content->size() >= expectedSize) {
          bytes = *content;
          break;
        }
      }
      std::this_thread::sleep_for(std::chrono::milliseconds(50));
    }
    spooler->ClosePrinter(handle);
    return bytes;
  }

  std::string queue;
  std::string file;
  std::shared_ptr<CupsSpooler> spooler = std::make_shared<CupsSpooler>();
  std::shared_ptr<Spooler> previous;
};

// One test: the queue and its file are shared by everything below.
TEST_F(CupsSpoolerTest, LabelsReachTheQueueByteForByte) {
  test::MemoryHost host;
  SetNow(DateTime::FromParts(2024, 3, 1));
  auto pack = host.Make<host::Pack>(
      {{"SSCC", "00093123450000000012"},
       {"CarrierId", 7},
       {"Carrier", host.Make<host::Carrier>({{"Name", "StarTrack Express"}})},
       {"Vendor", host.Make<host::Vendor>({{"Name", "Café Supplies"}})},
       {"Receiver", host.Make<host::Receiver>()},
       {"ShipTo", host.Make<host::Receiver>({{"CountryCode", "036"}})},
       {"Order", host.Make<host::Order>({{"DeliveryAddress", host.Make<host::Address>(
                                                                 {{"Name", "Jo Citizen"}, {"Postcode", "3207"}})}})},
       {"Despatch", host.Make<host::Despatch>({{"DespatchNo", "4500012345"}})},
       {"Carton", host.Make<host::Carton>({{"Code", "CTN"}})}});
  clsStarTrackGenericSCM label;

  fs::remove(file);
  ASSERT_TRUE(label.Init(host.system, queue));
  EXPECT_EQ(Delivered(label.PrintVPCLII().size()), label.PrintVPCLII());

  fs::remove(file);
  ASSERT_TRUE(label.PrintLabel(pack));
  const std::string batch = ToCodePage(label.VPCLIIBatchCommand());
  ASSERT_NE(batch.find("\"Caf\xE9 Supplies\""), std::string::npos);
  EXPECT_EQ(Delivered(batch.size()), batch);
  EXPECT_TRUE(host.logs.empty());

  // The same label drawn for an ordinary printer reaches the queue as a PDF page.
  fs::remove(file);
  host.system->fields["PrinterLanguage"] = "WinPCL";
  clsStarTrackGenericSCM drawn;
  ASSERT_TRUE(drawn.Init(host.system, queue));
  ASSERT_TRUE(drawn.PrintLabel(pack));
  const std::string pdf = Delivered(1000);
  EXPECT_TRUE(pdf.starts_with("%PDF-")) << pdf.substr(0, 40);
  EXPECT_NE(pdf.find("%%EOF"), std::string::npos);
  EXPECT_TRUE(host.logs.empty());
  SetNow(std::nullopt);

  long error = 0;
  EXPECT_EQ(spooler->OpenPrinter("quendal-no-such-queue", error), 0);
  EXPECT_EQ(error, err::kUnknownPrinter);
  EXPECT_EQ(spooler->OpenPrinter("", error), 0);
  EXPECT_EQ(error, err::kUnknownPrinter);

  const auto handle = spooler->OpenPrinter(queue, error);
  ASSERT_NE(handle, 0);
  EXPECT_EQ(error, 0);
  // A document given up before its end never reaches the printer.
  const auto before = ReadFile(file);
  ASSERT_GT(spooler->StartDoc(handle, "Quendal.clsStarTrackGenericSCM"), 0);
  EXPECT_TRUE(spooler->Write(handle, "{B,430,N,1|"));
  spooler->ClosePrinter(handle);
  EXPECT_FALSE(spooler->Write(handle, "x"));
  std::this_thread::sleep_for(std::chrono::milliseconds(300));
  EXPECT_EQ(ReadFile(file), before);

  bool listed = false;
  for (const InstalledPrinter& printer : spooler->InstalledPrinters()) {
    if (printer.name != queue) continue;
    listed = true;
    EXPECT_DOUBLE_EQ(printer.twipsPerPixelX, 1440.0 / 300);  // no resolution of its own
  }
  EXPECT_TRUE(listed);
}

}  // namespace
}  // namespace quendal
