#include "manifests/ConsolidatedManifest.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/manifests/StarTrackRowsFixture.h"

namespace quendal {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;

constexpr std::string_view kTableHeader =
    "Consignment No P Sender Ref Receiver Name Receiver Town Logistic Units Weight Volume";

// The summary as the host calls it on a date-range class, after Init.
class ConsolidatedManifestTest : public test::StarTrackRowsFixture {
 protected:
  void SetUp() override {
    StarTrackRowsFixture::SetUp();
    object = CreateObject("Quendal.clsStarTrackEODcln").object;
    Grid columns;
    as<RowInterface>(object)->Init(host.system, 7, columns);
    summary = as<ConsolidatedManifestInterface>(object);
  }
  std::int16_t Print(std::int16_t option = 1, const std::string& html = "",
                     const std::string& from = "14/03/2024", const std::string& to = "14/03/2024") {
    return summary->ConsolidatedManifestPrint(from, to, "ALP", "STE", option, html);
  }
  // The words of each page of a PDF.
  static std::vector<std::string> Pages(const std::string& pdf) {
    std::vector<std::string> pages;
    std::string text = test::PdfText(pdf);
    std::size_t start = 0;
    for (std::size_t feed; (feed = text.find('\f', start)) != std::string::npos; start = feed + 1)
      pages.push_back(test::Words(text.substr(start, feed - start)));
    return pages;
  }

  std::unique_ptr<Component> object;
  ConsolidatedManifestInterface* summary = nullptr;
};

TEST_F(ConsolidatedManifestTest, NoListAndAnEmptyListPrintNothing) {
  EXPECT_EQ(Print(), ConsolidatedManifestInterface::kEmptyList);
  host.system->methods["GetConNotesByDate"] = [](std::span<const Var>) { return Var(); };
  EXPECT_EQ(Print(), ConsolidatedManifestInterface::kNoList);
  EXPECT_TRUE(Jobs().empty());
  // A manifest run that saved no manifest has nothing to sum up, whatever awaits one.
  AddCartons(101, "SRXZ00012345", 1);
  auto manifestRun = CreateObject("Quendal.clsStarTrackManifestcln").object;
  Grid columns;
  as<RowInterface>(manifestRun)->Init(host.system, 7, columns);
  EXPECT_EQ(as<ConsolidatedManifestInterface>(manifestRun)->ConsolidatedManifestPrint("", "", "", "", 1, ""),
            ConsolidatedManifestInterface::kEmptyList);
  EXPECT_TRUE(Jobs().empty());
}

TEST_F(ConsolidatedManifestTest, TheDocumentListsTheDaysConsignmentsWithTotals) {
  AddCartons(101, "SRXZ00012345", 2, {{"ConNoteDate", DateTime::FromParts(2024, 3, 14)}});
  AddCartons(102, "SRXZ00012346", 3, {{"Weight", "n/a"}, {"Volume", 0.07}});
  AddConNote(103, "NOPACKS", {});
  AddCartons(104, "SRXZ00012348", 1,
             {{"ConNoteDate", DateTime::FromParts(2024, 3, 14, 23, 59, 59)}, {"Weight", 4}});
  AddCartons(105, "NEXTDAY", 1, {{"ConNoteDate", DateTime::FromParts(2024, 3, 15)}});
  ASSERT_EQ(Print(), ConsolidatedManifestInterface::kProduced);

  ASSERT_EQ(Jobs().size(), 1u);
  const std::string text = test::PdfWords(Jobs().front());
  EXPECT_THAT(text, HasSubstr("Consignment Summary Print"));
  EXPECT_THAT(text, HasSubstr("Date: Thursday, 14 March 2024"));
  EXPECT_THAT(text, HasSubstr("Sender: Alpine Cosmetics Carrier: StarTrack Express"));
  EXPECT_THAT(text, HasSubstr("88 Factory Lane Service Code:"));
  EXPECT_THAT(text, HasSubstr("DANDENONG VIC 3175 Account Ref: 10293847"));
  EXPECT_THAT(text, HasSubstr(std::string(kTableHeader)));
  EXPECT_THAT(text, HasSubstr("SRXZ00012345 S ASN-000501 12 Wharf Road Harbour Retail DC "
                              "PORT MELBOURNE VIC 3207 2 12.5 0.035"));
  EXPECT_THAT(text, HasSubstr("SRXZ00012346 S ASN-000501"));
  EXPECT_THAT(text, HasSubstr("3 n/a 0.07"));
  EXPECT_THAT(text, HasSubstr("SRXZ00012348"));
  EXPECT_THAT(text, Not(HasSubstr("NOPACKS")));
  EXPECT_THAT(text, Not(HasSubstr("NEXTDAY")));
  // Packs 2 + 3 + 1; weights 12.5 + 4 (the one that is not a number adds nothing).
  EXPECT_THAT(text, HasSubstr("TOTAL 6 16.5 0.14"));
  EXPECT_THAT(text, HasSubstr(
                        "DANGEROUS GOODS WARRANTY: I hereby declare that these consignments do not "
                        "contain dangerous goods, and that these consignments do not contain any "
                        "unauthorised explosive or incendiary devices. Please accept for carriage the "
                        "goods described hereon subject to the Terms and Conditions of the Carrier. I "
                        "am also aware that these consignments will be subject to security screening "
                        "and clearing."));
  EXPECT_THAT(text, HasSubstr("Sender name: ______________________________ Driver ID: "
                              "______________________________"));
  EXPECT_THAT(text, HasSubstr("Sender signature: ______________________________ Driver signature "
                              "______________________________"));
  EXPECT_THAT(text, HasSubstr("Pickup time: ______________________________"));
}

TEST_F(ConsolidatedManifestTest, HundredsOfConsignmentsRunOverPagesThatEachRepeatTheHeader) {
  for (int i = 0; i < 300; ++i) AddCartons(1000 + i, "SRXZ" + std::to_string(10000000 + i), 1);
  ASSERT_EQ(Print(), ConsolidatedManifestInterface::kProduced);
  const auto pages = Pages(Jobs().front());
  ASSERT_GE(pages.size(), 3u);
  for (const std::string& page : pages) EXPECT_THAT(page, HasSubstr(std::string(kTableHeader)));
  EXPECT_THAT(pages.back(), HasSubstr("TOTAL 300 3750 10.5"));
  EXPECT_THAT(pages.back(), HasSubstr("Pickup time:"));
}

TEST_F(ConsolidatedManifestTest, OptionsZeroAndTwoKeepTheDocumentWithItsHtmlCopy) {
  AddCartons(101, "SRXZ00012345", 1);
  for (std::int16_t option : {0, 2}) {
    const std::string html = temp / ("summary" + std::to_string(option) + ".html");
    ASSERT_EQ(Print(option, html), ConsolidatedManifestInterface::kProduced);
    EXPECT_EQ(summary->ConsolidatedManifestFile(), temp / ("summary" + std::to_string(option) + ".pdf"));
    EXPECT_THAT(test::PdfWords(summary->ConsolidatedManifestFile()), HasSubstr("SRXZ00012345"));
    EXPECT_THAT(ReadFile(html).value_or(""), HasSubstr("<td style=\"width:126px;text-align:left\">SRXZ00012345</td>"));
  }
  EXPECT_TRUE(Jobs().empty());
  // Printed straight away, nothing is kept.
  ASSERT_EQ(Print(1), ConsolidatedManifestInterface::kProduced);
  EXPECT_EQ(summary->ConsolidatedManifestFile(), "");
  EXPECT_EQ(Jobs().size(), 1u);
}

}  // namespace
}  // namespace quendal
