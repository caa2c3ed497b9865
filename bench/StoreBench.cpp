#include "StoreBench.h"

#include <array>
#include <chrono>
#include <cstdlib>
#include <memory>
#include <utility>

#include <fmt/format.h>

#include "base/DateText.h"
#include "store/DefaultDashboard.h"
#include "store/MetricStatements.h"
#include "support/TemporaryDirectory.h"

namespace quorl::bench {
namespace {

constexpr std::size_t kDays = 30;

/// Binds one row after the other to the parameters of the insert.
class Readings {
 public:
  void bindNext(sqlite3_stmt* statement, std::size_t index, Date time) {
    static constexpr const char* kEnumerators[] = {"kHVCellMonitorCellTypeServing", "MODULATION_256QAM",
                                                   "SYS_SRV_STATUS_SRV"};
    const std::size_t message = index / kRowsOfMessage;
    const std::size_t metric = message % kMetrics;
    const std::size_t attribute = index % kRowsOfMessage;
    texts_[0] = metricTechOf(metric);
    texts_[1] = metricNameOf(metric);
    texts_[2] = attributeNameOf(attribute);
    if (attribute == 0) {
      texts_[3] = std::to_string(time.time_since_epoch().count() / 1000 + static_cast<std::int64_t>(index));
    } else if (attribute == 1) {
      texts_[3] = kEnumerators[metric % 3];
    } else {
      texts_[3] = std::to_string(static_cast<long>(index * 7919 % 20000) - 140);
    }
    texts_[4] = attribute == 1 ? "STRING" : "INT";
    texts_[5] = std::to_string(806900 + metric);
    texts_[6] = wallClockText(time);
    for (const auto& [parameter, text] : {std::pair(1, 0), {2, 1}, {3, 2}, {4, 3}, {5, 4}, {7, 5}, {9, 6}}) {
      const std::string& value = texts_[static_cast<std::size_t>(text)];
      sqlite3_bind_text(statement, parameter, value.c_str(), static_cast<int>(value.size()), SQLITE_STATIC);
    }
    sqlite3_bind_int(statement, 6, attribute == 1 ? 0 : 1);
    sqlite3_bind_int(statement, 8, static_cast<int>(message / 3 % 2));
  }

 private:
  std::array<std::string, 7> texts_;
};

void fill(const std::filesystem::path& path, std::size_t rows, Date end) {
  const std::shared_ptr<SQLiteDatabase> database = SQLiteDatabase::open(path.string()).value();
  sqlite3* const connection = database->dbPointer();
  execute(connection, "PRAGMA synchronous=OFF");
  execute(connection, SQLTable<Metric>::createMetricTable);
  execute(connection, SQLTable<Metric>::createDashboardTable);
  execute(connection, "BEGIN");
  for (const Metric& pin : defaultDashboard(/*isMavDevice=*/true, end))
    execute(connection, SQLTable<Metric>::insertDashboardItem(
                            {pin.metricTech, pin.metricId, pin.metricName, pin.attributeName, pin.subsId}));
  const auto span = std::chrono::duration_cast<Date::duration>(std::chrono::hours(24 * kDays - 1));
  sqlite3_stmt* statement = nullptr;
  sqlite3_prepare_v2(connection, SQLTable<Metric>::insertMetric, -1, &statement, nullptr);
  Readings readings;
  for (std::size_t i = 0; i < rows; ++i) {
    const std::size_t left = (rows - i) / kRowsOfMessage * kRowsOfMessage;
    readings.bindNext(
        statement, i,
        end - std::chrono::duration_cast<Date::duration>(std::chrono::duration<double>(span) *
                                                         static_cast<double>(left) / static_cast<double>(rows)));
    if (sqlite3_step(statement) != SQLITE_DONE) std::abort();
    sqlite3_reset(statement);
  }
  sqlite3_finalize(statement);
  execute(connection, "COMMIT");
  execute(connection, "PRAGMA wal_checkpoint(TRUNCATE)");
}

}  // namespace

std::vector<std::string> directories(std::vector<std::string> otherwise) {
  if (const char* directory = std::getenv("QUORL_BENCH_DIR")) return {directory};
  return otherwise;
}

std::filesystem::path directory() {
  return directories({"."}).front();
}

std::size_t number(const char* name, std::size_t usual) {
  const char* text = std::getenv(name);
  return text != nullptr ? std::strtoull(text, nullptr, 10) : usual;
}

std::size_t rowCount() {
  return number("QUORL_BENCH_ROWS", 100'000);
}

void execute(sqlite3* database, const std::string& sql) {
  if (sqlite3_exec(database, sql.c_str(), nullptr, nullptr, nullptr) != SQLITE_OK) std::abort();
}

void stepBare(sqlite3* database, const std::string& sql, std::string_view columns) {
  sqlite3_stmt* statement = nullptr;
  if (sqlite3_prepare_v2(database, sql.c_str(), -1, &statement, nullptr) != SQLITE_OK) std::abort();
  while (sqlite3_step(statement) == SQLITE_ROW) {
    for (std::size_t i = 0; i < columns.size(); ++i) {
      const int column = static_cast<int>(i);
      if (columns[i] == 'i') benchmark::DoNotOptimize(sqlite3_column_int(statement, column));
      if (columns[i] == 't') benchmark::DoNotOptimize(sqlite3_column_text(statement, column));
    }
  }
  sqlite3_finalize(statement);
}

void bindShortRow(sqlite3_stmt* insert) {
  for (const int index : {1, 2, 3, 4, 5, 7}) sqlite3_bind_text(insert, index, "is_ims_voice", -1, SQLITE_STATIC);
  sqlite3_bind_int(insert, 6, 0);
  sqlite3_bind_int(insert, 8, 0);
  sqlite3_bind_text(insert, 9, "2026-01-05 09:30:12", -1, SQLITE_STATIC);
}

std::string metricTechOf(std::size_t metric) {
  static constexpr const char* kTechs[] = {"LTE", "5G", "MISC", "RAT"};
  return kTechs[metric % 4];
}

std::string metricNameOf(std::size_t metric) {
  return fmt::format("Serving Metric {}", metric);
}

std::string attributeNameOf(std::size_t attribute) {
  return attribute == 0 ? "timestamp" : fmt::format("some_attribute_name_{}", attribute);
}

std::filesystem::path monthOfRows(const std::filesystem::path& directory, std::size_t rows, Date now) {
  const std::filesystem::path path = directory / fmt::format("quorl-bench-month-{}.sqlite", rows);
  if (std::filesystem::exists(path)) return path;
  const test::TemporaryDirectory scratch(directory);  // a run that is cut short leaves no half of a file
  const std::filesystem::path unfinished = scratch.path() / "file.sqlite";
  fill(unfinished, rows, now);
  std::filesystem::rename(unfinished, path);
  return path;
}

}  // namespace quorl::bench
