// Runs the built quendal command in a temporary folder and checks its exit
// status, its one-line errors and its JSON output.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <thread>
#include <cstdio>
#include <cstdlib>
#include <set>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>

#include "frame/Catalogue.h"
#include "tests/support/TempFolder.h"

namespace quendal {
namespace {

using nlohmann::json;
using test::TempFolder;

struct Result {
  int status;
  std::string out;
  std::string err;
  json Json() const { return json::parse(out); }
};

std::string Quote(const std::string& arg) {
  std::string quoted = "'";
  for (char c : arg) quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
  return quoted + "'";
}

class CliTest : public ::testing::Test {
 protected:
  Result Run(const std::vector<std::string>& args) {
    std::string command = "cd " + Quote(folder.path()) + " && XDG_CONFIG_HOME=" + Quote(folder / "config") +
                          " QUENDAL_NOW=2024-03-14T09:30:00 " + Quote(QUENDAL_CLI_PATH);
    for (const auto& arg : args) command += " " + Quote(arg);
    command += " </dev/null >" + Quote(folder / "out.txt") + " 2>" + Quote(folder / "err.txt");
    const int raw = std::system(command.c_str());
    return {WIFEXITED(raw) ? WEXITSTATUS(raw) : -1, test::ReadText(folder / "out.txt"),
            test::ReadText(folder / "err.txt")};
  }
  static void ExpectOneLineError(const Result& r, int status, const std::string& text) {
    EXPECT_EQ(r.status, status) << r.err;
    EXPECT_NE(r.err.find(text), std::string::npos) << r.err;
    EXPECT_EQ(std::count(r.err.begin(), r.err.end(), '\n'), 1) << r.err;
  }
  std::string Example() const { return QUENDAL_MVSERVER_FIXTURES "/example-day.json"; }
  // A class of the family that is built, or not built, if the catalogue has one.
  static const CatalogueEntry* Find(Family family, bool built) {
    for (const auto& entry : Catalogue())
      if (entry.family == family && (entry.factory != nullptr) == built) return &entry;
    return nullptr;
  }

  TempFolder folder;
};

TEST_F(CliTest, ClassesListsTheWholeCatalogue) {
  const Result text = Run({"classes"});
  EXPECT_EQ(text.status, 0);
  EXPECT_NE(text.out.find("Quendal.clsStarTrackGenericSCM"), std::string::npos);
  const Result r = Run({"classes", "--json"});
  ASSERT_EQ(r.status, 0) << r.err;
  const json j = r.Json();
  ASSERT_EQ(j["classes"].size(), Catalogue().size());
  EXPECT_EQ(j["classes"][1]["identifier"], "Quendal.clsTNTDAet11");
  EXPECT_EQ(j["classes"][1]["family"], "consignment");
  EXPECT_EQ(j["classes"][1]["carrier"], "TNT");
  int built = 0;
  for (const auto& entry : Catalogue()) built += entry.factory ? 1 : 0;
  EXPECT_EQ(j["built"], built);
}

TEST_F(CliTest, ImportReportsWhatItLoadedAndRefusesBadInputWithOneLine) {
  const Result r = Run({"--json", "import", Example()});
  ASSERT_EQ(r.status, 0) << r.err;
  EXPECT_EQ(r.Json()["total"], 23);
  EXPECT_EQ(r.Json()["records"]["Packs"], 3);
  EXPECT_TRUE(std::filesystem::exists(folder / "quendal.db"));

  ExpectOneLineError(Run({"import", Example()}), 1, "Vendors[0].VendorId: VendorId 1 already exists");
  test::WriteText(folder / "bad.json", R"({"Packs": [{"PackId": 9, "ConNoteId": 77}]})");
  ExpectOneLineError(Run({"import", "bad.json"}), 1, "bad.json: Packs[0].ConNoteId: no ConNote 77");
  test::WriteText(folder / "broken.json", "{\"Packs\": [");
  ExpectOneLineError(Run({"import", "broken.json"}), 1, "invalid JSON");
  ExpectOneLineError(Run({"import", "missing.json"}), 2, "cannot read missing.json");
  ExpectOneLineError(Run({"--db", "no/such/folder/q.db", "import", Example()}), 2, "cannot open database");
  test::WriteText(folder / "text.db", "not a database at all, only words, words and more words....");
  ExpectOneLineError(Run({"--db", "text.db", "log"}), 2, "text.db");
}

TEST_F(CliTest, LogListsEntriesSinceAnId) {
  test::WriteText(folder / "logs.json",
                  R"({"Logs": [{"LogId": 1, "Message": "first", "Source": "Quendal.clsX"},
                               {"LogId": 2, "Message": "second", "ErrorNumber": 53}]})");
  ASSERT_EQ(Run({"import", "logs.json"}).status, 0);
  const Result r = Run({"log", "--since", "1", "--json"});
  ASSERT_EQ(r.status, 0) << r.err;
  ASSERT_EQ(r.Json()["entries"].size(), 1u);
  EXPECT_EQ(r.Json()["entries"][0]["Message"], "second");
  EXPECT_EQ(r.Json()["entries"][0]["ErrorNumber"], 53);
  const Result text = Run({"log"});
  EXPECT_NE(text.out.find("first"), std::string::npos);
  ExpectOneLineError(Run({"log", "--since", "x"}), 1, "--since");
}

