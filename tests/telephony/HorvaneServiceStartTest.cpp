#include "telephony/HorvaneServiceFixture.h"

namespace quorl::test {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

using HorvaneServiceStartTest = HorvaneServiceTest;

constexpr char kActivated[] = "HorvaneService - didBecomeActiveNotification";

TEST_F(HorvaneServiceStartTest, AsksForTheSubscriptionsAtOnceThroughAClientOnTheMainQueue) {
  service = HorvaneService::make(store);
  EXPECT_THAT(telephony.calls, ElementsAre("initWithQueue main", "setDelegate", "getSubscriptionInfo"));
  EXPECT_EQ(telephony.delegate.lock(), service);
  EXPECT_THAT(log.texts(log_category::kHorvaneService), ElementsAre("HorvaneService - init"));
  EXPECT_TRUE(logged("HorvaneService - init"));
}

TEST_F(HorvaneServiceStartTest, HearsActivationsFromFiveSecondsOn) {
  start();
  platform.time.advance(5s - 1us);
  activate();
  EXPECT_EQ(calls("getSubscriptionInfo"), 1U);
  EXPECT_FALSE(logged(kActivated));

  platform.time.advance(1us);
  activate();
  EXPECT_EQ(calls("getSubscriptionInfo"), 2U);
  EXPECT_TRUE(logged(kActivated));
}

TEST_F(HorvaneServiceStartTest, ActivationWithASimRemovedRebuildsTheListWithoutItAndKeepsItsRows) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  start();
  platform.time.advance(5s);
  const auto rowsOfSecond = [&] {
    return std::count_if(store.inserted.begin(), store.inserted.end(),
                         [](const Metric& row) { return row.subsId == 1; });
  };
  const auto before = rowsOfSecond();
  EXPECT_GT(before, 0);
  removeSim(2);
  activate();
  EXPECT_THAT(slots(), ElementsAre(1));
  EXPECT_EQ(rowsOfSecond(), before);
}

TEST_F(HorvaneServiceStartTest, TwoActivationsBeforeAnAnswerDoubleTheListAsMeant) {
  insertSim(1, "Testnet One");
  start();
  platform.time.advance(5s);
  NotificationCenter::defaultCenter().post(notification::kDidBecomeActive);
  NotificationCenter::defaultCenter().post(notification::kDidBecomeActive);
  settle();
  EXPECT_THAT(slots(), ElementsAre(1, 1));
}

TEST_F(HorvaneServiceStartTest, FailedSubscriptionsAreLoggedAndTheListStaysAsItWas) {
  insertSim(1, "Testnet One");
  telephony.subscriptionsError = HVError{"not now"};
  start();
  EXPECT_TRUE(logged("HorvaneService - fetchCarrierSubscriptions error: not now "));
  EXPECT_THAT(posted, IsEmpty());
  EXPECT_THAT(telephony.calls, ElementsAre("initWithQueue main", "setDelegate", "getSubscriptionInfo"));
  // The list is still empty, so the newcomer is its only record.
  monitor(2, true);
  EXPECT_THAT(slots(), ElementsAre(2));
}

TEST_F(HorvaneServiceStartTest, NeitherInfoNorSubscriptionsEndsSilently) {
  start();
  telephony.subscriptions.emplace();
  platform.time.advance(5s);
  activate();
  EXPECT_THAT(posted, IsEmpty());
  EXPECT_THAT(log.texts(log_category::kHorvaneService), ElementsAre("HorvaneService - init", kActivated));
}

TEST_F(HorvaneServiceStartTest, ContextsWithoutASimLeaveNoRecord) {
  removeSim(1);
  insertSim(2, "Testnet Two");
  start();
  EXPECT_THAT(slots(), ElementsAre(2));
  EXPECT_TRUE(carriers()[0].isSimPresent);
}

TEST_F(HorvaneServiceStartTest, PhoneWithoutSimsAsksForNothingMore) {
  removeSim(1);
  removeSim(2);
  start();
  EXPECT_THAT(posted, IsEmpty());
  EXPECT_THAT(telephony.calls, ElementsAre("initWithQueue main", "setDelegate", "getSubscriptionInfo"));
}

