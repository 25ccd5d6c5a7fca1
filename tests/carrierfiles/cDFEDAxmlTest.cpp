#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <pugixml.hpp>

#include "carrierfiles/TailJournal.h"
#include "carrierfiles/cDFEDAxml.h"
#include "tests/carrierfiles/DfeGolden.h"
#include "tests/manifests/StarTrackRowsFixture.h"
#include "tests/support/FileSizeLimit.h"
#include "tests/support/KillLoop.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using namespace test::dfe;
using test::MemoryObject;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

class DFEDAxmlTest : public test::StarTrackRowsFixture {
 protected:
  void SetUp() override {
    StarTrackRowsFixture::SetUp();
    carrier->fields["AccountNumber"] = "40217";
    path = folder + "MANIFEST_40217_202403141200.XML";
  }

  LogList Process(const std::shared_ptr<MemoryObject<host::ConNote>>& conNote, LogList log = {}) {
    cls.Process(host.system, conNote, asn, conNote->Packs(), log);
    return log;
  }
  std::string File() const { return ReadFile(path).value_or("<none>"); }

  // The connote texts of the tables of a day's file, which must parse.
  static std::vector<std::string> Connotes(const std::string& bytes) {
    pugi::xml_document doc;
    EXPECT_TRUE(doc.load_buffer(bytes.data(), bytes.size()));
    std::vector<std::string> connotes;
    for (pugi::xml_node table : doc.child("NewDataSet").children("Table"))
      connotes.emplace_back(table.child_value("Connote"));
    return connotes;
  }

  std::string path;
  clsDFEDAxml cls;
};

TEST_F(DFEDAxmlTest, FirstAndSecondConsignmentOfTheDay) {
  // Dangerous goods in the first carton of the first consignment.
  auto aerosol =
      host.Make<host::Product>({{"IsDangerous", true}, {"DGClass", "2.1"}, {"UnitWeight", 0.75}});
  auto dgPack = Pack(Sscc(1), 12);
  dgPack->fields["Lines"] = Var(test::MemoryHost::List<host::PackLine>(
      {host.Make<host::PackLine>({{"Product", aerosol}, {"Qty", 4}})}));
  auto first = AddConNote(101, "DFE00012345", {dgPack, Pack(Sscc(2), 12)});
  Process(first);
  const std::string one =
      Table({.connote = "4021710012345", .items = "2", .kgs = "12", .dangerous = "True"}) +
      Table1("101", "4021710012345", "CARTON", "2", "12", "ITEM") +
      Table2("101", "4021710012345", Sscc(1)) + Table2("101", "4021710012345", Sscc(2));
  EXPECT_EQ(File(), kHead + one + kTail);
  // The declaration in DFE's form, twice.
  const auto jobs = Jobs();
  ASSERT_EQ(jobs.size(), 2u);
  EXPECT_THAT(test::PdfWords(jobs[1]), HasSubstr("UN1950"));

  // Two pallets, no weight, a delivery window that has started: no carton
  // line, no cartons, the lightest weight and no start date.
  auto window =
      host.Make<host::Despatch>({{"DespatchNo", "DSP778812"},
                                 {"NotBefore", DateTime::FromParts(2024, 3, 14, 7, 0, 0)},
                                 {"NotAfter", DateTime::FromParts(2024, 3, 15, 17, 0, 0)}});
  std::vector<std::shared_ptr<MemoryObject<host::Pack>>> pallets = {Pack(Sscc(3), 60, "PLT01"),
                                                                    Pack(Sscc(4), 60, "PLT01")};
  pallets[0]->fields["PackType"] = "PALLET";
  pallets[1]->fields["PackType"] = "Pallet";
  for (auto& p : pallets) p->fields["Despatch"] = window;
  Process(AddConNote(102, "DFE00012346", pallets, {{"Weight", 0}}));
  EXPECT_EQ(File(), kHead + one +
                        Table({.connote = "4021710012346",
                               .items = "0",
                               .kgs = "1",
                               .start = "",
                               .stop = "2024-03-15T17:00:00+10"}) +
                        Table2("102", "4021710012346", Sscc(3)) +
                        Table2("102", "4021710012346", Sscc(4)) + kTail);
  EXPECT_THAT(host.LogMessages(), ElementsAre("ConNote DFE00012345 compile completed.",
                                              "ConNote DFE00012346 compile completed."));

  // Reading, extending and writing the whole document each time gives the same bytes.
  const std::string inPlace = File();
  fs::remove(path);
  clsDFEDAxml whole;
  whole.SetTailReplacement(false);
  LogList log;
  for (const auto& c : host.conNotes) whole.Process(host.system, c, asn, c->Packs(), log);
  EXPECT_EQ(File(), inPlace);
}

