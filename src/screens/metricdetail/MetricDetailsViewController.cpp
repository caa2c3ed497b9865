#include "screens/metricdetail/MetricDetailsViewController.h"

#include <optional>
#include <utility>

#include "shell/Logs.h"

namespace quorl {

std::shared_ptr<MetricDetailsViewController> MetricDetailsViewController::make(std::shared_ptr<PersistanceStore> store,
                                                                               std::string metricTech,
                                                                               std::string metricName,
                                                                               std::int32_t subsId, Date collectedOn) {
  std::shared_ptr<MetricDetailsViewController> controller(new MetricDetailsViewController(MetricDetailViewModel::make(
      std::move(store), std::move(metricTech), std::move(metricName), subsId, collectedOn)));
  controller->metricDetailsViewModel_->setDelegate(controller);
  return controller;
}

MetricDetailsViewController::MetricDetailsViewController(std::shared_ptr<MetricDetailViewModel> model)
    : metricDetailsViewModel_(std::move(model)), view_(metricDetailsViewModel_) {}

void MetricDetailsViewController::viewDidLoad() {
  appUiLog.log("MetricDetailsViewController - viewDidLoad - metricname: %{public}@",
               metricDetailsViewModel_->metricName());
  cancellable_ = view_.viewProtocol().subscribe([this](const std::optional<Metric>& metric) {
    if (metric) openGraph(*metric);
  });
}

void MetricDetailsViewController::refresh() {
  view_.refreshBookmarks();
}

void MetricDetailsViewController::openGraph(const Metric& metric) {
  const auto screen = AttributeContentDetailsViewController::make(metricDetailsViewModel_->persistanceStore(), metric);
  appUiLog.log("MetricDetailsViewController - cancellable - called");
  openGraph_(screen);
}

}  // namespace quorl
