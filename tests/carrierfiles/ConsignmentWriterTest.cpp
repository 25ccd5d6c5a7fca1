#include "carrierfiles/ConsignmentWriter.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "carrierfiles/FixedRecord.h"
#include "platform/Clock.h"
#include "tests/support/FileSizeLimit.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::MemoryHost;
using test::FileSizeLimit;
using ::testing::ElementsAre;

// A consignment class that logs twice and then fails.
class Probe : public ConsignmentWriter {
 public:
  Probe() : ConsignmentWriter("clsProbeDA") {}
  using ConsignmentWriter::CheckFolder;
  void Give(Ref<host::System> system) { system_ = std::move(system); }

 protected:
  void Compile(const Ref<host::ConNote>& conNote, const Ref<host::ASN>&,
               const Ref<host::PackList>&) override {
    Procedure proc = Guard("Sub Process");
    if (!proc([&] { LogLine(0, "Process", "started"); })) return;
    if (!proc([&] { LogLine(13, "Process", "checked " + conNote->ConNoteNo().Text()); })) return;
    if (!proc([&] { throw Error(err::kDeviceIO); })) return;
    proc([&] { LogLine(0, "Process", "never"); });
  }
};

class ConsignmentWriterTest : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 9, 0, 0));
    fs::create_directories(dir);
  }
  void TearDown() override {
    SetNow(std::nullopt);
  }
  std::string Path(const std::string& name) const { return (dir / name).string(); }

  MemoryHost host;
  test::PromptScope prompt{std::make_shared<test::ScriptedPrompt>()};
  test::TempFolder temp;
  fs::path dir{temp.path()};
  Probe probe;
};

TEST_F(ConsignmentWriterTest, ProcessHandsBackEveryLogLineEvenWhenItStopsEarly) {
  auto conNote = host.Make<host::ConNote>({{"ConNoteNo", "C1"}});
  LogList log = {90, 91};
  probe.Process(host.system, conNote, nullptr, nullptr, log);
  EXPECT_THAT(log, ElementsAre(90, 91, 1, 2));
  EXPECT_THAT(host.LogMessages(), ElementsAre("started", "checked C1"));
  // Consignment classes log at the error number.
  EXPECT_EQ(host.logs[1].at("Level").Whole(), 13);
  EXPECT_EQ(host.logs[1].at("ErrorNumber").Whole(), 13);
}

TEST_F(ConsignmentWriterTest, FolderMustExistAndEndWithTheSeparator) {
  probe.Give(host.system);
  EXPECT_TRUE(probe.CheckFolder(dir.string() + "/"));
  EXPECT_FALSE(probe.CheckFolder(dir.string()));
  EXPECT_FALSE(probe.CheckFolder(dir.string() + "/nope/"));
  EXPECT_FALSE(probe.CheckFolder(""));
  EXPECT_THAT(host.LogMessages(), ElementsAre("Invalid folder " + dir.string(),
                                              "Invalid folder " + dir.string() + "/nope/",
                                              "Invalid folder "));
}

TEST_F(ConsignmentWriterTest, FormatTextCutsOrPads) {
  EXPECT_EQ(ConsignmentWriter::FormatText("ABCDEF", 4), "ABCD");
  EXPECT_EQ(ConsignmentWriter::FormatText("AB", 4), "AB  ");
  EXPECT_EQ(ConsignmentWriter::FormatText("AB", 4, true), "  AB");
  EXPECT_EQ(ConsignmentWriter::FormatText("", 3), "   ");
  EXPECT_EQ(ConsignmentWriter::FormatText("Zürich", 3), "Zür");  // characters, not bytes
  EXPECT_EQ(ConsignmentWriter::FormatText("AB", 0), "");
}

