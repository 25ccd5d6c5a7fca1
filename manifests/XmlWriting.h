// What the carriers' XML files share: element text that keeps a file
// well-formed whatever the host holds, elements with text, the indented
// tree with every line ended by carriage return and line feed, and the
// reading of a day file written earlier.
#pragma once

#include <pugixml.hpp>
#include <string>
#include <string_view>

namespace quendal::xml {

// Text fit for an element: control characters become spaces, malformed
// UTF-8 becomes U+FFFD, so the file always stays well-formed.
std::string XmlText(std::string_view text);

// Appends an element with text to `parent` and returns it.
pugi::xml_node AppendText(pugi::xml_node parent, const char* name, std::string_view text);

// How the carriers' files are indented: two spaces a level, and an element
// without text written with its start and end tags.
inline constexpr const char* kIndent = "  ";
inline constexpr unsigned kFormat = pugi::format_indent | pugi::format_no_empty_element_tags;

// Collects serialised XML (UTF-8) with every line ended by CR LF.
class CrLfWriter : public pugi::xml_writer {
 public:
  explicit CrLfWriter(std::string& out) : out_(out) {}
  void write(const void* data, std::size_t size) override;

 private:
  std::string& out_;
};

// The node and what it holds as the indented file shows it at `depth`
// (0 for the document itself), each line ended by CR LF.
void AppendIndented(std::string& out, pugi::xml_node node, unsigned depth = 0);

// Reads a day file back. pugixml ends its parse at a NUL character, which
// XML allows nowhere, so a file with one after its root read as whole up to
// there: extending or rewriting it would misplace or drop what follows. Such
// a file reads as malformed (status_bad_pcdata, offset at the NUL), in
// whichever encoding pugixml found.
pugi::xml_parse_result LoadDayFile(pugi::xml_document& doc, std::string_view bytes,
                                   unsigned options);

}  // namespace quendal::xml
