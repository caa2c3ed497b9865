#include "store/KeptReadings.h"

#include <algorithm>
#include <iterator>
#include <limits>

#include <sqlite3.h>

#include "store/ConnectionLock.h"
#include "store/MetricStatements.h"
#include "store/StatementHandle.h"

namespace quorl::store_detail {
namespace {

/// Null if `sql` does not prepare.
StatementHandle prepare(sqlite3* connection, const char* sql) {
  sqlite3_stmt* statement = nullptr;
  sqlite3_prepare_v2(connection, sql, -1, &statement, nullptr);
  return StatementHandle(statement);
}

// Begins a transaction, which is when the connection takes notice of other ones, and reads next to nothing.
constexpr char kLook[] = "SELECT 1 FROM Metric LIMIT 1";

// The latest rows come first, so that few of the others count.
constexpr char kAllReadings[] =
    "SELECT metric_tech, metric_name, attribute_name, subs_id, collected_on, attribute_value, attribute_value_type, "
    "is_attribute_graphable, metric_id FROM Metric ORDER BY Id DESC";

constexpr char kSchemaOfMetric[] = "SELECT sql FROM sqlite_master WHERE tbl_name = 'Metric'";

// In double quotes these are columns of the table, whatever was meant.
constexpr std::string_view kColumns[] = {"id",
                                         "metric_tech",
                                         "metric_name",
                                         "attribute_name",
                                         "attribute_value",
                                         "attribute_value_type",
                                         "is_attribute_graphable",
                                         "metric_id",
                                         "subs_id",
                                         "collected_on",
                                         "rowid",
                                         "oid",
                                         "_rowid_"};

char lowercase(char character) {
  return character >= 'A' && character <= 'Z' ? static_cast<char>(character - 'A' + 'a') : character;
}

bool isColumn(std::string_view value) {
  return std::any_of(std::begin(kColumns), std::end(kColumns), [&](std::string_view column) {
    return std::equal(value.begin(), value.end(), column.begin(), column.end(),
                      [](char a, char b) { return lowercase(a) == b; });
  });
}

/// The part of a CREATE statement that a database file keeps as it was written.
std::string_view definition(std::string_view createStatement) {
  const std::size_t begin = createStatement.find("Metric(");
  if (begin == std::string_view::npos) return {};
  return createStatement.substr(begin, createStatement.rfind(')') + 1 - begin);
}

/// The columns of a row, and whether they all are what this program writes.
class PlainRow {
 public:
  explicit PlainRow(sqlite3_stmt* statement) : statement_(statement) {}

  std::string_view text(int column) {
    if (sqlite3_column_type(statement_, column) != SQLITE_TEXT) {
      isPlain_ = false;
      return {};
    }
    const auto* const bytes = reinterpret_cast<const char*>(sqlite3_column_text(statement_, column));
    if (bytes == nullptr) {  // out of memory
      isPlain_ = false;
      return {};
    }
    const std::string_view text(bytes, static_cast<std::size_t>(sqlite3_column_bytes(statement_, column)));
    if (text.find('\0') != std::string_view::npos) isPlain_ = false;
    return text;
  }
  std::int32_t integer(int column) {
    const sqlite3_int64 value = sqlite3_column_int64(statement_, column);
    if (sqlite3_column_type(statement_, column) != SQLITE_INTEGER || value < std::numeric_limits<std::int32_t>::min() ||
        value > std::numeric_limits<std::int32_t>::max())
      isPlain_ = false;
    return static_cast<std::int32_t>(value);
  }
  bool isPlain() const { return isPlain_; }

