#include "labels/cStarTrackGenericSCM.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <map>
#include <regex>

#include "frame/VB.h"
#include "platform/Clock.h"
#include "platform/Machine.h"
#include "platform/MemorySpooler.h"
#include "platform/Settings.h"
#include "tests/support/MemoryHost.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::MemoryHost;
using test::MemoryObject;

constexpr const char* kDocument = "Quendal.clsStarTrackGenericSCM";

// The "Generic" format as the printer stores it.
const std::string kGenericFormat =
    "{F,430,A,R,E,600,400,\"Generic\"|"
    "L,S,547,2,547,390,6,\"11111111\"|"
    "C,533,5,0,1,1,1,O,L,0,0,\"FROM:\"|"
    "T,1,50,V,532,48,0,1,1,1,O,L,0,0,0|"
    "T,10,50,V,520,5,0,1,1,1,O,L,0,0,0|"
    "T,2,50,V,508,5,0,1,1,1,O,L,0,0,0|"
    "T,3,50,V,508,130,0,1,1,1,O,L,0,0,0|"
    "C,528,250,0,1,1,1,O,L,0,0,\"CARRIER:\"|"
    "T,4,50,V,512,250,0,1,1,1,O,L,0,0,0|"
    "C,493,250,0,1,1,1,O,L,0,0,\"CONNOTE:\"|"
    "T,5,50,V,469,250,0,1,2,1,O,L,0,0,0|"
    "C,483,5,0,1,2,1,O,L,0,0,\"TO:\"|"
    "T,6,50,V,458,5,0,1,2,1,O,L,0,0,0|"
    "T,11,50,V,438,5,0,1,2,1,O,L,0,0,0|"
    "T,7,50,V,418,5,0,1,2,1,O,L,0,0,0|"
    "T,8,50,V,398,5,0,1,2,1,O,L,0,0,0|"
    "T,9,50,V,476,55,0,1,3,1,O,L,0,0,0|"
    "B,15,27,V,262,40,8,4,60,8,L,0|"
    "T,16,50,V,247,50,0,1,1,1,B,L,0,0,0|"
    "B,17,27,V,182,40,8,4,60,8,L,0|"
    "T,18,50,V,167,50,0,1,1,1,B,L,0,0,0|"
    "T,19,50,V,336,180,0,1,2,1,B,L,0,0,0|"
    "T,20,25,V,380,160,0,1,2,1,B,R,0,0,0|"
    "T,21,25,V,360,160,0,1,2,1,B,R,0,0,0|"
    "B,24,21,V,25,40,8,4,135,8,L,0|"
    "T,25,50,V,10,50,0,1,1,1,B,L,0,0,0|"
    "T,26,50,V,353,20,0,1,2,1,B,L,0,0,0|"
    "T,27,50,V,333,20,0,1,2,1,B,L,0,0,0|"
    "T,28,50,V,577,5,0,3,1,1,B,L,0,0,0|"
    "T,29,50,V,577,270,0,3,1,1,B,L,0,0,0|"
    "T,30,50,V,557,230,0,3,1,1,B,L,0,0,0|"
    "T,31,50,V,370,5,0,1,1,1,B,L,0,0,0|"
    "T,32,50,V,355,5,0,1,1,1,B,L,0,0,0|"
    "T,33,50,V,340,5,0,1,1,1,B,L,0,0,0|"
    "T,34,50,V,557,5,0,3,1,1,B,L,0,0,0|}";

// The ordinary carton of the fixture: store 0412 looked up through the
// receiver, no delivery name on the order.
const std::string kHeader = "{B,430,N,1|E,1,0,1,1,0,1|";
const std::string kSender =
    "1,\"Merivane Outdoor Supplies\"|2,\"Dandenong South\"|3,\"VIC\"|4,\"StarTrack Express\"|";
