#include "carrierfiles/FixedRecord.h"

#include "frame/VB.h"

namespace quendal::record {

namespace {

std::string Clean(std::string text) {
  for (char& c : text)
    if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F) c = ' ';
  return text;
}

std::string PadRight(std::string text, int width) {
  const long length = Len(text);
  if (length < width) text += quendal::Spaces(width - length);
  return text;
}

std::string PadLeft(std::string text, int width) {
  const long length = Len(text);
  if (length < width) text.insert(0, quendal::Spaces(width - length));
  return text;
}

}  // namespace

std::string Fill(const Field& field, const Var& value) {
  switch (field.kind) {
    case Kind::Literal:
      return std::string(field.text);
    case Kind::Spaces:
      return quendal::Spaces(field.width);
    case Kind::TextLeft:
      return PadRight(Clean(value.Text()), field.width);
    case Kind::TextRight:
      return PadLeft(Clean(value.Text()), field.width);
    case Kind::CutLeft:
      return PadRight(Left(Clean(value.Text()), field.width), field.width);
    case Kind::Zero: {
      const std::int64_t whole = RoundHalfEven(value.NumberOr(0));
      return Format(Var(whole), std::string(static_cast<std::size_t>(field.width), '0'));
    }
    case Kind::Date:
    case Kind::Number:
      return Clean(Format(value, field.text));
  }
  return {};
}

std::string Render(std::span<const Field> layout, std::initializer_list<Var> values) {
  std::string line;
  line.reserve(static_cast<std::size_t>(Width(layout)));
  const Var* next = values.begin();
  for (const Field& field : layout) {
    if (!TakesValue(field)) {
      line += Fill(field, Var());
      continue;
    }
    line += Fill(field, next != values.end() ? *next++ : Var());
  }
  return line;
}

}  // namespace quendal::record
