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

}  // namespace quendal
