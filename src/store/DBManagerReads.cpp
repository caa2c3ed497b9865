#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include <sqlite3.h>

#include "app/HardwareManager.h"
#include "base/DateText.h"
#include "store/ConnectionLock.h"
#include "store/DBManager.h"
#include "store/EnumeratorPrefix.h"
#include "store/KeptReadings.h"
#include "store/MetricStatements.h"
#include "store/WorkItems.h"

namespace quorl {

using store_detail::ConnectionLock;
using store_detail::enqueueRead;
using store_detail::failOnMain;
using store_detail::KeptReadings;
using store_detail::LatestReadings;
using store_detail::StoredReading;
using store_detail::succeedOnMain;

namespace {

SQLiteError emptyQueryResult() {
  return {SQLiteError::Case::EmptyQueryResult, {}};
}

/// The error that three of the reads report: a new one that carries the description of the first.
SQLiteError described(const SQLiteError& error) {
  return {SQLiteError::Case::Prepare, logText(error)};
}

/// The columns of the row at hand. A NULL text reads as empty and is remembered for the whole row.
class RowReader {
 public:
  explicit RowReader(sqlite3_stmt* statement) : statement_(statement) {}

  /// Valid until the next step.
  std::string_view view(int column) {
    const unsigned char* text = sqlite3_column_text(statement_, column);
    if (text == nullptr) {
      hasNull_ = true;
      return {};
    }
    return reinterpret_cast<const char*>(text);
  }
  std::string text(int column) { return std::string(view(column)); }
  std::int32_t integer(int column) { return sqlite3_column_int(statement_, column); }
  bool hasNull() const { return hasNull_; }

 private:
  sqlite3_stmt* const statement_;
  bool hasNull_ = false;
};

/// Localised attribute names of one read: few names, many rows.
class LocalizedNames {
 public:
  const std::string& of(const std::string& key) {
    const auto found = names_.find(key);
    if (found != names_.end()) return found->second;
    return names_.emplace(key, strings_.localized(key)).first->second;
  }

