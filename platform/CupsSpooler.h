// The CUPS back end of the spooler: printers are CUPS queues (on the server
// the CUPS client configuration names, e.g. CUPS_SERVER); a document is one
// raw job, created when it starts and completed when it ends; the queue
// length is the number of the queue's active jobs.
#pragma once

#include <map>
#include <memory>
#include <string>

#include "platform/Spooler.h"

namespace quendal {

class CupsSpooler : public Spooler {
 public:
  CupsSpooler();
  ~CupsSpooler() override;
  CupsSpooler(const CupsSpooler&) = delete;
  CupsSpooler& operator=(const CupsSpooler&) = delete;

  // Error 1801 for a queue the server does not know, 1722 when the server
  // can't be reached.
  std::int32_t OpenPrinter(const std::string& name, long& error) override;
  std::int32_t StartDoc(std::int32_t handle, const std::string& documentName) override;
  bool Write(std::int32_t handle, std::string_view bytes) override;
  bool EndDoc(std::int32_t handle) override;
  // A document that was started and not ended is cancelled.
  void ClosePrinter(std::int32_t handle) override;
  std::int32_t JobCount(std::int32_t handle, std::int32_t limit) override;
  // Every queue, with its default resolution (300 dpi where it has none).
  std::vector<InstalledPrinter> InstalledPrinters() override;
  // Pages drawn into a PDF document (a 100 x 150 mm page at the queue's
  // resolution) that goes to the queue as one job when the document ends.
  std::unique_ptr<DeviceContext> CreateDC(const std::string& printer, long& error) override;

  // Starts a document of the given MIME type (StartDoc starts a raw one).
  std::int32_t StartDocAs(std::int32_t handle, const std::string& documentName,
                          const char* format);

 private:
  struct Open;
  void Cancel(Open& open);
  std::map<std::int32_t, std::unique_ptr<Open>> open_;
  std::int32_t nextHandle_ = 1;
};

}  // namespace quendal
