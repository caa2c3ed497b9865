#include <algorithm>
#include <array>
#include <memory>
#include <optional>
#include <random>
#include <string>

#include <gtest/gtest.h>

#include "base/DateText.h"
#include "faults/BreakablePhone.h"

namespace quorl::test {
namespace {

using std::chrono::hours;
using std::chrono::milliseconds;
using std::chrono::minutes;
using std::chrono::seconds;

// With half hours, with a day that never was, with summer times on either half of the earth.
constexpr std::array kZones = {"UTC",          "Asia/Tokyo",       "America/St_Johns", "Australia/Lord_Howe",
                               "Pacific/Apia", "America/New_York", "Europe/Berlin",    "Asia/Kathmandu"};

class ClockAndZone : public testing::Test {
 protected:
  void clockJumpsBy(seconds distance) { phone.host.time.setNow(phone.host.time.now() + distance); }
  void zoneBecomes(const char* name) {
    phone.zone.reset();
    phone.zone.emplace(name);
  }
  /// The wall clock as SQLite and the system's library tell it.
  std::string wallClock(Date date) {
    const auto since = std::chrono::floor<seconds>(date).time_since_epoch().count();
    return RawDatabase(phone.file())
        .column("SELECT datetime(" + std::to_string(since) + ", 'unixepoch', 'localtime')")
        .at(0);
  }
  std::string lastStoredTime() {
    return RawDatabase(phone.file()).column("SELECT collected_on FROM Metric ORDER BY Id DESC LIMIT 1").at(0);
  }

  BreakablePhone phone;
};

TEST_F(ClockAndZone, WhateverTheyDoEveryRowIsStoredUnderTheTimeOfTheMoment) {
  phone.launch();
  phone.screens().menuBarDidSelectItemAt(1);
  std::mt19937 random(7);
  constexpr std::size_t kMetrics = 300;
  for (std::size_t i = 0; i < kMetrics; ++i) {
    clockJumpsBy(seconds(static_cast<std::int64_t>(random() % 10'000'000) - 5'000'000));
    if (i % 3 == 0) zoneBecomes(kZones[random() % kZones.size()]);
    phone.metricArrives(nasEvent(std::nullopt));
    ASSERT_EQ(lastStoredTime(), wallClock(phone.host.time.now())) << "of metric " << i;
    phone.passes(milliseconds(random() % 3000));
  }
  EXPECT_EQ(phone.storedRows(), kMetrics * (kRowsOfNasEvent - 1));
  EXPECT_EQ(phone.reportedRows, phone.storedRows());
  EXPECT_EQ(phone.lostRows(), 0U);

  // All that reads times can still read them.
  std::size_t answers = 0;
  for (const auto frame :
       {AttributeDetailTimeFrame::daily, AttributeDetailTimeFrame::weekly, AttributeDetailTimeFrame::monthly}) {
    phone.store().fetchAttributeHistory("NAS", "reg_status", frame,
                                        [&answers](const std::vector<Metric>&, const auto& error) {
                                          EXPECT_EQ(error, std::nullopt);
                                          ++answers;
                                        });
    phone.store().exportMetrics(frame, [&answers](const ExportedMetrics&, const auto& error) {
      EXPECT_EQ(error, std::nullopt);
      ++answers;
    });
  }
  phone.host.time.settle();
  EXPECT_EQ(answers, 6U);
}

TEST_F(ClockAndZone, TheLatestReadingIsTheOneWithTheLatestTimeNotTheOneThatCameLast) {
  phone.launch();
  phone.metricArrives(nasEvent(std::nullopt));
  const std::string first = lastStoredTime();
  clockJumpsBy(-hours(1));
  phone.metricArrives(nasEvent(std::nullopt));
  const auto latest = [this] {
    std::string time;
    phone.store().fetchMetricContents("LTE", "NAS", "reg_status", 0,
                                      [&time](const std::vector<Metric>& rows, const auto& /*error*/) {
                                        time = wallClockText(rows.at(0).collectedOn);
                                      });
    phone.host.time.settle();
    return time;
  };
  EXPECT_EQ(latest(), first) << "by its statement";
  EXPECT_EQ(latest(), first) << "from memory";
  clockJumpsBy(hours(2));
  phone.metricArrives(nasEvent(std::nullopt));
  EXPECT_EQ(latest(), lastStoredTime());
}

TEST_F(ClockAndZone, TimersKeepTheirPace) {
  phone.launch();
  phone.showsDashboard();
  std::size_t ticks = 0;
  const Connection connection = phone.screens().dashboardViewController()->onLastRefreshed([&ticks] { ++ticks; });
  std::mt19937 random(8);
  for (int minute = 0; minute < 30; ++minute) {
    clockJumpsBy(seconds(static_cast<std::int64_t>(random() % 200'000) - 100'000));
    if (minute % 5 == 0) zoneBecomes(kZones[random() % kZones.size()]);
    phone.passes(minutes(1));
  }
  EXPECT_EQ(ticks, 30U * 4) << "one each fifteen seconds";
}

/// What thirty days are is for the clock to say: rows go at a start, and only there.
TEST_F(ClockAndZone, AClockFarAheadCostsNothingWhileTheProductRuns) {
  phone.launch();
  phone.metricsArrive(5);
  clockJumpsBy(hours(24 * 400));
  phone.metricsArrive(5);
  phone.passes(hours(48));
  clockJumpsBy(-hours(24 * 402));
  phone.metricsArrive(5);
  EXPECT_EQ(phone.storedRows(), 15 * kRowsOfNasEvent);
  phone.ends();
  phone.launch();
  EXPECT_EQ(phone.storedRows(), 15 * kRowsOfNasEvent) << "the clock is right again at the next start";
}

}  // namespace
}  // namespace quorl::test
