#pragma once

#include <cstddef>
#include <memory>
#include <string>

#include "base/Signal.h"
#include "screens/dashboard/DashboardViewModel.h"
#include "screens/dashboard/ManageDashboardViewController.h"
#include "shell/Toast.h"

namespace quorl {

// How a row of the dashboard reads.

/// The attribute's name, followed by " (CA n)" for an attribute of section n.
std::string dashboardNameText(const DashboardViewModelObject& row);
std::string dashboardValueText(const DashboardViewModelObject& row);

/// The "Dashboard" tab. Main thread.
class DashboardViewController final : public DashboardViewModelDelegate,
                                      public std::enable_shared_from_this<DashboardViewController> {
 public:
  using OpenManaging = Signal<std::shared_ptr<ManageDashboardViewController>>;

  static constexpr char manageControlText[] = "Manage Dashboard";

  static std::shared_ptr<DashboardViewController> make(std::shared_ptr<PersistanceStore> store);
  DashboardViewController(const DashboardViewController&) = delete;
  DashboardViewController& operator=(const DashboardViewController&) = delete;

  const std::shared_ptr<DashboardViewModel>& viewModel() const { return viewModel_; }

  /// "Last refreshed: ", the time of the last tick and a blank; without a time before the first tick.
  const std::string& lastRefreshedText() const { return lastRefreshedText_; }
  /// "copied", after a long press on a row.
  Toast& showToast() { return showToast_; }

  /// Copies the value shown of row `index` to the pasteboard. Out of range it does nothing.
  void longPress(std::size_t index);
  /// Reads the pins of the current subscription and opens the managing screen with them.
  void manageDashboardTapped();

  void updateLastRefreshed(const std::string& text) override;

  /// `handler` runs after every change of the "Last refreshed: " line. The rows tell of theirs by the model.
  [[nodiscard]] Connection onLastRefreshed(Signal<>::Handler handler) { return refreshed_.connect(std::move(handler)); }
  /// `handler` receives the screen to present. Nobody else holds it.
  [[nodiscard]] Connection onOpenManaging(OpenManaging::Handler handler) {
    return openManaging_.connect(std::move(handler));
  }

 private:
  explicit DashboardViewController(std::shared_ptr<DashboardViewModel> model);

  const std::shared_ptr<DashboardViewModel> viewModel_;
  std::string lastRefreshedText_;
  Toast showToast_;
  Signal<> refreshed_;
  OpenManaging openManaging_;
};

}  // namespace quorl