TEST_F(ConsignmentWriterTest, ServiceCodesFirstLastAndOther) {
  auto code = [&](ServiceTable table, Var service, Var prefix = Var()) {
    auto c = host.Make<host::ConNote>({{"Service", service}, {"CarrierPrefix", prefix}});
    return probe.ServiceCode(table, c);
  };
  using enum ServiceTable;
  EXPECT_EQ(code(Ipec1250, " fashion "), "F");
  EXPECT_EQ(code(Ipec1250, "Priority Service"), "H");
  EXPECT_EQ(code(Ipec1250, "OVERNIGHT"), "X");
  EXPECT_EQ(code(Ipec1256, "road express"), "4H");
  EXPECT_EQ(code(Ipec1256, "PRIORITY SERVICE"), "1H");
  EXPECT_EQ(code(Ipec1256, Var()), "4H");
  EXPECT_EQ(code(Hunter, " AF "), "AF");
  EXPECT_EQ(code(Hunter, "af"), "RF");  // case counts
  EXPECT_EQ(code(TNTET11, "ECONOMY", "AAF-NSW"), "AJ");
  EXPECT_EQ(code(TNTET11, "ROAD", "AAF"), "***");
  EXPECT_EQ(code(TNTET11, "SAMEDAY", "TCE"), "SDY");
  EXPECT_EQ(code(TNTET11, " INTERNATIONAL ", "TEW"), "INT");
  EXPECT_EQ(code(TNTET11, "SATURDAY AIR", "TEX"), "10");
  EXPECT_EQ(code(TNTET11, "PRIORITY", "TEX"), "03");
  EXPECT_EQ(code(TNTET11, "PREPAID", "TNT"), "72E");
  EXPECT_EQ(code(TNTET11, "express", "TNT"), "76");
  EXPECT_EQ(code(TNTET11, "EXPRESS", "tnt"), "");
  EXPECT_EQ(code(TNTET11, "EXPRESS", Var()), "");
}

TEST_F(ConsignmentWriterTest, WriteFileDropsTheTrailerAndKeepsTheBatchValues) {
  const std::string batch = "A" + std::string("REF-0001") + std::string(12, ' ') + "rest\r\n" +
                            "B  77001   SRX\r\n" + "C  77001   CN1\r\n" + "Z" + "REF-0001" +
                            std::string(12, ' ') + "00004\r\n";
  ASSERT_TRUE(AppendFile(Path("SRX14031200.TXT"), batch));
  EXPECT_EQ(probe.WriteFile(Path("SRX14031200.TXT")), 3);
  EXPECT_EQ(ReadFile(Path("SRX14031200.TXT")).value_or(""),
            batch.substr(0, batch.find("\r\nZ") + 2));
  EXPECT_EQ(probe.AValue(), "REF-0001");
  EXPECT_EQ(probe.BValue(), "77001");
  EXPECT_EQ(probe.WriteFile(Path("missing.TXT")), 0);
  EXPECT_FALSE(FileExists(Path("missing.TXT")));
  // Values once remembered stay.
  ASSERT_TRUE(AppendFile(Path("other.TXT"), "AOTHER\r\nBNEXT\r\n"));
  EXPECT_EQ(probe.WriteFile(Path("other.TXT")), 2);
  EXPECT_EQ(probe.AValue(), "REF-0001");
}

TEST_F(ConsignmentWriterTest, WriteFileThatCannotRewriteLeavesTheBatchWhole) {
  const std::string batch = std::string(3000, 'C') + "\r\nZ00001\r\n";
  ASSERT_TRUE(AppendFile(Path("T.TXT"), batch));
  {
    FileSizeLimit limit(1000);
    EXPECT_EQ(probe.WriteFile(Path("T.TXT")), 0);
  }
  EXPECT_EQ(ReadFile(Path("T.TXT")).value_or(""), batch);
  EXPECT_EQ(std::distance(fs::directory_iterator(dir), fs::directory_iterator()), 1);
}

