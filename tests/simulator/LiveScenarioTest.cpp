#include <chrono>
#include <memory>
#include <optional>
#include <set>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "hosts/simulator/LiveScenario.h"
#include "messages/MetricCodable.h"
#include "simulator/ManagerCommands.h"
#include "simulator/network/TestScenarios.h"
#include "support/SteppedQueue.h"
#include "support/TemporaryDirectory.h"

namespace quorl::simulator {
namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;

ScenarioChoice city() {
  return {network::shippedScenario("city"), 1, metrics::Family::Mav};
}

constexpr std::int64_t kServingCellInfo = 803010;

/// A phone in the city with a client of its baseband manager, on virtual time.
class LiveScenarioTest : public testing::Test {
 protected:
  ~LiveScenarioTest() override {
    scenario.reset();
    time.settle();  // the modem's last task holds the modem, and with it its queue
  }
  void phoneIsIn(LiveScenario::Options options) {
    auto made = LiveScenario::make(std::move(options),
                                   {library, &telephony, time, *mainQueue, time, [this] { return isBehind; }, log});
    ASSERT_TRUE(made) << made.error();
    scenario = *std::move(made);
    scenario->setObserver([this](const network::ModemEvent& event, const auto&) { lastMs = event.atMs; });
    library.RegisterEventHandler(client, zelkor::kEventMetric,
                                 [this](const zelkor::KeyValueMessage& message, const auto&) {
                                   received.push_back(message.integer(zelkor::kKeyMetricID).value_or(-1));
                                 });
    library.EventsOn(client);
  }
  int perform(std::string_view command, const zelkor::KeyValueMessage& message) {
    zelkor::KeyValueMessage response;
    return library.PerformCommand(client, command, message, response).code;
  }
  void clientWants(std::string_view metrics) {
    ASSERT_EQ(perform(zelkor::kCommandAddConfiguration, test::addConfiguration(test::configurationOf(metrics))), 0);
  }
  void clientWantsNothingMore() {
    ASSERT_EQ(perform(zelkor::kCommandClearConfiguration, test::clearConfiguration()), 0);
  }
  void clientAsks() {
    ASSERT_EQ(perform(zelkor::kCommandQueryMetric, test::queryMetric()), 0);
    time.settle();
  }
  void driveOn(seconds duration) {
    scenario->advance(duration);
    time.settle();
  }
  std::vector<std::int64_t> taken() { return std::exchange(received, {}); }
  static std::set<std::int64_t> kinds(const std::vector<std::int64_t>& ids) { return {ids.begin(), ids.end()}; }

