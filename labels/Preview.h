// A picture of what a label printer prints for a job: VPCL II formats and
// their batches, and ZPL labels, drawn as the thermal printer prints them at
// its resolution, one PNG page per label. The label's size comes from its
// format (VPCL II) or the stream's ^PW and ^LL (ZPL); texts are turned,
// boxed and reversed as the job says, and both barcodes are drawn with the
// library's Code 128 encoder. The printer's own scalable fonts are
// approximated by a condensed sans face.
//
// This is not the drawn label of an ordinary printer (WinPCL): that one
// draws a label in its own way on a page of the office printer; this one
// shows a person what a thermal printer will make of a job.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/CairoCanvas.h"
#include "platform/DirectorySpooler.h"

namespace quendal::preview {

struct Settings {
  int dpi = 203;  // the printer's dots per inch
  // The label of a ZPL stream that sets no size of its own: 4 x 6 inches.
  double pageWidthMm = 101.6;
  double pageHeightMm = 152.4;
};

// A text as drawn: what it says and its cell on the page, in pixels.
struct PlacedText {
  std::string text;
  CanvasBox box;
};

struct Page {
  std::string png;  // 1-bit, at the printer's resolution
  int width = 0;    // pixels
  int height = 0;
  std::vector<PlacedText> texts;
};

struct Result {
  std::vector<Page> pages;         // one per label the job prints
  std::vector<std::string> notes;  // what could not be drawn, and why
};

// A label printer as far as pictures go. It keeps the VPCL II formats a job
// stores, so that the batches of later jobs find them, as the printer does.
class Printer : public JobPreviewer {
 public:
  explicit Printer(Settings settings = {});
  // The labels of one job (the bytes as sent, in the printer's code page).
  Result Print(std::string_view job);
  std::vector<std::string> Pages(std::string_view job) override;

 private:
  Settings settings_;
  std::map<std::string, std::string> formats_;  // by format number
};

// What the directory spooler calls to preview the jobs of a printer.
std::unique_ptr<JobPreviewer> MakePreviewer(int dpi, double widthMm, double heightMm);

}  // namespace quendal::preview
