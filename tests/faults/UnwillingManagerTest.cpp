#include <chrono>
#include <cstddef>
#include <cstdint>
#include <ctime>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "faults/BreakablePhone.h"
#include "intake/Payload.h"

namespace quorl::test {
namespace {

using std::chrono::hours;
using std::chrono::seconds;

constexpr char kAddRefused[] = "-[ZelkorWrapper addVexilConfigForAppId:andProtofFilePath:]: error=16 msg=resource busy";

/// The processor's time.
class Stopwatch {
 public:
  std::size_t ms() const { return static_cast<std::size_t>((std::clock() - begun_) * 1000 / CLOCKS_PER_SEC); }

 private:
  const std::clock_t begun_ = std::clock();
};

class UnwillingManagerTest : public testing::Test {
 protected:
  void refuses() { phone.library.refusal = zelkor::client::Result{16, "resource busy"}; }
  void isWillingAgain() { phone.library.refusal.reset(); }
  int queries() { return phone.library.commands[std::string(zelkor::kCommandQueryMetric)]; }

  BreakablePhone phone;
};

TEST_F(UnwillingManagerTest, OneThatRefusesEverythingIsToldAndAskedAgainAtTheNextActivation) {
  refuses();
  phone.launch();
  EXPECT_EQ(phone.errors->count(kAddRefused), 2U) << "at the start and at the first activation";
  EXPECT_FALSE(phone.deliver(nasEvent(1)));
  phone.passes(hours(1));
  phone.becomesActive();
  EXPECT_EQ(phone.errors->count(kAddRefused), 3U);

  isWillingAgain();
  phone.becomesActive();
  phone.metricsArrive(10);
  EXPECT_EQ(phone.storedRows(), 10 * kRowsOfNasEvent);
}

TEST_F(UnwillingManagerTest, RefusingToBeLeftItCostsNoRow) {
  phone.launch();
  phone.metricsArrive(5);
  refuses();
  ApplicationLoop(*phone.application).enterBackground();
  phone.host.time.settle();
  EXPECT_EQ(phone.errors->count("-[ZelkorWrapper removeVexilConfigForAppid:]: error=16 msg=resource busy"), 1U);
  phone.metricsArrive(5);
  isWillingAgain();
  phone.becomesActive();
  phone.metricsArrive(5);
  EXPECT_EQ(phone.storedRows(), 15 * kRowsOfNasEvent);
  EXPECT_EQ(phone.reportedRows, phone.storedRows());
}

TEST_F(UnwillingManagerTest, OneThatFallsSilentLeavesTheScreensAsTheyAre) {
  phone.launch();
  phone.metricsArrive(5);
  phone.screens().menuBarDidSelectItemAt(1);
  phone.passes(seconds(10));
  const auto& list = phone.screens().firstLevelViewController();
  const auto rows = [&list] { return list->table().at(1).rowItems.size(); };
  const std::size_t shown = rows();
  const int asked = queries();
  for (int hour = 0; hour < 8; ++hour) {
    phone.passes(hours(1));
    list->pullToRefresh();
    phone.passes(seconds(2));
    EXPECT_FALSE(list->isRefreshing()) << "a refresh ends without an answer";
    phone.becomesActive();
  }
  EXPECT_EQ(queries(), asked + 16) << "each wish is asked for once and none is repeated";
  EXPECT_EQ(rows(), shown);
  for (const auto& queue : phone.host.time.queues()) EXPECT_EQ(queue->waiting(), 0U) << queue->label();

  phone.metricsArrive(5);
  EXPECT_EQ(phone.storedRows(), 10 * kRowsOfNasEvent);
}

TEST_F(UnwillingManagerTest, WhatArrivesWhileACommandTakesItsTimeIsNotLost) {
  phone.launch();
  phone.library.duringCommand = [this] {
    for (std::uint64_t i = 0; i < 500; ++i) phone.deliver(nasEvent(1767605412000 + i));
  };
  phone.becomesActive();
  phone.library.duringCommand = {};
  phone.host.time.settle();
  EXPECT_EQ(phone.storedRows(), 2 * 500 * kRowsOfNasEvent);
  EXPECT_EQ(phone.reportedRows, phone.storedRows());
}

TEST_F(UnwillingManagerTest, AHundredThousandMetricsAtOnceBecomeRowsInTheirOrder) {
  constexpr std::uint64_t kMetrics = 100'000;
  constexpr std::uint64_t kFirstMs = 1767605412000;
  phone.launch();
  const Stopwatch watch;
  for (std::uint64_t i = 0; i < kMetrics; ++i) ASSERT_TRUE(phone.deliver(nasEvent(kFirstMs + i, /*hasStatus=*/false)));
  phone.host.time.settle();
  figure("ms of the processor until all rows are stored", watch.ms());
  EXPECT_EQ(phone.reportedRows, kMetrics * 2);
  EXPECT_EQ(phone.lostRows(), 0U);
  RawDatabase database(phone.file());
  EXPECT_EQ(database.column("SELECT count(*) FROM Metric WHERE metric_id = '3986700'").at(0),
            std::to_string(kMetrics * 2));
  EXPECT_EQ(database.run("SELECT count(*), min(attribute_value), max(attribute_value), "
                         "sum(attribute_value < earlier) IS 0 FROM (SELECT attribute_value, lag(attribute_value) OVER "
                         "(ORDER BY Id) AS earlier FROM Metric WHERE attribute_name = 'timestamp')"),
            (std::vector<Row>{
                {std::to_string(kMetrics), std::to_string(kFirstMs), std::to_string(kFirstMs + kMetrics - 1), "1"}}));
}

constexpr std::size_t kHuge = std::size_t{64} << 20;

/// A metric whose payload has 64 MiB, of any kind.
class HugePayload : public UnwillingManagerTest {
 protected:
  /// The rows that `payload` gives; the product must go on with the next metric as if nothing had been.
  std::size_t rowsOf(const std::string& payload) {
    phone.launch();
    EXPECT_GE(payload.size(), kHuge);
    const std::size_t before = phone.reportedRows;
    const Stopwatch watch;
    phone.metricArrives(metricEvent(kNasMetricId, ByteString(payload)));
    figure("ms of the processor for the metric", watch.ms());
    const std::size_t rows = phone.reportedRows - before;
    phone.metricsArrive(1);
    EXPECT_EQ(phone.reportedRows, before + rows + kRowsOfNasEvent);
    EXPECT_EQ(phone.lostRows(), 0U);
    return rows;
  }
};

TEST_F(HugePayload, OfOctetsWithoutMeaningIsDropped) {
  EXPECT_EQ(rowsOf(std::string(kHuge, '\xFF')), 0U);
}

TEST_F(HugePayload, ThatClaimsMoreThanItHasIsDropped) {
  EXPECT_EQ(rowsOf(Payload().number(1, 5).key(200, 2).varint(kHuge * 2).raw(std::string(kHuge, 'x')).data()), 0U);
}

TEST_F(HugePayload, OfAFieldThatNobodyKnowsGivesTheRowsOfTheOthers) {
  const ByteString known = *nasEvent(1767605412000).bytes(zelkor::kKeyPayload);
  EXPECT_EQ(rowsOf(Payload().raw(known.view()).bytes(2000, std::string(kHuge, 'x')).data()), kRowsOfNasEvent);
}

TEST_F(HugePayload, OfGroupsWithoutEndIsDropped) {
  std::string payload(kHuge, '\xC3');
  for (std::size_t i = 1; i < payload.size(); i += 2) payload[i] = '\x3E';
  EXPECT_EQ(rowsOf(payload), 0U);
}

TEST_F(HugePayload, OfOneNumberOverAndOverGivesItsLastValue) {
  const ByteString known = *nasEvent(1767605412000).bytes(zelkor::kKeyPayload);
  std::string payload;
  payload.reserve(kHuge + 64);
  while (payload.size() < kHuge) payload += known.view();
  EXPECT_EQ(rowsOf(payload), kRowsOfNasEvent);
}

}  // namespace
}  // namespace quorl::test
