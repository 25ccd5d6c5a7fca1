#include "labels/WinPrint.h"

#include "frame/VB.h"

namespace quendal {

std::string CreateArticleID(std::string_view articleId, std::string_view suffix) {
  std::string digits;
  const std::string prefix = Left(articleId, 3);
  for (unsigned char c : prefix)
    digits += (c >= '0' && c <= '9') ? static_cast<char>(c) : static_cast<char>('0' + c % 10);
  digits += Mid(articleId, 4);
  digits += suffix;
  int odd = 0;
  int even = 0;
  int position = 1;  // from the right
  for (auto it = digits.rbegin(); it != digits.rend(); ++it, ++position) {
    const int value = (*it >= '0' && *it <= '9') ? *it - '0' : 0;
    (position % 2 ? odd : even) += value;
  }
  const int r = (odd * 3 + even) % 10;
  const char check = static_cast<char>('0' + (r == 0 ? 0 : 10 - r));
  return std::string(articleId) + std::string(suffix) + check;
}

}  // namespace quendal
