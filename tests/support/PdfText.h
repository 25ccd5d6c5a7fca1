// The text of a PDF as poppler's pdftotext reads it, with every run of
// white space made one space, so tests can look for phrases however the
// lines were broken.
#pragma once

#include <cstdio>
#include <string>

namespace quendal::test {

inline std::string Words(const std::string& text) {
  std::string out;
  bool space = false;
  for (unsigned char c : text) {
    if (c == ' ' || c == '\n' || c == '\r' || c == '\t' || c == '\f') {
      space = !out.empty();
      continue;
    }
    if (space) out += ' ';
    space = false;
    out += static_cast<char>(c);
  }
  return out;
}

// The text as pdftotext lays it out; pages end with a form feed.
inline std::string PdfText(const std::string& path) {
  std::string text;
  if (FILE* pipe = ::popen(("pdftotext -q -layout '" + path + "' - 2>/dev/null").c_str(), "r")) {
    char buffer[4096];
    std::size_t n;
    while ((n = std::fread(buffer, 1, sizeof buffer, pipe)) > 0) text.append(buffer, n);
    ::pclose(pipe);
  }
  return text;
}

inline std::string PdfWords(const std::string& path) { return Words(PdfText(path)); }

}  // namespace quendal::test
