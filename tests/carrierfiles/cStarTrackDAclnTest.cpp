#include "carrierfiles/cStarTrackDAcln.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
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
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using test::Pad;
using test::Sp;

constexpr std::string_view kNo = "SRXZ00012345";
const std::string kNo20 = Pad(kNo, 20);

// The records of the standard consignment, built from named pieces.
std::string Header(std::string_view name, std::string_view stamp = "20240314083000") {
  return "00N" + Pad(name, 12) + std::string(stamp) + "G" + Sp(20) + std::string(stamp) + "Y" +
         Sp(71) + "\r\n";
}
std::string Consignment(std::string_view no = kNo, std::string_view packs = "   3",
                        std::string_view weight = "   12", std::string_view cubic = "   35",
                        std::string_view unit = "CTN") {
  return "10" + Pad(no, 20) + Sp(8) + Pad("Myer Chadstone", 40) + Sp(40) +
         Pad("1341 Dandenong Road", 40) + Pad("Loading Dock 3", 40) + Pad("CHADSTONE", 30) + "3" +
         "3148" + Sp(17) + "N" + "10293847" + "S" + std::string(packs) + "EXP" +
         std::string(weight) + std::string(cubic) + Sp(4) + "N" + Sp(4) + std::string(unit) +
         "\r\n";
}
std::string Window(std::string_view no = kNo) {
  return "13" + Pad(no, 20) + "Not Before: " + "15-Mar-2024  " + "Not After: " + "18-Mar-2024   " +
         "Leave at the loading dock" + "202403150700" + "202403181730" + "\r\n";
}
std::string References(std::string_view no = kNo) {
  return "15" + Pad(no, 20) + "S" + Pad("ASN-000501", 20) + "Senders Reference             Y\r\n" +
         "15" + Pad(no, 20) + "F" + Pad("ASN-000501", 20) + "Advance Ship Notice Number    Y\r\n" +
         "15" + Pad(no, 20) + "B" + Pad("DSP778812", 20) + "Customer Order Number         Y\r\n";
}
std::string Item(std::string_view sscc, std::string_view tail = "S CTN", std::string_view no = kNo) {
  return "20" + Pad(no, 20) + std::string(sscc) + std::string(tail) + "\r\n";
}
std::string Atl(int counter) {
  char value[16];
  std::snprintf(value, sizeof value, "C%09d", counter);
  return "15" + kNo20 + "E" + Pad(value, 20) + "ATL                           N\r\n";
}

const char* const kSscc[] = {"00093123450000000012", "00093123450000000029", "00093123450000000036",
                             "00093123450000000043", "00093123450000000050"};

