#include "screens/metriclist/AllMetricsViewController.h"

#include <chrono>
#include <utility>

#include "app/HardwareManager.h"
#include "intake/MetricChannel.h"
#include "intake/MetricService.h"
#include "platform/Platform.h"
#include "shell/Logs.h"
#include "shell/TimeTexts.h"

namespace quorl {
namespace {

constexpr std::chrono::seconds kRefreshDuration{1};

}  // namespace

std::shared_ptr<AllMetricsViewController> AllMetricsViewController::make(std::shared_ptr<PersistanceStore> store) {
  std::shared_ptr<AllMetricsViewController> controller(
      new AllMetricsViewController(AllMetricsViewModel::make(std::move(store))));
  controller->viewModel_->setDelegate(controller);
  return controller;
}

void AllMetricsViewController::viewWillAppear() {
  setLastRefreshedLine();
  changed_();
}

void AllMetricsViewController::reloadMetricsList() {
  table_ = viewModel_->metricsList();
  setLastRefreshedLine();
  changed_();
}

void AllMetricsViewController::setLastRefreshedLine() {
  lastRefreshedText_ = "Last refreshed: " + dateText(Platform::current().clock.now());
}

void AllMetricsViewController::pullToRefresh() {
  allMetricsLog.log("AllMetricsViewModel - pullToRefresh called");
  isRefreshing_ = true;
  changed_();
  metric_channel::requestSnapshot(viewModel_->persistanceStore()->metricService().zelkorShared(),
                                  HardwareManager::shared());
  Platform::current().mainQueue.asyncAfter(kRefreshDuration, [weak = weak_from_this()] {
    if (const auto self = weak.lock()) self->endRefresh();
  });
}

void AllMetricsViewController::endRefresh() {
  isRefreshing_ = false;
  reloadMetricsList();
}

void AllMetricsViewController::didSelectItemAt(std::size_t section, std::size_t row) {
  if (section >= table_.size() || row >= table_[section].rowItems.size()) return;
  const std::string& metricTech = table_[section].metricTech;
  const AllMetricsRowItem& item = table_[section].rowItems[row];
  allMetricsLog.log("AllMetricsViewModel - pullToRefresh didSelectItemAt GroupTec %{public}s GroupRowItem %{public}s",
                    metricTech, item.metricName);
  openDetail_(MetricDetailsViewController::make(viewModel_->persistanceStore(), metricTech, item.metricName,
                                                item.subsId, item.timeStamp));
}

std::string AllMetricsViewController::timeText(const AllMetricsRowItem& row) {
  return dateText(row.timeStamp);
}

}  // namespace quorl
