#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include <tl/expected.hpp>

#include "base/Queue.h"
#include "store/Metric.h"
#include "store/SQLiteError.h"
#include "store/StatementHandle.h"
#include "store/StoreCompletions.h"

struct sqlite3;
struct sqlite3_stmt;

namespace quorl {

namespace store_detail {
class KeptReadings;
class MainHandOver;
}  // namespace store_detail

/// Full path of the database file, directly in the documents directory; nothing when that cannot be had.
std::optional<std::string> databasePath();

/// The one connection to the database file and the one serial queue on which all its statements run, in call order.
///
/// Every operation may be called on any thread, returns at once and is one work item of the queue; it prepares, steps
/// and finalises a statement of its own. There is no statement cache, no batching, no retry, no escaping of what is
/// spliced into a text, and no pragma but the journal mode; foreign keys stay off, which the first dashboard needs.
/// The reads of latest values step theirs only where the latest readings, which inserts keep current, cannot answer:
/// the statements scan the table, and the answers are the same.
/// A work item holds the database weakly: with the database gone, a write does nothing and does not complete, and a
/// read ends the process.
///
/// Which queue a completion runs on is not uniform and part of each operation's contract. One that runs on the
/// database's queue runs inside the serial order, so it must not wait for another operation.
class SQLiteDatabase : public std::enable_shared_from_this<SQLiteDatabase> {
 public:
  /// Opens the file at `path`, making it (0600) if it is missing. `OpenDatabase` if that fails. Opening one path twice
  /// gives two connections with two queues.
  static tl::expected<std::shared_ptr<SQLiteDatabase>, SQLiteError> open(const std::string& path);
  /// Closes the connection. What is still queued runs before, as told above.
  ~SQLiteDatabase();
  SQLiteDatabase(const SQLiteDatabase&) = delete;
  SQLiteDatabase& operator=(const SQLiteDatabase&) = delete;

  /// For use on `queue` alone.
  sqlite3* dbPointer() const { return dbPointer_; }
  Queue& queue() const { return *queue_; }
  /// How completions of inserts reach the main queue; for the work items.
  const std::shared_ptr<store_detail::MainHandOver>& handOver() const { return handOver_; }

  /// On `queue` alone. `Prepare` if `sql` does not prepare. The database must outlive the statement.
  tl::expected<StatementHandle, SQLiteError> prepareStatement(const char* sql);

  // Writes. A failed step is reported as `Prepare`.

  /// Runs a CREATE statement; `tableName` is for the log. Completes on the database's queue, always.
  void createTable(std::string sql, std::string tableName, WriteCompletion completion);
  /// Writes one row of `Metric`, its `attributeName` as raw key. Completes on the main queue, always.
  void insertMetric(Metric metric, WriteCompletion completion);
  /// Deletes the rows of thirty days ago and older. Completes on the main queue, always.
  void deleteOlderRows(SuccessCompletion completion);
  /// Runs a statement that changes `Dashboard`. Completes on the main queue, but after a failed step on the
  /// database's.
  void executeDashboardStatement(std::string sql, WriteCompletion completion);
  /// Unpins an attribute, with all its duplicates; none there is a success. Completes on the main queue, but after a
  /// failed step on the database's.
  void removeDashboardItem(std::string_view metricTech, std::string_view attributeName, std::int32_t subsId,
                           WriteCompletion completion);

  // Reads. They complete on the main queue, with `Prepare` if the statement does not prepare; no rows are no error.
  // A row with a NULL text ends the read with `EmptyQueryResult` and without any rows, and so does a date that does
  // not parse; each read tells on which queue. A step that fails ends the rows without an error.

  /// The metrics of one subscription, each with the time at which it was last seen. A date that does not parse counts
  /// as now. `EmptyQueryResult` comes on the database's queue.
  void fetchAvailableMetrics(std::int32_t subsId, AvailableMetricsCompletion completion);
  /// Latest row of one attribute, or of each attribute of the metric if `attributeName` is none, sorted by it.
  /// `EmptyQueryResult` comes on the main queue for a NULL text and on the database's for a date.
  void fetchMetricContents(std::string_view metricTech, std::string_view metricName,
                           std::optional<std::string_view> attributeName, std::int32_t subsId,
                           MetricsCompletion completion);
  /// `daily`: the readings since local midnight of the subscription that is current when the work item runs. `weekly`
  /// and `monthly`: one average for each day, over both subscriptions. `EmptyQueryResult` comes on the main queue.
  void fetchAttributeHistory(std::string_view metricName, std::string_view attributeName,
                             AttributeDetailTimeFrame timeFrame, MetricsCompletion completion);
  /// The pinned attributes of one subscription, one for each attribute name, sorted by it. `EmptyQueryResult` comes on
  /// the database's queue.
  void fetchDashboard(std::int32_t subsId, DashboardCompletion completion);
  /// All rows of a time frame, of both subscriptions, values as stored and without value types. `EmptyQueryResult`
  /// comes on the database's queue. The statement stays with the connection until that is closed.
  void exportMetrics(AttributeDetailTimeFrame timeFrame, ExportCompletion completion);

 private:
  explicit SQLiteDatabase(sqlite3* dbPointer);

  /// The library's text for the last failure. None is a fatal stop.
  std::string libraryMessage() const;
  std::optional<SQLiteError> insert(const Metric& metric);
  std::optional<SQLiteError> bind(sqlite3_stmt* statement, const Metric& metric, const std::string& collectedOn);
  void runDashboardStatement(const std::string& sql, WriteCompletion completion);

  sqlite3* const dbPointer_;
  const std::unique_ptr<store_detail::KeptReadings> keptReadings_;  // on `queue` alone
  const std::shared_ptr<Queue> queue_;
  const std::shared_ptr<store_detail::MainHandOver> handOver_;
};

}  // namespace quorl
