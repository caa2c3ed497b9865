#include "store/DBManager.h"

#include <filesystem>
#include <utility>

#include <sqlite3.h>
#include <sys/stat.h>

#include "base/DateText.h"
#include "base/Uuid.h"
#include "shell/Logs.h"
#include "store/KeptReadings.h"
#include "store/MetricBinding.h"
#include "store/MetricStatements.h"
#include "store/WorkItems.h"

namespace quorl {

using store_detail::enqueueInsert;
using store_detail::enqueueWrite;
using store_detail::failOnMain;
using store_detail::onMain;
using store_detail::succeedOnMain;

namespace {

constexpr char kFileName[] = "metricPartV11.sqlite";

std::string messageOf(sqlite3* database) {
  const char* text = sqlite3_errmsg(database);
  return text != nullptr ? text : "No error message provided from sqlite.";
}

}  // namespace

std::optional<std::string> databasePath() {
  const std::optional<std::filesystem::path> directory = Platform::current().documents.path();
  if (!directory) return std::nullopt;
  return (*directory / kFileName).string();
}

tl::expected<std::shared_ptr<SQLiteDatabase>, SQLiteError> SQLiteDatabase::open(const std::string& path) {
  sqlite3* database = nullptr;
  const int flags = SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_FULLMUTEX;
  if (sqlite3_open_v2(path.c_str(), &database, flags, nullptr) != SQLITE_OK) {
    std::string message = messageOf(database);
    if (database != nullptr) sqlite3_close(database);
    return tl::unexpected(SQLiteError{SQLiteError::Case::OpenDatabase, std::move(message)});
  }
  // Rows hold cell identities. The journal files, made later, take over the mode.
  ::chmod(path.c_str(), S_IRUSR | S_IWUSR);
  // The reads write texts in double quotes.
  sqlite3_db_config(database, SQLITE_DBCONFIG_DQS_DML, 1, nullptr);
  sqlite3_db_config(database, SQLITE_DBCONFIG_DQS_DDL, 1, nullptr);
  return std::shared_ptr<SQLiteDatabase>(new SQLiteDatabase(database));
}

SQLiteDatabase::SQLiteDatabase(sqlite3* dbPointer)
    : dbPointer_(dbPointer),
      keptReadings_(std::make_unique<store_detail::KeptReadings>(dbPointer)),
      queue_(Platform::current().queues.makeSerialQueue("com.ardent.dbmanager.queue -" + Uuid::make().string())),
      handOver_(std::make_shared<store_detail::MainHandOver>(Platform::current().mainQueue)) {
  // A connection that stays out of WAL mode works on.
  sqlite3_exec(dbPointer_, "PRAGMA journal_mode=WAL;", nullptr, nullptr, nullptr);
}

SQLiteDatabase::~SQLiteDatabase() {
  // What exports have left would keep the connection open.
  while (sqlite3_stmt* statement = sqlite3_next_stmt(dbPointer_, nullptr)) sqlite3_finalize(statement);
  sqlite3_close(dbPointer_);
}

tl::expected<StatementHandle, SQLiteError> SQLiteDatabase::prepareStatement(const char* sql) {
  sqlite3_stmt* statement = nullptr;
  if (sqlite3_prepare_v2(dbPointer_, sql, -1, &statement, nullptr) != SQLITE_OK)
    return tl::unexpected(SQLiteError{SQLiteError::Case::Prepare, messageOf(dbPointer_)});
  return StatementHandle(statement);
}

std::string SQLiteDatabase::libraryMessage() const {
  const char* text = sqlite3_errmsg(dbPointer_);
  if (text == nullptr) fatalStop("sqlite3_errmsg is nil");
  return text;
}

void SQLiteDatabase::createTable(std::string sql, std::string tableName, WriteCompletion completion) {
  enqueueWrite(*this, [sql = std::move(sql), tableName = std::move(tableName),
                       completion = std::move(completion)](SQLiteDatabase& self) {
    self.keptReadings_->giveUp();
    StatementHandle statement;
    if (auto prepared = self.prepareStatement(sql.c_str())) {
      statement = std::move(*prepared);
    } else {
      databaseLog.error("%{public}s error ocurred while creating a table", prepared.error());
      completion(false, prepared.error());
      return;
    }
    if (sqlite3_step(statement.get()) == SQLITE_DONE) {
      statement.reset();
      databaseLog.error("%{public}s table created.", tableName);
      completion(true, std::nullopt);
      return;
    }
    const SQLiteError error{SQLiteError::Case::Prepare, self.libraryMessage()};
    statement.reset();
    databaseLog.error("%{public}s error ocurred while creating a table (sqlite3_step)", error);
    completion(false, error);
  });
}

std::optional<SQLiteError> SQLiteDatabase::bind(sqlite3_stmt* statement, const Metric& metric,
                                                const std::string& collectedOn) {
  const int refused = bindMetric(statement, metric, collectedOn);
  if (refused == 0) return std::nullopt;
  return SQLiteError{refused == 1 ? SQLiteError::Case::Prepare : SQLiteError::Case::Bind, libraryMessage()};
}

std::optional<SQLiteError> SQLiteDatabase::insert(const Metric& metric) {
  const std::string collectedOn = wallClockText(metric.collectedOn);
  const auto statement = prepareStatement(SQLTable<Metric>::insertMetric);
  if (!statement) return statement.error();
  if (auto error = bind(statement->get(), metric, collectedOn)) return error;
  if (sqlite3_step(statement->get()) != SQLITE_DONE) return SQLiteError{SQLiteError::Case::Prepare, libraryMessage()};
  // What is bound ends at its first zero byte.
  keptReadings_->hasInserted({metric.metricTech.c_str(), metric.metricName.c_str(), metric.attributeName.c_str(),
                              metric.attributeValue.c_str(), metric.attributeValueType.c_str(), metric.graphable,
                              metric.metricId.c_str(), metric.subsId, collectedOn});
  return std::nullopt;
}

void SQLiteDatabase::insertMetric(Metric metric, WriteCompletion completion) {
  enqueueInsert(*this, [metric = std::move(metric), completion = std::move(completion)](
                           SQLiteDatabase& self, store_detail::MainHandOver& handOver) mutable {
    std::optional<SQLiteError> error = self.insert(metric);
    if (error) self.keptReadings_->giveUp();
    handOver.add([completion = std::move(completion), error = std::move(error)] {
      completion(!error, error);
      if (!error) databaseLog.log("successfully inserted metric to db");
    });
  });
}

void SQLiteDatabase::deleteOlderRows(SuccessCompletion completion) {
  enqueueWrite(*this, [completion = std::move(completion)](SQLiteDatabase& self) mutable {
    self.keptReadings_->giveUp();
    bool success = false;
    if (const auto statement = self.prepareStatement(kDeleteOlderRowsStatement)) {
      success = sqlite3_step(statement->get()) == SQLITE_DONE;
      // The wording about a table is meant.
      if (!success)
        databaseLog.error("%{public}s error ocurred while creating a table (sqlite3_step)", self.libraryMessage());
    } else {
      databaseLog.error("%{public}s error ocurred while deleting old rows (sqlite3_step)", statement.error());
    }
    onMain([completion = std::move(completion), success] { completion(success); });
  });
}

void SQLiteDatabase::runDashboardStatement(const std::string& sql, WriteCompletion completion) {
  auto statement = prepareStatement(sql.c_str());
  if (!statement) return failOnMain(std::move(completion), statement.error());
  if (sqlite3_step(statement->get()) == SQLITE_DONE) {
    if (changesDashboardAlone(sql)) {
      keptReadings_->dashboardHasChanged();
    } else {
      keptReadings_->giveUp();
    }
    return succeedOnMain(std::move(completion), true);
  }
  keptReadings_->giveUp();
  const SQLiteError error{SQLiteError::Case::Prepare, libraryMessage()};
  statement->reset();
  completion(false, error);
}

void SQLiteDatabase::executeDashboardStatement(std::string sql, WriteCompletion completion) {
  enqueueWrite(*this, [sql = std::move(sql), completion = std::move(completion)](SQLiteDatabase& self) mutable {
    self.runDashboardStatement(sql, std::move(completion));
  });
}

void SQLiteDatabase::removeDashboardItem(std::string_view metricTech, std::string_view attributeName,
                                         std::int32_t subsId, WriteCompletion completion) {
  enqueueWrite(*this, [metricTech = std::string(metricTech), attributeName = std::string(attributeName), subsId,
                       completion = std::move(completion)](SQLiteDatabase& self) mutable {
    self.runDashboardStatement(SQLTable<Metric>::removeDashboardItem(metricTech, attributeName, subsId),
                               [completion = std::move(completion)](bool success, std::optional<SQLiteError> error) {
                                 if (success) databaseLog.log("Successfully deleted from dashboard table");
                                 completion(success, std::move(error));
                               });
  });
}

}  // namespace quorl
