#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "carrierfiles/cVicExpressDAcln.h"
#include "frame/VB.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
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

std::string Header(std::string_view name, std::string_view stamp) {
  return "00N" + Pad(name, 12) + std::string(stamp) + "O" + Sp(20) + std::string(stamp) + "Y" +
         Sp(71) + "\r\n";
}
std::string Consignment(std::string_view no, std::string_view packs, std::string_view weight,
                        std::string_view unit = "CTN") {
  return "10" + Pad(no, 20) + Sp(8) + Pad("Meridian Adelaide", 40) + Sp(40) +
         Pad("77 Rundle Mall", 40) + Pad("Rear loading dock", 40) + Pad("ADELAIDE", 30) + "5" +
         "5000" + Sp(17) + "N" + "60056789" + "S" + std::string(packs) + "MET" +
         std::string(weight) + Sp(5) + "VIC N" + Sp(4) + std::string(unit) + "\r\n";
}
std::string References(std::string_view no) {
  return "15" + Pad(no, 20) + "S" + Pad("ASN0004504", 20) + "Advance Ship Notice Number    Y\r\n" +
         "15" + Pad(no, 20) + "S" + Pad("PO778804", 20) + "Customer Order Number         Y\r\n";
}
std::string Item(std::string_view no, std::string_view sscc) {
  return "20" + Pad(no, 20) + std::string(sscc) + "S \r\n";
}

class VicExpressDAclnTest : public ::testing::Test {
 protected:
  void SetUp() override {
    // The day's file is found by its creation date, which the file system
    // gives: the clock keeps today's date.
    SetNow(std::nullopt);
    today = Today();
    SetNow(today.AddSeconds(9 * 3600 + 30 * 60));
    carrier = host.Make<host::Carrier>(
        {{"FileFolder", folder}, {"AccountRef", "VEX01"}, {"AccountNumber", "60056789"}});
    receiver = host.Make<host::Receiver>({{"Name", "Meridian Adelaide"},
                                          {"AddressLine1", "77 Rundle Mall"},
                                          {"AddressLine2", "Rear loading dock"},
                                          {"Suburb", "ADELAIDE"},
                                          {"State", " SA "},
                                          {"Postcode", "50001"}});
    despatch = host.Make<host::Despatch>({{"DespatchNo", "PO778804"}});
    asn = host.Make<host::ASN>({{"ID", 5}, {"ASNNo", "ASN0004504"}, {"ASNNumber", 4504}});
  }
  void TearDown() override { SetNow(std::nullopt); }

  std::shared_ptr<MemoryObject<host::Pack>> Pack(std::string_view sscc, std::string_view code,
                                                 Var cartonWeight, Var weight = Var(),
                                                 Var asnId = 5) {
    auto carton = host.Make<host::Carton>({{"Code", code}, {"Weight", cartonWeight}});
    return host.Make<host::Pack>({{"SSCC", sscc},
                                  {"ASNId", asnId},
                                  {"Carton", carton},
                                  {"Weight", weight},
                                  {"Despatch", despatch}});
  }
  void Process(std::string_view no,
               const std::vector<std::shared_ptr<MemoryObject<host::Pack>>>& packs) {
    auto conNote = host.Make<host::ConNote>(
        {{"ConNoteNo", no}, {"Service", "MET"}, {"Carrier", carrier}, {"Receiver", receiver}});
    MemoryHost::Attach(conNote, packs);
    LogList log;
    cls.Process(host.system, conNote, asn,
                host::Object::As<host::PackList>(conNote->fields["Packs"]), log);
  }
  std::string File(const std::string& name) const {
    return ReadFile(folder + name).value_or("<none>");
  }
  std::string Name(DateTime day) const {
    return "CARTON" + Format(Var(day), "YYYYMMDD") + "0930.CTN";
  }
  std::string Stamp(DateTime day) const { return Format(Var(day), "YYYYMMDD") + "093000"; }

  MemoryHost host;
  test::TempFolder temp;
  std::string folder = temp.path() + "/";
  DateTime today;
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Receiver>> receiver;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
  std::shared_ptr<MemoryObject<host::ASN>> asn;
  clsVicExpressDAcln cls;
};

TEST_F(VicExpressDAclnTest, TheDaysFileIsReusedAndTheNextDayStartsANewOne) {
  // Carton weights 1.2 + 1.3 make 2.5 kilograms, written as 2 (halves go
  // to even); a pack of another notice gets no item record.
  Process("VEX00012349",
          {Pack("00093123450000100231", "CTN01", 1.2), Pack("00093123450000100248", "CTN02", 1.3),
           Pack("00093123450000100255", "CTN01", 0, Var(), 77)});
  const std::string first =
      Header("VEX0104504.CLN", Stamp(today)) + Consignment("VEX00012349", "   3", "    2") +
      References("VEX00012349") + Item("VEX00012349", "00093123450000100231") +
      Item("VEX00012349", "00093123450000100248");
  EXPECT_EQ(File(Name(today)), first);

  // Later the same day, to the same file: no second header.
  SetNow(today.AddSeconds(15 * 3600));
  Process("VEX00012363", {Pack("00093123450000100910", "PLT01", 25.0)});
  const std::string second = first + Consignment("VEX00012363", "   1", "   25", "PAL") +
                             References("VEX00012363") +
                             Item("VEX00012363", "00093123450000100910");
  EXPECT_EQ(File(Name(today)), second);
  EXPECT_FALSE(FileExists(folder + "CARTON" + Format(Var(today), "YYYYMMDD") + "1500.CTN"));

  // The next day the file created today is no longer the day's file.
  const DateTime tomorrow = today.AddDays(1);
  SetNow(tomorrow.AddSeconds(9 * 3600 + 30 * 60));
  Process("VEX00012377", {Pack("00093123450000101214", "CTN01", 0, 0.4)});
  EXPECT_EQ(File(Name(tomorrow)), Header("VEX0104504.CLN", Stamp(tomorrow)) +
                                      Consignment("VEX00012377", "   1", "    1") +
                                      References("VEX00012377") +
                                      Item("VEX00012377", "00093123450000101214"));
  EXPECT_EQ(File(Name(today)), second);
  EXPECT_TRUE(host.logs.empty());
}

