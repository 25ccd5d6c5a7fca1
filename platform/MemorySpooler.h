// A spooler in memory, for tests and benchmarks: printers are declared,
// jobs are kept with their bytes, and the queue length can be scripted.
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "platform/RecordingCanvas.h"
#include "platform/Spooler.h"

namespace quendal {

class MemorySpooler : public Spooler {
 public:
  struct Job {
    std::string printer;
    std::string document;
    std::string bytes;
  };

  void AddPrinter(const std::string& name, int dpi = 300);

  std::int32_t OpenPrinter(const std::string& name, long& error) override;
  std::int32_t StartDoc(std::int32_t handle, const std::string& documentName) override;
  bool Write(std::int32_t handle, std::string_view bytes) override;
  bool EndDoc(std::int32_t handle) override;
  void ClosePrinter(std::int32_t handle) override;
  std::int32_t JobCount(std::int32_t handle, std::int32_t limit) override;
  std::vector<InstalledPrinter> InstalledPrinters() override;
  std::unique_ptr<DeviceContext> CreateDC(const std::string& printer, long& error) override;

  // A drawn job: what was drawn on it, page by page.
  struct DrawnJob {
    std::string printer;
    std::string document;
    RecordingCanvas canvas;
    bool ended = false;
  };

  std::vector<Job> jobs;  // finished jobs, in order
  std::vector<std::shared_ptr<DrawnJob>> drawnJobs;
  // When set, answers the queue length instead of counting jobs; called once per question.
  std::function<std::int32_t(const std::string& printer)> queueLength;
  int opens = 0;
  // When non-zero, CreateDC fails with this system error code.
  long dcError = 0;
  // Printers opened and not closed yet.
  std::size_t OpenHandles() const { return open_.size(); }

 private:
  std::map<std::string, int> printers_;
  std::map<std::int32_t, Job> open_;
  std::map<std::int32_t, bool> started_;
  std::int32_t nextHandle_ = 1;
};

}  // namespace quendal
