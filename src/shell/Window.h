#pragma once

#include <memory>

#include "shell/RootNavigationController.h"

namespace quorl {

/// The one top-level window; a host draws it, the product decides what stands in it. Main thread.
class Window {
 public:
  /// Null until the launch has installed it.
  const std::shared_ptr<RootNavigationController>& rootViewController() const { return rootViewController_; }
  void setRootViewController(std::shared_ptr<RootNavigationController> root) { rootViewController_ = std::move(root); }

  bool isVisible() const { return isVisible_; }
  /// Shows the window. The root's view loads with it.
  void makeVisible() {
    isVisible_ = true;
    if (rootViewController_) rootViewController_->viewDidLoad();
  }

 private:
  std::shared_ptr<RootNavigationController> rootViewController_;
  bool isVisible_ = false;
};

}  // namespace quorl
