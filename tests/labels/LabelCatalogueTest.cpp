// The label classes of the catalogue beyond the reference class and the two
// ZPL classes, each created by its identifier as the host creates it: the
// format header it downloads, the whole batch of the fixture's carton
// (golden files under tests/labels/golden/), the label drawn on an ordinary
// printer and as the thermal printer prints it, read back by an independent
// barcode reader. Then what sets single classes apart: the BigW setting and
// missing store zone/department, PrintFile, a whole pack list as one job.
//
// QUENDAL_WRITE_GOLDEN=1 writes the golden files from what the classes
// print now instead of comparing; review the difference before committing.
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <set>

#include "frame/Catalogue.h"
#include "labels/LabelPrinter.h"
#include "labels/Preview.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "tests/labels/LabelFixture.h"
#include "tests/support/Barcodes.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;

// The golden text of a file under tests/labels/golden/, which holds one
// packet a line (a line break after each "|"); written from `actual`
// instead when QUENDAL_WRITE_GOLDEN is set.
std::string Golden(const std::string& name, const std::string& actual) {
  const fs::path path = fs::path(QUENDAL_LABEL_GOLDEN) / name;
  if (std::getenv("QUENDAL_WRITE_GOLDEN")) {
    std::string lines;
    for (char c : actual) lines += c == '|' ? std::string("|\n") : std::string(1, c);
    std::ofstream(path, std::ios::binary) << lines << "\n";
  }
  std::ifstream in(path, std::ios::binary);
  std::string golden, line;
  while (std::getline(in, line)) golden += line;
  return golden;
}

struct Class {
  const char* name;
  const char* header;                 // the format's first packet
  std::set<std::string> barcodes;     // the element strings on the fixture's carton
  friend std::ostream& operator<<(std::ostream& out, const Class& c) { return out << c.name; }
};

const std::string kSscc = "(00)093123450000000012";
// The fixture's carton goes to store 0412 (postcode 3148) through the
// distribution centre 0900 (postcode 3029).
const std::string kToStore = "(421)0363148(90)0412";
const std::string kToStorePostcode = "(421)0363148";
const std::string kThroughDc = "(421)0363029(90)0412";
const std::string kStoreOnly = "(90)0412";

const Class kClasses[] = {
    {"clsTollGenericSCM", "{F,440,A,R,E,600,400,\"Generic\"|", {kSscc, kToStore}},
    {"clsTollNZSCM", "{F,82,A,R,E,600,400,\"Generic\"|", {kSscc, kToStorePostcode}},
    {"clsMayneGenericSCM", "{F,380,A,R,E,600,400,\"MayneGen\"|", {kSscc, kStoreOnly}},
    {"clsStarTrackCMLSCM", "{F,12,A,R,E,600,400,\"DFECMLDC\"|", {kSscc, kThroughDc}},
    {"clsTNTCMLSCM", "{F,13,A,R,E,600,400,\"TNTCMLDC\"|", {kSscc, kThroughDc}},
    {"clsMayneCMLSCMLSCP", "{F,14,A,R,E,800,300,\"CMLDC\"|", {kSscc, kThroughDc}},
    {"clsStarTrackDJsSCM", "{F,22,A,R,E,600,400,\"1djscm\"|", {kSscc, kToStore}},
    {"clsTollDJsSCM", "{F,22,A,R,E,600,400,\"1djscm\"|", {kSscc, kToStorePostcode}},
    {"clsMayneDJsSCM", "{F,16,A,R,E,600,400,\"1djscm\"|", {kSscc, kStoreOnly}},
    {"clsStarTrackSpotlightSCM", "{F,135,A,R,E,600,400,\"1djscm\"|", {kSscc, kToStore}},
    {"clsStarTrackBLSCM", "{F,117,A,R,E,600,400,\"STBLDC\"|", {kSscc, kThroughDc}},
    {"clsStarTrackBigWSCM", "{F,30,A,R,E,600,400,\"BigWDC\"|", {kSscc, kThroughDc}},
    {"clsTollBigWSCM", "{F,30,A,R,E,600,400,\"BigWDC\"|", {kSscc, kThroughDc}},
    {"clsStarTrackBigWERSCM", "{F,660,A,R,E,600,400,\"BigWDC\"|", {kSscc}},
    {"clsStarTrackHSSCM", "{F,640,A,R,E,600,400,\"HSDC\"|", {kSscc, kThroughDc}},
    {"clsStarTrackRebelSCM", "{F,60,A,R,E,600,400,\"RebelDC\"|", {kSscc, kThroughDc}},
};

class LabelCatalogueFixture : public test::LabelFixture {
 protected:
  // A label object of the class, as the host creates it.
  template <class Interface = LabelInterface>
  Interface* Create(const std::string& name) {
    Created created = CreateObject("Quendal." + name);
    object = std::move(created.object);
    EXPECT_TRUE(object) << created.reason;
    return as<Interface>(object);
  }
  std::unique_ptr<Component> object;
};

