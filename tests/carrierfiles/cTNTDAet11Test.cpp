#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "carrierfiles/TailJournal.h"
#include "carrierfiles/cTNTDAet11.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "tests/support/FileSizeLimit.h"
#include "tests/support/KillLoop.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/Records.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::MemoryHost;
using test::MemoryObject;
using test::Pad;
using test::Sp;
using ::testing::ElementsAre;

// The batch opened by consignment 102 of notice ASN0004501, and the records
// of a consignment, built from named pieces.
const std::string kBatch = Pad("102", 10);
std::string A() { return "A" + Pad("ASN0004501", 20) + Sp(42) + "MEL" + "202403140930" + "11\r\n"; }
std::string B() {
  return "B" + kBatch + Pad("TNT01", 15) + Pad("30012345", 10) +
         Pad("Kestrel Apparel Pty Ltd", 30) + Pad("40 Industry Drive", 30) + Sp(30) +
         Pad("DANDENONG SOUTH", 20) + "VIC" + "3175" + Sp(33) + "\r\n";
}
std::string C(std::string_view no, std::string_view service = "76  ") {
  return "C" + kBatch + Pad(no, 15) + "001" + Sp(25) + "HARBOUR Harbour Stores Chadsto" +
         Pad("Rear loading dock", 30) + Sp(30) + Pad("CHADSTONE", 20) + "VIC" + "3148" + Sp(33) +
         "14032024" + std::string(service) + "0S00" + Sp(42) + "\r\n";
}
std::string E(std::string_view no, std::string_view notAfter = "19/03/2024 17:00:00") {
  return "E" + kBatch + Pad(no, 15) + "0" +
         Pad("deliver not after date " + std::string(notAfter), 80) + "\r\n";
}
std::string F(std::string_view no, std::string_view packs, std::string_view weight = "00012.250",
              std::string_view kind = "Cartons", std::string_view asn = "ASN0004501") {
  return "F" + kBatch + Pad(no, 15) + "001" + Pad(asn, 15) + Pad(kind, 20) + Sp(6) +
         std::string(packs) + std::string(weight) + "KG" + Sp(23) + "00.0350000" + "CO" + Sp(10) +
         "\r\n";
}
std::string H(std::string_view no, std::string_view sequence, std::vector<std::string> slots) {
  std::string line = "H" + kBatch + Pad(no, 15) + std::string(sequence);
  for (std::size_t i = 0; i < 8; ++i) line += i < slots.size() ? slots[i] + "  " : Sp(20);
  return line + "\r\n";
}
std::string Z(std::string_view count) {
  return "Z" + Pad("ASN0004501", 20) + std::string(count) + "\r\n";
}

std::string Sscc(int i) {
  char text[24];
  std::snprintf(text, sizeof text, "0009312345%010d", i);
  return text;
}
// The 18 digits of a slot.
std::string Slot(int i) { return Sscc(i).substr(2); }

class TNTDAet11Test : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 9, 30, 0));
    carrier = host.Make<host::Carrier>(
        {{"FileFolder", folder}, {"AccountRef", "TNT01"}, {"AccountNumber", "30012345"}});
    vendor = host.Make<host::Vendor>({{"Name", "Kestrel Apparel Pty Ltd"},
                                      {"AddressLine2", "40 Industry Drive"},
                                      {"Suburb", "DANDENONG SOUTH"},
                                      {"State", "VIC"},
                                      {"Postcode", 3175}});
    receiver = host.Make<host::Receiver>({{"Name", "Harbour Stores Chadstone"},
                                          {"AddressLine1", "Shop 210"},
                                          {"AddressLine2", "Rear loading dock"},
                                          {"Suburb", "CHADSTONE"},
                                          {"State", "VIC"},
                                          {"Postcode", "3148"}});
    partner = host.Make<host::Partner>({{"ShortName", "HARBOUR"}});
    despatch =
        host.Make<host::Despatch>({{"NotAfter", DateTime::FromParts(2024, 3, 19, 17, 0, 0)}});
    asn = host.Make<host::ASN>({{"ID", 1}, {"ASNNo", "ASN0004501"}, {"OriginCode", "MELBOURNE"}});
  }
  void TearDown() override { SetNow(std::nullopt); }

  std::shared_ptr<MemoryObject<host::ConNote>> ConNote(int id, std::string_view no, int packs,
                                                       Var weight = 12.25) {
    auto conNote =
        host.Make<host::ConNote>({{"ConNoteId", id},
                                  {"ConNoteNo", no},
                                  {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 8, 0, 0)},
                                  {"Service", "EXPRESS"},
                                  {"CarrierPrefix", "TNT"},
                                  {"Weight", weight},
                                  {"Volume", 0.035},
                                  {"Carrier", carrier},
                                  {"Receiver", receiver},
                                  {"Vendor", vendor},
                                  {"Partner", partner}});
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> list;
    for (int i = 1; i <= packs; ++i)
      list.push_back(host.Make<host::Pack>(
          {{"SSCC", Sscc(i)}, {"PackType", "CARTON"}, {"Despatch", despatch}}));
    MemoryHost::Attach(conNote, list);
    return conNote;
  }
  static Ref<host::PackList> PacksOf(const std::shared_ptr<MemoryObject<host::ConNote>>& c) {
    return host::Object::As<host::PackList>(c->fields["Packs"]);
  }
  void Process(const std::shared_ptr<MemoryObject<host::ConNote>>& conNote) {
    LogList log;
    cls.Process(host.system, conNote, asn, PacksOf(conNote), log);
  }
  std::string File() const { return ReadFile(path).value_or("<none>"); }

  MemoryHost host;
  std::shared_ptr<test::ScriptedPrompt> answers = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope prompt{answers};
  test::TempFolder temp;
  std::string folder = temp.path() + "/";
  std::string path = folder + "TNT0114031200.TXT";
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::Receiver>> receiver;
  std::shared_ptr<MemoryObject<host::Partner>> partner;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
  std::shared_ptr<MemoryObject<host::ASN>> asn;
  clsTNTDAet11 cls;
};

