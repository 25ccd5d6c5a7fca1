#include "labels/WinPrint.h"

#include <gtest/gtest.h>

namespace quendal {
namespace {

TEST(ArticleIdTest, CheckDigitOverTheConvertedIdentifier) {
  // 1 2 3 4 5 0 1 5 0 2: odd positions from the right 2+5+0+4+2 = 13, even 0+1+5+3+1 = 10;
  // 13 * 3 + 10 = 49, check 1.
  EXPECT_EQ(CreateArticleID("12345", "01502"), "12345015021");
  // Letters in the first three places count as the last digit of their code, but are returned.
  // "ABC" -> 5 6 7: 5 6 7 1 2 0 1 5 0 2 -> odd 2+5+0+1+6 = 14, even 0+1+2+7+5 = 15; 57 -> 3.
  EXPECT_EQ(CreateArticleID("ABC12", "01502"), "ABC1201502" "3");
  // A total that is a multiple of ten gives 0, not 10: 0000000 -> total 0.
  EXPECT_EQ(CreateArticleID("000", "0000"), "00000000");
  // Letters after the third place count as 0.
  EXPECT_EQ(CreateArticleID("123X", ""), CreateArticleID("1230", "").replace(3, 1, "X"));
  EXPECT_EQ(CreateArticleID("", ""), "0");
}

}  // namespace
}  // namespace quendal