TEST_F(CliTest, SettingsStoreThePrintingSwitchPerClass) {
  const Result initial = Run({"settings", "get", "clsStarTrackGenericSCM", "--json"});
  ASSERT_EQ(initial.status, 0) << initial.err;
  EXPECT_EQ(initial.Json()["value"], "True");
  EXPECT_EQ(initial.Json()["key"], "clsStarTrackGenericSCM");
  ASSERT_EQ(Run({"settings", "set", "Quendal.clsStarTrackGenericSCM", "False"}).status, 0);
  EXPECT_EQ(Run({"--json", "settings", "get", "clsStarTrackGenericSCM"}).Json()["value"], "False");
  EXPECT_NE(test::ReadText(folder / "config/Merivane/settings.ini").find("clsStarTrackGenericSCM=False"),
            std::string::npos);
  ExpectOneLineError(Run({"settings", "set", "clsStarTrackGenericSCM", "maybe"}), 1, "True, False");
  ExpectOneLineError(Run({"settings", "get", "clsNoSuchThing"}), 1, "no class clsNoSuchThing");
  EXPECT_EQ(Run({"settings", "get"}).status, 1);
}

TEST_F(CliTest, WorkCommandsCheckTheClassBeforeTheyRunIt) {
  ASSERT_EQ(Run({"import", Example()}).status, 0);
  ExpectOneLineError(Run({"label", "clsTNTDAet11", "--pack", "1001"}), 1, "is a consignment class");
  ExpectOneLineError(Run({"despatch", "clsStarTrackGenericSCM", "--connote", "101"}), 1, "is a label class");
  ExpectOneLineError(Run({"manifest", "clsNoSuchThing", "--edi-doc", "7"}), 1, "no class clsNoSuchThing");
  ExpectOneLineError(Run({"label", "clsStarTrackGenericSCM", "--pack", "1001", "--connote", "101"}), 1,
                     "excludes");
  ExpectOneLineError(Run({"--now", "14/03/2024", "classes"}), 1, "--now");
  ExpectOneLineError(Run({"--on-error", "shrug", "classes"}), 1, "shrug");
  ExpectOneLineError(Run({"frobnicate"}), 1, "frobnicate");
  if (const auto* entry = Find(Family::Label, false))
    ExpectOneLineError(Run({"label", std::string(entry->className), "--pack", "1001"}), 1,
                       "is not built yet");
  if (const auto* entry = Find(Family::Consignment, false))
    ExpectOneLineError(Run({"despatch", std::string(entry->className), "--connote", "101"}), 1,
                       "is not built yet");
  if (const auto* entry = Find(Family::Rows, false))
    ExpectOneLineError(Run({"manifest", std::string(entry->className), "--edi-doc", "7"}), 1,
                       "is not built yet");
}

