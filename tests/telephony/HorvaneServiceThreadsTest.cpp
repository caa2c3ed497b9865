#include <chrono>
#include <future>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "base/SerialQueue.h"
#include "hosts/simulator/TelephonySimulator.h"
#include "shell/NotificationNames.h"
#include "support/FakePlatform.h"
#include "support/RowsOnlyStore.h"
#include "support/ThreadedQueues.h"
#include "telephony/HorvaneService.h"

namespace quorl::test {
namespace {

using namespace std::chrono_literals;
namespace event = simulator::telephony_event;

/// A store with a thread of its own, as the real one has. Reads that found nothing complete there, those that found
/// rows on the main queue.
class ThreadedStore final : public RowsOnlyStore {
 public:
  ThreadedStore(Queue& mainQueue, std::shared_ptr<Queue> database) : main_(mainQueue), database_(std::move(database)) {}

  void insertMetric(Metric metric, WriteCompletion completion) override {
    database_->async([this, metric = std::move(metric), completion = std::move(completion)] {
      rows_.push_back(metric);
      main_.async([completion] { completion(true, std::nullopt); });
    });
  }
  void fetchMetricContents(std::string_view, std::string_view metricName, std::optional<std::string_view>,
                           std::int32_t subsId, MetricsCompletion completion) override {
    database_->async([this, name = std::string(metricName), subsId, completion = std::move(completion)] {
      std::vector<Metric> found;
      for (const Metric& row : rows_)
        if (row.metricName == name && row.subsId == subsId) found.push_back(row);
      if (found.empty()) {
        completion({}, SQLiteError{SQLiteError::Case::EmptyQueryResult, ""});
      } else {
        main_.async([completion, found] { completion(found, std::nullopt); });
      }
    });
  }

 private:
  Queue& main_;
  const std::shared_ptr<Queue> database_;
  std::vector<Metric> rows_;  // on the database's queue alone
};

/// The service with real threads: a main queue, the simulated client's worker and a database.
class HorvaneServiceThreadsTest : public ::testing::Test {
 protected:
  HorvaneServiceThreadsTest() {
    fake_.properties.booleans["InternalBuild"] = true;
    Platform::install(&platform_);
    onMain([this] {
      HardwareManager::shared();
      updates_ =
          NotificationCenter::defaultCenter().observe(notification::kCarrierUpdate, [this](const Notification& posted) {
            EXPECT_TRUE(main_->isCurrent());
            carriers = *posted.entry<std::vector<CarrierInfoObject>>(notification::kCarriersKey);
          });
      rows_ =
          NotificationCenter::defaultCenter().observe(notification::kNewHVMetric, [this](const Notification& posted) {
            EXPECT_TRUE(main_->isCurrent());
            ++rowCounts[posted.entry<Metric>(notification::kMetricObjectKey)->metricName];
          });
    });
    for (const HVSubscriptionSlot slot : {1, 2}) {
      phone.perform(event::SimInserted{slot, "Testnet " + std::to_string(slot)});
      phone.perform(event::Cell{slot, cell(), false});
      phone.perform(event::Signal{slot, -90});
      phone.perform(event::Bands{slot, {HVBandDictionary{{"LTE", {1, 3}}}, std::nullopt}});
    }
  }

  ~HorvaneServiceThreadsTest() override {
    onMain([this] { service.reset(); });
    drain();
    updates_.disconnect();
    rows_.disconnect();
  }

  static HVCellInfo cell() {
    HVCellInfo info;
    info.legacyInfo.emplace().emplace_back(
        HVCellDictionary{{"kHVCellMonitorTAC", std::int64_t{1}}, {"kHVCellMonitorRSRP", std::int64_t{0}}});
    return info;
  }

  void onMain(const std::function<void()>& work) { runOn(*main_, work); }

  /// Waits until nothing is left to do: no chain of answers hops more often than this.
  void drain() {
    for (int hop = 0; hop < 12; ++hop) {
      factory_.drain();
      onMain([] {});
    }
  }

 private:
  FakePlatform fake_;
  ThreadedQueues factory_;
  std::shared_ptr<SerialQueue> main_ = std::make_shared<SerialQueue>("main");

 protected:
  simulator::TelephonySimulator phone{factory_};
  ThreadedStore store{*main_, factory_.makeSerialQueue("database")};
  std::shared_ptr<HorvaneService> service;  // on the main queue alone
  std::vector<CarrierInfoObject> carriers;
  std::map<std::string, int> rowCounts;

 private:
  SystemClock clock_;
  Platform platform_{*main_,          *main_,          factory_,         clock_,        fake_.properties,
                     fake_.resources, fake_.documents, fake_.strings,    fake_.console, fake_.alerts,
                     fake_.analytics, fake_.share,     fake_.pasteboard, fake_.zelkor,  phone};
  NotificationCenter::Observation updates_;
  NotificationCenter::Observation rows_;
};

TEST_F(HorvaneServiceThreadsTest, AnswersFromOtherThreadsBecomeRowsOnTheMainQueue) {
  onMain([this] { service = HorvaneService::make(store); });
  drain();
  onMain([this] {
    EXPECT_EQ(rowCounts["Cell Info"], 2 * 3);  // TAC, RSRP and PLMN
    EXPECT_EQ(rowCounts["Active Bands"], 2);
    ASSERT_EQ(carriers.size(), 2U);
  });
  phone.perform(event::Cell{2, cell(), true});
  drain();
  onMain([this] {
    EXPECT_EQ(rowCounts["Cell Info"], 3 * 3);
    EXPECT_EQ(carriers[0].cellInfo.size(), 3U);
    EXPECT_EQ(carriers[1].activeBands.size(), 1U);
  });
}

TEST_F(HorvaneServiceThreadsTest, UpdatesFromManyThreadsAreTakenUpOneByOne) {
  onMain([this] { service = HorvaneService::make(store); });
  drain();
  std::vector<std::future<void>> writers;
  for (const HVSubscriptionSlot slot : {1, 2}) {
    writers.push_back(std::async(std::launch::async, [this, slot] {
      for (int i = 0; i < 20; ++i) phone.perform(event::Cell{slot, cell(), true});
    }));
  }
  for (auto& writer : writers) writer.wait();
  drain();
  onMain([this] { EXPECT_EQ(rowCounts["Cell Info"], (2 + 40) * 3); });
}

TEST_F(HorvaneServiceThreadsTest, TearDownWhileAnswersAreOnTheirWayStopsQuietly) {
  for (int round = 0; round < 50; ++round) {
    onMain([this] { service = HorvaneService::make(store); });
    for (const HVSubscriptionSlot slot : {1, 2}) phone.perform(event::Cell{slot, cell(), true});
    for (int hop = 0; hop < round % 5; ++hop) onMain([] {});
    onMain([this] {
      std::weak_ptr<HorvaneService> weak = service;
      service.reset();
      EXPECT_TRUE(weak.expired());  // nobody off the main queue holds it
    });
  }
  drain();
  std::map<std::string, int> before;
  onMain([&] { before = rowCounts; });
  phone.perform(event::Cell{1, cell(), true});
  drain();
  onMain([&] { EXPECT_EQ(rowCounts, before); });
}

}  // namespace
}  // namespace quorl::test
