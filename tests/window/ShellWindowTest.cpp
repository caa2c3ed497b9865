#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "shell/view/Appearance.h"
#include "support/window/WindowFixture.h"

namespace quorl {
namespace {

class ShellWindowTest : public test::WindowTest {
 protected:
  QColor backgroundPixel() { return grab().pixelColor(2, 2); }
};

TEST_F(ShellWindowTest, TheWindowStandsInTheNamedBackground) {
  launch();
  EXPECT_EQ(backgroundPixel(), QColor("#F7F8FA"));
  view::Appearance::shared().setDark(true);
  EXPECT_EQ(backgroundPixel(), QColor("#0E1217"));
}

}  // namespace
}  // namespace quorl
