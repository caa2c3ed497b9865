#pragma once

#include <memory>
#include <utility>
#include <vector>

#include "base/Signal.h"
#include "screens/export/ExportView.h"

namespace quorl {

/// The screen on which the user takes all stored rows of a time frame out of the device. Main thread.
class ExportViewController final : public ExportViewDelegate {
 public:
  static constexpr char exportOptionsLabel[] = "Select a time frame to export all metrics";

  static std::shared_ptr<ExportViewController> make(std::shared_ptr<PersistanceStore> store);
  ExportViewController(const ExportViewController&) = delete;
  ExportViewController& operator=(const ExportViewController&) = delete;

  /// "Daily", "Weekly" and "Monthly".
  std::vector<ExportView>& containerView() { return containerView_; }
  LoadingView& loadingView() override { return loadingView_; }
  const std::shared_ptr<PersistanceStore>& persistanceStore() const override { return persistanceStore_; }

  /// The cross button.
  void dismiss() { dismissed_(); }
  /// `handler` closes the screen.
  [[nodiscard]] Connection onDismiss(Signal<>::Handler handler) { return dismissed_.connect(std::move(handler)); }

 private:
  explicit ExportViewController(std::shared_ptr<PersistanceStore> store)
      : persistanceStore_(std::move(store)), loadingView_(kGatheringText) {}

  const std::shared_ptr<PersistanceStore> persistanceStore_;
  LoadingView loadingView_;
  std::vector<ExportView> containerView_;
  Signal<> dismissed_;
};

}  // namespace quorl