TEST_F(CliTest, WorkCommandsRunBuiltClassesAndPrintWhatTheyReturned) {
  ASSERT_EQ(Run({"import", Example()}).status, 0);
  std::filesystem::create_directories(folder / "spool/Labels");
  if (const auto* entry = Find(Family::Label, true)) {
    const std::string name(entry->className);
    const Result r = Run({"--json", "label", name, "--pack", "1001", "1002", "--printer", "Labels"});
    ASSERT_EQ(r.status, 0) << r.err;
    ASSERT_EQ(r.Json()["labels"].size(), 2u);
    EXPECT_EQ(r.Json()["labels"][1]["pack"], 1002);
    EXPECT_TRUE(r.Json()["log"].is_array());
    ExpectOneLineError(Run({"label", name, "--pack", "999"}), 1, "no pack 999");
    ExpectOneLineError(Run({"label", name}), 1, "--pack ID ... or --connote ID");
  }
  if (const auto* entry = Find(Family::Consignment, true)) {
    const std::string name(entry->className);
    const Result r = Run({"--json", "despatch", name, "--connote", "101"});
    ASSERT_EQ(r.status, 0) << r.err;
    EXPECT_TRUE(r.Json()["vtErrorLog"].is_array());
    ExpectOneLineError(Run({"despatch", name, "--connote", "5"}), 1, "no consignment 5");
  }
  if (const auto* entry = Find(Family::Rows, true)) {
    const std::string name(entry->className);
    const Result r = Run({"--json", "manifest", name, "--edi-doc", "7"});
    ASSERT_EQ(r.status, 0) << r.err;
    EXPECT_TRUE(r.Json()["rows"].is_array());
    ExpectOneLineError(Run({"manifest", name, "--edi-doc", "8"}), 1, "no EDI document 8");
    ExpectOneLineError(Run({"manifest", name, "--edi-doc", "7", "--rows", "1,x"}), 1, "--rows");
  }
}

TEST_F(CliTest, SeparatorPdtAndPackLineOnAnyLabelClass) {
  ASSERT_EQ(Run({"import", Example()}).status, 0);
  std::filesystem::create_directories(folder / "spool/Dock 3");
  // The two characters \n separate the message's lines.
  Result r = Run({"--json", "separator", "clsStarTrackGenericSCM", "--printer", "Dock 3", "--message",
                  "Store 0412\\nChadstone"});
  ASSERT_EQ(r.status, 0) << r.err;
  EXPECT_EQ(r.Json()["separator"], true);
  const std::string job = test::ReadText(folder / "spool/Dock 3/000001-Quendal.clsStarTrackGenericSCM.prn");
  EXPECT_NE(job.find("C,580,150,0,3,2,2,B,L,0,3,\"STORE 0412\"|C,580,110,0,1,2,2,B,L,0,3,\"CHADSTONE\"|"),
            std::string::npos)
      << job;
  // --language: a ZPL printer gets no separator; a printer that is not there, none either.
  r = Run({"--json", "separator", "clsMayneCMLSCM", "--printer", "Dock 3", "--message", "x", "--language", "ZPL"});
  EXPECT_EQ(r.Json()["separator"], true);
  EXPECT_FALSE(std::filesystem::exists(folder / "spool/Dock 3/000002-Quendal.clsMayneCMLSCM.prn"));
  r = Run({"--json", "separator", "clsMayneCMLSCM", "--printer", "Dock 9", "--message", "x"});
  EXPECT_EQ(r.Json()["separator"], false);
  EXPECT_EQ(r.Json()["log"][0]["Message"], "Error 1801Unable to open printer Dock 9");

  r = Run({"--json", "pdt", "clsTollMYERSCM", "--job", "1"});
  ASSERT_EQ(r.status, 0) << r.err;
  const json pdt = r.Json();
  ASSERT_EQ(pdt["lines"].size(), 3u);
  for (const auto& line : pdt["lines"]) EXPECT_EQ(line["line"].get<std::string>().size(), 244u);
  EXPECT_EQ(pdt["lines"][1]["line"].get<std::string>().substr(0, 45),
            "556677 HBS0012         SO10045               ");
  ExpectOneLineError(Run({"pdt", "clsTollMYERSCM", "--job", "5"}), 1, "no job 5");

  r = Run({"--json", "packline", "clsStarTrackGenericSCM", "--order", "SO10045", "--pack", "1001", "--apn",
           "9312345000029", "--qty", "2"});
  ASSERT_EQ(r.status, 0) << r.err;
  EXPECT_EQ(r.Json()["lineNo"], 2);
  EXPECT_EQ(r.Json()["lastError"], 0);
  r = Run({"--json", "packline", "clsStarTrackGenericSCM", "--order", "SO10045", "--pack", "1003", "--apn",
           "9312345000029"});
  EXPECT_EQ(r.Json()["lineNo"], 0);
  EXPECT_EQ(r.Json()["lastError"], 8106);
}

