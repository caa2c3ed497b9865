#include "store/PersistanceStore.h"

#include <utility>

#include "app/HardwareManager.h"
#include "base/FatalStop.h"
#include "intake/MetricService.h"
#include "platform/Platform.h"
#include "shell/Logs.h"
#include "shell/NotificationNames.h"
#include "store/DefaultDashboard.h"
#include "store/MetricStatements.h"
#include "telephony/HorvaneService.h"

namespace quorl {
namespace {

// Names for the log alone; the first is not that of the table.
constexpr char kMetricTableName[] = "MetricV20";
constexpr char kDashboardTableName[] = "Dashboard";

PersistanceStoreErrors unableToCreateTables(std::string message) {
  return {PersistanceStoreErrors::Case::unableToCreateTables, std::move(message)};
}

}  // namespace

std::string logText(const PersistanceStoreErrors& error) {
  switch (error.kind) {
    case PersistanceStoreErrors::Case::unableToOpenDB:
      return caseDescription("unableToOpenDB", error.message);
    case PersistanceStoreErrors::Case::unableToCreateTables:
      return caseDescription("unableToCreateTables", error.message);
  }
  fatalStop("PersistanceStoreErrors: no such case");
}

PersistanceStore::PersistanceStore(HardwareManager& hardwareManager, ZelkorWrapper& zelkorWrapper)
    : hardwareManager_(hardwareManager), zelkorWrapper_(zelkorWrapper) {
  createTables([this, life = std::weak_ptr(life_)](bool success, const std::optional<PersistanceStoreErrors>& error) {
    if (!success) {
      databaseLog.log("unable to create tables %{public}s", error.value_or(unableToCreateTables("")));
      return;
    }
    if (!life.expired()) tablesCreated();
  });
  horvaneService();
  metricService();
  NotificationCenter& center = NotificationCenter::defaultCenter();
  const auto handler = [this](const Notification& notification) { processNewMetric(notification); };
  newZelkorMetric_ = center.observe(notification::kNewZelkorMetric, handler);
  newHVMetric_ = center.observe(notification::kNewHVMetric, handler);
}

PersistanceStore::~PersistanceStore() = default;

SQLiteDatabase& PersistanceStore::database() {
  if (!database_) {
    const std::optional<std::string> path = databasePath();
    if (!path) fatalStop("databasePath is nil");
    auto opened = SQLiteDatabase::open(*path);
    if (!opened) fatalStop(logText(opened.error()));
    database_ = *std::move(opened);
    databaseLog.log("Successfully opened connection to database.");
  }
  return *database_;
}

HorvaneService& PersistanceStore::horvaneService() {
  if (!horvaneService_) horvaneService_ = HorvaneService::make(*this);
  return *horvaneService_;
}

MetricService& PersistanceStore::metricService() {
  if (!metricService_) metricService_ = MetricService::make(*this, zelkorWrapper_);
  return *metricService_;
}

void PersistanceStore::createTables(TablesCompletion completion) {
  // One flag for both tables: it ends as the outcome of the last.
  const auto result = std::make_shared<bool>(false);
  const auto tableCreated = [group = group_, result, completion](bool success,
                                                                 const std::optional<SQLiteError>& error) mutable {
    *result = success;
    if (!success) completion(false, unableToCreateTables(error ? logText(*error) : std::string()));
    group.leave();
  };
  group_.enter();
  database().createTable(SQLTable<Metric>::createMetricTable, kMetricTableName, tableCreated);
  group_.enter();
  database().createTable(SQLTable<Metric>::createDashboardTable, kDashboardTableName, tableCreated);
  group_.notify(Platform::current().mainQueue, [result, completion = std::move(completion)] {
    if (*result) {
      completion(true, std::nullopt);
    } else {
      completion(false, unableToCreateTables(""));
    }
  });
}

void PersistanceStore::tablesCreated() {
  databaseLog.log("successfully created tables");
  database().deleteOlderRows([](bool success) {
    if (success) {
      databaseLog.log("successfully deleted older rows");
    } else {
      databaseLog.log("unable to delete older rows");
    }
  });
}

void PersistanceStore::loadInitialDashboard(WriteCompletion completion) {
  for (Metric& row : defaultDashboard(hardwareManager_.isMavDevice(), Platform::current().clock.now())) {
    firstTimeDashboard_.enter();
    const DashboardTableItem item{std::move(row.metricTech), std::move(row.metricId), std::move(row.metricName),
                                  std::move(row.attributeName), row.subsId};
    database().executeDashboardStatement(
        SQLTable<Metric>::insertDashboardItem(item),
        [group = firstTimeDashboard_](bool success, const std::optional<SQLiteError>& error) mutable {
          if (success) {
            databaseLog.log("inserted successfully");
          } else {
            databaseLog.log("insert dashboard failed, error: %{public}s", error.value_or(SQLiteError{}));
          }
          group.leave();
        });
  }
  firstTimeDashboard_.notify(Platform::current().mainQueue,
                             [completion = std::move(completion)] { completion(true, std::nullopt); });
}

void PersistanceStore::processNewMetric(const Notification& notification) {
  const auto* metric = notification.entry<Metric>(notification::kMetricObjectKey);
  if (metric == nullptr) return;
  if (const auto delegate = storeDelegate()) delegate->processNewMetric(*metric);
}

void PersistanceStore::executeDashboardStatement(std::string sql, WriteCompletion completion) {
  database().executeDashboardStatement(std::move(sql), std::move(completion));
}

void PersistanceStore::removeDashboardItem(std::string_view metricTech, std::string_view attributeName,
                                           std::int32_t subsId, WriteCompletion completion) {
  database().removeDashboardItem(metricTech, attributeName, subsId, std::move(completion));
}

void PersistanceStore::insertMetric(Metric metric, WriteCompletion completion) {
  database().insertMetric(std::move(metric), std::move(completion));
}

void PersistanceStore::fetchAvailableMetrics(std::int32_t subsId, AvailableMetricsCompletion completion) {
  database().fetchAvailableMetrics(subsId, std::move(completion));
}

void PersistanceStore::fetchMetricContents(std::string_view metricTech, std::string_view metricName,
                                           std::optional<std::string_view> attributeName, std::int32_t subsId,
                                           MetricsCompletion completion) {
  database().fetchMetricContents(metricTech, metricName, attributeName, subsId, std::move(completion));
}

void PersistanceStore::fetchAttributeHistory(std::string_view metricName, std::string_view attributeName,
                                             AttributeDetailTimeFrame timeFrame, MetricsCompletion completion) {
  database().fetchAttributeHistory(metricName, attributeName, timeFrame, std::move(completion));
}

void PersistanceStore::fetchDashboard(std::int32_t subsId, DashboardCompletion completion) {
  database().fetchDashboard(subsId, std::move(completion));
}

void PersistanceStore::exportMetrics(AttributeDetailTimeFrame timeFrame, ExportCompletion completion) {
  database().exportMetrics(timeFrame, std::move(completion));
}

}  // namespace quorl
