#include <filesystem>
#include <fstream>
#include <optional>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <sqlite3.h>
#include <sys/stat.h>

#include "app/HardwareManager.h"
#include "hosts/simulator/Recording.h"
#include "hosts/simulator/history/BulkIntake.h"
#include "intake/ZelkorWrapper.h"
#include "store/PersistanceStore.h"
#include "store/RawDatabase.h"
#include "support/FakePlatform.h"
#include "support/Reading.h"
#include "support/TimeZoneAndLocale.h"
#include "support/VirtualTimeVfs.h"

namespace quorl::simulator {
namespace {

namespace fs = std::filesystem;

constexpr char kAllRows[] = "SELECT * FROM Metric ORDER BY Id";

class BulkIntakeTest : public testing::TestWithParam<const char*> {
 protected:
  BulkIntakeTest() { platform.properties.texts["BasebandChipset"] = GetParam(); }

  static std::vector<RecordedEvent> shippedRecording() {
    const auto recording =
        readRecording(fs::path(QUORL_SOURCE_DIR "/resources/recordings") / (std::string(GetParam()) + ".jsonl"));
    return recording ? recording->events : std::vector<RecordedEvent>();
  }
  /// Has the product itself take the events.
  void productTakes(const std::vector<RecordedEvent>& events) {
    PersistanceStore store(HardwareManager::shared(), ZelkorWrapper::sharedInstance());
    platform.time.settle();
    // Without waiting for the disk at each row.
    ASSERT_EQ(sqlite3_exec(store.database().dbPointer(), "PRAGMA synchronous=OFF", nullptr, nullptr, nullptr),
              SQLITE_OK);
    for (const RecordedEvent& event : events) {
      store.metricService().processMetric(event.message());
      platform.time.settle();
    }
  }
  fs::path productsFile() const { return platform.directory.path() / "metricPartV11.sqlite"; }
  fs::path bulkFile() const { return platform.directory.path() / "bulk.sqlite"; }
  static std::vector<test::Row> query(const fs::path& file, const std::string& sql) {
    return test::RawDatabase(file).run(sql);
  }

  test::FakePlatform platform;
  test::VirtualTimeVfs vfs{platform.time};
  test::ScopedTimeZone zone{"Europe/Berlin"};
};

TEST_P(BulkIntakeTest, WritesTheRowsThatTheProductWouldHaveInserted) {
  const auto events = shippedRecording();
  ASSERT_GT(events.size(), 200U);
  productTakes(events);
  auto intake = BulkIntake::open(bulkFile());
  ASSERT_TRUE(intake) << intake.error();
  for (const RecordedEvent& event : events) ASSERT_TRUE((*intake)->take(event));
  EXPECT_EQ((*intake)->events(), events.size());
  ASSERT_TRUE((*intake)->finish());

  const auto expected = query(productsFile(), kAllRows);
  const auto written = query(bulkFile(), kAllRows);
  EXPECT_GT(expected.size(), 2000U);
  EXPECT_EQ((*intake)->rows(), expected.size());
  ASSERT_EQ(written.size(), expected.size());
  for (std::size_t i = 0; i < written.size(); ++i) ASSERT_EQ(written[i], expected[i]) << "row " << i;
}

TEST_P(BulkIntakeTest, MakesTheTableThatTheProductMakes) {
  productTakes({});
  auto intake = BulkIntake::open(bulkFile());
  ASSERT_TRUE(intake);
  ASSERT_TRUE((*intake)->finish());
  constexpr char kTable[] = "SELECT sql FROM sqlite_master WHERE name = 'Metric'";
  EXPECT_EQ(query(bulkFile(), kTable), query(productsFile(), kTable));
  EXPECT_EQ(query(bulkFile(), "PRAGMA journal_mode"), query(productsFile(), "PRAGMA journal_mode"));
}

TEST_P(BulkIntakeTest, TheProductGoesOnBehindAHistory) {
  const auto events = shippedRecording();
  ASSERT_FALSE(events.empty());
  auto intake = BulkIntake::open(productsFile());
  ASSERT_TRUE(intake);
  for (const RecordedEvent& event : events) ASSERT_TRUE((*intake)->take(event));
  ASSERT_TRUE((*intake)->finish());
  EXPECT_EQ(query(productsFile(), "SELECT count(*) FROM sqlite_master WHERE name = 'Dashboard'"),
            (std::vector<test::Row>{{"0"}}))
      << "for the product, it is a first start all the same";
  const auto before = query(productsFile(), "SELECT count(*), max(Id) FROM Metric");
  productTakes({events.front()});
  const auto after = query(productsFile(), "SELECT count(*) = max(Id), count(*) > " + before[0][0] + " FROM Metric");
  EXPECT_EQ(after, (std::vector<test::Row>{{"1", "1"}})) << "its rows take the next keys";
}

INSTANTIATE_TEST_SUITE_P(Families, BulkIntakeTest, testing::Values("mav", "ice"),
                         [](const auto& parameter) { return std::string(parameter.param); });

class BulkStoreTest : public testing::Test {
 protected:
  static Metric row(std::string value) {
    Metric metric = test::readingAt(Date(std::chrono::seconds(1767605412)), "LTE", "Serving Cell Info", "dl_freq",
                                    std::move(value), 1);
    metric.graphable = true;
    return metric;
  }
  std::vector<test::Row> stored(const char* sql) { return test::RawDatabase(file).run(sql); }

