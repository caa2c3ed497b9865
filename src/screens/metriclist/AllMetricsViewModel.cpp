#include "screens/metriclist/AllMetricsViewModel.h"

#include <algorithm>
#include <utility>

#include "app/HardwareManager.h"
#include "platform/Platform.h"
#include "screens/metricdetail/MetricSections.h"
#include "shell/Logs.h"
#include "shell/NotificationNames.h"

namespace quorl {
namespace {

constexpr char kTelephonyTech[] = "RAT";

/// The telephony rows, which stand in the list whether they have been seen or not.
AllMetricsDataSource telephonyGroup() {
  const HardwareManager& hardware = HardwareManager::shared();
  const Date now = Platform::current().clock.now();
  AllMetricsDataSource group{kTelephonyTech, {{kCellInfoName, now, hardware.currentSubsId()}}};
  if (hardware.isInternalOrCarrierBuild()) {
    group.rowItems.push_back({"Active Bands", now, hardware.currentSubsId()});
    group.rowItems.push_back({"Supported Bands", now, hardware.currentSubsId()});
  }
  return group;
}

auto rowNamed(const AllMetricsDataSource& group, std::string_view metricName) {
  return std::find_if(group.rowItems.begin(), group.rowItems.end(),
                      [&](const AllMetricsRowItem& row) { return row.metricName == metricName; });
}

}  // namespace

std::shared_ptr<AllMetricsViewModel> AllMetricsViewModel::make(std::shared_ptr<PersistanceStore> store) {
  std::shared_ptr<AllMetricsViewModel> model(new AllMetricsViewModel(std::move(store)));
  model->start();
  return model;
}

void AllMetricsViewModel::start() {
  persistanceStore_->setStoreDelegate(weak_from_this());
  subscriptionObservation_ = NotificationCenter::defaultCenter().observe(
      notification::kSubsIdSelectionChange, [weak = weak_from_this()](const Notification&) {
        if (const auto self = weak.lock()) self->load({Request::Kind::list, {}});
      });
  load({Request::Kind::list, {}});
}

void AllMetricsViewModel::loadMetricList(LoadCompletion completion) {
  load({Request::Kind::caller, std::move(completion)});
}

void AllMetricsViewModel::load(Request request) {
  allMetricsLog.log("AllMetricsViewModel - loadMetricList ");
  waiting_.push_back(std::move(request));
  if (!isReading_) read();
}

void AllMetricsViewModel::read() {
  isReading_ = true;
  persistanceStore_->fetchAvailableMetrics(
      HardwareManager::shared().currentSubsId(), [weak = weak_from_this(), requests = std::exchange(waiting_, {})](
                                                     AvailableMetrics available, std::optional<SQLiteError> error) {
        const auto self = weak.lock();
        if (!self) return;
        self->fetchAvailableMetricsList(std::move(available), error, requests);
        if (Platform::current().mainQueue.isCurrent()) return self->readDidEnd();
        Platform::current().mainQueue.async([weak] {  // a row that cannot be read is reported elsewhere
          if (const auto alive = weak.lock()) alive->readDidEnd();
        });
      });
}

void AllMetricsViewModel::readDidEnd() {
  isReading_ = false;
  if (!waiting_.empty()) read();
}

void AllMetricsViewModel::fetchAvailableMetricsList(AvailableMetrics available, const std::optional<SQLiteError>& error,
                                                    const std::vector<Request>& requests) {
  if (error) return reportFailure(*error, requests);
  replaceList(std::move(available));
  const bool success = metricsList_.size() >= 2;
  bool reloads = false;
  for (const Request& request : requests) {
    allMetricsLog.log("AllMetricsViewModel - fetchAvailableMetricsList metricsList.count : %{public}d ",
                      metricsList_.size());
    switch (request.kind) {
      case Request::Kind::list:
        reloads = true;
        break;
      case Request::Kind::newMetric:
        if (!success) break;
        allMetricsLog.log("AllMetricsViewModel - processNewMetric isSectionNameExists");
        reloads = true;
        break;
      case Request::Kind::caller:
        if (request.completion) request.completion(success);
        break;
    }
  }
  if (reloads) reloadScreen();
}

void AllMetricsViewModel::reportFailure(const SQLiteError& error, const std::vector<Request>& requests) {
  for (const Request& request : requests) {
    allMetricsLog.log("error occurred  ---> %{public}s", error);
    allMetricsLog.log("AllMetricsViewModel - fetchAvailableMetricsList error: %{public}s ", error);
    if (request.completion) request.completion(false);
  }
}

void AllMetricsViewModel::replaceList(AvailableMetrics available) {
  available.erase(kTelephonyTech);  // the fixed rows stand for them
  std::vector<AllMetricsDataSource> groups{telephonyGroup()};
  groups.reserve(available.size() + 1);
  for (auto& [metricTech, rows] : available) {  // the map's order is ascending
    AllMetricsDataSource group{metricTech, {}};
    group.rowItems.reserve(rows.size());
    for (MetricList& row : rows) group.rowItems.push_back({std::move(row.metricName), row.collectedOn, row.subsId});
    groups.push_back(std::move(group));
  }
  metricsList_ = std::move(groups);
}

void AllMetricsViewModel::processNewMetric(const Metric& metric) {
  allMetricsLog.log("AllMetricsViewModel - processNewMetric begins  tech %{public}s name: %{public}s",
                    metric.metricTech, metric.metricName);
  if (isNewerThanItsRow(metric)) load({Request::Kind::newMetric, {}});
}

bool AllMetricsViewModel::isSectionNameExists(std::string_view metricTech) const {
  return std::any_of(metricsList_.begin(), metricsList_.end(),
                     [&](const AllMetricsDataSource& group) { return group.metricTech == metricTech; });
}

bool AllMetricsViewModel::isNewerThanItsRow(const Metric& metric) const {
  const bool isRowKnown = std::any_of(metricsList_.begin(), metricsList_.end(), [&](const AllMetricsDataSource& group) {
    return rowNamed(group, metric.metricName) != group.rowItems.end();
  });
  if (!isRowKnown || !isSectionNameExists(metric.metricTech)) return true;
  // The name may be known from another technology only; then there is nothing to compare with, and nothing to do.
  return std::any_of(metricsList_.begin(), metricsList_.end(), [&](const AllMetricsDataSource& group) {
    if (group.metricTech != metric.metricTech) return false;
    const auto row = rowNamed(group, metric.metricName);
    return row != group.rowItems.end() && row->timeStamp < metric.collectedOn;
  });
}

void AllMetricsViewModel::reloadScreen() {
  if (const auto delegate = delegate_.lock()) delegate->reloadMetricsList();
}

}  // namespace quorl
