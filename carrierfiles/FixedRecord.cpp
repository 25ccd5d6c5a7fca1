#include "carrierfiles/FixedRecord.h"

#include "carrierfiles/CsvMap.h"
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

// The field's text for the value, before any blank text is put in its place.
std::string Filled(const Field& field, const Var& value) {
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
    case Kind::CutRight:
      return PadLeft(Left(Clean(value.Text()), field.width), field.width);
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

bool IsBlank(const Field& field, const Var& value) {
  if (value.IsNull() || Trim(value.Text()).empty()) return true;
  if (field.kind != Kind::Zero && field.kind != Kind::Number) return false;
  return !value.IsNumeric() || Filled(field, value) == Filled(field, Var(0));
}

}  // namespace

std::string Fill(const Field& field, const Var& value) {
  if (field.hasBlank && TakesValue(field) && IsBlank(field, value)) return std::string(field.blank);
  const bool text = field.kind == Kind::TextLeft || field.kind == Kind::TextRight ||
                    field.kind == Kind::CutLeft || field.kind == Kind::CutRight;
  if (field.upper && text) return Filled(field, Var(UCase(value.Text())));
  return Filled(field, value);
}

std::string Render(std::span<const Field> layout, std::initializer_list<Var> values) {
  return Render(layout, std::span<const Var>(values.begin(), values.size()));
}

std::string Render(std::span<const Field> layout, std::span<const Var> values) {
  std::string line;
  line.reserve(static_cast<std::size_t>(Width(layout)));
  auto next = values.begin();
  for (const Field& field : layout) {
    if (!TakesValue(field)) {
      line += Fill(field, Var());
      continue;
    }
    std::string text = Fill(field, next != values.end() ? *next++ : Var());
    // A missing date or number keeps its place in the record as spaces.
    if (text.empty() && (field.kind == Kind::Date || field.kind == Kind::Number))
      text = quendal::Spaces(field.width);
    // A field of width 0 takes its value as it stands (the end of a line).
    if (field.width > 0) {
      const long length = Len(text);
      if (length > field.width) FitCheck::Note(text, length, field.width);
    }
    line += text;
  }
  return line;
}

std::string RenderDelimited(std::span<const Field> layout, std::span<const Var> values,
                            char delimiter) {
  std::string line;
  auto next = values.begin();
  bool first = true;
  for (const Field& field : layout) {
    if (!first) line += delimiter;
    first = false;
    Var value;
    if (TakesValue(field) && next != values.end()) value = *next++;
    const std::string text = Fill(field, value);
    if (delimiter == '\t')
      line += text;
    else
      AppendCsvValue(line, text, delimiter);
  }
  return line;
}

namespace {
thread_local FitCheck* openCheck = nullptr;
}  // namespace

FitCheck::FitCheck() : previous_(openCheck) { openCheck = this; }

FitCheck::~FitCheck() { openCheck = previous_; }

void FitCheck::Note(std::string_view text, long length, int width) {
  if (!openCheck || openCheck->overlong_) return;
  constexpr long kShown = 20;
  std::string start = Left(text, kShown);
  if (length > kShown) start += "...";
  openCheck->overlong_ = Found{std::move(start), length, width};
}

std::string FitCheck::Refusal(std::string_view conNoteNo) const {
  if (!overlong_) return {};
  return "ConNote " + Left(conNoteNo, 40) + " not added: a value of " +
         std::to_string(overlong_->length) + " characters (\"" + overlong_->start +
         "\") is longer than its field of " + std::to_string(overlong_->width);
}

}  // namespace quendal::record
