#include <filesystem>

#include <sys/stat.h>

#include "store/DatabaseFixture.h"

namespace quorl {
namespace {

using test::Place;
using test::prepareError;
using test::Row;
using test::values;
using test::Written;

constexpr char kLabelStart[] = "com.ardent.dbmanager.queue -";

class SQLiteDatabaseTest : public test::DatabaseFixture {
 protected:
  /// Another program that writes: whoever wants to write meanwhile finds the database locked.
  void lockByAnother() {
    other.emplace(path());
    other->run("BEGIN IMMEDIATE");
  }
  static unsigned permissions(const std::string& file) {
    struct stat status {};
    EXPECT_EQ(stat(file.c_str(), &status), 0) << file;
    return status.st_mode & 0777U;
  }
  static bool exists(const std::string& file) { return std::filesystem::exists(file); }

  std::optional<test::RawDatabase> other;
};

TEST_F(SQLiteDatabaseTest, AMissingDirectoryFailsToOpenWithTheLibrarysText) {
  const auto opened = SQLiteDatabase::open((platform.directory.path() / "missing" / "file.sqlite").string());
  ASSERT_FALSE(opened.has_value());
  EXPECT_EQ(opened.error(), (SQLiteError{SQLiteError::Case::OpenDatabase, "unable to open database file"}));
}

TEST_F(SQLiteDatabaseTest, TheQueuesLabelEndsInAUuidRightAfterTheText) {
  open();
  const std::string& label = database->queue().label();
  EXPECT_EQ(label.rfind(kLabelStart, 0), 0U);
  EXPECT_EQ(label.size(), sizeof kLabelStart - 1 + 36);
}

TEST_F(SQLiteDatabaseTest, OnePathOpenedTwiceGivesTwoQueuesOfDifferentLabels) {
  open();
  const auto second = SQLiteDatabase::open(path());
  ASSERT_TRUE(second.has_value());
  EXPECT_NE(&database->queue(), &(*second)->queue());
  EXPECT_NE(database->queue().label(), (*second)->queue().label());
}

TEST_F(SQLiteDatabaseTest, OpensInWalModeAndIssuesNoOtherPragma) {
  static std::vector<std::string> statements;
  statements.clear();
  const auto traceNewConnection = +[](sqlite3* connection, char** /*error*/, const void* /*api*/) {
    return sqlite3_trace_v2(connection, SQLITE_TRACE_STMT, &test::StatementTrace::record, &statements);
  };
  sqlite3_auto_extension(reinterpret_cast<void (*)()>(traceNewConnection));
  open();
  sqlite3_reset_auto_extension();
  EXPECT_EQ(statements, Row{"PRAGMA journal_mode=WAL;"});
  EXPECT_EQ(run("PRAGMA journal_mode"), std::vector<Row>{{"wal"}});
}

TEST_F(SQLiteDatabaseTest, ForeignKeysStayOff) {
  open();
  EXPECT_EQ(run("PRAGMA foreign_keys"), std::vector<Row>{{"0"}});
}

TEST_F(SQLiteDatabaseTest, TextsInDoubleQuotesAreAccepted) {
  open();
  EXPECT_EQ(run("SELECT \"no column\""), std::vector<Row>{{"no column"}});
}

TEST_F(SQLiteDatabaseTest, AConnectionThatStaysOutOfWalModeIsNotReportedAndWorks) {
  other.emplace(path());
  other->run("CREATE TABLE held(x)");
  other->run("BEGIN EXCLUSIVE");
  open();
  other.reset();
  EXPECT_TRUE(log.lines().empty());
  EXPECT_EQ(run("PRAGMA journal_mode"), std::vector<Row>{{"delete"}});
  run(SQLTable<Metric>::createMetricTable);
  EXPECT_TRUE(insert(reading()).result);
}

TEST_F(SQLiteDatabaseTest, OnlyTheOwnerReadsTheFileAndItsJournal) {
  openWithTables();
  EXPECT_EQ(permissions(path()), 0600U);
  EXPECT_EQ(permissions(path() + "-wal"), 0600U);
}

TEST_F(SQLiteDatabaseTest, ClosingEndsTheStatementsThatExportsHaveLeft) {
  openWithTables();
  insert(reading());
  EXPECT_EQ(exported(AttributeDetailTimeFrame::daily).result.size(), 1U);
  EXPECT_EQ(openStatements(), 1);
  ASSERT_TRUE(exists(path() + "-wal"));
  database.reset();
  EXPECT_FALSE(exists(path() + "-wal"));  // taken back by the last connection that really closes
}

TEST_F(SQLiteDatabaseTest, OnlyExportsLeaveAStatement) {
  openWithTables();
  const Metric metric = reading();
  insert(metric);
  pin(metric);
  available();
  contents();
  contents("dl_freq");
  history(AttributeDetailTimeFrame::daily);
  history(AttributeDetailTimeFrame::weekly);
  dashboard();
  unpin("LTE", "dl_freq", 0);
  deleteOlderRows();
  EXPECT_EQ(openStatements(), 0);
}

TEST_F(SQLiteDatabaseTest, PrepareAnswersTheLibrarysText) {
  open();
  const auto statement = database->prepareStatement("SELEC 1");
  ASSERT_FALSE(statement.has_value());
  EXPECT_EQ(statement.error(), prepareError("near \"SELEC\": syntax error"));
}

TEST_F(SQLiteDatabaseTest, NothingRunsInsideTheCall) {
  openWithTables();
  Written outcome;
  database->insertMetric(reading(), into(outcome));
  EXPECT_TRUE(run("SELECT * FROM Metric").empty());
  EXPECT_EQ(outcome.calls, 0);
}

TEST_F(SQLiteDatabaseTest, AReadSeesTheInsertsThatWereCalledBeforeIt) {
  openWithTables();
  Written written;
  test::Read read;
  database->insertMetric(reading(), into(written));
  database->fetchMetricContents("LTE", "Serving Cell Info", std::nullopt, 0, into(read));
  platform.time.settle();
  EXPECT_EQ(values(read.result), Row{"5230"});
}

// Creation of a table: everything on the database's queue, all lines of error level.

TEST_F(SQLiteDatabaseTest, ACreatedTableIsReportedOnTheDatabasesQueueAndLoggedAsError) {
  open();
  const Written outcome = createTable(SQLTable<Metric>::createMetricTable, "MetricV20");
  EXPECT_TRUE(outcome.result);
  EXPECT_EQ(outcome.error, std::nullopt);
  EXPECT_EQ(outcome.place, Place::database);
  EXPECT_EQ(log.lines(), (std::vector<test::LogLine>{{"database", LogLevel::Error, "MetricV20 table created."}}));
}

TEST_F(SQLiteDatabaseTest, ATableThatDoesNotPrepareIsReportedOnTheDatabasesQueue) {
  open();
  const Written outcome = createTable("CREATE TABEL x", "x");
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.error, prepareError("near \"TABEL\": syntax error"));
  EXPECT_EQ(outcome.place, Place::database);
  EXPECT_EQ(log.lines(),
            (std::vector<test::LogLine>{{"database", LogLevel::Error,
                                         "Prepare(message: \"near \\\"TABEL\\\": syntax error\") error ocurred while "
                                         "creating a table"}}));
}

TEST_F(SQLiteDatabaseTest, ATableWhoseStepFailsIsReportedAsPrepareOnTheDatabasesQueue) {
  open();
  lockByAnother();
  const Written outcome = createTable(SQLTable<Metric>::createMetricTable, "MetricV20");
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.error, prepareError("database is locked"));
  EXPECT_EQ(outcome.place, Place::database);
  EXPECT_EQ(
      log.lines(),
      (std::vector<test::LogLine>{{"database", LogLevel::Error,
                                   "Prepare(message: \"database is locked\") error ocurred while creating a table "
                                   "(sqlite3_step)"}}));
}

