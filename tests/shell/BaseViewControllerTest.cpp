#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/AppDelegate.h"
#include "app/ApplicationLoop.h"
#include "shell/NotificationNames.h"
#include "store/PersistanceStore.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using namespace std::chrono_literals;
using enum BaseViewNavigationIndexes;

struct Device {
  std::string chipset;
  bool isInternalBuild = false;
  bool isCarrierBuild = false;
  bool hasLogCapture = false;
};

class BaseViewControllerTest : public ::testing::Test {
 protected:
  void isDevice(const Device& device) {
    phone_.properties.texts["BasebandChipset"] = device.chipset;
    phone_.properties.booleans["InternalBuild"] = device.isInternalBuild;
    phone_.properties.booleans["CarrierInstallCapability"] = device.isCarrierBuild;
    phone_.properties.classes.clear();
    if (device.hasLogCapture) phone_.properties.classes.emplace_back("Sondrel");
  }
  BaseViewController& launchOn(const Device& device) {
    isDevice(device);
    ApplicationLoop(application_).launch();
    return *application_.window()->rootViewController()->rootScreen();
  }
  BaseViewController& displayOn(const Device& device) {
    BaseViewController& screen = launchOn(device);
    screen.viewDidLoad();
    phone_.time.settle();
    return screen;
  }
  void press(BaseViewController& screen, std::size_t index) {
    screen.menuBar()->didSelectItemAt(index);
    phone_.time.advance(500ms);
  }
  static std::vector<std::string> tabs(BaseViewController& screen) {
    std::vector<std::string> titles;
    for (const TabButton& tab : screen.carrierBar()->tabButtons()) titles.push_back(tab.title());
    return titles;
  }
  static void postCarriers(const std::vector<CarrierInfoObject>& carriers) {
    NotificationCenter::defaultCenter().post(notification::kCarrierUpdate, {{notification::kCarriersKey, carriers}});
  }

  test::FakePlatform phone_;
  AppDelegate application_;
};

TEST_F(BaseViewControllerTest, BeforeItsFirstDisplayThereIsNothing) {
  BaseViewController& screen = launchOn({"mav20"});
  EXPECT_EQ(screen.title(), "");
  EXPECT_FALSE(screen.prefersLargeTitles());
  EXPECT_EQ(screen.horvaneViewModel(), nullptr);
  EXPECT_EQ(screen.carrierBar(), nullptr);
  screen.viewWillAppear();
  EXPECT_EQ(screen.title(), "");
}

TEST_F(BaseViewControllerTest, ItsFirstDisplayShowsTheDashboardUnderALargeTitle) {
  BaseViewController& screen = displayOn({"mav20"});
  EXPECT_EQ(screen.title(), "Dashboard");
  EXPECT_TRUE(screen.prefersLargeTitles());
  EXPECT_EQ(screen.currentlySelectedIndex(), first);
  EXPECT_EQ(screen.menuBar()->selectedIndex(), 0);
  EXPECT_EQ(screen.horvaneViewModel()->description(), "(, false, 0)");
}

TEST_F(BaseViewControllerTest, ThereIsOnlyOneFirstDisplay) {
  BaseViewController& screen = displayOn({"mav20"});
  const auto root = screen.horvaneViewModel();
  screen.viewDidLoad();
  EXPECT_EQ(screen.horvaneViewModel(), root);
}

TEST_F(BaseViewControllerTest, ThirdTabAndExportButtonAreAsTheDeviceAllows) {
  struct Case {
    Device device;
    int tabs;
    bool hasExport;
  };
  const std::vector<Case> cases = {
      {{"mav20", false, false, true}, 2, false},  // a user build that could capture logs
      {{"mav20", true, false, true}, 3, true},    //
      {{"mav20", false, true, true}, 3, true},    //
      {{"mav20", true, true, true}, 3, true},     //
      {{"mav20", true, false, false}, 2, true},   //
      {{"ice15", true, true, true}, 2, true},     // an Ice device has none, whatever it could do
      {{"ice15", false, false, true}, 2, false},  //
      {{"other", true, false, true}, 2, true},    //
  };
  for (const Case& each : cases) {
    test::resetSharedObjects();
    AppDelegate application;
    isDevice(each.device);
    application.onLaunch();
    BaseViewController& screen = *application.window()->rootViewController()->rootScreen();
    screen.viewDidLoad();
    const std::string name = each.device.chipset + (each.device.isInternalBuild ? " internal" : "") +
                             (each.device.isCarrierBuild ? " carrier" : "") +
                             (each.device.hasLogCapture ? " capture" : "");
    EXPECT_EQ(screen.menuBar()->numberOfSegments(), each.tabs) << name;
    EXPECT_EQ(screen.hasExportButton(), each.hasExport) << name;
    phone_.time.settle();
  }
}

TEST_F(BaseViewControllerTest, ATabHasItsTitleAndHidesTheExportButtonWhereNothingIsExported) {
  BaseViewController& screen = displayOn({"mav20", true, false, true});
  EXPECT_FALSE(screen.isExportButtonHidden());
  press(screen, 1);
  EXPECT_EQ(screen.title(), "All Metrics");
  EXPECT_EQ(screen.currentlySelectedIndex(), second);
  EXPECT_FALSE(screen.isExportButtonHidden());
  press(screen, 2);
  EXPECT_EQ(screen.title(), "Sondrel");
  EXPECT_EQ(screen.currentlySelectedIndex(), third);
  EXPECT_TRUE(screen.isExportButtonHidden());
  press(screen, 0);
  EXPECT_EQ(screen.title(), "Dashboard");
  EXPECT_FALSE(screen.isExportButtonHidden());
}

