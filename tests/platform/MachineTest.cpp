#include "platform/Machine.h"

#include <gtest/gtest.h>

namespace quendal {
namespace {

TEST(MachineTest, AComputerNameMustFitThirtyCharactersWithItsEnd) {
  EXPECT_EQ(ComputerNameFrom("PACKSTATION-07"), "PACKSTATION-07");
  EXPECT_EQ(ComputerNameFrom(std::string(29, 'W')), std::string(29, 'W'));
  // Not cut: a longer name is not given at all.
  EXPECT_EQ(ComputerNameFrom(std::string(30, 'W')), std::nullopt);
  EXPECT_EQ(ComputerNameFrom(""), std::nullopt);
}

}  // namespace
}  // namespace quendal