TEST_F(CliTest, PreviewDrawsJobsAsTheLabelPrinterPrintsThem) {
  ASSERT_EQ(Run({"import", Example()}).status, 0);
  std::filesystem::create_directories(folder / "spool/Zebra");
  test::WriteText(folder / "spool/Zebra/printer.ini", "dpi=203\npreview=yes\n");
  ASSERT_EQ(Run({"label", "clsMayneCMLSCM", "--pack", "1001", "--printer", "Zebra", "--language", "ZPL"}).status, 0);
  // The spooler drew the job beside it, as printer.ini asks.
  EXPECT_TRUE(std::filesystem::exists(folder / "spool/Zebra/preview-000001-Quendal.clsMayneCMLSCM.png"));
  const Result r = Run({"--json", "preview", "spool/Zebra/000001-Quendal.clsMayneCMLSCM.prn", "--out", "pictures",
                        "--dpi", "300"});
  ASSERT_EQ(r.status, 0) << r.err;
  ASSERT_EQ(r.Json()["jobs"][0]["pages"].size(), 1u);
  // The printer's label, 100 mm wide, at 300 dpi.
  EXPECT_EQ(r.Json()["jobs"][0]["pages"][0]["width"], 1181);
  EXPECT_TRUE(std::filesystem::exists(folder / "pictures/preview-000001-Quendal.clsMayneCMLSCM.png"));
  ExpectOneLineError(Run({"preview", "missing.prn"}), 2, "cannot read missing.prn");
}

TEST_F(CliTest, GalleryDrawsEveryBuiltLabelClassAndRewritesOnlyItsBlock) {
  ASSERT_EQ(Run({"import", Example()}).status, 0);
  test::WriteText(folder / "README.md", "# Labels\nSee `<!-- gallery -->` below.\n<!-- gallery -->\nold\n<!-- /gallery -->\nEnd\n");
  const Result r = Run({"--json", "gallery", "--out", "docs/gallery", "--readme", "README.md"});
  ASSERT_EQ(r.status, 0) << r.err;
  std::size_t built = 0;
  for (const auto& entry : Catalogue()) built += entry.family == Family::Label && entry.factory ? 1 : 0;
  const json pictures = r.Json()["pictures"];
  ASSERT_EQ(pictures.size(), built) << r.out;
  for (const auto& picture : pictures)
    EXPECT_TRUE(test::ReadText(folder / picture["file"].get<std::string>()).starts_with("\x89PNG")) << picture;
  const std::string readme = test::ReadText(folder / "README.md");
  EXPECT_TRUE(readme.starts_with("# Labels\nSee `<!-- gallery -->` below.\n<!-- gallery -->\n")) << readme;
  EXPECT_TRUE(readme.ends_with("</table>\n<!-- /gallery -->\nEnd\n")) << readme;
  EXPECT_NE(readme.find("<img src=\"docs/gallery/clsStarTrackGenericSCM.png\""), std::string::npos);
  EXPECT_EQ(readme.find("old"), std::string::npos);
  test::WriteText(folder / "NOTES.md", "no marks\n");
  ExpectOneLineError(Run({"gallery", "--readme", "NOTES.md"}), 1, "NOTES.md has no <!-- gallery -->");
}

