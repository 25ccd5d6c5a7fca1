#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "manifests/cDFEDAManifestxml.h"
#include "tests/carrierfiles/DfeGolden.h"
#include "tests/manifests/StarTrackRowsFixture.h"

namespace quendal {
namespace {

using namespace test::dfe;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

constexpr std::string_view kManifest = "Quendal.clsDFEDAManifestxml";

class DFEDAManifestxmlTest : public test::StarTrackRowsFixture {
 protected:
  void SetUp() override {
    StarTrackRowsFixture::SetUp();
    carrier->fields["AccountNumber"] = "40217";
    // The run writes to the EDI document's folder, not the carrier's.
    std::filesystem::create_directories(root / "manifests");
    host.ediDocuments[0]->fields["OutputFolder"] = (root / "manifests").string() + "/";
    path = (root / "manifests" / "MANIFEST_40217_202403141200.XML").string();
  }
  std::string path;
};

TEST_F(DFEDAManifestxmlTest, PalletsAndCartonsGetALineEachAndTheConsignmentIsStamped) {
  // Two pallets and three cartons, the first a pallet, with dangerous goods.
  auto aerosol =
      host.Make<host::Product>({{"IsDangerous", true}, {"DGClass", "2.1"}, {"UnitWeight", 0.75}});
  std::vector<std::shared_ptr<test::MemoryObject<host::Pack>>> packs = {
      Pack(Sscc(1), 60, "PLT01"), Pack(Sscc(2), 3), Pack(Sscc(3), 60, "PLT01"), Pack(Sscc(4), 3),
      Pack(Sscc(5), 3)};
  const double weights[] = {250.5, 10.25, 249.5, 10.25, 10.5};
  for (std::size_t i = 0; i < packs.size(); ++i) packs[i]->fields["Weight"] = weights[i];
  packs[0]->fields["PackType"] = "PALLET";
  packs[2]->fields["PackType"] = "PALLET";
  packs[3]->fields["Lines"] = Var(test::MemoryHost::List<host::PackLine>(
      {host.Make<host::PackLine>({{"Product", aerosol}, {"Qty", 2}})}));
  AddConNote(101, "DFE00012345", packs, {{"Weight", 531}});

  Run run = Start(kManifest);
  ASSERT_EQ(run.loaded, 1);
  EXPECT_EQ(run.columns.Rows(), 7u);
  EXPECT_EQ(run.grid(0, 4).Date(), DateTime::FromParts(2024, 3, 14, 9, 0, 0));
  LogList log = {77};
  EXPECT_EQ(run.rows->Process(0, log), 101);
  EXPECT_TRUE(run.rows->Term());

  const std::string id = "4021710012345";
  EXPECT_EQ(ReadFile(path).value_or(""),
            kHead + Table({.connote = id, .items = "3", .kgs = "531", .dangerous = "True"}) +
                Table1("1", id, "CARTON", "3", "31", "ITEM") +
                Table1("2", id, "Pallet", "2", "500", "PALLET") + Table2("101", id, Sscc(1)) +
                Table2("101", id, Sscc(2)) + Table2("101", id, Sscc(3)) +
                Table2("101", id, Sscc(4)) + Table2("101", id, Sscc(5)) + kTail);
  EXPECT_TRUE(FilesInFolder().empty());  // nothing in the carrier's own folder
  EXPECT_EQ(host.conNotes[0]->Get("ManifestId").Whole(), 1);
  EXPECT_EQ(host.conNotes[0]->Get("Status").Whole(), 8);
  EXPECT_THAT(host.LogMessages(), ElementsAre("ConNote DFE00012345 compile completed."));
  EXPECT_THAT(log, ElementsAre(77, 1));

  // StarTrack's declaration for the carton with the aerosol, twice; then the manifest's summary.
  const auto jobs = Jobs();
  ASSERT_EQ(jobs.size(), 3u);
  EXPECT_THAT(test::PdfWords(jobs[0]), HasSubstr("FLAMMABLE GASES"));
  EXPECT_THAT(jobs[1], HasSubstr("DANGEROUS GOODS"));
  EXPECT_THAT(test::PdfWords(jobs[2]), HasSubstr("DFE00012345 S ASN-000501"));
}

TEST_F(DFEDAManifestxmlTest, TermPrintsTheSummaryOnlyOfARunThatMadeAManifest) {
  AddCartons(101, "DFE00012345", 1);
  Run idle = Start(kManifest);
  EXPECT_TRUE(idle.rows->Term());
  EXPECT_TRUE(Jobs().empty());

  EXPECT_THAT(RunAll(kManifest), ElementsAre(101));
  ASSERT_EQ(SummaryJobs().size(), 1u);
  EXPECT_THAT(test::PdfWords(SummaryJobs()[0]), HasSubstr("DFE00012345"));
}

TEST_F(DFEDAManifestxmlTest, AFailedManifestSaveStopsTheRowAndAConsignmentWithoutPacksIsWritten) {
  AddConNote(101, "DFE00012345", {});
  Run run = Start(kManifest);
  host.manifestSaveFails = true;
  EXPECT_EQ(run.rows->Process(0, run.log), 0);
  EXPECT_EQ(host.LogMessages().back(), "Failed to create mainifest ID");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Process");
  EXPECT_FALSE(FileExists(path));

  host.manifestSaveFails = false;
  EXPECT_EQ(run.rows->Process(0, run.log), 101);
  EXPECT_EQ(ReadFile(path).value_or(""), kHead +
                                             Table({.connote = "4021710012345",
                                                    .items = "0",
                                                    .kgs = "12",
                                                    .reference = "PONo ",
                                                    .start = "",
                                                    .stop = "",
                                                    .name = "",
                                                    .address = {}}) +
                                             kTail);
  // The account check is the despatch advice's.
  carrier->fields["AccountNumber"] = "40217-01";
  EXPECT_EQ(run.rows->Process(0, run.log), 0);
  EXPECT_EQ(host.LogMessages().back(), "Invalid Carrier Account Reffolder 40217-01");
}

}  // namespace
}  // namespace quendal
