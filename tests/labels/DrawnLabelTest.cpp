// The drawn label end to end: the reference label drawn on a plain
// printer's page as a PNG file, read back by an independent barcode reader.
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <set>

#include "labels/cStarTrackGenericSCM.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "tests/support/Barcodes.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::MemoryHost;

class DrawnLabelTest : public ::testing::TestWithParam<int> {
 protected:
  void SetUp() override {
    fs::create_directories(root / "Office Laser");
    AppendFile((root / "Office Laser/printer.ini").string(),
               "dpi=" + std::to_string(GetParam()) + "\n");
    previous = SetSpooler(std::make_shared<DirectorySpooler>(root.string()));
    SetNow(DateTime::FromParts(2024, 3, 14, 10, 0));
    host.system->fields["PrinterLanguage"] = "WinPCL";
  }
  void TearDown() override {
    SetSpooler(previous);
    SetNow(std::nullopt);
  }

  test::TempFolder temp;
  fs::path root{temp.path()};
  std::shared_ptr<Spooler> previous;
  MemoryHost host;
};

TEST_P(DrawnLabelTest, BarcodesReadBackFromThePicture) {
  host.Make<host::Receiver>({{"Code", "0412"},
                             {"PartnerId", 1},
                             {"Name", "Harbour Stores Chadstone"},
                             {"AddressLine1", "Shop 210"},
                             {"Suburb", "CHADSTONE"},
                             {"State", "VIC"},
                             {"Postcode", "3148"}});
  auto conNote = host.Make<host::ConNote>({{"ConNoteNo", "SRX00012345"}, {"Service", "EXP"}});
  auto pack = host.Make<host::Pack>(
      {{"PackId", 1001},
       {"SSCC", "00093123450000000012"},
       {"StoreCode", "0412"},
       {"PartnerId", 1},
       {"ASNId", 1},
       {"CarrierId", 1},
       {"Carrier", host.Make<host::Carrier>({{"Name", "Southern Road Express"}})},
       {"Vendor", host.Make<host::Vendor>({{"Name", "Acme Apparel Pty Ltd"}})},
       {"Receiver", host.Make<host::Receiver>({{"StoreCode", "0900"}})},
       {"ShipTo", host.Make<host::Receiver>({{"CountryCode", "036"}})},
       {"Order", host.Make<host::Order>({{"DeliveryAddress", host.Make<host::Address>()}})},
       {"Despatch", host.Make<host::Despatch>({{"DespatchNo", "PO778812"}})},
       {"Carton", host.Make<host::Carton>({{"Code", "CTN01"}})}});
  MemoryHost::Attach(conNote, {pack});

  auto prompt = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope scope(prompt);
  clsStarTrackGenericSCM label;
  ASSERT_TRUE(label.Init(host.system, "Office Laser"));
  ASSERT_TRUE(label.PrintLabel(pack)) << (prompt->messages.empty() ? "" : prompt->messages[0]);
  EXPECT_TRUE(host.logs.empty());
  const auto png = ReadFile((root / "Office Laser/000001-Quendal.clsStarTrackGenericSCM.png").string());
  ASSERT_TRUE(png);
  EXPECT_EQ(test::ReadGs1Barcodes(*png),
            (std::set<std::string>{"(00)093123450000000012", "(421)0363148"}));
}

INSTANTIATE_TEST_SUITE_P(Resolutions, DrawnLabelTest, ::testing::Values(203, 300));

}  // namespace
}  // namespace quendal
