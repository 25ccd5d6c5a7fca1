// quendal: the command line over the library and the reference host.
//
// Exit status: 0 when the command ran (whatever the component returned,
// which is printed), 1 on bad usage or bad input (one line saying why), 2
// when the database or a file can't be opened.
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <sstream>

#include "cli/Cli.h"
#include "cli/Demo.h"
#include "cli/Layouts.h"
#include "cli/Gallery.h"
#include "cli/Prompt.h"
#include "cli/Work.h"
#include "frame/VB.h"
#include "labels/Preview.h"
#include "mvserver/SqliteHost.h"
#include "platform/FileSystem.h"
#include "platform/Clock.h"
#include "platform/CupsSpooler.h"
#include "platform/DirectorySpooler.h"
#include "platform/Settings.h"

namespace quendal::cli {
namespace {

struct Options {
  std::string db = "./quendal.db";
  std::string now;
  std::string spool = "./spool";
  bool cups = false;
  std::string onError;
  bool json = false;

  std::string file;
  std::int64_t since = 0;
  std::string className;
  std::string value;
  std::vector<std::int64_t> packs;
  std::int64_t conNote = 0;
  std::string printer;
  std::int16_t qty = 0;
  std::string language;
  std::int16_t ediDoc = 0;
  std::string rows = "all";
  std::string out = "./quendal-demo";
  std::string from;
  std::string to;
  std::string vendor;
  std::string carrier;
  std::string html;
  std::int16_t reportOption = 1;

  std::string message;
  std::int64_t job = 0;
  std::string orderNo;
  std::string apn;
  std::int32_t line = 0;
  std::vector<std::string> jobs;
  std::string previewOut;
  int dpi = 0;
  GalleryOptions gallery;
};

// A run shows its progress on a terminal once it has more rows than this.
constexpr std::size_t kProgressRows = 200;

// What System.LastError tells after PackLineValid.
std::string PackLineMeaning(int code) {
  switch (code) {
    case 0:
      return "the article may be packed";
    case 8101:
      return "the packing slip could not be examined";
    case 8102:
      return "no line of the slip carries the article";
    case 8103:
      return "the quantity would exceed the article's lines";
    case 8106:
      return "the pack does not belong to the packing slip";
    default:
      return "unknown code";
  }
}

// A message typed on the command line: a line break, or the two characters
// \n, separates its lines, which the label classes receive as CR LF.
std::string MessageLines(const std::string& text) {
  std::string lines = Replace(Replace(text, "\\n", "\n"), "\r\n", "\n");
  return Replace(lines, "\n", "\r\n");
}

class Command {
 public:
  explicit Command(Options& o) : o_(o) {}

  mvserver::SqliteHost& Host() {
    if (!host_) {
      try {
        host_ = mvserver::SqliteHost::Open(o_.db);
      } catch (const mvserver::OpenError& e) {
        throw OpenFailure(e.what());
      }
      host::RegisterLibrary(host_);
    }
    return *host_;
  }

  void Emit(const json& result, const std::function<void()>& text) {
    if (o_.json)
      std::cout << result.dump(2) << "\n";
    else
      text();
  }

  int Classes() {
    json list = json::array();
    std::vector<std::vector<std::string>> rows;
    int built = 0;
    for (const auto& entry : Catalogue()) {
      const bool ready = entry.factory != nullptr;
      built += ready ? 1 : 0;
      list.push_back({{"identifier", entry.Identifier()}, {"family", FamilyName(entry.family)},
                      {"carrier", entry.carrier}, {"fileOrRetailer", entry.retailerOrFile}, {"built", ready}});
      rows.push_back({entry.Identifier(), std::string(FamilyName(entry.family)), std::string(entry.carrier),
                      std::string(entry.retailerOrFile), ready ? "yes" : "not yet"});
    }
    Emit({{"classes", list}, {"built", built}, {"total", list.size()}}, [&] {
      PrintTable(std::cout, {"Identifier", "Family", "Carrier", "File/retailer", "Built"}, rows);
      std::cout << built << " of " << list.size() << " classes built\n";
    });
    return 0;
  }

