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
///
/// At most one read is under way. A request to load that comes meanwhile joins the one read that follows it, together
/// with all others that come until then: that read is of the subscription that is current when it starts, and sees
/// every row that was announced before. So no announced row goes unread, and the reads do not fall behind the rows.
/// Each request logs its lines as if it had a read of its own, in the order of the requests; the screen is reloaded
/// once for each read.
class AllMetricsViewModel final : public PersistanceStoreDelegate,
                                  public std::enable_shared_from_this<AllMetricsViewModel> {
 public:
  using LoadCompletion = std::function<void(bool success)>;

  /// Takes the store's delegate slot and starts the first load.
  static std::shared_ptr<AllMetricsViewModel> make(std::shared_ptr<PersistanceStore> store);
  AllMetricsViewModel(const AllMetricsViewModel&) = delete;
  AllMetricsViewModel& operator=(const AllMetricsViewModel&) = delete;

  /// Reads the list for the current subscription, now or after the read under way. `completion` receives true when
  /// there are at least two groups, and false after a failed read, which leaves the list as it was. It runs on the main
  /// queue, and for a row that cannot be read on the database's; not at all when the model is gone. It may be empty.
  void loadMetricList(LoadCompletion completion);

  /// A metric newer than its row, or without one, reloads the list, by a read that sees it. On the poster's thread,
  /// which is the main one.
  void processNewMetric(const Metric& metric) override;

  /// Whether `metricsList` has a group of this technology.
  bool isSectionNameExists(std::string_view metricTech) const;

  /// "RAT" first, then the technologies in ascending order. Empty before the first load.
  const std::vector<AllMetricsDataSource>& metricsList() const { return metricsList_; }
  const std::shared_ptr<PersistanceStore>& persistanceStore() const { return persistanceStore_; }

  void setDelegate(std::weak_ptr<AllMetricsViewModelDelegate> delegate) { delegate_ = std::move(delegate); }

 private:
  /// Who asks for a load.
  struct Request {
    enum class Kind {
      list,       // the list itself has to change: the first load, and a change of the subscription
      newMetric,  // an announced metric
      caller,     // `loadMetricList`
    };
    Kind kind;
    LoadCompletion completion;  // of a caller; may be empty
  };

  explicit AllMetricsViewModel(std::shared_ptr<PersistanceStore> store) : persistanceStore_(std::move(store)) {}

  void start();
  void load(Request request);
  void read();
  void readDidEnd();
  void fetchAvailableMetricsList(AvailableMetrics available, const std::optional<SQLiteError>& error,
                                 const std::vector<Request>& requests);
  void replaceList(AvailableMetrics available);
  static void reportFailure(const SQLiteError& error, const std::vector<Request>& requests);
  bool isNewerThanItsRow(const Metric& metric) const;
  void reloadScreen();

  const std::shared_ptr<PersistanceStore> persistanceStore_;
  std::vector<AllMetricsDataSource> metricsList_;
  std::vector<Request> waiting_;  // for the read that follows the one under way
  bool isReading_ = false;
  std::weak_ptr<AllMetricsViewModelDelegate> delegate_;
  NotificationCenter::Observation subscriptionObservation_;
};

}  // namespace quorl
