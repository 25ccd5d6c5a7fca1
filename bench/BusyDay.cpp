// A busy despatch day through the SQLite reference host, as a warehouse
// runs it: the day's data (the demo's carriers, stores and products, with
// 10,000 consignments and about 50,000 packs) is imported as one JSON
// document; four packing stations, each a process of its own, then take a
// share of the consignments each and, consignment by consignment, print a
// label per pack (the carrier's label class, to the directory spooler) and
// process the consignment with each of its carrier's consignment classes,
// all at once against the one database and the same carrier folders. While
// they work, this process plays the printers, taking finished jobs off the
// queues. Last, each carrier's manifest and end-of-day row classes run over
// the day.
//
//   BusyDay [--consignments N] [--stations S] [--disk] [--keep]
//
// Reports the wall time of each phase, labels and consignments per second,
// and checks the outcome: every label printed reached its printer, and every
// consignment is in each of its carrier's files exactly once (each of its
// packs, by SSCC, exactly once; where a file holds no SSCC, its lines or its
// consignment elements). Exit status 1 when a check fails.
//
// The database lies in /dev/shm when there is one (--disk: in the temporary
// folder, so that each host write costs a sync); the carrier folders and the
// spool lie in the temporary folder (TMPDIR). --keep leaves the day's folder.
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "cli/DemoData.h"
#include "frame/Catalogue.h"
#include "mvserver/SqliteHost.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"

