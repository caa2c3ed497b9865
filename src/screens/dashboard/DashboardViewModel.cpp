#include "screens/dashboard/DashboardViewModel.h"

#include <chrono>
#include <map>
#include <utility>

#include "app/HardwareManager.h"
#include "platform/Platform.h"
#include "screens/metricdetail/MetricSections.h"
#include "shell/Logs.h"
#include "shell/NotificationNames.h"
#include "shell/TimeTexts.h"

namespace quorl {
namespace {

constexpr std::chrono::seconds kRefreshInterval{15};
/// A dashboard with a single reading counts as empty.
constexpr std::size_t kFewestReadings = 2;

/// An error for the log, where none reads "nil".
struct Description {
  const std::optional<SQLiteError>& error;
};

std::string logText(const Description& description) {
  return description.error ? logText(*description.error) : "nil";
}

DashboardViewModelObject shown(const Metric& row) {
  return {row.metricTech,
          row.metricName,
          row.attributeNameNonLocalized,
          row.attributeName,
          row.attributeValue,
          row.collectedOn,
          sectionNumberOf(row.attributeNameNonLocalized)};
}

std::string keyOf(const DashboardViewModelObject& object) {
  return object.metricName + object.attributeName;
}

}  // namespace

std::shared_ptr<DashboardViewModel> DashboardViewModel::make(std::shared_ptr<PersistanceStore> store) {
  std::shared_ptr<DashboardViewModel> model(new DashboardViewModel(std::move(store)));
  model->start();
  return model;
}

void DashboardViewModel::start() {
  const auto reloadUnlessGone = [weak = weak_from_this()](const Notification&) {
    if (const auto self = weak.lock()) self->reload(/*isTick=*/false);
  };
  NotificationCenter& center = NotificationCenter::defaultCenter();
  subscriptionObservation_ = center.observe(notification::kSubsIdSelectionChange, reloadUnlessGone);
  removalObservation_ = center.observe(notification::kRemovedDashboardMetric, reloadUnlessGone);
  dashboardLog.log("DashboardViewModel -  init");
  loadDashboardData(
      [weak = weak_from_this()](std::optional<std::vector<Metric>> rows, const std::optional<SQLiteError>& error) {
        if (const auto self = weak.lock()) self->startUpDidLoad(rows, error);
      });
}

void DashboardViewModel::startUpDidLoad(const std::optional<std::vector<Metric>>& rows,
                                        const std::optional<SQLiteError>& error) {
  if (rows) {
    dashboardLog.log("DashboardViewModel -  init -  loadDashboardData success");
    updateDashboardDataSource(*rows);
    startTimer();
    return;
  }
  dashboardLog.log("DashboardViewModel -  init -  loadDashboardData %{public}s", Description{error});
  if (Platform::current().mainQueue.isCurrent()) {
    seed();
    return;
  }
  Platform::current().mainQueue.async([weak = weak_from_this()] {  // a pin that cannot be read is reported elsewhere
    if (const auto self = weak.lock()) self->seed();
  });
}

void DashboardViewModel::seed() {
  loadInitialDashboard([weak = weak_from_this()](bool success) {
    const auto self = weak.lock();
    if (success && self) self->startTimer();
  });
}

void DashboardViewModel::loadInitialDashboard(SeedingCompletion completion) {
  state_ = State::seeding;
  dashboardLog.log("DashboardViewModel -  loadInitialDashboard() ");
  persistanceStore_->loadInitialDashboard(
      [weak = weak_from_this(), completion = std::move(completion)](bool success, std::optional<SQLiteError> error) {
        if (!success) {
          dashboardLog.log("loadInitialDashboard - failed: %{public}s", Description{error});
          return;
        }
        if (const auto self = weak.lock()) self->loadSeededDashboard(completion);
      });
}

void DashboardViewModel::loadSeededDashboard(SeedingCompletion completion) {
  loadDashboardData([weak = weak_from_this(), completion = std::move(completion)](
                        std::optional<std::vector<Metric>> rows, const std::optional<SQLiteError>& error) {
    const auto self = weak.lock();
    if (rows && self) {
      dashboardLog.log("DashboardViewModel -  init -  loadInitialDashboard success");
      self->updateDashboardDataSource(*rows);
    } else {
      dashboardLog.log("DashboardViewModel -  init -  loadInitialDashboard failed: %{public}s", Description{error});
    }
    completion(rows.has_value());
  });
}

void DashboardViewModel::startTimer() {
  timer_ = std::make_unique<RepeatingTimer>(Platform::current().mainQueue, kRefreshInterval, [weak = weak_from_this()] {
    if (const auto self = weak.lock()) self->modifyRefresh();
  });
  state_ = State::live;
}

void DashboardViewModel::modifyRefresh() {
  reload(/*isTick=*/true);
}

void DashboardViewModel::reload(bool isTick) {
  loadDashboardData([weak = weak_from_this(), isTick](std::optional<std::vector<Metric>> rows,
                                                      const std::optional<SQLiteError>& error) {
    if (!rows) {
      dashboardLog.error("error  ---> %{public}s", Description{error});
      return;
    }
    const auto self = weak.lock();
    if (!self) return;
    self->updateDashboardDataSource(*rows);
    if (!isTick) return;
    if (const auto delegate = self->delegate_.lock())
      delegate->updateLastRefreshed(dateText(Platform::current().clock.now()));
  });
}

void DashboardViewModel::loadDashboardData(LoadCompletion completion) {
  dashboardLog.log("DashboardViewModel -  loadDashboardData() ");
  persistanceStore_->fetchDashboard(
      HardwareManager::shared().currentSubsId(),
      [weak = weak_from_this(), completion = std::move(completion)](std::vector<DashboardTableItem> pinned,
                                                                    std::optional<SQLiteError> error) {
        const auto self = weak.lock();
        if (!self) return;
        if (error || pinned.empty()) {
          dashboardLog.log("DashboardViewModel -  loadDashboardData - dashboardList.isempty");
          completion(std::nullopt, error);
          return;
        }
        dashboardLog.log("DashboardViewModel -  loadDashboardData - dashboardList.count %{public}d", pinned.size());
        self->fetchReadings(pinned, completion);
      });
}

void DashboardViewModel::fetchReadings(const std::vector<DashboardTableItem>& pinned, LoadCompletion completion) {
  const auto readings = std::make_shared<std::vector<Metric>>();
  for (const DashboardTableItem& item : pinned) {
    group_.enter();
    persistanceStore_->fetchMetricContents(
        item.metricTech, item.metricName, item.attributeName, item.subsId,
        [readings, group = group_](std::vector<Metric> rows, std::optional<SQLiteError> error) mutable {
          // Rows come on the main queue; only failures, which add nothing, come elsewhere.
          if (!error && !rows.empty()) readings->push_back(std::move(rows.front()));
          group.leave();
        });
  }
  group_.notify(Platform::current().mainQueue, [weak = weak_from_this(), readings, completion = std::move(completion)] {
    if (weak.expired()) return;
    if (readings->size() >= kFewestReadings) {
      completion(std::move(*readings), std::nullopt);
    } else {
      completion(std::nullopt, std::nullopt);
    }
  });
}

void DashboardViewModel::updateDashboardDataSource(const std::vector<Metric>& rows) {
  dashboardLog.log("DashboardViewModel -  updateDashboardDataSource()");
  // Two readings of one key: the later one wins. New rows keep the order of `rows`.
  std::vector<std::optional<DashboardViewModelObject>> latest;
  std::map<std::string, std::size_t, std::less<>> indexOfKey;
  for (const Metric& row : rows) {
    DashboardViewModelObject object = shown(row);
    const auto [entry, isNew] = indexOfKey.try_emplace(keyOf(object), latest.size());
    if (isNew) {
      latest.push_back(std::move(object));
    } else {
      latest[entry->second] = std::move(object);
    }
  }

  std::vector<std::size_t> gone;
  for (std::size_t index = 0; index < metrics_.size(); ++index) {
    const std::string key = keyOf(metrics_[index]);
    const auto entry = indexOfKey.find(key);
    if (entry == indexOfKey.end()) {
      gone.push_back(index);
      continue;
    }
    std::optional<DashboardViewModelObject>& object = latest[entry->second];
    metrics_[index].attributeValue = std::move(object->attributeValue);
    changed_({DashboardChange::Kind::attributeValue, index});
    metrics_[index].timeStamp = object->timeStamp;
    changed_({DashboardChange::Kind::timeStamp, index});
    dashboardLog.log("DashBoardViewModel - Updating value and timestamp for key : %{public}s ", key);
    object.reset();
    indexOfKey.erase(entry);
  }
  for (auto index = gone.rbegin(); index != gone.rend(); ++index) {  // from the end, so that the others stay valid
    metrics_.erase(metrics_.begin() + static_cast<std::ptrdiff_t>(*index));
    changed_({DashboardChange::Kind::removed, *index});
  }
  for (std::optional<DashboardViewModelObject>& object : latest) {
    if (!object) continue;
    metrics_.push_back(std::move(*object));
    changed_({DashboardChange::Kind::appended, metrics_.size() - 1});
  }
}

}  // namespace quorl