  test::TemporaryDirectory directory;
  test::ScopedTimeZone zone{"UTC"};
  const fs::path file = directory.path() / "history.sqlite";
};

TEST_F(BulkStoreTest, KeepsItsFilesForTheirUserAlone) {
  const mode_t before = ::umask(S_IWGRP | S_IWOTH);
  auto store = BulkStore::open(file);
  ::umask(before);
  ASSERT_TRUE(store);
  (*store)->insertMetric(row("1"), {});
  for (const char* name : {"history.sqlite", "history.sqlite-wal", "history.sqlite-shm"})
    EXPECT_EQ(fs::status(directory.path() / name).permissions(), fs::perms(0600)) << name;
  ASSERT_TRUE((*store)->finish());
  EXPECT_EQ(fs::status(file).permissions(), fs::perms(0600));
}

TEST_F(BulkStoreTest, LeavesAFileThatIsWholeWithoutItsLog) {
  auto store = BulkStore::open(file);
  ASSERT_TRUE(store);
  for (int i = 0; i < 3; ++i) (*store)->insertMetric(row(std::to_string(i)), {});
  ASSERT_TRUE((*store)->finish());
  const fs::path alone = directory.path() / "alone.sqlite";
  fs::copy_file(file, alone);
  EXPECT_EQ(test::RawDatabase(alone).run(
                "SELECT metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
                "is_attribute_graphable, metric_id, subs_id, collected_on FROM Metric WHERE Id = 3"),
            (std::vector<test::Row>{
                {"LTE", "Serving Cell Info", "dl_freq", "2", "INT", "1", "803010", "1", "2026-01-05 09:30:12"}}));
}

TEST_F(BulkStoreTest, WhatIsNotFinishedIsLost) {
  {
    auto store = BulkStore::open(file);
    ASSERT_TRUE(store);
    (*store)->insertMetric(row("1"), {});
  }
  EXPECT_EQ(stored("SELECT count(*) FROM Metric"), (std::vector<test::Row>{{"0"}}));
}

TEST_F(BulkStoreTest, TellsWhyAFileCannotBeUsed) {
  const auto inNoFolder = BulkStore::open(directory.path() / "no" / "folder.sqlite");
  ASSERT_FALSE(inNoFolder);
  EXPECT_EQ(inNoFolder.error(), "unable to open database file");
  std::ofstream(file) << "this is a text and long enough not to be taken for an empty database, whatever it says";
  const auto noDatabase = BulkStore::open(file);
  ASSERT_FALSE(noDatabase);
  EXPECT_EQ(noDatabase.error(), "file is not a database");
}

TEST_F(BulkStoreTest, AFullDiskEndsItAndIsTold) {
  // As full as a disk can be for one file: it may not grow any more.
  {
    auto store = BulkStore::open(file);
    ASSERT_TRUE(store && (*store)->finish());
  }
  auto store = BulkStore::open(file);
  ASSERT_TRUE(store);
  (*store)->limitPages(20);
  for (int i = 0; i < 5000 && !(*store)->hasFailed(); ++i) (*store)->insertMetric(row(std::string(100, 'x')), {});
  EXPECT_TRUE((*store)->hasFailed());
  const auto taken = (*store)->rows();
  (*store)->insertMetric(row("late"), {});
  EXPECT_EQ((*store)->rows(), taken) << "nothing more is written";
  const auto finished = (*store)->finish();
  ASSERT_FALSE(finished);
  EXPECT_EQ(finished.error(), "database or disk is full");
  EXPECT_EQ(stored("PRAGMA integrity_check"), (std::vector<test::Row>{{"ok"}}));
}

TEST_F(BulkStoreTest, AnswersNoReads) {
  auto store = BulkStore::open(file);
  ASSERT_TRUE(store);
  int errors = 0;
  const auto count = [&errors](const auto& /*result*/, const std::optional<SQLiteError>& error) {
    errors += error ? 1 : 0;
  };
  (*store)->fetchAvailableMetrics(0, count);
  (*store)->fetchMetricContents("LTE", "RACH", std::nullopt, 0, count);
  (*store)->fetchAttributeHistory("RACH", "rsrp", AttributeDetailTimeFrame::daily, count);
  (*store)->fetchDashboard(0, count);
  (*store)->exportMetrics(AttributeDetailTimeFrame::daily, count);
  EXPECT_EQ(errors, 5);
}

}  // namespace
}  // namespace quorl::simulator