class LabelCatalogueTest : public LabelCatalogueFixture, public ::testing::WithParamInterface<Class> {};

TEST_P(LabelCatalogueTest, DownloadsItsFormatAndPrintsTheCartonsBatch) {
  LabelInterface* label = Create(GetParam().name);
  ASSERT_TRUE(label);
  ASSERT_TRUE(label->Init(host.system, "Dock 3"));
  const auto format = TakeJobs();
  ASSERT_EQ(format.size(), 1u);
  EXPECT_EQ(format[0], label->PrintVPCLII());
  EXPECT_TRUE(format[0].starts_with(GetParam().header)) << format[0].substr(0, 40);
  EXPECT_TRUE(format[0].ends_with("|}"));

  ASSERT_TRUE(label->PrintLabel(pack));
  const auto batch = TakeJobs();
  ASSERT_EQ(batch.size(), 1u);
  EXPECT_EQ(batch[0], Golden(std::string(GetParam().name) + ".batch", batch[0]));
  EXPECT_TRUE(host.logs.empty()) << host.LogMessages().front();
}

INSTANTIATE_TEST_SUITE_P(Classes, LabelCatalogueTest, ::testing::ValuesIn(kClasses),
                         [](const auto& info) { return std::string(info.param.name); });

TEST_F(LabelCatalogueFixture, WholeFormatsOfEachLabelSize) {
  const std::string djs = Create("clsStarTrackDJsSCM")->PrintVPCLII();
  EXPECT_EQ(djs, Golden("1djscm-600x400.format", djs));
  const std::string longLabel = Create("clsMayneCMLSCMLSCP")->PrintVPCLII();
  EXPECT_EQ(longLabel, Golden("CMLDC-800x300.format", longLabel));
}

// The label drawn on an ordinary printer's page ("WinPCL", 100 x 210 mm so
// that the long label fits) and the picture of what the thermal printer
// prints; each barcode read back gives the class's element strings, and
// every text lies on the label.
class DrawnCatalogueTest : public LabelCatalogueFixture,
                           public ::testing::WithParamInterface<std::tuple<Class, int>> {};

TEST_P(DrawnCatalogueTest, BarcodesReadBack) {
  const auto& [c, dpi] = GetParam();
  test::TempFolder spool;
  fs::create_directories(spool / "Office Laser");
  AppendFile(spool / "Office Laser/printer.ini", "dpi=" + std::to_string(dpi) + "\nheight_mm=210\n");
  SetSpooler(std::make_shared<DirectorySpooler>(spool.path()));
  host.system->fields["PrinterLanguage"] = "WinPCL";
  LabelInterface* label = Create(c.name);
  ASSERT_TRUE(label->Init(host.system, "Office Laser"));
  ASSERT_TRUE(label->PrintLabel(pack));
  const auto png = ReadFile(spool / ("Office Laser/000001-Quendal." + std::string(c.name) + ".png"));
  ASSERT_TRUE(png);
  EXPECT_EQ(test::ReadGs1Barcodes(*png), c.barcodes);

  preview::Printer printer({dpi});
  const preview::Result thermal = printer.Print(label->PrintVPCLII() + label->VPCLIIBatchCommand());
  ASSERT_EQ(thermal.pages.size(), 1u);
  const preview::Page& page = thermal.pages[0];
  EXPECT_EQ(test::ReadGs1Barcodes(page.png), c.barcodes);
  for (const auto& t : page.texts) {
    EXPECT_GE(t.box.x1, 0) << t.text;
    EXPECT_GE(t.box.y1, 0) << t.text;
    EXPECT_LE(t.box.x2, page.width) << t.text;
    EXPECT_LE(t.box.y2, page.height) << t.text;
  }
}

INSTANTIATE_TEST_SUITE_P(Classes, DrawnCatalogueTest,
                         ::testing::Combine(::testing::ValuesIn(kClasses), ::testing::Values(203, 300)),
                         [](const auto& info) {
                           return std::string(std::get<0>(info.param).name) + "_" +
                                  std::to_string(std::get<1>(info.param));
                         });

TEST_F(LabelCatalogueFixture, AStoreWithoutANumberLeavesTheReferenceOutOfTheBarcodes) {
  store->fields.erase("StoreCode");
  for (const char* name : {"clsTollGenericSCM", "clsStarTrackBLSCM", "clsMayneDJsSCM"}) {
    LabelInterface* label = Create(name);
    label->Init(host.system);
    ASSERT_TRUE(label->PrintLabel(pack, std::nullopt, true));
    const std::string batch = label->VPCLIIBatchCommand();
    EXPECT_EQ(batch.find("~20190"), std::string::npos) << name << ": " << batch;
    EXPECT_EQ(batch.find("(90)"), std::string::npos) << name << ": " << batch;
  }
}