// --cups prints through the private CUPS server that scripts/test starts; the
// queue's device is a file, which receives the label batch.
TEST_F(CliTest, LabelsThroughCups) {
  const char* queue = std::getenv("QUENDAL_CUPS_CLI_QUEUE");
  const char* file = std::getenv("QUENDAL_CUPS_CLI_FILE");
  if (!std::getenv("CUPS_SERVER") || !queue || !file) {
    const char* ci = std::getenv("CI");
    if (ci && std::string(ci) == "true") FAIL() << "CI runs a private CUPS server";
    GTEST_SKIP() << "no private CUPS server (scripts/test starts one)";
  }
  ASSERT_EQ(Run({"import", Example()}).status, 0);
  const Result r = Run({"--cups", "--json", "label", "clsStarTrackGenericSCM", "--pack", "1001",
                        "--printer", queue});
  ASSERT_EQ(r.status, 0) << r.err;
  EXPECT_TRUE(r.Json()["log"].empty()) << r.out;  // the queue was found: no "Error 1801"
  // The server delivers asynchronously: wait for the batch of pack 1001.
  std::string delivered;
  for (int i = 0; i < 200 && delivered.find("(00)093123450000000012") == std::string::npos; ++i) {
    delivered = test::ReadText(file);
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
  }
  EXPECT_NE(delivered.find("{B,430,N,1|"), std::string::npos) << delivered;
  const Result unknown =
      Run({"--cups", "--json", "label", "clsStarTrackGenericSCM", "--pack", "1001", "--printer", "no-such-queue"});
  ASSERT_EQ(unknown.status, 0) << unknown.err;
  EXPECT_NE(unknown.out.find("Error 1801Unable to open printer no-such-queue"), std::string::npos)
      << unknown.out;
  ExpectOneLineError(Run({"--cups", "--spool", "x", "classes"}), 1, "excludes");
}

TEST_F(CliTest, DemoBuildsADayRunsWhatIsBuiltAndReplacesItsOwnFolderOnly) {
  const Result r = Run({"demo", "--out", "day", "--json"});
  ASSERT_EQ(r.status, 0) << r.err;
  const json j = r.Json();
  EXPECT_EQ(j["now"], "2024-03-14T09:30:00");
  const json& data = j["data"];
  EXPECT_EQ(data["vendors"], 1);
  EXPECT_EQ(data["consignments"], 30);
  EXPECT_EQ(data["asns"], 30);
  EXPECT_GE(data["packs"].get<int>(), 30);
  EXPECT_LE(data["packs"].get<int>(), 270);
  EXPECT_GT(data["pallets"].get<int>(), 0);
  EXPECT_GT(data["satchels"].get<int>(), 0);
  EXPECT_GT(data["dangerousGoodsPacks"].get<int>(), 0);
  EXPECT_EQ(data["carriers"], data["ediDocuments"]);
  EXPECT_EQ(j["catalogue"]["total"], Catalogue().size());
  EXPECT_EQ(j["runs"].size(), j["catalogue"]["built"].get<std::size_t>());

  // The demo's document names every catalogue carrier, dates today, and the folders exist.
  const json day = json::parse(test::ReadText(folder / "day/demo-data.json"));
  std::set<std::string> carriers;
  for (const auto& c : day["Carriers"]) {
    carriers.insert(c["Name"]);
    EXPECT_TRUE(std::filesystem::is_directory(c["FileFolder"].get<std::string>())) << c["FileFolder"];
    EXPECT_TRUE(std::filesystem::is_directory(folder / "day/spool/" + c["Name"].get<std::string>() + " Labels"));
    if (c["Name"] == "DFE") {
      EXPECT_EQ(c["AccountNumber"].get<std::string>().size(), 5u);
    }
  }
  for (const auto& entry : Catalogue())
    if (entry.carrier != "any") {
      EXPECT_TRUE(carriers.count(std::string(entry.carrier))) << entry.carrier;
    }
  for (const auto& c : day["ConNotes"]) EXPECT_TRUE(c["ConNoteDate"].get<std::string>().starts_with("2024-03-14T"));
  std::set<std::string> classes;
  for (const auto& p : day["Products"])
    if (p["IsDangerous"].get<bool>()) classes.insert(p["DGClass"]);
  EXPECT_EQ(classes, (std::set<std::string>{"2.1", "3.1", "5.1"}));

  // A second run replaces the first one's database instead of adding to it.
  const Result again = Run({"demo", "--out", "day", "--json"});
  ASSERT_EQ(again.status, 0) << again.err;
  EXPECT_EQ(again.Json()["data"]["consignments"], 30);
  // The demo's document goes through the ordinary import too.
  const Result imported = Run({"--db", "copy.db", "--json", "import", "day/demo-data.json"});
  ASSERT_EQ(imported.status, 0) << imported.err;
  EXPECT_EQ(imported.Json()["records"]["ConNotes"], 30);
  // A folder holding a database the demo did not make is left alone.
  ASSERT_EQ(Run({"import", Example()}).status, 0);
  ExpectOneLineError(Run({"demo", "--out", "."}), 1, "the demo did not make");
  EXPECT_TRUE(std::filesystem::exists(folder / "quendal.db"));
}

