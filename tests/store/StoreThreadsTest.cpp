#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "store/DBManager.h"
#include "store/MetricStatements.h"
#include "support/FakePlatform.h"
#include "support/Reading.h"
#include "support/ThreadedQueues.h"
#include "support/TimeZoneAndLocale.h"
#include "support/VirtualTimeVfs.h"

namespace quorl {
namespace {

/// The database on a thread of its own and the main queue on the test's.
class StoreThreadsTest : public testing::Test {
 protected:
  StoreThreadsTest() {
    Platform::install(&platform);
    database = *SQLiteDatabase::open((fake.directory.path() / "file.sqlite").string());
    for (const char* sql : {SQLTable<Metric>::createMetricTable, SQLTable<Metric>::createDashboardTable})
      database->createTable(sql, "table", [](bool /*success*/, const auto& /*error*/) {});
  }
  ~StoreThreadsTest() override {
    database.reset();
    queues.join();
    Platform::install(&fake.platform);
  }

  Metric reading(int value) const {
    return test::readingAt(fake.time.now() + std::chrono::seconds(value), "LTE", "Serving Cell Info",
                           "attribute_" + std::to_string(value % 7), std::to_string(value));
  }

  test::FakePlatform fake;
  test::VirtualTimeVfs vfs{fake.time};
  test::ScopedTimeZone zone{"UTC"};
  test::ThreadedQueues queues;
  LoopQueue main{"main"};
  Platform platform{main,           main,           queues,          fake.time,    fake.properties,
                    fake.resources, fake.documents, fake.strings,    fake.console, fake.alerts,
                    fake.analytics, fake.share,     fake.pasteboard, fake.zelkor,  fake.silentTelephony};
  std::shared_ptr<SQLiteDatabase> database;
};

TEST_F(StoreThreadsTest, InsertsAndReadsFromTheMainLoopKeepTheirOrder) {
  constexpr int kRows = 200;
  int written = 0;
  int reads = 0;
  bool sawEveryEarlierRow = true;
  main.async([&] {
    for (int i = 0; i < kRows; ++i) {
      database->insertMetric(reading(i), [&](bool success, const std::optional<SQLiteError>& /*error*/) {
        EXPECT_TRUE(success);
        EXPECT_TRUE(main.isCurrent());
        ++written;
      });
      if (i % 10 != 9) continue;
      database->exportMetrics(AttributeDetailTimeFrame::monthly,
                              [&, i](const ExportedMetrics& rows, const std::optional<SQLiteError>& error) {
                                EXPECT_EQ(error, std::nullopt);
                                if (rows.size() != static_cast<std::size_t>(i) + 1 || written != i + 1)
                                  sawEveryEarlierRow = false;
                                if (++reads == kRows / 10) main.stop();
                              });
    }
  });
  main.run();
  EXPECT_EQ(written, kRows);
  EXPECT_TRUE(sawEveryEarlierRow);
}

TEST_F(StoreThreadsTest, ReadsOfLatestValuesSeeEveryInsertThatWasCalledBefore) {
  constexpr int kRows = 200;
  int reads = 0;
  int late = 0;
  main.async([&] {
    for (int i = 0; i < kRows; ++i) {
      const Date last = reading(i).collectedOn;
      database->insertMetric(reading(i), [](bool success, const auto& /*error*/) { EXPECT_TRUE(success); });
      database->fetchAvailableMetrics(0, [&, last](const AvailableMetrics& metrics, const auto& error) {
        EXPECT_EQ(error, std::nullopt);
        if (metrics.at("LTE").front().collectedOn != last) ++late;
      });
      database->fetchMetricContents("LTE", "Serving Cell Info", reading(i).attributeName, 0,
                                    [&, last](const std::vector<Metric>& rows, const auto& error) {
                                      EXPECT_EQ(error, std::nullopt);
                                      if (rows.size() != 1 || rows.front().collectedOn != last) ++late;
                                      if (++reads == kRows) main.stop();
                                    });
    }
  });
  main.run();
  EXPECT_EQ(late, 0);
}

TEST_F(StoreThreadsTest, EveryReadRunsBesideTheMainLoop) {
  int left = 5;
  const auto done = [&] {
    EXPECT_TRUE(main.isCurrent());
    if (--left == 0) main.stop();
  };
  main.async([&] {
    for (int i = 0; i < 20; ++i) database->insertMetric(reading(i), [](bool /*success*/, const auto& /*error*/) {});
    database->fetchAvailableMetrics(0, [&](const AvailableMetrics& metrics, const auto& /*error*/) {
      EXPECT_EQ(metrics.size(), 1U);
      done();
    });
    database->fetchMetricContents("LTE", "Serving Cell Info", std::nullopt, 0,
                                  [&](const std::vector<Metric>& rows, const auto& /*error*/) {
                                    EXPECT_EQ(rows.size(), 7U);
                                    done();
                                  });
    database->fetchAttributeHistory("Serving Cell Info", "attribute_1", AttributeDetailTimeFrame::daily,
                                    [&](const std::vector<Metric>& rows, const auto& /*error*/) {
                                      EXPECT_EQ(rows.size(), 3U);
                                      done();
                                    });
    HardwareManager::shared().setCurrentSubsId(0);  // written here while the database's queue reads it
    database->fetchDashboard(0, [&](const std::vector<DashboardTableItem>& items, const auto& /*error*/) {
      EXPECT_TRUE(items.empty());
      done();
    });
    database->deleteOlderRows([&](bool success) {
      EXPECT_TRUE(success);
      done();
    });
  });
  main.run();
  EXPECT_EQ(left, 0);
}

}  // namespace
}  // namespace quorl