namespace {

using namespace quendal;
using namespace quendal::cli;
namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;

double Seconds(Clock::time_point from, Clock::time_point to) {
  return std::chrono::duration<double>(to - from).count();
}

// What a class's output is checked by.
enum class Check {
  Sscc,          // each pack's SSCC exactly once
  ConNoteLines,  // one line per pack naming the consignment number
  PcmsXml,       // one <ConsignmentNumber> per consignment, one article per pack
  None,          // writes no carrier file (a printed summary only)
};

// The files each consignment class writes in its carrier's folder (several
// classes of one carrier share it), and how its output is checked.
struct FileRule {
  std::string_view className;
  std::string_view prefix;
  std::string_view suffix;
  Check check;
};
constexpr FileRule kConsignmentFiles[] = {
    {"clsStarTrackDAcln", "STE", ".CLN", Check::Sscc},
    {"clsTNTDAet11", "TNT", ".TXT", Check::Sscc},
    {"clsTNTTransactionDAcsv", "_", ".txt", Check::ConNoteLines},
    {"clsMayneDAcl", "CL_", ".txt", Check::Sscc},
    {"clsIpecDA1250", "T1250_", ".DAT", Check::Sscc},
    {"clsIpecDA1256", "T1256_", ".DAT", Check::Sscc},
    {"clsVicExpressDAcln", "", ".CTN", Check::Sscc},
    {"clsVLODAcsv", "_", ".txt", Check::Sscc},
    {"clsDFEDAxml", "MANIFEST_", ".XML", Check::Sscc},
    {"clsHunterDA", "DOWNLOAD_", ".TXT", Check::Sscc},
    {"clsAlliedExpressSEDIP", "al_", ".dat", Check::Sscc},
};

Check RowCheck(std::string_view className) {
  if (className == "clsStarTrackEODcln") return Check::None;
  if (className.starts_with("clseParcel")) return Check::PcmsXml;
  return Check::Sscc;
}

struct Consignment {
  std::int64_t id;
  std::string number;
  std::string carrier;
  std::vector<std::string> ssccs;  // the 18 digits after the "00" application identifier
};

// The classes a station uses for one carrier's consignments.
struct CarrierClasses {
  const CatalogueEntry* label = nullptr;
  std::vector<const CatalogueEntry*> consignment;
  std::vector<const CatalogueEntry*> rows;
};

// Every carrier's classes from the catalogue: its first label class (the
// label without an SSCC for a carrier that has none), all of its consignment
// classes, its row classes in catalogue order.
std::map<std::string, CarrierClasses> ClassesByCarrier(const DemoData& data) {
  std::map<std::string, CarrierClasses> classes;
  const CatalogueEntry* anyLabel = nullptr;
  for (const auto& entry : Catalogue()) {
    if (!entry.factory) continue;
    const std::string carrier(entry.carrier);
    if (carrier == "any") {
      if (entry.family == Family::Label && !anyLabel) anyLabel = &entry;
      continue;
    }
    CarrierClasses& c = classes[carrier];
    if (entry.family == Family::Label && !c.label) c.label = &entry;
    if (entry.family == Family::Consignment) c.consignment.push_back(&entry);
    if (entry.family == Family::Rows) c.rows.push_back(&entry);
  }
  for (const auto& carrier : data.carriers)
    if (!classes[carrier.name].label) classes[carrier.name].label = anyLabel;
  return classes;
}

// ------------------------------------------------------------- the checks

// The text of files, by path.
using Texts = std::map<std::string, std::string>;

Texts ReadFolder(const fs::path& folder, bool recursive) {
  Texts texts;
  std::error_code ec;
  auto read = [&](const fs::directory_entry& e) {
    if (!e.is_regular_file(ec) || e.path().filename().string().starts_with(".")) return;
    std::ifstream in(e.path(), std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    texts[e.path().string()] = text.str();
  };
  if (recursive) {
    for (const auto& e : fs::recursive_directory_iterator(folder, ec)) read(e);
  } else {
    for (const auto& e : fs::directory_iterator(folder, ec)) read(e);
  }
  return texts;
}

// What a run added: new files whole, and of a file it changed, what follows
// the part it kept (a file's trailer is rewritten when records are added).
std::string Added(const Texts& before, const Texts& after) {
  std::string added;
  for (const auto& [path, text] : after) {
    auto it = before.find(path);
    if (it == before.end()) {
      added += text;
    } else if (it->second != text) {
      const auto kept = std::mismatch(text.begin(), text.end(), it->second.begin(), it->second.end());
      added += std::string(kept.first, text.end());
    }
    added += "\n";
  }
  return added;
}

std::string Joined(const Texts& texts) {
  std::string joined;
  for (const auto& [path, text] : texts) joined += text + "\n";
  return joined;
}

struct Outcome {
  std::size_t expected = 0;  // consignments
  std::size_t once = 0;
  std::size_t missing = 0;
  std::size_t twice = 0;  // or more, or part of it more than once
  std::size_t strays = 0;  // packs of other carriers' consignments
  std::string note;
  bool Good() const { return once == expected && missing == 0 && twice == 0 && strays == 0; }
};

Outcome CheckOutput(Check check, const std::string& text, const std::vector<const Consignment*>& mine,
                    const std::map<std::string, const Consignment*>& packOwner) {
  Outcome outcome;
  outcome.expected = mine.size();
  if (check == Check::None) {
    outcome.once = mine.size();
    outcome.note = "no carrier file";
    return outcome;
  }
  if (check == Check::Sscc) {
    std::map<std::string, int> seen;
    std::set<std::string> own;
    for (const Consignment* c : mine) own.insert(c->ssccs.begin(), c->ssccs.end());
    // Every SSCC of the day starts with its extension digit and company prefix.
    for (std::size_t at = text.find("09312345"); at != std::string::npos; at = text.find("09312345", at)) {
      const std::string candidate = text.substr(at, 18);
      if (candidate.size() == 18 && packOwner.count(candidate)) {
        if (own.count(candidate))
          ++seen[candidate];
        else
          ++outcome.strays;
        at += 18;
      } else {
        ++at;
      }
    }
    for (const Consignment* c : mine) {
      bool missing = false, twice = false;
      for (const auto& sscc : c->ssccs) {
        const int n = seen.count(sscc) ? seen[sscc] : 0;
        missing = missing || n == 0;
        twice = twice || n > 1;
      }
      if (twice)
        ++outcome.twice;
      else if (missing)
        ++outcome.missing;
      else
        ++outcome.once;
    }
    return outcome;
  }
  if (check == Check::ConNoteLines) {
    std::map<std::string, std::size_t> lines;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line);) {
      std::istringstream fields(line);
      for (std::string field; std::getline(fields, field, ',');)
        if (field.size() > 3) ++lines[field];
    }
    for (const Consignment* c : mine) {
      const std::size_t n = lines.count(c->number) ? lines[c->number] : 0;
      if (n == c->ssccs.size())
        ++outcome.once;
      else if (n == 0)
        ++outcome.missing;
      else
        ++outcome.twice;
    }
    return outcome;
  }
  // PCMS XML: consignment numbers are the carrier's own, so the check is by count.
  std::map<std::string, int> numbers;
  std::size_t articles = 0;
  const std::string open = "<ConsignmentNumber>", close = "</ConsignmentNumber>";
  for (std::size_t at = text.find(open); at != std::string::npos; at = text.find(open, at)) {
    at += open.size();
    const std::size_t end = text.find(close, at);
    if (end == std::string::npos) break;
    ++numbers[text.substr(at, end - at)];
  }
  for (std::size_t at = text.find("<ArticleNumber>"); at != std::string::npos;
       at = text.find("<ArticleNumber>", at + 1))
    ++articles;
  std::size_t packs = 0;
  for (const Consignment* c : mine) packs += c->ssccs.size();
  for (const auto& [number, n] : numbers) {
    if (n == 1) ++outcome.once;
    if (n > 1) ++outcome.twice;
  }
  outcome.missing = mine.size() > numbers.size() ? mine.size() - numbers.size() : 0;
  if (numbers.size() > mine.size()) outcome.strays = numbers.size() - mine.size();
  if (articles != packs) {
    outcome.note = std::to_string(articles) + " articles for " + std::to_string(packs) + " packs";
    ++outcome.twice;
  }
  return outcome;
}

