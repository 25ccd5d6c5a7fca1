// Several packing stations write consignments into one carrier folder at
// the same moment (child processes, let go together). Whatever the order,
// the folder must hold what one station writing them all in turn would
// write: no record lost, none twice, no consignment's records split by
// another's, and where the class refuses a consignment the file holds,
// one processed by every station at once is in the file once.
// QUENDAL_STATIONS_ROUNDS repeats the race (default 1), QUENDAL_STATIONS_EACH
// sets the consignments per station (default 6).
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <map>

#include "frame/Catalogue.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"
#include "platform/FileSystem.h"
#include "tests/support/MemoryHost.h"
#include "tests/support/Records.h"
#include "tests/support/Stations.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

namespace fs = std::filesystem;
using test::MemoryHost;
using test::MemoryObject;

constexpr int kStations = 3;

struct Writer {
  std::string_view identifier;
  // The class refuses a consignment its file holds: stations may race on the same one.
  bool refusesDuplicates;
};

void PrintTo(const Writer& writer, std::ostream* out) { *out << writer.identifier; }

class StationsTest : public ::testing::TestWithParam<Writer> {
 protected:
  void SetUp() override {
    // New files are dated today: the classes look for the day's file by its creation date.
    const DateTime now = Now();
    SetNow(DateTime::FromParts(now.Year(), now.Month(), now.Day(), 9, 30, 0));
  }
  void TearDown() override { SetNow(std::nullopt); }

  // Host data for one folder: a carrier, its receiver and vendor, one notice.
  void MakeHost(const std::string& folder) {
    const bool csv = GetParam().identifier == "Quendal.clsVLODAcsv";
    carrier_ = host_.Make<host::Carrier>({{"FileFolder", csv ? folder + "VLO" : folder},
                                          {"AccountRef", "SRX01"},
                                          {"AccountNumber", "40217"},
                                          {"Options", ""}});
    if (csv) test::WriteText(folder + "VLODA.map", "CONSIGNMENTNOTENO\r\nCONTAINERNO\r\nASNNO\r\n");
    receiver_ = host_.Make<host::Receiver>({{"Name", "Harbour Retail DC"},
                                            {"AddressLine1", "12 Wharf Road"},
                                            {"AddressLine2", "Gate 4"},
                                            {"Suburb", "PORT MELBOURNE"},
                                            {"City", "MEL"},
                                            {"State", "VIC"},
                                            {"Postcode", "3207"}});
    vendor_ = host_.Make<host::Vendor>({{"Name", "Alpine Cosmetics"}, {"State", "VIC"}});
    despatch_ = host_.Make<host::Despatch>({{"DespatchNo", "DSP778812"}});
    order_ = host_.Make<host::Order>({{"OrderNo", "PO-88120"}});
    asn_ = host_.Make<host::ASN>({{"ID", 501}, {"ASNNo", "ASN-000501"}, {"ASNNumber", 4500501}});
  }

  // Consignment `n` with two cartons; the same number gives the same records.
  std::shared_ptr<MemoryObject<host::ConNote>> ConNote(int n) {
    char no[32];
    std::snprintf(no, sizeof no, "SRXZ%08d", n);
    auto conNote = host_.Make<host::ConNote>({{"ConNoteNo", no},
                                              {"ConNoteDate", Now()},
                                              {"Service", "EXP"},  // a code of the CLN file's three characters
                                              {"Weight", 12.5},
                                              {"Volume", 0.035},
                                              {"Carrier", carrier_},
                                              {"Receiver", receiver_},
                                              {"Vendor", vendor_}});
    std::vector<std::shared_ptr<MemoryObject<host::Pack>>> packs;
    for (int i = 1; i <= 2; ++i) {
      char sscc[32];
      std::snprintf(sscc, sizeof sscc, "0009312345%08d%02d", n, i);
      packs.push_back(host_.Make<host::Pack>(
          {{"SSCC", sscc},
           {"ASNId", 501},
           {"PackType", "CARTON"},
           {"Weight", 6.25},
           {"Carton", host_.Make<host::Carton>({{"Code", "CTN01"}, {"Weight", 6.25}})},
           {"Order", order_},
           {"Despatch", despatch_},
           {"Receiver", receiver_},
           {"Vendor", vendor_}}));
    }
    MemoryHost::Attach(conNote, packs);
    return conNote;
  }

  void Process(ConsignmentInterface& writer, int n) {
    auto conNote = ConNote(n);
    LogList log;
    writer.Process(host_.system, conNote,
                   asn_, host::Object::As<host::PackList>(conNote->fields["Packs"]), log);
  }

  // Every line of the folder's carrier files, sorted; hidden files are named in `hidden`.
  static std::vector<std::string> Lines(const std::string& folder, std::vector<std::string>& hidden,
                                        std::map<std::string, std::string>& files) {
    std::vector<std::string> lines;
    for (const auto& entry : fs::directory_iterator(folder)) {
      const std::string name = entry.path().filename();
      if (name.starts_with(".")) {
        hidden.push_back(name);
        continue;
      }
      if (name.ends_with(".map")) continue;
      files[name] = test::ReadText(entry.path());
      for (std::string& line : test::CrLfLines(files[name])) lines.push_back(std::move(line));
    }
    std::sort(lines.begin(), lines.end());
    return lines;
  }

  MemoryHost host_;
  std::shared_ptr<MemoryObject<host::Carrier>> carrier_;
  std::shared_ptr<MemoryObject<host::Receiver>> receiver_;
  std::shared_ptr<MemoryObject<host::Vendor>> vendor_;
  std::shared_ptr<MemoryObject<host::Despatch>> despatch_;
  std::shared_ptr<MemoryObject<host::Order>> order_;
  std::shared_ptr<MemoryObject<host::ASN>> asn_;
};