// Insert: everything on the main queue.

TEST_F(SQLiteDatabaseTest, AnInsertedRowHoldsTheRawKeyAndTheLocalWallClock) {
  inZone("Asia/Tokyo");
  openWithTables();
  Metric metric = reading("dl_freq", "5230");
  metric.attributeNameNonLocalized = "not this one";
  metric.graphable = true;
  metric.subsId = 1;
  metric.collectedOn = utcDate("2026-01-05 09:30:12");
  const Written outcome = insert(metric);
  EXPECT_TRUE(outcome.result);
  EXPECT_EQ(outcome.error, std::nullopt);
  EXPECT_EQ(outcome.place, Place::main);
  EXPECT_EQ(run("SELECT * FROM Metric"), (std::vector<Row>{{"1", "LTE", "Serving Cell Info", "dl_freq", "5230", "INT",
                                                            "1", "803010", "1", "2026-01-05 18:30:12"}}));
}

TEST_F(SQLiteDatabaseTest, ValuesOfAnInsertMayHoldQuotes) {
  openWithTables();
  EXPECT_TRUE(insert(reading("dl_freq", "it's \"quoted\"")).result);
  EXPECT_EQ(values(contents().result), Row{"it's \"quoted\""});
}

TEST_F(SQLiteDatabaseTest, TheInsertIsLoggedAfterItsCompletion) {
  openWithTables();
  bool loggedBefore = true;
  database->insertMetric(reading(), [&](bool /*success*/, const std::optional<SQLiteError>& /*error*/) {
    loggedBefore = log.has("successfully inserted metric to db");
  });
  platform.time.settle();
  EXPECT_FALSE(loggedBefore);
  EXPECT_EQ(log.lines(),
            (std::vector<test::LogLine>{{"database", LogLevel::Default, "successfully inserted metric to db"}}));
}