  int Import() {
    std::ifstream in(o_.file, std::ios::binary);
    if (!in) throw OpenFailure("cannot read " + o_.file);
    std::ostringstream text;
    text << in.rdbuf();
    mvserver::ImportSummary summary;
    try {
      summary = Host().Import(text.str());
    } catch (const mvserver::ImportError& e) {
      throw UsageError(o_.file + ": " + e.what());
    }
    json records = json::object();
    for (const auto& [collection, count] : summary.records) records[collection] = count;
    Emit({{"database", o_.db}, {"file", o_.file}, {"records", records}, {"total", summary.total}}, [&] {
      std::cout << "Imported " << summary.total << " records from " << o_.file << " into " << o_.db;
      std::string sep = ": ";
      for (const auto& [collection, count] : summary.records) {
        std::cout << sep << collection << " " << count;
        sep = ", ";
      }
      std::cout << "\n";
    });
    return 0;
  }

  int Log() {
    if (o_.since < 0) throw UsageError("--since takes a log id (0 or more)");
    const auto logs = Host().LogsSince(o_.since);
    Emit({{"entries", LogsJson(logs)}}, [&] { PrintLogs(std::cout, logs); });
    return 0;
  }

  int Settings(bool set) {
    const CatalogueEntry* entry = FindClass(o_.className);
    if (!entry) throw UsageError("no class " + o_.className + " in the catalogue (see quendal classes)");
    const std::string key(entry->className);
    if (set) {
      // The classes read the switch as a flag; refuse what they could not read.
      try {
        TextToFlag(o_.value);
      } catch (const std::exception&) {
        throw UsageError("the printing switch takes True, False or a number, not \"" + o_.value + "\"");
      }
      if (!SaveSetting("Merivane", "Settings", key, o_.value))
        throw OpenFailure("cannot write " + SettingsPath("Merivane"));
    }
    const std::string value = GetSetting("Merivane", "Settings", key, "True");
    Emit({{"class", entry->Identifier()}, {"key", key}, {"value", value}},
         [&] { std::cout << entry->Identifier() << ": " << value << "\n"; });
    return 0;
  }

  Ref<host::System> System() {
    Ref<host::System> system = Host().System();
    if (!o_.language.empty()) system = OverrideSystem(system, "PrinterLanguage", Var(o_.language));
    return system;
  }

  Ref<host::ConNote> ConNote(std::int64_t id) {
    auto conNote = Host().Find<host::ConNote>("ConNote", id);
    if (!conNote) throw UsageError("no consignment " + std::to_string(id) + " in " + o_.db);
    return conNote;
  }

  int Label() {
    const CatalogueEntry& entry = BuiltClass(o_.className, Family::Label);
    if (o_.packs.empty() == (o_.conNote == 0)) throw UsageError("label needs --pack ID ... or --connote ID");
    std::vector<Ref<host::Pack>> packs;
    for (auto id : o_.packs) {
      auto pack = Host().Find<host::Pack>("Pack", id);
      if (!pack) throw UsageError("no pack " + std::to_string(id) + " in " + o_.db);
      packs.push_back(pack);
    }
    if (o_.conNote) {
      const Ref<host::PackList> list = ConNote(o_.conNote)->Packs();
      for (auto pack : *list) packs.push_back(pack);
    }
    const std::int64_t lastLog = Host().LastLogId();
    LabelInterface* labels = nullptr;
    auto object = Create(entry, labels);
    const auto qty = o_.qty ? std::optional<std::int16_t>(o_.qty) : std::nullopt;
    const LabelRun run = PrintLabels(*labels, System(), o_.printer, packs, qty);
    const auto logs = Host().LogsSince(lastLog);
    json results = json::array();
    for (const auto& [pack, printed] : run.labels) results.push_back({{"pack", pack}, {"printed", printed}});
    Emit({{"class", entry.Identifier()}, {"printer", o_.printer}, {"init", run.init}, {"labels", results},
          {"log", LogsJson(logs)}},
         [&] {
           std::cout << entry.Identifier() << " Init(\"" << o_.printer << "\"): " << (run.init ? "True" : "False") << "\n";
           for (const auto& [pack, printed] : run.labels)
             std::cout << "PrintLabel pack " << pack << ": " << (printed ? "True" : "False") << "\n";
           PrintLogs(std::cout, logs);
         });
    return 0;
  }

