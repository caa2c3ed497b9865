#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "shell/LoadingView.h"
#include "shell/Toast.h"
#include "support/FakePlatform.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
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

}  // namespace
}  // namespace quorl