TEST_F(ConsignmentWriterTest, AFailedAppendLeavesNothingBehind) {
  ASSERT_TRUE(AppendFile(Path("D.CLN"), "00N\r\n"));
  AppendingFile file;
  ASSERT_TRUE(file.Open(Path("D.CLN")));
  {
    FileSizeLimit limit(100);
    EXPECT_FALSE(file.Append(std::string(500, 'x')));
  }
  file.Close();
  EXPECT_EQ(ReadFile(Path("D.CLN")).value_or(""), "00N\r\n");
}

TEST_F(ConsignmentWriterTest, TotalShipmentWeightPrefersTheCartonWeight) {
  auto pack = [&](Var cartonWeight, Var packWeight, bool carton = true) {
    test::Fields fields = {{"Weight", packWeight}};
    if (carton) fields.push_back({"Carton", host.Make<host::Carton>({{"Weight", cartonWeight}})});
    return host.Make<host::Pack>(fields);
  };
  auto packs = MemoryHost::List<host::Pack>({pack(2.5, 9.0), pack(0, 1.25), pack(Var(), 3.0, false),
                                 pack(-1, Var()), pack("n/a", "heavy")});
  EXPECT_DOUBLE_EQ(probe.TotalShipmentWeight(packs), 6.75);
  EXPECT_DOUBLE_EQ(probe.TotalShipmentWeight(nullptr), 0);
}

TEST(FixedRecordTest, FieldsPadButNeverCutUnlessAskedAndMissingDatesKeepTheirWidth) {
  using namespace record;
  constexpr std::array layout = {Literal("15"), TextLeft(5), TextRight(4), CutLeft(3), Zero(4),
                                 Date("YYYYMMDD"), Spaces(2)};
  static_assert(Width(layout) == 28);
  EXPECT_EQ(Render(layout, {"AB", 7, "ABCDEF", 12.5, DateTime::FromParts(2024, 3, 14)}),
            "15AB      7ABC001220240314  ");
  EXPECT_EQ(Render(layout, {"ABCDEFG", "12345", "é", Var(), Var()}), "15ABCDEFG12345é  0000          ");
  EXPECT_EQ(Render(layout, {"a\tb\r\nc"}), "15a b  c       0000          ");
  constexpr std::array number = {Literal("W"), Number("0000.00"), Date("DD/MM/YYYY")};
  EXPECT_EQ(Render(number, {Var(), Var()}), "W" + std::string(17, ' '));
  // A delimited record leaves a missing date empty.
  EXPECT_EQ(RenderDelimited(number, std::vector<Var>{1.5, Var()}, ','), "W,0001.50,");
}

TEST(FixedRecordTest, AFitCheckNotesTheFirstValueLongerThanItsField) {
  using namespace record;
  constexpr std::array layout = {Literal("15"), TextLeft(4), CutLeft(2), Zero(3), TextLeft(0)};
  FitCheck fit;
  // Cut fields, a free-length tail and values that fit are not noted.
  Render(layout, {"ABCD", "XYZ", 999, std::string(50, 'T')});
  EXPECT_TRUE(fit.Fits());
  {
    FitCheck inner;  // a check opened inside another notes for itself alone
    Render(layout, {"AB", "", 1000});
    EXPECT_EQ(inner.Refusal("C1"),
              "ConNote C1 not added: a value of 4 characters (\"1000\") is longer than its field of 3");
  }
  EXPECT_TRUE(fit.Fits());
  Render(layout, {std::string(10000, 'N')});
  Render(layout, {"ABCDE"});
  EXPECT_EQ(fit.Refusal("C2"), "ConNote C2 not added: a value of 10000 characters (\"" +
                                   std::string(20, 'N') + "...\") is longer than its field of 4");
  // Delimited records have no widths to keep.
  FitCheck delimited;
  RenderDelimited(layout, std::vector<Var>{"ABCDEFG"}, ',');
  EXPECT_TRUE(delimited.Fits());
}

}  // namespace
}  // namespace quendal
