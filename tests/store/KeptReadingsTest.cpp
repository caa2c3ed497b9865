#include <algorithm>

#include "store/DatabaseFixture.h"
#include "store/KeptReadings.h"
#include "store/ReadingsDriver.h"

namespace quorl {
namespace {

using store_detail::KeptReadings;
using test::Row;
using test::values;

class KeptReadingsTest : public test::DatabaseFixture {
 protected:
  void SetUp() override { openWithTables(); }

  /// Two reads: the statement's, and the one after which the readings are kept.
  void warmUp() {
    contents();
    contents();
  }
  static std::string sqlOf(std::optional<std::string_view> attribute = std::nullopt) {
    return SQLTable<Metric>::metricContents("LTE", "Serving Cell Info", attribute, 0);
  }
  /// Whether `read` steps `sql`.
  template <typename Read>
  bool runs(const std::string& sql, const Read& read) {
    const test::StatementTrace trace(database->dbPointer());
    read();
    return std::count(trace.texts().begin(), trace.texts().end(), sql) > 0;
  }
  bool contentsRunTheirStatement() {
    return runs(sqlOf(), [&] { contents(); });
  }
};

TEST_F(KeptReadingsTest, TheFirstReadRunsItsStatementAndTheSecondReadsAllRowsForTheOthers) {
  insert(reading());
  EXPECT_TRUE(contentsRunTheirStatement());
  EXPECT_EQ(contentsRunTheirStatement(), !KeptReadings::areKept());
  EXPECT_EQ(runs(sqlOf("dl_freq"), [&] { contents("dl_freq"); }), !KeptReadings::areKept());
  EXPECT_EQ(runs(SQLTable<Metric>::availableMetrics(0), [&] { available(); }), !KeptReadings::areKept());
}

TEST_F(KeptReadingsTest, InsertsKeepTheReadingsCurrent) {
  insert(reading("dl_freq", "1", "2026-01-05 09:00:00"));
  warmUp();
  insert(reading("dl_freq", "2", "2026-01-05 09:00:01"));
  insert(reading("dl_freq", "3", "2026-01-05 08:00:00"));
  insert(reading("ul_freq", "4", "2026-01-05 09:00:02"));
  EXPECT_EQ(runs(sqlOf(), [&] { EXPECT_EQ(values(contents().result), (Row{"2", "4"})); }), !KeptReadings::areKept());
  EXPECT_EQ(values(contents("dl_freq").result), Row{"2"});
  EXPECT_EQ(available().result.at("LTE").front().collectedOn, utcDate("2026-01-05 09:00:02"));
}

TEST_F(KeptReadingsTest, OfTheRowsOfOneSecondTheFirstCountsBeforeAndAfter) {
  insert(reading("dl_freq", "1"));
  insert(reading("dl_freq", "2"));
  EXPECT_EQ(values(contents().result), Row{"1"});
  EXPECT_EQ(values(contents().result), Row{"1"});
  insert(reading("dl_freq", "3"));
  EXPECT_EQ(values(contents().result), Row{"1"});
  EXPECT_EQ(values(contents("dl_freq").result), Row{"1"});
}

TEST_F(KeptReadingsTest, AnAnswerFromMemoryPrintsTheLibrarysTextTooAsMeant) {
  insert(reading());
  warmUp();
  platform.console.lines.clear();
  contents();
  EXPECT_EQ(platform.console.lines, Row{"error occurred while fetching metric contents no more rows available"});
}

TEST_F(KeptReadingsTest, NamesZoneAndIdsAreThoseOfTheRead) {
  insert(reading("dl_freq", "1", "2026-01-05 09:00:00"));
  warmUp();
  const Uuid id = contents().result.front().id;
  platform.strings.table = {{"dl_freq", "Downlink frequency"}};
  inZone("Asia/Tokyo");
  const Metric row = contents().result.front();
  EXPECT_NE(row.id, id);
  EXPECT_EQ(row.attributeName, "Downlink frequency");
  EXPECT_EQ(row.collectedOn, utcDate("2026-01-05 00:00:00"));
}

TEST_F(KeptReadingsTest, PinsLeaveTheReadingsAsTheyAre) {
  insert(reading());
  warmUp();
  pin(reading());
  pin(reading("no such attribute"));
  unpin("LTE", "dl_freq", 0);
  unpin("LTE", "dl_freq", 0);
  EXPECT_EQ(contentsRunTheirStatement(), !KeptReadings::areKept());
}

TEST_F(KeptReadingsTest, AnInsertThatFailsMakesTheStatementRunAgain) {
  insert(reading());
  warmUp();
  Metric metric = reading();
  metric.collectedOn = Date(std::chrono::seconds(400000000000));  // beyond the year 9999
  EXPECT_FALSE(insert(metric).result);
  EXPECT_TRUE(contentsRunTheirStatement());
}

TEST_F(KeptReadingsTest, ARowOfAnotherConnectionMakesTheStatementRunAgain) {
  insert(reading("dl_freq", "1"));
  warmUp();
  test::RawDatabase(path()).run("UPDATE Metric SET attribute_value = '2'");
  EXPECT_TRUE(runs(sqlOf(), [&] { EXPECT_EQ(values(contents().result), Row{"2"}); }));
}

TEST_F(KeptReadingsTest, ARowOfAnotherConnectionBetweenTwoInsertsIsNotMissed) {
  insert(reading("dl_freq", "1", "2026-01-05 09:00:00"));
  warmUp();
  insert(reading("dl_freq", "2", "2026-01-05 09:00:01"));
  test::RawDatabase(path()).run("UPDATE Metric SET attribute_value = 'x'");
  insert(reading("ul_freq", "3", "2026-01-05 09:00:02"));
  EXPECT_TRUE(runs(sqlOf(), [&] { EXPECT_EQ(values(contents().result), (Row{"x", "3"})); }));
}

TEST_F(KeptReadingsTest, AnUntoldChangeOfItsOwnConnectionMakesTheStatementRunAgain) {
  insert(reading("dl_freq", "1"));
  warmUp();
  run("UPDATE Metric SET attribute_value = '2'");
  EXPECT_TRUE(runs(sqlOf(), [&] { EXPECT_EQ(values(contents().result), Row{"2"}); }));
}

TEST_F(KeptReadingsTest, AChangeThatMayYetBeRolledBackIsLeftToTheStatement) {
  insert(reading("dl_freq", "1", "2026-01-05 09:00:00"));
  warmUp();
  run("BEGIN");
  insert(reading("dl_freq", "2", "2026-01-05 09:00:01"));
  EXPECT_EQ(values(contents().result), Row{"2"});
  EXPECT_EQ(values(contents().result), Row{"2"});
  run("ROLLBACK");
  EXPECT_EQ(values(contents().result), Row{"1"});
  EXPECT_EQ(values(contents().result), Row{"1"});
}

TEST_F(KeptReadingsTest, RetentionMakesTheStatementRunAgain) {
  insert(reading("dl_freq", "1", "2025-11-01 00:00:00"));
  warmUp();
  EXPECT_TRUE(deleteOlderRows().result);
  EXPECT_TRUE(runs(sqlOf(), [&] { EXPECT_TRUE(contents().result.empty()); }));
}

TEST_F(KeptReadingsTest, AnyOtherStatementGivenAsOneOfTheDashboardMakesTheStatementRunAgain) {
  insert(reading("dl_freq", "1"));
  warmUp();
  EXPECT_TRUE(execute("UPDATE Metric SET attribute_value = '2'").result);
  EXPECT_TRUE(runs(sqlOf(), [&] { EXPECT_EQ(values(contents().result), Row{"2"}); }));
}

TEST_F(KeptReadingsTest, ATableThatHasGoneFailsToPrepareAsEver) {
  insert(reading());
  warmUp();
  run("DROP TABLE Metric");
  EXPECT_EQ(contents().error, test::prepareError("no such table: Metric"));
  EXPECT_EQ(available().error, test::prepareError("Prepare(message: \"no such table: Metric\")"));
}

TEST_F(KeptReadingsTest, ATriggerThatChangesWhatIsInsertedIsNotMissed) {
  run("CREATE TRIGGER foreign_trigger AFTER INSERT ON Metric BEGIN "
      "UPDATE Metric SET attribute_value = 'changed' WHERE Id == NEW.Id; END");
  insert(reading("dl_freq", "1", "2026-01-05 09:00:00"));
  warmUp();
  insert(reading("dl_freq", "2", "2026-01-05 09:00:01"));
  EXPECT_EQ(values(contents().result), Row{"changed"});
}

TEST_F(KeptReadingsTest, ATableWithAnIndexIsLeftToTheStatements) {
  run("CREATE INDEX foreign_index ON Metric(attribute_name)");
  insert(reading());
  warmUp();
  EXPECT_TRUE(contentsRunTheirStatement());
  run("DROP INDEX foreign_index");
  warmUp();
  EXPECT_EQ(contentsRunTheirStatement(), !KeptReadings::areKept());
}

TEST_F(KeptReadingsTest, ARowThatThisProgramDoesNotWriteLeavesTheTableToTheStatements) {
  for (const char* oddity : {"attribute_value = NULL", "collected_on = 7", "metric_tech = x'4C5445'",
                             "attribute_name = 'a' || char(0) || 'b'", "subs_id = 4294967296"}) {
    run("DELETE FROM Metric");
    insert(reading("ul_freq"));
    run(std::string("UPDATE Metric SET ") + oddity);
    insert(reading("dl_freq", "1"));
    warmUp();
    EXPECT_TRUE(contentsRunTheirStatement()) << oddity;
  }
}

TEST_F(KeptReadingsTest, AValueThatMeansAColumnInDoubleQuotesIsLeftToTheStatementAsMeant) {
  insert(reading("subs_id", "1"));
  insert(reading("0", "2"));
  warmUp();
  // "subs_id" is the column, whose 0 is compared with the attribute's name.
  EXPECT_EQ(values(contents("subs_id").result), Row{"2"});
  EXPECT_EQ(values(contents("SUBS_ID").result), Row{"2"});
}

TEST_F(KeptReadingsTest, TextsThatDoNotStandForThemselvesInDoubleQuotes) {
  EXPECT_TRUE(KeptReadings::areTakenAsTexts({"LTE", "Serving Cell Info", "", "it's", "metric_names"}));
  for (const char* column :
       {"id", "Metric_Tech", "metric_name", "attribute_name", "attribute_value", "attribute_value_type",
        "is_attribute_graphable", "metric_id", "subs_id", "COLLECTED_ON", "rowid", "oid", "_rowid_"})
    EXPECT_FALSE(KeptReadings::areTakenAsTexts({"LTE", column})) << column;
  EXPECT_FALSE(KeptReadings::areTakenAsTexts({"a\"b"}));
  EXPECT_FALSE(KeptReadings::areTakenAsTexts({std::string_view("a\0b", 3)}));
}

TEST_F(KeptReadingsTest, OnAConnectionThatStaysOutOfWalModeAnswersAreTheSame) {
  run("PRAGMA journal_mode=DELETE");
  insert(reading("dl_freq", "1", "2026-01-05 09:00:00"));
  warmUp();
  insert(reading("dl_freq", "2", "2026-01-05 09:00:01"));
  EXPECT_EQ(runs(sqlOf(), [&] { EXPECT_EQ(values(contents().result), Row{"2"}); }), !KeptReadings::areKept());
  test::RawDatabase(path()).run("DELETE FROM Metric WHERE attribute_value == '2'");
  EXPECT_EQ(values(contents().result), Row{"1"});
}

class ReadingsAtRandomTest : public test::DatabaseFixture, public testing::WithParamInterface<unsigned> {};

INSTANTIATE_TEST_SUITE_P(Seeds, ReadingsAtRandomTest, testing::Range(1U, 7U));

TEST_P(ReadingsAtRandomTest, EachAnswerIsTheStatements) {
  openWithTables();
  run("PRAGMA synchronous=OFF");
  test::ReadingsDriver driver(GetParam(), platform, database, path());
  for (int i = 0; i < 1000 && driver.difference().empty(); ++i) driver.step();
  EXPECT_EQ(driver.difference(), "");
  EXPECT_GT(driver.reads(), 300U);
  if (KeptReadings::areKept()) {
    EXPECT_GT(driver.readsFromMemory(), 50U);
  } else {
    EXPECT_EQ(driver.readsFromMemory(), 0U);
  }
}

}  // namespace
}  // namespace quorl
