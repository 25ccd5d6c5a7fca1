#include "manifests/ceParcelManifestEODxml.h"

#include <gtest/gtest.h>

#include <pugixml.hpp>

#include "tests/manifests/eParcelFixture.h"

namespace quendal {
namespace {

constexpr std::string_view kEndOfDayClass = "Quendal.clseParcelManifestEODxml";
constexpr std::string_view kManifestClass = "Quendal.clseParcelManifestxml";

class eParcelEndOfDayTest : public test::eParcelFixture {
 protected:
  std::shared_ptr<test::MemoryObject<host::Order>> JSmith() {
    return MakeOrder({{"Name", "J SMITH"},
                      {"Line1", "5 Sample Street"},
                      {"Suburb", "RICHMOND"},
                      {"State", "VIC"},
                      {"Postcode", "3121"},
                      {"Reference", "WEB-5521"}},
                     true);
  }
  static pugi::xml_document Parse(const std::string& text) {
    pugi::xml_document doc;
    EXPECT_TRUE(doc.load_string(text.c_str())) << text;
    return doc;
  }
};

TEST_F(eParcelEndOfDayTest, TodaysConsignmentsGoOutWithOneArticleAndNoManifestRecord) {
  auto today = AddConNote(201, "NPP0000201", 3, JSmith());
  AddConNote(202, "NPP0000202", 1, JSmith(),
             {{"ConNoteDate", DateTime::FromParts(2024, 3, 13, 23, 59, 59)}});
  AddConNote(203, "NPP0000203", 1, JSmith(),
             {{"ManifestId", 5}, {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 0, 0, 0)}});

  auto object = CreateObject(kEndOfDayClass).object;
  auto* rows = as<RowInterface>(object);
  Grid columns;
  ASSERT_TRUE(rows->Init(host.system, 7, columns));
  Grid grid;
  ASSERT_EQ(rows->Load("", grid), 2);  // yesterday's is not listed; a manifested one of today is
  EXPECT_EQ(grid(0, 2).Text(), "RICHMOND");  // always the delivery location
  EXPECT_EQ(grid(1, 0).Text(), "NPP0000203");

  LogList log;
  ASSERT_EQ(rows->Process(0, log), 201);
  ASSERT_EQ(log.size(), 1u);
  ASSERT_TRUE(rows->Term());

  ASSERT_EQ(FilesInFolder(), std::vector<std::string>{"NPP1_2403141630_EP.xml"});
  const auto doc = Parse(FileText("NPP1_2403141630_EP.xml"));
  EXPECT_STREQ(doc.select_node("//PCMSManifest/ManifestNumber").node().child_value(), "2403141630");
  const pugi::xml_node consignment = doc.select_node("//PCMSConsignment").node();
  EXPECT_STREQ(consignment.child_value("DeliveryCompanyName"), "Harbour Stores Online");
  const auto articles = doc.select_nodes("//PCMSDomesticArticle");
  ASSERT_EQ(articles.size(), 1u);
  EXPECT_STREQ(articles[0].node().child_value("ArticleNumber"), "NPP10000201015024");

  EXPECT_TRUE(today->Get("ManifestId").IsNull());
  EXPECT_FALSE(today->fields.contains("Updated"));
  EXPECT_EQ(host.nextManifestId, 1);
}

TEST_F(eParcelEndOfDayTest, EachRunLooksForTheDayFileWhereItsClassKeepsIt) {
  ClockOnRealDate();
  // The manifest run looks in the EDI document's output folder, the
  // end-of-day run in the carrier's file folder; both write to the latter.
  const std::filesystem::path elsewhere = dir / "edi";
  std::filesystem::create_directories(elsewhere);
  host.ediDocuments[0]->fields["OutputFolder"] = Var(elsewhere.string() + "/");
  AddConNote(301, "NPP0000301", 1, JSmith());
  AddConNote(302, "NPP0000302", 1, JSmith());

  auto manifest = Start(kManifestClass);
  LogList log;
  ASSERT_EQ(as<RowInterface>(manifest)->Process(0, log), 301);
  ASSERT_TRUE(as<RowInterface>(manifest)->Term());

  auto endOfDay = Start(kEndOfDayClass);
  ASSERT_EQ(as<RowInterface>(endOfDay)->Process(1, log), 302);
  ASSERT_TRUE(as<RowInterface>(endOfDay)->Term());
  EXPECT_EQ(Parse(FileText("NPP1_1000_EP.xml")).select_nodes("//PCMSConsignment").size(), 2u);

  AddConNote(303, "NPP0000303", 1, JSmith());
  auto second = Start(kManifestClass);
  ASSERT_EQ(as<RowInterface>(second)->Process(0, log), 302);  // 301 has its manifest now
  ASSERT_TRUE(as<RowInterface>(second)->Term());
  EXPECT_EQ(FilesInFolder(), (std::vector<std::string>{"NPP1_1000_EP.xml", "NPP1_1001_EP.xml", "edi"}));
}

}  // namespace
}  // namespace quendal
