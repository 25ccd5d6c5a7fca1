// The drawing module shared by the label classes and the eParcel manifest:
// barcode arithmetic and drawing routines.
#pragma once

#include <string>
#include <string_view>

namespace quendal {

// The postal article identifier with its check digit: `articleId` (kept as
// given, letters included) + `suffix` + one GS1 modulo-10 digit computed
// over the identifier whose first three characters are made digits (a
// letter becomes the last digit of its character code: "A" (65) -> "5"),
// then the rest and the suffix; a non-digit character counts as 0.
std::string CreateArticleID(std::string_view articleId, std::string_view suffix);

}  // namespace quendal
