#include "platform/DirectorySpooler.h"

#include <algorithm>
#include <cctype>
#include <cmath>
#include <cstdio>
#include <filesystem>

#include "frame/Error.h"
#include "frame/VB.h"
#include "platform/CairoCanvas.h"
#include "platform/FileLock.h"
#include "platform/FileSystem.h"

namespace quendal {

namespace fs = std::filesystem;

namespace {

// A job file: six digits, "-", the document name.
bool IsJobFile(const std::string& name) {
  if (name.size() < 8 || name[6] != '-') return false;
  return std::all_of(name.begin(), name.begin() + 6,
                     [](char c) { return std::isdigit(static_cast<unsigned char>(c)); });
}

}  // namespace

std::string SafeFileName(std::string_view name) {
  std::string out;
  for (unsigned char c : name) {
    const bool bad = c < 0x20 || c == '/' || c == '\\' || c == ':' || c == '*' || c == '?' ||
                     c == '"' || c == '<' || c == '>' || c == '|' || c == 0x7F;
    out += bad ? '_' : static_cast<char>(c);
  }
  for (std::size_t at; (at = out.find("..")) != std::string::npos;) out.replace(at, 2, "__");
  if (out.empty()) out = "_";
  return out;
}

std::string SafeNamePart(std::string_view text) {
  return text.empty() ? std::string() : SafeFileName(text);
}

std::string TitleForFileName(std::string_view title) {
  constexpr std::size_t kMostBytes = 100;
  std::string name = SafeFileName(title);
  if (name.size() <= kMostBytes) return name;
  std::size_t cut = kMostBytes;
  // Back to the start of a UTF-8 character: continuation bytes are 10xxxxxx.
  while (cut > 0 && (static_cast<unsigned char>(name[cut]) & 0xC0) == 0x80) --cut;
  name.resize(cut);
  return name;
}

DirectorySpooler::DirectorySpooler(std::string root) : root_(std::move(root)) {}

std::string DirectorySpooler::PrinterFolder(const std::string& name) const {
  return (fs::path(root_) / SafeFileName(name)).string();
}

std::string DirectorySpooler::TextSetting(const std::string& name, std::string_view key) const {
  const auto ini = ReadFile((fs::path(PrinterFolder(name)) / "printer.ini").string());
  if (!ini) return {};
  const std::string prefix = std::string(key) + "=";
  std::size_t pos = 0;
  while (pos < ini->size()) {
    std::size_t end = ini->find('\n', pos);
    if (end == std::string::npos) end = ini->size();
    const std::string line = Trim(Replace(ini->substr(pos, end - pos), "\r", ""));
    if (line.starts_with(prefix)) return Trim(line.substr(prefix.size()));
    pos = end + 1;
  }
  return {};
}

double DirectorySpooler::Setting(const std::string& name, std::string_view key, double fallback,
                                 double low, double high) const {
  const std::string value = TextSetting(name, key);
  if (!IsNumericText(value)) return fallback;
  const double v = std::strtod(value.c_str(), nullptr);
  return v >= low && v <= high ? v : fallback;
}

int DirectorySpooler::Dpi(const std::string& name) const {
  return static_cast<int>(Setting(name, "dpi", 300, 50, 2400));
}

double DirectorySpooler::PageWidthMm(const std::string& name) const {
  return Setting(name, "width_mm", 100, 10, 1000);
}

double DirectorySpooler::PageHeightMm(const std::string& name) const {
  return Setting(name, "height_mm", 150, 10, 1000);
}

std::int32_t DirectorySpooler::OpenPrinter(const std::string& name, long& error) {
  error = 0;
  if (name.empty() || SafeFileName(name) != name || !FolderExists(PrinterFolder(name))) {
    error = err::kUnknownPrinter;
    return 0;
  }
  const std::int32_t handle = nextHandle_++;
  open_[handle] = Open{name, {}, {}, 0};
  return handle;
}

std::string DirectorySpooler::NextJobPath(const std::string& name, const std::string& documentName,
                                          const std::string& extension) {
  const std::string folder = PrinterFolder(name);
  // The counter file keeps numbers rising even after the printer took its jobs away.
  const std::string counterPath = (fs::path(folder) / ".jobcounter").string();
  long next = 1;
  if (auto counter = ReadFile(counterPath); counter && IsNumericText(*counter))
    next = std::strtol(counter->c_str(), nullptr, 10) + 1;
  if (auto files = ListFiles(folder)) {
    for (const auto& f : *files)
      if (IsJobFile(f.name)) next = std::max(next, std::strtol(f.name.c_str(), nullptr, 10) + 1);
  }
  if (next > 999999) next = 1;
  ReplaceFile(counterPath, std::to_string(next));
  char number[32];
  std::snprintf(number, sizeof number, "%06ld", next);
  return (fs::path(folder) / (std::string(number) + "-" + TitleForFileName(documentName) + "." + extension))
      .string();
}

std::string DirectorySpooler::WriteNextJob(const std::string& name, const std::string& documentName,
                                           const std::string& extension, std::string_view bytes) {
  FileLock numbering;
  if (!numbering.Acquire((fs::path(PrinterFolder(name)) / ".jobcounter").string())) return {};
  const std::string path = NextJobPath(name, documentName, extension);
  return ReplaceFile(path, bytes) ? path : std::string();
}

std::int32_t DirectorySpooler::StartDoc(std::int32_t handle, const std::string& documentName) {
  auto it = open_.find(handle);
  if (it == open_.end()) return 0;
  it->second.document = documentName.empty() ? "document" : documentName;
  it->second.bytes.clear();
  it->second.job = ++jobSerial_;
  return it->second.job;
}

bool DirectorySpooler::Write(std::int32_t handle, std::string_view bytes) {
  auto it = open_.find(handle);
  if (it == open_.end() || it->second.document.empty()) return false;
  it->second.bytes.append(bytes);
  return true;
}

bool DirectorySpooler::EndDoc(std::int32_t handle) {
  auto it = open_.find(handle);
  if (it == open_.end() || it->second.document.empty()) return false;
  Open& doc = it->second;
  // A document named "*.pdf" is a PDF job and keeps that extension.
  std::string name = doc.document;
  std::string extension = "prn";
  if (name.size() > 4 && LCase(Right(name, 4)) == ".pdf") {
    name.resize(name.size() - 4);
    extension = "pdf";
  }
  // The job appears whole: written beside the queue, then renamed into it.
  const std::string path = WriteNextJob(doc.printer, name, extension, doc.bytes);
  const bool ok = !path.empty();
  if (ok && extension == "prn") WritePreview(doc.printer, path, doc.bytes);
  doc.document.clear();
  doc.bytes.clear();
  return ok;
}

void DirectorySpooler::WritePreview(const std::string& printer, const std::string& jobPath,
                                    std::string_view bytes) {
  if (!previewerFactory_ || LCase(TextSetting(printer, "preview")) != "yes") return;
  // A picture is a convenience: whatever goes wrong with it, the job stands.
  try {
    auto& previewer = previewers_[printer];
    if (!previewer)
      previewer = previewerFactory_(Dpi(printer), PageWidthMm(printer), PageHeightMm(printer));
    if (!previewer) return;
    const std::vector<std::string> pages = previewer->Pages(bytes);
    const fs::path job(jobPath);
    const std::string stem = "preview-" + job.stem().string();
    for (std::size_t i = 0; i < pages.size(); ++i) {
      const std::string suffix = i == 0 ? std::string() : "-" + std::to_string(i + 1);
      ReplaceFile((job.parent_path() / (stem + suffix + ".png")).string(), pages[i]);
    }
  } catch (const std::exception&) {
  }
}

void DirectorySpooler::ClosePrinter(std::int32_t handle) { open_.erase(handle); }

std::int32_t DirectorySpooler::JobCount(std::int32_t handle, std::int32_t limit) {
  auto it = open_.find(handle);
  if (it == open_.end()) return 0;
  const auto files = ListFiles(PrinterFolder(it->second.printer));
  if (!files) return 0;
  std::int32_t count = 0;
  for (const auto& f : *files)
    if (IsJobFile(f.name) && ++count >= limit) break;
  return count;
}

std::vector<InstalledPrinter> DirectorySpooler::InstalledPrinters() {
  std::vector<InstalledPrinter> printers;
  std::error_code ec;
  for (const auto& entry : fs::directory_iterator(root_, ec)) {
    if (!entry.is_directory(ec)) continue;
    const std::string name = entry.path().filename().string();
    const double dpi = Dpi(name);
    printers.push_back({name, 1440.0 / dpi, 1440.0 / dpi});
  }
  std::sort(printers.begin(), printers.end(),
            [](const InstalledPrinter& a, const InstalledPrinter& b) { return a.name < b.name; });
  return printers;
}

namespace {

// Pages drawn in memory, written as one PNG job file each when the document ends.
class DirectoryDC : public DeviceContext {
 public:
  DirectoryDC(DirectorySpooler& spooler, std::string printer)
      : spooler_(spooler), printer_(std::move(printer)) {
    const int dpi = spooler_.Dpi(printer_);
    canvas_ = std::make_unique<PngCanvas>(
        static_cast<int>(std::lround(spooler_.PageWidthMm(printer_) / 25.4 * dpi)),
        static_cast<int>(std::lround(spooler_.PageHeightMm(printer_) / 25.4 * dpi)), dpi);
  }
  bool StartDoc(const std::string& documentName) override {
    document_ = documentName.empty() ? "document" : documentName;
    return true;
  }
  bool EndDoc() override {
    if (document_.empty()) return false;
    if (pageOpen_) EndPage();
    bool ok = true;
    for (const std::string& page : canvas_->Pages())
      ok = !spooler_.WriteNextJob(printer_, document_, "png", page).empty() && ok;
    document_.clear();
    return ok;
  }
  void StartPage() override {
    canvas_->StartPage();
    pageOpen_ = true;
  }
  void EndPage() override {
    canvas_->EndPage();
    pageOpen_ = false;
  }
  void Rectangle(int x1, int y1, int x2, int y2, int penWidth) override {
    canvas_->Rectangle(x1, y1, x2, y2, penWidth);
  }
  void Text(int x, int y, std::string_view utf8, const CanvasFont& font, Colour text,
            Colour background) override {
    canvas_->Text(x, y, utf8, font, text, background);
  }

 private:
  DirectorySpooler& spooler_;
  std::string printer_;
  std::string document_;
  std::unique_ptr<PngCanvas> canvas_;
  bool pageOpen_ = false;
};

}  // namespace

std::unique_ptr<DeviceContext> DirectorySpooler::CreateDC(const std::string& printer,
                                                         long& error) {
  if (printer.empty() || SafeFileName(printer) != printer || !FolderExists(PrinterFolder(printer))) {
    error = err::kUnknownPrinter;
    return nullptr;
  }
  return std::make_unique<DirectoryDC>(*this, printer);
}

}  // namespace quendal
