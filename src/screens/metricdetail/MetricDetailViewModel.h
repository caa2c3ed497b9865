#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/DispatchGroup.h"
#include "base/Signal.h"
#include "screens/metricdetail/MetricSections.h"
#include "store/PersistanceStore.h"

namespace quorl {

class MetricDetailViewModelDelegate {
 public:
  virtual ~MetricDetailViewModelDelegate() = default;
  /// The bookmarks have been marked. Main thread.
  virtual void refresh() = 0;
};

/// The latest value of each attribute of one metric. Follows its metric live for as long as it holds the store's
/// delegate slot. Main thread, except where told otherwise.
///
/// While a load is under way, those asked for meanwhile wait and join: one for each subscription follows, in the order
/// in which each was last asked for, and sees every row that was announced before. So no announced row goes unread, and
/// the loads do not fall behind the rows. A failed load is logged once for each time that it was asked for.
class MetricDetailViewModel final : public PersistanceStoreDelegate,
                                    public std::enable_shared_from_this<MetricDetailViewModel> {
 public:
  /// Takes the store's delegate slot and starts the first load.
  static std::shared_ptr<MetricDetailViewModel> make(std::shared_ptr<PersistanceStore> store, std::string metricTech,
                                                     std::string metricName, std::int32_t subsId, Date collectedOn);
  MetricDetailViewModel(const MetricDetailViewModel&) = delete;
  MetricDetailViewModel& operator=(const MetricDetailViewModel&) = delete;

  /// The rows on show, sorted by the name shown.
  const std::vector<Metric>& metrics() const { return metrics_; }
  /// Copies of the rows, grouped; for "CA Status" only.
  const std::vector<MetricSectional>& metricSectionals() const { return metricSectionals_; }
  const std::shared_ptr<PersistanceStore>& persistanceStore() const { return persistanceStore_; }
  const std::string& metricTech() const { return metricTech_; }
  const std::string& metricName() const { return metricName_; }
  std::int32_t subsId() const { return subsId_; }
  /// When the last load ended, and before it what the model was made with.
  Date collectedOn() const { return collectedOn_; }
  /// True from the start until the first read returns, or for 30 seconds.
  bool shouldShowSPinner() const { return shouldShowSPinner_; }

  void setDelegate(std::weak_ptr<MetricDetailViewModelDelegate> delegate) { delegate_ = std::move(delegate); }
  [[nodiscard]] Connection onChange(Signal<>::Handler handler) { return changed_.connect(std::move(handler)); }

  /// Reads the metric again, for the subscription of `metric`, if it is the model's own; now or after the load under
  /// way. On the poster's thread, which is the main one.
  void processNewMetric(const Metric& metric) override;

  /// Row `index`, or the row of a section when `isSectioned`. Null when there is none.
  const Metric* row(std::size_t index, std::size_t sectionIndex, bool isSectioned) const;
  /// Pins a row's attribute on the dashboard, or unpins it. A failure is logged and changes nothing.
  void updateDashboardItem(std::size_t index, bool isBookmarked, std::size_t sectionIndex, bool isSectioned);

 private:
  MetricDetailViewModel(std::shared_ptr<PersistanceStore> store, std::string metricTech, std::string metricName,
                        std::int32_t subsId, Date collectedOn);

  /// What several requests have in common.
  struct Load {
    std::int32_t subsId;
    std::size_t requests;
  };

  void requestLoad(std::int32_t subsId);
  void startWaitingLoads();
  void start(const Load& load);
  void loadDidEnd(const std::vector<DashboardTableItem>& pinned);
  void scheduleEndOfSpinner();
  void contentsDidLoad(std::vector<Metric> rows, const std::optional<SQLiteError>& error, std::size_t requests);
  void endSpinner();
  void apply(std::vector<Metric> rows);
  void applyLastSeen();
  void applySectionRules();
  void markBookmarks(const std::vector<DashboardTableItem>& pinned);
  void pin(const Metric& metric);
  void unpin(const Metric& metric);

  const std::shared_ptr<PersistanceStore> persistanceStore_;
  const std::string metricTech_;
  const std::string metricName_;
  const std::int32_t subsId_;
  DispatchGroup group_;  // of all loads under way: the bookmarks wait for the sum of them
  std::size_t loadsUnderWay_ = 0;
  std::vector<Load> waitingLoads_;  // one for each subscription
  std::vector<Metric> metrics_;
  std::vector<MetricSectional> metricSectionals_;
  Date collectedOn_;
  bool shouldShowSPinner_ = true;
  std::weak_ptr<MetricDetailViewModelDelegate> delegate_;
  Signal<> changed_;
};

}  // namespace quorl
