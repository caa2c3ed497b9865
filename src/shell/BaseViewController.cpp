#include "shell/BaseViewController.h"

#include "app/HardwareManager.h"
#include "base/FatalStop.h"
#include "shell/NotificationNames.h"
#include "store/PersistanceStore.h"

namespace quorl {

const char* titleOf(BaseViewNavigationIndexes index) {
  switch (index) {
    case BaseViewNavigationIndexes::first:
      return "Dashboard";
    case BaseViewNavigationIndexes::second:
      return "All Metrics";
    case BaseViewNavigationIndexes::third:
      return "Sondrel";
  }
  fatalStop("BaseViewNavigationIndexes: no such case");
}

void BaseViewController::viewDidLoad() {
  if (isViewLoaded_) return;
  isViewLoaded_ = true;
  title_ = titleOf(BaseViewNavigationIndexes::first);
  prefersLargeTitles_ = true;
  menuBar();
  hasExportButton_ = HardwareManager::shared().isInternalOrCarrierBuild();
  horvaneViewModel_ = std::make_shared<HorvaneViewModel>();
  carrierBar_ = std::make_unique<CarrierNameSegmentView>(horvaneViewModel_);
  embed(BaseViewNavigationIndexes::first);
  carrierObservation_ = NotificationCenter::defaultCenter().observe(
      notification::kCarrierUpdate,
      [this](const Notification& update) { updateFromCarrierNotification(update, horvaneViewModel_.get()); });
}

void BaseViewController::viewWillAppear() {
  if (isViewLoaded_) embed(currentlySelectedIndex_);
}

const std::shared_ptr<MenuBar>& BaseViewController::menuBar() {
  if (!menuBar_) {
    menuBar_ = MenuBar::make(HardwareManager::shared().isSondrelCompatible() ? 3 : 2);
    menuBar_->setDelegate(weak_from_this());
  }
  return menuBar_;
}

const std::shared_ptr<DashboardViewController>& BaseViewController::dashboardViewController() {
  if (!dashboardViewController_) dashboardViewController_ = DashboardViewController::make(persistanceStore_);
  return dashboardViewController_;
}

const std::shared_ptr<AllMetricsViewController>& BaseViewController::firstLevelViewController() {
  if (!firstLevelViewController_) firstLevelViewController_ = AllMetricsViewController::make(persistanceStore_);
  return firstLevelViewController_;
}

const std::shared_ptr<SondrelViewController>& BaseViewController::sondrelViewController() {
  if (!sondrelViewController_) sondrelViewController_ = SondrelViewController::make();
  return sondrelViewController_;
}

void BaseViewController::menuBarDidSelectItemAt(std::size_t index) {
  if (index >= static_cast<std::size_t>(menuBar()->numberOfSegments())) return;
  const auto chosen = static_cast<BaseViewNavigationIndexes>(index);
  if (chosen == currentlySelectedIndex_) return;
  title_ = titleOf(chosen);
  currentlySelectedIndex_ = chosen;
  isExportButtonHidden_ = chosen == BaseViewNavigationIndexes::third;
  embed(chosen);
  changed_();
}

void BaseViewController::embed(BaseViewNavigationIndexes index) {
  switch (index) {
    case BaseViewNavigationIndexes::first:
      dashboardViewController();
      return;
    case BaseViewNavigationIndexes::second:
      firstLevelViewController()->viewWillAppear();
      return;
    case BaseViewNavigationIndexes::third:
      sondrelViewController()->viewDidLoad();
      return;
  }
}

void BaseViewController::exportTappedWithTapGestureRecognizer() {
  presentExport_(ExportViewController::make(persistanceStore_));
}

}  // namespace quorl
