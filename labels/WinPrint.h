// The drawing module shared by the label classes and the eParcel manifest:
// barcode arithmetic and drawing routines.
#pragma once

#include <string>
#include <string_view>

namespace quendal {

// The Code 128 symbol of `data` as modules, one character each ("1" bar,
// "0" space), from the start symbol to the stop symbol's termination bar,
// without quiet zones. "~201" (and the group separator) in the data is
// FNC1. Data whose first four characters are digits, or that holds FNC1,
// starts in code set C (digit pairs) and leaves it for good at the first
// character that is not a digit pair or FNC1, preferring set A over set B
// character by character; other data is encoded in set B throughout.
// A character that has no value in the code set in use (bytes above 127;
// control characters in set-B data) is dropped: it yields no symbol, so the
// symbol never loops or carries a wrong character.
std::string BarPattern(std::string_view data);

// Element widths ("211214") as modules: each digit adds that many modules,
// alternating from a bar ("11010010000"). Characters that are not digits
// are skipped.
std::string ConvertPattern(std::string_view widths);

// The element widths of Code 128 symbol value index - 1 (index 1 to 107);
// empty for any other index.
std::string GetBars(int index);

// The postal article identifier with its check digit: `articleId` (kept as
// given, letters included) + `suffix` + one GS1 modulo-10 digit computed
// over the identifier whose first three characters are made digits (a
// letter becomes the last digit of its character code: "A" (65) -> "5"),
// then the rest and the suffix; a non-digit character counts as 0.
std::string CreateArticleID(std::string_view articleId, std::string_view suffix);
// The Australia Post label classes' name for the same routine.
std::string CreateBarcode(std::string_view articleId, std::string_view suffix);

// The text without its double quotes, so that it can stand inside a quoted
// printer field.
std::string RemoveInvalidChar(std::string_view text);

}  // namespace quendal
