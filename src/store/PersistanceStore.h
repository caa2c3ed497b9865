#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "base/DispatchGroup.h"
#include "base/NotificationCenter.h"
#include "store/DBManager.h"
#include "store/PersistanceStoreDelegate.h"
#include "store/PersistanceStoreProtocol.h"

namespace quorl {

class HardwareManager;
class HorvaneService;
class MetricService;
class ZelkorWrapper;

/// Why the store did not come up.
struct PersistanceStoreErrors {
  enum class Case {
    unableToOpenDB,  // nothing raises it: without a database the process stops
    unableToCreateTables,
  };

  Case kind = Case::unableToCreateTables;
  std::string message;

  friend bool operator==(const PersistanceStoreErrors&, const PersistanceStoreErrors&) = default;
};

/// `unableToCreateTables(message: "...")`.
std::string logText(const PersistanceStoreErrors& error);

/// The one gateway to the database, and the owner of the two metric sources. Lives as long as the process.
///
/// Main thread. Completions run where `SQLiteDatabase` says.
class PersistanceStore final : public PersistanceStoreProtocol {
 public:
  using TablesCompletion = std::function<void(bool success, std::optional<PersistanceStoreErrors> error)>;

  /// Queues the creation of the tables, which the retention run follows, and only then starts the metric sources, so
  /// that no insert overtakes the tables. A database that cannot be opened ends the process. Both arguments must
  /// outlive the store.
  PersistanceStore(HardwareManager& hardwareManager, ZelkorWrapper& zelkorWrapper);
  ~PersistanceStore() override;
  PersistanceStore(const PersistanceStore&) = delete;
  PersistanceStore& operator=(const PersistanceStore&) = delete;

  /// Made on first use from the file at `databasePath()`; no path or no database ends the process.
  SQLiteDatabase& database();
  HorvaneService& horvaneService();
  MetricService& metricService();
  HardwareManager& hardwareManager() const { return hardwareManager_; }
  ZelkorWrapper& zelkorWrapper() const { return zelkorWrapper_; }

  /// One slot: the last object set wins, and the slot is empty again once that is gone.
  void setStoreDelegate(std::weak_ptr<PersistanceStoreDelegate> delegate) { storeDelegate_ = std::move(delegate); }
  std::shared_ptr<PersistanceStoreDelegate> storeDelegate() const { return storeDelegate_.lock(); }

  /// Creates what is missing of both tables. Each table that fails is reported at once, on the database's queue; in
  /// the end the outcome of the last table is reported on the main queue. So `completion` may be called up to three
  /// times, and a failure may be followed by a success.
  void createTables(TablesCompletion completion);
  /// Puts the default attributes of the device on the dashboard, on top of what is there. Completes with success on
  /// the main queue, whatever became of the rows: a row that fails is logged and does not stop the others.
  void loadInitialDashboard(WriteCompletion completion);
  /// See `SQLiteDatabase`.
  void executeDashboardStatement(std::string sql, WriteCompletion completion);
  void removeDashboardItem(std::string_view metricTech, std::string_view attributeName, std::int32_t subsId,
                           WriteCompletion completion);

  void insertMetric(Metric metric, WriteCompletion completion) override;
  void fetchAvailableMetrics(std::int32_t subsId, AvailableMetricsCompletion completion) override;
  void fetchMetricContents(std::string_view metricTech, std::string_view metricName,
                           std::optional<std::string_view> attributeName, std::int32_t subsId,
                           MetricsCompletion completion) override;
  void fetchAttributeHistory(std::string_view metricName, std::string_view attributeName,
                             AttributeDetailTimeFrame timeFrame, MetricsCompletion completion) override;
  void fetchDashboard(std::int32_t subsId, DashboardCompletion completion) override;
  void exportMetrics(AttributeDetailTimeFrame timeFrame, ExportCompletion completion) override;

 private:
  void tablesCreated();
  void processNewMetric(const Notification& notification);

  std::shared_ptr<SQLiteDatabase> database_;
  DispatchGroup group_;               // table creation
  DispatchGroup firstTimeDashboard_;  // insertion of the default dashboard
  std::weak_ptr<PersistanceStoreDelegate> storeDelegate_;
  HardwareManager& hardwareManager_;
  std::shared_ptr<HorvaneService> horvaneService_;
  std::shared_ptr<MetricService> metricService_;
  ZelkorWrapper& zelkorWrapper_;
  // Tells the start-up completion, which waits on the main queue, that there still is a store.
  std::shared_ptr<const bool> life_ = std::make_shared<const bool>(true);
  NotificationCenter::Observation newZelkorMetric_;
  NotificationCenter::Observation newHVMetric_;
};

}  // namespace quorl
