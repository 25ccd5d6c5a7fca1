// Carrier records declared as a list of fields and rendered to one line. A
// layout is a constexpr array of fields (or a list read from a layout file
// at run time); the values of the fields that take one are handed over in
// layout order.
//
//   constexpr std::array kItem = {Literal("20"), TextLeft(20), TextLeft(0)};
//   std::string line = Render(kItem, {conNoteNo, sscc});
//
// Fill rules never cut: a value longer than its field is written whole and
// shifts the rest of the line, and a FitCheck open on the thread notes it
// so that the writer can refuse the record instead. Only CutLeft and
// CutRight take the first characters. A delimited record joins the filled fields with a delimiter
// instead of setting them side by side.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "frame/Var.h"

namespace quendal::record {

enum class Kind : std::uint8_t {
  Literal,    // the field's own text
  Spaces,     // `width` spaces
  TextLeft,   // the value, padded with spaces on the right to `width`
  TextRight,  // the value, padded with spaces on the left to `width`
  CutLeft,    // the first `width` characters of the value, padded on the right
  CutRight,   // the first `width` characters of the value, padded on the left
  Zero,       // the value as a whole number, zero-filled on the left to `width` digits
  Date,       // the value formatted with the mask; a missing date is spaces in a fixed record
  Number,     // the number formatted with the mask ("00000.000")
};

struct Field {
  Kind kind;
  int width;              // characters the field takes when the value fits
  std::string_view text;  // the literal, or the date mask
  // Written instead of the filled value when the value is missing: Null,
  // blank text, or a number the field writes as it writes 0.
  std::string_view blank = {};
  bool hasBlank = false;
  bool upper = false;  // the value is upper-cased before it is filled
};

constexpr Field Literal(std::string_view text) {
  return {Kind::Literal, static_cast<int>(text.size()), text};
}
constexpr Field Spaces(int width) { return {Kind::Spaces, width, {}}; }
constexpr Field TextLeft(int width) { return {Kind::TextLeft, width, {}}; }
constexpr Field TextRight(int width) { return {Kind::TextRight, width, {}}; }
constexpr Field CutLeft(int width) { return {Kind::CutLeft, width, {}}; }
constexpr Field CutRight(int width) { return {Kind::CutRight, width, {}}; }
constexpr Field Zero(int width) { return {Kind::Zero, width, {}}; }
// Masks whose output is as long as the mask ("YYYYMMDDHHMMSS", "DD-MMM-YYYY  ").
constexpr Field Date(std::string_view mask) {
  return {Kind::Date, static_cast<int>(mask.size()), mask};
}
// Number masks of digits and a point; a whole part too long for the mask is written whole.
constexpr Field Number(std::string_view mask) {
  return {Kind::Number, static_cast<int>(mask.size()), mask};
}

constexpr bool TakesValue(const Field& field) {
  return field.kind != Kind::Literal && field.kind != Kind::Spaces;
}

// The length of a line whose values all fit their fields.
constexpr int Width(std::span<const Field> layout) {
  int width = 0;
  for (const Field& field : layout) width += field.width;
  return width;
}

// The line (UTF-8, without line ending). Null reads as the empty text, and a
// missing date or number is written as spaces of its field's width;
// values missing at the end of the list read as Null. Control characters
// in values (line breaks, tabs) become spaces: a value must never split or
// skew a record.
std::string Render(std::span<const Field> layout, std::initializer_list<Var> values);
std::string Render(std::span<const Field> layout, std::span<const Var> values);

// The fields filled as Render fills them, joined by `delimiter`. A value
// holding the delimiter or a double quote is written in double quotes with
// each quote doubled, so that it stays one column; with a tab delimiter
// values are written as they stand, as tabs in values become spaces.
std::string RenderDelimited(std::span<const Field> layout, std::span<const Var> values,
                            char delimiter);

// One field on its own, for values that are put together before they go in.
std::string Fill(const Field& field, const Var& value);

// While it lives, notes the first value that Render on this thread found
// longer than its field. A writer of a fixed-width file opens one around
// the records of a consignment and refuses the consignment when one was
// found: the longer value would shift every field after it and the carrier
// would misread the record, and a reference must not be cut to fit.
class FitCheck {
 public:
  FitCheck();
  ~FitCheck();
  FitCheck(const FitCheck&) = delete;
  FitCheck& operator=(const FitCheck&) = delete;

  bool Fits() const { return !overlong_.has_value(); }
  // The log text of a consignment refused for the first value that did not
  // fit: its length, its field's width and its first characters.
  std::string Refusal(std::string_view conNoteNo) const;

  // Called by Render for a value of `length` characters in a field of `width`.
  static void Note(std::string_view text, long length, int width);

 private:
  struct Found {
    std::string start;
    long length = 0;
    int width = 0;
  };
  std::optional<Found> overlong_;
  FitCheck* previous_;
};

}  // namespace quendal::record