const std::string kConNote = "5,\"STK0001234567\"|";
const std::string kReceiver =
    "6,\"REBEL SPORT CHADSTONE\"|7,\"1341 DANDENONG ROAD\"|8,\"CHADSTONE VIC 3148\"|9,\"\"|"
    "10,\"12 Foundry Road\"|11,\"SHOP 1040 CHADSTONE CENTRE\"|";
const std::string kMiddle =
    "17,\"~2014210363148\"|18,\"(421)0363148\"|19,\"(00)093123450000000012\"|"
    "20,\"PO 4500012345\"|21,\"SO 778123\"|"
    "24,\"~20100093123450000000012\"|25,\"(00)093123450000000012\"|26,\"\"|27,\"\"|"
    "28,\"CHADSTONE\"|";
const std::string kService = "29,\"3148 EXP\"|30,\"SERVICE:ROAD EXPRESS\"|";
const std::string kDates =
    "31,\"Date Packed 01/03/24\"|32,\"Not Before  04/03/24\"|33,\"Not After   08/03/24\"|";
const std::string kCn = "34,\"C/N:STK0001234567\"|}";
const std::string kOrdinary = kHeader + kSender + kConNote + kReceiver + kMiddle + kService + kDates + kCn;

// The batch with some fields' data replaced.
std::string WithFields(std::string batch, const std::map<int, std::string>& fields) {
  for (const auto& [number, data] : fields) {
    const std::regex field("\\|" + std::to_string(number) + ",\"[^\"]*\"\\|");
    batch = std::regex_replace(batch, field, "|" + std::to_string(number) + ",\"" + data + "\"|");
  }
  return batch;
}

class StarTrackGenericTest : public ::testing::Test {
 protected:
  void SetUp() override {
    config = fs::temp_directory_path() / ("quendal-labels-" + std::to_string(::getpid()));
    fs::remove_all(config);
    fs::create_directories(config);
    const char* xdg = std::getenv("XDG_CONFIG_HOME");
    savedXdg = xdg ? std::optional<std::string>(xdg) : std::nullopt;
    ::setenv("XDG_CONFIG_HOME", config.c_str(), 1);
    SetNow(DateTime::FromParts(2024, 3, 1, 9, 30));
    spooler->AddPrinter("Dock 3");
    previousSpooler = SetSpooler(spooler);

    vendor = host.Make<host::Vendor>({{"Name", "Merivane Outdoor Supplies Pty Ltd"},
                                      {"AddressLine2", "12 Foundry Road"},
                                      {"AddressLine3", "Dandenong South"},
                                      {"State", "VIC"}});
    carrier = host.Make<host::Carrier>({{"Name", "StarTrack Express"}, {"Options", "#%POD"}});
    receiver = host.Make<host::Receiver>({{"StoreCode", "0412"}, {"CarrierId", 7}});
    host.Make<host::Receiver>({{"Code", "0412"},
                               {"PartnerId", 3},
                               {"Name", "  Rebel Sport Chadstone "},
                               {"AddressLine1", " Shop 1040 Chadstone Centre"},
                               {"AddressLine2", "1341 Dandenong Road"},
                               {"Suburb", "Chadstone"},
                               {"State", "vic"},
                               {"Postcode", "3148"}});
    delivery = host.Make<host::Address>({{"Name", ""}});
    order = host.Make<host::Order>({{"OrderNo", "PO-1"}, {"DeliveryAddress", delivery}});
    despatch = host.Make<host::Despatch>({{"DespatchNo", "4500012345"},
                                          {"NotBefore", DateTime::FromParts(2024, 3, 4)},
                                          {"NotAfter", DateTime::FromParts(2024, 3, 8)}});
    carton = host.Make<host::Carton>({{"Code", "CTN"}});
    shipTo = host.Make<host::Receiver>({{"CountryCode", "036"}});
    conNote = host.Make<host::ConNote>({{"ConNoteNo", "STK000123456789"},
                                        {"Service", "ROAD EXPRESS"},
                                        {"ServiceLevel", "EXP"}});
    pack = MakePack(1);
    MemoryHost::Attach(conNote, {pack});
  }
  void TearDown() override {
    SetSpooler(previousSpooler);
    SetNow(std::nullopt);
    SetMessagePump(nullptr);
    if (savedXdg)
      ::setenv("XDG_CONFIG_HOME", savedXdg->c_str(), 1);
    else
      ::unsetenv("XDG_CONFIG_HOME");
    fs::remove_all(config);
  }

