#include <algorithm>

#include "app/HardwareManager.h"
#include "store/DatabaseFixture.h"
#include "store/EnumeratorPrefix.h"

namespace quorl {
namespace {

using test::emptyQueryResult;
using test::kDaily;
using test::kMonthly;
using test::kWeekly;
using test::Listed;
using test::Pinned;
using test::Place;
using test::prepareError;
using test::Read;
using test::Row;
using test::times;
using test::values;

class StoreReadsTest : public test::DatabaseFixture {
 protected:
  void SetUp() override { openWithTables(); }
};

// What all reads share.

TEST_F(StoreReadsTest, NoRowsAreNoError) {
  const Listed listed = available();
  expectSuccess(listed);
  EXPECT_TRUE(listed.result.empty());
  const Pinned pinned = dashboard();
  expectSuccess(pinned);
  EXPECT_TRUE(pinned.result.empty());
  for (const Read& read : {contents(), contents("dl_freq"), history(kDaily), history(kWeekly), history(kMonthly),
                           exported(kDaily), exported(kWeekly), exported(kMonthly)}) {
    expectSuccess(read);
    EXPECT_TRUE(read.result.empty());
  }
}

TEST_F(StoreReadsTest, AFailedPrepareOfTheListTheDashboardAndTheExportCarriesADescriptionAsMeant) {
  run("DROP TABLE Metric");
  run("DROP TABLE Dashboard");
  const SQLiteError noMetric = prepareError("Prepare(message: \"no such table: Metric\")");
  expectFailure(available(), noMetric, Place::main);
  expectFailure(exported(kDaily), noMetric, Place::main);
  expectFailure(dashboard(), prepareError("Prepare(message: \"no such table: Dashboard\")"), Place::main);
}

TEST_F(StoreReadsTest, AFailedPrepareOfContentsAndHistoryComesAsItWasThrown) {
  run("DROP TABLE Metric");
  const SQLiteError error = prepareError("no such table: Metric");
  expectFailure(contents(), error, Place::main);
  expectFailure(history(kDaily), error, Place::main);
  expectFailure(history(kMonthly), error, Place::main);
}

TEST_F(StoreReadsTest, ANullTextOfTheListCompletesOnTheDatabasesQueueAsMeant) {
  insert(reading());
  insertRowWith("metric_tech", "NULL");
  run("UPDATE Metric SET metric_name = 'Z' WHERE metric_tech IS NULL");
  expectFailure(available(), emptyQueryResult(), Place::database);
}

TEST_F(StoreReadsTest, ANullTextOfContentsCompletesOnTheMainQueue) {
  for (const char* column : {"attribute_name", "attribute_value", "attribute_value_type"}) {
    run("DELETE FROM Metric");
    insertRowWith("attribute_name", "'z_second_row'");
    insertRowWith(column, "NULL");
    expectFailure(contents(), emptyQueryResult(), Place::main);
  }
}

TEST_F(StoreReadsTest, ANullTextOfTheHistoryCompletesOnTheMainQueue) {
  for (const char* column : {"metric_tech", "attribute_value", "attribute_value_type"}) {
    for (const AttributeDetailTimeFrame timeFrame : {kDaily, kWeekly, kMonthly}) {
      run("DELETE FROM Metric");
      insertRowWith(column, "NULL");
      expectFailure(history(timeFrame), emptyQueryResult(), Place::main);
    }
  }
}

TEST_F(StoreReadsTest, ANullTextOfTheDashboardCompletesOnTheDatabasesQueueAsMeant) {
  run("INSERT INTO Dashboard (metric_id, metric_name, attribute_name, subs_id) VALUES ('1', 'N', 'a', 0)");
  expectFailure(dashboard(), emptyQueryResult(), Place::database);
}

TEST_F(StoreReadsTest, ANullTextOfTheExportCompletesOnTheDatabasesQueueAsMeant) {
  for (const char* column : {"metric_tech", "attribute_name", "attribute_value"}) {
    run("DELETE FROM Metric");
    insert(reading());
    insertRowWith(column, "NULL");
    expectFailure(exported(kDaily), emptyQueryResult(), Place::database);
  }
}

TEST_F(StoreReadsTest, ADateThatDoesNotParseCountsAsNowInTheList) {
  insertRowWith("collected_on", "'yesterday'");
  const Listed listed = available();
  expectSuccess(listed);
  ASSERT_EQ(listed.result.count("LTE"), 1U);
  EXPECT_EQ(listed.result.at("LTE").front().collectedOn, platform.time.now());
}

TEST_F(StoreReadsTest, ADateThatDoesNotParseEndsContentsAndExportOnTheDatabasesQueueAsMeant) {
  insertRowWith("collected_on", "'yesterday'");
  expectFailure(contents(), emptyQueryResult(), Place::database);
  expectFailure(contents("dl_freq"), emptyQueryResult(), Place::database);
  expectFailure(exported(kDaily), emptyQueryResult(), Place::database);
}

TEST_F(StoreReadsTest, ADateThatDoesNotParseEndsTheHistoryOnTheMainQueue) {
  insertRowWith("collected_on", "'yesterday'");
  expectFailure(history(kDaily), emptyQueryResult(), Place::main);
  expectFailure(history(kWeekly), emptyQueryResult(), Place::main);
  expectFailure(history(kMonthly), emptyQueryResult(), Place::main);
}

TEST_F(StoreReadsTest, AnExportThatEndsOnABadRowDoesNotHoldTheJournal) {
  insertRowWith("collected_on", "'yesterday'");
  exported(kDaily);
  insert(reading());
  test::RawDatabase other(path());
  EXPECT_EQ(other.run("PRAGMA wal_checkpoint(TRUNCATE)"), (std::vector<Row>{{"0", "0", "0"}}));
}

// The list of metrics.

TEST_F(StoreReadsTest, TheListGroupsByTechnologyInTheOrderOfTheNames) {
  Metric metric = reading();
  for (const auto& [tech, name] : {std::pair("LTE", "Serving Cell Info"), std::pair("5G", "Nr Ota Msg"),
                                   std::pair("LTE", "Ota Msg"), std::pair("LTE", "C-DRX")}) {
    metric.metricTech = tech;
    metric.metricName = name;
    insert(metric);
  }
  const Listed listed = available();
  expectSuccess(listed);
  ASSERT_EQ(listed.result.size(), 2U);
  Row names;
  for (const MetricList& entry : listed.result.at("LTE")) names.push_back(entry.metricName);
  EXPECT_EQ(names, (Row{"C-DRX", "Ota Msg", "Serving Cell Info"}));
  EXPECT_EQ(listed.result.at("5G").size(), 1U);
}

TEST_F(StoreReadsTest, TheListShowsTheLastTimeAndOneSubscriptionOnly) {
  insert(reading("dl_freq", "1", "2026-01-05 09:00:00"));
  insert(reading("ul_freq", "2", "2026-01-05 09:00:07"));
  insert(reading("dl_freq", "3", "2026-01-05 08:00:00"));
  insert(reading("dl_freq", "4", "2026-01-05 09:10:00", /*subsId=*/1));
  const Listed listed = available(0);
  ASSERT_EQ(listed.result.at("LTE").size(), 1U);
  EXPECT_EQ(listed.result.at("LTE").front().collectedOn, utcDate("2026-01-05 09:00:07"));
  EXPECT_EQ(listed.result.at("LTE").front().subsId, 0);
  EXPECT_EQ(available(1).result.at("LTE").front().subsId, 1);
}

// Contents of a metric.

TEST_F(StoreReadsTest, ContentsFillEveryField) {
  inZone("America/New_York");
  platform.strings.table = {{"dl_freq", "Downlink frequency"}};
  Metric metric = reading("dl_freq", "SYS_MODE_LTE", "2026-01-05 03:00:00", 1);
  metric.attributeValueType = "STRING";
  metric.graphable = true;
  insert(metric);
  const Read read = contents(std::nullopt, 1);
  expectSuccess(read);
  ASSERT_EQ(read.result.size(), 1U);
  const Metric& row = read.result.front();
  EXPECT_NE(row.id, metric.id);
  EXPECT_EQ(row.metricTech, "LTE");
  EXPECT_EQ(row.metricName, "Serving Cell Info");
  EXPECT_EQ(row.attributeName, "Downlink frequency");
  EXPECT_EQ(row.attributeNameNonLocalized, "dl_freq");
  EXPECT_EQ(row.attributeValue, "LTE");
  EXPECT_EQ(row.attributeValueType, "STRING");
  EXPECT_EQ(row.collectedOn, utcDate("2026-01-05 08:00:00"));
  EXPECT_EQ(row.metricId, "803010");
  EXPECT_EQ(row.subsId, 1);
  EXPECT_TRUE(row.graphable);
  EXPECT_FALSE(row.isBookmarked);
  EXPECT_EQ(row.sectionNumber, std::nullopt);
}

TEST_F(StoreReadsTest, AnAttributeWithoutTranslationKeepsItsRawName) {
  insert(reading());
  EXPECT_EQ(contents().result.front().attributeName, "dl_freq");
}

TEST_F(StoreReadsTest, OnlyOneCountsAsGraphable) {
  insertRowWith("is_attribute_graphable", "2");
  EXPECT_FALSE(contents().result.front().graphable);
}

TEST_F(StoreReadsTest, ContentsHoldTheLatestRowOfEachAttributeSortedByRawName) {
  insert(reading("ul_freq", "1", "2026-01-05 09:00:00"));
  insert(reading("dl_freq", "2", "2026-01-05 09:00:02"));
  insert(reading("dl_freq", "3", "2026-01-05 09:00:01"));
  EXPECT_EQ(values(contents().result), (Row{"2", "1"}));
}

TEST_F(StoreReadsTest, ContentsOfOneAttributeAreItsLatestRow) {
  insert(reading("dl_freq", "1", "2026-01-05 09:00:00"));
  insert(reading("dl_freq", "2", "2026-01-05 09:00:02"));
  insert(reading("ul_freq", "3", "2026-01-05 09:00:05"));
  EXPECT_EQ(values(contents("dl_freq").result), Row{"2"});
}

TEST_F(StoreReadsTest, ContentsKeepTechnologiesAndSubscriptionsApart) {
  Metric other = reading("dl_freq", "other tech");
  other.metricTech = "5G";
  insert(other);
  insert(reading("dl_freq", "other subscription", "2026-01-05 09:00:00", 1));
  EXPECT_TRUE(contents().result.empty());
}

TEST_F(StoreReadsTest, AGoodReadOfContentsPrintsTheLibrarysTextAsMeant) {
  insert(reading());
  contents();
  contents("dl_freq");
  const std::string line = "error occurred while fetching metric contents no more rows available";
  EXPECT_EQ(platform.console.lines, (Row{line, line}));
  EXPECT_FALSE(log.has(line));
}

TEST_F(StoreReadsTest, OnlyReadsOfContentsPrint) {
  insert(reading());
  available();
  history(kDaily);
  dashboard();
  exported(kDaily);
  EXPECT_TRUE(platform.console.lines.empty());
}

// History of an attribute.

TEST_F(StoreReadsTest, DailyHistoryHoldsTheReadingsOfTheCurrentSubscription) {
  platform.strings.table = {{"dl_freq", "Downlink frequency"}};
  Metric first = reading("dl_freq", "MODULATION_QAM64", "2026-01-05 08:00:00");
  first.graphable = true;
  insert(first);
  insert(reading("dl_freq", "7", "2026-01-05 07:00:00"));
  insert(reading("dl_freq", "8", "2026-01-05 07:00:00", 1));
  insert(reading("ul_freq", "9", "2026-01-05 07:00:00"));
  const Read read = history(kDaily);
  expectSuccess(read);
  EXPECT_EQ(values(read.result), (Row{"QAM64", "7"}));
  const Metric& row = read.result.front();
  EXPECT_EQ(row.attributeName, "Downlink frequency");
  EXPECT_EQ(row.attributeNameNonLocalized, "dl_freq");
  EXPECT_EQ(row.metricTech, "LTE");
  EXPECT_EQ(row.metricName, "Serving Cell Info");
  EXPECT_EQ(row.attributeValueType, "INT");
  EXPECT_EQ(row.metricId, "803010");
  EXPECT_EQ(row.subsId, 0);
  EXPECT_FALSE(row.graphable);
  EXPECT_FALSE(row.isBookmarked);
  EXPECT_EQ(row.collectedOn, utcDate("2026-01-05 08:00:00"));
  HardwareManager::shared().setCurrentSubsId(1);
  EXPECT_EQ(values(history(kDaily).result), Row{"8"});
}

TEST_F(StoreReadsTest, DailyHistoryIsOfTheSubscriptionThatIsCurrentWhenItRunsAsMeant) {
  insert(reading("dl_freq", "7", "2026-01-05 07:00:00", 0));
  insert(reading("dl_freq", "8", "2026-01-05 07:00:00", 1));
  Read read;
  database->fetchAttributeHistory("Serving Cell Info", "dl_freq", kDaily, into(read));
  HardwareManager::shared().setCurrentSubsId(1);
  platform.time.settle();
  EXPECT_EQ(values(read.result), Row{"8"});
}

TEST_F(StoreReadsTest, WeeklyAndMonthlyHistoryAverageEachDayOverBothSubscriptionsAsMeant) {
  insert(reading("dl_freq", "5", "2026-01-03 08:00:00", 0));
  insert(reading("dl_freq", "6", "2026-01-03 23:59:59", 1));
  insert(reading("dl_freq", "10", "2026-01-04 00:00:00", 1));
  for (const AttributeDetailTimeFrame timeFrame : {kWeekly, kMonthly}) {
    const Read read = history(timeFrame);
    expectSuccess(read);
    EXPECT_EQ(values(read.result), (Row{"5.5", "10.0"}));
    EXPECT_EQ(times(read.result), (Row{"2026-01-03 00:00:00", "2026-01-04 00:00:00"}));
    EXPECT_FALSE(read.result.front().graphable);
  }
}

TEST_F(StoreReadsTest, AnAttributeOfTextsAveragesToZero) {
  insert(reading("rrc_state", "IDLE", "2026-01-03 08:00:00"));
  EXPECT_EQ(values(history(kWeekly, "rrc_state").result), Row{"0.0"});
  EXPECT_EQ(values(history(kMonthly, "rrc_state").result), Row{"0.0"});
}

TEST_F(StoreReadsTest, ANameWithASingleQuoteBreaksTheAveragesAndOneWithADoubleQuoteTheRest) {
  for (const AttributeDetailTimeFrame timeFrame : {kWeekly, kMonthly}) {
    EXPECT_EQ(history(timeFrame, "dl_freq", "a'b").error, prepareError("near \"b\": syntax error"));
    EXPECT_EQ(history(timeFrame, "dl_freq", "a\"b").error, std::nullopt);
  }
  EXPECT_EQ(history(kDaily, "dl_freq", "a'b").error, std::nullopt);
  EXPECT_EQ(history(kDaily, "dl_freq", "a\"b").error, prepareError("near \"b\": syntax error"));
  EXPECT_EQ(contents(std::nullopt, 0, "LTE", "a\"b").error, prepareError("near \"b\": syntax error"));
  EXPECT_EQ(contents("dl_freq", 0, "LTE", "a\"b").error, prepareError("near \"b\": syntax error"));
}

// The dashboard.

TEST_F(StoreReadsTest, TheDashboardIsSortedByRawNameAndMergesEqualNamesAsMeant) {
  const auto add = [&](const char* name, const char* attribute, std::int32_t subsId) {
    execute(SQLTable<Metric>::insertDashboardItem({"LTE", "803010", name, attribute, subsId}));
  };
  add("Serving Cell Info", "ul_freq", 0);
  add("Serving Cell Info", "rsrp", 0);
  add("Rach Attempt", "rsrp", 0);
  add("Serving Cell Info", "dl_freq", 1);
  const Pinned pinned = dashboard();
  expectSuccess(pinned);
  ASSERT_EQ(pinned.result.size(), 2U);
  EXPECT_EQ(pinned.result[0].attributeName, "rsrp");
  EXPECT_EQ(pinned.result[1].attributeName, "ul_freq");
  EXPECT_EQ(pinned.result[1].metricTech, "LTE");
  EXPECT_EQ(pinned.result[1].metricId, "803010");
  EXPECT_EQ(pinned.result[1].metricName, "Serving Cell Info");
  EXPECT_EQ(pinned.result[1].subsId, 0);
}

// Export.

TEST_F(StoreReadsTest, ExportHoldsBothSubscriptionsAndValuesAsStored) {
  platform.strings.table = {{"dl_freq", "Downlink frequency"}};
  Metric metric = reading("dl_freq", "SYS_MODE_LTE", "2026-01-05 08:00:00", 1);
  metric.graphable = true;
  insert(metric);
  insert(reading("dl_freq", "7", "2026-01-05 07:00:00", 0));
  for (const AttributeDetailTimeFrame timeFrame : {kDaily, kWeekly, kMonthly}) {
    const Read read = exported(timeFrame);
    expectSuccess(read);
    EXPECT_EQ(values(read.result), (Row{"SYS_MODE_LTE", "7"}));
    const Metric& row = read.result.front();
    EXPECT_EQ(row.metricTech, "LTE");
    EXPECT_EQ(row.metricName, "Serving Cell Info");
    EXPECT_EQ(row.attributeName, "Downlink frequency");
    EXPECT_EQ(row.attributeNameNonLocalized, "dl_freq");
    EXPECT_EQ(row.attributeValueType, "");
    EXPECT_EQ(row.metricId, "803010");
    EXPECT_EQ(row.subsId, 1);
    EXPECT_EQ(row.collectedOn, utcDate("2026-01-05 08:00:00"));
    EXPECT_FALSE(row.graphable);
    EXPECT_FALSE(row.isBookmarked);
    EXPECT_EQ(row.sectionNumber, std::nullopt);
    EXPECT_NE(row.id, read.result.back().id);
  }
}

// The prefix rule.

std::string cleaned(std::string value) {
  removeEnumeratorPrefix(value);
  return value;
}

TEST(EnumeratorPrefixTest, EachPrefixIsRemoved) {
  for (const char* prefix : {"kHVCellMonitorRadioAccessTechnology", "MODULATION_", "NR5G_MAC_QSH_METRIC_CONNECTION_",
                             "CONN_INFO_", "kHVCellMonitorCellType", "SDM_TRIGGER_CAUSE_", "RB_PATH_", "RACH_RESULT_ ",
                             "SYS_ROAM_STATUS_", "SYS_SRV_STATUS_", "SYS_SRV_DOMAIN_", "SYS_MODE_", "KLTE_RRC_STATE_",
                             "FLUSH_REASON_", "HEALTH_MONITOR_TYPE_DATA_"})
    EXPECT_EQ(cleaned(std::string(prefix) + "value"), "value") << prefix;
}

TEST(EnumeratorPrefixTest, TheRachResultNeedsItsBlankAsMeant) {
  EXPECT_EQ(cleaned("RACH_RESULT_SUCCESS"), "RACH_RESULT_SUCCESS");
}

TEST(EnumeratorPrefixTest, AllOccurrencesGoWhereverTheyStand) {
  EXPECT_EQ(cleaned("a SYS_MODE_LTE, SYS_MODE_GSM SYS_MODE_"), "a LTE, GSM ");
}

TEST(EnumeratorPrefixTest, OnlyTheFirstOfTheListThatOccursIsTried) {
  EXPECT_EQ(cleaned("SYS_MODE_LTE MODULATION_QAM16"), "SYS_MODE_LTE QAM16");
}

TEST(EnumeratorPrefixTest, WhatIsLeftIsNotSearchedAgain) {
  EXPECT_EQ(cleaned("SYS_SYS_MODE_MODE_LTE"), "SYS_MODE_LTE");
}

TEST(EnumeratorPrefixTest, OtherValuesStayAsTheyAre) {
  EXPECT_EQ(cleaned("5230"), "5230");
  EXPECT_EQ(cleaned(""), "");
  EXPECT_EQ(cleaned("sys_mode_lte"), "sys_mode_lte");
}

}  // namespace
}  // namespace quorl
