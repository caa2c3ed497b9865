#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "intake/ZelkorWrapper.h"
#include "shell/LogCategories.h"
#include "shell/NotificationNames.h"
#include "store/PersistanceStore.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"
#include "telephony/FakeTelephony.h"

namespace quorl::test {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;

/// The service inside the real store, on a real database file.
class HorvaneServiceStoreTest : public ::testing::Test {
 protected:
  HorvaneServiceStoreTest() {
    // The database asks the system for the time, and its first run deletes what is thirty days old by it.
    platform.time.setNow(SystemClock().now());
    telephony.worker = platform.time.makeStepped("telephony");
    platform.properties.booleans["InternalBuild"] = true;
    HVCellInfo info;
    info.legacyInfo.emplace().emplace_back(
        HVCellDictionary{{"kHVCellMonitorTAC", std::int64_t{7}},
                         {"kHVCellMonitorCellType", std::string("kHVCellMonitorCellTypeServing")}});
    telephony.slots[1].cell = info;
    telephony.slots[1].measurements = HVSignalStrengthMeasurements{-90, ""};
    telephony.slots[1].bands = HVBandInfo{HVBandDictionary{{"LTE", {1, 3}}}, std::nullopt};
    telephony.subscriptions.emplace().subscriptions = {{1, true}, {2, false}};
  }

  void start() {
    store = std::make_unique<PersistanceStore>(HardwareManager::shared(), ZelkorWrapper::sharedInstance());
    platform.time.settle();
  }

  std::map<std::string, std::string> read(const char* metricName) {
    std::map<std::string, std::string> values;
    store->fetchMetricContents("RAT", metricName, std::nullopt, 0, [&](const auto& rows, const auto&) {
      for (const Metric& row : rows) values[row.attributeName] = row.attributeValue;
    });
    platform.time.settle();
    return values;
  }

  FakeTelephony telephony;
  FakePlatform platform{&telephony};
  LogRecorder log;
  std::vector<CarrierInfoObject> carriers;
  NotificationCenter::Observation updates =
      NotificationCenter::defaultCenter().observe(notification::kCarrierUpdate, [this](const Notification& posted) {
        carriers = *posted.entry<std::vector<CarrierInfoObject>>(notification::kCarriersKey);
      });
  std::unique_ptr<PersistanceStore> store;
};

TEST_F(HorvaneServiceStoreTest, RowsOfAStartAreInTheDatabase) {
  start();
  EXPECT_THAT(read("Cell Info"), ElementsAre(Pair("PLMN", "0 0"), Pair("kHVCellMonitorCellType", "Serving"),
                                             Pair("kHVCellMonitorTAC", "7")));
  EXPECT_THAT(read("Active Bands"), ElementsAre(Pair("LTE", "1,3")));
  EXPECT_THAT(read("Supported Bands"), IsEmpty());
}

TEST_F(HorvaneServiceStoreTest, RecordHoldsTheRowsAsTheStoreReadsThem) {
  start();
  telephony.tell([this](HorvaneClientDelegate& delegate) {
    delegate.cellMonitorUpdate(HVServiceSubscriptionContext(1, true), *telephony.slots[1].cell);
  });
  platform.time.settle();
  ASSERT_EQ(carriers.size(), 1U);
  EXPECT_EQ(carriers[0].cellInfo.size(), 3U);
  EXPECT_EQ(carriers[0].activeBands.size(), 1U);
  EXPECT_TRUE(log.has(LogLine{log_category::kHorvaneService, LogLevel::Error, "error occured  ---> nil"}));
}

TEST_F(HorvaneServiceStoreTest, StoreThatGoesWhileRowsAreOnTheirWayTakesTheServiceAlong) {
  store = std::make_unique<PersistanceStore>(HardwareManager::shared(), ZelkorWrapper::sharedInstance());
  for (int step = 0; step < 6; ++step)
    for (const auto& queue : platform.time.queues()) queue->step();
  store.reset();
  platform.time.settle();
  EXPECT_TRUE(telephony.delegate.expired());
}

}  // namespace
}  // namespace quorl::test
