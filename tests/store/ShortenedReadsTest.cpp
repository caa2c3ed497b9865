#include <sqlite3.h>

#include "store/DatabaseFixture.h"

// Reads that do not come to the end of their rows: a step fails in the middle, or a row cannot be read.

namespace quorl {
namespace {

using test::emptyQueryResult;
using test::kDaily;
using test::kMonthly;
using test::kWeekly;
using test::Place;
using test::Read;
using test::Row;

constexpr char kInterruptedLine[] = "error occurred while fetching metric contents interrupted";

class ShortenedReadsTest : public test::DatabaseFixture {
 protected:
  void SetUp() override { openWithTables(); }

  /// The outcome of `read` when its statement fails at the latest moment at which `isShortened` holds of it.
  template <typename ReadCall, typename IsShortened>
  auto failingInTheMiddle(ReadCall read, IsShortened isShortened) {
    struct Budget {
      int used = 0;
      int limit = 1 << 30;
    } budget;
    const auto spend = [](void* context) {
      auto* const spent = static_cast<Budget*>(context);
      return ++spent->used > spent->limit ? 1 : 0;
    };
    const auto readWithin = [&](int limit) {
      run("UPDATE Metric SET metric_id = metric_id");  // unseen, so that the statement has to answer
      platform.console.lines.clear();
      budget = {0, limit};
      sqlite3_progress_handler(database->dbPointer(), 1, spend, &budget);
      auto outcome = read();
      sqlite3_progress_handler(database->dbPointer(), 0, nullptr, nullptr);
      return outcome;
    };
    auto outcome = readWithin(budget.limit);
    for (int limit = budget.used - 1; limit > 0 && !isShortened(outcome); --limit) outcome = readWithin(limit);
    return outcome;
  }
  /// The same for a read of `count` rows, which has some of them then.
  template <typename ReadCall>
  void expectSomeRowsOf(std::size_t count, ReadCall read) {
    ASSERT_EQ(read().result.size(), count);
    const auto outcome = failingInTheMiddle(read, [&](const auto& whole) { return whole.result.size() < count; });
    expectSuccess(outcome);
    EXPECT_EQ(outcome.result.size(), count - 1);
  }
};

TEST_F(ShortenedReadsTest, AListThatFailsInTheMiddleHasTheMetricsReadSoFar) {
  for (const char* tech : {"5G", "GSM", "LTE", "MISC", "UMTS"}) {
    Metric metric = reading();
    metric.metricTech = tech;
    metric.metricName = tech;
    insert(metric);
  }
  expectSomeRowsOf(5, [this] { return available(); });
}

TEST_F(ShortenedReadsTest, ContentsThatFailInTheMiddleHaveTheRowsReadSoFarAndPrintTheOtherText) {
  for (const char* attribute : {"a", "b", "c", "d", "e"}) insert(reading(attribute));
  expectSomeRowsOf(5, [this] { return contents(); });
  EXPECT_EQ(platform.console.lines, Row{kInterruptedLine});
}

TEST_F(ShortenedReadsTest, ContentsOfOneAttributeThatFailHaveTheirRowOrNoneAndPrintTheOtherText) {
  for (const char* value : {"1", "2", "3"}) insert(reading("dl_freq", value));
  const auto read = [this] { return contents("dl_freq"); };
  ASSERT_EQ(read().result.size(), 1U);
  const Read behindTheRow =
      failingInTheMiddle(read, [this](const Read&) { return platform.console.lines == Row{kInterruptedLine}; });
  expectSuccess(behindTheRow);
  EXPECT_EQ(behindTheRow.result.size(), 1U);
  const Read beforeTheRow = failingInTheMiddle(read, [](const Read& outcome) { return outcome.result.empty(); });
  expectSuccess(beforeTheRow);
  EXPECT_TRUE(beforeTheRow.result.empty());
  EXPECT_EQ(platform.console.lines, Row{kInterruptedLine});
}

TEST_F(ShortenedReadsTest, AHistoryThatFailsInTheMiddleHasTheReadingsSoFar) {
  for (const char* time : {"2026-01-05 07:00:00", "2026-01-05 08:00:00", "2026-01-05 09:00:00"})
    insert(reading("dl_freq", "7", time));
  expectSomeRowsOf(3, [this] { return history(kDaily); });
  for (const char* time : {"2026-01-02 08:00:00", "2026-01-03 08:00:00", "2026-01-04 08:00:00"})
    insert(reading("dl_freq", "7", time));
  expectSomeRowsOf(4, [this] { return history(kWeekly); });
  expectSomeRowsOf(4, [this] { return history(kMonthly); });
  EXPECT_TRUE(platform.console.lines.empty());
}

TEST_F(ShortenedReadsTest, ADashboardThatFailsInTheMiddleHasTheItemsReadSoFar) {
  for (const char* attribute : {"a", "b", "c"})
    execute(SQLTable<Metric>::insertDashboardItem({"LTE", "803010", "Serving Cell Info", attribute, 0}));
  expectSomeRowsOf(3, [this] { return dashboard(); });
  EXPECT_TRUE(platform.console.lines.empty());
}

TEST_F(ShortenedReadsTest, AnExportThatFailsInTheMiddleHasTheRowsReadSoFar) {
  for (int i = 0; i < 20; ++i) insert(reading("dl_freq", std::to_string(i)));
  for (const AttributeDetailTimeFrame timeFrame : {kDaily, kWeekly, kMonthly})
    expectSomeRowsOf(20, [&] { return exported(timeFrame); });
  EXPECT_TRUE(platform.console.lines.empty());
}

// Rows that cannot be read.

TEST_F(ShortenedReadsTest, ANullTextDropsTheReadingsBeforeIt) {
  insert(reading("dl_freq", "7", "2026-01-05 07:00:00"));
  ASSERT_EQ(history(kDaily).result.size(), 1U);
  insertRowWith("attribute_value_type", "NULL");
  expectFailure(history(kDaily), emptyQueryResult(), Place::main);
}

TEST_F(ShortenedReadsTest, ANullTextDropsTheDaysBeforeIt) {
  insert(reading("dl_freq", "7", "2026-01-04 07:00:00"));
  for (const AttributeDetailTimeFrame timeFrame : {kWeekly, kMonthly}) ASSERT_EQ(history(timeFrame).result.size(), 1U);
  insertRowWith("attribute_value_type", "NULL");  // on the next day
  for (const AttributeDetailTimeFrame timeFrame : {kWeekly, kMonthly})
    expectFailure(history(timeFrame), emptyQueryResult(), Place::main);
}

TEST_F(ShortenedReadsTest, ADateThatDoesNotParseDropsTheReadingsBeforeIt) {
  insert(reading("dl_freq", "7", "2026-01-05 07:00:00"));
  ASSERT_EQ(history(kDaily).result.size(), 1U);
  insertRowWith("collected_on", "'yesterday'");
  expectFailure(history(kDaily), emptyQueryResult(), Place::main);
}

TEST_F(ShortenedReadsTest, ANullTextDropsTheDashboardItemsBeforeIt) {
  execute(SQLTable<Metric>::insertDashboardItem({"LTE", "803010", "Serving Cell Info", "a", 0}));
  ASSERT_EQ(dashboard().result.size(), 1U);
  run("INSERT INTO Dashboard (metric_id, metric_name, attribute_name, subs_id) VALUES ('1', 'N', 'b', 0)");
  expectFailure(dashboard(), emptyQueryResult(), Place::database);
}

TEST_F(ShortenedReadsTest, ContentsThatEndOnABadRowPrintNothing) {
  for (const auto& [column, value] : {std::pair("attribute_value", "NULL"), std::pair("collected_on", "'yesterday'")}) {
    run("DELETE FROM Metric");
    insert(reading("a_first"));
    insertRowWith(column, value);
    EXPECT_EQ(contents().error, emptyQueryResult()) << column;
    EXPECT_EQ(contents("dl_freq").error, emptyQueryResult()) << column;
    EXPECT_TRUE(platform.console.lines.empty()) << column;
  }
}

}  // namespace
}  // namespace quorl
