#include "cli/Demo.h"

#include <filesystem>
#include <fstream>
#include <map>
#include <ostream>

#include "cli/DemoData.h"
#include "cli/Work.h"
#include "frame/Catalogue.h"
#include "frame/VB.h"
#include "labels/LabelPrinter.h"
#include "labels/Preview.h"
#include "mvserver/SqliteHost.h"
#include "platform/Clock.h"
#include "platform/DirectorySpooler.h"

namespace quendal::cli {

namespace fs = std::filesystem;

namespace {

// The ordinary printer of a carrier, on which the demo draws a label.
std::string DrawnPrinter(const std::string& carrier) { return carrier + " Drawn"; }
// The ZPL printer of a carrier whose label classes also speak ZPL.
std::string ZplPrinter(const std::string& carrier) { return carrier + " ZPL"; }
// Label printers of the demo: 203 dpi, with a picture beside each job.
constexpr const char* kThermalPrinter = "dpi=203\npreview=yes\n";

// Marks a folder the demo made, so a later run may replace what is in it.
constexpr const char* kMarker = ".quendal-demo";
constexpr const char* kDatabase = "quendal.db";

// The files under the demo folder and their sizes, by path relative to it.
using Files = std::map<std::string, std::uintmax_t>;

Files Snapshot(const fs::path& root) {
  Files files;
  std::error_code ec;
  for (auto it = fs::recursive_directory_iterator(root, ec); !ec && it != fs::recursive_directory_iterator();
       it.increment(ec)) {
    // Hidden files are the spooler's and the demo's bookkeeping, not output.
    if (it->path().filename().string().starts_with(".") || !it->is_regular_file(ec)) continue;
    const std::string relative = fs::relative(it->path(), root, ec).string();
    if (relative.starts_with(kDatabase) || relative == "demo-data.json") continue;
    files[relative] = it->file_size(ec);
  }
  return files;
}

// Files that are new or have grown since the snapshot.
json Changes(const Files& before, const Files& after) {
  json changes = json::array();
  for (const auto& [path, size] : after) {
    auto it = before.find(path);
    if (it == before.end())
      changes.push_back({{"path", path}, {"bytes", size}, {"new", true}});
    else if (it->second != size)
      changes.push_back({{"path", path}, {"bytes", size - it->second}, {"new", false}});
  }
  return changes;
}

void PrepareFolder(const fs::path& root) {
  std::error_code ec;
  fs::create_directories(root, ec);
  if (!fs::is_directory(root)) throw OpenFailure("cannot create the demo folder " + root.string());
  const bool ours = fs::exists(root / kMarker);
  if (!ours && fs::exists(root / kDatabase))
    throw UsageError(root.string() + " holds a " + kDatabase +
                     " the demo did not make; choose another folder with --out");
  if (ours) {
    // Replace the previous demo's database and outputs.
    for (const char* suffix : {"", "-journal", "-wal", "-shm"}) fs::remove(root / (std::string(kDatabase) + suffix), ec);
    fs::remove_all(root / "spool", ec);
    fs::remove_all(root / "carriers", ec);
    fs::remove_all(root / "reports", ec);
  }
  std::ofstream(root / kMarker) << "Made by quendal demo; the next demo run replaces this folder's outputs.\n";
}

struct ClassRun {
  const CatalogueEntry* entry;
  json result;
};

std::string Summary(const json& run) {
  const std::string family = run["family"];
  if (run.contains("failed")) return "failed: " + run["failed"].get<std::string>();
  if (family == "label") {
    int printed = 0;
    for (const auto& l : run["labels"]) printed += l["printed"].get<bool>() ? 1 : 0;
    return std::to_string(run["labels"].size()) + " labels, " + std::to_string(printed) + " printed";
  }
  if (family == "consignment") return std::to_string(run["consignments"].size()) + " consignments processed";
  std::string text;
  for (const auto& r : run["runs"])
    text += (text.empty() ? "" : "; ") + std::string("Init ") + (r["init"].get<bool>() ? "True" : "False") +
            ", " + std::to_string(r["loaded"].get<int>()) + " rows, " + std::to_string(r["processed"].size()) +
            " processed, Term " + (r["term"].get<bool>() ? "True" : "False");
  return text.empty() ? "no EDI document" : text;
}

}  // namespace

int RunDemo(const std::string& out, std::ostream& cout, bool asJson) {
  const fs::path root = fs::absolute(out).lexically_normal();
  PrepareFolder(root);
  const DemoData data = BuildDemoData(root.string(), Now());
  {
    std::ofstream file(root / "demo-data.json");
    file << data.document.dump(2) << "\n";
    if (!file) throw OpenFailure("cannot write " + (root / "demo-data.json").string());
  }
  for (const auto& carrier : data.carriers) {
    fs::create_directories(root / "spool" / SafeFileName(carrier.printer));
    std::ofstream(root / "spool" / SafeFileName(carrier.printer) / "printer.ini") << kThermalPrinter;
    fs::create_directories(carrier.folder);
    // An ordinary printer per carrier, on which one label is drawn as a picture.
    const fs::path drawn = root / "spool" / SafeFileName(DrawnPrinter(carrier.name));
    fs::create_directories(drawn);
    std::ofstream(drawn / "printer.ini") << "dpi=300\n";
  }
  fs::create_directories(root / "spool" / SafeFileName(data.documentPrinter));
  for (const DemoFile& file : data.files) {
    std::ofstream out(file.path, std::ios::binary);
    out << file.text;
    if (!out) throw OpenFailure("cannot write " + file.path);
  }

  std::shared_ptr<mvserver::SqliteHost> host;
  try {
    host = mvserver::SqliteHost::Open((root / kDatabase).string());
  } catch (const mvserver::OpenError& e) {
    throw OpenFailure(e.what());
  }
  host->Import(data.document.dump());
  auto previousLibrary = host::RegisterLibrary(host);
  auto spooler = std::make_shared<DirectorySpooler>((root / "spool").string());
  spooler->SetPreviewer(preview::MakePreviewer);
  auto previousSpooler = SetSpooler(spooler);

  // The consignments of each carrier, by the carrier's name.
  std::map<std::string, std::vector<Ref<host::ConNote>>> byCarrier;
  std::vector<Ref<host::ConNote>> all;
  for (auto id : host->Keys("ConNote")) {
    auto conNote = host->Find<host::ConNote>("ConNote", id);
    byCarrier[conNote->Carrier()->Name().Text()].push_back(conNote);
    all.push_back(conNote);
  }
  auto printerOf = [&](const Ref<host::ConNote>& conNote) {
    const std::string name = conNote->Carrier()->Name().Text();
    for (const auto& c : data.carriers)
      if (c.name == name) return c.printer;
    return std::string();
  };

  const auto system = host->System();
  json runs = json::array();
  int built = 0;
  std::map<Family, std::pair<int, int>> families;  // built, total
  for (const auto& entry : Catalogue()) {
    ++families[entry.family].second;
    if (!entry.factory) continue;
    ++built;
    ++families[entry.family].first;
    const std::string carrier(entry.carrier);
    const auto& conNotes = carrier == "any" ? all : byCarrier[carrier];
    json run = {{"class", entry.Identifier()}, {"family", FamilyName(entry.family)}, {"carrier", carrier}};
    const Files before = Snapshot(root);
    const std::int64_t lastLog = host->LastLogId();
    try {
      Created created = CreateObject(entry.Identifier());
      if (!created.object) throw UsageError(created.reason);
      if (auto* labels = as<LabelInterface>(created.object)) {
        run["labels"] = json::array();
        run["separators"] = json::array();
        // One Init per printer: the packs of each carrier go to that carrier's printer.
        std::map<std::string, std::vector<Ref<host::Pack>>> packsByPrinter;
        for (const auto& conNote : conNotes) {
          const Ref<host::PackList> packs = conNote->Packs();
          for (auto pack : *packs) packsByPrinter[printerOf(conNote)].push_back(pack);
        }
        for (const auto& [printer, packs] : packsByPrinter) {
          const LabelRun labelRun = PrintLabels(*labels, system, printer, packs, std::nullopt);
          for (const auto& [pack, printed] : labelRun.labels)
            run["labels"].push_back({{"pack", pack}, {"printer", printer}, {"printed", printed}});
          // A separator after the class's cartons, as between two stores.
          run["separators"].push_back(
              {{"printer", printer},
               {"printed", labels->Separator(printer, "End of " + std::string(entry.className) + "\r\n" +
                                                          std::to_string(packs.size()) + " cartons")}});
        }
        // The first label once more on a ZPL printer, for the classes that speak ZPL.
        const auto* frame = dynamic_cast<const LabelPrinter*>(created.object.get());
        if (frame && frame->SpeaksZpl() && !conNotes.empty() && conNotes.front()->Packs()->Count() > 0) {
          Created zplObject = CreateObject(entry.Identifier());
          if (auto* zpl = as<LabelInterface>(zplObject.object)) {
            const std::string printer = ZplPrinter(carrier);
            fs::create_directories(root / "spool" / SafeFileName(printer));
            std::ofstream(root / "spool" / SafeFileName(printer) / "printer.ini") << kThermalPrinter;
            const LabelRun labelRun =
                PrintLabels(*zpl, OverrideSystem(system, "PrinterLanguage", Var("ZPL")), printer,
                            {conNotes.front()->Packs()->Item(1)}, std::nullopt);
            for (const auto& [pack, printed] : labelRun.labels)
              run["labels"].push_back({{"pack", pack}, {"printer", printer}, {"printed", printed}, {"zpl", true}});
          }
        }
        // The first of the carrier's labels once more, drawn on an ordinary printer as a PNG page.
        if (!conNotes.empty() && conNotes.front()->Packs()->Count() > 0) {
          Created drawnObject = CreateObject(entry.Identifier());
          if (auto* drawn = as<LabelInterface>(drawnObject.object)) {
            const std::string printer = DrawnPrinter(carrier == "any" ? "Any" : carrier);
            fs::create_directories(root / "spool" / SafeFileName(printer));
            std::ofstream(root / "spool" / SafeFileName(printer) / "printer.ini") << "dpi=300\n";
            const LabelRun labelRun =
                PrintLabels(*drawn, OverrideSystem(system, "PrinterLanguage", Var("WinPCL")), printer,
                            {conNotes.front()->Packs()->Item(1)}, std::nullopt);
            for (const auto& [pack, printed] : labelRun.labels)
              run["labels"].push_back(
                  {{"pack", pack}, {"printer", printer}, {"printed", printed}, {"drawn", true}});
          }
        }
      } else if (auto* consignment = as<ConsignmentInterface>(created.object)) {
        run["consignments"] = json::array();
        for (const auto& conNote : conNotes) {
          const LogList log = Despatch(*consignment, system, conNote);
          run["consignments"].push_back({{"connote", conNote->ConNoteId().Whole()}, {"vtErrorLog", log}});
        }
      } else if (auto* rows = as<RowInterface>(created.object)) {
        run["runs"] = json::array();
        for (const auto& c : data.carriers) {
          if (c.name != carrier) continue;
          const RowRun rowRun = RunRows(*rows, system, static_cast<std::int16_t>(c.ediDocumentId), std::nullopt);
          json processed = json::array();
          for (const auto& [row, result] : rowRun.processed) processed.push_back({{"row", row}, {"result", result}});
          run["runs"].push_back({{"ediDocument", c.ediDocumentId}, {"init", rowRun.init}, {"loaded", rowRun.loaded},
                                 {"processed", processed}, {"term", rowRun.term}, {"vtErrorLog", rowRun.vtErrorLog}});
          // The summary Term printed, once more kept as a PDF with its HTML copy for viewing.
          if (auto* summary = as<ConsolidatedManifestInterface>(created.object)) {
            const std::string today = Format(Var(Today()), "Short Date");
            const fs::path html = root / "reports" / (std::string(entry.className) + ".html");
            fs::create_directories(html.parent_path());
            const std::int16_t result = summary->ConsolidatedManifestPrint(
                today, today, host->Find<host::Vendor>("Vendor", 1)->VendorCode().Text(),
                host->Find<host::Carrier>("Carrier", c.carrierId)->CarrierCode().Text(), 0, html.string());
            run["summary"] = {{"result", result}, {"kept", summary->ConsolidatedManifestFile()},
                              {"html", result == 0 ? html.string() : std::string()}};
          }
        }
      }
    } catch (const std::exception& e) {
      run["failed"] = e.what();
    }
    run["files"] = Changes(before, Snapshot(root));
    run["log"] = LogsJson(host->LogsSince(lastLog));
    runs.push_back(run);
  }

  std::int64_t pallets = 0, satchels = 0, dangerous = 0;
  for (const auto& pack : data.document["Packs"]) {
    pallets += pack["PackType"] == "PALLET";
    satchels += pack["PackType"] == "SATCHEL";
    dangerous += pack["Lines"].size() > 1;
  }
  json summary = {
      {"folder", root.string()},
      {"database", (root / kDatabase).string()},
      {"now", Now().Iso()},
      {"data",
       {{"vendors", host->Count("Vendor")}, {"carriers", host->Count("Carrier")},
        {"receivers", host->Count("Receiver")}, {"consignments", host->Count("ConNote")},
        {"packs", host->Count("Pack")}, {"pallets", pallets}, {"satchels", satchels},
        {"dangerousGoodsPacks", dangerous}, {"asns", host->Count("ASN")},
        {"ediDocuments", host->Count("EDIDocument")}}},
      {"catalogue", {{"built", built}, {"total", Catalogue().size()}}},
      {"runs", runs},
      {"log", LogsJson(host->LogsSince(0))}};
  for (const auto& [family, counts] : families)
    summary["catalogue"][std::string(FamilyName(family))] = {{"built", counts.first}, {"total", counts.second}};

  SetSpooler(previousSpooler);
  host::RegisterLibrary(previousLibrary);

  if (asJson) {
    cout << summary.dump(2) << "\n";
    return 0;
  }
  const json& d = summary["data"];
  cout << "Quendal demo in " << root.string() << " (now " << summary["now"].get<std::string>() << ")\n"
       << "Database " << summary["database"].get<std::string>() << ", data in demo-data.json\n"
       << "Data: " << d["vendors"] << " vendor, " << d["carriers"] << " carriers, " << d["receivers"]
       << " receivers, " << d["consignments"] << " consignments, " << d["packs"] << " packs ("
       << pallets << " pallets, " << satchels << " satchels, " << dangerous << " with dangerous goods), "
       << d["asns"] << " ASNs, " << d["ediDocuments"] << " EDI documents\n";
  cout << "Catalogue: " << built << " of " << Catalogue().size() << " classes built (";
  bool first = true;
  for (const auto& [family, counts] : families) {
    cout << (first ? "" : ", ") << FamilyName(family) << " " << counts.first << "/" << counts.second;
    first = false;
  }
  cout << ")\n\n";

  // Per carrier: its consignments and packs, and how many of its classes are built.
  std::vector<std::vector<std::string>> carrierRows;
  for (const auto& c : data.carriers) {
    int classes = 0, ready = 0;
    for (const auto& entry : Catalogue())
      if (entry.carrier == c.name) {
        ++classes;
        ready += entry.factory ? 1 : 0;
      }
    std::size_t packs = 0;
    for (const auto& conNote : byCarrier[c.name]) packs += static_cast<std::size_t>(conNote->Packs()->Count());
    carrierRows.push_back({c.name, std::to_string(byCarrier[c.name].size()), std::to_string(packs),
                           std::to_string(ready) + "/" + std::to_string(classes), "spool/" + SafeFileName(c.printer),
                           fs::relative(c.folder, root).string() + "/"});
  }
  PrintTable(cout, {"Carrier", "Consignments", "Packs", "Built", "Label printer", "Carrier folder"}, carrierRows);
  cout << "\n";

  if (runs.empty()) {
    cout << "No class is built yet: nothing to run. As classes are built, this demo runs them.\n";
    return 0;
  }
  std::vector<std::vector<std::string>> rows;
  for (const auto& run : runs) {
    std::string wrote;
    const auto& files = run["files"];
    if (files.empty()) wrote = "-";
    for (std::size_t i = 0; i < files.size() && i < 3; ++i)
      wrote += (i ? ", " : "") + files[i]["path"].get<std::string>();
    if (files.size() > 3) wrote += " (+" + std::to_string(files.size() - 3) + " more)";
    rows.push_back({run["class"], run["family"], run["carrier"], Summary(run),
                    std::to_string(run["log"].size()), wrote});
  }
  PrintTable(cout, {"Class", "Family", "Carrier", "Run", "Log", "Wrote"}, rows);
  // Where each consignment summary went: the job Term printed, and the copy kept for viewing.
  bool heading = false;
  for (const auto& run : runs) {
    if (!run.contains("summary")) continue;
    if (!heading) cout << "\nConsignment Summary Print:\n";
    heading = true;
    std::string printed;
    for (const auto& file : run["files"]) {
      const std::string path = file["path"];
      if (path.starts_with("spool/") && path.find("Consignment Summary Print") != std::string::npos)
        printed = path;
    }
    const json& summary = run["summary"];
    cout << "  " << run["class"].get<std::string>() << ": "
         << (printed.empty() ? std::string("nothing printed at Term") : "printed at Term as " + printed);
    if (!summary["kept"].get<std::string>().empty())
      cout << "; kept as " << fs::relative(summary["kept"].get<std::string>(), root).string() << " and "
           << fs::relative(summary["html"].get<std::string>(), root).string();
    else
      cout << "; ConsolidatedManifestPrint returned " << summary["result"];
    cout << "\n";
  }
  cout << "\nLog entries:\n";
  PrintLogs(cout, host->LogsSince(0));
  return 0;
}

}  // namespace quendal::cli