 private:
  StringTable& strings_ = Platform::current().strings;
  std::unordered_map<std::string, std::string> names_;
};

/// All rows of an export; nothing once one of them cannot be read.
std::optional<ExportedMetrics> readExport(sqlite3* connection, sqlite3_stmt* statement) {
  ExportedMetrics metrics;
  StringTable& strings = Platform::current().strings;
  WallClockReader dates;
  // Entered once for all rows: each column would do so again, and nobody else uses the connection.
  const ConnectionLock lock(connection);
  while (sqlite3_step(statement) == SQLITE_ROW) {
    RowReader row(statement);
    ExportedMetric metric;
    metric.metricTech = row.view(0);
    metric.metricName = row.view(1);
    metric.attributeNameNonLocalized = row.view(2);
    metric.attributeValue = row.view(3);
    metric.subsId = row.integer(4);
    metric.metricId = row.view(5);
    const std::optional<Date> date = dates.read(row.view(6));
    if (row.hasNull() || !date) return std::nullopt;
    metric.collectedOn = *date;
    metrics.append(metric, strings);
  }
  return metrics;
}

}  // namespace

void SQLiteDatabase::fetchAvailableMetrics(std::int32_t subsId, AvailableMetricsCompletion completion) {
  enqueueRead(*this, [subsId, completion = std::move(completion)](SQLiteDatabase& self) mutable {
    auto statement = self.prepareStatement(SQLTable<Metric>::availableMetrics(subsId).c_str());
    if (!statement) return failOnMain(std::move(completion), described(statement.error()));
    AvailableMetrics metrics;
    WallClockReader dates;
    const auto add = [&](const StoredReading& row) {
      const std::optional<Date> date = dates.read(row.collectedOn);
      auto rows = metrics.find(row.metricTech);
      if (rows == metrics.end()) rows = metrics.try_emplace(std::string(row.metricTech)).first;
      rows->second.push_back({std::string(row.metricName), date ? *date : Platform::current().clock.now(), row.subsId});
    };
    if (const LatestReadings* const latest = self.keptReadings_->current()) {
      latest->eachMetric(subsId, add);
    } else {
      while (sqlite3_step(statement->get()) == SQLITE_ROW) {
        RowReader columns(statement->get());
        StoredReading row;
        row.metricTech = columns.view(0);
        row.metricName = columns.view(1);
        row.collectedOn = columns.view(2);
        row.subsId = columns.integer(3);
        if (columns.hasNull()) {
          statement->reset();
          return completion({}, emptyQueryResult());
        }
        add(row);
      }
      self.keptReadings_->statementHasAnswered();
    }
    statement->reset();
    succeedOnMain(std::move(completion), std::move(metrics));
  });
}

void SQLiteDatabase::fetchMetricContents(std::string_view metricTech, std::string_view metricName,
                                         std::optional<std::string_view> attributeName, std::int32_t subsId,
                                         MetricsCompletion completion) {
  enqueueRead(*this, [metricTech = std::string(metricTech), metricName = std::string(metricName),
                      attributeName = attributeName ? std::optional<std::string>(*attributeName) : std::nullopt, subsId,
                      completion = std::move(completion)](SQLiteDatabase& self) mutable {
    auto statement =
        self.prepareStatement(SQLTable<Metric>::metricContents(metricTech, metricName, attributeName, subsId).c_str());
    if (!statement) return failOnMain(std::move(completion), statement.error());
    std::vector<Metric> metrics;
    WallClockReader dates;
    LocalizedNames names;
    bool isDated = true;
    const auto add = [&](const StoredReading& row) {
      const std::optional<Date> date = dates.read(row.collectedOn);
      isDated = isDated && date;
      if (!isDated) return;
      Metric& metric = metrics.emplace_back();
      metric.id = Uuid::make();
      metric.metricTech = row.metricTech;
      metric.metricName = row.metricName;
      metric.attributeNameNonLocalized = row.attributeName;
      metric.attributeName = names.of(metric.attributeNameNonLocalized);
      metric.attributeValue = row.attributeValue;
      removeEnumeratorPrefix(metric.attributeValue);
      metric.attributeValueType = row.attributeValueType;
      metric.collectedOn = *date;
      metric.metricId = row.metricId;
      metric.subsId = row.subsId;
      metric.graphable = row.graphable;
    };
    std::string message;
    const bool areTexts = KeptReadings::areTakenAsTexts({metricTech, metricName, attributeName.value_or("")});
    if (const LatestReadings* const latest = areTexts ? self.keptReadings_->current() : nullptr) {
      if (!attributeName) {
        latest->eachReading(metricTech, metricName, subsId, add);
      } else if (const auto row = latest->reading(metricTech, metricName, *attributeName, subsId)) {
        add(*row);
      }
      message = sqlite3_errstr(SQLITE_DONE);
    } else {
      while (isDated && sqlite3_step(statement->get()) == SQLITE_ROW) {
        RowReader columns(statement->get());
        StoredReading row;
        row.metricTech = columns.view(1);
        row.metricName = columns.view(2);
        row.attributeName = columns.view(3);
        row.attributeValue = columns.view(4);
        row.attributeValueType = columns.view(5);
        row.graphable = columns.integer(6) == 1;
        row.metricId = columns.view(7);
        row.subsId = columns.integer(8);
        row.collectedOn = columns.view(9);
        if (columns.hasNull()) return failOnMain(std::move(completion), emptyQueryResult());
        add(row);
      }
      message = self.libraryMessage();
      self.keptReadings_->statementHasAnswered();
    }
    statement->reset();
    if (!isDated) return completion({}, emptyQueryResult());
    // The library's text is never empty, so a read that went well prints this line too.
    if (!message.empty()) Platform::current().console.print("error occurred while fetching metric contents " + message);
    succeedOnMain(std::move(completion), std::move(metrics));
  });
}

void SQLiteDatabase::fetchAttributeHistory(std::string_view metricName, std::string_view attributeName,
                                           AttributeDetailTimeFrame timeFrame, MetricsCompletion completion) {
  enqueueRead(*this, [metricName = std::string(metricName), attributeName = std::string(attributeName), timeFrame,
                      completion = std::move(completion)](SQLiteDatabase& self) mutable {
    // The subscription is the one that is current now, not at the call.
    const std::int32_t currentSubsId = HardwareManager::shared().currentSubsId();
    auto statement = self.prepareStatement(
        SQLTable<Metric>::attributeHistory(metricName, attributeName, timeFrame, currentSubsId).c_str());
    if (!statement) return failOnMain(std::move(completion), statement.error());
    std::vector<Metric> metrics;
    WallClockReader dates;
    LocalizedNames names;
    while (sqlite3_step(statement->get()) == SQLITE_ROW) {
      RowReader row(statement->get());
      Metric metric;
      metric.metricTech = row.text(0);
      metric.metricName = row.text(1);
      metric.attributeNameNonLocalized = row.text(2);
      metric.attributeValue = row.text(3);
      metric.attributeValueType = row.text(4);
      metric.metricId = row.text(5);
      metric.subsId = row.integer(6);
      const std::string_view collectedOn = row.view(7);
      if (row.hasNull()) return failOnMain(std::move(completion), emptyQueryResult());
      const std::optional<Date> date =
          timeFrame == AttributeDetailTimeFrame::daily ? dates.read(collectedOn) : dates.readDay(collectedOn);
      if (!date) return failOnMain(std::move(completion), emptyQueryResult());
      metric.id = Uuid::make();
      metric.attributeName = names.of(metric.attributeNameNonLocalized);
      removeEnumeratorPrefix(metric.attributeValue);
      metric.collectedOn = *date;
      metrics.push_back(std::move(metric));
    }
    statement->reset();
    succeedOnMain(std::move(completion), std::move(metrics));
  });
}

void SQLiteDatabase::fetchDashboard(std::int32_t subsId, DashboardCompletion completion) {
  enqueueRead(*this, [subsId, completion = std::move(completion)](SQLiteDatabase& self) mutable {
    auto statement = self.prepareStatement(SQLTable<Metric>::dashboard(subsId).c_str());
    if (!statement) return failOnMain(std::move(completion), described(statement.error()));
    std::vector<DashboardTableItem> items;
    while (sqlite3_step(statement->get()) == SQLITE_ROW) {
      RowReader row(statement->get());
      DashboardTableItem item;
      item.metricTech = row.text(0);
      item.metricId = row.text(1);
      item.metricName = row.text(2);
      item.attributeName = row.text(3);
      item.subsId = row.integer(4);
      if (row.hasNull()) {
        statement->reset();
        return completion({}, emptyQueryResult());
      }
      items.push_back(std::move(item));
    }
    statement->reset();
    succeedOnMain(std::move(completion), std::move(items));
  });
}

void SQLiteDatabase::exportMetrics(AttributeDetailTimeFrame timeFrame, ExportCompletion completion) {
  enqueueRead(*this, [timeFrame, completion = std::move(completion)](SQLiteDatabase& self) mutable {
    auto prepared = self.prepareStatement(exportStatement(timeFrame));
    if (!prepared) return failOnMain(std::move(completion), described(prepared.error()));
    // Left unfinalised on purpose, until the connection is closed.
    sqlite3_stmt* const statement = prepared->release();
    std::optional<ExportedMetrics> metrics = readExport(self.dbPointer(), statement);
    if (!metrics) {
      // Its snapshot must not outlive the read, or the journal could never be taken back.
      sqlite3_reset(statement);
      return completion({}, emptyQueryResult());
    }
    succeedOnMain(std::move(completion), *std::move(metrics));
  });
}

}  // namespace quorl