class StarTrackDAclnTest : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 9, 0, 0));
    fs::create_directories(root / "carrier");
    fs::create_directories(root / "spool" / "Office Laser");
    folder = (root / "carrier").string() + "/";
    previousSpooler = SetSpooler(std::make_shared<DirectorySpooler>((root / "spool").string()));
    host.system->fields["DocumentPrinter"] = "Office Laser";

    carrier = host.Make<host::Carrier>({{"Name", "StarTrack Express"},
                                        {"FileFolder", folder},
                                        {"AccountRef", "SRX"},
                                        {"AccountNumber", "10293847"},
                                        {"Options", ""}});
    receiver = host.Make<host::Receiver>({{"Name", "Harbour Retail DC"},
                                          {"AddressLine1", "12 Wharf Road"},
                                          {"AddressLine2", "Gate 4"},
                                          {"Suburb", "PORT MELBOURNE"},
                                          {"State", "VIC"},
                                          {"Postcode", "3207"}});
    address = host.Make<host::Address>({{"Name", "Myer Chadstone"},
                                        {"Line1", "1341 Dandenong Road"},
                                        {"Line2", "Loading Dock 3"},
                                        {"Suburb", "CHADSTONE"},
                                        {"State", "VIC"},
                                        {"Postcode", "3148"}});
    order = host.Make<host::Order>({{"OrderNo", "PO-88120"}, {"DeliveryAddress", address}});
    despatch = host.Make<host::Despatch>(
        {{"DespatchNo", "DSP778812"},
         {"NotBefore", DateTime::FromParts(2024, 3, 15, 7, 0, 0)},
         {"NotAfter", DateTime::FromParts(2024, 3, 18, 17, 30, 0)}});
    vendor = host.Make<host::Vendor>({{"Name", "Alpine Cosmetics"}, {"State", "VIC"}});
    asn = host.Make<host::ASN>({{"ID", 501}, {"ASNNo", "ASN-000501"}, {"ASNNumber", 4500501}});
  }
  void TearDown() override {
    SetSpooler(previousSpooler);
    SetNow(std::nullopt);
  }

  std::shared_ptr<MemoryObject<host::Pack>> Pack(std::string_view sscc,
                                                  std::string_view cartonCode = "CTN01") {
    auto carton = host.Make<host::Carton>({{"Code", cartonCode}, {"Weight", 0.4}});
    return host.Make<host::Pack>({{"SSCC", sscc},
                                  {"ASNId", 501},
                                  {"PackType", "CARTON"},
                                  {"Carton", carton},
                                  {"Order", order},
                                  {"Despatch", despatch}});
  }

  // A consignment of `count` cartons.
  std::shared_ptr<MemoryObject<host::ConNote>> ConNote(
      std::string_view no, int count, DateTime date = DateTime::FromParts(2024, 3, 14, 8, 30, 0)) {
    auto conNote = host.Make<host::ConNote>(
        {{"ConNoteNo", no},
         {"ConNoteDate", date},
         {"Service", ""},
         {"Weight", 12.5},
         {"Volume", 0.035},
         {"DeliveryInstructions", "Leave at the loading dock behind the store"},
         {"Carrier", carrier},
         {"Receiver", receiver},
         {"Vendor", vendor}});
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> packs;
    for (int i = 0; i < count; ++i) packs.push_back(Pack(kSscc[i]));
    MemoryHost::Attach(conNote, packs);
    return conNote;
  }

  static Ref<host::PackList> PacksOf(const std::shared_ptr<MemoryObject<host::ConNote>>& c) {
    return host::Object::As<host::PackList>(c->fields["Packs"]);
  }

  LogList Process(const std::shared_ptr<MemoryObject<host::ConNote>>& conNote,
                  LogList log = {}) {
    cls.Process(host.system, conNote, asn, PacksOf(conNote), log);
    return log;
  }

  std::string File(const std::string& name) const { return ReadFile(folder + name).value_or("<none>"); }

  MemoryHost host;
  test::TempFolder temp;
  fs::path root{temp.path()};
  std::string folder;
  std::shared_ptr<Spooler> previousSpooler;
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Receiver>> receiver;
  std::shared_ptr<MemoryObject<host::Address>> address;
  std::shared_ptr<MemoryObject<host::Order>> order;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::ASN>> asn;
  clsStarTrackDAcln cls;
};

TEST_F(StarTrackDAclnTest, FirstConsignmentOfTheDayStartsTheFileWithItsHeader) {
  const LogList log = Process(ConNote(kNo, 3));

  EXPECT_EQ(File("SRX00501.CLN"), Header("SRX00501.CLN") + Consignment() + Window() +
                                      References() + Item(kSscc[0]) + Item(kSscc[1]) +
                                      Item(kSscc[2]));
  const std::string path = folder + "SRX00501.CLN";
  EXPECT_THAT(host.LogMessages(),
              ElementsAre("ConNote SRXZ00012345. ActiveX called Quendal.clsStarTrackDAcln",
                          "ConNote SRXZ00012345. Target file selected " + path,
                          "ConNote SRXZ00012345 compile Started.",
                          "SSCC 00093123450000000012 added to CLN for ConNote SRXZ00012345",
                          "SSCC 00093123450000000029 added to CLN for ConNote SRXZ00012345",
                          "SSCC 00093123450000000036 added to CLN for ConNote SRXZ00012345",
                          "ConNote SRXZ00012345 compile completed."));
  EXPECT_THAT(log, ElementsAre(1, 2, 3, 4, 5, 6, 7));
  EXPECT_EQ(host.logs[0].at("Source").Text(), "Quendal.clsStarTrackDAcln");
  EXPECT_EQ(host.logs[0].at("Procedure").Text(), "Process");
  EXPECT_EQ(cls.Log()->ID().Whole(), 7);
}

