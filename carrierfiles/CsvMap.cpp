#include "carrierfiles/CsvMap.h"

#include <algorithm>
#include <set>

namespace quendal {

namespace {

// Notes beyond this many are summed up in one, so a damaged file can't
// flood the host's log.
constexpr std::size_t kNotesShown = 10;

std::string_view TrimBlanks(std::string_view text) {
  const std::size_t first = text.find_first_not_of(" \t");
  if (first == std::string_view::npos) return {};
  return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

std::string AsciiUpper(std::string_view text) {
  std::string upper(text);
  for (char& c : upper)
    if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
  return upper;
}

}  // namespace

std::string DecodeHandEdited(std::string_view bytes) {
  if (bytes.starts_with("\xEF\xBB\xBF")) return std::string(bytes.substr(3));
  const bool little = bytes.starts_with("\xFF\xFE");
  if (!little && !bytes.starts_with("\xFE\xFF")) return std::string(bytes);
  std::string text;
  text.reserve(bytes.size() / 2);
  for (std::size_t i = 2; i + 1 < bytes.size(); i += 2) {
    const auto first = static_cast<unsigned char>(bytes[i]);
    const auto second = static_cast<unsigned char>(bytes[i + 1]);
    const unsigned unit = little ? first | second << 8 : first << 8 | second;
    text += unit < 0x80 ? static_cast<char>(unit) : '?';
  }
  return text;
}

std::vector<std::string_view> SplitLines(std::string_view text) {
  std::vector<std::string_view> lines;
  std::size_t start = 0;
  while (start < text.size()) {
    const std::size_t end = text.find_first_of("\r\n", start);
    if (end == std::string_view::npos) {
      lines.push_back(text.substr(start));
      break;
    }
    lines.push_back(text.substr(start, end - start));
    start = end + 1;
    if (text[end] == '\r' && start < text.size() && text[start] == '\n') ++start;
  }
  return lines;
}

CsvMap ReadCsvMap(std::string_view bytes, std::span<const std::string_view> catalogue) {
  const std::string text = DecodeHandEdited(bytes);
  const std::vector<std::string_view> lines = SplitLines(text);
  std::size_t used = lines.size();
  while (used > 0 && TrimBlanks(lines[used - 1]).empty()) --used;

  CsvMap map;
  map.columns.reserve(used);
  std::size_t unnamed = 0;
  std::set<std::string> unknown;
  // A note says what is wrong with a line; beyond the first few they are only counted.
  const auto note = [&](std::size_t line, const auto& what) {
    if (++unnamed <= kNotesShown)
      map.notes.push_back("line " + std::to_string(line) + what() +
                          "; its column is written empty.");
  };
  for (std::size_t i = 0; i < used; ++i) {
    const std::string_view name = TrimBlanks(lines[i]);
    std::ptrdiff_t field = kNoField;
    if (name.empty()) {
      note(i + 1, [] { return std::string(" is blank"); });
    } else if (name.size() > kMapNameLimit) {
      note(i + 1, [&] {
        return " is too long to name a field (" + std::to_string(name.size()) + " bytes)";
      });
    } else {
      const std::string upper = AsciiUpper(name);
      const auto it = std::find(catalogue.begin(), catalogue.end(), upper);
      if (it != catalogue.end())
        field = it - catalogue.begin();
      else if (unknown.insert(upper).second)
        note(i + 1, [&] { return " names no field: \"" + ShownText(name) + "\""; });
    }
    map.columns.push_back(field);
  }
  if (unnamed > kNotesShown)
    map.notes.push_back(std::to_string(unnamed - kNotesShown) +
                        " more lines name no field; their columns are written empty.");
  return map;
}

std::string ShownText(std::string_view text) {
  constexpr std::size_t kShown = 40;
  std::string shown;
  for (std::size_t i = 0; i < text.size() && i < kShown; ++i) {
    const auto c = static_cast<unsigned char>(text[i]);
    shown += c >= 0x20 && c < 0x7F ? static_cast<char>(c) : '?';
  }
  if (text.size() > kShown) shown += "...";
  return shown;
}

void AppendCsvValue(std::string& line, std::string_view value, char delimiter) {
  // A line break would split the record for a carrier that reads line by
  // line, quoted or not: it becomes a space, as in fixed-width records.
  auto put = [&line](char c) { line += c == '\r' || c == '\n' ? ' ' : c; };
  if (value.find(delimiter) == std::string_view::npos && value.find('"') == std::string_view::npos) {
    for (char c : value) put(c);
    return;
  }
  line += '"';
  for (char c : value) {
    if (c == '"') line += '"';
    put(c);
  }
  line += '"';
}

}  // namespace quendal
