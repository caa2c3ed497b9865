#include "Documents.h"

#include <functional>
#include <memory>
#include <string_view>
#include <system_error>
#include <utility>

#include <fmt/format.h>
#include <sqlite3.h>

#include "hosts/simulator/UsableDocuments.h"

namespace quorl::tool {

namespace fs = std::filesystem;

namespace {

class Database {
 public:
  static tl::expected<Database, std::string> open(const fs::path& file, int flags) {
    sqlite3* handle = nullptr;
    const int code = sqlite3_open_v2(file.c_str(), &handle, flags, nullptr);
    Database database(handle);
    if (code != SQLITE_OK) return tl::unexpected(database.message());
    sqlite3_busy_timeout(handle, kBusyTimeoutMs);
    return database;
  }

  /// Runs a statement and hands each of its rows to `row`.
  tl::expected<void, std::string> run(const char* sql, const std::function<void(sqlite3_stmt*)>& row = {}) const {
    sqlite3_stmt* statement = nullptr;
    if (sqlite3_prepare_v2(handle_.get(), sql, -1, &statement, nullptr) != SQLITE_OK) return tl::unexpected(message());
    const std::unique_ptr<sqlite3_stmt, int (*)(sqlite3_stmt*)> finalizing(statement, sqlite3_finalize);
    int code = SQLITE_ROW;
    while ((code = sqlite3_step(statement)) == SQLITE_ROW)
      if (row) row(statement);
    if (code != SQLITE_DONE) return tl::unexpected(message());
    return {};
  }

 private:
  static constexpr int kBusyTimeoutMs = 5000;

  explicit Database(sqlite3* handle) : handle_(handle, sqlite3_close) {}
  std::string message() const { return sqlite3_errmsg(handle_.get()); }

  std::unique_ptr<sqlite3, int (*)(sqlite3*)> handle_;
};

std::string columnText(sqlite3_stmt* statement, int column) {
  const unsigned char* text = sqlite3_column_text(statement, column);
  return text == nullptr ? std::string() : reinterpret_cast<const char*>(text);
}

tl::unexpected<std::string> cannotUse(const fs::path& path, std::string_view why) {
  return tl::unexpected(fmt::format("{}: {}", path.string(), why));
}

/// Opens a database that is there already.
tl::expected<Database, std::string> openExisting(const fs::path& file) {
  std::error_code error;
  if (!fs::exists(file, error)) return cannotUse(file, error ? error.message() : "No such file or directory");
  auto database = Database::open(file, SQLITE_OPEN_READWRITE);
  if (!database) return cannotUse(file, database.error());
  return database;
}

}  // namespace

tl::expected<void, std::string> foldWriteAheadLog(const fs::path& documents) {
  const fs::path file = simulator::databaseFile(documents);
  auto database = Database::open(file, SQLITE_OPEN_READWRITE);
  if (!database) return cannotUse(file, database.error());
  if (auto folded = database->run("PRAGMA wal_checkpoint(TRUNCATE)"); !folded) return cannotUse(file, folded.error());
  return {};
}

std::optional<StoredRows> storedRows(const fs::path& documents, std::int64_t lastId) {
  const auto database = openExisting(simulator::databaseFile(documents));
  if (!database) return std::nullopt;
  StoredRows rows;
  const auto read = database->run(fmt::format("SELECT count(*), max(Id) FROM Metric WHERE Id <= {}", lastId).c_str(),
                                  [&rows](sqlite3_stmt* row) {
                                    rows = {sqlite3_column_int64(row, 0), sqlite3_column_int64(row, 1)};
                                  });
  return read ? std::optional(rows) : std::nullopt;
}

tl::expected<std::string, std::string> basebandFamily(const fs::path& documents) {
  constexpr std::int64_t kLeastIceId = 3900000;
  const fs::path file = simulator::databaseFile(documents);
  const auto database = openExisting(file);
  if (!database) return tl::unexpected(database.error());
  bool isIce = false;
  const auto read = database->run("SELECT CAST(metric_id AS INTEGER) FROM Metric WHERE metric_id GLOB '[0-9]*' LIMIT 1",
                                  [&isIce](sqlite3_stmt* row) { isIce = sqlite3_column_int64(row, 0) >= kLeastIceId; });
  if (!read) return cannotUse(file, read.error());
  return isIce ? "ice" : "mav";
}

tl::expected<std::vector<MetricSummary>, std::string> summarize(const fs::path& documents) {
  const fs::path file = simulator::databaseFile(documents);
  const auto database = openExisting(file);
  if (!database) return tl::unexpected(database.error());
  std::vector<MetricSummary> metrics;
  const auto read = database->run(
      "SELECT metric_tech, metric_name, count(*), max(collected_on) FROM Metric"
      " GROUP BY metric_tech, metric_name ORDER BY metric_tech, metric_name",
      [&metrics](sqlite3_stmt* row) {
        metrics.push_back({columnText(row, 0), columnText(row, 1), sqlite3_column_int64(row, 2), columnText(row, 3)});
      });
  if (!read) return cannotUse(file, read.error());
  return metrics;
}

}  // namespace quorl::tool