// An empty file of today's, as a run killed before its header leaves one,
// is the day's file: its header names the file itself.
TEST_F(VicExpressDAclnTest, AnEmptyFileOfTodaysIsReusedAndItsHeaderNamesIt) {
  test::WriteText(folder + "left.ctn", "");
  Process("VEX1", {Pack("00093123450000100231", "CTN01", 2)});
  EXPECT_EQ(File("left.ctn"), Header("left.ctn", Stamp(today)) +
                                  Consignment("VEX1", "   1", "    2") + References("VEX1") +
                                  Item("VEX1", "00093123450000100231"));
  EXPECT_FALSE(FileExists(folder + Name(today)));
}

TEST_F(VicExpressDAclnTest, PacksWithoutWeightAnEmptyPackListAndAMissingFolder) {
  // No packs: a new file gets its header, but nothing of the consignment.
  Process("VEX0", {});
  EXPECT_EQ(File(Name(today)), Header("VEX0104504.CLN", Stamp(today)));
  // Packs that weigh nothing still weigh 1 kilogram.
  Process("VEX1",
          {Pack("00093123450000100231", "CTN01", 0), Pack("00093123450000100248", "CTN01", Var())});
  EXPECT_EQ(File(Name(today)), Header("VEX0104504.CLN", Stamp(today)) +
                                   Consignment("VEX1", "   2", "    1") + References("VEX1") +
                                   Item("VEX1", "00093123450000100231") +
                                   Item("VEX1", "00093123450000100248"));

  // A long receiver name keeps to its field; a pack whose notice is not
  // known still has its item record.
  receiver->fields["Name"] = std::string(45, 'N');
  Process("VEX3", {Pack("00093123450000100262", "CTN01", 2, Var(), Var())});
  const std::string file = File(Name(today));
  EXPECT_EQ(file.substr(file.find("10VEX3"), 283).substr(30, 80), std::string(40, 'N') + Sp(40));
  EXPECT_THAT(file, ::testing::EndsWith(Item("VEX3", "00093123450000100262")));

  carrier->fields["FileFolder"] = temp.path() + "/missing/";
  Process("VEX4", {Pack("00093123450000100279", "CTN01", 2)});
  EXPECT_EQ(host.LogMessages().back(), "Cannot open file " + temp.path() + "/missing/");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Open carrier message file");

  // A consignment number longer than its field is refused.
  carrier->fields["FileFolder"] = folder;
  const std::string day = File(Name(today));
  Process(std::string(21, '9'), {Pack("00093123450000100286", "CTN01", 2)});
  EXPECT_EQ(File(Name(today)), day);
  EXPECT_EQ(host.LogMessages().back(), "ConNote " + std::string(21, '9') +
                                           " not added: a value of 21 characters (\"" +
                                           std::string(20, '9') + "...\") is longer than its field of 20");

  // No folder text: nothing goes to the working directory.
  test::WorkingDirectory cwd(folder + "cwd");
  for (const Var& none : {Var(""), Var()}) {
    carrier->fields["FileFolder"] = none;
    Process("VEX5", {Pack("00093123450000100286", "CTN01", 2)});
    EXPECT_EQ(host.LogMessages().back(), "Invalid folder ");
  }
  EXPECT_TRUE(cwd.Entries().empty());
}

// A process killed at any moment while it adds consignments leaves the
// header and whole consignments only, and the next call adds to that file.
TEST_F(VicExpressDAclnTest, KilledAtAnyMomentTheFileHoldsOnlyWholeConsignments) {
  test::ScriptedPrompt answers;
  test::PromptScope prompt{std::shared_ptr<ErrorPrompt>(&answers, [](ErrorPrompt*) {})};
  test::KillLoop loop;
  loop.write = [&](int n) {
    const std::size_t asked = answers.messages.size();
    const std::size_t logged = host.logs.size();
    Process("V" + std::to_string(n), {Pack("00093123450000100231", "CTN01", 1.2),
                                      Pack("00093123450000100248", "CTN01", 1.3)});
    // The class logs only what went wrong.
    return answers.messages.size() == asked && host.logs.size() == logged;
  };
  loop.read = [&] {
    const std::vector<std::string> lines = test::CrLfLines(File(Name(today)));
    std::vector<int> numbers;
    EXPECT_FALSE(lines.empty());
    if (lines.empty()) return numbers;
    // A kill between creating the file and writing its header leaves it
    // empty; the next call reuses it, and a reused file's header carries
    // the file's own name.
    EXPECT_THAT(lines[0] + "\r\n", ::testing::AnyOf(Header("VEX0104504.CLN", Stamp(today)),
                                                    Header(Name(today), Stamp(today))));
    // Each consignment: "10", two "15" and an item "20" per pack.
    for (const std::string& first : test::ClnConsignments(lines, "10 15 15 20 20 ")) {
      EXPECT_EQ(first + "\r\n", Consignment(Trim(first.substr(2, 20)), "   2", "    2"));
      numbers.push_back(std::stoi(first.substr(3, 19)));
    }
    // One day, one file: a kill never leaves a second one started.
    EXPECT_EQ(std::distance(fs::directory_iterator(folder), fs::directory_iterator()), 1);
    return numbers;
  };
  test::RunKillLoop(loop);
}

}  // namespace
}  // namespace quendal