  std::shared_ptr<MemoryObject<host::Pack>> MakePack(int id) {
    return host.Make<host::Pack>({{"PackId", id},
                                  {"SSCC", "00093123450000000012"},
                                  {"StoreCode", "DC"},
                                  {"PartnerId", 3},
                                  {"SalesOrderNo", "778123"},
                                  {"ASNId", 55},
                                  {"CarrierId", 7},
                                  {"Carrier", carrier},
                                  {"Vendor", vendor},
                                  {"Receiver", receiver},
                                  {"ShipTo", shipTo},
                                  {"Order", order},
                                  {"Despatch", despatch},
                                  {"Carton", carton}});
  }

  // Init on "Dock 3" and forget the format job.
  void Ready() {
    ASSERT_TRUE(label.Init(host.system, "Dock 3"));
    spooler->jobs.clear();
    spooler->opens = 0;
  }
  std::string Printed(const Ref<host::Pack>& p) {
    EXPECT_TRUE(label.PrintLabel(p));
    EXPECT_EQ(spooler->OpenHandles(), 0u);
    if (spooler->jobs.empty()) return "(nothing printed)";
    const std::string bytes = spooler->jobs.back().bytes;
    spooler->jobs.clear();
    return bytes;
  }

  fs::path config;
  std::optional<std::string> savedXdg;
  std::shared_ptr<MemorySpooler> spooler = std::make_shared<MemorySpooler>();
  std::shared_ptr<Spooler> previousSpooler;
  MemoryHost host;
  clsStarTrackGenericSCM label;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Receiver>> receiver;
  std::shared_ptr<MemoryObject<host::Address>> delivery;
  std::shared_ptr<MemoryObject<host::Order>> order;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch;
  std::shared_ptr<MemoryObject<host::Carton>> carton;
  std::shared_ptr<MemoryObject<host::Receiver>> shipTo;
  std::shared_ptr<MemoryObject<host::ConNote>> conNote;
  std::shared_ptr<MemoryObject<host::Pack>> pack;
};

TEST_F(StarTrackGenericTest, InitDownloadsTheGenericFormatOnce) {
  EXPECT_EQ(label.PrintVPCLII(), kGenericFormat);
  ASSERT_TRUE(label.Init(host.system, "Dock 3"));
  ASSERT_EQ(spooler->jobs.size(), 1u);
  EXPECT_EQ(spooler->jobs[0].printer, "Dock 3");
  EXPECT_EQ(spooler->jobs[0].document, kDocument);
  EXPECT_EQ(spooler->jobs[0].bytes, kGenericFormat);
  EXPECT_TRUE(label.PrintSCMatOpen());
  EXPECT_FALSE(label.PrintSCMatClose());
  EXPECT_EQ(spooler->OpenHandles(), 0u);
  // Labels are batches only: the format is not sent again.
  EXPECT_EQ(Printed(pack).substr(0, 2), "{B");
}

TEST_F(StarTrackGenericTest, OrdinaryCarton) {
  Ready();
  EXPECT_EQ(Printed(pack), kOrdinary);
  EXPECT_EQ(label.Values().ToNameShort, "REBEL SPORT CHADSTONE");
  EXPECT_EQ(label.Values().LabelCarrierId, "7");
  // The same values again on request, as the host sends them itself.
  EXPECT_EQ(label.VPCLIIBatchCommand(), kOrdinary);
}