 private:
  sqlite3_stmt* const statement_;
  bool isPlain_ = true;
};

}  // namespace

bool KeptReadings::areKept() {
  return QUORL_LATEST_READINGS != 0;
}

bool KeptReadings::areTakenAsTexts(std::initializer_list<std::string_view> values) {
  return std::none_of(values.begin(), values.end(), [](std::string_view value) {
    return value.find('"') != std::string_view::npos || value.find('\0') != std::string_view::npos || isColumn(value);
  });
}

KeptReadings::Seen KeptReadings::seen() const {
  Seen seen;
  seen.changes = sqlite3_total_changes64(connection_);
  sqlite3_file_control(connection_, "main", SQLITE_FCNTL_DATA_VERSION, &seen.version);
  return seen;
}

bool KeptReadings::hasChangedByOne(std::int64_t changes) const {
  // Somebody's own transaction may be rolled back.
  return sqlite3_get_autocommit(connection_) != 0 && seen() == Seen{seen_.changes + changes, seen_.version + 1};
}

void KeptReadings::giveUp() {
  if (stage_ != Stage::unread) readings_.clear();
  stage_ = Stage::unread;
}

const LatestReadings* KeptReadings::current() {
  if (!areKept() || stage_ == Stage::unread) return nullptr;
  if (!looksAtFile() || seen() != seen_) {
    giveUp();
    return nullptr;
  }
  if (stage_ == Stage::read) {
    stage_ = load();
    if (stage_ != Stage::kept) readings_.clear();
  }
  return stage_ == Stage::kept ? &readings_ : nullptr;
}

void KeptReadings::statementHasAnswered() {
  if (!areKept() || stage_ != Stage::unread) return;
  seen_ = seen();
  stage_ = Stage::read;
}

void KeptReadings::hasInserted(const StoredReading& row) {
  if (stage_ == Stage::unread) return;
  if (!hasChangedByOne(1)) return giveUp();
  seen_ = {seen_.changes + 1, seen_.version + 1};
  if (stage_ == Stage::kept) readings_.add(row);
}

void KeptReadings::dashboardHasChanged() {
  if (stage_ == Stage::unread) return;
  const std::int64_t changes = sqlite3_changes64(connection_);
  if (!hasChangedByOne(changes)) return giveUp();
  seen_ = {seen_.changes + changes, seen_.version + 1};
}

bool KeptReadings::looksAtFile() const {
  if (sqlite3_get_autocommit(connection_) == 0) return false;
  const StatementHandle statement = prepare(connection_, kLook);
  if (!statement) return false;
  const int result = sqlite3_step(statement.get());
  return result == SQLITE_ROW || result == SQLITE_DONE;
}

bool KeptReadings::isOwnTable() const {
  const StatementHandle statement = prepare(connection_, kSchemaOfMetric);
  if (!statement || sqlite3_step(statement.get()) != SQLITE_ROW) return false;
  PlainRow row(statement.get());
  const std::string_view sql = row.text(0);
  const bool isOwn = row.isPlain() && definition(sql) == definition(SQLTable<Metric>::createMetricTable);
  return isOwn && sqlite3_step(statement.get()) == SQLITE_DONE;  // no index, whose order would tell in ties
}

KeptReadings::Stage KeptReadings::load() {
  if (!isOwnTable()) return Stage::refused;
  const StatementHandle statement = prepare(connection_, kAllReadings);
  if (!statement) return Stage::unread;
  const ConnectionLock lock(connection_);  // once for all rows
  int result = sqlite3_step(statement.get());
  if (seen() != seen_) return Stage::unread;
  for (; result == SQLITE_ROW; result = sqlite3_step(statement.get())) {
    PlainRow row(statement.get());
    StoredReading key;
    key.metricTech = row.text(0);
    key.metricName = row.text(1);
    key.attributeName = row.text(2);
    key.subsId = row.integer(3);
    key.collectedOn = row.text(4);
    readings_.addEarlier(key, [&](StoredReading& reading) {
      reading.attributeValue = row.text(5);
      reading.attributeValueType = row.text(6);
      reading.graphable = row.integer(7) == 1;
      reading.metricId = row.text(8);
    });
    if (!row.isPlain()) return Stage::refused;
  }
  return result == SQLITE_DONE ? Stage::kept : Stage::unread;
}

}  // namespace quorl::store_detail
