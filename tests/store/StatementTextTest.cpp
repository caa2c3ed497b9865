#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "store/DatabaseFixture.h"

// The texts are the contract with what is stored, blanks and line breaks included. They are written out here whole and
// compared with what the library was given.

namespace quorl {
namespace {

using test::Row;

constexpr char kCreateMetric[] =
    "  CREATE TABLE IF NOT EXISTS Metric(\n      Id INTEGER PRIMARY KEY AUTOINCREMENT,\n      metric_tech CHAR(255),\n "
    "     metric_name CHAR(255) NOT NULL,\n      attribute_name CHAR(255),\n      attribute_value TEXT,\n      "
    "attribute_value_type TEXT,\n      is_attribute_graphable INTEGER,\n      metric_id CHAR(255) NOT NULL,\n      "
    "subs_id INTEGER NOT NULL,\n      collected_on DATETIME NOT NULL\n    );";

constexpr char kCreateDashboard[] =
    "  CREATE TABLE IF NOT EXISTS Dashboard(\n\"metric_tech\"    CHAR(255),\n    \"metric_id\"    CHAR(255) NOT "
    "NULL,\n    \"metric_name\"    CHAR(255) NOT NULL,\n    \"attribute_name\"    CHAR(255) NOT NULL,\n    \"subs_id\" "
    "   INTEGER NOT NULL,\n    \"metric_table_id\"    INTEGER NOT NULL UNIQUE,\n    PRIMARY KEY(\"metric_table_id\" "
    "AUTOINCREMENT),\n    CONSTRAINT \"fk_metric_table_id\" FOREIGN KEY(\"metric_table_id\") REFERENCES "
    "\"Metric\"(\"Id\") ON DELETE CASCADE);";

class StatementTextTest : public test::DatabaseFixture {
 protected:
  void SetUp() override {
    openWithTables();
    trace.emplace(database->dbPointer());
  }
  void TearDown() override { trace.reset(); }

  void expectOnly(const std::string& text) { EXPECT_EQ(trace->texts(), Row{text}); }

