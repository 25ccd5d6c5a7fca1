#include "manifests/XmlWriting.h"

#include <optional>

namespace quendal::xml {

namespace {

constexpr std::string_view kReplacement = "\xEF\xBF\xBD";

// Length of the well-formed UTF-8 sequence at the start of `s` that XML
// allows (0 when malformed or not an XML character).
std::size_t XmlCharLength(std::string_view s) {
  const auto b0 = static_cast<unsigned char>(s[0]);
  std::size_t length;
  char32_t code;
  if (b0 < 0x80) return 1;
  if (b0 >= 0xC2 && b0 <= 0xDF) {
    length = 2;
    code = b0 & 0x1F;
  } else if (b0 >= 0xE0 && b0 <= 0xEF) {
    length = 3;
    code = b0 & 0x0F;
  } else if (b0 >= 0xF0 && b0 <= 0xF4) {
    length = 4;
    code = b0 & 0x07;
  } else {
    return 0;
  }
  if (s.size() < length) return 0;
  for (std::size_t i = 1; i < length; ++i) {
    const auto b = static_cast<unsigned char>(s[i]);
    if ((b & 0xC0) != 0x80) return 0;
    code = (code << 6) | (b & 0x3F);
  }
  const bool overlong = (length == 3 && code < 0x800) || (length == 4 && code < 0x10000);
  const bool surrogate = code >= 0xD800 && code <= 0xDFFF;
  if (overlong || surrogate || code > 0x10FFFF || code == 0xFFFE || code == 0xFFFF) return 0;
  return length;
}

}  // namespace

std::string XmlText(std::string_view text) {
  std::string out;
  out.reserve(text.size());
  while (!text.empty()) {
    const std::size_t length = XmlCharLength(text);
    if (length == 0) {
      out.append(kReplacement);
      text.remove_prefix(1);
      continue;
    }
    if (length == 1 && static_cast<unsigned char>(text[0]) < 0x20)
      out.push_back(' ');
    else
      out.append(text.substr(0, length));
    text.remove_prefix(length);
  }
  return out;
}

pugi::xml_node AppendText(pugi::xml_node parent, const char* name, std::string_view text) {
  pugi::xml_node node = parent.append_child(name);
  node.text().set(XmlText(text).c_str());
  return node;
}

void CrLfWriter::write(const void* data, std::size_t size) {
  std::string_view bytes(static_cast<const char*>(data), size);
  for (std::size_t at; (at = bytes.find('\n')) != std::string_view::npos;) {
    out_.append(bytes.substr(0, at));
    out_.append("\r\n");
    bytes.remove_prefix(at + 1);
  }
  out_.append(bytes);
}

void AppendIndented(std::string& out, pugi::xml_node node, unsigned depth) {
  CrLfWriter writer(out);
  node.print(writer, kIndent, kFormat, pugi::encoding_utf8, depth);
}

namespace {

// Where the first NUL character is, reading `bytes` in code units of `unit` bytes.
std::optional<std::size_t> FirstNul(std::string_view bytes, std::size_t unit) {
  for (std::size_t at = 0; at + unit <= bytes.size(); at += unit)
    if (bytes.substr(at, unit).find_first_not_of('\0') == std::string_view::npos) return at;
  return std::nullopt;
}

std::size_t UnitOf(pugi::xml_encoding encoding) {
  switch (encoding) {
    case pugi::encoding_utf16_le:
    case pugi::encoding_utf16_be:
    case pugi::encoding_utf16:
      return 2;
    case pugi::encoding_utf32_le:
    case pugi::encoding_utf32_be:
    case pugi::encoding_utf32:
      return 4;
    case pugi::encoding_wchar:
      return sizeof(wchar_t);
    default:
      return 1;
  }
}

}  // namespace

pugi::xml_parse_result LoadDayFile(pugi::xml_document& doc, std::string_view bytes,
                                   unsigned options) {
  pugi::xml_parse_result parsed =
      doc.load_buffer(bytes.data(), bytes.size(), options, pugi::encoding_auto);
  if (!parsed) return parsed;
  if (const auto nul = FirstNul(bytes, UnitOf(parsed.encoding))) {
    doc.reset();
    parsed.status = pugi::status_bad_pcdata;
    parsed.offset = static_cast<std::ptrdiff_t>(*nul);
  }
  return parsed;
}

}  // namespace quendal::xml