  int Separator() {
    const CatalogueEntry& entry = BuiltClass(o_.className, Family::Label);
    const std::int64_t lastLog = Host().LastLogId();
    LabelInterface* labels = nullptr;
    auto object = Create(entry, labels);
    // Init without a printer: the separator needs no label format on it.
    const bool init = labels->Init(System());
    const bool printed = labels->Separator(o_.printer, MessageLines(o_.message));
    const auto logs = Host().LogsSince(lastLog);
    Emit({{"class", entry.Identifier()}, {"printer", o_.printer}, {"init", init}, {"separator", printed},
          {"log", LogsJson(logs)}},
         [&] {
           std::cout << entry.Identifier() << " Separator(\"" << o_.printer
                     << "\"): " << (printed ? "True" : "False") << "\n";
           PrintLogs(std::cout, logs);
         });
    return 0;
  }

  int Pdt() {
    const CatalogueEntry& entry = BuiltClass(o_.className, Family::Label);
    auto job = Host().Find<host::Job>("Job", o_.job);
    if (!job) throw UsageError("no job " + std::to_string(o_.job) + " in " + o_.db);
    const std::int64_t lastLog = Host().LastLogId();
    LabelInterface* labels = nullptr;
    auto object = Create(entry, labels);
    const auto system = System();
    labels->Init(system);
    // Every order's packing slip, line by line.
    json lines = json::array();
    for (auto id : Host().Keys("Order")) {
      const auto order = Host().Find<host::Order>("Order", id);
      const Ref<host::SlipLines> slip = order->SlipLines();
      for (auto line : *slip)
        lines.push_back({{"order", VarJson(order->OrderNo())}, {"lineNo", VarJson(line->LineNo())},
                         {"line", labels->PDTLookupLine(job, line)}});
    }
    const auto logs = Host().LogsSince(lastLog);
    const std::string type = system->PDTType().Text();
    Emit({{"class", entry.Identifier()}, {"job", o_.job}, {"pdtType", type},
          {"fieldLengths", labels->PDTFieldLength()}, {"lines", lines}, {"log", LogsJson(logs)}},
         [&] {
           std::cout << entry.Identifier() << " PDTLookupLine, job " << o_.job << ", PDT type \"" << type
                     << "\" (field widths " << labels->PDTFieldLength() << ")\n";
           for (const auto& l : lines)
             std::cout << "order " << (l["order"].is_string() ? l["order"].get<std::string>() : l["order"].dump())
                       << " line " << l["lineNo"].dump() << ": \"" << l["line"].get<std::string>() << "\"\n";
           PrintLogs(std::cout, logs);
         });
    return 0;
  }

  int PackLine() {
    const CatalogueEntry& entry = BuiltClass(o_.className, Family::Label);
    const std::int64_t lastLog = Host().LastLogId();
    LabelInterface* labels = nullptr;
    auto object = Create(entry, labels);
    labels->Init(System());
    std::int16_t error = 0;
    const Var line = labels->PackLineValid(Var(o_.orderNo), Var(o_.packs.front()), Var(o_.apn),
                                           o_.qty ? Var(o_.qty) : Var(), &error, o_.line);
    const auto logs = Host().LogsSince(lastLog);
    Emit({{"class", entry.Identifier()}, {"order", o_.orderNo}, {"pack", o_.packs.front()}, {"apn", o_.apn},
          {"qty", o_.qty ? o_.qty : 1}, {"lineNo", VarJson(line)}, {"lastError", error},
          {"meaning", PackLineMeaning(error)}, {"log", LogsJson(logs)}},
         [&] {
           std::cout << entry.Identifier() << " PackLineValid(order " << o_.orderNo << ", pack "
                     << o_.packs.front() << ", APN " << o_.apn << ", qty " << (o_.qty ? o_.qty : 1)
                     << "): line " << VarText(line) << ", LastError " << error << " ("
                     << PackLineMeaning(error) << ")\n";
           PrintLogs(std::cout, logs);
         });
    return 0;
  }

