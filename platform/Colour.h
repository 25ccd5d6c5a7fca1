// Colours of drawn pages and printed documents.
#pragma once

#include <cstdint>

namespace quendal {

using Colour = std::uint32_t;  // 0xRRGGBB
inline constexpr Colour kBlack = 0x000000;
inline constexpr Colour kWhite = 0xFFFFFF;

}  // namespace quendal