TEST_F(StarTrackDAclnTest, SecondConsignmentIsAppendedAndARepeatedNumberIsRefused) {
  Process(ConNote(kNo, 1));
  Process(ConNote("SRXZ00012346", 2));
  const std::string day = Header("SRX00501.CLN") + Consignment(kNo, "   1") + Window() +
                          References() + Item(kSscc[0]) + Consignment("SRXZ00012346", "   2") +
                          Window("SRXZ00012346") + References("SRXZ00012346") +
                          Item(kSscc[0], "S CTN", "SRXZ00012346") +
                          Item(kSscc[1], "S CTN", "SRXZ00012346");
  EXPECT_EQ(File("SRX00501.CLN"), day);

  // The entries the caller's list held stay; the call's own follow them.
  const std::size_t before = host.logs.size();
  const LogList log = Process(ConNote(kNo, 2), {41, 42});
  EXPECT_EQ(File("SRX00501.CLN"), day);
  EXPECT_EQ(host.LogMessages().back(), "Cannot process, connoteno already exists SRXZ00012345");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Open carrier message file");
  const auto id = [&](std::size_t i) { return static_cast<std::int32_t>(before + i); };
  EXPECT_THAT(log, ElementsAre(41, 42, id(1), id(2), id(3)));
}

// A reference is never cut to fit, and a longer one would shift every
// field after it: the consignment is refused whole.
TEST_F(StarTrackDAclnTest, AValueLongerThanItsFieldRefusesTheConsignment) {
  Process(ConNote(kNo, 1));
  const std::string day = File("SRX00501.CLN");
  const std::string no = "SRXZ" + std::string(10000, '7');
  Process(ConNote(no, 1));
  EXPECT_EQ(File("SRX00501.CLN"), day);
  EXPECT_EQ(host.LogMessages().back(), "ConNote " + no.substr(0, 40) +
                                           " not added: a value of 10004 characters (\"SRXZ" +
                                           std::string(16, '7') + "...\") is longer than its field of 20");
  EXPECT_EQ(host.logs.back().at("Procedure").Text(), "Open carrier message file");
}

TEST_F(StarTrackDAclnTest, AConsignmentAnotherWriterAddedIsStillRefused) {
  Process(ConNote(kNo, 1));
  // Another program adds a consignment to the same day's file.
  ASSERT_TRUE(AppendFile(folder + "SRX00501.CLN", Consignment("SRXZ00099999", "   1")));
  const std::string day = File("SRX00501.CLN");
  Process(ConNote("SRXZ00099999", 1));
  EXPECT_EQ(File("SRX00501.CLN"), day);
  EXPECT_EQ(host.LogMessages().back(), "Cannot process, connoteno already exists SRXZ00099999");
}