  test::VirtualTime time;
  std::shared_ptr<test::SteppedQueue> mainQueue = time.makeStepped("main");
  BasebandManager library;
  TelephonySimulator telephony{time};
  std::shared_ptr<zelkor::client::Manager> client = library.CreateManager("quorl", time.makeStepped("delivery"));
  bool isBehind = false;  // the phone, with its work
  const std::shared_ptr<BasebandLog> log = std::make_shared<BasebandLog>();
  std::unique_ptr<LiveScenario> scenario;
  std::vector<std::int64_t> received;
  network::SimulatedMs lastMs = 0;  // of the last event of the world
  test::TemporaryDirectory directory;
};

TEST_F(LiveScenarioTest, WhatIsDeliveredIsWhatTheConfigurationLists) {
  phoneIsIn({city()});
  clientWants("[803010, 806660]");
  driveOn(seconds(120));
  EXPECT_EQ(kinds(taken()), (std::set<std::int64_t>{803010, 806660}));
  clientWants("[803011]");
  driveOn(seconds(120));
  EXPECT_EQ(kinds(taken()), std::set<std::int64_t>{803011});
}

TEST_F(LiveScenarioTest, ClearingTheConfigurationStopsDelivery) {
  phoneIsIn({city()});
  driveOn(seconds(30));
  EXPECT_TRUE(taken().empty()) << "nobody asked yet";
  clientWants("[803010, 806660]");
  driveOn(seconds(60));
  EXPECT_FALSE(taken().empty());
  const auto events = scenario->events();
  clientWantsNothingMore();
  driveOn(seconds(60));
  EXPECT_TRUE(taken().empty());
  EXPECT_EQ(scenario->events(), events);
}

TEST_F(LiveScenarioTest, AQueryBringsASnapshotAtOnce) {
  phoneIsIn({city()});
  clientWants("[827648, 827649, 803011, 827651]");
  driveOn(seconds(60));
  taken();
  clientAsks();
  const auto snapshot = taken();
  EXPECT_EQ(kinds(snapshot), (std::set<std::int64_t>{827648, 827649, 827651}))
      << "a message over the air is nothing that is so now";
  EXPECT_EQ(snapshot.size(), 6U) << "for both SIMs";
}

TEST_F(LiveScenarioTest, TimePassesWithTheClockByTheSpeed) {
  phoneIsIn({city(), 4, std::nullopt});
  time.advance(seconds(60));
  EXPECT_EQ(lastMs, 0U) << "not before it starts";
  scenario->start();
  time.advance(seconds(60));
  EXPECT_NEAR(static_cast<double>(lastMs), 240000, 3000);
  scenario->stop();
  time.settle();
  const auto stopped = lastMs;
  time.advance(seconds(60));
  EXPECT_EQ(lastMs, stopped);
}

TEST_F(LiveScenarioTest, MetricsBearTheTimeAtWhichTheyCome) {
  phoneIsIn({city(), 20});
  log->open();
  const auto comesNow = [&] {
    time.advance(seconds(5));
    std::istringstream lines(log->take(BasebandLog::kCapacity));
    const auto now = std::chrono::duration_cast<milliseconds>(time.now().time_since_epoch()).count();
    int count = 0;
    for (const RecordedEvent& event : readRecording(lines).events) {
      if (event.metricID != kServingCellInfo) continue;
      const auto message = makeMessage("CellularLteScellInfo");
      message->initWithData(event.payload);
      const auto timestamp = message->dictionaryRepresentation()->find("timestamp")->integer().value();
      ++count;
      EXPECT_LE(timestamp, now);
      EXPECT_GE(timestamp, now - 5100);
    }
    EXPECT_GT(count, 0);
  };
  scenario->start();
  comesNow();
  comesNow();
  isBehind = true;
  time.advance(seconds(100));
  isBehind = false;
  comesNow();
  time.setNow(time.now() - std::chrono::hours(2));
  time.advance(seconds(1));
  log->open();
  comesNow();
}

TEST_F(LiveScenarioTest, AClockThatJumpsMovesTheWorldByASecondAtMost) {
  phoneIsIn({city()});
  scenario->start();
  time.advance(seconds(30));
  time.setNow(time.now() + std::chrono::hours(5));
  time.advance(seconds(30));
  EXPECT_LT(lastMs, 62000U);
  time.setNow(time.now() - std::chrono::hours(5));
  time.advance(seconds(30));
  EXPECT_GT(lastMs, 80000U);
}

TEST_F(LiveScenarioTest, WaitsForAProductThatCannotKeepUp) {
  phoneIsIn({city()});
  scenario->start();
  time.advance(seconds(10));
  const auto before = lastMs;
  mainQueue->setHanging(true);
  time.advance(seconds(60));
  EXPECT_LE(lastMs, before + 1000);
  mainQueue->setHanging(false);
  time.advance(seconds(10));
  EXPECT_GT(lastMs, before + 5000);
}

TEST_F(LiveScenarioTest, StandsStillWhileThePhoneIsBehind) {
  phoneIsIn({city()});
  scenario->start();
  time.advance(seconds(10));
  const auto before = lastMs;
  EXPECT_GT(before, 5000U);
  isBehind = true;
  time.advance(seconds(60));
  EXPECT_EQ(lastMs, before);
  isBehind = false;
  time.advance(seconds(10));
  EXPECT_GT(lastMs, before + 5000);
  EXPECT_LT(lastMs, before + 15000) << "what it stood is not made up for";
}

TEST_F(LiveScenarioTest, ACaptureSeesAllThatTheBasebandDoes) {
  phoneIsIn({city()});
  driveOn(seconds(10));
  log->open();
  driveOn(seconds(30));
  log->close();
  driveOn(seconds(30));
  std::istringstream captured(log->take(BasebandLog::kCapacity));
  const Recording recording = readRecording(captured);
  EXPECT_TRUE(recording.faults.empty());
  std::set<std::int64_t> seen;
  for (const RecordedEvent& event : recording.events) {
    EXPECT_GE(event.atMs, 10000U);
    EXPECT_LE(event.atMs, 40000U);
    seen.insert(*event.metricID);
  }
  EXPECT_GT(seen.size(), 3U) << "though nobody subscribed to any";
}

TEST_F(LiveScenarioTest, RecordsWhatItDelivers) {
  const auto file = directory.path() / "live.jsonl";
  phoneIsIn({city(), 1, file});
  clientWants("[803010, 806660, 827648]");
  driveOn(seconds(60));
  clientAsks();
  driveOn(seconds(60));
  std::optional<bool> isGood;
  scenario->finishRecording([&isGood](const auto& outcome) { isGood = outcome.has_value(); });
  time.settle();
  EXPECT_EQ(isGood, true);
  const auto recording = readRecording(file);
  ASSERT_TRUE(recording);
  EXPECT_TRUE(recording->faults.empty());
  std::vector<std::int64_t> recorded;
  for (const RecordedEvent& event : recording->events) recorded.push_back(*event.metricID);
  EXPECT_FALSE(recorded.empty());
  EXPECT_EQ(recorded, taken());
  EXPECT_EQ(recorded.size(), scenario->events());
}

TEST_F(LiveScenarioTest, ARecordingThatCannotBeWrittenIsToldAtOnce) {
  const auto made = LiveScenario::make({city(), 1, directory.path() / "no" / "folder"},
                                       {library, &telephony, time, *mainQueue, time});
  ASSERT_FALSE(made);
  EXPECT_EQ(made.error(), (directory.path() / "no" / "folder").string() + ": No such file or directory");
}

TEST_F(LiveScenarioTest, OneThatHasGoneAnswersNothing) {
  phoneIsIn({city()});
  clientWants("[827648]");
  driveOn(seconds(10));
  scenario->start();
  scenario.reset();
  time.advance(seconds(10));
  taken();
  clientAsks();
  time.advance(seconds(10));
  EXPECT_TRUE(taken().empty());
}

}  // namespace
}  // namespace quorl::simulator
