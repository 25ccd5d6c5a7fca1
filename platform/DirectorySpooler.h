// The embedded default spooler: printer NAME is the folder SPOOL/NAME/ (it
// exists = it is installed); each job is one file
// SPOOL/NAME/NNNNNN-<document name>.prn holding the bytes as sent (a
// document named "*.pdf" is a PDF job: NNNNNN-<name>.pdf); the
// queue length is the number of job files. SPOOL/NAME/printer.ini may set
// dpi= (default 300), and preview=yes to have a picture of what each raw
// job prints written beside it (preview-NNNNNN-<document name>.png, then
// -2, -3 ... for the job's further labels), when a previewer is installed.
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/Spooler.h"

namespace quendal {

// Draws what a printer prints for raw jobs, one PNG page per label. It may
// keep what earlier jobs sent it, as a printer keeps stored formats.
class JobPreviewer {
 public:
  virtual ~JobPreviewer() = default;
  virtual std::vector<std::string> Pages(std::string_view job) = 0;
};

// Makes the previewer of one printer: its resolution and the page of a
// label that sets no size of its own, in millimetres.
using JobPreviewerFactory =
    std::function<std::unique_ptr<JobPreviewer>(int dpi, double widthMm, double heightMm)>;

class DirectorySpooler : public Spooler {
 public:
  explicit DirectorySpooler(std::string root);

  std::int32_t OpenPrinter(const std::string& name, long& error) override;
  std::int32_t StartDoc(std::int32_t handle, const std::string& documentName) override;
  bool Write(std::int32_t handle, std::string_view bytes) override;
  bool EndDoc(std::int32_t handle) override;
  void ClosePrinter(std::int32_t handle) override;
  std::int32_t JobCount(std::int32_t handle, std::int32_t limit) override;
  std::vector<InstalledPrinter> InstalledPrinters() override;
  std::unique_ptr<DeviceContext> CreateDC(const std::string& printer, long& error) override;

  // Installs what draws the previews of the printers whose printer.ini says
  // preview=yes (none by default).
  void SetPreviewer(JobPreviewerFactory factory) { previewerFactory_ = std::move(factory); }

  const std::string& Root() const { return root_; }
  // The folder of a printer.
  std::string PrinterFolder(const std::string& name) const;
  // The printer's resolution from printer.ini (dpi=, default 300).
  int Dpi(const std::string& name) const;
  // The page of a drawn printer in millimetres (printer.ini width_mm=, height_mm=; default a
  // 100 x 150 mm label).
  double PageWidthMm(const std::string& name) const;
  double PageHeightMm(const std::string& name) const;
  // Reserves the next job file name "NNNNNN-<document>.<extension>" in a printer's folder.
  std::string NextJobPath(const std::string& name, const std::string& documentName,
                          const std::string& extension);
  // Writes a job file under the next number and returns its path (empty
  // when it could not be written). The printer folder's numbering is locked
  // from reading the counter until the job is in the queue, so processes
  // printing to one folder never take the same number.
  std::string WriteNextJob(const std::string& name, const std::string& documentName,
                           const std::string& extension, std::string_view bytes);

 private:
  // A number from printer.ini within [low, high], else `fallback`.
  double Setting(const std::string& name, std::string_view key, double fallback, double low,
                 double high) const;
  // A text from printer.ini, trimmed; empty when not set.
  std::string TextSetting(const std::string& name, std::string_view key) const;
  // Writes the pictures of a raw job beside it when its printer asks for them.
  void WritePreview(const std::string& printer, const std::string& jobPath, std::string_view bytes);
  struct Open {
    std::string printer;
    std::string document;  // empty when no document is started
    std::string bytes;
    std::int32_t job = 0;
  };
  std::string root_;
  std::map<std::int32_t, Open> open_;
  std::int32_t nextHandle_ = 1;
  std::int32_t jobSerial_ = 0;
  JobPreviewerFactory previewerFactory_;
  std::map<std::string, std::unique_ptr<JobPreviewer>> previewers_;  // by printer
};

// A file name made safe: path separators, "..", control characters and
// characters that file systems refuse become "_".
std::string SafeFileName(std::string_view name);
// A piece of a file name taken from host text, made safe the same way on its
// own; an empty piece stays empty. Build a name from safe pieces and fixed
// parts, so that no host text can reach into the extension or the folder.
std::string SafeNamePart(std::string_view text);
// A document's title as a part of a file name that only tells people what
// the file holds (a spooled job, a drawn page): made safe, and cut to at
// most 100 bytes of whole characters, so that a long title can't make a
// name the file system refuses.
std::string TitleForFileName(std::string_view title);

}  // namespace quendal
