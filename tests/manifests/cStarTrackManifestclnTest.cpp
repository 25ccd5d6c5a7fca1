#include "manifests/cStarTrackManifestcln.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "carrierfiles/ClnWriter.h"
#include "tests/manifests/StarTrackRowsFixture.h"

namespace quendal {
namespace {

using test::MemoryObject;
using test::Pad;
using test::Sp;
using ::testing::ElementsAre;
using ::testing::ElementsAreArray;
using ::testing::HasSubstr;
using ::testing::Not;

constexpr std::string_view kManifest = "Quendal.clsStarTrackManifestcln";

// The records of one consignment, built from named pieces.
std::string Consignment(std::string_view no, std::string_view packs, std::string_view weight,
                        std::string_view cubic) {
  return "10" + Pad(no, 20) + Sp(8) + Pad("Myer Chadstone", 40) + Sp(40) +
         Pad("1341 Dandenong Road", 40) + Pad("Loading Dock 3", 40) + Pad("CHADSTONE", 30) + "3" +
         "3148" + Sp(17) + "N" + "10293847" + "S" + std::string(packs) + "EXP" +
         std::string(weight) + std::string(cubic) + Sp(4) + "N" + Sp(4) + "CTN";
}
std::vector<std::string> Opening(std::string_view no) {
  return {"13" + Pad(no, 20) + "Not Before: 15-Mar-2024  Not After: 18-Mar-2024   " +
              "Leave at the loading dock" + "202403150700" + "202403181730",
          "15" + Pad(no, 20) + "S" + Pad("ASN-000501", 20) + "Senders Reference             Y",
          "15" + Pad(no, 20) + "F" + Pad("ASN-000501", 20) + "Advance Ship Notice Number    Y",
          "15" + Pad(no, 20) + "B" + Pad("DSP778812", 20) + "Customer Order Number         Y"};
}
std::string Item(std::string_view no, const std::string& sscc, std::string_view tail) {
  return "20" + Pad(no, 20) + sscc + std::string(tail);
}
std::string Atl(std::string_view no, int counter) {
  char value[16];
  std::snprintf(value, sizeof value, "C%09d", counter);
  return "15" + Pad(no, 20) + "E" + Pad(value, 20) + "ATL                           N";
}
std::string Header(std::string_view name) {
  return "00N" + Pad(name, 12) + "20240314090000" + "G" + Sp(20) + "20240314090000" + "Y" + Sp(71);
}

class StarTrackManifestTest : public test::StarTrackRowsFixture {};

TEST_F(StarTrackManifestTest, ARunWritesItsConsignmentsToTheManifestsFileAndStampsThem) {
  // Dangerous goods in the first carton of the first consignment.
  auto aerosol = host.Make<host::Product>({{"IsDangerous", true}, {"DGClass", "2.1"}, {"UnitWeight", 0.75}});
  auto soap = host.Make<host::Product>({{"IsDangerous", false}, {"UnitWeight", 2}});
  auto dgPack = Pack(Sscc(1), 12);
  dgPack->fields["Lines"] = Var(test::MemoryHost::List<host::PackLine>(
      {host.Make<host::PackLine>({{"Product", aerosol}, {"Qty", 4}}),
       host.Make<host::PackLine>({{"Product", soap}, {"Qty", 3}})}));
  AddConNote(101, "SRXZ00012345", {dgPack, Pack(Sscc(2), 12)});
  // Two pallets of 60 items and three cartons of 3.
  AddConNote(102, "SRXZ00012346",
             {Pack(Sscc(3), 60, "PLT01"), Pack(Sscc(4), 3), Pack(Sscc(5), 60, "PLT01"),
              Pack(Sscc(6), 3), Pack(Sscc(7), 3)},
             {{"Weight", 182.95}});
  // Authority to leave, no weight, 81 items a carton.
  AddConNote(103, "SRXZ00012347", {Pack(Sscc(8), 81), Pack(Sscc(9), 81)},
             {{"Carrier", MakeCarrier("#%ATL")}, {"Weight", Var()}});

  EXPECT_THAT(RunAll(kManifest), ElementsAre(101, 102, 103));

  // Manifest number 1234567: every row in SRX34567.CLN, header once; cubes by item count.
  std::vector<std::string> expected = {Header("SRX34567.CLN"),
                                       Consignment("SRXZ00012345", "   2", "   12", "   30")};
  for (const auto& line : Opening("SRXZ00012345")) expected.push_back(line);
  expected.push_back("19" + Pad("SRXZ00012345", 20) + Sp(15) + Pad("2.1", 7) +
                     Pad("FLAMMABLE GASES", 35) + Sp(35) + "CARTON" + Sp(21) + "0001" + "00003");
  expected.push_back(Item("SRXZ00012345", Sscc(1), "S CTN"));
  expected.push_back(Item("SRXZ00012345", Sscc(2), "S CTN"));
  expected.push_back(Consignment("SRXZ00012346", "   5", "  183", "   91"));
  for (const auto& line : Opening("SRXZ00012346")) expected.push_back(line);
  for (int i = 3; i <= 7; ++i) expected.push_back(Item("SRXZ00012346", Sscc(i), "S "));
  expected.push_back(Consignment("SRXZ00012347", "   2", "    0", "  142"));
  for (const auto& line : Opening("SRXZ00012347")) expected.push_back(line);
  expected.push_back(Atl("SRXZ00012347", 1));
  expected.push_back(Item("SRXZ00012347", Sscc(8), "S CTN"));
  expected.push_back(Atl("SRXZ00012347", 2));
  expected.push_back(Item("SRXZ00012347", Sscc(9), "S CTN"));
  EXPECT_THAT(Lines("SRX34567.CLN"), ElementsAreArray(expected));
  EXPECT_THAT(FilesInFolder(), ElementsAre("SRX34567.CLN"));

  // Each consignment bears the manifest, and the cubes it was written with.
  for (const auto& c : host.conNotes) EXPECT_EQ(c->Get("ManifestId").Whole(), 1);
  EXPECT_DOUBLE_EQ(host.conNotes[1]->Get("CubicTotal").Number(), 0.091);
  EXPECT_EQ(host.conNotes[1]->Get("CubicOverride").Whole(), 0);
  EXPECT_DOUBLE_EQ(host.packs[2]->Get("Cubic").Number(), 0.038);

  // Two declarations for the dangerous goods, then the summary of the manifest.
  const auto jobs = Jobs();
  ASSERT_EQ(jobs.size(), 3u);
  EXPECT_THAT(jobs[0], HasSubstr("DANGEROUS GOODS"));
  EXPECT_THAT(jobs[1], HasSubstr("DANGEROUS GOODS"));
  const std::string summary = test::PdfWords(jobs[2]);
  EXPECT_THAT(summary, HasSubstr("SRXZ00012345 S ASN-000501"));
  EXPECT_THAT(summary, HasSubstr("SRXZ00012347"));
  EXPECT_THAT(summary, HasSubstr("TOTAL 9 195.45"));  // no weight adds nothing

  // A second run the same day makes a new manifest (number 12) and a new file.
  host.nextManifestNumber = 12;
  AddCartons(104, "SRXZ00012348", 1);
  EXPECT_THAT(RunAll(kManifest), ElementsAre(104));
  EXPECT_THAT(FilesInFolder(), ElementsAre("SRX00012.CLN", "SRX34567.CLN"));
  EXPECT_EQ(Lines("SRX00012.CLN").front(), Header("SRX00012.CLN"));
  EXPECT_EQ(Lines("SRX00012.CLN").size(), 7u);
  EXPECT_EQ(Lines("SRX34567.CLN").size(), expected.size());
  EXPECT_EQ(host.conNotes[3]->Get("ManifestId").Whole(), 2);
  const std::string second = test::PdfWords(SummaryJobs().back());
  EXPECT_THAT(second, HasSubstr("SRXZ00012348"));
  EXPECT_THAT(second, Not(HasSubstr("SRXZ00012345")));
}

TEST_F(StarTrackManifestTest, GridAndTheLogOfARow) {
  AddCartons(101, "SRXZ00012345", 1);
  Run run = Start(kManifest);
  ASSERT_EQ(run.loaded, 1);
  ASSERT_EQ(run.columns.Rows(), 7u);
  EXPECT_EQ(run.columns(3, 0).Text(), "Service-Run Code");
  EXPECT_EQ(run.columns(5, 0).Text(), "Sheduled Date");
  EXPECT_EQ(run.columns(0, 2).Whole(), 2200);
  ASSERT_EQ(run.grid.Columns(), 7u);
  EXPECT_EQ(run.grid(0, 3).Text(), "-ROAD");
  EXPECT_EQ(run.grid(0, 4).Date(), DateTime::FromParts(2024, 3, 14, 9, 0, 0));
  EXPECT_EQ(run.grid(0, 5).Date(), DateTime::FromParts(2024, 3, 15));
  EXPECT_EQ(run.grid(0, 6).Text(), "");

  LogList log = {77};
  EXPECT_EQ(run.rows->Process(0, log), 101);
  EXPECT_THAT(host.LogMessages(),
              ElementsAre("ConNote SRXZ00012345. ActiveX called Quendal.clsStarTrackManifestcln",
                          "ConNote SRXZ00012345. Target file selected " + folder + "SRX34567.CLN",
                          "ConNote SRXZ00012345 compile Started.",
                          "SSCC " + Sscc(1010) + " added to CLN for ConNote SRXZ00012345",
                          "ConNote SRXZ00012345 compile completed."));
  EXPECT_THAT(log, ElementsAre(77, 1, 2, 3, 4, 5));
  // The same row again: the file holds it already.
  EXPECT_EQ(run.rows->Process(0, log), 0);
  EXPECT_EQ(host.LogMessages().back(), "Cannot process, connoteno already exists SRXZ00012345");
  EXPECT_THAT(log, ElementsAre(77, 1, 2, 3, 4, 5, 6, 7, 8));
}

TEST_F(StarTrackManifestTest, AFailedManifestSaveStopsOnlyThatRow) {
  AddCartons(101, "SRXZ00012345", 1);
  AddCartons(102, "SRXZ00012346", 1);
  Run run = Start(kManifest);
  host.manifestSaveFails = true;
  EXPECT_EQ(run.rows->Process(0, run.log), 0);
  EXPECT_EQ(host.LogMessages().back(), "Failed to create manifest ID");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Process");
  EXPECT_EQ(run.log.back(), static_cast<std::int32_t>(host.logs.size()));
  EXPECT_TRUE(FilesInFolder().empty());

  host.manifestSaveFails = false;
  EXPECT_EQ(run.rows->Process(1, run.log), 102);
  EXPECT_TRUE(run.rows->Term());
  EXPECT_EQ(RecordOf("SRX34567.CLN", "SRXZ00012345"), "<none>");
  EXPECT_NE(RecordOf("SRX34567.CLN", "SRXZ00012346"), "<none>");
  EXPECT_TRUE(host.conNotes[0]->Get("ManifestId").IsNull());
  EXPECT_EQ(host.conNotes[1]->Get("ManifestId").Whole(), 1);
}

TEST_F(StarTrackManifestTest, WeightsWithoutAValue) {
  AddCartons(101, "W1", 1, {{"Weight", Var()}});
  AddCartons(102, "W2", 1, {{"Weight", 0}});
  AddCartons(103, "W3", 1, {{"Weight", "heavy"}});
  RunAll(kManifest);
  EXPECT_EQ(RecordOf("SRX34567.CLN", "W1").substr(259, 5), "    0");
  EXPECT_EQ(RecordOf("SRX34567.CLN", "W2").substr(259, 5), "    1");  // a weight below 1 is 1
  EXPECT_EQ(RecordOf("SRX34567.CLN", "W3").substr(259, 5), "    0");
}

TEST(CubeByItemCountTest, EdgesOfEachRow) {
  const std::vector<std::pair<int, double>> edges = {
      {1, 0.005},  {3, 0.005},  {4, 0.009},  {6, 0.009},  {7, 0.015},  {15, 0.015},
      {16, 0.023}, {25, 0.023}, {26, 0.027}, {35, 0.027}, {36, 0.038}, {50, 0.038},
      {51, 0.038}, {60, 0.038}, {61, 0.071}, {80, 0.071}, {81, 0.071}, {0, 0.071},
      {-2, 0.071}};
  for (const auto& [items, cube] : edges) EXPECT_DOUBLE_EQ(CubeByItemCount(Var(items)), cube) << items;
  EXPECT_DOUBLE_EQ(CubeByItemCount(Var()), 0.071);
  EXPECT_DOUBLE_EQ(CubeByItemCount(Var("many")), 0.071);
}

}  // namespace
}  // namespace quendal