TEST_F(BaseViewControllerTest, TheScreenChangesOnceTheMarkerHasArrived) {
  BaseViewController& screen = displayOn({"mav20"});
  screen.menuBar()->didSelectItemAt(1);
  phone_.time.advance(499ms);
  EXPECT_EQ(screen.title(), "Dashboard");
  phone_.time.advance(1ms);
  EXPECT_EQ(screen.title(), "All Metrics");
}

TEST_F(BaseViewControllerTest, APressDuringTheMovementLeavesOnlyTheLastTab) {
  BaseViewController& screen = displayOn({"mav20", true, false, true});
  std::vector<std::string> shown;
  const Connection connection = screen.onChange([&] { shown.push_back(screen.title()); });
  screen.menuBar()->didSelectItemAt(1);
  phone_.time.advance(200ms);
  screen.menuBar()->didSelectItemAt(2);
  phone_.time.advance(5s);
  EXPECT_THAT(shown, ElementsAre("Sondrel"));
}

TEST_F(BaseViewControllerTest, PressingTheShownTabDoesNothing) {
  BaseViewController& screen = displayOn({"mav20"});
  int changes = 0;
  const Connection connection = screen.onChange([&] { ++changes; });
  press(screen, 0);
  EXPECT_EQ(changes, 0);
}

TEST_F(BaseViewControllerTest, AnIndexWithoutATabDoesNothing) {
  BaseViewController& screen = displayOn({"mav20"});
  screen.menuBarDidSelectItemAt(2);
  EXPECT_EQ(screen.title(), "Dashboard");
}

TEST_F(BaseViewControllerTest, AScreenIsMadeOnItsFirstUseAndKept) {
  test::LogRecorder log;
  BaseViewController& screen = displayOn({"mav20"});
  const auto made = [&](const std::string& line) { return log.count(line); };
  EXPECT_EQ(made("DashboardViewModel -  init"), 1);
  EXPECT_EQ(made("AllMetricsViewModel - loadMetricList "), 0);
  press(screen, 1);
  const auto list = screen.firstLevelViewController();
  press(screen, 0);
  press(screen, 1);
  EXPECT_EQ(made("DashboardViewModel -  init"), 1);
  EXPECT_EQ(screen.firstLevelViewController(), list);
}

TEST_F(BaseViewControllerTest, TheListLearnsEachTimeThatItAppears) {
  BaseViewController& screen = displayOn({"mav20"});
  press(screen, 1);
  const std::string before = screen.firstLevelViewController()->lastRefreshedText();
  phone_.time.advance(1min);
  EXPECT_EQ(screen.firstLevelViewController()->lastRefreshedText(), before);
  screen.viewWillAppear();
  EXPECT_NE(screen.firstLevelViewController()->lastRefreshedText(), before);
}

TEST_F(BaseViewControllerTest, TheCarrierBarFollowsTheCarriersFromTheFirstDisplayOn) {
  BaseViewController& screen = displayOn({"mav20"});
  EXPECT_THAT(tabs(screen), IsEmpty());
  CarrierInfoObject north;
  north.carrierName = "Testnet North";
  north.isSimPresent = true;
  north.simSlotKey = simSlotKeyForSlot(1);
  CarrierInfoObject empty;
  postCarriers({north, empty});
  EXPECT_THAT(tabs(screen), ElementsAre("Testnet North"));
  postCarriers({});
  EXPECT_THAT(tabs(screen), IsEmpty());
}

TEST_F(BaseViewControllerTest, ExportPresentsANewScreenEachTime) {
  BaseViewController& screen = displayOn({"mav20", true});
  std::vector<std::shared_ptr<ExportViewController>> presented;
  const Connection connection =
      screen.onPresentExport([&](std::shared_ptr<ExportViewController> next) { presented.push_back(std::move(next)); });
  screen.exportTappedWithTapGestureRecognizer();
  screen.exportTappedWithTapGestureRecognizer();
  ASSERT_EQ(presented.size(), 2);
  EXPECT_NE(presented[0], presented[1]);
  EXPECT_EQ(presented[0]->persistanceStore(), screen.persistanceStore());
}

TEST_F(BaseViewControllerTest, TheIndicesOfTheTabsAreConstants) {
  EXPECT_EQ(BaseViewController::dashobardIndex, 0);  // spelled so
  EXPECT_EQ(BaseViewController::allMetricsIndex, 1);
  EXPECT_EQ(BaseViewController::sondrelIndex, 2);
}

TEST_F(BaseViewControllerTest, TheEndOfTheNavigationIsAnErrorInTheLog) {
  test::LogRecorder log;
  {
    AppDelegate application;
    application.onLaunch();
    phone_.time.settle();
  }
  EXPECT_EQ(log.count("root navigation vc deinit called"), 1);
  EXPECT_TRUE(log.has({"app-ui", LogLevel::Error, "root navigation vc deinit called"}));
}

}  // namespace
}  // namespace quorl
