#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "shell/MenuBar.h"
#include "support/FakePlatform.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using namespace std::chrono_literals;

class MenuBarTest : public ::testing::Test, protected MenuBarDelegate {
 protected:
  void menuBarDidSelectItemAt(std::size_t index) override { told_.push_back(index); }

  std::shared_ptr<MenuBar> bar(int numberOfSegments) {
    auto bar = MenuBar::make(numberOfSegments);
    bar->setDelegate(std::shared_ptr<MenuBarDelegate>(self_, this));
    return bar;
  }
  static std::vector<std::string> tints(const MenuBar& bar) {
    std::vector<std::string> tints;
    for (const MenuCell& cell : bar.cells()) tints.emplace_back(cell.tint());
    return tints;
  }

  test::FakePlatform platform_;
  std::shared_ptr<int> self_ = std::make_shared<int>();
  std::vector<std::size_t> told_;
};

TEST_F(MenuBarTest, ThreeSegmentsHaveTheBolt) {
  const auto three = bar(3);
  EXPECT_THAT(three->menuImageNames(), ElementsAre("house", "list.dash", "bolt"));
  EXPECT_EQ(three->segmentWidthMultiplier(), 3);
  EXPECT_EQ(three->numberOfSegments(), 3);
}

TEST_F(MenuBarTest, AnyOtherNumberIsTwo) {
  for (int number : {2, 0, 4, -1}) {
    const auto two = bar(number);
    EXPECT_THAT(two->menuImageNames(), ElementsAre("house", "list.dash")) << number;
    EXPECT_EQ(two->segmentWidthMultiplier(), 2) << number;
    EXPECT_EQ(two->numberOfSegments(), 2) << number;
  }
}

TEST_F(MenuBarTest, TheFirstItemIsSelectedAtOnce) {
  EXPECT_THAT(tints(*bar(3)), ElementsAre("ButtonSelected", "ButtonNormal", "ButtonNormal"));
  EXPECT_THAT(told_, IsEmpty());
}

TEST_F(MenuBarTest, ACellIsAHouseUntilTheBarSaysOtherwise) {
  const MenuCell cell(50);
  EXPECT_EQ(cell.imageName(), "house");
  EXPECT_STREQ(cell.tint(), "ButtonNormal");
}

TEST_F(MenuBarTest, TheMarkerIsAsWideAsAnItemAndStandsUnderIt) {
  const auto two = bar(2);
  EXPECT_EQ(two->itemWidth(390), 195);
  EXPECT_EQ(two->markerX(390), 0);
  two->didSelectItemAt(1);
  EXPECT_EQ(two->markerX(390), 195);
  const auto three = bar(3);
  three->didSelectItemAt(2);
  EXPECT_EQ(three->itemWidth(390), 130);
  EXPECT_EQ(three->markerX(390), 260);
}

TEST_F(MenuBarTest, TheDelegateIsToldWhenTheMarkerHasArrived) {
  const auto two = bar(2);
  two->didSelectItemAt(1);
  EXPECT_THAT(tints(*two), ElementsAre("ButtonNormal", "ButtonSelected"));
  platform_.time.advance(499ms);
  EXPECT_THAT(told_, IsEmpty());
  platform_.time.advance(1ms);
  EXPECT_THAT(told_, ElementsAre(1));
}

TEST_F(MenuBarTest, AnInterruptedMovementTellsNothingAndOnlyTheLastDoes) {
  const auto three = bar(3);
  three->didSelectItemAt(1);
  platform_.time.advance(300ms);
  three->didSelectItemAt(2);
  platform_.time.advance(300ms);
  three->didSelectItemAt(0);
  platform_.time.advance(499ms);
  EXPECT_THAT(told_, IsEmpty());
  platform_.time.advance(10s);
  EXPECT_THAT(told_, ElementsAre(0));
}

TEST_F(MenuBarTest, TheSameItemTwiceIsToldOnceTheSecondMovementEnds) {
  const auto two = bar(2);
  two->didSelectItemAt(1);
  platform_.time.advance(250ms);
  two->didSelectItemAt(1);
  platform_.time.advance(499ms);
  EXPECT_THAT(told_, IsEmpty());
  platform_.time.advance(1ms);
  EXPECT_THAT(told_, ElementsAre(1));
}

TEST_F(MenuBarTest, AnItemThatIsNotThereIsNotSelected) {
  const auto two = bar(2);
  two->didSelectItemAt(2);
  platform_.time.advance(1s);
  EXPECT_EQ(two->selectedIndex(), 0);
  EXPECT_THAT(told_, IsEmpty());
}

TEST_F(MenuBarTest, ABarThatIsGoneTellsNothing) {
  bar(2)->didSelectItemAt(1);
  platform_.time.advance(1s);
  EXPECT_THAT(told_, IsEmpty());
}

TEST_F(MenuBarTest, TheMarkerStartsFastAndSettlesWithoutOvershoot) {
  EXPECT_EQ(MenuBar::markerProgress(0), 0);
  EXPECT_EQ(MenuBar::markerProgress(1), 1);
  double before = 0;
  for (int step = 1; step <= 100; ++step) {
    const double progress = MenuBar::markerProgress(step / 100.0);
    EXPECT_GE(progress, before) << step;
    EXPECT_LE(progress, 1) << step;
    before = progress;
  }
  EXPECT_GT(MenuBar::markerProgress(0.25), 0.5);
  EXPECT_GT(MenuBar::markerProgress(0.999), 0.998);  // no visible jump at the end
  // Its first hundredth of a second is that of a body at one way a second that the spring then speeds up.
  EXPECT_NEAR(MenuBar::markerProgress(0.002), 0.001, 0.0004);
}

TEST_F(MenuBarTest, OutsideItsTimeTheMarkerStandsAtAnEnd) {
  EXPECT_EQ(MenuBar::markerProgress(-1), 0);
  EXPECT_EQ(MenuBar::markerProgress(2), 1);
}

}  // namespace
}  // namespace quorl
