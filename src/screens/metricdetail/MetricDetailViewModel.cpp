#include "screens/metricdetail/MetricDetailViewModel.h"

#include <algorithm>
#include <chrono>
#include <ctime>
#include <set>
#include <utility>

#include "base/NotificationCenter.h"
#include "intake/AttributeKeys.h"
#include "platform/Platform.h"
#include "shell/Logs.h"
#include "shell/NotificationNames.h"
#include "store/MetricStatements.h"

namespace quorl {
namespace {

constexpr std::chrono::seconds kLongestSpinner{30};
constexpr int kCalendarDaysToLastSeen = 30;

/// `date` moved by calendar days in the device's time zone, at the same time of day.
Date byCalendarDays(Date date, int days) {
  const auto seconds = std::chrono::floor<std::chrono::seconds>(date);
  const auto time = static_cast<std::time_t>(seconds.time_since_epoch().count());
  std::tm local{};
  tzset();
  localtime_r(&time, &local);
  local.tm_mday += days;
  local.tm_isdst = -1;
  return Date(std::chrono::seconds(std::mktime(&local))) + (date - seconds);
}

}  // namespace

std::shared_ptr<MetricDetailViewModel> MetricDetailViewModel::make(std::shared_ptr<PersistanceStore> store,
                                                                   std::string metricTech, std::string metricName,
                                                                   std::int32_t subsId, Date collectedOn) {
  std::shared_ptr<MetricDetailViewModel> model(
      new MetricDetailViewModel(std::move(store), std::move(metricTech), std::move(metricName), subsId, collectedOn));
  model->persistanceStore_->setStoreDelegate(model);
  model->requestLoad(model->subsId_);
  return model;
}

MetricDetailViewModel::MetricDetailViewModel(std::shared_ptr<PersistanceStore> store, std::string metricTech,
                                             std::string metricName, std::int32_t subsId, Date collectedOn)
    : persistanceStore_(std::move(store)),
      metricTech_(std::move(metricTech)),
      metricName_(std::move(metricName)),
      subsId_(subsId),
      collectedOn_(collectedOn) {}

void MetricDetailViewModel::requestLoad(std::int32_t subsId) {
  const auto waiting =
      std::find_if(waitingLoads_.begin(), waitingLoads_.end(), [&](const Load& load) { return load.subsId == subsId; });
  if (waiting == waitingLoads_.end()) {
    waitingLoads_.push_back({subsId, 1});
  } else {
    ++waiting->requests;
    std::rotate(waiting, waiting + 1, waitingLoads_.end());  // what was asked for last is shown last
  }
  if (loadsUnderWay_ == 0) startWaitingLoads();
}

void MetricDetailViewModel::startWaitingLoads() {
  for (const Load& load : std::exchange(waitingLoads_, {})) start(load);
}

void MetricDetailViewModel::start(const Load& load) {
  ++loadsUnderWay_;
  scheduleEndOfSpinner();
  group_.enter();
  persistanceStore_->fetchMetricContents(metricTech_, metricName_, std::nullopt, load.subsId,
                                         [weak = weak_from_this(), group = group_, requests = load.requests](
                                             std::vector<Metric> rows, std::optional<SQLiteError> error) mutable {
                                           if (const auto self = weak.lock())
                                             self->contentsDidLoad(std::move(rows), error, requests);
                                           group.leave();
                                         });
  group_.enter();
  const auto pinned = std::make_shared<std::vector<DashboardTableItem>>();
  persistanceStore_->fetchDashboard(
      load.subsId,
      [pinned, group = group_](std::vector<DashboardTableItem> items, std::optional<SQLiteError> /*error*/) mutable {
        *pinned = std::move(items);
        group.leave();
      });
  group_.notify(Platform::current().mainQueue, [weak = weak_from_this(), pinned] {
    if (const auto self = weak.lock()) self->loadDidEnd(*pinned);
  });
}

void MetricDetailViewModel::loadDidEnd(const std::vector<DashboardTableItem>& pinned) {
  markBookmarks(pinned);
  --loadsUnderWay_;
  if (loadsUnderWay_ == 0) startWaitingLoads();
}

void MetricDetailViewModel::scheduleEndOfSpinner() {
  Platform::current().backgroundQueue.async([weak = weak_from_this()] {
    Platform::current().mainQueue.asyncAfter(kLongestSpinner, [weak] {
      if (const auto self = weak.lock()) self->endSpinner();
    });
  });
}

void MetricDetailViewModel::endSpinner() {
  shouldShowSPinner_ = false;
  changed_();
}

void MetricDetailViewModel::contentsDidLoad(std::vector<Metric> rows, const std::optional<SQLiteError>& error,
                                            std::size_t requests) {
  if (!error) {
    endSpinner();
    apply(std::move(rows));
    return;
  }
  for (; requests > 0; --requests)
    metricDetailLog.log("metricDetailsViewModel error - processNewMetric: %{public}@", *error);
  // A row that cannot be read is reported on the database's queue.
  Platform::current().mainQueue.async([weak = weak_from_this()] {
    if (const auto self = weak.lock()) self->endSpinner();
  });
}

void MetricDetailViewModel::apply(std::vector<Metric> rows) {
  metrics_ = std::move(rows);
  changed_();
  applyLastSeen();
  if (!metrics_.empty()) applySectionRules();
  std::erase_if(metrics_, [](const Metric& row) { return row.attributeNameNonLocalized == kTimestampKey; });
  std::stable_sort(metrics_.begin(), metrics_.end(),
                   [](const Metric& a, const Metric& b) { return a.attributeName < b.attributeName; });
  changed_();
}

void MetricDetailViewModel::applyLastSeen() {
  const Date now = Platform::current().clock.now();
  const Date lastSeen = metrics_.empty() ? now : metrics_.front().collectedOn;
  if (lastSeen >= byCalendarDays(now, kCalendarDaysToLastSeen)) return;
  // Always so but for a row of the far future: what is shown as "last seen" is the time of the load.
  collectedOn_ = now;
  changed_();
}

void MetricDetailViewModel::applySectionRules() {
  if (metricName_ == kCellInfoName) applyDeploymentRule(metrics_);
  if (metricName_ != kCaStatusName) return;
  metricSectionals_.clear();
  changed_();
  assignSectionNumbers(metrics_);
  for (MetricSectional& section : sectionsOf(metrics_)) {
    metricSectionals_.push_back(std::move(section));
    changed_();
  }
}

void MetricDetailViewModel::markBookmarks(const std::vector<DashboardTableItem>& pinned) {
  std::set<std::string, std::less<>> pinnedNames;
  for (const DashboardTableItem& item : pinned)
    pinnedNames.insert(Platform::current().strings.localized(item.attributeName));
  for (Metric& row : metrics_)
    if (pinnedNames.contains(row.attributeName)) row.isBookmarked = true;
  if (const auto delegate = delegate_.lock()) delegate->refresh();
}

void MetricDetailViewModel::processNewMetric(const Metric& metric) {
  if (metric.metricTech != metricTech_ || metric.metricName != metricName_) return;
  requestLoad(metric.subsId);
}

const Metric* MetricDetailViewModel::row(std::size_t index, std::size_t sectionIndex, bool isSectioned) const {
  if (isSectioned && sectionIndex >= metricSectionals_.size()) return nullptr;
  const std::vector<Metric>& rows = isSectioned ? metricSectionals_[sectionIndex].sectionMetrics : metrics_;
  return index < rows.size() ? &rows[index] : nullptr;
}

void MetricDetailViewModel::updateDashboardItem(std::size_t index, bool isBookmarked, std::size_t sectionIndex,
                                                bool isSectioned) {
  const Metric* metric = row(index, sectionIndex, isSectioned);
  if (metric == nullptr) {
    metricDetailLog.log("MetricDetailViewModel - updateDashboardItem - unable to unwrap metric");
  } else if (isBookmarked) {
    pin(*metric);
  } else {
    unpin(*metric);
  }
}

void MetricDetailViewModel::pin(const Metric& metric) {
  persistanceStore_->executeDashboardStatement(
      SQLTable<Metric>::pinAttribute(metric.metricTech, metric.attributeNameNonLocalized, metric.subsId),
      [](bool success, std::optional<SQLiteError> error) {
        if (success) {
          metricDetailLog.log("attribute inserted from dashboard table");
        } else {
          metricDetailLog.log("unable to insert attribute from dashboard table %{public}s",
                              error.value_or(SQLiteError{}));
        }
      });
}

void MetricDetailViewModel::unpin(const Metric& metric) {
  persistanceStore_->removeDashboardItem(
      metric.metricTech, metric.attributeNameNonLocalized, metric.subsId,
      [weak = weak_from_this()](bool success, std::optional<SQLiteError> error) {
        if (!success) {
          metricDetailLog.log("unable to delete attribute from dashboard table %{public}s",
                              error.value_or(SQLiteError{}));
          return;
        }
        metricDetailLog.log("attribute deleted from dashboard table");
        const auto self = weak.lock();
        if (!self || self->delegate_.expired()) return;
        NotificationCenter::defaultCenter().post(notification::kRemovedDashboardMetric);
      });
}

}  // namespace quorl