TEST_F(LabelCatalogueFixture, BigWClassesKeepTheAsnSettingAndHaveNoStoreZone) {
  for (const char* name : {"clsStarTrackBigWSCM", "clsTollBigWSCM", "clsStarTrackBigWERSCM"}) {
    auto* setting = Create<AsnRequiredInterface>(name);
    ASSERT_TRUE(setting) << name;
    EXPECT_FALSE(setting->ASNRequiredForSSCC());
    setting->SetASNRequiredForSSCC(true);
    EXPECT_TRUE(setting->ASNRequiredForSSCC());
    setting->SetASNRequiredForSSCC(false);
    EXPECT_FALSE(setting->ASNRequiredForSSCC());

    // The host is told the object has no such property; nothing reaches the label.
    auto prompt = std::make_shared<test::ScriptedPrompt>();
    test::PromptScope scope(prompt);
    LabelInterface* label = as<LabelInterface>(object);
    label->SetStoreZoneDept("LEVEL 2");
    ASSERT_EQ(prompt->messages.size(), 1u);
    EXPECT_NE(prompt->messages[0].find("#438"), std::string::npos) << prompt->messages[0];
    EXPECT_NE(prompt->messages[0].find("Property (Let) StoreZoneDept"), std::string::npos);
    label->Init(host.system);
    ASSERT_TRUE(label->PrintLabel(pack, std::nullopt, true));
    EXPECT_EQ(label->VPCLIIBatchCommand().find("|19,"), std::string::npos);
    EXPECT_EQ(label->PrintVPCLII().find("T,19,"), std::string::npos);
  }
  // The other classes have no such setting.
  EXPECT_FALSE(Create<AsnRequiredInterface>("clsStarTrackBLSCM"));
}

TEST_F(LabelCatalogueFixture, PrintFileInEachLanguage) {
  EXPECT_TRUE(Create<PrintFileInterface>("clsStarTrackRebelSCM"));
  const std::string format = "{F,77,A,R,E,600,400,\"HANDED\"|T,1,30,V,300,20,0,1,2,2,B,L,0,0,0|}";
  const std::string batch = "{B,77,N,1|E,1,0,1,1,0,1|1,\"SRXZ00012345\"|}";
  auto* file = Create<PrintFileInterface>("clsStarTrackHSSCM");
  LabelInterface* label = as<LabelInterface>(object);
  ASSERT_TRUE(file && label);
  const auto printIn = [&](const char* language, const std::string& printer) {
    host.system->fields["PrinterLanguage"] = language;
    label->Init(host.system, printer);
    TakeJobs();
    return file->PrintFile(format, batch);
  };
  EXPECT_TRUE(printIn("VPCLII", "Dock 3"));
  EXPECT_EQ(TakeJobs(), std::vector<std::string>{format + batch});

  spooler->AddPrinter("Office Laser", 203);
  EXPECT_TRUE(printIn("WinPCL", "Office Laser"));
  EXPECT_TRUE(TakeJobs().empty());
  bool drawn = false;
  for (const auto& p : spooler->drawnJobs.back()->canvas.primitives) drawn = drawn || p.text == "SRXZ00012345";
  EXPECT_TRUE(drawn);

  EXPECT_TRUE(printIn("Axiohm", "Dock 3"));
  EXPECT_EQ(TakeJobs(), std::vector<std::string>{format});
  EXPECT_EQ(host.LogMessages(), std::vector<std::string>{"Axiohm unknown."});
}

TEST_F(LabelCatalogueFixture, BigWPackListIsOneJobOfSeparatorsAndBigWBatches) {
  auto second = MakePack(1002, "00093123450000000029");
  test::MemoryHost::Attach(conNote, {pack, second});
  auto* packList = Create<PackListInterface>("clsStarTrackBigWERSCM");
  LabelInterface* label = as<LabelInterface>(object);
  ASSERT_TRUE(packList && label);
  label->Init(host.system, "Dock 3");
  TakeJobs();
  ASSERT_TRUE(packList->PrintAllLabels(conNote->Packs(), true, false));
  const auto jobs = TakeJobs();
  ASSERT_EQ(jobs.size(), 1u);
  // One order: one separator, then both cartons' batches for format 660.
  const std::string& job = jobs[0];
  EXPECT_EQ(job.substr(0, job.find("\r\n")), packList->RatioSeparator("PACK ID 1001"));
  const std::size_t first = job.find("{B,660,N,1|");
  ASSERT_NE(first, std::string::npos);
  EXPECT_NE(job.find("{B,660,N,1|", first + 1), std::string::npos);
  EXPECT_NE(job.find("|31,\"(00)093123450000000029\"|}"), std::string::npos);
  EXPECT_EQ(job.find("|22,"), std::string::npos);
}

}  // namespace
}  // namespace quendal
