#pragma once

#include <string>
#include <utility>

#include "base/Signal.h"

namespace quorl {

/// A spinner with a text beside it. Main thread.
class LoadingView {
 public:
  explicit LoadingView(std::string loadingLabelText) : loadingLabelText_(std::move(loadingLabelText)) {}

  const std::string& loadingLabelText() const { return loadingLabelText_; }
  void setLoadingLabelText(std::string text);
  /// Whether `hide` takes the text away as well.
  bool shouldHideLoadingView() const { return shouldHideLoadingView_; }
  void setShouldHideLoadingView(bool shouldHide) { shouldHideLoadingView_ = shouldHide; }

  bool isHidden() const { return isHidden_; }
  bool isAnimating() const { return isAnimating_; }
  bool isLabelHidden() const { return isLabelHidden_; }

  void show();
  void hide();
  /// Stops the spinner and leaves the text standing.
  void stopAnimating();

  [[nodiscard]] Connection onChange(Signal<>::Handler handler) { return changed_.connect(std::move(handler)); }

 private:
  std::string loadingLabelText_;
  bool shouldHideLoadingView_ = true;
  bool isHidden_ = true;
  bool isAnimating_ = false;
  bool isLabelHidden_ = false;
  Signal<> changed_;
};

}  // namespace quorl
