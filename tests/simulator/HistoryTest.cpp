#include <algorithm>
#include <chrono>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "hosts/simulator/RecordingWriter.h"
#include "hosts/simulator/history/BulkIntake.h"
#include "hosts/simulator/history/History.h"
#include "hosts/simulator/history/HistoryDraft.h"
#include "simulator/network/TestScenarios.h"
#include "store/RawDatabase.h"
#include "support/FakePlatform.h"
#include "support/FileSizeLimit.h"
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
  std::vector<std::string> entries() const {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(platform.directory.path()))
      names.push_back(entry.path().filename().string());
    return names;
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
            (platform.directory.path() / "no" / "folder.sqlite").string() + ": No such file or directory");
}

TEST_F(HistoryTest, IsThereOnlyWhenItIsWhole) {
  bool wasThere = false;
  ASSERT_TRUE(writeHistory(file, plan(1), [&](const HistoryProgress&) { wasThere = wasThere || fs::exists(file); }));
  EXPECT_FALSE(wasThere);
  EXPECT_EQ(entries(), std::vector<std::string>{"history.sqlite"}) << "no write-ahead log is needed";
  EXPECT_EQ(fs::status(file).permissions(), fs::perms(0600));
}

TEST_F(HistoryTest, ThatIsStoppedLeavesNothing) {
  int sessions = 0;
  const auto made = writeHistory(
      file, plan(2), [&](const HistoryProgress&) { ++sessions; }, [&] { return sessions == 2; });
  ASSERT_FALSE(made);
  EXPECT_EQ(made.error(), file.string() + ": stopped before its end");
  EXPECT_EQ(sessions, 2);
  EXPECT_EQ(entries(), std::vector<std::string>());
}

TEST_F(HistoryTest, ThatDoesNotFitOnTheDiskLeavesNothing) {
  {
    const test::FileSizeLimit limit(128 * 1024);
    const auto made = writeHistory(file, plan(1), {});
    ASSERT_FALSE(made);
    EXPECT_TRUE(made.error().starts_with(file.string() + ": ")) << made.error();
  }
  EXPECT_EQ(entries(), std::vector<std::string>());
}

TEST_F(HistoryTest, NeverReplacesAFileThatCameMeanwhile) {
  const auto made = writeHistory(file, plan(1), [&](const HistoryProgress&) { std::ofstream(file) << "other"; });
  ASSERT_FALSE(made);
  EXPECT_EQ(made.error(), file.string() + ": another program has made it meanwhile");
  EXPECT_EQ(entries(), std::vector<std::string>{"history.sqlite"});
  EXPECT_EQ(fs::file_size(file), 5U);
}

TEST_F(HistoryTest, IsAddedToAFileThatIsThere) {
  const auto first = writeHistory(file, plan(1), {});
  ASSERT_TRUE(first);
  const auto second = writeHistory(file, plan(1), {});
  ASSERT_TRUE(second) << second.error();
  EXPECT_EQ(query("SELECT count(*) FROM Metric"),
            (std::vector<test::Row>{{std::to_string(first->rows + second->rows)}}));
}

TEST_F(HistoryTest, TakesNothingFromARemovedDatabase) {
  for (const char* left : {"history.sqlite-wal", "history.sqlite-shm", "history.sqlite-journal"})
    std::ofstream(platform.directory.path() / left) << "left";
  ASSERT_TRUE(writeHistory(file, plan(1), {}));
  EXPECT_EQ(entries(), std::vector<std::string>{"history.sqlite"});
}

TEST_F(HistoryTest, RemovesWhatAKilledOneHasLeftAndNothingElse) {
  const auto left = platform.directory.path() / ".quorl-history-killed";
  const auto foreign = platform.directory.path() / ".quorl-history-notes";
  for (const fs::path& folder : {left, foreign}) fs::create_directory(folder);
  for (const char* name : {"history.sqlite", "history.sqlite-wal", "history.sqlite-shm"})
    std::ofstream(left / name) << "x";
  std::ofstream(foreign / "notes.txt") << "mine";
  const auto living = HistoryDraft::of(file);
  ASSERT_TRUE(living) << living.error();
  std::ofstream((*living)->file()) << "half";
  removeAbandonedHistories(file);
  EXPECT_FALSE(fs::exists(left));
  EXPECT_TRUE(fs::exists(foreign / "notes.txt"));
  EXPECT_TRUE(fs::exists((*living)->file())) << "its maker lives";
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