TEST_F(StarTrackGenericTest, AuthorityToLeaveNumbersThePackInItsConsignment) {
  carrier->fields["Options"] = "#%POD#%ATL";
  std::vector<std::shared_ptr<MemoryObject<host::Pack>>> packs;
  for (int id = 11; id <= 15; ++id) packs.push_back(MakePack(id));
  MemoryHost::Attach(conNote, packs);
  Ready();
  const std::string atl =
      "11,\"SHOP 1040 CHADSTONE CENTRE\"|15,\"C000000003\"|16,\"C000000003     ATL\"|17,";
  EXPECT_EQ(Printed(packs[2]),
            std::regex_replace(kOrdinary, std::regex("11,\"SHOP 1040 CHADSTONE CENTRE\"\\|17,"), atl));
  EXPECT_EQ(label.Values().PackOrdinal, 3);

  // A pack its consignment does not list takes the last place.
  auto stray = MakePack(99);
  stray->fields["ConNote"] = conNote;
  EXPECT_NE(Printed(stray).find("|15,\"C000000005\"|16,\"C000000005     ATL\"|17,"),
            std::string::npos);

  // Without authority to leave the fields are not sent, and the number stays.
  carrier->fields["Options"] = "#%atl";
  EXPECT_EQ(Printed(packs[0]), kOrdinary);
  EXPECT_EQ(label.Values().ATLNumber, "C000000005");
}

TEST_F(StarTrackGenericTest, PalletsGetFiveCopiesWhateverQtySays) {
  Ready();
  ASSERT_TRUE(label.PrintLabel(pack, std::int16_t{3}));
  EXPECT_EQ(spooler->jobs.back().bytes, kOrdinary);
  carton->fields["Code"] = "PLT-1200";
  ASSERT_TRUE(label.PrintLabel(pack, std::int16_t{3}));
  EXPECT_EQ(spooler->jobs.back().bytes,
            std::regex_replace(kOrdinary, std::regex("\\{B,430,N,1\\|"), "{B,430,N,5|"));
}

TEST_F(StarTrackGenericTest, NoConsignmentWithoutAnAdvanceNotice) {
  Ready();
  const std::string expected = WithFields(kOrdinary, {{5, ""}, {29, "3148 "}, {30, ""}, {34, "C/N:"}});
  pack->fields["ASNId"] = Var();
  EXPECT_EQ(Printed(pack), expected);
  // A pack not yet on a consignment prints the same.
  pack->fields["ConNote"] = Var();
  EXPECT_EQ(Printed(pack), expected);
}

TEST_F(StarTrackGenericTest, AddressedStoreLookup) {
  for (const char* code : {"12", "DC", "", "77"}) {
    host.Make<host::Receiver>({{"Code", code},
                               {"PartnerId", 3},
                               {"Name", std::string("Store ") + code},
                               {"Suburb", "Carlton"},
                               {"State", "VIC"},
                               {"Postcode", "3053"}});
  }
  Ready();
  struct Case {
    const char* packStore;
    const char* receiverStore;
    const char* store;
  };
  // The receiver's own store code replaces "DC" or nothing, when it is longer than one character.
  for (const Case& c : {Case{"DC", "12", "12"}, Case{"DC", "1", "DC"}, Case{"", "", ""},
                        Case{"77", "12", "77"}}) {
    pack->fields["StoreCode"] = c.packStore;
    receiver->fields["StoreCode"] = c.receiverStore;
    const std::string name = Trim(std::string("STORE ") + c.store);
    EXPECT_EQ(Printed(pack), WithFields(kOrdinary, {{6, name},
                                                    {7, ""},
                                                    {8, "CARLTON VIC 3053"},
                                                    {11, ""},
                                                    {17, "~2014210363053"},
                                                    {18, "(421)0363053"},
                                                    {28, "CARLTON"},
                                                    {29, "3053 EXP"}}))
        << c.packStore << "/" << c.receiverStore;
  }
}

