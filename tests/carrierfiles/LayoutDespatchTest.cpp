#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "carrierfiles/cHunterDA.h"
#include "carrierfiles/cIpecDA1250.h"
#include "carrierfiles/cIpecDA1256.h"
#include "carrierfiles/cMayneDAcl.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "tests/support/KillLoop.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/Records.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::CrLfLines;
using test::MemoryHost;
using test::MemoryObject;
using test::Pad;
using test::Sp;
using ::testing::ElementsAre;

std::string Sscc(int i) {
  char text[24];
  std::snprintf(text, sizeof text, "0009312345%010d", i);
  return text;
}

// One consignment of two cartons to a store, for each of the despatch
// classes laid out by layout files.
class LayoutDespatchTest : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 9, 30, 0));
    carrier = host.Make<host::Carrier>(
        {{"FileFolder", folder}, {"AccountRef", "ipe/01"}, {"AccountNumber", "50045678"}});
    receiver = host.Make<host::Receiver>({{"Name", "Harbour Stores Chadstone"},
                                          {"AddressLine1", "Shop 210"},
                                          {"AddressLine2", "Rear loading dock"},
                                          {"Suburb", "CHADSTONE"},
                                          {"State", "VIC"},
                                          {"Postcode", "3148"}});
    vendor = host.Make<host::Vendor>({{"Name", "Kestrel Apparel Pty Ltd"}});
    asn = host.Make<host::ASN>({{"ID", 1}, {"ASNNo", "ASN0004501"}});
    despatch = host.Make<host::Despatch>(
        {{"NotBefore", DateTime::FromParts(2024, 3, 15, 7, 0, 0)},
         {"NotAfter", DateTime::FromParts(2024, 3, 18, 17, 30, 0)}});
  }
  void TearDown() override { SetNow(std::nullopt); }

  std::shared_ptr<MemoryObject<host::ConNote>> ConNote(std::string_view no, Var weight = 12.5,
                                                       std::string_view service = "Road Express") {
    auto conNote = host.Make<host::ConNote>(
        {{"ConNoteNo", no},
         {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 8, 0, 0)},
         {"Service", service},
         {"Weight", weight},
         {"Volume", 0.035},
         {"DeliveryInstructions", "Rear dock"},
         {"Carrier", carrier},
         {"Receiver", receiver},
         {"Vendor", vendor}});
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> packs;
    for (int i = 1; i <= 2; ++i)
      packs.push_back(host.Make<host::Pack>(
          {{"SSCC", Sscc(i)},
           {"Weight", 6.25},
           {"Despatch", despatch},
           {"Carton", host.Make<host::Carton>({{"Code", "CTN01"}})}}));
    MemoryHost::Attach(conNote, packs);
    return conNote;
  }
  LogList Process(ConsignmentWriter& cls, const std::shared_ptr<MemoryObject<host::ConNote>>& c) {
    LogList log{77};
    cls.Process(host.system, c, asn, host::Object::As<host::PackList>(c->fields["Packs"]), log);
    return log;
  }
  void SiteLayout(std::string_view name, std::string_view text) {
    std::ofstream(folder + std::string(name) + ".layout", std::ios::binary) << text;
  }
  std::vector<std::string> Lines(std::string_view name) const {
    return CrLfLines(ReadFile(folder + std::string(name)).value_or("<none>"));
  }
  std::vector<std::string> Files() const {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(folder))
      if (entry.path().extension() != ".layout") names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }

  MemoryHost host;
  std::shared_ptr<test::ScriptedPrompt> answers = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope prompt{answers};
  test::TempFolder temp;
  std::string folder = temp.path() + "/";
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Receiver>> receiver;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::ASN>> asn;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
};

// The receiver block as the shipped fixed layouts cut it.
std::string Receiver(int name, int line, int suburb) {
  return Pad("Harbour Stores Chadstone", name) + Pad("Shop 210", line) + Pad("Rear loading dock", line) +
         Pad("CHADSTONE", suburb) + "VIC" + "3148";
}