TEST_P(StationsTest, StationsWritingAtOnceLoseNothingAndWriteNothingTwice) {
  const Writer writer = GetParam();
  const int rounds = test::EnvCount("QUENDAL_STATIONS_ROUNDS", 1);
  const int each = test::EnvCount("QUENDAL_STATIONS_EACH", 6);
  // Stations that refuse duplicates all start with the same two consignments.
  const int shared = writer.refusesDuplicates ? 2 : 0;
  const auto numbers = [&](int station) {
    std::vector<int> list;
    for (int s = 1; s <= shared; ++s) list.push_back(s);
    for (int i = 0; i < each; ++i) list.push_back(100 * (station + 1) + i);
    return list;
  };

  for (int round = 0; round < rounds; ++round) {
    test::TempFolder one, many;
    const std::string alone = one.path() + "/";
    const std::string together = many.path() + "/";

    // One station writing every consignment once, in turn.
    MakeHost(alone);
    {
      auto object = CreateObject(writer.identifier).object;
      auto* consignments = as<ConsignmentInterface>(object);
      ASSERT_NE(consignments, nullptr);
      for (int station = 0; station < kStations; ++station)
        for (int n : numbers(station))
          if (n > shared || station == 0) Process(*consignments, n);
    }

    MakeHost(together);
    test::Stations stations;
    for (int station = 0; station < kStations; ++station) {
      stations.Start([&, station] {
        auto object = CreateObject(writer.identifier).object;
        auto* consignments = as<ConsignmentInterface>(object);
        for (int n : numbers(station)) Process(*consignments, n);
        return 0;
      });
    }
    stations.Go();
    EXPECT_EQ(stations.Wait(), std::vector<int>(kStations, 0));

    std::vector<std::string> hiddenAlone, hiddenTogether;
    std::map<std::string, std::string> filesAlone, filesTogether;
    const auto expected = Lines(alone, hiddenAlone, filesAlone);
    const auto written = Lines(together, hiddenTogether, filesTogether);
    ASSERT_FALSE(expected.empty());
    EXPECT_EQ(written, expected) << writer.identifier;
    // Same file names: the stations found each other's day file.
    EXPECT_EQ(filesTogether.size(), filesAlone.size());
    // No lock or journal is left behind.
    EXPECT_EQ(hiddenTogether, std::vector<std::string>{});

    // No consignment's lines are split by another's: the lines holding one
    // number follow each other.
    for (const auto& [name, text] : filesTogether) {
      const std::vector<std::string> lines = test::CrLfLines(text);
      std::map<std::string, std::pair<std::size_t, std::size_t>> span;  // first, count
      std::map<std::string, std::size_t> last;
      for (std::size_t i = 0; i < lines.size(); ++i) {
        const std::size_t at = lines[i].find("SRXZ");
        if (at == std::string::npos) continue;
        const std::string no = lines[i].substr(at, 12);
        if (last.contains(no)) {
          EXPECT_EQ(last[no] + 1, i) << writer.identifier << ": " << no << " split in " << name;
        }
        last[no] = i;
      }
    }
  }
}

INSTANTIATE_TEST_SUITE_P(
    DayFiles, StationsTest,
    ::testing::Values(Writer{"Quendal.clsStarTrackDAcln", true}, Writer{"Quendal.clsTNTDAet11", false},
                      Writer{"Quendal.clsVicExpressDAcln", false}, Writer{"Quendal.clsDFEDAxml", true},
                      Writer{"Quendal.clsIpecDA1250", false}, Writer{"Quendal.clsMayneDAcl", false},
                      Writer{"Quendal.clsVLODAcsv", false}),
    [](const auto& info) { return std::string(info.param.identifier.substr(11)); });

// Jobs printed to one printer folder by several processes at once each get
// a number of their own: none is written over by another.
TEST(StationsSpoolerTest, JobNumbersAreTakenOnceAcrossProcesses) {
  test::TempFolder root;
  fs::create_directories(fs::path(root.path()) / "Zebra");
  const int each = test::EnvCount("QUENDAL_STATIONS_EACH", 6) * 3;
  test::Stations stations;
  for (int station = 0; station < kStations; ++station) {
    stations.Start([&, station] {
      DirectorySpooler spooler(root.path());
      for (int i = 0; i < each; ++i) {
        const std::string body = "station " + std::to_string(station) + " job " + std::to_string(i);
        if (spooler.WriteNextJob("Zebra", "label", "prn", body).empty()) return 1;
      }
      return 0;
    });
  }
  stations.Go();
  EXPECT_EQ(stations.Wait(), std::vector<int>(kStations, 0));
  std::vector<std::string> bodies;
  std::vector<std::string> hidden;
  for (const auto& entry : fs::directory_iterator(fs::path(root.path()) / "Zebra")) {
    const std::string name = entry.path().filename();
    if (name.starts_with("."))
      hidden.push_back(name);
    else
      bodies.push_back(test::ReadText(entry.path()));
  }
  EXPECT_EQ(bodies.size(), static_cast<std::size_t>(kStations * each));
  std::sort(bodies.begin(), bodies.end());
  EXPECT_EQ(std::unique(bodies.begin(), bodies.end()), bodies.end());
  EXPECT_EQ(hidden, std::vector<std::string>{".jobcounter"});
}

}  // namespace
}  // namespace quendal