  int Preview() {
    namespace fs = std::filesystem;
    // The printer's resolution and label from the printer.ini beside the
    // first job (a printer folder of the directory spooler), else 203 dpi
    // and 4 x 6 inches.
    preview::Settings settings;
    const fs::path first = fs::absolute(o_.jobs.front());
    if (FileExists((first.parent_path() / "printer.ini").string())) {
      const DirectorySpooler folder(first.parent_path().parent_path().string());
      const std::string name = first.parent_path().filename().string();
      settings = {folder.Dpi(name), folder.PageWidthMm(name), folder.PageHeightMm(name)};
    }
    if (o_.dpi) settings.dpi = o_.dpi;
    if (!o_.previewOut.empty() && !CreateFolder(o_.previewOut))
      throw OpenFailure("cannot create " + o_.previewOut);
    preview::Printer printer(settings);
    json jobs = json::array();
    for (const std::string& path : o_.jobs) {
      const auto bytes = ReadFile(path);
      if (!bytes) throw OpenFailure("cannot read " + path);
      const preview::Result result = printer.Print(*bytes);
      const fs::path job(path);
      const fs::path folder = o_.previewOut.empty() ? job.parent_path() : fs::path(o_.previewOut);
      json pages = json::array();
      for (std::size_t i = 0; i < result.pages.size(); ++i) {
        const std::string name = "preview-" + job.stem().string() +
                                 (i == 0 ? std::string() : "-" + std::to_string(i + 1)) + ".png";
        const std::string out = (folder / name).string();
        if (!ReplaceFile(out, result.pages[i].png)) throw OpenFailure("cannot write " + out);
        pages.push_back({{"file", out}, {"width", result.pages[i].width}, {"height", result.pages[i].height}});
      }
      jobs.push_back({{"job", path}, {"pages", pages}, {"notes", result.notes}});
    }
    Emit({{"dpi", settings.dpi}, {"jobs", jobs}}, [&] {
      for (const auto& j : jobs) {
        std::cout << j["job"].get<std::string>() << ": " << j["pages"].size() << " label"
                  << (j["pages"].size() == 1 ? "" : "s") << " at " << settings.dpi << " dpi\n";
        for (const auto& page : j["pages"])
          std::cout << "  " << page["file"].get<std::string>() << " (" << page["width"] << " x "
                    << page["height"] << " pixels)\n";
        for (const auto& note : j["notes"]) std::cout << "  note: " << note.get<std::string>() << "\n";
      }
    });
    return 0;
  }

  int Gallery() { return RunGallery(Host(), o_.gallery, std::cout, o_.json); }

  int Despatch() {
    const CatalogueEntry& entry = BuiltClass(o_.className, Family::Consignment);
    auto conNote = ConNote(o_.conNote);
    const std::int64_t lastLog = Host().LastLogId();
    ConsignmentInterface* consignment = nullptr;
    auto object = Create(entry, consignment);
    const LogList vtErrorLog = cli::Despatch(*consignment, System(), conNote);
    const auto logs = Host().LogsSince(lastLog);
    Emit({{"class", entry.Identifier()}, {"connote", o_.conNote}, {"vtErrorLog", vtErrorLog},
          {"log", LogsJson(logs)}},
         [&] {
           std::cout << entry.Identifier() << " Process consignment " << o_.conNote << ": vtErrorLog (";
           for (std::size_t i = 0; i < vtErrorLog.size(); ++i) std::cout << (i ? ", " : "") << vtErrorLog[i];
           std::cout << ")\n";
           PrintLogs(std::cout, logs);
         });
    return 0;
  }