TEST_F(CliTest, ReportPrintsOrKeepsTheConsignmentSummary) {
  ASSERT_EQ(Run({"import", Example()}).status, 0);
  std::filesystem::create_directories(folder / "spool/Despatch Office Laser");
  // The day's summary of a vendor and carrier, with further options.
  auto day = [](std::string from, std::string vendor, std::initializer_list<std::string> more) {
    std::vector<std::string> args = {"--json", "report", "--class", "clsStarTrackEODcln", "--from", from,
                                     "--to", "14/03/2024", "--vendor", vendor, "--carrier", "SRX"};
    args.insert(args.end(), more);
    return args;
  };
  const Result printed = Run(day("2024-03-14", "ACME", {}));
  ASSERT_EQ(printed.status, 0) << printed.err;
  EXPECT_EQ(printed.Json()["result"], 0);
  EXPECT_EQ(printed.Json()["printer"], "Despatch Office Laser");
  int jobs = 0;
  for (const auto& job : std::filesystem::directory_iterator(folder / "spool/Despatch Office Laser"))
    jobs += job.path().filename().string().ends_with("Consignment Summary Print.pdf");
  EXPECT_EQ(jobs, 1);

  const Result kept = Run(day("2024-03-14", "ACME", {"--option", "0", "--html", "summary.html"}));
  ASSERT_EQ(kept.status, 0) << kept.err;
  EXPECT_EQ(kept.Json()["kept"], "summary.pdf");
  EXPECT_TRUE(std::filesystem::exists(folder / "summary.pdf"));
  EXPECT_NE(test::ReadText(folder / "summary.html").find("SRX00012345"), std::string::npos);

  const Result none = Run(day("2024-03-14", "NOBODY", {}));
  EXPECT_EQ(none.Json()["result"], 1);  // the host knows no such vendor: no list
  ExpectOneLineError(Run(day("14.03.2024", "ACME", {})), 1, "--from takes a date");
  ExpectOneLineError(Run({"report", "--class", "clseParcelManifestxml", "--from", "2024-03-14", "--to",
                          "2024-03-14", "--vendor", "ACME", "--carrier", "SRX"}),
                     1, "does not print the consolidated manifest");
}

