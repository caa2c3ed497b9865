#include <algorithm>
#include <chrono>
#include <cstdint>
#include <filesystem>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "hosts/simulator/RecordingWriter.h"
#include "hosts/simulator/history/BulkIntake.h"
#include "hosts/simulator/history/History.h"
#include "simulator/network/TestScenarios.h"
#include "store/RawDatabase.h"
#include "support/FakePlatform.h"
#include "support/TimeZoneAndLocale.h"

namespace quorl::simulator {
namespace {

namespace fs = std::filesystem;

/// A platform of family Mav, and files of rows.
class HistoryTest : public testing::Test {
 protected:
  HistoryTest() { platform.properties.texts["BasebandChipset"] = "mav"; }
  HistoryPlan plan(int days) const {
    HistoryPlan made{city(1), days, platform.time.now()};
    made.session = std::chrono::minutes(1);
    return made;
  }
  static ScenarioChoice city(std::uint64_t seed) {
    return {network::shippedScenario("city"), seed, metrics::Family::Mav};
  }
  std::vector<test::Row> query(const char* sql) { return test::RawDatabase(file).run(sql); }

  test::FakePlatform platform;
  test::ScopedTimeZone zone{"UTC"};
  const fs::path file = platform.directory.path() / "history.sqlite";
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
  EXPECT_EQ(steps, made->sessions);
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
  fs::remove(file);
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
  constexpr std::uint64_t kBeginMs = 1767605400000;  // 2026-01-05 09:30:00 UTC
  ScenarioRun run(city(7), kBeginMs);
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
    for (const RecordedEvent& event : events) ASSERT_TRUE((*intake)->take(event));
    ASSERT_TRUE((*intake)->finish());
    rows.push_back(query("SELECT * FROM Metric ORDER BY Id"));
    fs::remove(file);
  }
  EXPECT_GT(rows[0].size(), 500U);
  EXPECT_TRUE(rows[0] == rows[1]);
}

}  // namespace
}  // namespace quorl::simulator