  std::optional<std::vector<std::int32_t>> ChosenRows() {
    if (o_.rows == "all") return std::nullopt;
    std::vector<std::int32_t> rows;
    std::stringstream list(o_.rows);
    std::string item;
    while (std::getline(list, item, ',')) {
      const std::string t = Trim(item);
      if (t.empty() || t.size() > 9 || t.find_first_not_of("0123456789") != std::string::npos)
        throw UsageError("--rows takes all or row numbers N,N,... (from 0), not \"" + o_.rows + "\"");
      rows.push_back(std::stoi(t));
    }
    if (rows.empty()) throw UsageError("--rows takes all or row numbers N,N,... (from 0)");
    return rows;
  }

  int Manifest() {
    const CatalogueEntry& entry = BuiltClass(o_.className, Family::Rows);
    const auto chosen = ChosenRows();
    if (!Host().Find("EDIDocument", o_.ediDoc))
      throw UsageError("no EDI document " + std::to_string(o_.ediDoc) + " in " + o_.db);
    const std::int64_t lastLog = Host().LastLogId();
    RowInterface* rows = nullptr;
    auto object = Create(entry, rows);
    // Progress goes to a person watching a long run, never into output a program reads.
    Progress progress;
    if (!o_.json && isatty(STDERR_FILENO)) {
      progress = [show = TerminalProgress(std::cerr)](std::size_t done, std::size_t total) {
        if (total > kProgressRows) show(done, total);
      };
    }
    const RowRun run = RunRows(*rows, System(), o_.ediDoc, chosen, progress);
    const auto logs = Host().LogsSince(lastLog);
    json processed = json::array();
    for (const auto& [row, result] : run.processed) processed.push_back({{"row", row}, {"result", result}});
    Emit({{"class", entry.Identifier()}, {"ediDocument", o_.ediDoc}, {"init", run.init},
          {"columns", GridJson(run.columns)}, {"loaded", run.loaded}, {"rows", GridJson(run.rows)},
          {"processed", processed}, {"term", run.term}, {"vtErrorLog", run.vtErrorLog}, {"log", LogsJson(logs)}},
         [&] {
           std::cout << entry.Identifier() << " Init(EDI document " << o_.ediDoc
                     << "): " << (run.init ? "True" : "False") << "\nLoad: " << run.loaded << " rows\n";
           PrintGrid(std::cout, run.columns, run.rows);
           for (const auto& [row, result] : run.processed)
             std::cout << "Process row " << row << ": " << result << "\n";
           std::cout << "Term: " << (run.term ? "True" : "False") << "\n";
           PrintLogs(std::cout, logs);
         });
    return 0;
  }

  // A date as the host takes it; UsageError for anything else.
  std::string DateArgument(const std::string& option, const std::string& text) {
    try {
      Var(text).Date();
    } catch (const std::exception&) {
      throw UsageError(option + " takes a date, YYYY-MM-DD or dd/mm/yyyy, not \"" + text + "\"");
    }
    return text;
  }

  int Report() {
    const CatalogueEntry& entry = BuiltClass(o_.className, Family::Rows);
    const std::string from = DateArgument("--from", o_.from);
    const std::string to = DateArgument("--to", o_.to);
    if (o_.ediDoc != 0 && !Host().Find("EDIDocument", o_.ediDoc))
      throw UsageError("no EDI document " + std::to_string(o_.ediDoc) + " in " + o_.db);
    const std::int64_t lastLog = Host().LastLogId();
    RowInterface* rows = nullptr;
    auto object = Create(entry, rows);
    auto* summary = as<ConsolidatedManifestInterface>(object);
    if (!summary) throw UsageError(entry.Identifier() + " does not print the consolidated manifest");
    // Init gives the class the System (and, with an EDI document, its run's records).
    Grid columns;
    rows->Init(System(), o_.ediDoc, columns);
    const std::int16_t result =
        summary->ConsolidatedManifestPrint(from, to, o_.vendor, o_.carrier, o_.reportOption, o_.html);
    const std::string kept = summary->ConsolidatedManifestFile();
    const std::string printer = Host().System()->DocumentPrinter().Text();
    const auto logs = Host().LogsSince(lastLog);
    static constexpr const char* kMeaning[] = {"produced", "the host gave no consignment list",
                                               "no consignments", "not produced"};
    const std::string meaning = result >= 0 && result <= 3 ? kMeaning[result] : "unknown";
    json out = {{"class", entry.Identifier()}, {"from", from}, {"to", to}, {"vendor", o_.vendor},
                {"carrier", o_.carrier}, {"option", o_.reportOption}, {"result", result},
                {"meaning", meaning}, {"log", LogsJson(logs)}};
    if (!kept.empty()) out["kept"] = kept;
    if (result == 0 && kept.empty()) out["printer"] = printer;
    if (!o_.html.empty() && result == 0) out["html"] = o_.html;
    Emit(out, [&] {
      std::cout << entry.Identifier() << " ConsolidatedManifestPrint(" << from << ", " << to << ", "
                << o_.vendor << ", " << o_.carrier << ", " << o_.reportOption << "): " << result
                << " (" << meaning << ")\n";
      if (!kept.empty()) std::cout << "Consignment Summary Print kept in " << kept << "\n";
      if (result == 0 && kept.empty()) std::cout << "Consignment Summary Print sent to printer " << printer << "\n";
      if (!o_.html.empty() && result == 0) std::cout << "HTML copy in " << o_.html << "\n";
      PrintLogs(std::cout, logs);
    });
    return 0;
  }