// -------------------------------------------------------------- stations

struct StationTally {
  long labels = 0, labelsFailed = 0, inits = 0, processes = 0;
  double labelSeconds = 0, processSeconds = 0;
};

StationTally RunStation(int station, int stations, const std::string& database, const fs::path& root,
                        const DemoData& data, const std::vector<Consignment>& day) {
  StationTally tally;
  auto host = mvserver::SqliteHost::Open(database);
  auto previousLibrary = host::RegisterLibrary(host);
  auto previousSpooler = SetSpooler(std::make_shared<DirectorySpooler>((root / "spool").string()));
  const auto system = host->System();
  const auto classes = ClassesByCarrier(data);

  // One object of each class per station, as a station keeps them all day.
  struct Objects {
    std::unique_ptr<Component> labelObject;
    LabelInterface* label = nullptr;
    std::vector<std::unique_ptr<Component>> consignmentObjects;
    std::vector<ConsignmentInterface*> consignment;
  };
  std::map<std::string, Objects> objects;
  for (const auto& carrier : data.carriers) {
    Objects& o = objects[carrier.name];
    const CarrierClasses& c = classes.at(carrier.name);
    if (c.label) {
      o.labelObject = CreateObject(c.label->Identifier()).object;
      o.label = as<LabelInterface>(o.labelObject);
      if (o.label) {
        o.label->Init(system, carrier.printer);
        ++tally.inits;
      }
    }
    for (const auto* entry : c.consignment) {
      o.consignmentObjects.push_back(CreateObject(entry->Identifier()).object);
      if (auto* p = as<ConsignmentInterface>(o.consignmentObjects.back())) o.consignment.push_back(p);
    }
  }

  for (std::size_t i = static_cast<std::size_t>(station); i < day.size(); i += static_cast<std::size_t>(stations)) {
    const Consignment& c = day[i];
    Objects& o = objects[c.carrier];
    const auto conNote = host->Find<host::ConNote>("ConNote", c.id);
    const Ref<host::PackList> packs = conNote->Packs();
    const auto labelStart = Clock::now();
    if (o.label) {
      for (auto pack : *packs) {
        if (o.label->PrintLabel(pack, std::nullopt))
          ++tally.labels;
        else
          ++tally.labelsFailed;
      }
    }
    const auto processStart = Clock::now();
    const Ref<host::ASN> asn = packs->Count() > 0 ? packs->Item(1)->ASN() : Ref<host::ASN>();
    for (auto* consignment : o.consignment) {
      LogList log;
      consignment->Process(system, conNote, asn, packs, log);
      ++tally.processes;
    }
    const auto end = Clock::now();
    tally.labelSeconds += Seconds(labelStart, processStart);
    tally.processSeconds += Seconds(processStart, end);
  }
  objects.clear();
  SetSpooler(previousSpooler);
  host::RegisterLibrary(previousLibrary);
  return tally;
}