TEST_F(HorvaneServiceStartTest, EachRecordBringsTheCarriersThenItsBandsThenItsCellThenItsMeasurementOnceMore) {
  internalBuild();
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  service = HorvaneService::make(store);
  telephony.calls.clear();
  platform.mainQueue->step();
  EXPECT_THAT(telephony.calls,
              ElementsAre("subscriberProviders", "getBandInfo 1", "copyCellInfo 1", "getSignalStrengthMeasurements 1",
                          "subscriberProviders", "getBandInfo 2", "copyCellInfo 2", "getSignalStrengthMeasurements 2"));
}

TEST_F(HorvaneServiceStartTest, CarrierUpdateGoesOutOncePerRecordWithTheWholeList) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  start();
  ASSERT_EQ(updates.size(), 2U);
  for (const auto& list : updates) {
    ASSERT_EQ(list.size(), 2U);
    EXPECT_EQ(list[0].carrierName, "Testnet One");
    EXPECT_EQ(list[1].carrierName, "Testnet Two");
  }
  EXPECT_EQ(log.count("HorvaneService - processCarrierInfo"), 2U);
}

TEST_F(HorvaneServiceStartTest, SecondMeasurementOfASubscriptionGoesToTheConsoleAndNoFurther) {
  insertSim(1, "Testnet One");
  start();
  EXPECT_EQ(calls("getSignalStrengthMeasurements 1"), 2U);
  EXPECT_THAT(platform.console.lines, ElementsAre("measurements rsrp -91", "measurements rsrp -91"));
  EXPECT_THAT(store.values("Cell Info"), ElementsAre(std::pair("kHVCellMonitorTAC", "101"), std::pair("PLMN", "0 0")));
}

TEST_F(HorvaneServiceStartTest, TearDownRemovesTheObserver) {
  insertSim(1, "Testnet One");
  start();
  platform.time.advance(5s);
  service.reset();
  log.clear();
  activate();
  EXPECT_EQ(calls("getSubscriptionInfo"), 1U);
  EXPECT_FALSE(logged(kActivated));
}

TEST_F(HorvaneServiceStartTest, TearDownBeforeTheFiveSecondsObservesNothing) {
  start();
  service.reset();
  platform.time.advance(6s);
  activate();
  EXPECT_EQ(calls("getSubscriptionInfo"), 1U);
}

TEST_F(HorvaneServiceStartTest, TearDownWithTheSubscriptionsOnTheirWayStopsThere) {
  insertSim(1, "Testnet One");
  service = HorvaneService::make(store);
  service.reset();
  settle();
  EXPECT_THAT(posted, IsEmpty());
  EXPECT_THAT(telephony.calls, ElementsAre("initWithQueue main", "setDelegate", "getSubscriptionInfo"));
}

TEST_F(HorvaneServiceStartTest, TearDownAtAnyStepOfAStartStoresNothingAfterwards) {
  internalBuild();
  insertSim(1, "Testnet One");
  telephony.slots[1].bands = HVBandInfo{HVBandDictionary{{"LTE", {1}}}, std::nullopt};
  // Measures a whole start, then cuts one short after each number of steps.
  start();
  const std::size_t rows = store.inserted.size();
  ASSERT_GT(rows, 0U);
  for (int steps = 0; steps < 40; ++steps) {
    service = HorvaneService::make(store);
    const auto step = [&](Queue& queue) { static_cast<SteppedQueue&>(queue).step(); };
    for (int i = 0; i < steps; ++i) step(i % 2 == 0 ? static_cast<Queue&>(*platform.mainQueue) : *telephony.worker);
    service.reset();
    const std::size_t inserted = store.inserted.size();
    const std::size_t read = store.reads.size();
    settle();
    EXPECT_EQ(store.inserted.size(), inserted) << "after " << steps << " steps";
    EXPECT_EQ(store.reads.size(), read) << "after " << steps << " steps";
  }
}

}  // namespace
}  // namespace quorl::test
