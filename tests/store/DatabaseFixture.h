#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "base/DateText.h"
#include "store/DBManager.h"
#include "store/MetricStatements.h"
#include "store/RawDatabase.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"
#include "support/Reading.h"
#include "support/TimeZoneAndLocale.h"
#include "support/VirtualTimeVfs.h"

namespace quorl::test {

inline constexpr auto kDaily = AttributeDetailTimeFrame::daily;
inline constexpr auto kWeekly = AttributeDetailTimeFrame::weekly;
inline constexpr auto kMonthly = AttributeDetailTimeFrame::monthly;

/// On which queue a completion ran.
enum class Place { none, main, database };

/// What a completion was told; one call is expected.
template <typename Result>
struct Outcome {
  int calls = 0;
  Result result{};
  std::optional<SQLiteError> error;
  Place place = Place::none;
};

using Written = Outcome<bool>;
using Read = Outcome<std::vector<Metric>>;
using Listed = Outcome<AvailableMetrics>;
using Pinned = Outcome<std::vector<DashboardTableItem>>;

/// A read that went well, whatever its rows.
template <typename Result>
void expectSuccess(const Outcome<Result>& outcome) {
  EXPECT_EQ(outcome.calls, 1);
  EXPECT_EQ(outcome.error, std::nullopt);
  EXPECT_EQ(outcome.place, Place::main);
}

/// A read that failed and has no rows.
template <typename Result>
void expectFailure(const Outcome<Result>& outcome, const SQLiteError& error, Place place) {
  EXPECT_EQ(outcome.calls, 1);
  EXPECT_TRUE(outcome.result.empty());
  EXPECT_EQ(outcome.error, error);
  EXPECT_EQ(outcome.place, place);
}

inline SQLiteError prepareError(std::string message) {
  return {SQLiteError::Case::Prepare, std::move(message)};
}
inline SQLiteError emptyQueryResult() {
  return {SQLiteError::Case::EmptyQueryResult, {}};
}

/// A real database file under a fake platform. The clock, SQLite's included, stands at 2026-01-05 09:30:12 UTC, and
/// the zone is UTC unless a test says otherwise.
class DatabaseFixture : public testing::Test {
 protected:
  FakePlatform platform;
  VirtualTimeVfs vfs{platform.time};
  LogRecorder log;
  std::optional<ScopedTimeZone> zone{std::in_place, "UTC"};
  std::shared_ptr<SQLiteDatabase> database;

  std::string path() const { return (platform.directory.path() / "metricPartV11.sqlite").string(); }

  void open() {
    auto opened = SQLiteDatabase::open(path());
    ASSERT_TRUE(opened.has_value());
    database = *opened;
  }
  void openWithTables() {
    open();
    run(SQLTable<Metric>::createMetricTable);
    run(SQLTable<Metric>::createDashboardTable);
  }
  void inZone(std::string_view name) {
    zone.reset();
    zone.emplace(name);
  }
  void setClock(std::string_view utc) { platform.time.setNow(utcDate(utc)); }
  static Date utcDate(std::string_view text) {
    const ScopedTimeZone utcZone("UTC");
    return parseWallClock(text).value();
  }

  /// On the product's own connection, past its queue.
  std::vector<Row> run(const std::string& sql) { return test::run(database->dbPointer(), sql); }

  Place place() const {
    if (platform.mainQueue->isCurrent()) return Place::main;
    return database && database->queue().isCurrent() ? Place::database : Place::none;
  }
  template <typename Result>
  auto into(Outcome<Result>& outcome) {
    return [this, &outcome](Result result, std::optional<SQLiteError> error) {
      ++outcome.calls;
      outcome.result = std::move(result);
      outcome.error = std::move(error);
      outcome.place = place();
    };
  }

  /// A reading of the serving cell; tests change what matters to them.
  static Metric reading(std::string attribute = "dl_freq", std::string value = "5230",
                        std::string_view collectedOn = "2026-01-05 09:00:00", std::int32_t subsId = 0) {
    return readingAt(parseWallClock(collectedOn).value(), "LTE", "Serving Cell Info", std::move(attribute),
                     std::move(value), subsId);
  }