  std::optional<test::StatementTrace> trace;
};

TEST_F(StatementTextTest, CreationOfBothTables) {
  EXPECT_STREQ(SQLTable<Metric>::createMetricTable, kCreateMetric);
  EXPECT_STREQ(SQLTable<Metric>::createDashboardTable, kCreateDashboard);
}

TEST_F(StatementTextTest, MetricInsert) {
  insert(reading());
  expectOnly(
      "INSERT INTO Metric (metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
      "is_attribute_graphable, metric_id, subs_id, collected_on) VALUES (?, ?, ?, ?, ?, ?, ?, ?, datetime(?));");
}

TEST_F(StatementTextTest, RetentionRun) {
  deleteOlderRows();
  expectOnly("   DELETE FROM Metric WHERE collected_on <= datetime('now', '-30 days');");
}

TEST_F(StatementTextTest, DefaultDashboardRow) {
  EXPECT_EQ(SQLTable<Metric>::insertDashboardItem({"5G", "806913", "Nr Ota Msg", "deployment", 1}),
            "INSERT OR REPLACE INTO Dashboard (metric_tech, metric_id, metric_name, attribute_name, subs_id) VALUES "
            "(\"5G\", \"806913\", \"Nr Ota Msg\", \"deployment\", 1);");
}

TEST_F(StatementTextTest, PinKeepsItsTwoBlanksBeforeAnd) {
  EXPECT_EQ(SQLTable<Metric>::pinAttribute("LTE", "dl_freq", 1),
            "INSERT OR REPLACE INTO Dashboard (metric_tech, metric_id, metric_name, attribute_name, subs_id) SELECT "
            "metric_tech, metric_id, metric_name, attribute_name, subs_id FROM Metric where metric_tech == \"LTE\" AND "
            "attribute_name == \"dl_freq\"  AND subs_id == 1 ORDER by collected_on DESC LIMIT 1;");
}

TEST_F(StatementTextTest, UnpinHasNoClosingSemicolon) {
  unpin("LTE", "dl_freq", 1);
  expectOnly("DELETE from Dashboard WHERE metric_tech == \"LTE\" AND attribute_name == \"dl_freq\" AND subs_id == 1");
}

TEST_F(StatementTextTest, AvailableMetricsTakeTheSubscriptionAsText) {
  available(1);
  expectOnly(
      "SELECT *\nFROM (\n    SELECT  metric_tech, metric_name, collected_on, subs_id\n    FROM Metric WHERE subs_id == "
      "\"1\"\n    ORDER BY collected_on DESC\n) AS sub\nGROUP BY metric_name");
}

TEST_F(StatementTextTest, ContentsOfOneAttribute) {
  contents("dl_freq", 1);
  expectOnly(
      "SELECT * from Metric where metric_tech == \"LTE\" AND metric_name == \"Serving Cell Info\" AND attribute_name "
      "== \"dl_freq\" AND subs_id == \"1\" ORDER BY collected_on DESC LIMIT 1");
}

TEST_F(StatementTextTest, ContentsOfAllAttributes) {
  contents(std::nullopt, 1);
  expectOnly(
      "    SELECT *\n    FROM (\n    SELECT *\n    FROM Metric WHERE metric_tech == \"LTE\" AND metric_name == "
      "\"Serving Cell Info\" AND subs_id == \"1\"\n    ORDER BY collected_on DESC\n    ) AS sub\n    GROUP BY "
      "attribute_name");
}

TEST_F(StatementTextTest, DailyHistoryTakesTheSubscriptionThatIsCurrentWhenItRuns) {
  test::Read outcome;
  database->fetchAttributeHistory("Serving Cell Info", "dl_freq", AttributeDetailTimeFrame::daily, into(outcome));
  HardwareManager::shared().setCurrentSubsId(1);
  platform.time.settle();
  expectOnly(
      "        SELECT metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, metric_id, "
      "subs_id, collected_on from Metric WHERE metric_name ==\"Serving Cell Info\" AND attribute_name ==\"dl_freq\" "
      "AND subs_id == 1 AND collected_on >= datetime('now', 'localtime', 'start of day')");
}

TEST_F(StatementTextTest, WeeklyHistory) {
  history(AttributeDetailTimeFrame::weekly);
  expectOnly(
      "select max(metric_tech) as 'metric_tech', max(metric_name) as 'metric_name',  max(attribute_name) as "
      "'attribute_name', avg(attribute_value) as 'attribute_value', attribute_value_type,  metric_id,  subs_id, "
      "strftime('%Y-%m-%d',collected_on) as 'collected_on' FROM Metric WHERE metric_name='Serving Cell Info' AND "
      "attribute_name ='dl_freq' AND collected_on >= datetime('now', '-7 days') group by strftime('%Y-%m-%d', "
      "collected_on);");
}

TEST_F(StatementTextTest, MonthlyHistoryBeginsWithTwoBlanks) {
  history(AttributeDetailTimeFrame::monthly);
  expectOnly(
      "  select max(metric_tech) as 'metric_tech', max(metric_name) as 'metric_name',  max(attribute_name) as "
      "'attribute_name', avg(attribute_value) as 'attribute_value', attribute_value_type,  metric_id,  subs_id, "
      "strftime('%Y-%m-%d',collected_on) as 'collected_on' FROM Metric WHERE metric_name='Serving Cell Info' AND "
      "attribute_name ='dl_freq' AND collected_on >= datetime('now', '-30 days') group by strftime('%Y-%m-%d', "
      "collected_on);");
}

TEST_F(StatementTextTest, Dashboard) {
  dashboard(1);
  expectOnly("SELECT * FROM Dashboard WHERE subs_id == 1 GROUP BY attribute_name");
}

TEST_F(StatementTextTest, Exports) {
  exported(AttributeDetailTimeFrame::daily);
  exported(AttributeDetailTimeFrame::weekly);
  exported(AttributeDetailTimeFrame::monthly);
  EXPECT_EQ(trace->texts(),
            (Row{"SELECT metric_tech, metric_name, attribute_name, attribute_value, subs_id, metric_id,collected_on "
                 "from Metric WHERE collected_on >= datetime('now', 'localtime', 'start of day')",
                 "SELECT metric_tech, metric_name, attribute_name, attribute_value, subs_id, metric_id,collected_on "
                 "from Metric WHERE collected_on >= datetime('now', 'start of day', '-7 days')",
                 "SELECT metric_tech, metric_name, attribute_name, attribute_value, subs_id, metric_id,collected_on "
                 "from Metric WHERE collected_on >= datetime('now', 'start of day', '-30 days')"}));
}

TEST_F(StatementTextTest, OneStatementForEachInsertAndNoTransactionAroundThem) {
  test::Written first;
  test::Written second;
  database->insertMetric(reading("dl_freq"), into(first));
  database->insertMetric(reading("ul_freq"), into(second));
  platform.time.settle();
  EXPECT_EQ(trace->texts(), (Row{SQLTable<Metric>::insertMetric, SQLTable<Metric>::insertMetric}));
}

}  // namespace
}  // namespace quorl
