#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "base/Signal.h"
#include "screens/history/AttributeContentDetailsViewController.h"
#include "screens/metricdetail/MetricDetailView.h"
#include "screens/metricdetail/MetricDetailViewModel.h"

namespace quorl {

/// The detail screen of one metric. Whoever shows it holds it; with it goes its model, and the store's delegate slot
/// is empty then. Main thread.
class MetricDetailsViewController final : public MetricDetailViewModelDelegate,
                                          public std::enable_shared_from_this<MetricDetailsViewController> {
 public:
  using OpenGraph = Signal<std::shared_ptr<AttributeContentDetailsViewController>>;

  /// Its model starts to load at once.
  static std::shared_ptr<MetricDetailsViewController> make(std::shared_ptr<PersistanceStore> store,
                                                           std::string metricTech, std::string metricName,
                                                           std::int32_t subsId, Date collectedOn);
  MetricDetailsViewController(const MetricDetailsViewController&) = delete;
  MetricDetailsViewController& operator=(const MetricDetailsViewController&) = delete;

  /// To be called once, when the screen is about to be shown. From then on it opens graphs.
  void viewDidLoad();
  void refresh() override;

  const std::string& title() const { return metricDetailsViewModel_->metricName(); }
  const std::shared_ptr<MetricDetailViewModel>& metricDetailsViewModel() const { return metricDetailsViewModel_; }
  MetricDetailView& view() { return view_; }
  /// `handler` receives the screen to push. Nobody else holds it.
  [[nodiscard]] Connection onOpenGraph(OpenGraph::Handler handler) { return openGraph_.connect(std::move(handler)); }

 private:
  explicit MetricDetailsViewController(std::shared_ptr<MetricDetailViewModel> model);
  void openGraph(const Metric& metric);

  const std::shared_ptr<MetricDetailViewModel> metricDetailsViewModel_;
  MetricDetailView view_;
  OpenGraph openGraph_;
  Connection cancellable_;
};

}  // namespace quorl
