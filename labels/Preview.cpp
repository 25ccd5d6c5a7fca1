#include "labels/Preview.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <variant>

#include "frame/VB.h"
#include "labels/VpclLabel.h"
#include "labels/WinPrint.h"
#include "platform/CodePage.h"

namespace quendal::preview {

namespace {

// The condensed sans face that stands in for the printers' scalable fonts.
constexpr std::string_view kFace = "Liberation Sans Narrow";
// No label is larger than this many pixels a side; larger numbers are bad data.
constexpr double kMaxPixels = 12000;

// A text as the job places it. VPCL II places a text by the lower-left end
// of its line (the lower-right end when right-aligned), in the text's own
// direction; ZPL by the top-left corner of the box it covers.
enum class Anchor { LineStart, LineEnd, BoxCorner };
struct TextItem {
  double x = 0, y = 0;
  Anchor anchor = Anchor::BoxCorner;
  int turns = 0;  // quarter turns clockwise
  CanvasFont font;
  bool reversed = false;  // white on a black cell
  bool invert = false;    // reverses what lies beneath
  std::string text;
};
struct FillItem {
  double x1, y1, x2, y2;
};
struct BarcodeItem {
  double x, y;  // top-left of the bars
  double module, height;
  std::string data;  // "~201" for FNC1
};
using Item = std::variant<TextItem, FillItem, BarcodeItem>;

struct Label {
  double width = 0, height = 0;  // pixels
  std::vector<Item> items;
};

double Bounded(double v) { return std::clamp(v, -kMaxPixels, kMaxPixels); }

// A whole number in a parameter text; `fallback` when there is none.
double NumberIn(std::string_view text, double fallback = 0) {
  const std::string t = Trim(text);
  double value = 0;
  const auto [ptr, ec] = std::from_chars(t.data(), t.data() + t.size(), value);
  if (ec != std::errc() || ptr == t.data() || !std::isfinite(value)) return fallback;
  return std::clamp(value, -1e6, 1e6);
}

std::vector<std::string_view> Split(std::string_view text, char separator) {
  std::vector<std::string_view> parts;
  std::size_t start = 0;
  for (std::size_t i = 0; i <= text.size(); ++i)
    if (i == text.size() || text[i] == separator) {
      parts.push_back(text.substr(start, i - start));
      start = i + 1;
    }
  return parts;
}

Page Draw(const Label& label, int dpi) {
  Page page;
  page.width = static_cast<int>(std::lround(std::clamp(label.width, 1.0, kMaxPixels)));
  page.height = static_cast<int>(std::lround(std::clamp(label.height, 1.0, kMaxPixels)));
  PngCanvas canvas(page.width, page.height, dpi);
  canvas.StartPage();
  for (const Item& item : label.items) {
    if (const auto* f = std::get_if<FillItem>(&item)) {
      canvas.Fill(f->x1, f->y1, f->x2, f->y2);
    } else if (const auto* b = std::get_if<BarcodeItem>(&item)) {
      const std::string modules = BarPattern(b->data);
      for (std::size_t i = 0; i < modules.size();) {
        std::size_t run = 0;
        while (i + run < modules.size() && modules[i + run] == modules[i]) ++run;
        if (modules[i] == '1')
          canvas.Fill(b->x + static_cast<double>(i) * b->module, b->y,
                      b->x + static_cast<double>(i + run) * b->module, b->y + b->height);
        i += run;
      }
    } else if (const auto* t = std::get_if<TextItem>(&item)) {
      const double w = canvas.TextWidth(t->text, t->font);
      const double h = t->font.height;
      // The text's direction and its "up", turned as the text is.
      static constexpr double kAlong[4][2] = {{1, 0}, {0, 1}, {-1, 0}, {0, -1}};
      const double ax = kAlong[t->turns][0], ay = kAlong[t->turns][1];
      const double ux = ay, uy = -ax;  // a quarter turn back from the direction
      double x = t->x, y = t->y;
      if (t->anchor == Anchor::LineEnd) x -= w * ax, y -= w * ay;
      if (t->anchor == Anchor::BoxCorner) {
        // The cell's corner that ends up top-left on the page.
        x += std::max(0.0, -w * ax) + std::max(0.0, -h * -ux);
        y += std::max(0.0, -w * ay) + std::max(0.0, -h * -uy);
      } else {
        x += h * ux, y += h * uy;
      }
      const CanvasBox box =
          canvas.TurnedText(x, y, t->text, t->font, t->turns, t->reversed ? kWhite : kBlack,
                            t->reversed ? std::optional<Colour>(kBlack) : std::nullopt, t->invert);
      page.texts.push_back({t->text, box});
    }
  }
  canvas.EndPage();
  page.png = canvas.Pages().empty() ? std::string() : canvas.Pages().front();
  return page;
}

// ---- VPCL II --------------------------------------------------------------

// A printer font's cell in format units at size factors 1: height, average
// character width, weight.
struct VpclFont {
  double height, width;
  int weight;
};
VpclFont FontOf(int number) {
  switch (number) {
    case 2:
      return {14, 7, 400};
    case 3:
      return {18, 12, 700};
    default:
      return {10, 4.75, 400};
  }
}

// Module width of a barcode density, in millimetres (the same reading the
// drawn labels make of it).
double ModuleMm(std::string_view density) {
  const std::string d = Trim(density);
  return d == "8" ? 0.3 : d == "6" ? 0.4 : 0.5;
}

// The top-level groups of a VPCL II stream: "{F...}", "{B...}", "{G...}".
std::vector<std::string_view> Groups(std::string_view stream) {
  std::vector<std::string_view> groups;
  bool quoted = false;
  std::size_t start = std::string_view::npos;
  for (std::size_t i = 0; i < stream.size(); ++i) {
    const char c = stream[i];
    if (start == std::string_view::npos) {
      if (c == '{') start = i;
      continue;
    }
    if (c == '"') quoted = !quoted;
    else if (c == '}' && !quoted) {
      groups.push_back(stream.substr(start, i - start + 1));
      start = std::string_view::npos;
    }
  }
  return groups;
}

// The letter and the number of a group's header: "{F,430,..." gives F, 430.
std::pair<char, std::string> HeaderOf(std::string_view group) {
  const std::string header = Trim(group.substr(1, group.find('|') == std::string_view::npos
                                                      ? std::string_view::npos
                                                      : group.find('|') - 1));
  const auto params = Split(header, ',');
  const char letter = header.empty() ? ' ' : static_cast<char>(std::toupper(static_cast<unsigned char>(header[0])));
  return {letter, params.size() > 1 ? Trim(params[1]) : std::string()};
}

Label VpclPage(const VpclLabel& vpcl, int dpi) {
  // Formats are measured in hundredths of an inch ("E"), or tenths of a
  // millimetre where the header says "M".
  const double u = Trim(vpcl.storage) == "M" ? dpi / 254.0 : dpi / 100.0;
  // The printer's fonts keep their size whatever unit the format measures in.
  const double fontUnit = dpi / 100.0;
  const double length = vpcl.length;
  Label label;
  label.width = vpcl.width * u;
  label.height = vpcl.length * u;
  const auto X = [&](double column) { return Bounded(column * u); };
  const auto Y = [&](double row) { return Bounded((length - row) * u); };
  std::map<std::string, std::string> fixed;  // barcode data fixed in the format
  for (const VpclElement& e : vpcl.elements)
    if (e.kind == "R" && e.params.size() > 2) fixed[Trim(e.params[1])] = e.params[2];
  for (const VpclElement& e : vpcl.elements) {
    const auto& p = e.params;
    const auto N = [&](std::size_t i) { return i < p.size() ? NumberIn(p[i]) : 0.0; };
    const auto S = [&](std::size_t i) { return i < p.size() ? Trim(p[i]) : std::string(); };
    if (e.kind == "C" || e.kind == "T") {
      const bool constant = e.kind == "C";
      const std::size_t at = constant ? 1 : 4;
      std::string text = e.data;
      if (!constant && N(2) > 0) text = Left(text, static_cast<long>(N(2)));
      if (text.empty()) continue;
      const VpclFont metrics = FontOf(static_cast<int>(N(at + 3)));
      const double across = std::clamp(N(at + 4), 1.0, 100.0);
      const double down = std::clamp(N(at + 5), 1.0, 100.0);
      TextItem t;
      t.x = X(N(at + 1));
      t.y = Y(N(at));
      t.anchor = S(at + 7) == "R" ? Anchor::LineEnd : Anchor::LineStart;
      // A right-aligned field ends where its longest text would end.
      if (!constant && t.anchor == Anchor::LineEnd)
        t.x = X(N(at + 1) + std::max(0.0, N(2)) * metrics.width * across * fontUnit / u);
      // Rotation counts quarter turns anticlockwise: 3 runs the text down the label.
      const int rotation = static_cast<int>(N(constant ? 10 : 13));
      t.turns = (4 - ((rotation % 4) + 4) % 4) % 4;
      t.font.height = static_cast<int>(std::lround(std::min(kMaxPixels, metrics.height * down * fontUnit)));
      t.font.width = static_cast<int>(std::lround(std::min(kMaxPixels, metrics.width * across * fontUnit)));
      t.font.weight = metrics.weight;
      t.font.face = std::string(kFace);
      t.reversed = S(at + 6) == "W";
      t.text = std::move(text);
      label.items.emplace_back(std::move(t));
    } else if (e.kind == "B") {
      const std::string data = S(3) == "F" ? fixed[S(1)] : e.data;
      if (data.empty()) continue;
      const double module = std::max(1.0, std::round(ModuleMm(S(7)) / 25.4 * dpi));
      const double height = Bounded(N(8) * u);
      label.items.emplace_back(BarcodeItem{X(N(5)), Y(N(4)) - height, module, height, data});
    } else if (e.kind == "L") {
      // A band as thick as the line, on the row or the column it names.
      const double t = std::max(1.0, N(6) * u);
      if (N(2) == N(4))
        label.items.emplace_back(
            FillItem{X(std::min(N(3), N(5))), Y(N(2)) - t, X(std::max(N(3), N(5))), Y(N(2))});
      else if (N(3) == N(5))
        label.items.emplace_back(
            FillItem{X(N(3)), Y(std::max(N(2), N(4))), X(N(3)) + t, Y(std::min(N(2), N(4)))});
    } else if (e.kind == "Q") {
      const double t = std::max(1.0, N(5) * u);
      const double left = X(std::min(N(2), N(4))), right = X(std::max(N(2), N(4)));
      const double top = Y(std::max(N(1), N(3))), bottom = Y(std::min(N(1), N(3)));
      label.items.emplace_back(FillItem{left, top, right, std::min(bottom, top + t)});
      label.items.emplace_back(FillItem{left, std::max(top, bottom - t), right, bottom});
      label.items.emplace_back(FillItem{left, top, std::min(right, left + t), bottom});
      label.items.emplace_back(FillItem{std::max(left, right - t), top, right, bottom});
    }
  }
  return label;
}

// ---- ZPL ---------------------------------------------------------------

// ZPL barcode data as Code 128 data: ">8" is FNC1; the start and code-set
// invocations (">;", ">:", ">9", ">5", ">6", ">7") are left to the
// encoder, which picks code sets itself.
std::string Code128Data(std::string_view data) {
  std::string out;
  for (std::size_t i = 0; i < data.size(); ++i) {
    if (data[i] == '>' && i + 1 < data.size()) {
      const char next = data[i + 1];
      if (next == '8') {
        out += "~201";
        ++i;
        continue;
      }
      if (std::string_view(";:9567").find(next) != std::string_view::npos) {
        ++i;
        continue;
      }
    }
    out += data[i];
  }
  return out;
}

int TurnsOf(char orientation) {
  switch (std::toupper(static_cast<unsigned char>(orientation))) {
    case 'R':
      return 1;
    case 'I':
      return 2;
    case 'B':
      return 3;
    default:
      return 0;
  }
}

std::vector<Label> ZplLabels(std::string_view stream, const Settings& settings,
                             std::vector<std::string>& notes) {
  std::vector<Label> labels;
  const double defaultWidth = settings.pageWidthMm / 25.4 * settings.dpi;
  const double defaultLength = settings.pageHeightMm / 25.4 * settings.dpi;
  double printWidth = 0, labelLength = 0;  // ^PW and ^LL, kept from label to label
  double homeX = 0, homeY = 0, x = 0, y = 0;
  int fontHeight = 18, fontWidth = 10, defaultHeight = 18, defaultFontWidth = 10;
  char orientation = 'N', defaultOrientation = 'N';
  double barModule = 2, barHeight = 10;
  bool reverse = false, barcode = false;
  double barcodeHeight = 0;
  bool open = false;
  Label label;
  std::size_t i = 0;
  while (i < stream.size()) {
    const char c = stream[i];
    if ((c != '^' && c != '~') || i + 2 >= stream.size()) {
      ++i;
      continue;
    }
    std::string command{static_cast<char>(std::toupper(static_cast<unsigned char>(stream[i + 1]))),
                        static_cast<char>(std::toupper(static_cast<unsigned char>(stream[i + 2])))};
    const std::size_t begin = i + 3;
    std::size_t end = stream.find_first_of("^~", begin);
    if (end == std::string_view::npos) end = stream.size();
    const std::string_view args = stream.substr(begin, end - begin);
    i = end;
    const auto params = Split(args, ',');
    const auto P = [&](std::size_t k, double fallback) {
      return k < params.size() ? NumberIn(params[k], fallback) : fallback;
    };
    if (c == '^' && command[0] == 'A' && command != "A@") {
      // ^A<font><orientation>,<height>,<width>
      if (!args.empty() && std::isalpha(static_cast<unsigned char>(args[0])))
        orientation = args[0];
      const auto sizes = Split(args.substr(std::min<std::size_t>(args.size(), 1)), ',');
      fontHeight = sizes.size() > 1 ? static_cast<int>(NumberIn(sizes[1], defaultHeight)) : defaultHeight;
      fontWidth = sizes.size() > 2 ? static_cast<int>(NumberIn(sizes[2], fontHeight)) : fontHeight;
      continue;
    }
    if (command == "XA") {
      open = true;
      label = Label{};
      homeX = homeY = x = y = 0;
      reverse = barcode = false;
    } else if (command == "XZ") {
      if (open && !label.items.empty()) {
        label.width = printWidth > 0 ? printWidth : defaultWidth;
        label.height = labelLength > 0 ? labelLength : defaultLength;
        labels.push_back(std::move(label));
      }
      label = Label{};
      open = false;
    } else if (command == "LH") {
      homeX = P(0, 0), homeY = P(1, 0);
    } else if (command == "FO" || command == "FT") {
      x = Bounded(homeX + P(0, 0));
      y = Bounded(homeY + P(1, 0));
      // ^FT places the text's baseline, ^FO its top.
      if (command == "FT") y -= fontHeight;
    } else if (command == "CF") {
      defaultHeight = fontHeight = static_cast<int>(P(1, defaultHeight));
      defaultFontWidth = fontWidth = static_cast<int>(P(2, fontHeight));
    } else if (command == "FW") {
      if (!args.empty()) defaultOrientation = orientation = args[0];
    } else if (command == "FR") {
      reverse = true;
    } else if (command == "BY") {
      barModule = std::clamp(P(0, barModule), 1.0, 10.0);
      barHeight = std::clamp(P(2, barHeight), 1.0, kMaxPixels);
    } else if (command == "BC") {
      barcode = true;
      barcodeHeight = std::clamp(P(1, barHeight), 1.0, kMaxPixels);
    } else if (command == "GB") {
      const double t = std::clamp(P(2, 1), 1.0, kMaxPixels);
      const double w = std::max(std::clamp(P(0, t), 1.0, kMaxPixels), t);
      const double h = std::max(std::clamp(P(1, t), 1.0, kMaxPixels), t);
      label.items.emplace_back(FillItem{x, y, x + w, std::min(y + h, y + t)});
      label.items.emplace_back(FillItem{x, y + h - std::min(t, h), x + w, y + h});
      label.items.emplace_back(FillItem{x, y, x + std::min(t, w), y + h});
      label.items.emplace_back(FillItem{x + w - std::min(t, w), y, x + w, y + h});
    } else if (command == "FD" || command == "FV") {
      if (barcode) {
        label.items.emplace_back(BarcodeItem{x, y, barModule, barcodeHeight, Code128Data(args)});
      } else if (!args.empty()) {
        TextItem t;
        t.x = x, t.y = y;
        t.turns = TurnsOf(orientation);
        t.font.height = std::clamp(fontHeight, 1, static_cast<int>(kMaxPixels));
        // Font 0's characters are about half as wide as the width asked.
        t.font.width = std::clamp((fontWidth + 1) / 2, 1, static_cast<int>(kMaxPixels));
        t.font.weight = 700;
        t.font.face = std::string(kFace);
        t.invert = reverse;
        t.text = std::string(args);
        label.items.emplace_back(std::move(t));
      }
    } else if (command == "FS") {
      reverse = barcode = false;
      orientation = defaultOrientation;
      fontHeight = defaultHeight, fontWidth = defaultFontWidth;
    } else if (command == "PW") {
      printWidth = std::clamp(P(0, 0), 0.0, kMaxPixels);
    } else if (command == "LL") {
      labelLength = std::clamp(P(0, 0), 0.0, kMaxPixels);
    }
  }
  if (open && !label.items.empty()) notes.push_back("a ZPL label without ^XZ is not printed");
  return labels;
}

}  // namespace

Printer::Printer(Settings settings) : settings_(settings) {
  settings_.dpi = std::clamp(settings_.dpi, 50, 2400);
}

Result Printer::Print(std::string_view job) {
  Result result;
  const std::string text = FromCodePage(job);
  if (text.find("^XA") != std::string::npos || text.find("^xa") != std::string::npos) {
    for (const Label& label : ZplLabels(text, settings_, result.notes))
      result.pages.push_back(Draw(label, settings_.dpi));
    return result;
  }
  std::vector<std::string> storedHere;  // formats this job stores, in order
  bool batches = false;
  for (std::string_view group : Groups(text)) {
    const auto [letter, number] = HeaderOf(group);
    if (letter == 'F') {
      formats_[number] = std::string(group);
      storedHere.push_back(number);
    } else if (letter == 'B') {
      batches = true;
      const auto format = formats_.find(number);
      if (format == formats_.end()) {
        result.notes.push_back("a batch for format " + number + ", which was never sent");
        continue;
      }
      result.pages.push_back(Draw(VpclPage(ReadVpclLabel(format->second, group), settings_.dpi), settings_.dpi));
    }
  }
  // A job that only stores formats shows each one as it stands.
  if (!batches)
    for (const std::string& number : storedHere)
      result.pages.push_back(Draw(VpclPage(ReadVpclLabel(formats_[number], {}), settings_.dpi), settings_.dpi));
  if (result.pages.empty() && result.notes.empty())
    result.notes.push_back("no VPCL II format or batch and no ZPL label in the job");
  return result;
}

std::vector<std::string> Printer::Pages(std::string_view job) {
  std::vector<std::string> pages;
  for (Page& page : Print(job).pages) pages.push_back(std::move(page.png));
  return pages;
}

std::unique_ptr<JobPreviewer> MakePreviewer(int dpi, double widthMm, double heightMm) {
  return std::make_unique<Printer>(Settings{dpi, widthMm, heightMm});
}

}  // namespace quendal::preview
