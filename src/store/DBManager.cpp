#include "store/DBManager.h"

#include <filesystem>
#include <utility>

#include <sqlite3.h>
#include <sys/stat.h>

#include "base/FatalStop.h"
#include "base/Uuid.h"
#include "platform/Platform.h"

namespace quorl {

namespace {

constexpr char kFileName[] = "metricPartV11.sqlite";

std::string messageOf(sqlite3* database) {
  const char* text = sqlite3_errmsg(database);
  return text != nullptr ? text : "No error message provided from sqlite.";
}

}  // namespace

void FinalizeStatement::operator()(sqlite3_stmt* statement) const {
  sqlite3_finalize(statement);
}

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
      queue_(Platform::current().queues.makeSerialQueue("com.ardent.dbmanager.queue -" + Uuid::make().string())) {
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

}  // namespace quorl
