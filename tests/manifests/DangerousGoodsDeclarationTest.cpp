#include "manifests/DangerousGoodsDeclaration.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>

#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/PdfText.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::MemoryHost;
using test::MemoryObject;
using ::testing::HasSubstr;
using ::testing::Not;

class DangerousGoodsDeclarationTest : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 9, 0, 0));
    fs::create_directories(root / "Office Laser");
    previous = SetSpooler(std::make_shared<DirectorySpooler>(root.string()));
    host.system->fields["DocumentPrinter"] = "Office Laser";

    aerosol = host.Make<host::Product>({{"IsDangerous", true}, {"DGClass", "2.1"}, {"UnitWeight", 0.25}});
    perfume = host.Make<host::Product>({{"IsDangerous", true}, {"DGClass", "3.1"}, {"UnitWeight", 0.5}});
    mystery = host.Make<host::Product>({{"IsDangerous", true}, {"DGClass", "9"}, {"UnitWeight", 1}});
    soap = host.Make<host::Product>({{"IsDangerous", false}, {"DGClass", "3.1"}, {"UnitWeight", 2}});
    auto address = host.Make<host::Address>({{"Name", "Myer Chadstone"},
                                             {"Line1", "1341 Dandenong Road"},
                                             {"Line2", "Loading Dock 3"},
                                             {"Suburb", "CHADSTONE"},
                                             {"State", "VIC"},
                                             {"Postcode", "3148"}});
    order = host.Make<host::Order>({{"OrderNo", "PO-88120"}, {"DeliveryAddress", address}});
    conNote = host.Make<host::ConNote>(
        {{"ConNoteNo", "SRXZ00012345"},
         {"Carrier", host.Make<host::Carrier>({{"Name", "StarTrack Express"}})},
         {"Vendor", host.Make<host::Vendor>({{"Name", "Alpine Cosmetics"},
                                             {"AddressLine1", "Unit 4"},
                                             {"AddressLine2", "88 Factory Lane"},
                                             {"AddressLine3", "DANDENONG"},
                                             {"State", "VIC"},
                                             {"Postcode", "3175"}})},
         {"Orders", Var(MemoryHost::List<host::Order>({order}))}});
  }
  void TearDown() override {
    SetSpooler(previous);
    SetNow(std::nullopt);
  }

  using Line = std::pair<std::shared_ptr<MemoryObject<host::Product>>, int>;
  // Packs holding the given lines.
  void Packs(const std::vector<std::vector<Line>>& packs) {
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> list;
    int n = 0;
    for (const auto& lines : packs) {
      std::vector<std::shared_ptr<host::PackLine>> packLines;
      for (const auto& [product, qty] : lines)
        packLines.push_back(host.Make<host::PackLine>({{"Product", product}, {"Qty", qty}}));
      list.push_back(host.Make<host::Pack>({{"SSCC", "0009312345000000001" + std::to_string(n++)},
                                            {"Order", order},
                                            {"Lines", Var(MemoryHost::List(packLines))}}));
    }
    MemoryHost::Attach(conNote, list);
  }

  bool Print(DeclarationForm form = DeclarationForm::StarTrack) {
    return PrintDangerousGoodsDeclaration(form, host.system, conNote, "cStarTrackDAcln");
  }

  // The text of each printed document, in job order.
  std::vector<std::string> Documents() const {
    std::vector<std::string> jobs;
    for (const auto& entry : fs::directory_iterator(root / "Office Laser"))
      if (entry.path().extension() == ".pdf") jobs.push_back(entry.path().string());
    std::sort(jobs.begin(), jobs.end());
    std::vector<std::string> texts;
    for (const auto& job : jobs) texts.push_back(test::PdfWords(job));
    return texts;
  }

  MemoryHost host;
  test::TempFolder temp;
  fs::path root{temp.path()};
  std::shared_ptr<Spooler> previous;
  std::shared_ptr<MemoryObject<host::Product>> aerosol, perfume, mystery, soap;
  std::shared_ptr<MemoryObject<host::Order>> order;
  std::shared_ptr<MemoryObject<host::ConNote>> conNote;
};

TEST_F(DangerousGoodsDeclarationTest, AStoreDeliveryNamesTheConsignmentsReceiver) {
  // The order of a store delivery has no delivery address of its own.
  order->fields["DeliveryAddress"] = host.Make<host::Address>();
  conNote->fields["Receiver"] = host.Make<host::Receiver>({{"Name", "Harbour Retail DC"},
                                                           {"AddressLine1", "12 Wharf Road"},
                                                           {"AddressLine2", "Gate 4"},
                                                           {"Suburb", "PORT MELBOURNE"},
                                                           {"State", "VIC"},
                                                           {"Postcode", "3207"}});
  Packs({{{aerosol, 1}}});
  ASSERT_TRUE(Print());
  ASSERT_TRUE(Print(DeclarationForm::DFE));
  const auto docs = Documents();
  ASSERT_EQ(docs.size(), 2u);
  for (const std::string& text : docs)
    for (const char* phrase :
         {"Harbour Retail DC", "12 Wharf Road", "Gate 4", "PORT MELBOURNE", "VIC 3207"})
      EXPECT_THAT(text, HasSubstr(phrase));
}

