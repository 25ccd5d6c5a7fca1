#include "labels/VpclLabel.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <map>

#include "frame/VB.h"

namespace quendal {

namespace {

// Splits at `separator` outside double quotes.
std::vector<std::string_view> SplitOutsideQuotes(std::string_view text, char separator) {
  std::vector<std::string_view> parts;
  bool quoted = false;
  std::size_t start = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '"') quoted = !quoted;
    else if (text[i] == separator && !quoted) {
      parts.push_back(text.substr(start, i - start));
      start = i + 1;
    }
  }
  parts.push_back(text.substr(start));
  return parts;
}

std::vector<std::string> Params(std::string_view packet) {
  std::vector<std::string> params;
  for (std::string_view p : SplitOutsideQuotes(packet, ',')) {
    std::string value;
    for (char c : p)
      if (c != '"') value += c;
    params.push_back(std::move(value));
  }
  return params;
}

// The packets of a command stream without its braces.
std::vector<std::vector<std::string>> Packets(std::string_view stream) {
  std::vector<std::vector<std::string>> packets;
  for (std::string_view p : SplitOutsideQuotes(stream, '|')) {
    while (!p.empty() && (p.front() == '{' || p.front() == '\r' || p.front() == '\n')) p.remove_prefix(1);
    if (p.empty() || p == "}") continue;
    packets.push_back(Params(p));
  }
  return packets;
}

// A numeric parameter; anything unreadable counts as 0, and values are
// bounded so that no later arithmetic can overflow.
double Number(const std::vector<std::string>& params, std::size_t index) {
  if (index >= params.size()) return 0;
  const std::string t = Trim(params[index]);
  double value = 0;
  const auto [ptr, ec] = std::from_chars(t.data(), t.data() + t.size(), value);
  if (ec != std::errc() || !std::isfinite(value)) return 0;
  return std::clamp(value, -1e6, 1e6);
}

const std::string& Param(const std::vector<std::string>& params, std::size_t index) {
  static const std::string empty;
  return index < params.size() ? params[index] : empty;
}

int Whole(double v) { return static_cast<int>(RoundHalfEven(v)); }

constexpr double kUnitsPerValue = 25.0 / 100.0;

// A barcode field whose data the format fixes ("B,n,max,F,...").
bool IsFixed(const VpclElement& e) { return e.kind == "B" && Trim(Param(e.params, 3)) == "F"; }

}  // namespace

VpclLabel ReadVpclLabel(std::string_view format, std::string_view batch) {
  VpclLabel label;
  const auto formatPackets = Packets(format);
  std::map<std::string, std::size_t> byField;
  for (std::size_t i = 0; i < formatPackets.size(); ++i) {
    const auto& params = formatPackets[i];
    if (i == 0 && Param(params, 0) == "F") {
      label.length = Number(params, 5);
      label.width = Number(params, 6);
      label.name = Param(params, 7);
      label.storage = Param(params, 4);
      continue;
    }
    VpclElement element{Param(params, 0), params, {}};
    if (element.kind == "C") element.data = Param(params, 11);
    if (element.kind == "T" || element.kind == "B") byField[Param(params, 1)] = label.elements.size();
    // The data of a fixed-data barcode, given in the format itself.
    if (element.kind == "R") {
      auto it = byField.find(Param(params, 1));
      if (it != byField.end()) label.elements[it->second].data = Param(params, 2);
    }
    label.elements.push_back(std::move(element));
  }
  for (const auto& params : Packets(batch)) {
    const std::string& first = Param(params, 0);
    if (first == "B" || first == "E") continue;
    auto it = byField.find(first);
    // A fixed-data barcode keeps the data of its format.
    if (it != byField.end() && !IsFixed(label.elements[it->second]))
      label.elements[it->second].data = Param(params, 1);
  }
  return label;
}

LabelDrawing LayOutLabel(const VpclLabel& label) {
  LabelDrawing drawing;
  // A format measured in hundredths of an inch takes a quarter of a label
  // unit per value; one measured in tenths of a millimetre ("M" in its
  // header) takes 2.54 times less, so that it is drawn at its own size and
  // fits the page as the same label in inches does.
  const double perValue = Trim(label.storage) == "M" ? kUnitsPerValue / 2.54 : kUnitsPerValue;
  const double h = label.length * perValue;
  drawing.height = h;
  drawing.width = label.width * perValue;
  for (const VpclElement& e : label.elements) {
    const auto& p = e.params;
    if (e.kind == "C" || e.kind == "T") {
      // Constant text: C,row,col,0,font,f1,f2,colour,...; field: T,n,max,V,row,col,0,font,f1,f2,colour,...
      const std::size_t at = e.kind == "C" ? 1 : 4;
      if (e.data.empty()) continue;
      LabelText t;
      t.x = Whole(Number(p, at + 1) * perValue);
      t.y = Whole(h - Number(p, at) * perValue);
      const int font = static_cast<int>(Number(p, at + 3));
      const double f1 = Number(p, at + 4);
      const double f2 = Number(p, at + 5);
      switch (font) {
        case 1:
          t.width = Whole(2 * f1), t.height = Whole(2 * f2);
          break;
        case 2:
          t.width = Whole(f1), t.height = Whole(2 * f2);
          break;
        case 3:
          t.width = Whole(3 * f1), t.height = Whole(3 * f2), t.weight = 700;
          break;
        default:
          t.width = Whole(f1), t.height = Whole(f2);
      }
      t.reversed = Param(p, at + 6) == "W";
      t.text = e.data;
      drawing.items.emplace_back(std::move(t));
    } else if (e.kind == "L") {
      // L,S,row1,col1,row2,col2,thickness,pattern; rows lowered by 3 units.
      LabelLine l;
      l.x1 = Whole(Number(p, 3) * perValue);
      l.y1 = Whole(h - (Number(p, 2) * perValue - 3));
      l.x2 = Whole(Number(p, 5) * perValue);
      l.y2 = Whole(h - (Number(p, 4) * perValue - 3));
      l.width = static_cast<double>(RoundHalfEven(Number(p, 6) * perValue));
      drawing.items.emplace_back(l);
    } else if (e.kind == "B") {
      // B,n,max,V,row,col,8,density,height,8,L,0; the row is the bars' bottom, lowered by 4 units.
      if (e.data.empty()) continue;
      LabelBarcode b;
      const std::string density = Trim(Param(p, 7));
      b.module = density == "8" ? 0.3 : density == "6" ? 0.4 : 0.5;
      b.height = Whole(Number(p, 8) * perValue);
      b.left = Whole(Number(p, 5) * perValue);
      b.bottom = h - (Number(p, 4) * perValue - 4);
      b.top = Whole(b.bottom - b.height);
      b.data = e.data;
      drawing.items.emplace_back(std::move(b));
    }
  }
  return drawing;
}

}  // namespace quendal
