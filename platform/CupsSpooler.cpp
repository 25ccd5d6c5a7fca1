#include "platform/CupsSpooler.h"

#include <cups/cups.h>

#include <cmath>
#include <cstdlib>
#include <cstring>

#include "frame/Error.h"
#include "platform/CairoCanvas.h"

namespace quendal {

namespace {

// The server could not be reached (the spooler service is not available).
constexpr long kServerUnavailable = 1722;
constexpr int kDefaultDpi = 300;

// "300dpi", "600x300dpi" or "118dpcm": the across and down resolution in dots per inch.
bool ParseResolution(const char* text, double& x, double& y) {
  char* end = nullptr;
  x = std::strtod(text, &end);
  if (end == text || x <= 0) return false;
  y = x;
  if (*end == 'x') {
    const char* rest = end + 1;
    y = std::strtod(rest, &end);
    if (end == rest || y <= 0) return false;
  }
  if (std::strcmp(end, "dpcm") == 0) {
    x *= 2.54;
    y *= 2.54;
  } else if (std::strcmp(end, "dpi") != 0) {
    return false;
  }
  return true;
}

void DestResolution(cups_dest_t& dest, double& x, double& y) {
  x = y = kDefaultDpi;
  for (const char* option : {"printer-resolution", "resolution"}) {
    if (const char* value = cupsGetOption(option, dest.num_options, dest.options))
      if (ParseResolution(value, x, y)) return;
  }
  cups_dinfo_t* info = cupsCopyDestInfo(CUPS_HTTP_DEFAULT, &dest);
  if (!info) return;
  ipp_attribute_t* attr = cupsFindDestDefault(CUPS_HTTP_DEFAULT, &dest, info, "printer-resolution");
  if (attr && ippGetValueTag(attr) == IPP_TAG_RESOLUTION) {
    int down = 0;
    ipp_res_t units = IPP_RES_PER_INCH;
    const int across = ippGetResolution(attr, 0, &down, &units);
    const double factor = units == IPP_RES_PER_CM ? 2.54 : 1.0;
    if (across > 0 && down > 0) {
      x = across * factor;
      y = down * factor;
    }
  }
  cupsFreeDestInfo(info);
}

}  // namespace

struct CupsSpooler::Open {
  std::string printer;
  http_t* http = nullptr;  // the job's own connection while its document is sent
  int job = 0;
};

CupsSpooler::CupsSpooler() = default;

CupsSpooler::~CupsSpooler() {
  for (auto& [handle, open] : open_) Cancel(*open);
}

std::int32_t CupsSpooler::OpenPrinter(const std::string& name, long& error) {
  error = 0;
  cups_dest_t* dest = name.empty() ? nullptr : cupsGetNamedDest(CUPS_HTTP_DEFAULT, name.c_str(), nullptr);
  if (!dest) {
    error = cupsLastError() == IPP_STATUS_ERROR_SERVICE_UNAVAILABLE && !name.empty()
                ? kServerUnavailable
                : err::kUnknownPrinter;
    return 0;
  }
  cupsFreeDests(1, dest);
  const std::int32_t handle = nextHandle_++;
  auto open = std::make_unique<Open>();
  open->printer = name;
  open_[handle] = std::move(open);
  return handle;
}

std::int32_t CupsSpooler::StartDoc(std::int32_t handle, const std::string& documentName) {
  return StartDocAs(handle, documentName, CUPS_FORMAT_RAW);
}

std::int32_t CupsSpooler::StartDocAs(std::int32_t handle, const std::string& documentName,
                                     const char* format) {
  auto it = open_.find(handle);
  if (it == open_.end()) return 0;
  Open& open = *it->second;
  Cancel(open);
  open.http = httpConnect2(cupsServer(), ippPort(), nullptr, AF_UNSPEC, cupsEncryption(), 1, 30000,
                           nullptr);
  if (!open.http) return 0;
  const char* title = documentName.empty() ? "document" : documentName.c_str();
  open.job = cupsCreateJob(open.http, open.printer.c_str(), title, 0, nullptr);
  if (open.job > 0 && cupsStartDocument(open.http, open.printer.c_str(), open.job, title,
                                        format, 1) == HTTP_STATUS_CONTINUE)
    return open.job;
  Cancel(open);
  return 0;
}

bool CupsSpooler::Write(std::int32_t handle, std::string_view bytes) {
  auto it = open_.find(handle);
  if (it == open_.end() || !it->second->http || it->second->job == 0) return false;
  return cupsWriteRequestData(it->second->http, bytes.data(), bytes.size()) == HTTP_STATUS_CONTINUE;
}

bool CupsSpooler::EndDoc(std::int32_t handle) {
  auto it = open_.find(handle);
  if (it == open_.end() || !it->second->http || it->second->job == 0) return false;
  Open& open = *it->second;
  const ipp_status_t status = cupsFinishDocument(open.http, open.printer.c_str());
  httpClose(open.http);
  open.http = nullptr;
  open.job = 0;
  return status <= IPP_STATUS_OK_EVENTS_COMPLETE;
}

void CupsSpooler::Cancel(Open& open) {
  if (open.http) {
    // Closing the connection breaks off the document; the job is then removed.
    httpClose(open.http);
    open.http = nullptr;
  }
  if (open.job > 0) cupsCancelJob2(CUPS_HTTP_DEFAULT, open.printer.c_str(), open.job, 1);
  open.job = 0;
}

void CupsSpooler::ClosePrinter(std::int32_t handle) {
  auto it = open_.find(handle);
  if (it == open_.end()) return;
  Cancel(*it->second);
  open_.erase(it);
}

std::int32_t CupsSpooler::JobCount(std::int32_t handle, std::int32_t limit) {
  auto it = open_.find(handle);
  if (it == open_.end()) return 0;
  cups_job_t* jobs = nullptr;
  const int count =
      cupsGetJobs2(CUPS_HTTP_DEFAULT, &jobs, it->second->printer.c_str(), 0, CUPS_WHICHJOBS_ACTIVE);
  cupsFreeJobs(count > 0 ? count : 0, jobs);
  if (count <= 0) return 0;
  return count < limit ? count : limit;
}

std::vector<InstalledPrinter> CupsSpooler::InstalledPrinters() {
  std::vector<InstalledPrinter> printers;
  cups_dest_t* dests = nullptr;
  const int count = cupsGetDests2(CUPS_HTTP_DEFAULT, &dests);
  for (int i = 0; i < count; ++i) {
    cups_dest_t& dest = dests[i];
    if (dest.instance) continue;  // option sets of a queue, not printers of their own
    double x = kDefaultDpi;
    double y = kDefaultDpi;
    DestResolution(dest, x, y);
    printers.push_back({dest.name, 1440.0 / x, 1440.0 / y});
  }
  cupsFreeDests(count, dests);
  return printers;
}

namespace {

class CupsDC : public DeviceContext {
 public:
  CupsDC(CupsSpooler& spooler, std::string printer, int dpi)
      : spooler_(spooler),
        printer_(std::move(printer)),
        canvas_(static_cast<int>(std::lround(100.0 / 25.4 * dpi)),
                static_cast<int>(std::lround(150.0 / 25.4 * dpi)), dpi) {}
  bool StartDoc(const std::string& documentName) override {
    document_ = documentName.empty() ? "document" : documentName;
    return true;
  }
  bool EndDoc() override {
    if (document_.empty()) return false;
    const std::string pdf = canvas_.Document();
    long error = 0;
    const std::int32_t handle = spooler_.OpenPrinter(printer_, error);
    bool ok = handle != 0 && spooler_.StartDocAs(handle, document_, "application/pdf") != 0 &&
              spooler_.Write(handle, pdf) && spooler_.EndDoc(handle);
    if (handle) spooler_.ClosePrinter(handle);
    document_.clear();
    return ok;
  }
  void StartPage() override { canvas_.StartPage(); }
  void EndPage() override { canvas_.EndPage(); }
  void Rectangle(int x1, int y1, int x2, int y2, int penWidth) override {
    canvas_.Rectangle(x1, y1, x2, y2, penWidth);
  }
  void Text(int x, int y, std::string_view utf8, const CanvasFont& font, Colour text,
            Colour background) override {
    canvas_.Text(x, y, utf8, font, text, background);
  }

 private:
  CupsSpooler& spooler_;
  std::string printer_;
  std::string document_;
  PdfCanvas canvas_;
};

}  // namespace

std::unique_ptr<DeviceContext> CupsSpooler::CreateDC(const std::string& printer, long& error) {
  for (const InstalledPrinter& p : InstalledPrinters())
    if (p.name == printer)
      return std::make_unique<CupsDC>(*this, printer,
                                      static_cast<int>(std::lround(1440.0 / p.twipsPerPixelX)));
  error = err::kUnknownPrinter;
  return nullptr;
}

}  // namespace quendal