TEST_F(StarTrackDAclnTest, AFutureConsignmentGoesToTheFolderOfItsDay) {
  const DateTime tomorrow = DateTime::FromParts(2024, 3, 15, 6, 0, 0);
  Process(ConNote(kNo, 1, tomorrow));
  Process(ConNote("SRXZ00012346", 1, tomorrow));
  ASSERT_TRUE(FolderExists(folder + "2024-03-15"));
  EXPECT_EQ(ReadFile(folder + "2024-03-15/SRX00501.CLN").value_or(""),
            Header("SRX00501.CLN", "20240315060000") + Consignment(kNo, "   1") + Window() +
                References() + Item(kSscc[0]) + Consignment("SRXZ00012346", "   1") +
                Window("SRXZ00012346") + References("SRXZ00012346") +
                Item(kSscc[0], "S CTN", "SRXZ00012346"));
  EXPECT_FALSE(FileExists(folder + "SRX00501.CLN"));
  // A consignment of today, once that day's folder exists, goes there as well.
  ASSERT_TRUE(CreateFolder(folder + "2024-03-14"));
  Process(ConNote("SRXZ00012347", 1));
  EXPECT_TRUE(FileExists(folder + "2024-03-14/SRX00501.CLN"));
}

TEST_F(StarTrackDAclnTest, TodaysFileIsFoundByItsCreationDate) {
  // Creation dates come from the file system, so the clock runs on real time here.
  SetNow(std::nullopt);
  const DateTime today = Now();
  Process(ConNote(kNo, 1, today));
  asn->fields["ASNNumber"] = 4500777;
  Process(ConNote("SRXZ00012346", 1, today));
  EXPECT_FALSE(FileExists(folder + "SRX00777.CLN"));
  EXPECT_THAT(File("SRX00501.CLN"), HasSubstr(Item(kSscc[0], "S CTN", "SRXZ00012346")));

  // The next day the file created today is no longer the day's file.
  SetNow(today.AddDays(1));
  Process(ConNote("SRXZ00012347", 1, today.AddDays(1)));
  EXPECT_THAT(File("SRX00777.CLN"), ::testing::StartsWith("00NSRX00777.CLN"));
}

TEST_F(StarTrackDAclnTest, WeightAndCubicRules) {
  auto field = [&](std::string_view no, Var weight, Var volume, std::size_t pos) {
    auto c = ConNote(no, 1);
    c->fields["Weight"] = weight;
    c->fields["Volume"] = volume;
    Process(c);
    const std::string file = File("SRX00501.CLN");
    const std::size_t at = file.find("10" + Pad(no, 20));
    return at == std::string::npos ? std::string("<missing>") : file.substr(at + pos - 1, 5);
  };
  EXPECT_EQ(field("W1", 0.4, 0.035, 260), "    1");
  EXPECT_EQ(field("W2", Var(), 0.035, 260), "     ");
  EXPECT_EQ(field("W3", 2.5, 0.035, 260), "    2");  // halves go to even
  EXPECT_EQ(field("W4", "heavy", 0.035, 260), "     ");
  EXPECT_EQ(field("C1", 12.5, 150, 265), "99999");
  EXPECT_EQ(field("C2", 12.5, Var(), 265), "    0");
  EXPECT_EQ(field("C3", 12.5, 0.0625, 265), "   62");  // 62.5 litres
}

TEST_F(StarTrackDAclnTest, ReceiverBlockSources) {
  // A state outside the table is a space; postcode and state follow the delivery address.
  address->fields["State"] = "NZ";
  Process(ConNote("R1", 1));
  std::string file = File("SRX00501.CLN");
  std::size_t at = file.find("10" + Pad("R1", 20));
  EXPECT_EQ(file.substr(at + 220, 5), " 3148");

  // A delivery address with a name but no first line moves its second line up.
  address->fields["Line1"] = Var();
  Process(ConNote("R2", 1));
  file = File("SRX00501.CLN");
  at = file.find("10" + Pad("R2", 20));
  EXPECT_EQ(file.substr(at + 110, 80), Pad("Loading Dock 3", 80));

  // Without a delivery name the consignment's receiver is used: its name
  // and a space, within the 40 characters of the field.
  address->fields["Name"] = Var();
  address->fields["State"] = Var();
  receiver->fields["Name"] = std::string(45, 'N');
  Process(ConNote("R3", 1));
  file = File("SRX00501.CLN");
  at = file.find("10" + Pad("R3", 20));
  EXPECT_EQ(file.substr(at, 281 + 2).substr(30, 195),
            std::string(40, 'N') + Sp(40) + Pad("12 Wharf Road", 40) + Pad("Gate 4", 40) +
                Pad("PORT MELBOURNE", 30) + "3" + "3207");
  EXPECT_EQ(file.substr(at + 281, 2), "\r\n");

  // With delivery texts and no delivery name, the receiver's first line
  // stands before its name and again as the first address line.
  receiver->fields["Name"] = "Harbour Retail DC";
  despatch->fields["DeliveryText2"] = " Ring bell ";
  Process(ConNote("R4", 1));
  file = File("SRX00501.CLN");
  at = file.find("10" + Pad("R4", 20));
  EXPECT_EQ(file.substr(at + 30, 195), Pad("12 Wharf Road Harbour Retail DC", 40) + Sp(40) +
                                           Pad("12 Wharf Road", 40) + Pad("Gate 4", 40) +
                                           Pad("PORT MELBOURNE", 30) + "3" + "3207");
}

