#include "shell/LoadingView.h"

namespace quorl {

void LoadingView::setLoadingLabelText(std::string text) {
  loadingLabelText_ = std::move(text);
  changed_();
}

void LoadingView::show() {
  isHidden_ = false;
  isAnimating_ = true;
  isLabelHidden_ = false;
  changed_();
}

void LoadingView::hide() {
  isLabelHidden_ = shouldHideLoadingView_;
  isAnimating_ = false;
  isHidden_ = true;
  changed_();
}

void LoadingView::stopAnimating() {
  isAnimating_ = false;
  changed_();
}

}  // namespace quorl
