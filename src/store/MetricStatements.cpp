#include "store/MetricStatements.h"

#include <initializer_list>

#include "base/FatalStop.h"

namespace quorl {
namespace {

std::string concatenation(std::initializer_list<std::string_view> pieces) {
  std::size_t size = 0;
  for (const std::string_view piece : pieces) size += piece.size();
  std::string text;
  text.reserve(size);
  for (const std::string_view piece : pieces) text += piece;
  return text;
}

constexpr std::string_view kDailyAverageColumns =
    "select max(metric_tech) as 'metric_tech', max(metric_name) as 'metric_name',  max(attribute_name) as "
    "'attribute_name', avg(attribute_value) as 'attribute_value', attribute_value_type,  metric_id,  subs_id, "
    "strftime('%Y-%m-%d',collected_on) as 'collected_on' FROM Metric WHERE metric_name='";

constexpr std::string_view kDailyAverageGroups = " group by strftime('%Y-%m-%d', collected_on);";

}  // namespace

const char SQLTable<Metric>::createMetricTable[] =
    "  CREATE TABLE IF NOT EXISTS Metric(\n"
    "      Id INTEGER PRIMARY KEY AUTOINCREMENT,\n"
    "      metric_tech CHAR(255),\n"
    "      metric_name CHAR(255) NOT NULL,\n"
    "      attribute_name CHAR(255),\n"
    "      attribute_value TEXT,\n"
    "      attribute_value_type TEXT,\n"
    "      is_attribute_graphable INTEGER,\n"
    "      metric_id CHAR(255) NOT NULL,\n"
    "      subs_id INTEGER NOT NULL,\n"
    "      collected_on DATETIME NOT NULL\n"
    "    );";

// The foreign key is never enforced: pins survive the retention run and need no row of `Metric`.
const char SQLTable<Metric>::createDashboardTable[] =
    "  CREATE TABLE IF NOT EXISTS Dashboard(\n"
    "\"metric_tech\"    CHAR(255),\n"
    "    \"metric_id\"    CHAR(255) NOT NULL,\n"
    "    \"metric_name\"    CHAR(255) NOT NULL,\n"
    "    \"attribute_name\"    CHAR(255) NOT NULL,\n"
    "    \"subs_id\"    INTEGER NOT NULL,\n"
    "    \"metric_table_id\"    INTEGER NOT NULL UNIQUE,\n"
    "    PRIMARY KEY(\"metric_table_id\" AUTOINCREMENT),\n"
    "    CONSTRAINT \"fk_metric_table_id\" FOREIGN KEY(\"metric_table_id\") REFERENCES \"Metric\"(\"Id\") ON DELETE "
    "CASCADE);";

const char SQLTable<Metric>::insertMetric[] =
    "INSERT INTO Metric (metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
    "is_attribute_graphable, metric_id, subs_id, collected_on) VALUES (?, ?, ?, ?, ?, ?, ?, ?, datetime(?));";

const char kDeleteOlderRowsStatement[] = "   DELETE FROM Metric WHERE collected_on <= datetime('now', '-30 days');";

std::string SQLTable<Metric>::insertDashboardItem(const DashboardTableItem& item) {
  return concatenation(
      {"INSERT OR REPLACE INTO Dashboard (metric_tech, metric_id, metric_name, attribute_name, "
       "subs_id) VALUES (\"",
       item.metricTech, "\", \"", item.metricId, "\", \"", item.metricName, "\", \"", item.attributeName, "\", ",
       std::to_string(item.subsId), ");"});
}

std::string SQLTable<Metric>::pinAttribute(std::string_view metricTech, std::string_view attributeName,
                                           std::int32_t subsId) {
  return concatenation(
      {"INSERT OR REPLACE INTO Dashboard (metric_tech, metric_id, metric_name, attribute_name, "
       "subs_id) SELECT metric_tech, metric_id, metric_name, attribute_name, subs_id FROM Metric "
       "where metric_tech == \"",
       metricTech, "\" AND attribute_name == \"", attributeName, "\"  AND subs_id == ", std::to_string(subsId),
       " ORDER by collected_on DESC LIMIT 1;"});
}

std::string SQLTable<Metric>::removeDashboardItem(std::string_view metricTech, std::string_view attributeName,
                                                  std::int32_t subsId) {
  return concatenation({"DELETE from Dashboard WHERE metric_tech == \"", metricTech, "\" AND attribute_name == \"",
                        attributeName, "\" AND subs_id == ", std::to_string(subsId)});
}

std::string SQLTable<Metric>::availableMetrics(std::int32_t subsId) {
  return concatenation(
      {"SELECT *\n"
       "FROM (\n"
       "    SELECT  metric_tech, metric_name, collected_on, subs_id\n"
       "    FROM Metric WHERE subs_id == \"",
       std::to_string(subsId),
       "\"\n"
       "    ORDER BY collected_on DESC\n"
       ") AS sub\n"
       "GROUP BY metric_name"});
}

std::string SQLTable<Metric>::metricContents(std::string_view metricTech, std::string_view metricName,
                                             std::optional<std::string_view> attributeName, std::int32_t subsId) {
  const std::string subscription = std::to_string(subsId);
  if (attributeName) {
    return concatenation({"SELECT * from Metric where metric_tech == \"", metricTech, "\" AND metric_name == \"",
                          metricName, "\" AND attribute_name == \"", *attributeName, "\" AND subs_id == \"",
                          subscription, "\" ORDER BY collected_on DESC LIMIT 1"});
  }
  return concatenation(
      {"    SELECT *\n"
       "    FROM (\n"
       "    SELECT *\n"
       "    FROM Metric WHERE metric_tech == \"",
       metricTech, "\" AND metric_name == \"", metricName, "\" AND subs_id == \"", subscription,
       "\"\n"
       "    ORDER BY collected_on DESC\n"
       "    ) AS sub\n"
       "    GROUP BY attribute_name"});
}

std::string SQLTable<Metric>::attributeHistory(std::string_view metricName, std::string_view attributeName,
                                               AttributeDetailTimeFrame timeFrame, std::int32_t currentSubsId) {
  switch (timeFrame) {
    case AttributeDetailTimeFrame::daily:
      return concatenation(
          {"        SELECT metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
           "metric_id, subs_id, collected_on from Metric WHERE metric_name ==\"",
           metricName, "\" AND attribute_name ==\"", attributeName, "\" AND subs_id == ", std::to_string(currentSubsId),
           " AND collected_on >= datetime('now', 'localtime', 'start of day')"});
    case AttributeDetailTimeFrame::weekly:
      return concatenation({kDailyAverageColumns, metricName, "' AND attribute_name ='", attributeName,
                            "' AND collected_on >= datetime('now', '-7 days')", kDailyAverageGroups});
    case AttributeDetailTimeFrame::monthly:
      return concatenation({"  ", kDailyAverageColumns, metricName, "' AND attribute_name ='", attributeName,
                            "' AND collected_on >= datetime('now', '-30 days')", kDailyAverageGroups});
  }
  fatalStop("AttributeDetailTimeFrame: no such case");
}

std::string SQLTable<Metric>::dashboard(std::int32_t subsId) {
  return concatenation(
      {"SELECT * FROM Dashboard WHERE subs_id == ", std::to_string(subsId), " GROUP BY attribute_name"});
}

bool changesDashboardAlone(std::string_view sql) {
  return sql.starts_with("INSERT OR REPLACE INTO Dashboard (") || sql.starts_with("DELETE from Dashboard WHERE ");
}

const char* exportStatement(AttributeDetailTimeFrame timeFrame) {
  switch (timeFrame) {
    case AttributeDetailTimeFrame::daily:
      return "SELECT metric_tech, metric_name, attribute_name, attribute_value, subs_id, metric_id,collected_on from "
             "Metric WHERE collected_on >= datetime('now', 'localtime', 'start of day')";
    case AttributeDetailTimeFrame::weekly:
      return "SELECT metric_tech, metric_name, attribute_name, attribute_value, subs_id, metric_id,collected_on from "
             "Metric WHERE collected_on >= datetime('now', 'start of day', '-7 days')";
    case AttributeDetailTimeFrame::monthly:
      return "SELECT metric_tech, metric_name, attribute_name, attribute_value, subs_id, metric_id,collected_on from "
             "Metric WHERE collected_on >= datetime('now', 'start of day', '-30 days')";
  }
  fatalStop("AttributeDetailTimeFrame: no such case");
}

}  // namespace quorl