TEST_F(StarTrackDAclnTest, NameFieldHoldsFortyCharactersWhateverItsSource) {
  // Each source of the name with 45 characters: the delivery address, the
  // receiver, and the receiver's first line before its name.
  const std::string long45 = std::string(40, 'L') + "TAILS";
  auto recordOf = [&](std::string_view no) {
    const std::string file = File("SRX00501.CLN");
    const std::size_t at = file.find("10" + Pad(no, 20));
    return file.substr(at, file.find("\r\n", at) - at);
  };
  address->fields["Name"] = long45;
  Process(ConNote("N1", 1));
  address->fields["Name"] = Var();
  address->fields["State"] = Var();
  receiver->fields["Name"] = long45;
  Process(ConNote("N2", 1));
  despatch->fields["DeliveryText1"] = "Ring bell";
  Process(ConNote("N3", 1));
  for (const char* no : {"N1", "N2", "N3"}) {
    const std::string record = recordOf(no);
    EXPECT_EQ(record.size(), 281u) << no;
    EXPECT_EQ(record.substr(278), "CTN") << no;
  }
  EXPECT_EQ(recordOf("N1").substr(30, 40), std::string(40, 'L'));
  EXPECT_EQ(recordOf("N3").substr(30, 41), Pad("12 Wharf Road " + std::string(26, 'L'), 40) + " ");
}

TEST_F(StarTrackDAclnTest, APackWithoutANoticeIsStillAnItem) {
  auto c = ConNote(kNo, 2);
  std::dynamic_pointer_cast<MemoryObject<host::Pack>>(PacksOf(c)->Item(2).ptr())->fields["ASNId"] = Var();
  Process(c);
  EXPECT_EQ(File("SRX00501.CLN"), Header("SRX00501.CLN") + Consignment(kNo, "   2") + Window() +
                                      References() + Item(kSscc[0]) + Item(kSscc[1]));
  EXPECT_THAT(host.LogMessages(), ::testing::Contains("SSCC " + std::string(kSscc[1]) +
                                                      " added to CLN for ConNote " + std::string(kNo)));
}