// A job in a printer's queue: NNNNNN-<document name>.
bool IsJob(const fs::path& path) {
  const std::string file = path.filename().string();
  return file.size() > 7 && file[6] == '-' && std::all_of(file.begin(), file.begin() + 6, ::isdigit);
}

// The jobs each carrier's label class sends at Init (its format download),
// counted on a printer of its own.
std::map<std::string, long> FormatDownloads(mvserver::SqliteHost& host, const fs::path& root,
                                            const DemoData& data) {
  std::map<std::string, long> downloads;
  auto previousLibrary = host::RegisterLibrary(host.shared_from_this());
  auto previousSpooler = SetSpooler(std::make_shared<DirectorySpooler>((root / "spool").string()));
  const auto classes = ClassesByCarrier(data);
  const fs::path printer = root / "spool" / "Init";
  for (const auto& carrier : data.carriers) {
    const CatalogueEntry* entry = classes.at(carrier.name).label;
    if (!entry) continue;
    fs::create_directories(printer);
    auto object = CreateObject(entry->Identifier()).object;
    if (auto* label = as<LabelInterface>(object)) label->Init(host.System(), "Init");
    for (const auto& job : fs::directory_iterator(printer)) downloads[carrier.name] += IsJob(job.path());
    fs::remove_all(printer);
  }
  SetSpooler(previousSpooler);
  host::RegisterLibrary(previousLibrary);
  return downloads;
}

// Takes the finished jobs off every printer's queue, as the printers would,
// into printed/<printer>/; returns how many it took per printer.
void Drain(const fs::path& spool, const fs::path& printed, std::map<std::string, long>& taken) {
  std::error_code ec;
  for (const auto& printer : fs::directory_iterator(spool, ec)) {
    if (!printer.is_directory(ec)) continue;
    const std::string name = printer.path().filename().string();
    for (const auto& job : fs::directory_iterator(printer.path(), ec)) {
      if (!IsJob(job.path())) continue;
      fs::create_directories(printed / name, ec);
      const long n = ++taken[name];
      fs::rename(job.path(), printed / name / (std::to_string(n) + "-" + job.path().filename().string()), ec);
    }
  }
}

}  // namespace