TEST_F(LayoutDespatchTest, Ipec1250WritesItsDayFileAndMovesTheTrailer) {
  clsIpecDA1250 cls;
  const LogList log = Process(cls, ConNote("IPE00012346"));
  // The account reference is a host text: its separator can't make a folder of the name.
  const std::string name = "T1250_IPE__20240314093000.DAT";
  EXPECT_THAT(Files(), ElementsAre(name));
  const auto consignment = [](std::string_view no, std::string_view weight) {
    return "40240314C" + Pad("50045678", 10) + Pad(no, 12) + "X" + Receiver(30, 30, 25) + "0002" +
           std::string(weight) + "00.035" + Pad("ASN0004501", 20) + Pad("Rear dock", 30) + Sp(240);
  };
  const auto item = [](std::string_view no, int i) {
    return "40240314I" + Pad(no, 12) + "000" + std::to_string(i) + Sscc(i) + "0006.3";
  };
  EXPECT_THAT(Lines(name), ElementsAre(consignment("IPE00012346", "0012.5"), item("IPE00012346", 1),
                                       item("IPE00012346", 2), "20240314", "%%EOF"));
  EXPECT_EQ(Lines(name)[0].size(), 460u);
  EXPECT_THAT(log, ElementsAre(77, 1, 2));
  EXPECT_THAT(host.LogMessages(), ElementsAre("ConNote IPE00012346. ActiveX called Quendal.clsIpecDA1250",
                                              "ConNote IPE00012346 compile completed."));

  // The next consignment goes before the trailer, which stays the file's end.
  Process(cls, ConNote("IPE00012347", 0));
  EXPECT_THAT(Lines(name),
              ElementsAre(consignment("IPE00012346", "0012.5"), item("IPE00012346", 1),
                          item("IPE00012346", 2), consignment("IPE00012347", "000000"),
                          item("IPE00012347", 1), item("IPE00012347", 2), "20240314", "%%EOF"));
}

// A number too large for its field would shift the rest of the record: the
// consignment is refused, and the file keeps its trailer.
TEST_F(LayoutDespatchTest, ANumberLongerThanItsFieldRefusesTheConsignment) {
  clsIpecDA1250 cls;
  Process(cls, ConNote("IPE00012346"));
  const std::string name = "T1250_IPE__20240314093000.DAT";
  const std::vector<std::string> before = Lines(name);
  Process(cls, ConNote("IPE00012347", 123456));
  EXPECT_EQ(Lines(name), before);
  EXPECT_EQ(host.LogMessages().back(),
            "ConNote IPE00012347 not added: a value of 8 characters (\"123456.0\") is longer than "
            "its field of 6");
}

TEST_F(LayoutDespatchTest, Ipec1256Mayne) {
  clsIpecDA1256 ipec;
  Process(ipec, ConNote("IPE00012346", 12.5, "priority service"));
  clsMayneDAcl mayne;
  Process(mayne, ConNote("MAY00012346"));
  EXPECT_THAT(Files(), ElementsAre("CL_20240314093000.txt", "T1256_IPE__20240314093000.DAT"));
  EXPECT_THAT(Lines("T1256_IPE__20240314093000.DAT"),
              ElementsAre("C" + Pad("50045678", 10) + Pad("IPE00012346", 12) + "20240314" + "1H" +
                              Receiver(30, 30, 25) + "202403150700" + "202403181730" + "0002" +
                              "00012.5" + "00.035" + Pad("ASN0004501", 20) + Pad("Rear dock", 30),
                          "I" + Pad("IPE00012346", 12) + "0001" + Sscc(1) + "CTN01" + "006.3",
                          "I" + Pad("IPE00012346", 12) + "0002" + Sscc(2) + "CTN01" + "006.3"));
  EXPECT_THAT(Lines("CL_20240314093000.txt"),
              ElementsAre("H" + Pad("50045678", 10) + Pad("Kestrel Apparel Pty Ltd", 30) + "20240314093000",
                          "C" + Pad("MAY00012346", 15) + "14032024" + Pad("Road Expre", 10) +
                              Pad("Harbour Stores Chadstone", 30) + Pad("Shop 210", 30) +
                              Pad("Rear loading dock", 30) + Pad("CHADSTONE", 20) + "VIC3148" + "0002" +
                              "00012.50" + "000.035" + Pad("ASN0004501", 20) + Pad("Rear dock", 40),
                          "P" + Pad("MAY00012346", 15) + "0001" + Sscc(1) + "CTN01" + "006.25",
                          "P" + Pad("MAY00012346", 15) + "0002" + Sscc(2) + "CTN01" + "006.25"));
}

