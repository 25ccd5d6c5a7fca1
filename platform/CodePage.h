// Host texts are UTF-8; printer data and carrier files are single-byte
// Windows-1252. Characters the code page lacks become "?".
#pragma once

#include <string>
#include <string_view>

namespace quendal {

std::string ToCodePage(std::string_view utf8);
std::string FromCodePage(std::string_view bytes);

}  // namespace quendal
