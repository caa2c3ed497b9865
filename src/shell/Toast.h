#pragma once

#include <memory>
#include <string>

#include "base/Signal.h"

namespace quorl {

/// A short text over a screen, which takes itself away after a second. Main thread.
class Toast {
 public:
  explicit Toast(std::string text) : text_(std::move(text)), isShowing_(std::make_shared<Published<bool>>(false)) {}

  const std::string& text() const { return text_; }
  bool isShowing() const { return isShowing_->get(); }
  /// Shows it for a second. Shown again meanwhile it still goes when the first second ends.
  void show();
  /// `handler` runs whenever the toast comes or goes.
  [[nodiscard]] Connection onChange(Published<bool>::Handler handler) {
    return isShowing_->subscribe(std::move(handler));
  }

 private:
  std::string text_;
  std::shared_ptr<Published<bool>> isShowing_;
};

}  // namespace quorl
