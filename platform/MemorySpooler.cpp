#include "platform/MemorySpooler.h"

#include "frame/Error.h"

namespace quendal {

void MemorySpooler::AddPrinter(const std::string& name, int dpi) { printers_[name] = dpi; }

std::int32_t MemorySpooler::OpenPrinter(const std::string& name, long& error) {
  ++opens;
  error = 0;
  if (!printers_.contains(name)) {
    error = err::kUnknownPrinter;
    return 0;
  }
  const std::int32_t handle = nextHandle_++;
  open_[handle] = Job{name, {}, {}};
  started_[handle] = false;
  return handle;
}

std::int32_t MemorySpooler::StartDoc(std::int32_t handle, const std::string& documentName) {
  auto it = open_.find(handle);
  if (it == open_.end()) return 0;
  it->second.document = documentName;
  it->second.bytes.clear();
  started_[handle] = true;
  return static_cast<std::int32_t>(jobs.size() + 1);
}

bool MemorySpooler::Write(std::int32_t handle, std::string_view bytes) {
  auto it = open_.find(handle);
  if (it == open_.end() || !started_[handle]) return false;
  it->second.bytes.append(bytes);
  return true;
}

bool MemorySpooler::EndDoc(std::int32_t handle) {
  auto it = open_.find(handle);
  if (it == open_.end() || !started_[handle]) return false;
  jobs.push_back(it->second);
  it->second.bytes.clear();
  started_[handle] = false;
  return true;
}

void MemorySpooler::ClosePrinter(std::int32_t handle) {
  open_.erase(handle);
  started_.erase(handle);
}

std::int32_t MemorySpooler::JobCount(std::int32_t handle, std::int32_t limit) {
  auto it = open_.find(handle);
  if (it == open_.end()) return 0;
  std::int32_t n = 0;
  if (queueLength) {
    n = queueLength(it->second.printer);
  } else {
    for (const auto& job : jobs)
      if (job.printer == it->second.printer) ++n;
  }
  return n < limit ? n : limit;
}

std::vector<InstalledPrinter> MemorySpooler::InstalledPrinters() {
  std::vector<InstalledPrinter> out;
  for (const auto& [name, dpi] : printers_) out.push_back({name, 1440.0 / dpi, 1440.0 / dpi});
  return out;
}

namespace {

class MemoryDC : public DeviceContext {
 public:
  explicit MemoryDC(std::shared_ptr<MemorySpooler::DrawnJob> job) : job_(std::move(job)) {}
  bool StartDoc(const std::string& documentName) override {
    job_->document = documentName;
    return true;
  }
  bool EndDoc() override {
    job_->ended = true;
    return true;
  }
  void StartPage() override { job_->canvas.StartPage(); }
  void EndPage() override { job_->canvas.EndPage(); }
  void Rectangle(int x1, int y1, int x2, int y2, int penWidth) override {
    job_->canvas.Rectangle(x1, y1, x2, y2, penWidth);
  }
  void Text(int x, int y, std::string_view utf8, const CanvasFont& font, Colour text,
            Colour background) override {
    job_->canvas.Text(x, y, utf8, font, text, background);
  }

 private:
  std::shared_ptr<MemorySpooler::DrawnJob> job_;
};

}  // namespace

std::unique_ptr<DeviceContext> MemorySpooler::CreateDC(const std::string& printer, long& error) {
  if (!printers_.contains(printer)) {
    error = err::kUnknownPrinter;
    return nullptr;
  }
  if (dcError != 0) {
    error = dcError;
    return nullptr;
  }
  auto job = std::make_shared<DrawnJob>();
  job->printer = printer;
  drawnJobs.push_back(job);
  return std::make_unique<MemoryDC>(job);
}

}  // namespace quendal
