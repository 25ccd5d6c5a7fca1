// The print spooler behind the printer channel: raw jobs by printer name,
// the queue length, and the list of installed printers. Back ends are
// sibling implementations (directory, CUPS, memory); the process chooses
// one at start-up with SetSpooler.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/DeviceContext.h"

namespace quendal {

struct InstalledPrinter {
  std::string name;        // device name, compared exactly (case-sensitive)
  double twipsPerPixelX;   // 1440 / horizontal dots per inch
  double twipsPerPixelY;   // 1440 / vertical dots per inch
};

class Spooler {
 public:
  virtual ~Spooler() = default;

  // A handle (non-zero) for the named printer, or 0 with `error` set to the
  // system error code (1801 for a printer the spooler does not know).
  virtual std::int32_t OpenPrinter(const std::string& name, long& error) = 0;
  // Starts a raw document; returns its job number (0 on failure).
  virtual std::int32_t StartDoc(std::int32_t handle, const std::string& documentName) = 0;
  // Appends bytes to the open document; false when there is none.
  virtual bool Write(std::int32_t handle, std::string_view bytes) = 0;
  // Ends the document: the job is queued for the printer.
  virtual bool EndDoc(std::int32_t handle) = 0;
  virtual void ClosePrinter(std::int32_t handle) = 0;
  // Jobs waiting in the printer's queue, at most `limit`.
  virtual std::int32_t JobCount(std::int32_t handle, std::int32_t limit) = 0;
  virtual std::vector<InstalledPrinter> InstalledPrinters() = 0;
  // A device context for drawing on an installed printer; null when it
  // can't be made, with `error` set to the system error code (1801 for a
  // printer the spooler does not know).
  virtual std::unique_ptr<DeviceContext> CreateDC(const std::string& printer, long& error) = 0;
};

// Installs the process-wide spooler and returns the previous one.
std::shared_ptr<Spooler> SetSpooler(std::shared_ptr<Spooler> spooler);
// The installed spooler; a directory spooler on "./spool" when none was set.
Spooler& CurrentSpooler();

}  // namespace quendal