TEST_F(DFEDAxmlTest, TextsAreEscapedAndTheFileStaysInItsFolder) {
  order->DeliveryAddress()->Set("Name", "Smith & Sons <\"Dock\"> Caf\xC3\xA9\x01");
  // An account of five characters that would lead out of the folder.
  carrier->fields["AccountNumber"] = "../12";
  Process(AddCartons(101, "DFE00012345", 1));
  EXPECT_THAT(FilesInFolder(), ElementsAre("MANIFEST____12_202403141200.XML"));
  const std::string file = ReadFile(folder + "MANIFEST____12_202403141200.XML").value_or("");
  EXPECT_THAT(
      file,
      HasSubstr("<ReceiverName>Smith &amp; Sons &lt;\"Dock\"&gt; Caf\xC3\xA9 </ReceiverName>"));
  pugi::xml_document doc;
  ASSERT_TRUE(doc.load_string(file.c_str()));
  pugi::xml_node table = doc.child("NewDataSet").child("Table");
  EXPECT_STREQ(table.child_value("ReceiverName"), "Smith & Sons <\"Dock\"> Caf\xC3\xA9 ");
  EXPECT_STREQ(table.child_value("Connote"), "../1210012345");
}

TEST_F(DFEDAxmlTest, IdentifierWeightAndWindowRules) {
  EXPECT_EQ(DfeConnote(Var("40217"), Var("DFE00012345")), "4021710012345");
  EXPECT_EQ(DfeConnote(Var("9940217"), Var("ABC1234567")), "4021711234567");  // the last 5 and 7
  EXPECT_EQ(DfeConnote(Var("217"), Var(12)), "0021710000012");                // zero-filled
  EXPECT_EQ(DfeConnote(Var(), Var()), "0000010000000");
  for (const Var& none : {Var(), Var(0), Var(0.4), Var(-3), Var("heavy"), Var(1e300)})
    EXPECT_EQ(DfeKgs(none), "1") << none.Text();
  EXPECT_EQ(DfeKgs(Var(2.5)), "2");  // halves to even
  EXPECT_EQ(DfeKgs(Var(3.5)), "4");
  const DateTime now = DateTime::FromParts(2024, 3, 14, 9, 0, 0);
  EXPECT_EQ(DfeWindowDate(Var(now.AddSeconds(-1)), now), "");
  EXPECT_EQ(DfeWindowDate(Var(now), now), "2024-03-14T09:00:00+10");
  EXPECT_EQ(DfeWindowDate(Var(), now), "");
  EXPECT_EQ(DfeWindowDate(Var("soon"), now), "");

  // The packs' weights are summed, then rounded to whole kilograms once.
  auto packs = AddCartons(101, "DFE1", 3)->Packs();
  const double weights[] = {2.5, 2.5, 0};
  for (int i = 1; i <= 3; ++i) packs->Item(i)->Set("Weight", weights[i - 1]);
  packs->Item(1)->Carton()->Set("Length", 0.4);
  cls.GetTotals(packs);
  EXPECT_EQ(cls.Totals().packs, 3);
  EXPECT_EQ(cls.Totals().weight, 5);
  EXPECT_DOUBLE_EQ(cls.Totals().length, 0.4);
}