TEST_F(StarTrackGenericTest, OrderDeliveryAddressWhenItNamesSomeone) {
  Ready();
  delivery->fields = {{"Name", "   "}, {"Line1", "elsewhere"}, {"Postcode", "x"}};
  EXPECT_EQ(Printed(pack), kOrdinary);  // a name of spaces is no name

  delivery->fields = {{"Name", " Jo Citizen "},
                      {"Line1", " 4 Pier St "},
                      {"Line2", "Unit 2 "},
                      {"Suburb", "Port Melbourne"},
                      {"State", "Vic"},
                      {"Postcode", "3207ab"}};
  EXPECT_EQ(Printed(pack), WithFields(kOrdinary, {{6, "JO CITIZEN"},
                                                  {7, "UNIT 2 "},
                                                  {8, "PORT MELBOURNE VIC 3207"},
                                                  {11, "4 PIER ST"},
                                                  {17, "~2014210363207"},
                                                  {18, "(421)0363207"},
                                                  {28, "PORT MELBOURNE"},
                                                  {29, "3207 EXP"}}));
  delivery->fields["Postcode"] = "ab12";
  EXPECT_EQ(label.PrintLabel(pack), true);
  EXPECT_EQ(label.Values().ToPostcode, "AB12");
}

TEST_F(StarTrackGenericTest, CutsAndPropertyTexts) {
  Ready();
  label.SetUser1(std::string(40, 'u'));
  label.SetUser2("second line");
  label.SetStoreZoneDept(std::string(35, 'z'));
  pack->fields["SSCC"] = "012345678";  // shorter than 18: taken whole
  const std::string printed = Printed(pack);
  EXPECT_NE(printed.find("|26,\"" + std::string(30, 'u') + "\"|27,\"second line\"|"), std::string::npos);
  EXPECT_NE(printed.find("|24,\"~20100012345678\"|25,\"(00)012345678\"|"), std::string::npos);
  EXPECT_EQ(label.Values().StoreZoneDept, std::string(30, 'z'));
}

TEST_F(StarTrackGenericTest, FieldDataCannotBreakThePacket) {
  Ready();
  vendor->fields["Name"] = "\"Best\" | {Tools}\r\nCafé ✓";
  receiver->fields["StoreCode"] = "0412";
  const std::string printed = Printed(pack);
  // Quotes, "|", braces gone; line breaks are spaces; é is one code page byte; ✓ has none.
  EXPECT_NE(printed.find("|1,\"Best  Tools  Caf\xE9 ?\"|2,"), std::string::npos) << printed;
}

TEST_F(StarTrackGenericTest, NullHostValuesPrintEmpty) {
  auto bare = host.Make<host::Pack>({{"Carrier", host.Make<host::Carrier>()},
                                     {"Vendor", host.Make<host::Vendor>()},
                                     {"Receiver", host.Make<host::Receiver>(
                                                      {{"Carrier", host.Make<host::Carrier>()}})},
                                     {"ShipTo", host.Make<host::Receiver>()},
                                     {"Order", host.Make<host::Order>(
                                                   {{"DeliveryAddress", host.Make<host::Address>()}})},
                                     {"Despatch", host.Make<host::Despatch>()},
                                     {"Carton", host.Make<host::Carton>()}});
  Ready();
  EXPECT_EQ(Printed(bare),
            "{B,430,N,1|E,1,0,1,1,0,1|1,\"\"|2,\"\"|3,\"\"|4,\"\"|5,\"\"|6,\"\"|7,\"\"|8,\"  \"|9,\"\"|"
            "10,\"\"|11,\"\"|17,\"~201421\"|18,\"(421)\"|19,\"(00)\"|20,\"PO \"|21,\"\"|"
            "24,\"~20100\"|25,\"(00)\"|26,\"\"|27,\"\"|28,\"\"|29,\" \"|30,\"\"|"
            "31,\"Date Packed 01/03/24\"|32,\"Not Before  \"|33,\"Not After   \"|34,\"C/N:\"|}");
}

