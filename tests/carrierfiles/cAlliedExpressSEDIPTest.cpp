#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "carrierfiles/cAlliedExpressSEDIP.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::MemoryHost;
using test::MemoryObject;
using ::testing::ElementsAre;

std::string Delivery(std::string_view sscc) {
  return "|D|15/03/2024|09:00:00||5000|MDS|Rear loading dock|ADELAIDE|SA||||Store Manager|03 9000 "
         "1140|" +
         std::string(sscc) + "|1||||||||||||||\r\n";
}

// The file of consignment ALX00012355 with the given delivery lines.
std::string Transmission(std::string_view records, std::string_view deliveries) {
  return "#SOT\r\n#SOH\r\n#City=ADL\r\n#Version=SEDIP 1.6\r\n#Account_Code=AB12001234\r\n"
         "#Company_Name=Kestrel Apparel Pty Ltd\r\n#Transmission_Date=14/03/2024 09:30:00\r\n"
         "#Num_Record=" +
         std::string(records) +
         "\r\n#SOD\r\n"
         "|H|ALX00012355|ASN0004510|SA|ADL|40|12.5|ROAD||||||Allied Express|ASN0004510||||\r\n"
         "|P|14/03/2024|10:30:00|3175|Kestrel Apparel Pty Ltd|40 Industry Drive|DANDENONG "
         "SOUTH|VIC|||||||"
         "Unit 7|\r\n" +
         std::string(deliveries) + "#EOD\r\n#EOT\r\n";
}

class AlliedExpressSEDIPTest : public ::testing::Test {
 protected:
  void SetUp() override {
    SetNow(DateTime::FromParts(2024, 3, 14, 9, 30, 0));
    carrier = host.Make<host::Carrier>({{"FileFolder", folder}, {"AccountNumber", "AB12001234"}});
    receiver = host.Make<host::Receiver>({{"City", "ADL"},
                                          {"State", "SA"},
                                          {"Postcode", "5000"},
                                          {"AddressLine2", "Rear loading dock"},
                                          {"Suburb", "ADELAIDE"},
                                          {"Extra1", "Store Manager"},
                                          {"Extra2", "03 9000 1140"}});
    vendor = host.Make<host::Vendor>({{"Name", "Kestrel Apparel Pty Ltd"},
                                      {"AddressLine1", "Unit 7"},
                                      {"AddressLine2", "40 Industry Drive"},
                                      {"AddressLine3", "DANDENONG SOUTH"},
                                      {"State", "VIC"},
                                      {"Postcode", 3175}});
    partner = host.Make<host::Partner>({{"Code", "MDS"}});
    asn = host.Make<host::ASN>({{"ASNNo", "ASN0004510"}});
  }
  void TearDown() override { SetNow(std::nullopt); }

  void Process(int packs) {
    auto conNote =
        host.Make<host::ConNote>({{"ConNoteNo", "ALX00012355"},
                                  {"ConNoteDate", DateTime::FromParts(2024, 3, 14, 10, 30, 0)},
                                  {"ScheduledDate", DateTime::FromParts(2024, 3, 15, 9, 0, 0)},
                                  {"Weight", 0.4 * 100},
                                  {"Cube", 12.5},
                                  {"Service", "ROAD"},
                                  {"Carrier", carrier},
                                  {"Receiver", receiver},
                                  {"Vendor", vendor},
                                  {"Partner", partner}});
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> list;
    for (int i = 0; i < packs; ++i)
      list.push_back(host.Make<host::Pack>({{"SSCC", "0009312345000010050" + std::to_string(i)}}));
    MemoryHost::Attach(conNote, list);
    LogList log;
    cls.Process(host.system, conNote, asn,
                host::Object::As<host::PackList>(conNote->fields["Packs"]), log);
  }
  std::vector<std::string> Files() const {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(temp.path()))
      names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }
  std::string File(const std::string& name) const {
    return ReadFile(folder + name).value_or("<none>");
  }

  MemoryHost host;
  test::TempFolder temp;
  std::string folder = temp.path() + "/";
  std::shared_ptr<MemoryObject<host::Carrier>> carrier;
  std::shared_ptr<MemoryObject<host::Receiver>> receiver;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor;
  std::shared_ptr<MemoryObject<host::Partner>> partner;
  std::shared_ptr<MemoryObject<host::ASN>> asn;
  clsAlliedExpressSEDIP cls;
};

TEST_F(AlliedExpressSEDIPTest, OneFilePerConsignmentEvenWithinOneSecond) {
  Process(3);
  // Two more in the same second: each takes the next second that is free.
  Process(0);
  carrier->fields["FileFolder"] = temp.path();  // the folder may also come without its separator
  Process(1);
  EXPECT_THAT(Files(),
              ElementsAre("al_ab12001234_20240314_093000.dat", "al_ab12001234_20240314_093001.dat",
                          "al_ab12001234_20240314_093002.dat"));
  EXPECT_EQ(File("al_ab12001234_20240314_093000.dat"),
            Transmission("5", Delivery("00093123450000100500") + Delivery("00093123450000100501") +
                                  Delivery("00093123450000100502")));
  EXPECT_EQ(File("al_ab12001234_20240314_093001.dat"), Transmission("2", ""));
  EXPECT_EQ(File("al_ab12001234_20240314_093002.dat"),
            Transmission("3", Delivery("00093123450000100500")));
  EXPECT_TRUE(host.logs.empty());
}

TEST_F(AlliedExpressSEDIPTest, HostTextsNeitherSplitRecordsNorLeaveTheFolder) {
  receiver->fields["City"] = "ADL|x\r\n#EOT";
  carrier->fields["AccountNumber"] = "../../AB";
  Process(0);
  ASSERT_THAT(Files(), ElementsAre("al_______ab_20240314_093000.dat"));
  const std::string file = File(Files()[0]);
  EXPECT_THAT(file, ::testing::StartsWith("#SOT\r\n#SOH\r\n#City=ADL x  #EOT\r\n"));
  EXPECT_THAT(file, ::testing::HasSubstr("|SA|ADL x  #EOT|40|"));

  // A folder that isn't there is reported; nothing is written anywhere.
  carrier->fields["FileFolder"] = temp.path() + "/missing/";
  Process(1);
  EXPECT_EQ(host.LogMessages().back(), "Invalid folder " + temp.path() + "/missing/");
  EXPECT_EQ(Files().size(), 1u);
}

}  // namespace
}  // namespace quendal