 private:
  Options& o_;
  std::shared_ptr<mvserver::SqliteHost> host_;
};

int Main(int argc, char** argv) {
  Options o;
  CLI::App app{"Carrier labels, despatch-advice files and manifests on the reference host.", "quendal"};
  app.require_subcommand(1, 1);
  app.fallthrough();
  app.add_option("--db", o.db, "host database (created on first use)")->capture_default_str();
  app.add_option("--now", o.now, "fix the clock: YYYY-MM-DDTHH:MM:SS");
  auto* spoolOption =
      app.add_option("--spool", o.spool, "directory spooler: a printer is a folder in it")->capture_default_str();
  app.add_flag("--cups", o.cups, "print through CUPS: a printer is a CUPS queue")->excludes(spoolOption);
  app.add_option("--on-error", o.onError,
                 "answer to error reports: abort, retry, ignore, or ask (default: ask on a terminal, else abort)")
      ->check(CLI::IsMember({"abort", "retry", "ignore", "ask"}));
  app.add_flag("--json", o.json, "print the result as JSON");

  auto* classes = app.add_subcommand("classes", "the catalogue: identifier, family, carrier, file/retailer, built");
  auto* import = app.add_subcommand("import", "load a host-data JSON document into the database");
  import->add_option("FILE", o.file, "host-data JSON document")->required();
  auto* log = app.add_subcommand("log", "host log entries");
  log->add_option("--since", o.since, "only entries after this log id");
  auto* settings = app.add_subcommand("settings", "the per-class printing switch");
  settings->require_subcommand(1, 1);
  auto* get = settings->add_subcommand("get", "show a class's printing switch (default True)");
  get->add_option("CLASS", o.className, "class name")->required();
  auto* set = settings->add_subcommand("set", "set a class's printing switch");
  set->add_option("CLASS", o.className, "class name")->required();
  set->add_option("VALUE", o.value, "True, False or a number")->required();

  auto* label = app.add_subcommand("label", "Init once, then PrintLabel per pack");
  label->add_option("CLASS", o.className, "label class")->required();
  auto* packOption = label->add_option("--pack", o.packs, "pack ids")->expected(1, -1);
  auto* conNoteOption = label->add_option("--connote", o.conNote, "every pack of this consignment");
  packOption->excludes(conNoteOption);
  label->add_option("--printer", o.printer, "printer name");
  label->add_option("--qty", o.qty, "copies")->check(CLI::Range(1, 32767));
  label->add_option("--language", o.language, "overrides System.PrinterLanguage for this command");

  auto* separator = app.add_subcommand("separator", "Init, then Separator: a separator label between groups of cartons");
  separator->add_option("CLASS", o.className, "label class")->required();
  separator->add_option("--printer", o.printer, "printer name")->required();
  separator->add_option("--message", o.message,
                        "up to five lines; a line break or the two characters \\n separate them")
      ->required();
  separator->add_option("--language", o.language, "overrides System.PrinterLanguage for this command");

  auto* pdt = app.add_subcommand("pdt", "PDTLookupLine of every packing-slip line, for a job");
  pdt->add_option("CLASS", o.className, "label class")->required();
  pdt->add_option("--job", o.job, "job id")->required();

  auto* packline = app.add_subcommand("packline", "PackLineValid: may the article go into the pack?");
  packline->add_option("CLASS", o.className, "label class")->required();
  packline->add_option("--order", o.orderNo, "order number (the packing slip)")->required();
  packline->add_option("--pack", o.packs, "pack id")->required()->expected(1);
  packline->add_option("--apn", o.apn, "the scanned article number")->required();
  packline->add_option("--qty", o.qty, "quantity to pack (default 1)")->check(CLI::Range(1, 32767));
  packline->add_option("--line", o.line, "only this slip line");

  auto* preview = app.add_subcommand("preview", "draw printer jobs (VPCL II, ZPL) as the label printer prints them, as PNG");
  preview->add_option("JOB", o.jobs, "job files, in the order the printer received them")->required();
  preview->add_option("--out", o.previewOut, "folder for the pictures (default: beside each job)");
  preview->add_option("--dpi", o.dpi, "the printer's resolution (default: its printer.ini, else 203)")
      ->check(CLI::Range(50, 2400));

  auto* gallery = app.add_subcommand(
      "gallery", "a picture of every built label class's label, as its label printer prints it (PNG)");
  gallery->add_option("--out", o.gallery.out, "folder for the pictures, one <class>.png each")
      ->capture_default_str();
  gallery->add_option("--dpi", o.gallery.dpi, "the printer's resolution")
      ->capture_default_str()
      ->check(CLI::Range(50, 2400));
  gallery->add_option("--readme", o.gallery.readme,
                      "a Markdown file whose <!-- gallery --> ... <!-- /gallery --> block gets the pictures' table");
  gallery->footer(
      "Each class prints the first carton of its carrier's first consignment in the database (the demo "
      "day's: scripts/gallery makes it) on a VPCL II printer; the last label of its jobs is drawn.");

  auto* despatch = app.add_subcommand("despatch", "Process(System, ConNote, ASN of its first pack, its packs)");
  despatch->add_option("CLASS", o.className, "consignment class")->required();
  despatch->add_option("--connote", o.conNote, "consignment id")->required();

  auto* manifest = app.add_subcommand("manifest", "Init, Load, Process the rows, Term");
  manifest->add_option("CLASS", o.className, "row class")->required();
  manifest->add_option("--edi-doc", o.ediDoc, "EDI document id")->required();
  manifest->add_option("--rows", o.rows, "all, or row numbers from 0: N,N,...")->capture_default_str();
  manifest->footer("On a terminal, a run of more than " + std::to_string(kProgressRows) +
                   " rows shows its progress (rows done of rows) on stderr; with --json or "
                   "without a terminal it shows none.");

  auto* report = app.add_subcommand(
      "report", "ConsolidatedManifestPrint: the consignment summary of a vendor and carrier's days");
  report->footer(
      "Prints the \"Consignment Summary Print\" of the consignments dated FROM to TO (both "
      "included). A class that sums up its own manifest has nothing to list here (result 2): its "
      "summary comes with `quendal manifest`. Results: 0 produced, 1 the host gave no consignment "
      "list, 2 no consignments, 3 not produced.");
  report->add_option("--class", o.className, "row class that prints the summary")->required();
  report->add_option("--from", o.from, "first day: YYYY-MM-DD or dd/mm/yyyy")->required();
  report->add_option("--to", o.to, "last day, included")->required();
  report->add_option("--vendor", o.vendor, "vendor code (or id)")->required();
  report->add_option("--carrier", o.carrier, "carrier code (or id)")->required();
  report->add_option("--html", o.html, "also write the summary as HTML to this file");
  report
      ->add_option("--option", o.reportOption,
                   "1 prints on the System's document printer; 0 or 2 keep the PDF and say where")
      ->check(CLI::Range(0, 32767))
      ->capture_default_str();
  report->add_option("--edi-doc", o.ediDoc, "EDI document to Init the class with (default: none)");

  auto* layout = app.add_subcommand("layout", "the carrier layout a class uses; validate a site layout");
  layout->require_subcommand(1, 1);
  auto* layoutShow = layout->add_subcommand("show", "print the layout the library ships for a class");
  layoutShow->add_option("CLASS", o.className, "class laid out by a layout file")->required();
  auto* layoutCheck = layout->add_subcommand(
      "check", "check a layout file and show what it writes for a sample consignment");
  layoutCheck->add_option("FILE", o.file, "layout file")->required();
  layoutCheck->add_option("--class", o.className,
                          "the class it is meant for (default: the class the file is named after)");
  layout->footer(
      "A site layout lies beside the carrier's output as CLASS.layout and replaces the layout the "
      "library ships. check prints the problem of a file that can't be used (FILE line L column C) "
      "and exits 1; for a sound file it runs the class on a sample consignment in a scratch folder "
      "and prints the records written and the log.");

  auto* demo = app.add_subcommand("demo", "a demo day in a fresh database, running every built class");
  demo->add_option("--out", o.out, "demo folder")->capture_default_str();

  // An unknown command is named as such, not as a missing one.
  for (int i = 1; i < argc; ++i) {
    const std::string arg = argv[i];
    if (arg == "--db" || arg == "--now" || arg == "--spool" || arg == "--on-error") {
      ++i;
      continue;
    }
    if (arg.starts_with("-")) continue;
    bool known = false;
    for (const auto* sub : app.get_subcommands([](CLI::App*) { return true; }))
      known = known || sub->get_name() == arg;
    if (!known) {
      std::cerr << "quendal: unknown command " << arg << " (see quendal --help)\n";
      return 1;
    }
    break;
  }
  try {
    app.parse(argc, argv);
  } catch (const CLI::Success& e) {
    return app.exit(e);
  } catch (const CLI::ParseError& e) {
    std::cerr << "quendal: " << e.what() << " (see quendal --help)\n";
    return 1;
  }

  try {
    if (!o.now.empty()) {
      const auto now = DateTime::Parse(o.now);
      if (!now) throw UsageError("--now takes YYYY-MM-DDTHH:MM:SS, not \"" + o.now + "\"");
      SetNow(*now);
    }
    SetErrorPrompt(MakePrompt(o.onError, std::cin, std::cerr, isatty(STDIN_FILENO) != 0));
    if (o.cups)
      SetSpooler(std::make_shared<CupsSpooler>());
    else {
      auto spooler = std::make_shared<DirectorySpooler>(o.spool);
      spooler->SetPreviewer(preview::MakePreviewer);
      SetSpooler(spooler);
    }

    if (*layout) {
      if (layoutShow->parsed()) return LayoutShow(o.className, std::cout, o.json);
      return LayoutCheck(o.file, o.className, std::cout, o.json);
    }
    Command command(o);
    if (*classes) return command.Classes();
    if (*import) return command.Import();
    if (*log) return command.Log();
    if (*settings) return command.Settings(set->parsed());
    if (*label) return command.Label();
    if (*separator) return command.Separator();
    if (*pdt) return command.Pdt();
    if (*packline) return command.PackLine();
    if (*preview) return command.Preview();
    if (*gallery) return command.Gallery();
    if (*despatch) return command.Despatch();
    if (*manifest) return command.Manifest();
    if (*report) return command.Report();
    if (*demo) return RunDemo(o.out, std::cout, o.json);
  } catch (const UsageError& e) {
    std::cerr << "quendal: " << e.what() << "\n";
    return 1;
  } catch (const OpenFailure& e) {
    std::cerr << "quendal: " << e.what() << "\n";
    return 2;
  } catch (const std::filesystem::filesystem_error& e) {
    std::cerr << "quendal: " << e.what() << "\n";
    return 2;
  } catch (const std::exception& e) {
    std::cerr << "quendal: " << e.what() << "\n";
    return 1;
  }
  return 1;
}

}  // namespace
}  // namespace quendal::cli

int main(int argc, char** argv) { return quendal::cli::Main(argc, argv); }
