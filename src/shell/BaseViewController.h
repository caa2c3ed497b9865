#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <utility>

#include "base/NotificationCenter.h"
#include "base/Signal.h"
#include "capture/SondrelViewController.h"
#include "screens/dashboard/DashboardViewController.h"
#include "screens/export/ExportViewController.h"
#include "screens/metriclist/AllMetricsViewController.h"
#include "shell/MenuBar.h"
#include "telephony/CarrierNameSegmentView.h"

namespace quorl {

class PersistanceStore;

/// The tabs.
enum class BaseViewNavigationIndexes { first, second, third };

/// What the bar over a tab's screen says.
const char* titleOf(BaseViewNavigationIndexes index);

/// The container of the tabs' screens: the tab bar, the carrier bar under it, and the current tab's screen. A screen is
/// made when its tab is first shown and kept from then on. Main thread.
class BaseViewController final : public MenuBarDelegate, public std::enable_shared_from_this<BaseViewController> {
 public:
  using PresentExport = Signal<std::shared_ptr<ExportViewController>>;

  static constexpr int dashobardIndex = 0;
  static constexpr int allMetricsIndex = 1;
  static constexpr int sondrelIndex = 2;
  static constexpr double kCarrierBarHeight = 50;  // points, with or without tabs in it

  explicit BaseViewController(std::shared_ptr<PersistanceStore> store) : persistanceStore_(std::move(store)) {}
  BaseViewController(const BaseViewController&) = delete;
  BaseViewController& operator=(const BaseViewController&) = delete;

  /// The first display, once a window shows the container: makes the bars and embeds the dashboard. Further calls do
  /// nothing.
  void viewDidLoad();
  bool isViewLoaded() const { return isViewLoaded_; }
  /// The container comes back into sight from under a pushed screen.
  void viewWillAppear();

  const std::shared_ptr<PersistanceStore>& persistanceStore() const { return persistanceStore_; }
  /// Root of the carrier bar; null before the first display.
  const std::shared_ptr<HorvaneViewModel>& horvaneViewModel() const { return horvaneViewModel_; }
  /// Null before the first display.
  CarrierNameSegmentView* carrierBar() const { return carrierBar_.get(); }

  /// Made on first use, with three segments on a device that can capture logs: a Mav one of an internal or carrier
  /// build.
  const std::shared_ptr<MenuBar>& menuBar();
  const std::shared_ptr<DashboardViewController>& dashboardViewController();
  const std::shared_ptr<AllMetricsViewController>& firstLevelViewController();
  const std::shared_ptr<SondrelViewController>& sondrelViewController();

  /// Text of the navigation bar, "" before the first display.
  const std::string& title() const { return title_; }
  bool prefersLargeTitles() const { return prefersLargeTitles_; }
  /// Whether the device has the export button at all.
  bool hasExportButton() const { return hasExportButton_; }
  bool isExportButtonHidden() const { return isExportButtonHidden_; }
  BaseViewNavigationIndexes currentlySelectedIndex() const { return currentlySelectedIndex_; }

  /// Shows a tab. The one on show is left alone, and so is everything for an index without a tab.
  void menuBarDidSelectItemAt(std::size_t index) override;
  /// The export button: presents an export screen.
  void exportTappedWithTapGestureRecognizer();

  /// `handler` runs after another tab was shown.
  [[nodiscard]] Connection onChange(Signal<>::Handler handler) { return changed_.connect(std::move(handler)); }
  /// `handler` receives the screen to present. Nobody else holds it.
  [[nodiscard]] Connection onPresentExport(PresentExport::Handler handler) {
    return presentExport_.connect(std::move(handler));
  }

 private:
  void embed(BaseViewNavigationIndexes index);

  const std::shared_ptr<PersistanceStore> persistanceStore_;
  std::shared_ptr<HorvaneViewModel> horvaneViewModel_;
  std::shared_ptr<MenuBar> menuBar_;
  BaseViewNavigationIndexes currentlySelectedIndex_ = BaseViewNavigationIndexes::first;
  std::shared_ptr<AllMetricsViewController> firstLevelViewController_;
  std::shared_ptr<DashboardViewController> dashboardViewController_;
  std::shared_ptr<SondrelViewController> sondrelViewController_;
  std::unique_ptr<CarrierNameSegmentView> carrierBar_;
  std::string title_;
  bool prefersLargeTitles_ = false;
  bool hasExportButton_ = false;
  bool isExportButtonHidden_ = false;
  bool isViewLoaded_ = false;
  Signal<> changed_;
  PresentExport presentExport_;
  NotificationCenter::Observation carrierObservation_;
};

}  // namespace quorl
