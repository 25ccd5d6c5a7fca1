#include "cli/Gallery.h"

#include <algorithm>
#include <filesystem>
#include <map>
#include <ostream>
#include <regex>

#include "cli/Work.h"
#include "labels/Preview.h"
#include "mvserver/SqliteHost.h"
#include "platform/FileSystem.h"
#include "platform/MemorySpooler.h"

namespace quendal::cli {

namespace fs = std::filesystem;

namespace {

constexpr const char* kPrinter = "Gallery";
constexpr int kColumns = 4;
constexpr int kImageWidth = 180;

// Puts a spooler in place for one scope and the previous one back after it.
class SpoolerScope {
 public:
  explicit SpoolerScope(std::shared_ptr<Spooler> spooler) : previous_(SetSpooler(std::move(spooler))) {}
  ~SpoolerScope() { SetSpooler(previous_); }
  SpoolerScope(const SpoolerScope&) = delete;
  SpoolerScope& operator=(const SpoolerScope&) = delete;

 private:
  std::shared_ptr<Spooler> previous_;
};

// What a thermal printer prints for the jobs a label class sent it for one
// carton: the last label of them (the jobs before it store formats).
struct Picture {
  std::string format;  // the format's header: name, number and size
  preview::Page page;
  std::vector<std::string> notes;
};

Picture Print(LabelInterface& labels, const Ref<host::System>& system, const Ref<host::Pack>& pack,
              int dpi) {
  auto spooler = std::make_shared<MemorySpooler>();
  spooler->AddPrinter(kPrinter);
  {
    SpoolerScope scope(spooler);
    PrintLabels(labels, OverrideSystem(system, "PrinterLanguage", Var("VPCLII")), kPrinter, {pack},
                std::nullopt);
  }
  Picture picture;
  preview::Printer printer({dpi});
  std::string sent;
  for (const MemorySpooler::Job& job : spooler->jobs) {
    sent += job.bytes;
    preview::Result result = printer.Print(job.bytes);
    if (!result.pages.empty()) picture.page = std::move(result.pages.back());
    for (auto& note : result.notes) picture.notes.push_back(std::move(note));
  }
  // The format the last batch was printed on: the last one stored under its number before it.
  static const std::regex kBatch("\\{B,([^,|]*),");
  static const std::regex kFormat("\\{F,([^,|]*),A,R,[A-Z],([0-9]+),([0-9]+),\"([^\"]*)\"");
  std::string number;
  std::size_t batchAt = sent.size();
  for (auto it = std::sregex_iterator(sent.begin(), sent.end(), kBatch); it != std::sregex_iterator(); ++it) {
    number = (*it)[1].str();
    batchAt = static_cast<std::size_t>(it->position());
  }
  for (auto it = std::sregex_iterator(sent.begin(), sent.begin() + static_cast<std::ptrdiff_t>(batchAt), kFormat);
       it != std::sregex_iterator(); ++it)
    if ((*it)[1].str() == number || number.empty())
      picture.format = "\"" + (*it)[4].str() + "\" " + (*it)[1].str() + ", " + (*it)[2].str() + " x " + (*it)[3].str();
  return picture;
}

// The first carton of a carrier's first consignment ("any": of the first
// consignment of all), as the demo prints it.
std::map<std::string, Ref<host::Pack>> FirstPacks(mvserver::SqliteHost& host) {
  std::map<std::string, Ref<host::Pack>> first;
  for (auto id : host.Keys("ConNote")) {
    auto conNote = host.Find<host::ConNote>("ConNote", id);
    const Ref<host::PackList> packs = conNote->Packs();
    if (packs->Count() == 0) continue;
    first.try_emplace(conNote->Carrier()->Name().Text(), packs->Item(1));
    first.try_emplace("any", packs->Item(1));
  }
  return first;
}

std::string Table(const json& pictures, const fs::path& readme) {
  std::string table = std::string(kGalleryStart) +
                      "\n<!-- made by scripts/gallery (quendal gallery); not edited by hand -->\n<table>\n";
  int column = 0;
  for (const auto& p : pictures) {
    if (column == 0) table += "<tr>\n";
    const std::string src =
        fs::absolute(p["file"].get<std::string>()).lexically_normal().lexically_relative(readme.parent_path())
            .generic_string();
    table += "<td align=\"center\" valign=\"top\"><img src=\"" + src + "\" width=\"" +
             std::to_string(kImageWidth) + "\" alt=\"" + p["class"].get<std::string>() + "\"><br><code>" +
             p["class"].get<std::string>() + "</code><br>" + p["format"].get<std::string>() + "</td>\n";
    if (++column == kColumns) {
      table += "</tr>\n";
      column = 0;
    }
  }
  if (column != 0) table += "</tr>\n";
  return table + "</table>\n" + kGalleryEnd;
}

// Where the gallery block of a Markdown file begins and ends (the end mark's
// position); UsageError when the file has none.
std::pair<std::size_t, std::size_t> Block(const std::string& path, const std::string& text) {
  // The marks stand on lines of their own (a text may quote them).
  const auto line = [&](std::string_view mark, std::size_t from) {
    for (std::size_t at = text.find(mark, from); at != std::string::npos; at = text.find(mark, at + 1)) {
      const std::size_t after = at + mark.size();
      if ((at == 0 || text[at - 1] == '\n') && (after == text.size() || text[after] == '\n')) return at;
    }
    return std::string::npos;
  };
  const std::size_t start = line(kGalleryStart, 0);
  const std::size_t end = start == std::string::npos ? start : line(kGalleryEnd, start);
  if (end == std::string::npos)
    throw UsageError(path + " has no " + kGalleryStart + " ... " + kGalleryEnd + " block for the gallery");
  return {start, end};
}

std::string ReadMarkdown(const std::string& path) {
  const auto text = ReadFile(path);
  if (!text) throw OpenFailure("cannot read " + path);
  Block(path, *text);
  return *text;
}

void WriteTable(const std::string& path, const std::string& table) {
  const std::string text = ReadMarkdown(path);
  const auto [start, end] = Block(path, text);
  const std::string updated =
      text.substr(0, start) + table + text.substr(end + std::string_view(kGalleryEnd).size());
  if (!ReplaceFile(path, updated)) throw OpenFailure("cannot write " + path);
}

}  // namespace

int RunGallery(mvserver::SqliteHost& host, const GalleryOptions& options, std::ostream& cout, bool asJson) {
  // A file that can take no table is refused before anything is drawn.
  if (!options.readme.empty()) ReadMarkdown(options.readme);
  if (!CreateFolder(options.out)) throw OpenFailure("cannot create " + options.out);
  const auto packs = FirstPacks(host);
  const auto system = host.System();
  json pictures = json::array();
  json skipped = json::array();
  // By class name, so that each carrier's classes stand together.
  std::vector<const CatalogueEntry*> classes;
  for (const auto& entry : Catalogue())
    if (entry.family == Family::Label && entry.factory) classes.push_back(&entry);
  std::sort(classes.begin(), classes.end(),
            [](const CatalogueEntry* a, const CatalogueEntry* b) { return a->className < b->className; });
  for (const CatalogueEntry* built : classes) {
    const CatalogueEntry& entry = *built;
    const auto pack = packs.find(std::string(entry.carrier));
    const auto any = packs.find("any");
    if (pack == packs.end() && any == packs.end()) {
      skipped.push_back({{"class", entry.className}, {"why", "no consignment in the database"}});
      continue;
    }
    LabelInterface* labels = nullptr;
    auto object = Create(entry, labels);
    const Picture picture = Print(*labels, system, (pack != packs.end() ? pack : any)->second, options.dpi);
    if (picture.page.png.empty()) {
      skipped.push_back({{"class", entry.className}, {"why", "no label printed"}, {"notes", picture.notes}});
      continue;
    }
    const std::string file = (fs::path(options.out) / (std::string(entry.className) + ".png")).string();
    if (!ReplaceFile(file, picture.page.png)) throw OpenFailure("cannot write " + file);
    pictures.push_back({{"class", entry.className}, {"format", picture.format}, {"file", file},
                        {"width", picture.page.width}, {"height", picture.page.height}});
  }
  if (!options.readme.empty())
    WriteTable(options.readme, Table(pictures, fs::absolute(options.readme).lexically_normal()));
  if (asJson) {
    cout << json{{"dpi", options.dpi}, {"pictures", pictures}, {"skipped", skipped}}.dump(2) << "\n";
    return 0;
  }
  for (const auto& p : pictures)
    cout << p["class"].get<std::string>() << ": " << p["file"].get<std::string>() << " (" << p["width"] << " x "
         << p["height"] << " pixels, " << p["format"].get<std::string>() << ")\n";
  for (const auto& s : skipped)
    cout << s["class"].get<std::string>() << ": skipped, " << s["why"].get<std::string>() << "\n";
  if (!options.readme.empty()) cout << "Gallery table written to " << options.readme << "\n";
  return 0;
}

}  // namespace quendal::cli