TEST_F(LayoutDespatchTest, HunterWritesTabSeparatedLines) {
  clsHunterDA cls;
  Process(cls, ConNote("HUN00012346", 12.5, "AF"));
  const auto line = [](int i) {
    return "HUN00012346\t14/03/2024\t50045678\tAF\tHarbour Stores Chadstone\tShop 210\tRear loading dock\t"
           "CHADSTONE\tVIC\t3148\t" +
           std::to_string(i) + "\t2\t" + Sscc(i) + "\t6.25\t12.50\t0.035\tASN0004501\tRear dock";
  };
  EXPECT_THAT(Lines("DOWNLOAD_IPE__20240314.TXT"), ElementsAre(line(1), line(2)));
}

// A site layout beside the output replaces the shipped one: here fields
// reordered and resized, a trailer of its own and a header for Hunter.
TEST_F(LayoutDespatchTest, SiteLayoutsReorderAndResize) {
  SiteLayout("clsIpecDA1250",
             "record consignment\n  \"40\"\n  cut 12 ConNote.ConNoteNo\n  date \"YYMMDD\" ConNote.ConNoteDate\n"
             "  cut 8 Receiver.Name upper\n  zero 3 PackCount\n"
             "record trailer\n  \"99\"\n  zero 4 PackCount\n");
  SiteLayout("clsHunterDA",
             "format delimited \",\"\nrecord header\n  \"Consignment\"\n  \"Receiver\"\n"
             "record consignment\n  text ConNote.ConNoteNo\n  cut 7 Receiver.Name\n");
  SiteLayout("clsMayneDAcl", "record pack\n  cut 4 Pack.SSCC\n  right 4 PackNo\n");
  SiteLayout("clsIpecDA1256", "record consignment\n  cutright 14 ConNote.ConNoteNo\n  text ServiceCode\n");
  clsIpecDA1250 ipec;
  Process(ipec, ConNote("IPE00012346"));
  Process(ipec, ConNote("IPE00012347"));
  clsHunterDA hunter;
  Process(hunter, ConNote("HUN00012346"));
  Process(hunter, ConNote("HUN00012347"));
  clsMayneDAcl mayne;
  Process(mayne, ConNote("MAY00012346"));
  clsIpecDA1256 ipec56;
  Process(ipec56, ConNote("IPE00012348"));
  EXPECT_THAT(Lines("T1250_IPE__20240314093000.DAT"),
              ElementsAre("40" + Pad("IPE00012346", 12) + "240314HARBOUR 002",
                          "40" + Pad("IPE00012347", 12) + "240314HARBOUR 002", "990002"));
  EXPECT_THAT(Lines("DOWNLOAD_IPE__20240314.TXT"),
              ElementsAre("Consignment,Receiver", "HUN00012346,Harbour", "HUN00012347,Harbour"));
  EXPECT_THAT(Lines("CL_20240314093000.txt"), ElementsAre("0009   1", "0009   2"));
  EXPECT_THAT(Lines("T1256_IPE__20240314093000.DAT"), ElementsAre("   IPE000123484H"));
}

