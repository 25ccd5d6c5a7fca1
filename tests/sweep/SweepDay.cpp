#include "tests/sweep/SweepDay.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <pugixml.hpp>
#include <set>
#include <sstream>

#include "cli/DemoData.h"
#include "mvserver/SqliteHost.h"
#include "platform/Clock.h"
#include "tests/support/MemoryHost.h"

namespace quendal::test {

namespace fs = std::filesystem;

namespace {

// Where the day's data says its folders are; each run moves them into its own folder.
constexpr const char* kDataRoot = "/quendal-sweep-day";
// The run's root lies three folders below the run's folder, so that a file
// that climbs out of a carrier folder with ".." still lands where it is seen.
constexpr const char* kRootBelowRun = "up1/up2/day";

std::string Slurp(const fs::path& path) { return ReadText(path.string()); }

void Spill(const fs::path& path, const std::string& bytes) {
  fs::create_directories(path.parent_path());
  WriteText(path.string(), bytes);
}

FileMap Snapshot(const fs::path& folder) {
  FileMap files;
  std::error_code ec;
  for (auto it = fs::recursive_directory_iterator(folder, ec);
       !ec && it != fs::recursive_directory_iterator(); it.increment(ec)) {
    if (!it->is_regular_file(ec)) continue;
    const std::string relative = fs::relative(it->path(), folder, ec).string();
    if (relative.starts_with("host.db")) continue;
    files[relative] = Slurp(it->path());
  }
  return files;
}

std::string Extension(const std::string& path) {
  std::string ext = fs::path(path).extension().string();
  for (char& c : ext) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return ext;
}

std::vector<std::string> Lines(const std::string& text) {
  std::vector<std::string> lines;
  std::size_t start = 0;
  while (start < text.size()) {
    std::size_t end = text.find("\r\n", start);
    if (end == std::string::npos) end = text.size();
    lines.push_back(text.substr(start, end - start));
    start = end + 2;
  }
  return lines;
}

// The columns of a delimited line, quotes respected ("" inside quotes is a quote).
std::size_t Columns(const std::string& line, char delimiter) {
  std::size_t columns = 1;
  bool quoted = false;
  for (char c : line) {
    if (c == '"')
      quoted = !quoted;
    else if (c == delimiter && !quoted)
      ++columns;
  }
  return columns;
}

// How a carrier file is built, learnt from the clean run's copy of it.
struct FileShape {
  bool xml = false;
  char delimiter = 0;  // a delimited file: every line has `columns` columns
  std::size_t columns = 0;
  std::map<std::string, std::size_t>
      widths;  // a fixed-width file: record width by its first two characters
  std::map<std::string, std::size_t> fields;  // a tagged file: "|"-separated fields by record tag
};

// Tagged records ("|H|...|") are delimited by "|" record by record.
// Lines of "#Name=value" carry no fixed width either.
bool IsTagged(const std::string& line) {
  return line.starts_with("#") || std::count(line.begin(), line.end(), '|') >= 2;
}

FileShape ShapeOf(const std::string& path, const std::string& text) {
  FileShape shape;
  if (Extension(path) == ".xml") {
    shape.xml = true;
    return shape;
  }
  const auto lines = Lines(text);
  for (char delimiter : {',', '|', '\t'}) {
    if (lines.empty()) break;
    const std::size_t columns = Columns(lines.front(), delimiter);
    bool same = columns >= 3;
    for (const auto& line : lines) same = same && Columns(line, delimiter) == columns;
    if (same) {
      shape.delimiter = delimiter;
      shape.columns = columns;
      return shape;
    }
  }
  std::set<std::string> uneven;
  for (const auto& line : lines) {
    const std::string key = line.substr(0, 2);
    if (IsTagged(line)) {
      shape.fields[key] = Columns(line, '|');
      continue;
    }
    auto [it, added] = shape.widths.try_emplace(key, line.size());
    if (!added && it->second != line.size()) uneven.insert(key);
  }
  for (const auto& key : uneven) shape.widths.erase(key);
  return shape;
}

std::vector<std::string> FileFaults(const std::string& path, const std::string& text,
                                    const FileShape& shape) {
  std::vector<std::string> faults;
  if (shape.xml) {
    pugi::xml_document doc;
    const auto parsed = doc.load_buffer(text.data(), text.size());
    if (!parsed) faults.push_back(path + ": not well-formed XML (" + parsed.description() + ")");
    return faults;
  }
  if (!text.empty() && !text.ends_with("\r\n"))
    faults.push_back(path + ": the last record is not whole");
  int line = 0;
  for (const auto& l : Lines(text)) {
    ++line;
    if (l.find_first_of("\r\n") != std::string::npos)
      faults.push_back(path + " line " + std::to_string(line) +
                       ": a bare line break inside a record");
    if (shape.delimiter && Columns(l, shape.delimiter) != shape.columns)
      faults.push_back(path + " line " + std::to_string(line) + ": " +
                       std::to_string(Columns(l, shape.delimiter)) + " columns, not " +
                       std::to_string(shape.columns));
    if (auto tagged = shape.fields.find(l.substr(0, 2)); tagged != shape.fields.end()) {
      if (Columns(l, '|') != tagged->second)
        faults.push_back(path + " line " + std::to_string(line) + ": record " + tagged->first +
                         " has " + std::to_string(Columns(l, '|')) + " fields, not " +
                         std::to_string(tagged->second));
    } else if (!shape.delimiter) {
      auto it = shape.widths.find(l.substr(0, 2));
      // A record shorter than its width has lost a field's place; a longer
      // one shifts every field after the value that did not fit.
      if (it != shape.widths.end() && l.size() != it->second)
        faults.push_back(path + " line " + std::to_string(line) + ": record " + it->first + " is " +
                         std::to_string(l.size()) + " wide, not " + std::to_string(it->second));
    }
  }
  return faults;
}

bool IsZpl(const std::string& bytes) { return bytes.find("^XA") != std::string::npos; }
bool IsVpcl(const std::string& bytes) { return bytes.starts_with("{"); }

// The structure of a printer stream: VPCL II packet marks, or the ZPL commands.
std::string StreamShape(const std::string& bytes) {
  std::string shape;
  if (!IsVpcl(bytes) && IsZpl(bytes)) {
    for (std::size_t i = 0; i + 2 < bytes.size(); ++i)
      if (bytes[i] == '^' || bytes[i] == '~') shape += bytes.substr(i, 3);
  } else {
    for (char c : bytes)
      if (c == '{' || c == '}' || c == '|' || c == '"') shape += c;
  }
  return shape;
}

std::vector<std::string> StreamFaults(const MemorySpooler::Job& job) {
  std::vector<std::string> faults;
  const std::string& b = job.bytes;
  const std::string name = "job " + job.document;
  if (IsVpcl(b)) {
    int depth = 0;
    std::size_t quotes = 0;
    for (char c : b) {
      if (c == '{') ++depth;
      if (c == '}') --depth;
      if (depth < 0 || depth > 1) return {name + ": packets nest or close unopened"};
      if (c == '"') ++quotes;
      if (c == '}' && quotes % 2) return {name + ": a quoted text runs past its packet"};
    }
    if (depth != 0) faults.push_back(name + ": a packet is not closed");
  } else if (IsZpl(b)) {
    std::size_t starts = 0, ends = 0;
    for (std::size_t i = 0; i + 2 < b.size() + 1; ++i) {
      if (b.compare(i, 3, "^XA") == 0) ++starts;
      if (b.compare(i, 3, "^XZ") == 0) ++ends;
    }
    if (starts != ends) faults.push_back(name + ": ^XA and ^XZ do not pair");
  }
  return faults;
}

std::string Printable(std::string text) {
  if (text.size() > 160) text = text.substr(0, 160) + "...";
  for (char& c : text)
    if (static_cast<unsigned char>(c) < 32) c = ' ';
  return text;
}

}  // namespace

bool FullSweep() {
  const char* value = std::getenv("QUENDAL_SWEEP");
  return value && std::string(value) == "full";
}

bool Swept(const CatalogueEntry& entry) {
  const char* only = std::getenv("QUENDAL_SWEEP_CLASS");
  return !only || !*only || entry.className == only;
}

SweepDay::SweepDay() {
  if (const char* config = std::getenv("XDG_CONFIG_HOME")) previousConfig_ = config;
  // Every label class prints: the settings store is the sweep's own, empty.
  setenv("XDG_CONFIG_HOME", (temp_ / "config").c_str(), 1);
  const DateTime now = DateTime::FromParts(2026, 3, 16, 14, 30, 0);
  SetNow(now);
  const cli::DemoData data = cli::BuildDemoData(kDataRoot, now);

  const std::string database = temp_ / "day.db";
  {
    auto host = mvserver::SqliteHost::Open(database);
    host->Import(data.document.dump());
    for (auto id : host->Keys("ConNote")) {
      auto conNote = host->Find<host::ConNote>("ConNote", id);
      carriers_[conNote->Carrier()->Name().Text()].conNotes.push_back(id);
    }
  }
  day_.database = Slurp(database);
  for (const auto& c : data.carriers) {
    CarrierDay& day = carriers_[c.name];
    day.ediDocument = static_cast<std::int16_t>(c.ediDocumentId);
    day.printer = c.printer;
    day.folder = fs::path(c.folder).lexically_relative(kDataRoot).string();
    if (!day.folder.ends_with("/")) day.folder += "/";
    printers_.push_back(c.printer);
    // Carrier folders exist (empty) in every run, the map files beside them.
    day_.files[std::string(kRootBelowRun) + "/" +
               fs::path(c.outputFolder).lexically_relative(kDataRoot).string() + "/.keep"] = "";
    day_.files[std::string(kRootBelowRun) + "/" + day.folder + ".keep"] = "";
  }
  for (const auto& f : data.files)
    day_.files[std::string(kRootBelowRun) + "/" +
               fs::path(f.path).lexically_relative(kDataRoot).string()] = f.text;
  printers_.push_back(data.documentPrinter);
}

SweepDay::~SweepDay() {
  SetNow(std::nullopt);
  if (previousConfig_.empty())
    unsetenv("XDG_CONFIG_HOME");
  else
    setenv("XDG_CONFIG_HOME", previousConfig_.c_str(), 1);
}

std::string SweepDay::CarrierFolder(const CatalogueEntry& entry) const {
  auto it = carriers_.find(std::string(entry.carrier));
  return it == carriers_.end() ? std::string()
                               : std::string(kRootBelowRun) + "/" + it->second.folder;
}

const SweepDay::Seed& SweepDay::SeedOf(const CatalogueEntry& entry) {
  auto it = seeds_.find(std::string(entry.className));
  if (it != seeds_.end()) return it->second;
  Seed seed = day_;
  if (entry.family == Family::Consignment) {
    // The day file already holds the carrier's first consignment.
    Sweep sweep;
    RunIn(entry, sweep, day_, false);
    const fs::path run = temp_ / ("run-" + std::to_string(runNumber_));
    seed.database = Slurp(run / "host.db");
    seed.files = Snapshot(run);
    fs::remove_all(run);
  }
  return seeds_.emplace(std::string(entry.className), std::move(seed)).first->second;
}

Outcome SweepDay::Run(const CatalogueEntry& entry, Sweep& sweep) {
  const Seed& seed = SeedOf(entry);
  Outcome outcome = RunIn(entry, sweep, seed, true);
  fs::remove_all(temp_ / ("run-" + std::to_string(runNumber_)));
  return outcome;
}

Outcome SweepDay::RunIn(const CatalogueEntry& entry, Sweep& sweep, const Seed& seed, bool second) {
  Outcome outcome;
  const fs::path run = temp_ / ("run-" + std::to_string(++runNumber_));
  for (const auto& [path, bytes] : seed.files) Spill(run / path, bytes);
  Spill(run / "host.db", seed.database);
  sweep.MoveRoot(kDataRoot, (run / kRootBelowRun).string());

  const std::string carrierName(entry.carrier);
  const CarrierDay& carrier =
      carriers_.count(carrierName) ? carriers_.at(carrierName) : carriers_.begin()->second;
  const std::int64_t conNoteId = second ? carrier.conNotes.back() : carrier.conNotes.front();

  auto host = mvserver::SqliteHost::Open((run / "host.db").string());
  const std::int64_t lastLog = host->LastLogId();
  auto previousLibrary = host::RegisterLibrary(std::make_shared<SweepLibrary>(host, sweep));
  auto spooler = std::make_shared<MemorySpooler>();
  for (const auto& printer : printers_) spooler->AddPrinter(printer);
  auto previousSpooler = SetSpooler(spooler);
  auto prompt = std::make_shared<ScriptedPrompt>();
  {
    PromptScope scope(prompt);
    // A file written where no folder points lands in the run's folder, where
    // the check sees it as a file outside the carrier folder.
    WorkingDirectory cwd((run / "cwd").string());
    // The caller's own reads go to the host directly, so that only the class's reads are swept.
    const auto conNote = host->Find<host::ConNote>("ConNote", conNoteId);
    const Ref<host::PackList> packs = conNote->Packs();
    const Ref<host::Pack> firstPack = packs->Count() > 0 ? packs->Item(1) : Ref<host::Pack>();
    try {
      Created created = CreateObject(entry.Identifier());
      if (!created.object) throw std::runtime_error(created.reason);
      const auto system = sweep.Wrap(host->System());
      if (auto* labels = as<LabelInterface>(created.object)) {
        labels->Init(system, carrier.printer);
        labels->PrintLabel(sweep.Wrap(firstPack));
      } else if (auto* consignment = as<ConsignmentInterface>(created.object)) {
        LogList vtErrorLog;
        consignment->Process(system, sweep.Wrap(conNote),
                             sweep.Wrap(firstPack ? firstPack->ASN() : Ref<host::ASN>()),
                             sweep.Wrap(packs), vtErrorLog);
        consignment->Term();
      } else if (auto* rows = as<RowInterface>(created.object)) {
        Grid columns, grid;
        LogList vtErrorLog;
        rows->Init(system, carrier.ediDocument, columns);
        rows->Load({}, grid);
        for (std::size_t r = 0; r < grid.Rows(); ++r)
          rows->Process(static_cast<std::int32_t>(r), vtErrorLog);
        rows->Term();
      }
    } catch (const std::exception& e) {
      outcome.escaped = e.what();
      if (outcome.escaped.empty()) outcome.escaped = "an exception";
    } catch (...) {
      outcome.escaped = "an exception";
    }
  }
  sweep.Forget();
  SetSpooler(previousSpooler);
  host::RegisterLibrary(previousLibrary);
  for (const auto& log : host->LogsSince(lastLog)) outcome.logs.push_back(log->Message().Text());
  outcome.prompts = prompt->messages;
  outcome.jobs = spooler->jobs;
  host.reset();
  outcome.files = Snapshot(run);
  return outcome;
}

std::vector<std::string> SweepDay::Check(const CatalogueEntry& entry, const Outcome& clean,
                                         const Outcome& run, bool sameShape) const {
  std::vector<std::string> faults;
  if (!run.escaped.empty()) faults.push_back("escaped to the host: " + Printable(run.escaped));
  const std::string folder = CarrierFolder(entry);
  const auto seed = seeds_.find(std::string(entry.className));
  for (const auto& [path, text] : run.files) {
    if (path.ends_with(".keep") || Extension(path) == ".map") continue;
    if (folder.empty() || !path.starts_with(folder)) {
      faults.push_back("a file outside the carrier folder: " + Printable(path));
      continue;
    }
    // A file appended to keeps what it held (when the clean run keeps it too:
    // files with a trailer are rewritten).
    if (seed != seeds_.end())
      if (auto before = seed->second.files.find(path); before != seed->second.files.end())
        if (auto after = clean.files.find(path);
            after != clean.files.end() && after->second.starts_with(before->second))
          if (!text.starts_with(before->second))
            faults.push_back(path + ": what the file held was changed");
    // The clean run's file of the same kind gives the shape.
    const std::string* model = nullptr;
    if (auto same = clean.files.find(path); same != clean.files.end()) model = &same->second;
    for (const auto& [cleanPath, cleanText] : clean.files)
      if (!model && Extension(cleanPath) == Extension(path) && cleanPath.starts_with(folder))
        model = &cleanText;
    if (!model) continue;
    for (auto& f : FileFaults(path, text, ShapeOf(path, *model))) faults.push_back(Printable(f));
  }
  // A run that leaves out what the clean run wrote or printed says why: in
  // the log, or in an error report.
  const FileMap& before = seed != seeds_.end() ? seed->second.files : day_.files;
  const auto wrote = [&](const Outcome& outcome) {
    for (const auto& [path, text] : outcome.files) {
      if (fs::path(path).filename().string().starts_with(".")) continue;
      const auto it = before.find(path);
      if (it == before.end() || it->second != text) return true;
    }
    return false;
  };
  // Whether a consignment carries dangerous goods is read from data the
  // sweep makes Null, so a declaration may rightly be left out.
  const auto documents = [](const Outcome& outcome) {
    return std::count_if(outcome.jobs.begin(), outcome.jobs.end(), [](const auto& job) {
      return !job.document.starts_with("DANGEROUS GOODS SHIPPING/TRANSPORT DOCUMENT");
    });
  };
  if (((wrote(clean) && !wrote(run)) || documents(run) < documents(clean)) &&
      run.prompts.empty()) {
    const std::multiset<std::string> cleanLogs(clean.logs.begin(), clean.logs.end());
    const bool said = std::any_of(run.logs.begin(), run.logs.end(), [&](const std::string& log) {
      return !cleanLogs.contains(log);
    });
    if (!said) {
      std::string logs;
      for (const auto& log : run.logs) logs += " / " + log;
      faults.push_back("left out what the clean run wrote or printed, and said nothing (jobs " +
                       std::to_string(run.jobs.size()) + " of " + std::to_string(clean.jobs.size()) +
                       "; files " + (wrote(run) ? "written" : "not written") + "; log" +
                       Printable(logs) + ")");
    }
  }
  for (const auto& job : run.jobs)
    if (!job.bytes.starts_with("%PDF"))
      for (auto& f : StreamFaults(job)) faults.push_back(f);
  if (sameShape && run.jobs.size() == clean.jobs.size())
    for (std::size_t i = 0; i < run.jobs.size(); ++i) {
      // Label streams only: printed documents are PDF pages.
      const std::string& model = clean.jobs[i].bytes;
      if (model.starts_with("%PDF") || !(IsVpcl(model) || IsZpl(model))) continue;
      const std::string before = StreamShape(clean.jobs[i].bytes),
                        after = StreamShape(run.jobs[i].bytes);
      if (before == after) continue;
      std::size_t at = 0;
      while (at < before.size() && at < after.size() && before[at] == after[at]) ++at;
      faults.push_back("job " + run.jobs[i].document + ": the stream's structure changed after " +
                       Printable(before.substr(at > 12 ? at - 12 : 0, 40)) + " / " +
                       Printable(after.substr(at > 12 ? at - 12 : 0, 40)));
    }
  return faults;
}

}  // namespace quendal::test