TEST_F(SQLiteDatabaseTest, AnInsertThatDoesNotPrepareFailsOnTheMainQueue) {
  open();
  const Written outcome = insert(reading());
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.error, prepareError("no such table: Metric"));
  EXPECT_EQ(outcome.place, Place::main);
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(SQLiteDatabaseTest, AnInsertWhoseStepFailsReportsPrepareOnTheMainQueue) {
  openWithTables();
  lockByAnother();
  const Written outcome = insert(reading());
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.error, prepareError("database is locked"));
  EXPECT_EQ(outcome.place, Place::main);
}

TEST_F(SQLiteDatabaseTest, ATimeThatSqliteDoesNotTakeFailsTheStep) {
  openWithTables();
  Metric metric = reading();
  metric.collectedOn = Date(std::chrono::seconds(400000000000));  // beyond the year 9999
  EXPECT_EQ(insert(metric).error, prepareError("NOT NULL constraint failed: Metric.collected_on"));
}

TEST_F(SQLiteDatabaseTest, AFailedBindOfTheFirstParameterReportsPrepareThoseOfTheOthersBind) {
  openWithTables();
  sqlite3_limit(database->dbPointer(), SQLITE_LIMIT_LENGTH, 200);
  const std::string tooLong(201, 'x');
  struct Case {
    std::string Metric::*field;
    SQLiteError::Case kind;
  };
  for (const Case& c :
       {Case{&Metric::metricTech, SQLiteError::Case::Prepare}, Case{&Metric::metricName, SQLiteError::Case::Bind},
        Case{&Metric::attributeName, SQLiteError::Case::Bind}, Case{&Metric::attributeValue, SQLiteError::Case::Bind},
        Case{&Metric::attributeValueType, SQLiteError::Case::Bind}, Case{&Metric::metricId, SQLiteError::Case::Bind}}) {
    Metric metric = reading();
    metric.*c.field = tooLong;
    const Written outcome = insert(metric);
    EXPECT_FALSE(outcome.result);
    EXPECT_EQ(outcome.error, (SQLiteError{c.kind, "string or blob too big"}));
    EXPECT_EQ(outcome.place, Place::main);
  }
  EXPECT_TRUE(run("SELECT Id FROM Metric").empty());
}

TEST_F(SQLiteDatabaseTest, AFailedInsertIsNotRetriedAndTheNextOneGoesOn) {
  openWithTables();
  lockByAnother();
  EXPECT_FALSE(insert(reading("dl_freq")).result);
  other.reset();
  EXPECT_TRUE(insert(reading("ul_freq")).result);
  EXPECT_EQ(run("SELECT attribute_name FROM Metric"), std::vector<Row>{{"ul_freq"}});
}

// Retention: everything on the main queue.

