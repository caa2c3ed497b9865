#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "shell/NotificationNames.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"

namespace quorl {
namespace {

using test::LogLine;

class HardwareManagerTest : public ::testing::Test {
 protected:
  void deviceHasChipset(const std::string& chipset) { host.properties.texts["BasebandChipset"] = chipset; }
  void deviceHasClass(const std::string& deviceClass) { host.properties.texts["DeviceClass"] = deviceClass; }
  void buildIsInternal() { host.properties.booleans["InternalBuild"] = true; }
  void buildIsForCarriers() { host.properties.booleans["CarrierInstallCapability"] = true; }
  void captureLibraryIsPresent() { host.properties.classes.emplace_back("Sondrel"); }

  static std::vector<CarrierInfoObject> carriersNamed(const std::vector<std::string>& names) {
    std::vector<CarrierInfoObject> carriers;
    for (const std::string& name : names) {
      carriers.emplace_back();
      carriers.back().carrierName = name;
    }
    return carriers;
  }
  static std::vector<std::string> namesOf(const std::vector<CarrierInfoObject>& carriers) {
    std::vector<std::string> names;
    for (const CarrierInfoObject& carrier : carriers) names.push_back(carrier.carrierName);
    return names;
  }

  test::FakePlatform host;
  test::LogRecorder log;
};

TEST_F(HardwareManagerTest, AMavDevice) {
  deviceHasChipset("mav20");
  const HardwareManager manager;
  EXPECT_TRUE(manager.isMavDevice());
  EXPECT_FALSE(manager.isIceDevice());
  EXPECT_EQ(manager.basebandChipset(), "mav20");
  EXPECT_EQ(manager.deviceConfigFileName(), "Quorl2");
  EXPECT_EQ(manager.metricTriggerID(), 5202011);
  EXPECT_NO_THROW(manager.validateBaseband());
}

TEST_F(HardwareManagerTest, AnIceDevice) {
  deviceHasChipset("ice7");
  const HardwareManager manager;
  EXPECT_FALSE(manager.isMavDevice());
  EXPECT_TRUE(manager.isIceDevice());
  EXPECT_EQ(manager.deviceConfigFileName(), "Quorl1");
  EXPECT_EQ(manager.metricTriggerID(), 8323091);
  EXPECT_NO_THROW(manager.validateBaseband());
}

TEST_F(HardwareManagerTest, AChipsetOfNeitherFamilyHasTheMavConstantsAndIsNoError) {
  deviceHasChipset("other3");
  const HardwareManager manager;
  EXPECT_FALSE(manager.isMavDevice());
  EXPECT_FALSE(manager.isIceDevice());
  EXPECT_EQ(manager.deviceConfigFileName(), "Quorl2");
  EXPECT_EQ(manager.metricTriggerID(), 5202011);
  EXPECT_NO_THROW(manager.validateBaseband());
}

TEST_F(HardwareManagerTest, AChipsetOfBothFamiliesHasTheIceConstants) {
  deviceHasChipset("mav-on-ice");
  const HardwareManager manager;
  EXPECT_TRUE(manager.isMavDevice());
  EXPECT_TRUE(manager.isIceDevice());
  EXPECT_EQ(manager.deviceConfigFileName(), "Quorl1");
  EXPECT_EQ(manager.metricTriggerID(), 8323091);
}

TEST_F(HardwareManagerTest, TheFamilyIsSearchedCaseSensitively) {
  deviceHasChipset("MAV20 Ice");
  const HardwareManager manager;
  EXPECT_FALSE(manager.isMavDevice());
  EXPECT_FALSE(manager.isIceDevice());
}

TEST_F(HardwareManagerTest, WithoutChipsetTheDeviceIsUnknown) {
  const HardwareManager manager;
  EXPECT_EQ(manager.basebandChipset(), "unknown");
  EXPECT_FALSE(manager.isMavDevice());
  EXPECT_FALSE(manager.isIceDevice());
  EXPECT_EQ(manager.deviceConfigFileName(), "Quorl2");
  try {
    manager.validateBaseband();
    FAIL() << "an unknown chipset passed";
  } catch (const HardwareException& exception) {
    EXPECT_EQ(exception.error(), HardwareError::unableToGetBasebandInfo);
  }
}

TEST_F(HardwareManagerTest, AChipsetThatReadsUnknownIsUnknown) {
  deviceHasChipset("unknown");
  const HardwareManager manager;
  EXPECT_THROW(manager.validateBaseband(), HardwareException);
}

TEST_F(HardwareManagerTest, AChipsetThatOnlyContainsUnknownIsKnown) {
  deviceHasChipset("unknown2");
  const HardwareManager manager;
  EXPECT_NO_THROW(manager.validateBaseband());
}

TEST_F(HardwareManagerTest, OnlyTheOneDeviceClassIsATablet) {
  const auto deviceClassOf = [&](const std::string& text) {
    deviceHasClass(text);
    return HardwareManager().deviceClass();
  };
  EXPECT_EQ(HardwareManager().deviceClass(), "Quillo");
  EXPECT_EQ(deviceClassOf("Tabrin"), "Tabrin");
  EXPECT_EQ(deviceClassOf("Quillo"), "Quillo");
  EXPECT_EQ(deviceClassOf("tabrin"), "Quillo");
  EXPECT_EQ(deviceClassOf("Tabrin2"), "Quillo");
  EXPECT_EQ(deviceClassOf("unknown"), "Quillo");
}

TEST_F(HardwareManagerTest, EachPropertyIsReadOnce) {
  const HardwareManager manager;
  EXPECT_EQ(host.properties.asked,
            (std::vector<std::string>{"InternalBuild", "CarrierInstallCapability", "BasebandChipset", "DeviceClass"}));
}

TEST_F(HardwareManagerTest, TheBuildKinds) {
  {
    const HardwareManager user;
    EXPECT_FALSE(user.isInternalBuild());
    EXPECT_FALSE(user.isCarrierBuild());
    EXPECT_FALSE(user.isInternalOrCarrierBuild());
  }
  buildIsForCarriers();
  {
    const HardwareManager carrier;
    EXPECT_FALSE(carrier.isInternalBuild());
    EXPECT_TRUE(carrier.isCarrierBuild());
    EXPECT_TRUE(carrier.isInternalOrCarrierBuild());
  }
  host.properties.booleans.clear();
  buildIsInternal();
  {
    const HardwareManager internal;
    EXPECT_TRUE(internal.isInternalBuild());
    EXPECT_FALSE(internal.isCarrierBuild());
    EXPECT_TRUE(internal.isInternalOrCarrierBuild());
  }
}

TEST_F(HardwareManagerTest, LogCaptureNeedsTheLibraryAMavDeviceAndAnInternalOrCarrierBuild) {
  deviceHasChipset("mav20");
  buildIsInternal();
  EXPECT_FALSE(HardwareManager().isSondrelCompatible()) << "library absent";

  captureLibraryIsPresent();
  EXPECT_TRUE(HardwareManager().isSondrelCompatible());

  host.properties.booleans.clear();
  EXPECT_FALSE(HardwareManager().isSondrelCompatible()) << "user build";

  buildIsForCarriers();
  EXPECT_TRUE(HardwareManager().isSondrelCompatible());

  deviceHasChipset("ice7");
  EXPECT_FALSE(HardwareManager().isSondrelCompatible()) << "Ice device";
}

TEST_F(HardwareManagerTest, ConstructionLogsTheDeviceAndThenTheCaptureLibraryUnderItsOddName) {
  deviceHasChipset("mav20");
  deviceHasClass("Tabrin");
  captureLibraryIsPresent();
  const HardwareManager manager;
  EXPECT_EQ(
      log.lines(),
      (std::vector<LogLine>{{"general", LogLevel::Default,
                             "Hardware manager - init - basebandchipset: mav20 - deviceClass: Tabrin - isMavDevice: 1"},
                            {"sondrel", LogLevel::Default, "Base view controller - is sondrel available TRUE"}}));
}

TEST_F(HardwareManagerTest, AnUnknownDeviceIsLoggedAtConstructionAndWhenItIsValidated) {
  const HardwareManager manager;
  EXPECT_THROW(manager.validateBaseband(), HardwareException);
  EXPECT_EQ(log.lines(),
            (std::vector<LogLine>{
                {"general", LogLevel::Default,
                 "Hardware manager - init - basebandchipset: unknown - deviceClass: Quillo - isMavDevice: 0"},
                {"sondrel", LogLevel::Default, "Base view controller - is sondrel available FALSE"},
                {"general", LogLevel::Default,
                 "Hardware manager - init - unknown chipset: unknown - deviceClass: Quillo throwing error"}}));
}

TEST_F(HardwareManagerTest, ACarrierUpdateReplacesTheCarriersInItsOrder) {
  const HardwareManager manager;
  EXPECT_TRUE(manager.carriers().empty());
  NotificationCenter& center = NotificationCenter::defaultCenter();
  center.post(notification::kCarrierUpdate, {{notification::kCarriersKey, carriersNamed({"North", "South"})}});
  EXPECT_EQ(namesOf(manager.carriers()), (std::vector<std::string>{"North", "South"}));
  center.post(notification::kCarrierUpdate, {{notification::kCarriersKey, carriersNamed({})}});
  EXPECT_TRUE(manager.carriers().empty());
}

TEST_F(HardwareManagerTest, ACarrierUpdateWithoutUsableCarriersLeavesThemUntouched) {
  const HardwareManager manager;
  NotificationCenter& center = NotificationCenter::defaultCenter();
  center.post(notification::kCarrierUpdate, {{notification::kCarriersKey, carriersNamed({"North"})}});
  center.post(notification::kCarrierUpdate);
  center.post(notification::kCarrierUpdate, {});
  center.post(notification::kCarrierUpdate, {{"others", carriersNamed({"South"})}});
  center.post(notification::kCarrierUpdate, {{notification::kCarriersKey, std::string("South")}});
  EXPECT_EQ(namesOf(manager.carriers()), (std::vector<std::string>{"North"}));
}

TEST_F(HardwareManagerTest, TheSelectionStartsEmptyAndChanges) {
  HardwareManager manager;
  EXPECT_EQ(manager.currentSubsId(), 0);
  EXPECT_EQ(manager.tabSelectedTitle(), "");
  manager.setCurrentSubsId(1);
  manager.setTabSelectedTitle("North");
  EXPECT_EQ(manager.currentSubsId(), 1);
  EXPECT_EQ(manager.tabSelectedTitle(), "North");
}

TEST_F(HardwareManagerTest, FirstUseOnSeveralThreadsMakesOneInstance) {
  std::vector<HardwareManager*> seen(8);
  std::vector<std::thread> threads;
  for (HardwareManager*& slot : seen) threads.emplace_back([&slot] { slot = &HardwareManager::shared(); });
  for (std::thread& thread : threads) thread.join();
  for (const HardwareManager* instance : seen) EXPECT_EQ(instance, seen.front());
  EXPECT_EQ(log.texts("general").size(), 1U);
}

}  // namespace
}  // namespace quorl
