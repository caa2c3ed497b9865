#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/DispatchGroup.h"
#include "base/NotificationCenter.h"
#include "base/RepeatingTimer.h"
#include "base/Signal.h"
#include "store/PersistanceStore.h"

namespace quorl {

/// One pinned attribute with its latest value.
struct DashboardViewModelObject {
  std::string metricTech;
  std::string metricName;
  std::string attributeNameNonLocalized;
  std::string attributeName;  // display name
  std::string attributeValue;
  Date timeStamp;
  std::optional<std::string> section;  // number of a "section-" attribute
};

/// One change of the rows, told after it has happened.
struct DashboardChange {
  enum class Kind { attributeValue, timeStamp, removed, appended };

  Kind kind;
  std::size_t index;  // of the row, for `removed` before it left

  friend bool operator==(const DashboardChange&, const DashboardChange&) = default;
};

class DashboardViewModelDelegate {
 public:
  virtual ~DashboardViewModelDelegate() = default;
  /// A tick of the timer has refreshed the rows at the time that `text` tells. Main thread.
  virtual void updateLastRefreshed(const std::string& text) = 0;
};

/// The pinned attributes of the current subscription, read again every 15 seconds, also while nobody looks. Fills the
/// dashboard with its default pins when fewer than two of its pins have a reading at the start. Main thread.
///
/// Loads may overlap; each has its own rows but all wait for the sum of what is being read.
class DashboardViewModel final : public std::enable_shared_from_this<DashboardViewModel> {
 public:
  /// `live` means that the timer runs. A seeding that fails stays `seeding` for good.
  enum class State { loading, seeding, live };
  using LoadCompletion =
      std::function<void(std::optional<std::vector<Metric>> rows, const std::optional<SQLiteError>& error)>;

  /// Starts the first load.
  static std::shared_ptr<DashboardViewModel> make(std::shared_ptr<PersistanceStore> store);
  DashboardViewModel(const DashboardViewModel&) = delete;
  DashboardViewModel& operator=(const DashboardViewModel&) = delete;

  /// Reads the pins of the current subscription and the latest value of each. Fewer than two values count as none.
  /// `completion` runs on the main queue, and on the database's for a pin that cannot be read; not at all when the
  /// model is gone. Changes no row.
  void loadDashboardData(LoadCompletion completion);
  /// A tick of the timer: takes over the latest values and has the time of it shown.
  void modifyRefresh();
  /// Takes over `rows`: rows on show keep their places, those without a reading in `rows` leave, new ones go to the
  /// end.
  void updateDashboardDataSource(const std::vector<Metric>& rows);

  const std::vector<DashboardViewModelObject>& metrics() const { return metrics_; }
  State state() const { return state_; }
  const std::shared_ptr<PersistanceStore>& persistanceStore() const { return persistanceStore_; }

  void setDelegate(std::weak_ptr<DashboardViewModelDelegate> delegate) { delegate_ = std::move(delegate); }
  [[nodiscard]] Connection onChange(Signal<const DashboardChange&>::Handler handler) {
    return changed_.connect(std::move(handler));
  }

 private:
  using SeedingCompletion = std::function<void(bool success)>;

  explicit DashboardViewModel(std::shared_ptr<PersistanceStore> store) : persistanceStore_(std::move(store)) {}

  void start();
  void startUpDidLoad(const std::optional<std::vector<Metric>>& rows, const std::optional<SQLiteError>& error);
  void seed();
  void loadInitialDashboard(SeedingCompletion completion);
  void loadSeededDashboard(SeedingCompletion completion);
  void startTimer();
  /// Takes over the latest values. Of a tick of the timer the delegate is told the time, of a notification it is not.
  void reload(bool isTick);
  void fetchReadings(const std::vector<DashboardTableItem>& pinned, LoadCompletion completion);

  const std::shared_ptr<PersistanceStore> persistanceStore_;
  std::weak_ptr<DashboardViewModelDelegate> delegate_;
  DispatchGroup group_;
  std::unique_ptr<RepeatingTimer> timer_;
  std::vector<DashboardViewModelObject> metrics_;
  State state_ = State::loading;
  Signal<const DashboardChange&> changed_;
  NotificationCenter::Observation subscriptionObservation_;
  NotificationCenter::Observation removalObservation_;
};

}  // namespace quorl