TEST_F(TNTDAet11Test, FirstAndSecondConsignmentOfTheDay) {
  Process(ConNote(102, "TNT00012346", 2));
  const std::string first = A() + B() + C("TNT00012346") + E("TNT00012346") +
                            F("TNT00012346", "00002") + H("TNT00012346", "001", {Slot(1), Slot(2)});
  EXPECT_EQ(File(), first + Z("00007"));

  // The second joins the batch: no second "A" or "B", the batch number of
  // the first, the trailer moved to the end and counting every line.
  asn->fields["ASNNo"] = "ASN0004515";
  Process(ConNote(116, "TNT00012360", 1, 0.5));
  EXPECT_EQ(File(), first + C("TNT00012360") + E("TNT00012360") +
                        F("TNT00012360", "00001", "00001.000", "Cartons", "ASN0004515") +
                        H("TNT00012360", "001", {Slot(1)}) + Z("00011"));
  EXPECT_TRUE(host.logs.empty());
}

TEST_F(TNTDAet11Test, NinePacksPalletsAndServices) {
  auto nine = ConNote(102, "TNT00012346", 9);
  PacksOf(nine)->Item(1)->Set("PackType", "pallet");
  nine->fields["Service"] = "SUNDAY";  // outside the table: TNT's default
  Process(nine);
  std::vector<std::string> eight;
  for (int i = 1; i <= 8; ++i) eight.push_back(Slot(i));
  EXPECT_EQ(File(), A() + B() + C("TNT00012346") + E("TNT00012346") +
                        F("TNT00012346", "00009", "00012.250", "Pallets") +
                        H("TNT00012346", "001", eight) + H("TNT00012346", "002", {Slot(9)}) +
                        Z("00008"));

  // A carrier prefix outside the table has no service code; no packs still give one "H".
  auto none = ConNote(103, "AAA1", 0);
  none->fields["CarrierPrefix"] = "XYZ";
  Process(none);
  EXPECT_THAT(File(), ::testing::EndsWith(C("AAA1", "    ") + E("AAA1", "") + F("AAA1", "00000") +
                                          H("AAA1", "001", {}) + Z("00012")));
}

TEST_F(TNTDAet11Test, AFileThatDoesNotEndInItsTrailerIsLeftAlone) {
  Process(ConNote(102, "TNT00012346", 1));
  ASSERT_TRUE(AppendFile(path, "C102       TNT00099999    001\r\n"));
  const std::string before = File();
  Process(ConNote(103, "TNT00012347", 1));
  EXPECT_EQ(File(), before);
  EXPECT_THAT(host.LogMessages(), ElementsAre("Cannot open file to add consignment " + folder,
                                              "ConNote TNT00012347 not added: the last line of " +
                                                  path + " is not the trailer of its batch"));
  EXPECT_EQ(host.logs[0].at("Procedure").Text(), "Open carrier message file");
}