TEST_F(SQLiteDatabaseTest, RetentionOnAnEmptyTableSucceeds) {
  openWithTables();
  const Written outcome = deleteOlderRows();
  EXPECT_TRUE(outcome.result);
  EXPECT_EQ(outcome.place, Place::main);
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(SQLiteDatabaseTest, RetentionThatDoesNotPrepareFailsOnTheMainQueue) {
  open();
  const Written outcome = deleteOlderRows();
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.place, Place::main);
  EXPECT_EQ(
      log.lines(),
      (std::vector<test::LogLine>{{"database", LogLevel::Error,
                                   "Prepare(message: \"no such table: Metric\") error ocurred while deleting old rows "
                                   "(sqlite3_step)"}}));
}

TEST_F(SQLiteDatabaseTest, RetentionWhoseStepFailsLogsTheLibrarysTextAndSpeaksOfATableAsMeant) {
  openWithTables();
  lockByAnother();
  const Written outcome = deleteOlderRows();
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.place, Place::main);
  EXPECT_EQ(log.lines(),
            (std::vector<test::LogLine>{{"database", LogLevel::Error,
                                         "database is locked error ocurred while creating a table (sqlite3_step)"}}));
}

TEST_F(SQLiteDatabaseTest, RetentionIgnoresTheDashboard) {
  openWithTables();
  const Metric old = reading("dl_freq", "5230", "2025-11-01 00:00:00");
  insert(old);
  pin(old);
  deleteOlderRows();
  EXPECT_TRUE(run("SELECT * FROM Metric").empty());
  EXPECT_EQ(dashboard().result.size(), 1U);
}

// Statements on the dashboard: main queue, but a failed step on the database's.

TEST_F(SQLiteDatabaseTest, ADashboardStatementSucceedsOnTheMainQueue) {
  openWithTables();
  insert(reading());
  log.clear();
  const Written outcome = pin(reading());
  EXPECT_TRUE(outcome.result);
  EXPECT_EQ(outcome.error, std::nullopt);
  EXPECT_EQ(outcome.place, Place::main);
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(SQLiteDatabaseTest, ADashboardStatementThatDoesNotPrepareFailsOnTheMainQueue) {
  openWithTables();
  const Written outcome = execute("INSERT OR REPLACE INTO Dashbord VALUES (1);");
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.error, prepareError("no such table: Dashbord"));
  EXPECT_EQ(outcome.place, Place::main);
}

TEST_F(SQLiteDatabaseTest, ADashboardStatementWhoseStepFailsReportsPrepareOnTheDatabasesQueueAsMeant) {
  openWithTables();
  const Written outcome = execute("INSERT INTO Dashboard (metric_tech) VALUES (\"LTE\");");
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.error, prepareError("NOT NULL constraint failed: Dashboard.metric_id"));
  EXPECT_EQ(outcome.place, Place::database);
}

TEST_F(SQLiteDatabaseTest, AValueWithADoubleQuoteBreaksTheTextThatItIsSplicedInto) {
  openWithTables();
  const std::string text = SQLTable<Metric>::insertDashboardItem({"LTE", "1", "a\"b", "dl_freq", 0});
  EXPECT_EQ(execute(text).error, prepareError("near \"b\": syntax error"));
  EXPECT_EQ(unpin("LTE", "a\"b", 0).error, prepareError("near \"b\": syntax error"));
}

TEST_F(SQLiteDatabaseTest, AnUnpinIsLoggedBeforeItsCompletionOnTheMainQueue) {
  openWithTables();
  insert(reading());
  pin(reading());
  log.clear();
  bool loggedBefore = false;
  Place where = Place::none;
  database->removeDashboardItem("LTE", "dl_freq", 0, [&](bool success, const std::optional<SQLiteError>& error) {
    EXPECT_TRUE(success);
    EXPECT_EQ(error, std::nullopt);
    loggedBefore = log.has({"database", LogLevel::Default, "Successfully deleted from dashboard table"});
    where = place();
  });
  platform.time.settle();
  EXPECT_TRUE(loggedBefore);
  EXPECT_EQ(where, Place::main);
  EXPECT_TRUE(dashboard().result.empty());
}