TEST_F(StarTrackDAclnTest, ItemTailsForPalletsAndCartons) {
  auto mixed = ConNote(kNo, 5);
  auto packs = PacksOf(mixed);
  for (int i : {1, 4}) {
    auto pack = std::dynamic_pointer_cast<MemoryObject<host::Pack>>(packs->Item(i).ptr());
    pack->fields["Carton"] = host.Make<host::Carton>({{"Code", "PLT01"}});
  }
  Process(mixed);
  std::string file = File("SRX00501.CLN");
  for (const char* sscc : kSscc) EXPECT_THAT(file, HasSubstr(Item(sscc, "S ")));

  // Only pallets: "B PAL"; satchels name their unit.
  auto pallets = ConNote("SRXZ00012346", 2);
  for (int i : {1, 2}) {
    auto pack =
        std::dynamic_pointer_cast<MemoryObject<host::Pack>>(PacksOf(pallets)->Item(i).ptr());
    pack->fields["Carton"] = host.Make<host::Carton>({{"Code", "PLT01"}});
  }
  Process(pallets);
  file = File("SRX00501.CLN");
  EXPECT_THAT(file, HasSubstr(Item(kSscc[0], "B PAL", "SRXZ00012346")));
  EXPECT_THAT(file, HasSubstr(Item(kSscc[1], "B PAL", "SRXZ00012346")));

  auto satchel = ConNote("SRXZ00012347", 1);
  std::dynamic_pointer_cast<MemoryObject<host::Pack>>(PacksOf(satchel)->Item(1).ptr())
      ->fields["PackType"] = "Small Satchel";
  Process(satchel);
  file = File("SRX00501.CLN");
  EXPECT_THAT(file, HasSubstr(Item(kSscc[0], "S SAT", "SRXZ00012347")));
  EXPECT_THAT(file, HasSubstr(Consignment("SRXZ00012347", "   1", "   12", "   35", "SAT")));
}

TEST_F(StarTrackDAclnTest, AuthorityToLeaveBeforeEachItemAndPacksOfAnotherNotice) {
  carrier->fields["Options"] = "#SIG#%ATL";
  auto c = ConNote(kNo, 3);
  std::dynamic_pointer_cast<MemoryObject<host::Pack>>(PacksOf(c)->Item(2).ptr())->fields["ASNId"] = 777;
  Process(c);
  EXPECT_EQ(File("SRX00501.CLN"), Header("SRX00501.CLN") + Consignment() + Window() +
                                      References() + Atl(1) + Item(kSscc[0]) + Atl(2) + Atl(3) +
                                      Item(kSscc[2]));
  const auto messages = host.LogMessages();
  EXPECT_EQ(std::count_if(messages.begin(), messages.end(),
                          [](const std::string& m) { return m.starts_with("SSCC "); }),
            2);
}

TEST_F(StarTrackDAclnTest, DangerousGoodsRecordAndTwoDeclarations) {
  auto aerosol = host.Make<host::Product>({{"IsDangerous", true}, {"DGClass", "2.1"}, {"UnitWeight", 0.75}});
  auto perfume = host.Make<host::Product>({{"IsDangerous", "True"}, {"DGClass", "3.1"}, {"UnitWeight", 0.5}});
  auto soap = host.Make<host::Product>({{"IsDangerous", false}, {"DGClass", Var()}, {"UnitWeight", 2}});
  auto c = ConNote(kNo, 3);
  auto packs = PacksOf(c);
  auto line = [&](auto product, int qty) {
    return host.Make<host::PackLine>({{"Product", product}, {"Qty", qty}});
  };
  auto set = [&](int i, std::vector<std::shared_ptr<host::PackLine>> lines) {
    std::dynamic_pointer_cast<MemoryObject<host::Pack>>(packs->Item(i).ptr())->fields["Lines"] =
        Var(MemoryHost::List(lines));
  };
  set(1, {line(aerosol, 4), line(soap, 3)});
  set(2, {line(soap, 1)});
  set(3, {line(aerosol, 2), line(perfume, 6)});
  Process(c);

  // Class of the last dangerous line, cartons holding dangerous lines, their net weight.
  const std::string dg = "19" + kNo20 + Sp(15) + Pad("3.1", 7) + Pad("FLAMMABLE LIQUID", 35) +
                         Sp(35) + "CARTON" + Sp(21) + "0002" + "00008" + "\r\n";
  EXPECT_EQ(File("SRX00501.CLN"), Header("SRX00501.CLN") + Consignment() + Window() +
                                      References() + dg + Item(kSscc[0]) + Item(kSscc[1]) +
                                      Item(kSscc[2]));
  // Two copies, each a document per pack and class: pack 1 (2.1), pack 3 (2.1 and 3.1).
  std::size_t jobs = 0;
  for (const auto& entry : fs::directory_iterator(root / "spool" / "Office Laser"))
    jobs += entry.path().extension() == ".pdf";
  EXPECT_EQ(jobs, 6u);

  // An unknown document printer: the file is complete, each copy's failure is logged.
  host.system->fields["DocumentPrinter"] = "Nowhere";
  Process(ConNote("SRXZ00012346", 1));  // no dangerous goods: nothing printed, nothing logged
  auto again = ConNote("SRXZ00012347", 1);
  std::dynamic_pointer_cast<MemoryObject<host::Pack>>(PacksOf(again)->Item(1).ptr())
      ->fields["Lines"] = Var(MemoryHost::List<host::PackLine>({line(perfume, 1)}));
  Process(again);
  const auto messages = host.LogMessages();
  EXPECT_EQ(std::count(messages.begin(), messages.end(),
                       "Error printing dangerous goods declaration, sales order SRXZ00012347"),
            2);
  EXPECT_EQ(messages.back(), "ConNote SRXZ00012347 compile completed.");
  EXPECT_THAT(File("SRX00501.CLN"), HasSubstr(Item(kSscc[0], "S CTN", "SRXZ00012347")));
  EXPECT_FALSE(cls.DGDeclaration());
}