// A longer value would shift the rest of its record: the consignment is
// refused, and the batch keeps its trailer.
TEST_F(TNTDAet11Test, AValueLongerThanItsFieldRefusesTheConsignment) {
  Process(ConNote(102, "TNT00012346", 1));
  const std::string before = File();
  receiver->fields["AddressLine2"] = std::string(31, 'S');
  Process(ConNote(103, "TNT00012347", 1));
  EXPECT_EQ(File(), before);
  EXPECT_EQ(host.LogMessages().back(),
            "ConNote TNT00012347 not added: a value of 31 characters (\"" + std::string(20, 'S') +
                "...\") is longer than its field of 30");

  // A batch whose trailer can't count one more consignment takes no more.
  receiver->fields["AddressLine2"] = "Gate 4";
  std::string full = before;
  full.replace(full.size() - 7, 5, "99998");
  ASSERT_TRUE(ReplaceFile(path, full));
  Process(ConNote(104, "TNT00012348", 1));
  EXPECT_EQ(File(), full);
  EXPECT_EQ(host.LogMessages().back(),
            "ConNote TNT00012348 not added: a value of 6 characters (\"100002\") is longer than "
            "its field of 5");

  // A new batch whose sender record would not keep its width is not started.
  carrier->fields["AccountRef"] = "TNT01-NORTHSIDE";  // 15 characters: fits
  Process(ConNote(105, "TNT00012348", 1));
  EXPECT_TRUE(fs::exists(folder + "TNT01-NORTHSIDE14031200.TXT"));
  carrier->fields["AccountRef"] = "TNT01-SOUTHSIDE2";
  Process(ConNote(106, "TNT00012349", 1));
  EXPECT_FALSE(fs::exists(folder + "TNT01-SOUTHSIDE214031200.TXT"));
  EXPECT_EQ(host.LogMessages().back(),
            "ConNote TNT00012349 not added: a value of 16 characters (\"TNT01-SOUTHSIDE2\") is "
            "longer than its field of 15");
}

TEST_F(TNTDAet11Test, WithoutAFolderTextNothingIsWritten) {
  test::WorkingDirectory cwd(folder + "cwd");
  for (const Var& none : {Var(""), Var()}) {
    carrier->fields["FileFolder"] = none;
    Process(ConNote(102, "TNT00012346", 1));
    EXPECT_EQ(host.LogMessages().back(), "Invalid folder ");
    EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Open carrier message file");
  }
  EXPECT_TRUE(cwd.Entries().empty());
}

TEST_F(TNTDAet11Test, AFailedWriteLeavesTheDayFileAndACrashedOneIsCompleted) {
  Process(ConNote(102, "TNT00012346", 1));
  const std::string one = File();
  // Room for the journal but not for the longer file; then not even for the journal.
  for (const std::size_t room : {one.size() + 100, std::size_t{100}}) {
    test::FileSizeLimit limit(room);
    Process(ConNote(103, "TNT00012347", 8));
  }
  EXPECT_EQ(File(), one);
  EXPECT_FALSE(fs::exists(folder + ".TNT0114031200.TXT.journal"));
  ASSERT_EQ(answers->messages.size(), 2u);
  EXPECT_THAT(answers->messages[0], ::testing::HasSubstr("#57"));

  // What a crash leaves once the journal of consignment 103 is durable and
  // the file cut at its trailer: the next consignment completes 103 first.
  const std::string two = one.substr(0, one.size() - 28) + C("TNT00012347") + E("TNT00012347") +
                          F("TNT00012347", "00001") + H("TNT00012347", "001", {Slot(1)}) +
                          Z("00011");
  TailJournal journal(path);
  const auto begun = journal.Begin(
      [](const TailJournal::End& end) { return std::optional<std::size_t>(end.bytes.size() - 28); },
      [&](std::string_view) { return two.substr(one.size() - 28); });
  ASSERT_TRUE(begun.pending);
  fs::resize_file(path, begun.pending->offset);
  Process(ConNote(104, "TNT00012348", 1));
  EXPECT_EQ(File(), two.substr(0, two.size() - 28) + C("TNT00012348") + E("TNT00012348") +
                        F("TNT00012348", "00001") + H("TNT00012348", "001", {Slot(1)}) +
                        Z("00015"));
  EXPECT_EQ(host.LogMessages().size(), 0u);
}

// A process killed at any moment while it adds consignments never leaves a
// day file that the next consignment can't complete: every consignment is
// whole and there once, and the trailer counts the lines.
TEST_F(TNTDAet11Test, KilledAtAnyMomentTheNextConsignmentFindsAWholeFile) {
  test::KillLoop loop;
  loop.write = [&](int n) {
    auto conNote = ConNote(102, "N" + std::to_string(n), 2);
    LogList log;
    cls.Process(host.system, conNote, asn, PacksOf(conNote), log);
    return log.empty();  // the class logs only what went wrong
  };
  loop.read = [&] {
    const std::vector<std::string> lines = test::CrLfLines(File());
    std::vector<int> numbers;
    EXPECT_GE(lines.size(), 3u);
    if (lines.size() < 3) return numbers;
    EXPECT_EQ(lines[0][0], 'A');
    EXPECT_EQ(lines[1][0], 'B');
    char count[8];
    std::snprintf(count, sizeof count, "%05zu", lines.size());
    EXPECT_EQ(lines.back() + "\r\n", Z(count));
    std::string kinds;
    for (std::size_t i = 2; i + 1 < lines.size(); ++i) {
      kinds += lines[i][0];
      if (lines[i][0] == 'C') numbers.push_back(std::stoi(lines[i].substr(12, 14)));
    }
    std::string whole;
    for (std::size_t i = 0; i < numbers.size(); ++i) whole += "CEFH";
    EXPECT_EQ(kinds, whole);
    return numbers;
  };
  test::RunKillLoop(loop);
}

}  // namespace
}  // namespace quendal
