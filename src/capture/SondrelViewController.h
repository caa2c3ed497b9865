#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "base/Signal.h"
#include "capture/CaptureSlider.h"
#include "capture/HighlightedText.h"
#include "capture/SondrelService.h"
#include "capture/SondrelServiceProtocol.h"
#include "shell/CircularTransition.h"
#include "shell/FavoritesTableCellV2.h"
#include "shell/LoadingView.h"
#include "shell/MultiChoiceSelectionModal.h"

namespace quorl {

/// The screen that drives the capture of baseband logs: its configuration, its limits, and the files that the library
/// reports. It keeps no state of the capture, and no button is ever disabled. Main thread.
class SondrelViewController final : public SondrelServiceProtocol,
                                    public MultiChoiceSelectionModalDelegate,
                                    public std::enable_shared_from_this<SondrelViewController> {
 public:
  enum class Action { start, stop, reset };
  using PresentModal = Signal<std::shared_ptr<MultiChoiceSelectionModal>>;

  static constexpr char kLoadingText[] = "Choose log config or press start";
  static constexpr double kBlinkDurationS = 0.8;

  /// Opacity of a pressed button when `part`, 0 to 1, of the blink has passed: twice down to 0.1 and back, each way in
  /// 0.2 seconds, eased at both ends.
  static double opacityOfBlink(double part);

  static std::shared_ptr<SondrelViewController> make();
  SondrelViewController(const SondrelViewController&) = delete;
  SondrelViewController& operator=(const SondrelViewController&) = delete;

  /// The first display: makes the capture service. Further calls do nothing.
  void viewDidLoad();

  /// Empties the list at once; the capture starts 0.3 seconds later, with the limits as they are then.
  void didTapStart();
  /// Ends the capture 0.3 seconds later.
  void didTapStop();
  /// Discards the library's files and empties the list 0.3 seconds later.
  void didTapReset();
  /// Asks the library for its configurations, which leads to the choice.
  void didTapConfig();
  /// The chunk slider was moved to `value`; it snaps to a multiple of 32.
  void didChangedChunkFileSliderValue(double value);
  /// The maximum slider was moved to `value`; it snaps to an integer.
  void didChangedMaxLogsSlider(double value);

  void didReceiveLogs(const std::vector<SondrelFileInformation>& batch) override;
  void showConfigOption(const std::vector<std::string>& configurations) override;
  void setMaxNumberOfLogs(double count) override { maxNumberOfLogs_ = count; }
  void setSondrelConfigurations(std::vector<std::string> configurations) override {
    sondrelConfigurations_ = std::move(configurations);
  }
  void present(Alert alert) override;
  void didSelectChoice(const std::string& name) override;

  /// Null until the view has loaded.
  const std::shared_ptr<SondrelService>& sondrelService() const { return sondrelService_; }
  /// None until the first batch.
  const std::optional<std::vector<SondrelFileInformation>>& sondrelData() const { return sondrelData_; }
  const std::vector<std::string>& sondrelConfigurations() const { return sondrelConfigurations_; }
  const std::string& currentLogConfiguration() const { return currentLogConfiguration_; }
  /// Nothing reads it.
  const std::string& loadingViewContext() const { return loadingViewContext_; }
  /// The limit that the library has confirmed; 0 before its first start.
  double maxNumberOfLogs() const { return maxNumberOfLogs_; }
  /// Of the configuration choice. The view sets its starting point.
  CircularTransition& transition() { return transition_; }
  LoadingView& loadingView() { return loadingView_; }

  const HighlightedText& configButtonTitle() const { return configButtonTitle_; }
  const HighlightedText& chunkFileLabel() const { return chunkFileLabel_; }
  const HighlightedText& maxLogsLabel() const { return maxLogsLabel_; }
  const CaptureSlider& chunkFileSlider() const { return chunkFileSlider_; }
  const CaptureSlider& maxLogsSlider() const { return maxLogsSlider_; }

  std::size_t numberOfRows() const { return sondrelData_ ? sondrelData_->size() : 0; }
  /// `index` must be less than `numberOfRows`.
  FavoritesTableCellV2 rowAt(std::size_t index) const { return row(sondrelData_.value().at(index)); }
  /// How a file is shown.
  static FavoritesTableCellV2 row(const SondrelFileInformation& file);

  /// `handler` reads the rows anew.
  [[nodiscard]] Connection onReload(Signal<>::Handler handler) { return reload_.connect(std::move(handler)); }
  /// `handler` reads texts and sliders anew.
  [[nodiscard]] Connection onChange(Signal<>::Handler handler) { return changed_.connect(std::move(handler)); }
  /// `handler` makes a button blink.
  [[nodiscard]] Connection onBlink(Signal<Action>::Handler handler) { return blink_.connect(std::move(handler)); }
  /// `handler` receives the modal to show. Nobody else holds it.
  [[nodiscard]] Connection onPresentModal(PresentModal::Handler handler) {
    return presentModal_.connect(std::move(handler));
  }

 private:
  SondrelViewController();
  /// Null when service or library is absent.
  Sondrel* sondrel() const { return sondrelService_ ? sondrelService_->sondrel() : nullptr; }
  double settledValue(double value, double step) const;
  void emptyList();
  void afterBlink(void (SondrelViewController::*action)());
  void start();
  void stop();
  void reset();
  void cleanupUIAfterReset();
  void checkIfReachedMax(const std::vector<SondrelFileInformation>& batch);

  CircularTransition transition_;
  std::shared_ptr<SondrelService> sondrelService_;
  std::optional<std::vector<SondrelFileInformation>> sondrelData_;
  std::vector<std::string> sondrelConfigurations_;
  std::string currentLogConfiguration_ = "Default";
  std::string loadingViewContext_;
  double maxNumberOfLogs_ = 0;
  LoadingView loadingView_{kLoadingText};
  CaptureSlider chunkFileSlider_{32, 1024};
  CaptureSlider maxLogsSlider_{256, 8192};
  HighlightedText configButtonTitle_;
  HighlightedText chunkFileLabel_;
  HighlightedText maxLogsLabel_;
  Signal<> reload_;
  Signal<> changed_;
  Signal<Action> blink_;
  PresentModal presentModal_;
};

}  // namespace quorl
