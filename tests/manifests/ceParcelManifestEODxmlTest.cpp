#include <gtest/gtest.h>

#include <algorithm>

#include "manifests/ceParcelManifestEODxml.h"
#include "tests/manifests/eParcelFixture.h"

namespace quendal {
namespace {

using Strings = std::vector<std::string>;

constexpr std::string_view kEndOfDayClass = "Quendal.clseParcelManifestEODxml";

class eParcelEndOfDayTest : public test::eParcelFixture {
 protected:
  std::shared_ptr<test::MemoryObject<host::Order>> JSmith() {
    return MakeOrder({{"Name", "J SMITH"}, {"Suburb", "RICHMOND"}, {"Postcode", "3121"}});
  }
};

TEST_F(eParcelEndOfDayTest, TodaysConsignmentsGoOutWithOneArticleAndNoManifestRecord) {
  auto today = AddConNote(201, "NPP0000201", 3, JSmith());
  AddConNote(202, "NPP0000202", 1, JSmith(),
             {{"ConNoteDate", DateTime::FromParts(2024, 3, 13, 23, 59, 59)}});
  AddConNote(203, "NPP0000203", 1, JSmith(), {{"ManifestId", 5}});

  auto object = CreateObject(kEndOfDayClass).object;
  auto* rows = as<RowInterface>(object);
  Grid columns, grid;
  ASSERT_TRUE(rows->Init(host.system, 7, columns));
  ASSERT_EQ(rows->Load("", grid), 2);  // yesterday's is not listed; a manifested one of today is
  EXPECT_EQ(grid(0, 2).Text(), "RICHMOND");  // the delivery location, even for a single order
  LogList log;
  ASSERT_EQ(rows->Process(0, log), 201);
  ASSERT_TRUE(rows->Term());

  const std::string file = "NPP1_2403141630_EP.xml";  // the manifest number is the clock
  ASSERT_EQ(FilesInFolder(), Strings{file});
  EXPECT_EQ(Values(file, "//PCMSManifest/ManifestNumber"), Strings{"2403141630"});
  EXPECT_EQ(Values(file, "//DeliveryCompanyName"), Strings{"Harbour Stores Online"});
  EXPECT_EQ(Values(file, "//ArticleNumber"), Strings{"NPP10000201015024"});
  EXPECT_TRUE(today->Get("ManifestId").IsNull());
  EXPECT_FALSE(today->fields.contains("Status"));
  EXPECT_EQ(host.nextManifestId, 1);
}

TEST_F(eParcelEndOfDayTest, EachRunLooksForTheDayFileWhereItsClassKeepsIt) {
  // The manifest run looks in the EDI document's output folder, the
  // end-of-day run in the carrier's file folder; both write to the latter.
  ClockOnRealDate();
  std::filesystem::create_directories(dir / "edi");
  host.ediDocuments[0]->fields["OutputFolder"] = Var(folder + "edi/");
  AddConNote(301, "NPP0000301", 1, JSmith());
  AddConNote(302, "NPP0000302", 1, JSmith());
  Run("Quendal.clseParcelManifestxml", {0});
  Run(kEndOfDayClass, {1});
  EXPECT_EQ(Values("NPP1_1000_EP.xml", "//ConsignmentNumber"),
            (Strings{"NPP10000301", "NPP10000302"}));
  Run("Quendal.clseParcelManifestxml", {0});
  EXPECT_EQ(FilesInFolder(), (Strings{"NPP1_1000_EP.xml", "NPP1_1001_EP.xml", "edi"}));
}

TEST_F(eParcelEndOfDayTest, AnEndOfDayRunAfterTheManifestRunAddsEachConsignmentOnce) {
  ClockOnRealDate();
  AddConNote(301, "NPP0000301", 1, JSmith());
  AddConNote(302, "NPP0000302", 2, JSmith());
  Run("Quendal.clseParcelManifestxml", {0, 1});
  AddConNote(303, "NPP0000303", 1, JSmith());
  Run(kEndOfDayClass, {0, 1, 2});

  ASSERT_EQ(FilesInFolder(), Strings{"NPP1_1000_EP.xml"});
  EXPECT_EQ(Values("NPP1_1000_EP.xml", "//ConsignmentNumber"),
            (Strings{"NPP10000301", "NPP10000302", "NPP10000303"}));
  // The manifest run's articles stay as they were written.
  EXPECT_EQ(Values("NPP1_1000_EP.xml", "//ArticleNumber").size(), 4u);
  const Strings messages = host.LogMessages();
  for (const char* number : {"NPP10000301", "NPP10000302"})
    EXPECT_EQ(std::count(messages.begin(), messages.end(),
                         "Consignment " + std::string(number) + " is already in the manifest file " +
                             folder + "NPP1_1000_EP.xml; it is not added again."),
              1);
}

}  // namespace
}  // namespace quendal
