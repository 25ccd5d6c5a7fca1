// Text, number and date helpers that behave as the host's runtime does, so
// that carrier records and labels come out exactly as the carriers expect.
// Texts are UTF-8; lengths and positions count characters, not bytes.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "frame/Var.h"

namespace quendal {

// The first n characters (all when shorter; none when n <= 0).
std::string Left(std::string_view text, long n);
// The last n characters.
std::string Right(std::string_view text, long n);
// From the 1-based character position `start`, at most `length` characters (all when length < 0).
std::string Mid(std::string_view text, long start, long length = -1);
// Length in characters.
long Len(std::string_view text);
// Leading and trailing spaces removed (spaces only, as the runtime does).
std::string Trim(std::string_view text);
std::string LTrim(std::string_view text);
std::string RTrim(std::string_view text);
// Upper / lower case, for ASCII and the Latin-1 letters.
std::string UCase(std::string_view text);
std::string LCase(std::string_view text);
// 1-based position of `what` in `text`, 0 when absent (case-sensitive).
long InStr(std::string_view text, std::string_view what);
std::string Replace(std::string_view text, std::string_view what, std::string_view with);
std::string Spaces(long n);

// A number as the runtime writes it: at most 15 significant digits, no
// trailing zeros, exponent form "1E+20" for very large or small values.
std::string NumberText(double value);
// Whole number, halves to the even neighbour (0.5 -> 0, 1.5 -> 2, 2.5 -> 2).
std::int64_t RoundHalfEven(double value);
// Rounded to `digits` decimals, halves to even.
double Round(double value, int digits);
// True when the text reads as a number (leading/trailing spaces allowed).
bool IsNumericText(std::string_view text);
// The text as a flag: "True"/"False" in any case, or a number (0 = False);
// anything else raises "Type mismatch".
bool TextToFlag(std::string_view text);

// Format(value, mask) with the masks the carriers' records use:
//  - dates: d dd ddd dddd m mm mmm mmmm yy yyyy h hh n nn s ss (any case);
//    "m"/"mm" after an hour or before seconds means minutes; "Short Date",
//    "Long Date"; other characters are copied;
//  - numbers: "0" digit, "#" optional digit, "." decimal point (rounded half away from zero);
//  - text: "@" a character, right-aligned and padded; "!" first = left-aligned; never cut.
// Null formats as "". Text that is not a number or date is returned as it is by numeric/date masks.
std::string Format(const Var& value, std::string_view mask);

}  // namespace quendal
