#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/NotificationCenter.h"
#include "store/PersistanceStore.h"

namespace quorl {

/// One metric of the list.
struct AllMetricsRowItem {
  std::string metricName;
  Date timeStamp;  // when it was last seen
  std::int32_t subsId = 0;
};

/// The metrics of one technology.
struct AllMetricsDataSource {
  std::string metricTech;
  std::vector<AllMetricsRowItem> rowItems;
};

class AllMetricsViewModelDelegate {
 public:
  virtual ~AllMetricsViewModelDelegate() = default;
  /// The list has changed and is worth showing. Main thread.
  virtual void reloadMetricsList() = 0;
};

/// Every metric of the current subscription, by technology. Follows the store's new rows for as long as it holds the
/// store's delegate slot, and the choice of the subscription always. Main thread, except where told otherwise.
class AllMetricsViewModel final : public PersistanceStoreDelegate,
                                  public std::enable_shared_from_this<AllMetricsViewModel> {
 public:
  using LoadCompletion = std::function<void(bool success)>;

  /// Takes the store's delegate slot and starts the first load.
  static std::shared_ptr<AllMetricsViewModel> make(std::shared_ptr<PersistanceStore> store);
  AllMetricsViewModel(const AllMetricsViewModel&) = delete;
  AllMetricsViewModel& operator=(const AllMetricsViewModel&) = delete;

  /// Reads the list for the current subscription. `completion` receives true when there are at least two groups, and
  /// false after a failed read, which leaves the list as it was. It runs on the main queue, and for a row that cannot
  /// be read on the database's; not at all when the model is gone. It may be empty.
  void loadMetricList(LoadCompletion completion);

  /// A metric newer than its row, or without one, reloads the list. On the poster's thread.
  void processNewMetric(const Metric& metric) override;

  /// Whether `metricsList` has a group of this technology.
  bool isSectionNameExists(std::string_view metricTech) const;

  /// "RAT" first, then the technologies in ascending order. Empty before the first load.
  const std::vector<AllMetricsDataSource>& metricsList() const { return metricsList_; }
  const std::shared_ptr<PersistanceStore>& persistanceStore() const { return persistanceStore_; }

  void setDelegate(std::weak_ptr<AllMetricsViewModelDelegate> delegate) { delegate_ = std::move(delegate); }

 private:
  using ListCompletion = std::function<void(bool isReplaced, bool success)>;

  explicit AllMetricsViewModel(std::shared_ptr<PersistanceStore> store) : persistanceStore_(std::move(store)) {}

  void start();
  void load(ListCompletion completion);
  /// For the first load and a change of the subscription, where rows on show that are not in the list have to go.
  void loadAndReload();
  void fetchAvailableMetricsList(AvailableMetrics available, const std::optional<SQLiteError>& error,
                                 const ListCompletion& completion);
  bool isNewerThanItsRow(const Metric& metric) const;
  void reloadScreen();

  const std::shared_ptr<PersistanceStore> persistanceStore_;
  std::vector<AllMetricsDataSource> metricsList_;
  std::weak_ptr<AllMetricsViewModelDelegate> delegate_;
  NotificationCenter::Observation subscriptionObservation_;
};

}  // namespace quorl
