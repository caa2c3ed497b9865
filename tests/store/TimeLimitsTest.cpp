#include "store/DatabaseFixture.h"

// Rows hold local wall-clock time; some limits are local and some UTC, on purpose. Each limit is tried on both sides,
// in a zone ahead of UTC and in one behind, at moments at which the local date is not the date in UTC.

namespace quorl {
namespace {

using test::kDaily;
using test::kMonthly;
using test::kWeekly;
using test::Row;
using test::times;
using test::values;

struct Moment {
  const char* name;
  const char* zone;
  const char* now;            // in UTC
  const char* localMidnight;  // limit of today
  const char* beforeMidnight;
};

// Ahead, it is already the 6th; behind, it is still the 4th.
constexpr Moment kAhead{"Ahead", "Asia/Tokyo", "2026-01-05 20:30:12", "2026-01-06 00:00:00", "2026-01-05 23:59:59"};
constexpr Moment kBehind{"Behind", "America/New_York", "2026-01-05 02:30:12", "2026-01-04 00:00:00",
                         "2026-01-03 23:59:59"};

class TimeLimitsTest : public test::DatabaseFixture, public testing::WithParamInterface<Moment> {
 protected:
  void SetUp() override {
    inZone(GetParam().zone);
    setClock(GetParam().now);
    openWithTables();
  }
  /// The clock's time of day in UTC, on another day.
  std::string thatTimeOn(const std::string& day) const { return day + std::string(GetParam().now).substr(10); }
  std::string secondBefore(const std::string& text) const {
    return wallClockText(parseWallClock(text).value() - std::chrono::seconds(1));
  }
  void insertAt(const std::string& text, const std::string& value) { insert(reading("dl_freq", value, text)); }
};

INSTANTIATE_TEST_SUITE_P(Zones, TimeLimitsTest, testing::Values(kAhead, kBehind),
                         [](const auto& instance) { return std::string(instance.param.name); });

TEST_P(TimeLimitsTest, RetentionDeletesUpToExactlyThirtyDaysBeforeTheUtcInstant) {
  const std::string limit = thatTimeOn("2025-12-06");
  insertAt(secondBefore(limit), "older");
  insertAt(limit, "exactly thirty days");
  insertAt(wallClockText(parseWallClock(limit).value() + std::chrono::seconds(1)), "younger");
  EXPECT_TRUE(deleteOlderRows().result);
  EXPECT_EQ(run("SELECT attribute_value FROM Metric"), std::vector<Row>{{"younger"}});
}

TEST_P(TimeLimitsTest, DailyHistoryBeginsAtLocalMidnight) {
  insertAt(GetParam().beforeMidnight, "1");
  insertAt(GetParam().localMidnight, "2");
  EXPECT_EQ(values(history(kDaily).result), Row{"2"});
}

TEST_P(TimeLimitsTest, WeeklyHistoryBeginsSevenDaysBeforeTheUtcInstant) {
  const std::string limit = thatTimeOn("2025-12-29");
  insertAt(secondBefore(limit), "1");
  EXPECT_TRUE(history(kWeekly).result.empty());
  insertAt(limit, "2");
  EXPECT_EQ(values(history(kWeekly).result), Row{"2.0"});
  EXPECT_EQ(times(history(kWeekly).result), Row{"2025-12-29 00:00:00"});
}

TEST_P(TimeLimitsTest, MonthlyHistoryBeginsThirtyDaysBeforeTheUtcInstant) {
  const std::string limit = thatTimeOn("2025-12-06");
  insertAt(secondBefore(limit), "1");
  EXPECT_TRUE(history(kMonthly).result.empty());
  insertAt(limit, "2");
  EXPECT_EQ(values(history(kMonthly).result), Row{"2.0"});
}

TEST_P(TimeLimitsTest, AveragesAreOfLocalDays) {
  insertAt("2026-01-02 23:59:59", "1");
  insertAt("2026-01-03 00:00:00", "2");
  EXPECT_EQ(times(history(kWeekly).result), (Row{"2026-01-02 00:00:00", "2026-01-03 00:00:00"}));
}

TEST_P(TimeLimitsTest, DailyExportBeginsAtLocalMidnight) {
  insertAt(GetParam().beforeMidnight, "1");
  insertAt(GetParam().localMidnight, "2");
  EXPECT_EQ(values(exported(kDaily).result), Row{"2"});
}

TEST_P(TimeLimitsTest, WeeklyExportBeginsAtUtcMidnightSevenDaysBack) {
  insertAt("2025-12-28 23:59:59", "1");
  insertAt("2025-12-29 00:00:00", "2");
  EXPECT_EQ(values(exported(kWeekly).result), Row{"2"});
}

TEST_P(TimeLimitsTest, MonthlyExportBeginsAtUtcMidnightThirtyDaysBack) {
  insertAt("2025-12-05 23:59:59", "1");
  insertAt("2025-12-06 00:00:00", "2");
  EXPECT_EQ(values(exported(kMonthly).result), Row{"2"});
}

TEST_P(TimeLimitsTest, ARowReadsBackAsTheInstantThatWasWritten) {
  const Date now = utcDate(GetParam().now);
  Metric metric = reading();
  metric.collectedOn = now;
  insert(metric);
  EXPECT_EQ(contents().result.front().collectedOn, now);
}

class TimeTest : public test::DatabaseFixture {
 protected:
  void SetUp() override { openWithTables(); }
};

TEST_F(TimeTest, JustAfterLocalMidnightTodayIsEmptyAndTheWeekIsNot) {
  inZone("Asia/Tokyo");
  setClock("2026-01-05 15:00:01");  // one second past midnight there
  insert(reading("dl_freq", "5", "2026-01-05 23:59:58"));
  EXPECT_TRUE(history(kDaily).result.empty());
  EXPECT_EQ(values(history(kWeekly).result), Row{"5.0"});
}

TEST_F(TimeTest, TheWeeklyExportBeginsEarlierAheadOfUtcThanBehind) {
  const auto firstRowIn = [&](std::string_view name) {
    inZone(name);
    run("DELETE FROM Metric");
    insert(reading("dl_freq", "1", "2025-12-28 23:59:59"));
    insert(reading("dl_freq", "2", "2025-12-29 00:00:00"));
    const auto rows = exported(kWeekly).result;
    EXPECT_EQ(rows.size(), 1U);
    return rows.front().collectedOn;
  };
  EXPECT_EQ(firstRowIn("Asia/Tokyo"), utcDate("2025-12-28 15:00:00"));
  EXPECT_EQ(firstRowIn("America/New_York"), utcDate("2025-12-29 05:00:00"));
}

TEST_F(TimeTest, AChangeOfZoneLeavesEarlierRowsAtTheirWallClock) {
  inZone("Asia/Tokyo");
  insert(reading("dl_freq", "1", "2026-01-05 18:00:00"));
  inZone("UTC");
  EXPECT_EQ(times(contents().result), Row{"2026-01-05 18:00:00"});
  EXPECT_EQ(run("SELECT collected_on FROM Metric"), std::vector<Row>{{"2026-01-05 18:00:00"}});
}

TEST_F(TimeTest, OfAnHourThatOccursTwiceTheFirstIsReadBackAsMeant) {
  inZone("America/New_York");
  Metric metric = reading();
  metric.collectedOn = utcDate("2025-11-02 06:30:00");  // the second half past one
  insert(metric);
  EXPECT_EQ(contents().result.front().collectedOn, utcDate("2025-11-02 05:30:00"));
}

}  // namespace
}  // namespace quorl
