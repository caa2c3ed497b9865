#include <fstream>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/AppDelegate.h"
#include "hosts/desktop/Lifecycle.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class LifecycleTest : public ::testing::Test {
 protected:
  LifecycleTest() {
    const auto path = phone_.directory.path() / "Quorl2.deviceconfig";
    std::ofstream(path) << "metrics";
    phone_.resources.files["Quorl2.deviceconfig"] = path;
    phone_.properties.texts["BasebandChipset"] = "mav20";
    lifecycle_.launch();
    phone_.time.settle();
    log_.clear();
  }
  /// What the application object was told since the last call.
  std::vector<std::string> told() {
    std::vector<std::string> lines;
    for (const std::string& line : log_.texts("general"))
      if (line.starts_with("Appdelegate - application")) lines.push_back(line.substr(25));
    log_.clear();
    return lines;
  }

  test::FakePlatform phone_;
  AppDelegate application_;
  desktop::Lifecycle lifecycle_{application_};
  test::LogRecorder log_;
};

TEST_F(LifecycleTest, TheFirstFocusAfterTheLaunchIsNothingNew) {
  lifecycle_.stateDidChange(Qt::ApplicationActive);
  EXPECT_THAT(told(), IsEmpty());
}

TEST_F(LifecycleTest, AWindowWithoutTheKeyboardStaysSubscribed) {
  lifecycle_.stateDidChange(Qt::ApplicationInactive);
  EXPECT_THAT(told(), IsEmpty());
  lifecycle_.stateDidChange(Qt::ApplicationActive);
  EXPECT_THAT(told(), ElementsAre("DidBecomeActive"));
}

TEST_F(LifecycleTest, ADismissedWindowIsInTheBackgroundOnce) {
  lifecycle_.stateDidChange(Qt::ApplicationHidden);
  lifecycle_.stateDidChange(Qt::ApplicationSuspended);
  EXPECT_THAT(told(), ElementsAre("DidEnterBackground"));
  lifecycle_.stateDidChange(Qt::ApplicationInactive);
  lifecycle_.stateDidChange(Qt::ApplicationActive);
  EXPECT_THAT(told(), ElementsAre("DidBecomeActive"));
}

TEST_F(LifecycleTest, NothingFollowsTheEnd) {
  lifecycle_.terminate();
  EXPECT_THAT(told(), ElementsAre("WillTerminate"));
  lifecycle_.terminate();
  lifecycle_.stateDidChange(Qt::ApplicationHidden);
  lifecycle_.stateDidChange(Qt::ApplicationActive);
  EXPECT_THAT(told(), IsEmpty());
}

TEST_F(LifecycleTest, BeforeTheLaunchNothingIsTold) {
  test::resetSharedObjects();
  AppDelegate application;
  desktop::Lifecycle lifecycle(application);
  lifecycle.stateDidChange(Qt::ApplicationActive);
  lifecycle.terminate();
  EXPECT_EQ(application.window(), nullptr);
  EXPECT_THAT(told(), IsEmpty());
}

}  // namespace
}  // namespace quorl
