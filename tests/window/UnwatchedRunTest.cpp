#include <QQuickWindow>
#include <filesystem>

#include <gtest/gtest.h>

#include "hosts/desktop/UnwatchedRun.h"
#include "shell/BaseViewController.h"
#include "support/TemporaryDirectory.h"
#include "support/window/WindowFixture.h"

namespace quorl::desktop {
namespace {

class UnwatchedRunTest : public test::WindowTest {
 protected:
  UnwatchedRunTest() {
    isDevice("mav20");
    launch();
  }
  UnwatchedRun runWith(const std::filesystem::path& pictures) {
    return UnwatchedRun(window(), *window().property("shell").value<view::ShellBinding*>(),
                        *application().window()->rootViewController()->rootScreen(), pictures);
  }

  test::TemporaryDirectory directory;
};

TEST_F(UnwatchedRunTest, AClosedWindowStaysForThePicturesAndGoesWhenClosedAgain) {
  const UnwatchedRun run = runWith(directory.path() / "new" / "pictures");
  EXPECT_FALSE(window().close());
  EXPECT_TRUE(window().isVisible());
  EXPECT_TRUE(std::filesystem::is_directory(directory.path() / "new" / "pictures"));
  EXPECT_TRUE(window().close());
  EXPECT_FALSE(window().isVisible());
  EXPECT_FALSE(run.hasFailed());
}

TEST_F(UnwatchedRunTest, AClosedWindowGoesWhereNoPicturesAreWanted) {
  const UnwatchedRun run = runWith({});
  EXPECT_TRUE(window().close());
}

TEST_F(UnwatchedRunTest, TellsWhyThePicturesHaveNoFolder) {
  testing::internal::CaptureStderr();
  UnwatchedRun run = runWith("/proc/none/pictures");
  run.end();
  EXPECT_EQ(testing::internal::GetCapturedStderr(),
            "quorl-simulator: /proc/none/pictures: No such file or directory\n");
  EXPECT_TRUE(run.hasFailed());
}

}  // namespace
}  // namespace quorl::desktop