TEST_F(DangerousGoodsDeclarationTest, StarTrackDocumentCarriesPartiesNotesAndGoods) {
  Packs({{{perfume, 4}, {soap, 1}}});
  ASSERT_TRUE(Print());
  const auto docs = Documents();
  ASSERT_EQ(docs.size(), 1u);
  const std::string& text = docs[0];
  for (const char* phrase :
       {"DANGEROUS GOODS SHIPPING/TRANSPORT DOCUMENT", "SENDER:", "RECEIVER", "Alpine Cosmetics",
        "88 Factory Lane", "VIC 3175", "Myer Chadstone", "Loading Dock 3", "CHADSTONE", "VIC 3148",
        "NOTE:",
        "1. A seperate shipping/transport document must be used for each consignment containing "
        "dangerouse goods.",
        "2. Information must be in English, easy to identify, legible and durable.",
        "CARRIER: StarTrack Express", "CONNOTENO SRXZ00012345", "Order PO-88120",
        "Technical/Proper Shipping Name FLAMMABLE LIQUID",
        "Trade/Common Name Nail Polish Remover/Polish, or Perfumery",
        "DG Class/Division 3.1 FLAMMABLE LIQUID", "Type of outer packaging Carton",
        "Number of outer packages of each type 1", "Aggregate of each DG (Net Weight) kg 2",
        "the ADG Code).", "SENDERS NAME: ____", "DATE: 14/03/2024"})
    EXPECT_THAT(text, HasSubstr(phrase)) << phrase;
}

TEST_F(DangerousGoodsDeclarationTest, OneStarTrackDocumentPerPackAndClass) {
  Packs({{{aerosol, 1}, {aerosol, 2}}});  // same class twice in one pack
  ASSERT_TRUE(Print());
  EXPECT_EQ(Documents().size(), 1u);
  EXPECT_THAT(Documents()[0], HasSubstr("Aggregate of each DG (Net Weight) kg 0.75"));

  fs::remove_all(root / "Office Laser");
  fs::create_directories(root / "Office Laser");
  Packs({{{aerosol, 1}}, {{aerosol, 1}}});  // same class in two packs
  ASSERT_TRUE(Print());
  EXPECT_EQ(Documents().size(), 2u);

  fs::remove_all(root / "Office Laser");
  fs::create_directories(root / "Office Laser");
  Packs({{{aerosol, 1}, {perfume, 1}, {mystery, 1}}, {{soap, 3}}});  // classes in one pack
  ASSERT_TRUE(Print());
  const auto docs = Documents();
  ASSERT_EQ(docs.size(), 3u);
  EXPECT_THAT(docs[0], HasSubstr("Trade/Common Name Aerosol, Body Spray or Shaving Cream"));
  EXPECT_THAT(docs[1], HasSubstr("Technical/Proper Shipping Name FLAMMABLE LIQUID"));
  // A class the carrier has no names for keeps the names of the one before.
  EXPECT_THAT(docs[2], HasSubstr("DG Class/Division 9 FLAMMABLE LIQUID"));
}

TEST_F(DangerousGoodsDeclarationTest, NothingDangerousPrintsNothing) {
  Packs({{{soap, 3}}, {}});
  EXPECT_TRUE(Print());
  EXPECT_TRUE(Documents().empty());
}

TEST_F(DangerousGoodsDeclarationTest, DFEDocumentCountsEveryDangerousLine) {
  Packs({{{aerosol, 4}, {perfume, 2}}, {{perfume, 1}, {soap, 5}}});
  ASSERT_TRUE(Print(DeclarationForm::DFE));
  const auto docs = Documents();
  ASSERT_EQ(docs.size(), 1u);
  for (const char* phrase :
       {"UN Number UN1266", "Technical/Proper Shipping Name PERFUMERY PRODUCTS",
        "Trade/Common Name PERFUME", "DG Class/Division 3.1 FLAMMABLE LIQUID",
        "DG Subsidary Risk (if any) NONE", "Packing Group Designator (if any) 2",
        "Number of outer packages of each type 3", "Aggregate of each DG (Net Weight) kg 2.5",
        "SENDERS NAME: Alpine Cosmetics"})
    EXPECT_THAT(docs[0], HasSubstr(phrase)) << phrase;
  EXPECT_THAT(docs[0], Not(HasSubstr("SENDERS NAME: ___")));
}

TEST_F(DangerousGoodsDeclarationTest, AnUnknownPrinterGivesFalse) {
  Packs({{{aerosol, 1}}});
  host.system->fields["DocumentPrinter"] = "Nowhere";
  EXPECT_FALSE(Print());
  host.system->fields["DocumentPrinter"] = Var();
  EXPECT_FALSE(Print(DeclarationForm::DFE));
  EXPECT_TRUE(Documents().empty());
}

}  // namespace
}  // namespace quendal
