#include <cmath>
#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "shell/CircularTransition.h"
#include "shell/LoadingView.h"
#include "shell/MultiChoiceSelectionModal.h"
#include "shell/Toast.h"
#include "support/FakePlatform.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using namespace std::chrono_literals;

TEST(ToastTest, GoesAfterASecond) {
  test::FakePlatform platform;
  Toast toast("copied");
  EXPECT_FALSE(toast.isShowing());
  std::vector<bool> seen;
  const Connection connection = toast.onChange([&](bool isShowing) { seen.push_back(isShowing); });
  toast.show();
  platform.time.advance(999ms);
  EXPECT_TRUE(toast.isShowing());
  platform.time.advance(1ms);
  EXPECT_FALSE(toast.isShowing());
  EXPECT_THAT(seen, ElementsAre(false, true, false));
}

TEST(ToastTest, ShownTwiceItGoesWhenTheFirstSecondEnds) {
  test::FakePlatform platform;
  Toast toast("copied");
  toast.show();
  platform.time.advance(600ms);
  toast.show();
  platform.time.advance(400ms);
  EXPECT_FALSE(toast.isShowing());
}

TEST(ToastTest, ItsSecondMayEndAfterIt) {
  test::FakePlatform platform;
  std::vector<bool> seen;
  {
    Toast toast("copied");
    const Connection connection = toast.onChange([&](bool isShowing) { seen.push_back(isShowing); });
    toast.show();
  }
  platform.time.advance(2s);
  EXPECT_THAT(seen, ElementsAre(false, true));
}

TEST(LoadingViewTest, ComesAndGoesWithItsText) {
  LoadingView view("Gathering");
  EXPECT_TRUE(view.isHidden());
  view.show();
  EXPECT_FALSE(view.isHidden());
  EXPECT_TRUE(view.isAnimating());
  EXPECT_FALSE(view.isLabelHidden());
  view.hide();
  EXPECT_TRUE(view.isHidden());
  EXPECT_FALSE(view.isAnimating());
  EXPECT_TRUE(view.isLabelHidden());
}

TEST(LoadingViewTest, ItsFlagMayKeepTheTextWhenItHides) {
  LoadingView view("Gathering");
  view.setShouldHideLoadingView(false);
  view.show();
  view.hide();
  EXPECT_TRUE(view.isHidden());
  EXPECT_FALSE(view.isLabelHidden());
}

TEST(LoadingViewTest, TellsOfANewText) {
  LoadingView view("Gathering");
  int changes = 0;
  const Connection connection = view.onChange([&] { ++changes; });
  view.setLoadingLabelText("Nearly there");
  EXPECT_EQ(view.loadingLabelText(), "Nearly there");
  EXPECT_EQ(changes, 1);
}

TEST(LoadingViewTest, ItsSpinnerMayStopUnderItsText) {
  LoadingView view("Choose");
  view.show();
  int changes = 0;
  const Connection connection = view.onChange([&] { ++changes; });
  view.stopAnimating();
  EXPECT_FALSE(view.isHidden());
  EXPECT_FALSE(view.isAnimating());
  EXPECT_FALSE(view.isLabelHidden());
  EXPECT_EQ(changes, 1);
}

TEST(CircularTransitionTest, StartsAsTheWayInFromTheOrigin) {
  const CircularTransition transition;
  EXPECT_EQ(transition.startingPoint(), (CircularTransition::Point{0, 0}));
  EXPECT_EQ(transition.circleColor(), "white");
  EXPECT_EQ(transition.durationS(), 0.3);
  EXPECT_EQ(transition.transitionMode(), CircularTransitionMode::present);
  EXPECT_EQ(CircularTransition::kSmallestScale, 0.001);
}

TEST(CircularTransitionTest, TheCircleCoversTheFarthestCornerAndNoMore) {
  CircularTransition transition;
  transition.setStartingPoint({100, 700});
  // 300 to the right edge and 700 to the top one.
  EXPECT_DOUBLE_EQ(transition.diameter({400, 800}), 2 * std::sqrt(300.0 * 300 + 700 * 700));
  transition.setStartingPoint({200, 400});
  EXPECT_DOUBLE_EQ(transition.diameter({400, 800}), std::sqrt(400.0 * 400 + 800 * 800));
}

TEST(CircularTransitionTest, FromAnyCornerItCoversTheOppositeOne) {
  CircularTransition transition;
  for (const auto& corner : {CircularTransition::Point{0, 0}, {300, 0}, {0, 400}, {300, 400}}) {
    transition.setStartingPoint(corner);
    EXPECT_DOUBLE_EQ(transition.diameter({300, 400}), 1000);
  }
}

TEST(CircularTransitionTest, APointOutsideTheContainerIsCoveredToo) {
  CircularTransition transition;
  transition.setStartingPoint({-30, 0});
  EXPECT_DOUBLE_EQ(transition.diameter({10, 30}), 100);
}

class ChoiceTest : public ::testing::Test {
 protected:
  struct Chooser final : MultiChoiceSelectionModalDelegate {
    void didSelectChoice(const std::string& name) override { events.push_back(name); }
    std::vector<std::string> events;
  };

  ChoiceTest() : dismissal(modal.onDismiss([this] { chooser->events.push_back("closed"); })) {}

  std::shared_ptr<Chooser> chooser = std::make_shared<Chooser>();
  MultiChoiceSelectionModal modal{{"Default", "", "Voice"}, chooser};
  Connection dismissal;
};

TEST_F(ChoiceTest, APressedRowTellsTheDelegateAndCloses) {
  modal.didSelectRow(2);
  EXPECT_THAT(chooser->events, ElementsAre("Voice", "closed"));
}

TEST_F(ChoiceTest, ARowWithoutTextOnlyCloses) {
  modal.didSelectRow(1);
  EXPECT_THAT(chooser->events, ElementsAre("closed"));
}

TEST_F(ChoiceTest, TheCrossOnlyCloses) {
  modal.dismiss();
  EXPECT_THAT(chooser->events, ElementsAre("closed"));
}

TEST_F(ChoiceTest, ThereIsNoRowBeyondTheLast) {
  modal.didSelectRow(3);
  EXPECT_THAT(chooser->events, IsEmpty());
}

TEST_F(ChoiceTest, ItHoldsItsDelegateWeakly) {
  const std::weak_ptr<Chooser> weak = chooser;
  dismissal.disconnect();
  chooser.reset();
  EXPECT_TRUE(weak.expired());
  modal.didSelectRow(0);
}

}  // namespace
}  // namespace quorl