TEST_F(CliTest, ALongManifestRunShowsItsProgressOnATerminalOnly) {
  // A StarTrack carrier with 250 consignments awaiting a manifest.
  json day = {{"System", {{"DocumentPrinter", "Office"}}},
              {"Vendors", {{{"VendorId", 1}, {"VendorCode", "ACME"}}}},
              {"Carriers", {{{"CarrierId", 1}, {"CarrierCode", "SRX"}, {"AccountRef", "SRX"},
                             {"FileFolder", (folder / "carrier/")}}}},
              {"EDIDocuments", {{{"ID", 7}, {"VendorId", 1}, {"CarrierId", 1}}}},
              {"ConNotes", json::array()}};
  for (int i = 0; i < 250; ++i)
    day["ConNotes"].push_back({{"ConNoteId", 1000 + i}, {"ConNoteNo", "SRX" + std::to_string(5000 + i)},
                               {"ConNoteDate", "2024-03-14T08:00:00"}, {"CarrierId", 1}, {"VendorId", 1}});
  std::filesystem::create_directories(folder / "carrier");
  test::WriteText(folder / "day.json", day.dump());
  // Every host write is a transaction of its own: on a memory-backed folder
  // the runs take a second rather than a minute of disk syncs.
  const std::filesystem::path shm = "/dev/shm";
  const std::string db = std::filesystem::is_directory(shm)
                             ? (shm / ("quendal-cli-" + std::to_string(::getpid()))).string()
                             : folder / "day";
  struct Remove {
    std::string prefix;
    ~Remove() {
      for (const char* suffix : {".db", "-again.db", "-plain.db"}) std::filesystem::remove(prefix + suffix);
    }
  } remove{db};
  ASSERT_EQ(Run({"--db", db + ".db", "import", "day.json"}).status, 0);

  // Under a terminal (script gives the command one) the count goes to stderr.
  auto onTerminal = [&](const std::string& args) {
    const std::string command = "cd " + Quote(folder.path()) + " && QUENDAL_NOW=2024-03-14T09:30:00 script -qec " +
                                Quote(Quote(QUENDAL_CLI_PATH) + " " + args + " >/dev/null") + " /dev/null";
    std::string seen;
    if (FILE* pipe = ::popen(command.c_str(), "r")) {
      char buffer[4096];
      for (std::size_t n; (n = std::fread(buffer, 1, sizeof buffer, pipe)) > 0;) seen.append(buffer, n);
      ::pclose(pipe);
    }
    return seen;
  };
  const std::string shown =
      onTerminal("--db " + Quote(db + ".db") + " manifest clsStarTrackManifestcln --edi-doc 7 --rows 0,1,2,3");
  EXPECT_EQ(shown.find("Process:"), std::string::npos) << shown;  // four rows: no count
  const std::string counted = onTerminal("--db " + Quote(db + ".db") + " manifest clsStarTrackManifestcln --edi-doc 7");
  std::size_t counts = 0;
  for (std::size_t at = 0; (at = counted.find("\rProcess: ", at)) != std::string::npos; ++at) ++counts;
  EXPECT_GE(counts, 100u) << counted;
  EXPECT_NE(counted.find("Process: 246 of 246 rows"), std::string::npos) << counted;
  const std::string again = db + "-again.db";
  ASSERT_EQ(Run({"--db", again, "import", "day.json"}).status, 0);
  EXPECT_EQ(onTerminal("--db " + Quote(again) + " --json manifest clsStarTrackManifestcln --edi-doc 7").find("Process:"),
            std::string::npos);
  // Without a terminal, nothing but the result.
  const std::string plainDb = db + "-plain.db";
  ASSERT_EQ(Run({"--db", plainDb, "import", "day.json"}).status, 0);
  const Result plain = Run({"--db", plainDb, "manifest", "clsStarTrackManifestcln", "--edi-doc", "7"});
  ASSERT_EQ(plain.status, 0);
  EXPECT_NE(plain.out.find("Process row 249:"), std::string::npos);
  EXPECT_EQ(plain.err, "");
}

TEST_F(CliTest, LayoutShowsTheShippedLayoutAndChecksASiteOne) {
  const Result shown = Run({"layout", "show", "Quendal.clsIpecDA1250"});
  EXPECT_EQ(shown.status, 0);
  EXPECT_NE(shown.out.find("record trailer\n  \"%%EOF\""), std::string::npos) << shown.out;
  ExpectOneLineError(Run({"layout", "show", "clsStarTrackDAcln"}), 1, "no layout for clsStarTrackDAcln");

  std::ofstream(folder / "clsIpecDA1250.layout") << "record consignment\n  \"40\"\n  cut 4 ConNote.ConNoteNo\n";
  const Result checked = Run({"--json", "layout", "check", "clsIpecDA1250.layout"});
  ASSERT_EQ(checked.status, 0) << checked.err;
  const json result = checked.Json();
  ASSERT_EQ(result["written"].size(), 1u);
  EXPECT_EQ(result["written"][0]["file"], "T1250_IPE0_20240314093000.DAT");
  EXPECT_EQ(result["written"][0]["text"], "40IPE0\r\n");

  std::ofstream(folder / "site.layout") << "record pack\n  cut 4 Pack.Colour\n";
  ExpectOneLineError(Run({"layout", "check", "site.layout", "--class", "clsHunterDA"}), 1,
                     "site.layout line 2 column 9: unknown value \"Pack.Colour\"");
  ExpectOneLineError(Run({"layout", "check", "site.layout"}), 1, "no layout for site");
  ExpectOneLineError(Run({"layout", "check", "none.layout", "--class", "clsHunterDA"}), 2, "cannot open none.layout");
}

}  // namespace
}  // namespace quendal
