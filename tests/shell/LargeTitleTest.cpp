#include <gtest/gtest.h>

#include "shell/LargeTitle.h"

namespace quorl {
namespace {

constexpr double kTitle = 50;

ScrollPosition longList(double scrolled) {
  return {scrolled, 4000, 600};
}

TEST(LargeTitleTest, GivesWayOnceHalfOfItIsScrolled) {
  EXPECT_FALSE(isLargeTitleCollapsed(false, longList(0), kTitle));
  EXPECT_FALSE(isLargeTitleCollapsed(false, longList(25), kTitle));
  EXPECT_TRUE(isLargeTitleCollapsed(false, longList(26), kTitle));
}

TEST(LargeTitleTest, ComesBackAtTheStartAlone) {
  EXPECT_TRUE(isLargeTitleCollapsed(true, longList(1), kTitle));
  EXPECT_FALSE(isLargeTitleCollapsed(true, longList(0), kTitle));
  EXPECT_FALSE(isLargeTitleCollapsed(true, longList(-80), kTitle));
}

TEST(LargeTitleTest, StaysWhereTheListWouldFitWithoutIt) {
  EXPECT_FALSE(isLargeTitleCollapsed(false, {40, 650, 600}, kTitle));
  EXPECT_TRUE(isLargeTitleCollapsed(false, {40, 651, 600}, kTitle));
}

}  // namespace
}  // namespace quorl
