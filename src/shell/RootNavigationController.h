#pragma once

#include <memory>
#include <string>

#include "shell/BaseViewController.h"

namespace quorl {

class PersistanceStore;

/// The navigation stack at the root of the window, and the place where the metric channel starts. Main thread. Lives
/// as long as the process; its destruction is logged as an error.
class RootNavigationController : public std::enable_shared_from_this<RootNavigationController> {
 public:
  /// Starts the metric channel before it returns.
  static std::shared_ptr<RootNavigationController> make(std::shared_ptr<PersistanceStore> store,
                                                        std::shared_ptr<BaseViewController> root);
  ~RootNavigationController();
  RootNavigationController(const RootNavigationController&) = delete;
  RootNavigationController& operator=(const RootNavigationController&) = delete;

  /// The view has loaded: logs the device type and asks for a snapshot 10 seconds from now.
  void viewDidLoad();
  /// Asks for a snapshot of all metrics.
  void refreshMetrics();
  /// The same, for a timer; nothing in the product starts one.
  void firstTimerMetricRefresh() { refreshMetrics(); }

  const std::shared_ptr<PersistanceStore>& persistanceStore() const { return persistanceStore_; }
  const std::shared_ptr<BaseViewController>& rootScreen() const { return rootScreen_; }
  /// Named colours of the navigation bar.
  const std::string& tint() const { return tint_; }
  const std::string& barTint() const { return barTint_; }

 private:
  RootNavigationController(std::shared_ptr<PersistanceStore> store, std::shared_ptr<BaseViewController> root);
  void startMetricChannel();

  std::shared_ptr<PersistanceStore> persistanceStore_;
  std::shared_ptr<BaseViewController> rootScreen_;
  std::string tint_;
  std::string barTint_;
};

}  // namespace quorl