TEST_F(StarTrackGenericTest, MissingHostObjectsAreReportedAndNothingIsQueued) {
  Ready();
  auto prompt = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope scope(prompt);
  pack->fields["Vendor"] = Var();
  EXPECT_FALSE(label.PrintLabel(pack));  // Abort
  ASSERT_EQ(prompt->messages.size(), 1u);
  EXPECT_TRUE(prompt->messages[0].starts_with("MVE error - program error #91 ("));
  EXPECT_NE(prompt->messages[0].find(") occured in module cStarTrackGenericSCM, Function PrintLabel, line "),
            std::string::npos);
  EXPECT_TRUE(spooler->jobs.empty());
  EXPECT_EQ(spooler->OpenHandles(), 0u);
  EXPECT_FALSE(label.PrintLabel(Ref<host::Pack>()));
  EXPECT_EQ(spooler->OpenHandles(), 0u);

  // Ignore skips each failing read: those values print empty, not as the
  // previous carton had them.
  pack->fields["Vendor"] = vendor;
  EXPECT_EQ(Printed(pack), kOrdinary);
  pack->fields["Vendor"] = Var();
  prompt->answers.assign(4, Answer::Ignore);
  EXPECT_EQ(Printed(pack), WithFields(kOrdinary, {{1, ""}, {2, ""}, {3, ""}, {10, ""}}));
}

TEST_F(StarTrackGenericTest, PrintingSwitchedOff) {
  Ready();
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "False"));
  EXPECT_FALSE(label.PrintLabel(pack));
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "0"));
  EXPECT_FALSE(label.PrintLabel(pack));
  EXPECT_EQ(spooler->opens, 0);
  // A switch that is neither a flag nor a number is an error: no label either.
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "maybe"));
  auto prompt = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope scope(prompt);
  EXPECT_FALSE(label.PrintLabel(pack));
  EXPECT_EQ(prompt->messages.size(), 1u);
  EXPECT_EQ(spooler->opens, 0);
  ASSERT_TRUE(SaveSetting("Merivane", "Settings", "clsStarTrackGenericSCM", "True"));
  EXPECT_EQ(Printed(pack), kOrdinary);
}

TEST_F(StarTrackGenericTest, PrinterThatCannotBeOpenedIsLoggedAndTheLabelLost) {
  EXPECT_TRUE(label.Init(host.system, "Dock 9"));  // format not sent, still True
  EXPECT_TRUE(label.PrintLabel(pack));
  EXPECT_TRUE(spooler->jobs.empty());
  ASSERT_EQ(host.logs.size(), 2u);
  const auto& entry = host.logs[1];
  EXPECT_EQ(entry.at("Message").Text(), "Error 1801Unable to open printer Dock 9");
  EXPECT_EQ(entry.at("Procedure").Text(), "OpenPtr");
  EXPECT_EQ(entry.at("Source").Text(), kDocument);
  EXPECT_EQ(entry.at("Level").Whole(), 0);
  EXPECT_EQ(entry.at("UserName").Text(), "packer1");
}

TEST_F(StarTrackGenericTest, InitWithoutPrinterSendsNothing) {
  EXPECT_TRUE(label.Init(host.system));
  EXPECT_TRUE(label.Init(host.system, ""));
  EXPECT_EQ(spooler->opens, 0);
  // Printing afterwards tries the printer with no name.
  EXPECT_TRUE(label.PrintLabel(pack));
  EXPECT_EQ(host.LogMessages(), std::vector<std::string>{"Error 1801Unable to open printer "});
  // The values still name the class's format.
  EXPECT_EQ(label.VPCLIIBatchCommand(), kOrdinary);
}

