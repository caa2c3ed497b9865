#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "base/Signal.h"
#include "screens/metricdetail/MetricDetailsViewController.h"
#include "screens/metriclist/AllMetricsViewModel.h"

namespace quorl {

/// The "All Metrics" tab. It shows the list as it was at the last reload, whatever the model has learned since. Main
/// thread.
class AllMetricsViewController final : public AllMetricsViewModelDelegate,
                                       public std::enable_shared_from_this<AllMetricsViewController> {
 public:
  using OpenDetail = Signal<std::shared_ptr<MetricDetailsViewController>>;

  static constexpr char pullToRefreshHint[] = "Pull to refresh";

  static std::shared_ptr<AllMetricsViewController> make(std::shared_ptr<PersistanceStore> store);
  AllMetricsViewController(const AllMetricsViewController&) = delete;
  AllMetricsViewController& operator=(const AllMetricsViewController&) = delete;

  const std::shared_ptr<AllMetricsViewModel>& viewModel() const { return viewModel_; }

  void viewWillAppear();
  /// Takes the model's list on show.
  void reloadMetricsList() override;
  /// Asks the baseband manager for fresh metrics, which then arrive by themselves. One second later the refresh ends
  /// and the list at hand is shown; the store is not read.
  void pullToRefresh();
  /// Opens a row of the table on show. Indices out of range do nothing.
  void didSelectItemAt(std::size_t section, std::size_t row);

  /// "Last refreshed: " and the time. Empty before the screen has appeared.
  const std::string& lastRefreshedText() const { return lastRefreshedText_; }
  bool isRefreshing() const { return isRefreshing_; }
  /// A header with the technology for each group, and under it its rows.
  const std::vector<AllMetricsDataSource>& table() const { return table_; }
  static const std::string& nameText(const AllMetricsRowItem& row) { return row.metricName; }
  static std::string timeText(const AllMetricsRowItem& row);

  /// `handler` runs after every change of a text, of the table or of the refresh's state.
  [[nodiscard]] Connection onChange(Signal<>::Handler handler) { return changed_.connect(std::move(handler)); }
  /// `handler` receives the screen to push. Nobody else holds it.
  [[nodiscard]] Connection onOpenDetail(OpenDetail::Handler handler) { return openDetail_.connect(std::move(handler)); }

 private:
  explicit AllMetricsViewController(std::shared_ptr<AllMetricsViewModel> model) : viewModel_(std::move(model)) {}

  void setLastRefreshedLine();
  void endRefresh();

  const std::shared_ptr<AllMetricsViewModel> viewModel_;
  std::vector<AllMetricsDataSource> table_;
  std::string lastRefreshedText_;
  bool isRefreshing_ = false;
  Signal<> changed_;
  OpenDetail openDetail_;
};

}  // namespace quorl
