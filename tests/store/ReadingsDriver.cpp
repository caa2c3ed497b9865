#include "store/ReadingsDriver.h"

#include <algorithm>
#include <iterator>
#include <map>
#include <utility>

#include "base/DateText.h"
#include "store/EnumeratorPrefix.h"
#include "store/MetricStatements.h"

namespace quorl::test {
namespace {

constexpr const char* kTechs[] = {"LTE", "5G", "metric_name"};
constexpr const char* kNames[] = {"Serving Cell Info", "Ota Msg", "Rach Attempt", "Subs_Id", "it's", "a\"b", ""};
constexpr const char* kAttributes[] = {"dl_freq", "ul_freq", "rsrp", "subs_id", "ROWID", "g\xC3\xBCt", "Zeta", ""};
constexpr const char* kValues[] = {"SYS_MODE_LTE", "5230", "", "-140", "MODULATION_256QAM"};
constexpr std::int64_t kFirstInstant = 1767600000;  // 2026-01-05 08:00:00 UTC
constexpr unsigned kInstants = 12;
constexpr std::size_t kMostRows = 250;

std::string quoted(const std::string& text) {
  std::string result = "'";
  for (const char character : text) result.append(character == '\'' ? 2 : 1, character);
  return result + "'";
}

template <std::size_t Count>
const char* oneOf(const char* const (&texts)[Count], std::mt19937& random) {
  return texts[random() % Count];
}

const char* placeText(FakePlatform& platform, const SQLiteDatabase& database) {
  if (platform.mainQueue->isCurrent()) return "main";
  return database.queue().isCurrent() ? "database" : "elsewhere";
}

}  // namespace

ReadingsDriver::ReadingsDriver(unsigned seed, FakePlatform& platform, std::shared_ptr<SQLiteDatabase> database,
                               const std::string& path)
    : random_(seed), platform_(platform), database_(std::move(database)), other_(path) {
  sqlite3_trace_v2(database_->dbPointer(), SQLITE_TRACE_STMT, &StatementTrace::record, &stepped_);
}

ReadingsDriver::~ReadingsDriver() {
  if (sqlite3_get_autocommit(database_->dbPointer()) == 0) own("ROLLBACK");
  sqlite3_trace_v2(database_->dbPointer(), 0, nullptr, nullptr);
}

void ReadingsDriver::step() {
  stepped_.clear();
  platform_.console.lines.clear();
  if (sqlite3_get_autocommit(database_->dbPointer()) == 0 && upTo(10) == 0) transaction();
  if (hasIndex_ && sqlite3_get_autocommit(database_->dbPointer()) != 0 && upTo(40) == 0) indexByAnother();
  const unsigned dice = upTo(1000);
  if (dice < 480) {
    insert();
  } else if (dice < 660) {
    readList(static_cast<std::int32_t>(upTo(3)));
  } else if (dice < 930) {
    const std::string tech = oneOf(kTechs, random_);
    const std::string name = oneOf(kNames, random_);
    const std::string attribute = oneOf(kAttributes, random_);
    readContents(tech, name, upTo(2) == 0 ? std::optional(attribute) : std::nullopt,
                 static_cast<std::int32_t>(upTo(3)));
  } else if (dice < 960) {
    pinOrUnpin();
  } else if (dice < 968) {
    insertThatFails();
  } else if (dice < 976) {
    writeByAnother();
  } else if (dice < 979) {
    oddRowByAnother();
  } else if (dice < 985) {
    changeUntold();
  } else if (dice < 990) {
    statementOnMetric();
  } else if (dice < 994) {
    transaction();
  } else {
    database_->deleteOlderRows([](bool /*success*/) {});
    platform_.time.settle();
  }
  if (++rows_ >= kMostRows) thinOut();
}

void ReadingsDriver::readEverything() {
  for (const int time : {1, 2}) {
    for (const std::int32_t subsId : {0, 1}) {
      stepped_.clear();
      readList(subsId);
      for (const char* const tech : kTechs) {
        for (const char* const name : kNames) {
          stepped_.clear();
          platform_.console.lines.clear();
          readContents(tech, name, std::nullopt, subsId);
          if (time == 1) continue;
          for (const char* const attribute : kAttributes) {
            stepped_.clear();
            platform_.console.lines.clear();
            readContents(tech, name, attribute, subsId);
          }
        }
      }
    }
  }
}

Metric ReadingsDriver::reading() {
  Metric metric;
  metric.metricTech = oneOf(kTechs, random_);
  metric.metricName = oneOf(kNames, random_);
  metric.attributeName = oneOf(kAttributes, random_);
  metric.attributeNameNonLocalized = metric.attributeName;
  metric.attributeValue = upTo(2) == 0 ? oneOf(kValues, random_) : std::to_string(upTo(10'000));
  metric.attributeValueType = upTo(2) == 0 ? "INT" : "STRING";
  metric.graphable = upTo(2) == 0;
  metric.metricId = std::to_string(upTo(3));
  metric.subsId = static_cast<std::int32_t>(upTo(2));
  const bool isOld = upTo(50) == 0;  // for the retention run
  metric.collectedOn = Date(std::chrono::seconds(kFirstInstant + upTo(kInstants) - (isOld ? 40 * 86400 : 0)));
  if (upTo(40) == 0) metric.attributeName += std::string("\0hidden", 7);
  return metric;
}

std::string ReadingsDriver::sqlRow() {
  const Metric metric = reading();
  return "INSERT INTO Metric (metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
         "is_attribute_graphable, metric_id, subs_id, collected_on) VALUES (" +
         quoted(metric.metricTech) + ", " + quoted(metric.metricName) + ", " + quoted(metric.attributeName.c_str()) +
         ", " + quoted(metric.attributeValue) + ", 'INT', " + (metric.graphable ? "1" : "2") + ", " +
         quoted(metric.metricId) + ", " + std::to_string(metric.subsId) + ", " +
         quoted(wallClockText(metric.collectedOn)) + ")";
}

void ReadingsDriver::insert() {
  // A message's rows are queued at once.
  for (unsigned count = 1 + upTo(3); count > 0; --count, ++rows_)
    database_->insertMetric(reading(), [](bool /*success*/, const auto& /*error*/) {});
  platform_.time.settle();
}

void ReadingsDriver::insertThatFails() {
  Metric metric = reading();
  metric.collectedOn = Date(std::chrono::seconds(400000000000));  // beyond the year 9999
  database_->insertMetric(metric, [&](bool success, const auto& /*error*/) {
    if (success) difference_ = "an insert without a time succeeded";
  });
  platform_.time.settle();
}

void ReadingsDriver::readList(std::int32_t subsId) {
  const Date now = platform_.time.now();
  std::string answer;
  database_->fetchAvailableMetrics(subsId, [&](const AvailableMetrics& metrics, const auto& error) {
    if (error) {
      answer = logText(*error);
    } else {
      for (const auto& [tech, rows] : metrics)
        for (const MetricList& row : rows)
          answer += tech + "|" + row.metricName + "|" + std::to_string(row.subsId) + "|" +
                    (row.collectedOn == now ? "now" : wallClockText(row.collectedOn)) + "\n";
    }
    answer += placeText(platform_, *database_);
  });
  platform_.time.settle();
  const std::string sql = SQLTable<Metric>::availableMetrics(subsId);
  compare(sql, answer, expected(sql, 2, /*isList=*/true));
}

void ReadingsDriver::readContents(const std::string& tech, const std::string& name,
                                  const std::optional<std::string>& attribute, std::int32_t subsId) {
  std::string answer;
  database_->fetchMetricContents(
      tech, name, attribute, subsId, [&](const std::vector<Metric>& rows, const auto& error) {
        if (error) answer = logText(*error);
        for (const Metric& row : rows)
          answer += row.metricTech + "|" + row.metricName + "|" + row.attributeNameNonLocalized + "|" +
                    row.attributeValue + "|" + row.attributeValueType + "|" + (row.graphable ? "1" : "0") + "|" +
                    row.metricId + "|" + std::to_string(row.subsId) + "|" + wallClockText(row.collectedOn) + "\n";
        if (!error)
          for (const std::string& line : platform_.console.lines) answer += line + "\n";
        answer += placeText(platform_, *database_);
      });
  platform_.time.settle();
  const std::string sql = SQLTable<Metric>::metricContents(tech, name, attribute, subsId);
  compare(sql, answer, expected(sql, 9, /*isList=*/false));
}

std::string ReadingsDriver::expected(const std::string& sql, std::size_t timeColumn, bool isList) {
  sqlite3* const connection = database_->dbPointer();
  sqlite3_stmt* statement = nullptr;
  if (sqlite3_prepare_v2(connection, sql.c_str(), -1, &statement, nullptr) != SQLITE_OK) {
    const std::string message = logText(SQLiteError{SQLiteError::Case::Prepare, sqlite3_errmsg(connection)});
    return (isList ? logText(SQLiteError{SQLiteError::Case::Prepare, message}) : message) + "main";
  }
  std::map<std::string, std::string> byTech;
  std::string lines;
  std::string failure;
  while (failure.empty() && sqlite3_step(statement) == SQLITE_ROW) {
    Row row;
    for (int i = 0; i < sqlite3_column_count(statement); ++i) {
      const auto* const text = reinterpret_cast<const char*>(sqlite3_column_text(statement, i));
      if (text == nullptr) failure = isList ? "EmptyQueryResultdatabase" : "EmptyQueryResultmain";
      row.emplace_back(text != nullptr ? text : "");
    }
    if (!failure.empty()) break;
    const bool isTime = parseWallClock(row[timeColumn]).has_value();
    if (isList) {
      byTech[row[0]] += row[0] + "|" + row[1] + "|" + row[3] + "|" + (isTime ? row[2] : "now") + "\n";
      continue;
    }
    if (!isTime) failure = "EmptyQueryResultdatabase";
    removeEnumeratorPrefix(row[4]);
    row[6] = row[6] == "1" ? "1" : "0";
    for (std::size_t i = 1; i < row.size(); ++i) lines += row[i] + (i + 1 < row.size() ? "|" : "\n");
  }
  for (const auto& [tech, rows] : byTech) lines += rows;
  if (!isList)
    lines += std::string("error occurred while fetching metric contents ") + sqlite3_errmsg(connection) + "\n";
  sqlite3_finalize(statement);
  return failure.empty() ? lines + "main" : failure;
}

void ReadingsDriver::compare(const std::string& sql, const std::string& answer, const std::string& expected) {
  ++reads_;
  // The last time is the comparison's own.
  const auto times = std::count(stepped_.begin(), stepped_.end(), sql);
  if (times == 1) ++readsFromMemory_;
  if (answer != expected && difference_.empty())
    difference_ = sql + "\nanswered\n" + answer + "\ninstead of\n" + expected;
}

void ReadingsDriver::pinOrUnpin() {
  const Metric metric = reading();
  const auto ignore = [](bool /*success*/, const auto& /*error*/) {};
  if (upTo(2) == 0) {
    database_->executeDashboardStatement(
        SQLTable<Metric>::pinAttribute(metric.metricTech, metric.attributeName.c_str(), metric.subsId), ignore);
  } else {
    database_->removeDashboardItem(metric.metricTech, metric.attributeName.c_str(), metric.subsId, ignore);
  }
  platform_.time.settle();
}

std::string ReadingsDriver::removal() {
  switch (upTo(4)) {
    case 0:
      return "DELETE FROM Metric WHERE Id % 3 == " + std::to_string(upTo(3));
    case 1:
      return "DELETE FROM Metric WHERE Id == (SELECT max(Id) FROM Metric)";
    case 2:
      return "DELETE FROM Metric WHERE collected_on == (SELECT max(collected_on) FROM Metric)";
    default:
      return "UPDATE Metric SET collected_on = datetime(collected_on, '+3 seconds'), attribute_value = 'moved' "
             "WHERE Id % 5 == " +
             std::to_string(upTo(5));
  }
}

void ReadingsDriver::writeByAnother() {
  if (sqlite3_get_autocommit(database_->dbPointer()) == 0) return;  // it would find the file locked
  switch (upTo(3)) {
    case 0:
      other_.run(removal());
      break;
    case 1:
      indexByAnother();
      break;
    default:
      other_.run(sqlRow());
  }
}

void ReadingsDriver::indexByAnother() {
  other_.run(hasIndex_ ? "DROP INDEX foreign_index"
                       : "CREATE INDEX foreign_index ON Metric(metric_name, collected_on DESC, Id DESC)");
  hasIndex_ = !hasIndex_;
  own("SELECT 1 FROM Metric LIMIT 1");  // or the next statement would speak of a schema that has changed
}

void ReadingsDriver::oddRowByAnother() {
  if (sqlite3_get_autocommit(database_->dbPointer()) == 0) return;
  constexpr const char* kOddities[] = {"attribute_name = NULL", "metric_tech = NULL",    "attribute_value = NULL",
                                       "collected_on = 7",      "collected_on = 'soon'", "metric_tech = x'4C5445'",
                                       "metric_id = NULL || 1", "subs_id = 4294967296",  "attribute_value = x'31'"};
  if (upTo(3) == 0) {
    other_.run(std::string("UPDATE OR IGNORE Metric SET ") + oneOf(kOddities, random_) + " WHERE Id % 40 == 0");
  } else {
    other_.run("DELETE FROM Metric WHERE Id % 40 == 0");
  }
}

void ReadingsDriver::own(const std::string& sql) {
  run(database_->dbPointer(), sql);
}

void ReadingsDriver::changeUntold() {
  own(upTo(2) == 0 ? removal() : sqlRow());
}

void ReadingsDriver::statementOnMetric() {
  database_->executeDashboardStatement(removal(), [](bool /*success*/, const auto& /*error*/) {});
  platform_.time.settle();
}

void ReadingsDriver::transaction() {
  if (sqlite3_get_autocommit(database_->dbPointer()) != 0) {
    own("BEGIN");
  } else {
    own(upTo(2) == 0 ? "COMMIT" : "ROLLBACK");
  }
}

void ReadingsDriver::thinOut() {
  if (sqlite3_get_autocommit(database_->dbPointer()) == 0) own("COMMIT");
  const std::string sql = "DELETE FROM Metric WHERE Id NOT IN (SELECT Id FROM Metric ORDER BY Id DESC LIMIT 40)";
  if (upTo(2) == 0) {
    other_.run(sql);
    other_.run("DELETE FROM Dashboard");
  } else {
    own(sql);
    own("DELETE FROM Dashboard");
  }
  rows_ = 40;
}

}  // namespace quorl::test