int main(int argc, char** argv) {
  int count = 10000, stations = 4;
  bool disk = false, keep = false;
  for (int i = 1; i < argc; ++i) {
    const std::string arg = argv[i];
    if (arg == "--consignments" && i + 1 < argc) {
      count = std::atoi(argv[++i]);
    } else if (arg == "--stations" && i + 1 < argc) {
      stations = std::atoi(argv[++i]);
    } else if (arg == "--disk") {
      disk = true;
    } else if (arg == "--keep") {
      keep = true;
    } else {
      std::fprintf(stderr, "usage: BusyDay [--consignments N] [--stations S] [--disk] [--keep]\n");
      return 2;
    }
  }
  if (count < 1 || stations < 1) {
    std::fprintf(stderr, "BusyDay: --consignments and --stations must be at least 1\n");
    return 2;
  }

  const fs::path root = fs::temp_directory_path() / ("quendal-busyday-" + std::to_string(::getpid()));
  const fs::path dbFolder = !disk && fs::is_directory("/dev/shm") ? fs::path("/dev/shm") : root;
  const std::string database = (dbFolder / ("quendal-busyday-" + std::to_string(::getpid()) + ".db")).string();
  fs::remove_all(root);
  fs::create_directories(root);

  // The day, and its folders and printers.
  const DemoData data = BuildDemoData(root.string(), Now(), count);
  for (const auto& carrier : data.carriers) {
    fs::create_directories(root / "spool" / SafeFileName(carrier.printer));
    fs::create_directories(carrier.folder);
    fs::create_directories(carrier.outputFolder);
  }
  fs::create_directories(root / "spool" / SafeFileName(data.documentPrinter));
  for (const DemoFile& file : data.files) std::ofstream(file.path, std::ios::binary) << file.text;

  std::vector<Consignment> day;
  std::map<std::int64_t, std::size_t> byId;
  std::map<std::string, const Consignment*> packOwner;
  for (const auto& c : data.document["ConNotes"]) {
    const auto carrierId = c["CarrierId"].get<std::size_t>();
    byId[c["ConNoteId"].get<std::int64_t>()] = day.size();
    day.push_back({c["ConNoteId"], c["ConNoteNo"], data.carriers[carrierId - 1].name, {}});
  }
  for (const auto& p : data.document["Packs"])
    day[byId[p["ConNoteId"].get<std::int64_t>()]].ssccs.push_back(p["SSCC"].get<std::string>().substr(2));
  for (const auto& c : day)
    for (const auto& sscc : c.ssccs) packOwner[sscc] = &c;
  const std::size_t packCount = packOwner.size();

  std::printf("Busy day: %d consignments, %zu packs, %zu carriers, %d stations\n", count, packCount,
              data.carriers.size(), stations);
  std::printf("Database %s; carrier folders and spool in %s\n", database.c_str(), root.c_str());
  const auto dayStart = Clock::now();

  // Import, as `quendal import` does; the host is closed again before the stations fork.
  double importSeconds = 0;
  std::map<std::string, long> downloads;  // jobs a label class's Init sends, by carrier
  {
    const std::string json = data.document.dump();
    const auto start = Clock::now();
    auto host = mvserver::SqliteHost::Open(database);
    host->Import(json);
    importSeconds = Seconds(start, Clock::now());
    downloads = FormatDownloads(*host, root, data);
  }
  std::printf("Import: %.2f s\n", importSeconds);
  std::fflush(stdout);

  // The stations.
  const fs::path results = root / "results";
  fs::create_directories(results);
  const auto stationsStart = Clock::now();
  std::vector<pid_t> children;
  for (int s = 0; s < stations; ++s) {
    const pid_t pid = ::fork();
    if (pid < 0) {
      std::perror("fork");
      return 2;
    }
    if (pid == 0) {
      int status = 0;
      try {
        const StationTally t = RunStation(s, stations, database, root, data, day);
        std::ofstream(results / std::to_string(s))
            << t.labels << " " << t.labelsFailed << " " << t.inits << " " << t.processes << " " << t.labelSeconds
            << " " << t.processSeconds << "\n";
      } catch (const std::exception& e) {
        std::fprintf(stderr, "station %d: %s\n", s + 1, e.what());
        status = 1;
      }
      std::fflush(nullptr);
      ::_exit(status);
    }
    children.push_back(pid);
  }
  std::map<std::string, long> taken;
  bool stationsFailed = false;
  while (!children.empty()) {
    Drain(root / "spool", root / "printed", taken);
    for (auto it = children.begin(); it != children.end();) {
      int status = 0;
      if (::waitpid(*it, &status, WNOHANG) == *it) {
        stationsFailed = stationsFailed || !WIFEXITED(status) || WEXITSTATUS(status) != 0;
        it = children.erase(it);
      } else {
        ++it;
      }
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
  }
  const double stationSeconds = Seconds(stationsStart, Clock::now());
  Drain(root / "spool", root / "printed", taken);

  StationTally total;
  for (int s = 0; s < stations; ++s) {
    StationTally t;
    std::ifstream in(results / std::to_string(s));
    if (!(in >> t.labels >> t.labelsFailed >> t.inits >> t.processes >> t.labelSeconds >> t.processSeconds)) {
      stationsFailed = true;
      continue;
    }
    total.labels += t.labels;
    total.labelsFailed += t.labelsFailed;
    total.inits += t.inits;
    total.processes += t.processes;
    total.labelSeconds += t.labelSeconds;
    total.processSeconds += t.processSeconds;
  }
  std::printf("Stations: %.2f s wall; %ld labels (%ld refused), %.0f labels/s; %d consignments "
              "(%ld Process calls), %.0f consignments/s\n",
              stationSeconds, total.labels, total.labelsFailed, total.labels / stationSeconds, count,
              total.processes, count / stationSeconds);
  std::printf("  station time: labels %.2f s (%.2f ms each), Process %.2f s (%.2f ms each)\n", total.labelSeconds,
              total.labels ? total.labelSeconds * 1000 / static_cast<double>(total.labels) : 0.0,
              total.processSeconds,
              total.processes ? total.processSeconds * 1000 / static_cast<double>(total.processes) : 0.0);

  bool good = !stationsFailed && total.labels == static_cast<long>(packCount) && total.labelsFailed == 0;
  if (stationsFailed) std::printf("  A STATION FAILED\n");

  // Every label reached its printer: one job per label, and the format each Init downloads.
  long labelJobs = 0, formatJobs = 0;
  for (const auto& carrier : data.carriers) {
    labelJobs += taken[SafeFileName(carrier.printer)];
    formatJobs += downloads[carrier.name] * stations;
  }
  const long expectedJobs = total.labels + formatJobs;
  std::printf("Label jobs printed: %ld (labels %ld + format downloads %ld = %ld)%s\n", labelJobs, total.labels,
              formatJobs, expectedJobs, labelJobs == expectedJobs ? "" : "  MISMATCH");
  good = good && labelJobs == expectedJobs;

  // Every consignment in each of its carrier's consignment files exactly once.
  const auto classes = ClassesByCarrier(data);
  std::map<std::string, std::vector<const Consignment*>> byCarrier;
  for (const auto& c : day) byCarrier[c.carrier].push_back(&c);
  std::printf("\n%-26s %-24s %8s %8s %8s %8s %8s\n", "Class", "Carrier", "expected", "once", "missing", "twice",
              "strays");
  auto report = [&](std::string_view className, const std::string& carrier, const Outcome& o) {
    std::printf("%-26s %-24s %8zu %8zu %8zu %8zu %8zu%s%s%s\n", std::string(className).c_str(), carrier.c_str(),
                o.expected, o.once, o.missing, o.twice, o.strays, o.Good() ? "" : "  FAILED",
                o.note.empty() ? "" : "  ", o.note.c_str());
    good = good && o.Good();
  };
  for (const auto& carrier : data.carriers) {
    const fs::path folder = carrier.folder;
    const Texts texts = ReadFolder(folder, false);
    for (const auto* entry : classes.at(carrier.name).consignment) {
      const FileRule* rule = nullptr;
      for (const auto& r : kConsignmentFiles)
        if (r.className == entry->className) rule = &r;
      if (!rule) {
        std::printf("%-26s no file rule: not checked  FAILED\n", std::string(entry->className).c_str());
        good = false;
        continue;
      }
      std::string text;
      for (const auto& [path, content] : texts) {
        const std::string name = fs::path(path).filename().string();
        if (name.starts_with(rule->prefix) && name.ends_with(rule->suffix)) text += content + "\n";
      }
      report(entry->className, carrier.name, CheckOutput(rule->check, text, byCarrier[carrier.name], packOwner));
    }
  }

  // The manifest and end-of-day runs, one class after another as the office runs them.
  const auto rowsStart = Clock::now();
  {
    auto host = mvserver::SqliteHost::Open(database);
    auto previousLibrary = host::RegisterLibrary(host);
    auto previousSpooler = SetSpooler(std::make_shared<DirectorySpooler>((root / "spool").string()));
    const auto system = host->System();
    for (const auto& entry : Catalogue()) {
      if (entry.family != Family::Rows || !entry.factory) continue;
      for (const auto& carrier : data.carriers) {
        if (carrier.name != entry.carrier) continue;
        const Texts before = ReadFolder(carrier.folder, true);
        auto object = CreateObject(entry.Identifier()).object;
        auto* rows = as<RowInterface>(object);
        Grid columns, grid;
        const bool init = rows->Init(system, static_cast<std::int16_t>(carrier.ediDocumentId), columns);
        const std::int32_t loaded = rows->Load("", grid);
        LogList log;
        std::int32_t written = 0;
        for (std::int32_t row = 0; row < loaded; ++row) written += rows->Process(row, log) != 0;
        const bool term = rows->Term();
        // A PCMS day's document is reopened and extended by each run: the whole of it counts.
        const Check check = RowCheck(entry.className);
        const Texts after = ReadFolder(carrier.folder, true);
        Outcome o = CheckOutput(check, check == Check::PcmsXml ? Joined(after) : Added(before, after),
                                byCarrier[carrier.name], packOwner);
        // Rows are consignments or packs; a run that writes no file of its own returns no ids.
        if (!init || !term || loaded < static_cast<std::int32_t>(byCarrier[carrier.name].size()) ||
            (check != Check::None && written != loaded)) {
          o.note += (o.note.empty() ? "" : "; ") + std::string("Init ") + (init ? "True" : "False") + ", " +
                    std::to_string(loaded) + " rows, " + std::to_string(written) + " written, Term " +
                    (term ? "True" : "False");
          o.once = 0;
        }
        report(entry.className, carrier.name, o);
      }
    }
    SetSpooler(previousSpooler);
    host::RegisterLibrary(previousLibrary);
  }
  const double rowSeconds = Seconds(rowsStart, Clock::now());
  const double daySeconds = Seconds(dayStart, Clock::now());

  // What went wrong on the way, as the host's log has it.
  long problems = 0;
  {
    auto host = mvserver::SqliteHost::Open(database);
    std::map<std::string, long> kinds;
    for (const auto& log : host->LogsSince(0)) {
      if (log->ErrorNumber().Whole() == 0) continue;
      ++problems;
      ++kinds[log->Source().Text() + ": " + log->Message().Text().substr(0, 90)];
    }
    std::printf("\nLog entries with an error number: %ld\n", problems);
    int shown = 0;
    for (const auto& [kind, n] : kinds) {
      if (++shown > 12) break;
      std::printf("  %5ld x %s\n", n, kind.c_str());
    }
  }

  struct rusage usage {};
  ::getrusage(RUSAGE_CHILDREN, &usage);
  std::printf("\nManifest and end-of-day runs: %.2f s\n", rowSeconds);
  std::printf("Whole day: %.2f s wall (import %.2f s, stations %.2f s, rows %.2f s); stations' CPU %.2f s\n",
              daySeconds, importSeconds, stationSeconds, rowSeconds,
              static_cast<double>(usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) +
                  static_cast<double>(usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6);
  std::printf("Result: %s\n", good ? "every label printed, every consignment in its carrier's files exactly once"
                                     : "CHECKS FAILED");
  if (!keep) {
    std::error_code ec;
    fs::remove_all(root, ec);
  } else {
    std::printf("Kept %s\n", root.c_str());
  }
  for (const char* suffix : {"", "-wal", "-shm", "-journal"}) {
    std::error_code ec;
    if (!keep) fs::remove(database + suffix, ec);
  }
  return good ? 0 : 1;
}