TEST_F(StarTrackGenericTest, ComDirectPreparesTheBatchWithoutAJob) {
  Ready();
  EXPECT_TRUE(label.PrintLabel(pack, std::nullopt, true));
  EXPECT_EQ(spooler->opens, 0);
  EXPECT_TRUE(spooler->jobs.empty());
  EXPECT_EQ(label.VPCLIIBatchCommand(), kOrdinary);
  EXPECT_TRUE(label.PrintLabel(pack, std::nullopt, false));
  EXPECT_EQ(spooler->jobs.size(), 1u);
}

TEST_F(StarTrackGenericTest, QueueWait) {
  Ready();
  int pumps = 0;
  SetMessagePump([&] { ++pumps; });
  std::vector<std::int32_t> answers;
  spooler->queueLength = [&](const std::string&) {
    const std::int32_t n = answers.front();
    if (answers.size() > 1) answers.erase(answers.begin());
    return n;
  };
  host.system->fields["SpoolerMode"] = 0;
  answers = {998};
  EXPECT_EQ(Printed(pack), kOrdinary);
  EXPECT_EQ(pumps, 1);

  // A full queue holds the label back until it drops below 999.
  pumps = 0;
  answers = {999, 1500, 998};
  EXPECT_EQ(Printed(pack), kOrdinary);
  EXPECT_EQ(answers.size(), 1u);
  EXPECT_EQ(pumps, 3);

  // An unset mode is not mode 2: the queue is looked at too.
  host.system->fields["SpoolerMode"] = Var();
  answers = {999, 998};
  EXPECT_EQ(Printed(pack), kOrdinary);
  EXPECT_EQ(answers.size(), 1u);

  // Spooler mode 2 never looks at the queue.
  host.system->fields["SpoolerMode"] = 2;
  spooler->queueLength = [](const std::string&) -> std::int32_t {
    ADD_FAILURE() << "queue asked in spooler mode 2";
    return 999;
  };
  EXPECT_EQ(Printed(pack), kOrdinary);
}

TEST_F(StarTrackGenericTest, UnknownLanguageIsLoggedAndNothingPrinted) {
  host.system->fields["PrinterLanguage"] = "ZPL";
  ASSERT_TRUE(label.Init(host.system, "Dock 3"));
  EXPECT_EQ(spooler->jobs.size(), 1u);  // the format still goes for any spooled language
  EXPECT_TRUE(label.PrintLabel(pack));
  ASSERT_EQ(host.logs.size(), 1u);
  EXPECT_EQ(host.logs[0].at("Message").Text(), "ZPL unknown.");
  EXPECT_EQ(host.logs[0].at("Procedure").Text(), "WriteLabel");
  ASSERT_EQ(spooler->jobs.size(), 2u);
  EXPECT_EQ(spooler->jobs[1].bytes, "");
  EXPECT_EQ(spooler->OpenHandles(), 0u);
}

TEST_F(StarTrackGenericTest, DrawnPrinterIsFoundByItsExactName) {
  spooler->AddPrinter("Office Laser", 203);
  host.system->fields["PrinterLanguage"] = "WinPCL";
  EXPECT_TRUE(label.Init(host.system, "Office Laser"));
  EXPECT_EQ(spooler->opens, 0);
  EXPECT_TRUE(label.PrintLabel(pack));
  EXPECT_FLOAT_EQ(label.TwipsPerPixelX(), 7.09f);  // 1440 / 203 dpi
  EXPECT_FLOAT_EQ(label.TwipsPerPixelY(), 7.09f);
  EXPECT_TRUE(spooler->jobs.empty());
  EXPECT_TRUE(host.logs.empty());
  EXPECT_TRUE(label.Init(host.system, "office laser"));
  EXPECT_FALSE(label.PrintLabel(pack));

  // A page that cannot be made is logged with the spooler's own error code.
  spooler->dcError = 5;
  EXPECT_TRUE(label.Init(host.system, "Office Laser"));
  EXPECT_TRUE(label.PrintLabel(pack));
  EXPECT_EQ(host.LogMessages().back(), "Error 5Unable to open printer Office Laser");
}

}  // namespace
}  // namespace quendal
