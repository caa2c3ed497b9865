#include "capture/SondrelViewController.h"

#include <chrono>
#include <cmath>

#include <fmt/format.h>

#include "base/DateText.h"
#include "platform/Platform.h"
#include "shell/Logs.h"

namespace quorl {
namespace {

constexpr std::chrono::milliseconds kActionDelay{300};
constexpr double kChunkFileStep = 32;
constexpr double kMaxLogsStep = 1;
constexpr double kBlinkOpacity = 0.1;
constexpr int kBlinkCount = 2;

double easedAtBothEnds(double part) {
  return part < 0.5 ? 2 * part * part : 1 - 2 * (1 - part) * (1 - part);
}

}  // namespace

SondrelViewController::SondrelViewController()
    : configButtonTitle_(highlight("Log Configuration: Default", currentLogConfiguration_)),
      // "Mb" until the slider is first moved, and " Kb" from then on.
      chunkFileLabel_(highlight("Chunk file size: 32 Mb", currentLogConfiguration_)),
      maxLogsLabel_(highlight("Max log file: 256 files", currentLogConfiguration_)) {
  transition_.setCircleColor("Background");
  loadingView_.show();
  loadingView_.stopAnimating();
}

std::shared_ptr<SondrelViewController> SondrelViewController::make() {
  return std::shared_ptr<SondrelViewController>(new SondrelViewController);
}

void SondrelViewController::viewDidLoad() {
  if (sondrelService_) return;
  sondrelService_ = SondrelService::make();
  sondrelService_->setDelegate(weak_from_this());
}

double SondrelViewController::opacityOfBlink(double part) {
  const double way = std::fmod(part * kBlinkCount, 1) * 2;  // 0 to 1 down, 1 to 2 back
  return 1 - (1 - kBlinkOpacity) * easedAtBothEnds(way < 1 ? way : 2 - way);
}

void SondrelViewController::didTapStart() {
  emptyList();
  blink_(Action::start);
  appUiLog.log("SondrelViewController - didTapStart");
  afterBlink(&SondrelViewController::start);
}

void SondrelViewController::didTapStop() {
  blink_(Action::stop);
  appUiLog.log("SondrelViewController - didTapStop");
  afterBlink(&SondrelViewController::stop);
}

void SondrelViewController::didTapReset() {
  blink_(Action::reset);
  appUiLog.log("SondrelViewController - didTapReset");
  afterBlink(&SondrelViewController::reset);
}

void SondrelViewController::afterBlink(void (SondrelViewController::*action)()) {
  Platform::current().mainQueue.asyncAfter(kActionDelay, [weak = weak_from_this(), action] {
    if (const auto self = weak.lock()) ((*self).*action)();
  });
}

void SondrelViewController::start() {
  Sondrel* library = sondrel();
  if (library == nullptr) return;
  SondrelConfiguration configuration;
  configuration.setActiveConfig(currentLogConfiguration_);
  configuration.setChunkFileSize(chunkFileSlider_.value());
  configuration.setMaxNumberOfLogs(maxLogsSlider_.value());
  sondrelLog.log("SondrelService - initializeLogger");
  library->start(configuration);
}

void SondrelViewController::stop() {
  if (Sondrel* library = sondrel()) library->stop();
}

void SondrelViewController::reset() {
  if (Sondrel* library = sondrel()) library->reset();
  cleanupUIAfterReset();
}

void SondrelViewController::cleanupUIAfterReset() {
  appUiLog.log("SondrelViewController - cleanupUIAfterReset");
  emptyList();
  loadingView_.setLoadingLabelText(kLoadingText);
  loadingView_.show();
  loadingView_.stopAnimating();
}

void SondrelViewController::emptyList() {
  if (sondrelData_) sondrelData_->clear();
  reload_();
}

void SondrelViewController::didTapConfig() {
  appUiLog.log("SondrelViewController - didTapConfig");
  if (Sondrel* library = sondrel()) library->getConfigurationList();
}

double SondrelViewController::settledValue(double value, double step) const {
  // The chunk slider's limits are taken as they are by either slider.
  if (value == chunkFileSlider_.minimum()) return chunkFileSlider_.minimum();
  if (value == chunkFileSlider_.maximum()) return chunkFileSlider_.maximum();
  return std::round(value / step) * step;
}

void SondrelViewController::didChangedChunkFileSliderValue(double value) {
  chunkFileSlider_.setValue(value);
  chunkFileSlider_.setValue(settledValue(chunkFileSlider_.value(), kChunkFileStep));
  chunkFileLabel_ =
      highlight(fmt::format("Chunk file size: {:.0f} Kb", chunkFileSlider_.value()), currentLogConfiguration_);
  changed_();
}

void SondrelViewController::didChangedMaxLogsSlider(double value) {
  maxLogsSlider_.setValue(value);
  maxLogsSlider_.setValue(settledValue(maxLogsSlider_.value(), kMaxLogsStep));
  maxLogsLabel_ =
      highlight(fmt::format("Max log file: {:.0f} files", maxLogsSlider_.value()), currentLogConfiguration_);
  changed_();
}

void SondrelViewController::didReceiveLogs(const std::vector<SondrelFileInformation>& batch) {
  appUiLog.log("SondrelViewController - didReceiveLogs");
  if (!sondrelData_) {
    sondrelData_ = batch;
  } else {
    checkIfReachedMax(batch);
    sondrelData_->insert(sondrelData_->end(), batch.begin(), batch.end());
  }
  if (batch.empty()) {
    loadingView_.show();
  } else {
    loadingView_.hide();
  }
  reload_();
}

void SondrelViewController::checkIfReachedMax(const std::vector<SondrelFileInformation>& batch) {
  const std::size_t count = sondrelData_->size();
  if (static_cast<double>(count) < maxNumberOfLogs_) return;
  appUiLog.log("SondrelViewController - checkIfReachedMax - maxReached: %{public}d", count + batch.size());
  // The caller appends the batch again, so that it stands in the list twice after a wrap.
  sondrelData_ = batch;
  reload_();
}

void SondrelViewController::showConfigOption(const std::vector<std::string>& configurations) {
  appUiLog.log("SondrelViewController - showConfigOption");
  presentModal_(std::make_shared<MultiChoiceSelectionModal>(configurations, weak_from_this()));
}

void SondrelViewController::present(Alert alert) {
  Platform::current().alerts.present(std::move(alert));
}

void SondrelViewController::didSelectChoice(const std::string& name) {
  currentLogConfiguration_ = name;
  configButtonTitle_ = highlight("Log Configuration: " + name, name);
  changed_();
}

FavoritesTableCellV2 SondrelViewController::row(const SondrelFileInformation& file) {
  return {"File name: " + file.fileName, "File Size: " + file.fileSize,
          styledText(file.timestamp, DateTextStyle::Medium, DateTextStyle::Medium),
          /*isActivityIndicatorHidden=*/true};
}

}  // namespace quorl