TEST_F(StarTrackDAclnTest, InvalidFolderWritesNothing) {
  const fs::path missing = root / "missing";
  carrier->fields["FileFolder"] = missing.string() + "/";
  LogList log = Process(ConNote(kNo, 1), {9});
  carrier->fields["FileFolder"] = (root / "carrier").string();  // exists, but no separator at the end
  log = Process(ConNote(kNo, 1), log);
  EXPECT_THAT(host.LogMessages(),
              ElementsAre(HasSubstr("ActiveX called"), "Invalid folder " + missing.string() + "/",
                          HasSubstr("ActiveX called"), "Invalid folder " + (root / "carrier").string()));
  EXPECT_EQ(host.logs[1].at("Procedure").Text(), "Open carrier message file");
  EXPECT_THAT(log, ElementsAre(9, 1, 2, 3, 4));
  EXPECT_TRUE(fs::is_empty(root / "carrier"));
  EXPECT_FALSE(fs::exists(missing));
}

TEST_F(StarTrackDAclnTest, AFileThatCannotBeOpenedIsLogged) {
  fs::create_directories(root / "carrier" / "SRX00501.CLN");  // a folder where the file would go
  Process(ConNote(kNo, 1));
  EXPECT_EQ(host.LogMessages().back(), "Cannot open file " + folder);
  EXPECT_EQ(host.logs.back().at("Level").Whole(), err::kPathFileAccess);
}

TEST_F(StarTrackDAclnTest, NamesFromHostTextsStayInsideTheFolder) {
  carrier->fields["AccountRef"] = "../";
  Process(ConNote(kNo, 1));
  carrier->fields["AccountRef"] = "S";
  asn->fields["ASNNumber"] = "/../../x";
  Process(ConNote("SRXZ00012346", 1));
  std::vector<std::string> names;
  for (const auto& entry : fs::directory_iterator(root / "carrier"))
    names.push_back(entry.path().filename().string());
  std::sort(names.begin(), names.end());
  EXPECT_THAT(names, ElementsAre("S_______x.CLN", "___00501.CLN"));
  EXPECT_FALSE(fs::exists(root / "00501.CLN"));
  EXPECT_FALSE(fs::exists(root / "x.CLN"));

  // A host text that ends in a dot never reaches into the extension.
  fs::remove_all(root / "carrier");
  fs::create_directories(root / "carrier");
  carrier->fields["AccountRef"] = "A.";
  asn->fields["ASNNumber"] = "";
  Process(ConNote("SRXZ00012347", 1));
  EXPECT_TRUE(fs::exists(root / "carrier" / "A..CLN"));
}

