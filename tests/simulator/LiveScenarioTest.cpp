#include <algorithm>
#include <chrono>
#include <memory>
#include <optional>
#include <set>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include <fmt/format.h>
#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "hosts/simulator/LiveScenario.h"
#include "hosts/simulator/ScenarioFiles.h"
#include "hosts/simulator/history/BulkIntake.h"
#include "hosts/simulator/history/History.h"
#include "intake/ZelkorWrapper.h"
#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"
#include "simulator/ManagerCommands.h"
#include "store/PersistanceStore.h"
#include "store/RawDatabase.h"
#include "support/FakePlatform.h"
#include "support/SteppedQueue.h"
#include "support/TemporaryDirectory.h"
#include "support/TimeZone.h"

namespace quorl::simulator {
namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;

ScenarioChoice city(std::uint64_t seed = 1) {
  return {findScenario("city", {QUORL_SOURCE_DIR "/resources"}).value(), seed, metrics::Family::Mav};
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
    auto made = LiveScenario::make(std::move(options), {library, &telephony, time, *mainQueue, time});
    ASSERT_TRUE(made) << made.error();
    scenario = *std::move(made);
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
    zelkor::KeyValueMessage message;
    message.set(zelkor::kKeyAppID, std::int64_t{2});
    message.set(zelkor::kKeyPayload,
                ByteString(fmt::format(R"({{"applicationId":2,"payloadType":0,"profileId":0,"triggers":)"
                                       R"([{{"triggerId":5202011,"triggerType":0,"triggerRef":9999}}],"metrics":{}}})",
                                       metrics)));
    message.set(zelkor::kKeyPayloadType, std::int64_t{0});
    ASSERT_EQ(perform(zelkor::kCommandAddConfiguration, message), 0);
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
  std::unique_ptr<LiveScenario> scenario;
  std::vector<std::int64_t> received;
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
  std::uint64_t last = 0;
  scenario->setObserver([&last](const auto& event, const auto&) { last = event.atMs; });
  time.advance(seconds(60));
  EXPECT_EQ(last, 0U) << "not before it starts";
  scenario->start();
  time.advance(seconds(60));
  EXPECT_NEAR(static_cast<double>(last), 240000, 3000);
  scenario->stop();
  time.settle();
  const auto stopped = last;
  time.advance(seconds(60));
  EXPECT_EQ(last, stopped);
}

TEST_F(LiveScenarioTest, MetricsBearTheTimeAtWhichTheyCome) {
  const auto log = std::make_shared<BasebandLog>();
  bool isBehind = false;
  auto made = LiveScenario::make({city(), 20},
                                 {library, &telephony, time, *mainQueue, time, [&isBehind] { return isBehind; }, log});
  ASSERT_TRUE(made) << made.error();
  scenario = *std::move(made);
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
  std::uint64_t last = 0;
  scenario->setObserver([&last](const auto& event, const auto&) { last = event.atMs; });
  scenario->start();
  time.advance(seconds(30));
  time.setNow(time.now() + std::chrono::hours(5));
  time.advance(seconds(30));
  EXPECT_LT(last, 62000U);
  time.setNow(time.now() - std::chrono::hours(5));
  time.advance(seconds(30));
  EXPECT_GT(last, 80000U);
}

TEST_F(LiveScenarioTest, WaitsForAProductThatCannotKeepUp) {
  phoneIsIn({city()});
  std::uint64_t last = 0;
  scenario->setObserver([&last](const auto& event, const auto&) { last = event.atMs; });
  scenario->start();
  time.advance(seconds(10));
  const auto before = last;
  mainQueue->setHanging(true);
  time.advance(seconds(60));
  EXPECT_LE(last, before + 1000);
  mainQueue->setHanging(false);
  time.advance(seconds(10));
  EXPECT_GT(last, before + 5000);
}

TEST_F(LiveScenarioTest, StandsStillWhileThePhoneIsBehind) {
  bool isBehind = false;
  auto made =
      LiveScenario::make({city()}, {library, &telephony, time, *mainQueue, time, [&isBehind] { return isBehind; }});
  ASSERT_TRUE(made) << made.error();
  scenario = *std::move(made);
  std::uint64_t last = 0;
  scenario->setObserver([&last](const auto& event, const auto&) { last = event.atMs; });
  scenario->start();
  time.advance(seconds(10));
  const auto before = last;
  EXPECT_GT(before, 5000U);
  isBehind = true;
  time.advance(seconds(60));
  EXPECT_EQ(last, before);
  isBehind = false;
  time.advance(seconds(10));
  EXPECT_GT(last, before + 5000);
  EXPECT_LT(last, before + 15000) << "what it stood is not made up for";
}

TEST_F(LiveScenarioTest, ACaptureSeesAllThatTheBasebandDoes) {
  const auto log = std::make_shared<BasebandLog>();
  auto made = LiveScenario::make({city()}, {library, &telephony, time, *mainQueue, time, {}, log});
  ASSERT_TRUE(made) << made.error();
  scenario = *std::move(made);
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

TEST(RecordingWriterTest, AFullDiskIsToldAtTheEnd) {
  auto writer = RecordingWriter::open("/dev/full");
  ASSERT_TRUE(writer);
  RecordedEvent event;
  event.metricID = 803010;
  event.payload = ByteString(std::string(100000, 'x'));
  for (int i = 0; i < 3; ++i) writer->write(event);
  const auto closed = writer->close();
  ASSERT_FALSE(closed);
  EXPECT_EQ(closed.error(), "No space left on device");
}

/// A platform of family Mav, and files of rows.
class HistoryTest : public testing::Test {
 protected:
  HistoryTest() { platform.properties.texts["BasebandChipset"] = "mav"; }
  HistoryPlan plan(int days) const {
    HistoryPlan made{city(), days, platform.time.now()};
    made.session = std::chrono::minutes(1);
    return made;
  }
  std::vector<test::Row> query(const char* sql) { return test::RawDatabase(file).run(sql); }

  test::FakePlatform platform;
  test::ScopedTimeZone zone{"UTC"};
  const std::filesystem::path file = platform.directory.path() / "history.sqlite";
};

TEST_F(HistoryTest, HasSessionsOnEveryDayUpToNowAndNoneLater) {
  const auto times = sessionTimes(plan(30));
  EXPECT_GE(times.size(), 30U * 4 - 4);
  EXPECT_LE(times.size(), 31U * 4);
  EXPECT_TRUE(std::is_sorted(times.begin(), times.end()));
  EXPECT_GE(times.front(), platform.time.now() - std::chrono::hours(24 * 30));
  EXPECT_LT(times.back(), platform.time.now());
  EXPECT_EQ(times, sessionTimes(plan(30)));
}

TEST_F(HistoryTest, FillsEveryDayWithRows) {
  int steps = 0;
  const auto made = writeHistory(file, plan(3), [&steps](const HistoryProgress& so) {
    EXPECT_EQ(so.sessionsDone, ++steps);
    EXPECT_LE(so.sessionsDone, so.sessions);
  });
  ASSERT_TRUE(made) << made.error();
  EXPECT_EQ(made->sessionsDone, made->sessions);
  EXPECT_GT(made->rows, 1000U);
  EXPECT_EQ(query("SELECT count(*) FROM Metric"), (std::vector<test::Row>{{std::to_string(made->rows)}}));
  EXPECT_EQ(query("SELECT DISTINCT date(collected_on) FROM Metric ORDER BY 1"),
            (std::vector<test::Row>{{"2026-01-02"}, {"2026-01-03"}, {"2026-01-04"}, {"2026-01-05"}}));
  EXPECT_EQ(query("SELECT count(*) FROM Metric WHERE collected_on > '2026-01-05 09:30:12'"),
            (std::vector<test::Row>{{"0"}}));
  EXPECT_EQ(query("SELECT count(*) > 10 FROM Metric WHERE is_attribute_graphable = 1"), (std::vector<test::Row>{{"1"}}))
      << "graphs have something to show";
}

TEST_F(HistoryTest, IsTheSameForTheSamePlan) {
  ASSERT_TRUE(writeHistory(file, plan(1), {}));
  const auto first = query("SELECT * FROM Metric ORDER BY Id");
  std::filesystem::remove(file);
  ASSERT_TRUE(writeHistory(file, plan(1), {}));
  EXPECT_EQ(query("SELECT * FROM Metric ORDER BY Id"), first);
}

TEST_F(HistoryTest, TellsWhichFileCannotBeWritten) {
  const auto made = writeHistory(platform.directory.path() / "no" / "folder.sqlite", plan(1), {});
  ASSERT_FALSE(made);
  EXPECT_EQ(made.error(),
            (platform.directory.path() / "no" / "folder.sqlite").string() + ": unable to open database file");
}

TEST_F(HistoryTest, OfARecordedWayHasTheRowsOfTheWayItself) {
  ScenarioRun run(city(7), 1767605400000);
  std::vector<RecordedEvent> lived;
  run.advance(std::chrono::minutes(2), [&lived](RecordedEvent event) { lived.push_back(std::move(event)); });
  const auto recordingFile = platform.directory.path() / "way.jsonl";
  auto writer = RecordingWriter::open(recordingFile);
  ASSERT_TRUE(writer);
  for (const RecordedEvent& event : lived) writer->write(event);
  ASSERT_TRUE(writer->close());
  const auto recording = readRecording(recordingFile);
  ASSERT_TRUE(recording);

  std::vector<std::vector<test::Row>> rows;
  for (const auto& events : {lived, recording->events}) {
    auto intake = BulkIntake::open(file);
    ASSERT_TRUE(intake);
    for (const RecordedEvent& event : events) (*intake)->take(event);
    ASSERT_TRUE((*intake)->finish());
    rows.push_back(query("SELECT * FROM Metric ORDER BY Id"));
    std::filesystem::remove(file);
  }
  EXPECT_GT(rows[0].size(), 500U);
  EXPECT_TRUE(rows[0] == rows[1]);
}

}  // namespace
}  // namespace quorl::simulator