TEST_F(SQLiteDatabaseTest, AnUnpinThatDoesNotPrepareFailsOnTheMainQueue) {
  open();
  const Written outcome = unpin("LTE", "dl_freq", 0);
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.error, prepareError("no such table: Dashboard"));
  EXPECT_EQ(outcome.place, Place::main);
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(SQLiteDatabaseTest, AnUnpinWhoseStepFailsReportsPrepareOnTheDatabasesQueueAsMeant) {
  openWithTables();
  lockByAnother();
  const Written outcome = unpin("LTE", "dl_freq", 0);
  EXPECT_FALSE(outcome.result);
  EXPECT_EQ(outcome.error, prepareError("database is locked"));
  EXPECT_EQ(outcome.place, Place::database);
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(SQLiteDatabaseTest, PinningWhatHasNoRowSucceedsWithoutARow) {
  openWithTables();
  insert(reading("dl_freq", "5230", "2026-01-05 09:00:00", /*subsId=*/0));
  EXPECT_TRUE(pin(reading("dl_freq", "5230", "2026-01-05 09:00:00", /*subsId=*/1)).result);
  EXPECT_TRUE(run("SELECT * FROM Dashboard").empty());
}

TEST_F(SQLiteDatabaseTest, PinningTwiceMakesTwoRowsThatTheReadCollapsesAndOneUnpinDeletes) {
  openWithTables();
  insert(reading());
  pin(reading());
  pin(reading());
  EXPECT_EQ(run("SELECT * FROM Dashboard"),
            (std::vector<Row>{{"LTE", "803010", "Serving Cell Info", "dl_freq", "0", "1"},
                              {"LTE", "803010", "Serving Cell Info", "dl_freq", "0", "2"}}));
  EXPECT_EQ(dashboard().result.size(), 1U);
  unpin("LTE", "dl_freq", 0);
  EXPECT_TRUE(run("SELECT * FROM Dashboard").empty());
}

TEST_F(SQLiteDatabaseTest, UnpinningLeavesTheOtherSubscription) {
  openWithTables();
  execute(SQLTable<Metric>::insertDashboardItem({"LTE", "1", "Serving Cell Info", "dl_freq", 0}));
  execute(SQLTable<Metric>::insertDashboardItem({"LTE", "1", "Serving Cell Info", "dl_freq", 1}));
  unpin("LTE", "dl_freq", 0);
  EXPECT_TRUE(dashboard(0).result.empty());
  EXPECT_EQ(dashboard(1).result.size(), 1U);
}

// The database gone before its work.

using SQLiteDatabaseDeathTest = SQLiteDatabaseTest;

TEST_F(SQLiteDatabaseDeathTest, AReadThatFindsTheDatabaseGoneEndsTheProcess) {
  open();
  const auto queue = platform.time.queues().back();
  database->fetchDashboard(0, [](const auto& /*items*/, const auto& /*error*/) {});
  database.reset();
  EXPECT_DEATH(queue->step(), "self is nil");
}

TEST_F(SQLiteDatabaseTest, AWriteThatFindsTheDatabaseGoneDoesNothing) {
  openWithTables();
  const auto queue = platform.time.queues().back();
  Written outcome;
  database->insertMetric(reading(), into(outcome));
  database.reset();
  EXPECT_TRUE(queue->step());
  platform.time.settle();
  EXPECT_EQ(outcome.calls, 0);
}

TEST(SQLiteErrorTest, DescriptionsNameTheCaseAndQuoteTheMessage) {
  EXPECT_EQ(logText(SQLiteError{SQLiteError::Case::OpenDatabase, "a"}), "OpenDatabase(message: \"a\")");
  EXPECT_EQ(logText(SQLiteError{SQLiteError::Case::Prepare, "near \"x\": b\\c"}),
            "Prepare(message: \"near \\\"x\\\": b\\\\c\")");
  EXPECT_EQ(logText(SQLiteError{SQLiteError::Case::Step, "a\n\t\r"}), "Step(message: \"a\\n\\t\\r\")");
  EXPECT_EQ(logText(SQLiteError{SQLiteError::Case::Bind, ""}), "Bind(message: \"\")");
  EXPECT_EQ(logText(SQLiteError{SQLiteError::Case::EmptyQueryResult, ""}), "EmptyQueryResult");
}

TEST(SQLiteErrorTest, AnOptionalErrorSaysSo) {
  EXPECT_EQ(logText(std::optional(prepareError("a"))), "Optional(Prepare(message: \"a\"))");
  EXPECT_EQ(logText(std::optional<SQLiteError>()), "nil");
}

}  // namespace
}  // namespace quorl