TEST_F(StarTrackDAclnTest, NullHostDataDoesNotStopTheFile) {
  // A consignment whose every value is missing still gets its records, each
  // of its full width: missing dates and the SSCC are spaces.
  auto bare = host.Make<host::ConNote>({{"Carrier", carrier}});
  auto pack = host.Make<host::Pack>();
  MemoryHost::Attach(bare, {pack});
  auto emptyAsn = host.Make<host::ASN>();
  LogList log;
  cls.Process(host.system, bare, emptyAsn, PacksOf(bare), log);
  const std::string name = "SRX.CLN";
  const std::string blank20 = Sp(20);
  EXPECT_EQ(File("SRX.CLN"),
            "00N" + Pad(name, 12) + Sp(14) + "G" + Sp(20) + Sp(14) + "Y" + Sp(71) + "\r\n" + "10" + blank20 + Sp(8) +
                Sp(40) + Sp(40) + Sp(40) + Sp(40) + Sp(30) + " " + Sp(4) + Sp(17) + "N" +
                "10293847" + "S" + "   1" + "EXP" + Sp(5) + "    0" + Sp(4) + "N" + Sp(4) +
                "CTN\r\n" + "13" + blank20 + "Not Before: " + Sp(13) + "Not After: " + Sp(14) + Sp(25) + Sp(24) + "\r\n" +
                "15" + blank20 + "S" + blank20 + "Senders Reference             Y\r\n" + "15" +
                blank20 + "F" + blank20 + "Advance Ship Notice Number    Y\r\n" + "15" + blank20 +
                "B" + blank20 + "Customer Order Number         Y\r\n" + "20" + blank20 +
                blank20 + "S CTN\r\n");
  EXPECT_EQ(host.LogMessages().back(), "ConNote  compile completed.");

  // Nothing at all: no carrier, no packs, no notice.
  auto nothing = host.Make<host::ConNote>();
  cls.Process(host.system, nothing, nullptr, nullptr, log);
  EXPECT_EQ(host.LogMessages().back(), "Invalid folder ");
}

TEST_F(StarTrackDAclnTest, LineBreaksInHostTextsDoNotSplitRecords) {
  auto c = ConNote(kNo, 1);
  c->fields["DeliveryInstructions"] = "Rear\r\ndock";
  Process(c);
  EXPECT_THAT(File("SRX00501.CLN"), HasSubstr("Rear  dock" + Sp(15) + "202403150700"));
}

// A process killed at any moment while it adds consignments leaves the
// header and whole consignments only, and the next call adds to that file.
TEST_F(StarTrackDAclnTest, KilledAtAnyMomentTheFileHoldsOnlyWholeConsignments) {
  test::ScriptedPrompt answers;
  test::PromptScope prompt{std::shared_ptr<ErrorPrompt>(&answers, [](ErrorPrompt*) {})};
  test::KillLoop loop;
  loop.write = [&](int n) {
    const std::size_t asked = answers.messages.size();
    const LogList log = Process(ConNote("K" + std::to_string(n), 2));
    return answers.messages.size() == asked && test::Logged(host, log, "compile completed.");
  };
  loop.read = [&] {
    const std::vector<std::string> lines = test::CrLfLines(File("SRX00501.CLN"));
    std::vector<int> numbers;
    EXPECT_FALSE(lines.empty());
    if (lines.empty()) return numbers;
    EXPECT_EQ(lines[0] + "\r\n", Header("SRX00501.CLN"));
    // Each consignment: "10", "13", three "15" and an item "20" per pack.
    for (const std::string& first : test::ClnConsignments(lines, "10 13 15 15 15 20 20 ")) {
      EXPECT_EQ(first.size(), Consignment().size() - 2) << first;
      numbers.push_back(std::stoi(first.substr(3, 19)));
    }
    return numbers;
  };
  test::RunKillLoop(loop);
}

}  // namespace
}  // namespace quendal