TEST_F(DFEDAxmlTest, ChecksBeforeAnythingIsWritten) {
  EXPECT_THAT(Process(AddConNote(101, "DFE1", {}), {77}), ElementsAre(77, 1));
  carrier->fields["FileFolder"] = folder.substr(0, folder.size() - 1);
  Process(AddCartons(102, "DFE2", 1));
  carrier->fields["FileFolder"] = folder + "missing/";
  Process(AddCartons(103, "DFE3", 1));
  carrier->fields["FileFolder"] = folder;
  for (const char* account : {"4021", "402171"}) {
    carrier->fields["AccountNumber"] = account;
    Process(AddCartons(104, "DFE4", 1));
  }
  EXPECT_THAT(
      host.LogMessages(),
      ElementsAre("Shipments has no packs DFE1",
                  "Invalid folder " + folder.substr(0, folder.size() - 1),
                  "Invalid folder " + folder + "missing/", "Invalid Carrier Account Reffolder 4021",
                  "Invalid Carrier Account Reffolder 402171"));
  std::vector<std::string> sources;
  for (const auto& entry : host.logs) sources.push_back(entry.at("Procedure").Text());
  EXPECT_THAT(
      sources,
      ElementsAre("DFEXML processing", "Open carrier message file", "Open carrier message file",
                  "Carrier Account Ref must be 5 digits", "Carrier Account Ref must be 5 digits"));
  EXPECT_TRUE(FilesInFolder().empty());
}

TEST_F(DFEDAxmlTest, ADayFileItCannotReadIsKeptAndAConsignmentIsWrittenOnce) {
  const std::string torn = kHead + "  <Table>\r\n    <Connote>40217";
  test::WriteText(path, torn);
  Process(AddCartons(101, "DFE00012345", 1));
  Process(AddCartons(101, "DFE00012345", 1));  // the same again
  Process(AddCartons(102, "DFE00012346", 1));
  EXPECT_EQ(File(), torn);
  const std::string beside = folder + "MANIFEST_40217_202403141200_2.XML";
  EXPECT_THAT(Connotes(ReadFile(beside).value_or("")),
              ElementsAre("4021710012345", "4021710012346"));
  const std::string kept = "Despatch advice file " + path +
                           " cannot be read as a DFE despatch advice; it is kept and ConNote ";
  EXPECT_THAT(host.LogMessages(),
              ElementsAre(kept + "DFE00012345 is written to " + beside + ".",
                          "ConNote DFE00012345 compile completed.",
                          kept + "DFE00012345 is written to " + beside + ".",
                          "Cannot process, connoteno already exists DFE00012345",
                          kept + "DFE00012346 is written to " + beside + ".",
                          "ConNote DFE00012346 compile completed."));
}

TEST_F(DFEDAxmlTest, OnlyAUtf8NewDataSetEndingInItsEndTagIsExtended) {
  const std::string beside = folder + "MANIFEST_40217_202403141200_2.XML";
  const std::string others[] = {
      "<NewDataSet/>\r\n",
      "<?xml version='1.0' encoding='windows-1252'?>\r\n<NewDataSet>\r\n</NewDataSet>\r\n",
      kHead + kTail + "<!-- after the root -->\r\n",
      // A NUL ends the parser's reading; the end tag after it is not the root's.
      kHead + kTail + std::string(1, '\0') + "\r\n" + kTail,
      "<Other></Other>\r\n",
  };
  for (const std::string& other : others) {
    test::WriteText(path, other);
    fs::remove(beside);
    clsDFEDAxml fresh;
    LogList log;
    fresh.Process(host.system, AddCartons(101, "DFE00012345", 1), asn, nullptr, log);
    EXPECT_EQ(File(), other);
    EXPECT_THAT(Connotes(ReadFile(beside).value_or("")), ElementsAre("4021710012345")) << other;
  }
  // Written by another hand on one line, or empty: extended in place.
  for (const std::string& mine :
       {std::string("<NewDataSet><Table><Connote>1</Connote></Table></NewDataSet>"),
        std::string()}) {
    test::WriteText(path, mine);
    clsDFEDAxml fresh;
    LogList log;
    fresh.Process(host.system, AddCartons(102, "DFE00012346", 1), asn, nullptr, log);
    EXPECT_TRUE(File().starts_with(mine.empty() ? kHead : mine.substr(0, mine.size() - 13)));
    EXPECT_EQ(Connotes(File()).back(), "4021710012346");
  }
}

