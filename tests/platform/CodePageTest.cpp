#include "platform/CodePage.h"

#include <gtest/gtest.h>

namespace quendal {
namespace {

TEST(CodePageTest, ConvertsToWindows1252) {
  EXPECT_EQ(ToCodePage("PLAIN"), "PLAIN");
  EXPECT_EQ(ToCodePage("CRÈME"), "CR\xC8ME");
  EXPECT_EQ(ToCodePage("€5"), "\x80" "5");
  EXPECT_EQ(ToCodePage("東京"), "??");      // not in the code page
  EXPECT_EQ(ToCodePage("A\xFF" "B"), "A?B");  // not valid UTF-8 either
  EXPECT_EQ(FromCodePage("CR\xC8ME"), "CRÈME");
}

}  // namespace
}  // namespace quendal
