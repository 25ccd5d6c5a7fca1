#include "cli/Layouts.h"

#include <stdlib.h>

#include <algorithm>
#include <filesystem>
#include <ostream>

#include "carrierfiles/Layout.h"
#include "cli/Cli.h"
#include "cli/DemoData.h"
#include "cli/Work.h"
#include "frame/Catalogue.h"
#include "mvserver/SqliteHost.h"
#include "platform/Clock.h"
#include "platform/CodePage.h"
#include "platform/FileSystem.h"

namespace quendal::cli {

namespace fs = std::filesystem;

namespace {

// The class name without the "Quendal." prefix, when it has a shipped layout.
std::string LayoutClass(std::string name) {
  if (name.starts_with("Quendal.")) name.erase(0, 8);
  if (DefaultLayout(name).empty()) {
    std::string known;
    for (std::string_view c : DefaultLayoutClasses()) known += (known.empty() ? "" : ", ") + std::string(c);
    throw UsageError("no layout for " + name + "; the classes laid out by layout files are " + known);
  }
  return name;
}

// A scratch folder removed again when the check ends.
class Scratch {
 public:
  Scratch() {
    std::string pattern = (fs::temp_directory_path() / "quendal-layout-XXXXXX").string();
    if (!mkdtemp(pattern.data())) throw OpenFailure("cannot make a scratch folder in " + fs::temp_directory_path().string());
    path_ = pattern;
  }
  ~Scratch() {
    std::error_code ec;
    fs::remove_all(path_, ec);
  }
  const std::string& Path() const { return path_; }

 private:
  std::string path_;
};

// The host library for the check, put back when it ends.
struct LibraryScope {
  explicit LibraryScope(std::shared_ptr<host::Library> library) : previous(host::RegisterLibrary(std::move(library))) {}
  ~LibraryScope() { host::RegisterLibrary(previous); }
  std::shared_ptr<host::Library> previous;
};

}  // namespace

int LayoutShow(const std::string& className, std::ostream& out, bool asJson) {
  const std::string name = LayoutClass(className);
  const std::string_view text = DefaultLayout(name);
  if (asJson)
    out << json({{"class", name}, {"layout", std::string(text)}}).dump(2) << "\n";
  else
    out << text;
  return 0;
}

int LayoutCheck(const std::string& file, std::string className, std::ostream& out, bool asJson) {
  if (className.empty()) className = fs::path(file).stem().string();
  const std::string name = LayoutClass(className);
  if (!FileExists(file)) throw OpenFailure("cannot open " + file);
  const std::optional<std::string> bytes = ReadFileHead(file, kLayoutFileLimit + 1);
  if (!bytes) throw OpenFailure("cannot read " + file);
  const LayoutRead read = ReadLayout(*bytes);
  if (!read.layout) throw UsageError(ProblemText(file, read.problem));

  // A sample day in a scratch database; the class writes into its carrier's folder there.
  Scratch scratch;
  const DemoData data = BuildDemoData(scratch.Path(), Now());
  const CatalogueEntry* entry = FindClass(name);
  const auto carrier = std::find_if(data.carriers.begin(), data.carriers.end(),
                                    [&](const DemoCarrier& c) { return c.name == entry->carrier; });
  if (carrier == data.carriers.end()) throw UsageError("no sample consignment for " + name);
  fs::create_directories(carrier->folder);
  if (WriteNewFile(carrier->folder + name + ".layout", *bytes) != NewFile::Written)
    throw OpenFailure("cannot write to the scratch folder " + scratch.Path());

  std::shared_ptr<mvserver::SqliteHost> host;
  try {
    host = mvserver::SqliteHost::Open(scratch.Path() + "/sample.db");
  } catch (const mvserver::OpenError& e) {
    throw OpenFailure(e.what());
  }
  host->Import(data.document.dump());
  LibraryScope scope(host);
  const std::int64_t lastLog = host->LastLogId();
  Ref<host::ConNote> sample;
  for (auto id : host->Keys("ConNote")) {
    auto conNote = host->Find<host::ConNote>("ConNote", id);
    if (conNote->Carrier()->Name().Text() == entry->carrier) {
      sample = conNote;
      break;
    }
  }
  if (!sample) throw UsageError("no sample consignment for " + name);

  Created created = CreateObject(entry->Identifier());
  if (!created.object) throw UsageError(created.reason);
  if (auto* consignment = as<ConsignmentInterface>(created.object)) {
    Despatch(*consignment, host->System(), sample);
  } else if (auto* rows = as<RowInterface>(created.object)) {
    // The first row of a run; Term is left out, as it would print the day's summary.
    Grid columns;
    Grid grid;
    LogList log;
    if (rows->Init(host->System(), static_cast<std::int16_t>(carrier->ediDocumentId), columns) &&
        rows->Load("", grid) > 0)
      rows->Process(0, log);
  }

  json written = json::array();
  for (const auto& item : fs::directory_iterator(carrier->folder)) {
    const std::string writtenName = item.path().filename().string();
    if (writtenName.starts_with(".") || writtenName.ends_with(".layout")) continue;
    const std::string text = FromCodePage(ReadFile(item.path().string()).value_or(""));
    written.push_back({{"file", writtenName}, {"text", text}});
  }
  const auto logs = host->LogsSince(lastLog);
  if (asJson) {
    out << json({{"file", file}, {"class", name}, {"valid", true}, {"sample", sample->ConNoteNo().Text()},
                 {"written", written}, {"log", LogsJson(logs)}})
               .dump(2)
        << "\n";
    return 0;
  }
  out << file << ": a sound layout for " << name << " ("
      << (read.layout->delimited ? "delimited" : "fixed width") << ", " << read.layout->records.size()
      << " records)\n";
  out << "Sample consignment " << sample->ConNoteNo().Text() << " with " << sample->Packs()->Count()
      << " packs, as " << name << " writes it:\n";
  for (const auto& w : written) {
    out << "--- " << w["file"].get<std::string>() << "\n";
    std::string text = w["text"];
    for (std::size_t at; (at = text.find("\r\n")) != std::string::npos;) text.erase(at, 1);
    out << text;
  }
  if (written.empty()) out << "(nothing written)\n";
  PrintLogs(out, logs);
  return 0;
}

}  // namespace quendal::cli