TEST_F(DFEDAxmlTest, AFailedWriteLeavesTheDayFileAndACrashedOneIsCompleted) {
  test::ScriptedPrompt answers;
  test::PromptScope prompt{std::shared_ptr<ErrorPrompt>(&answers, [](ErrorPrompt*) {})};
  Process(AddCartons(101, "DFE00012345", 1));
  const std::string one = File();
  // Eight packs add about 2.6 KB: room for their journal but not for the
  // longer file; then not even for the journal.
  for (const std::size_t room : {one.size() + 1500, std::size_t{200}}) {
    test::FileSizeLimit limit(room);
    Process(AddCartons(102, "DFE00012346", 8));
  }
  EXPECT_EQ(File(), one);
  EXPECT_FALSE(fs::exists(folder + ".MANIFEST_40217_202403141200.XML.journal"));
  ASSERT_EQ(answers.messages.size(), 2u);
  EXPECT_THAT(answers.messages[0], HasSubstr("#57"));

  // What a crash leaves once the journal of a consignment is durable and
  // the file cut at its closing tag: the next call completes it first.
  const std::string added = Table2("103", "4021710012347", Sscc(1030));
  TailJournal journal(path);
  const auto begun = journal.Begin(
      [&](const TailJournal::End& end) { return std::optional(end.bytes.size() - kTail.size()); },
      [&](std::string_view) {
        return Table({.connote = "4021710012347", .items = "1", .kgs = "12"}) + added + kTail;
      });
  ASSERT_TRUE(begun.pending);
  fs::resize_file(path, begun.pending->offset);
  Process(AddCartons(104, "DFE00012348", 1));
  EXPECT_THAT(Connotes(File()), ElementsAre("4021710012345", "4021710012347", "4021710012348"));
  EXPECT_FALSE(fs::exists(journal.JournalPath()));
}

// A process killed at any moment while it adds consignments never leaves a
// day file that the next call can't extend: it parses and holds every
// consignment whole and once.
TEST_F(DFEDAxmlTest, KilledAtAnyMomentTheNextConsignmentFindsAWholeFile) {
  test::KillLoop loop;
  loop.write = [&](int n) {
    const LogList log = Process(AddCartons(n, std::to_string(n), 2));
    return test::Logged(host, log, "compile completed.");
  };
  loop.read = [&] {
    const std::string file = File();
    EXPECT_TRUE(file.ends_with(kTail));
    pugi::xml_document doc;
    EXPECT_TRUE(doc.load_buffer(file.data(), file.size()));
    std::vector<int> numbers;
    std::map<std::string, int> labels;
    for (pugi::xml_node table : doc.child("NewDataSet").children("Table"))
      numbers.push_back(std::stoi(std::string(table.child_value("Connote")).substr(6)));
    for (pugi::xml_node table : doc.child("NewDataSet").children("Table2")) {
      EXPECT_EQ(std::string(table.child_value("LabelTrackCode")).size(), 20u);
      ++labels[table.child_value("Connote")];
    }
    for (const auto& [connote, count] : labels) EXPECT_EQ(count, 2) << connote;
    EXPECT_EQ(labels.size(), numbers.size());
    return numbers;
  };
  test::RunKillLoop(loop);
}

}  // namespace
}  // namespace quendal