  /// A row of `Metric` in which one column holds `value`, an SQL expression.
  void insertRowWith(const std::string& column, const std::string& value) {
    std::vector<std::pair<std::string, std::string>> row{{"metric_tech", "'LTE'"},
                                                         {"metric_name", "'Serving Cell Info'"},
                                                         {"attribute_name", "'dl_freq'"},
                                                         {"attribute_value", "'5230'"},
                                                         {"attribute_value_type", "'INT'"},
                                                         {"is_attribute_graphable", "0"},
                                                         {"metric_id", "'803010'"},
                                                         {"subs_id", "0"},
                                                         {"collected_on", "'2026-01-05 09:00:00'"}};
    std::string columns;
    std::string fields;
    for (const auto& [name, expression] : row) {
      columns += (columns.empty() ? "" : ", ") + name;
      fields += (fields.empty() ? "" : ", ") + (name == column ? value : expression);
    }
    run("INSERT INTO Metric (" + columns + ") VALUES (" + fields + ")");
  }

  Written createTable(const std::string& sql, const std::string& name) {
    Written outcome;
    database->createTable(sql, name, into(outcome));
    platform.time.settle();
    return outcome;
  }
  Written insert(const Metric& metric) {
    Written outcome;
    database->insertMetric(metric, into(outcome));
    platform.time.settle();
    return outcome;
  }
  Written deleteOlderRows() {
    Written outcome;
    database->deleteOlderRows([this, &outcome](bool success) {
      ++outcome.calls;
      outcome.result = success;
      outcome.place = place();
    });
    platform.time.settle();
    return outcome;
  }
  Written execute(const std::string& sql) {
    Written outcome;
    database->executeDashboardStatement(sql, into(outcome));
    platform.time.settle();
    return outcome;
  }
  Written pin(const Metric& metric) {
    return execute(SQLTable<Metric>::pinAttribute(metric.metricTech, metric.attributeNameNonLocalized, metric.subsId));
  }
  Written unpin(std::string_view tech, std::string_view attribute, std::int32_t subsId) {
    Written outcome;
    database->removeDashboardItem(tech, attribute, subsId, into(outcome));
    platform.time.settle();
    return outcome;
  }
  Listed available(std::int32_t subsId = 0) {
    Listed outcome;
    database->fetchAvailableMetrics(subsId, into(outcome));
    platform.time.settle();
    return outcome;
  }
  Read contents(std::optional<std::string_view> attribute = std::nullopt, std::int32_t subsId = 0,
                std::string_view tech = "LTE", std::string_view name = "Serving Cell Info") {
    Read outcome;
    database->fetchMetricContents(tech, name, attribute, subsId, into(outcome));
    platform.time.settle();
    return outcome;
  }
  Read history(AttributeDetailTimeFrame timeFrame, std::string_view attribute = "dl_freq",
               std::string_view name = "Serving Cell Info") {
    Read outcome;
    database->fetchAttributeHistory(name, attribute, timeFrame, into(outcome));
    platform.time.settle();
    return outcome;
  }
  Pinned dashboard(std::int32_t subsId = 0) {
    Pinned outcome;
    database->fetchDashboard(subsId, into(outcome));
    platform.time.settle();
    return outcome;
  }
  Read exported(AttributeDetailTimeFrame timeFrame) {
    Outcome<ExportedMetrics> rows;
    database->exportMetrics(timeFrame, into(rows));
    platform.time.settle();
    Read outcome;
    outcome.calls = rows.calls;
    outcome.error = std::move(rows.error);
    outcome.place = rows.place;
    for (std::size_t i = 0; i < rows.result.size(); ++i) outcome.result.push_back(rows.result.row(i).metric());
    return outcome;
  }

  /// How many statements the connection still holds.
  int openStatements() const {
    int count = 0;
    for (sqlite3_stmt* at = nullptr; (at = sqlite3_next_stmt(database->dbPointer(), at)) != nullptr;) ++count;
    return count;
  }
};

inline std::vector<std::string> values(const std::vector<Metric>& metrics) {
  std::vector<std::string> result;
  for (const Metric& metric : metrics) result.push_back(metric.attributeValue);
  return result;
}

inline std::vector<std::string> times(const std::vector<Metric>& metrics) {
  std::vector<std::string> result;
  for (const Metric& metric : metrics) result.push_back(wallClockText(metric.collectedOn));
  return result;
}

}  // namespace quorl::test