// A layout that can't be used is named with its line and column, and the
// consignment is not written at all; the log list keeps what it held.
TEST_F(LayoutDespatchTest, ABrokenLayoutWritesNothing) {
  const std::string path = folder + "clsHunterDA.layout";
  const std::pair<std::string_view, std::string_view> broken[] = {
      {"record pack\n  text Pack.SSCC\n  text ConNote.Colour\n", "line 3 column 8: unknown value \"ConNote.Colour\""},
      {"record pack\n  cut 2x Pack.SSCC\n", "line 2 column 7: bad width \"2x\": a width is a whole number from 1 to 999"},
      {"record pack\n  \"AB\n", "line 2 column 3: the quoted text is not closed: it must end on its line with \""},
  };
  clsHunterDA cls;
  for (const auto& [text, problem] : broken) {
    host.logs.clear();
    SiteLayout("clsHunterDA", text);
    const LogList log = Process(cls, ConNote("HUN00012346"));
    EXPECT_THAT(host.LogMessages(), ElementsAre("ConNote HUN00012346. ActiveX called Quendal.clsHunterDA",
                                                "Cannot use layout " + path + " " + std::string(problem)));
    EXPECT_EQ(host.logs[1].at("Procedure").Text(), "Open layout file");
    EXPECT_EQ(log.size(), 3u);
    EXPECT_TRUE(Files().empty());
  }
  // Mended, the same object takes the file as it now stands.
  SiteLayout("clsHunterDA", "record pack\n  text Pack.SSCC\n");
  Process(cls, ConNote("HUN00012346"));
  EXPECT_THAT(Lines("DOWNLOAD_IPE__20240314.TXT"), ElementsAre(Sscc(1), Sscc(2)));
}

TEST_F(LayoutDespatchTest, AFolderWithoutItsSeparatorIsRefused) {
  carrier->fields["FileFolder"] = temp.path();
  clsIpecDA1250 cls;
  Process(cls, ConNote("IPE00012346"));
  EXPECT_EQ(host.LogMessages().back(), "Invalid folder " + temp.path());
  EXPECT_TRUE(Files().empty());
}

// A process killed at any moment while it adds consignments leaves whole
// consignments before the trailer, and the next call completes or drops
// what the kill interrupted before it adds its own.
TEST_F(LayoutDespatchTest, Ipec1250KilledAtAnyMomentKeepsWholeConsignmentsAndItsTrailer) {
  clsIpecDA1250 cls;
  test::KillLoop loop;
  loop.write = [&](int n) {
    const std::size_t asked = answers->messages.size();
    const LogList log = Process(cls, ConNote("I" + std::to_string(n)));
    return answers->messages.size() == asked && test::Logged(host, log, "compile completed.");
  };
  loop.read = [&] {
    const std::vector<std::string> lines = Lines("T1250_IPE__20240314093000.DAT");
    std::vector<int> numbers;
    EXPECT_GE(lines.size(), 2u);
    if (lines.size() < 2) return numbers;
    EXPECT_EQ(lines[lines.size() - 2], "20240314");
    EXPECT_EQ(lines.back(), "%%EOF");
    EXPECT_EQ((lines.size() - 2) % 3, 0u);
    for (std::size_t i = 0; i + 2 < lines.size() - 2; i += 3) {
      const std::string no = lines[i].substr(19, 12);
      EXPECT_EQ(lines[i].substr(0, 9), "40240314C") << "line " << i;
      EXPECT_EQ(lines[i].size(), 460u) << "line " << i;
      EXPECT_EQ(lines[i + 1], "40240314I" + no + "0001" + Sscc(1) + "0006.3") << "line " << i + 1;
      EXPECT_EQ(lines[i + 2], "40240314I" + no + "0002" + Sscc(2) + "0006.3") << "line " << i + 2;
      numbers.push_back(std::stoi(no.substr(1)));
    }
    return numbers;
  };
  test::RunKillLoop(loop);
}

}  // namespace
}  // namespace quendal
