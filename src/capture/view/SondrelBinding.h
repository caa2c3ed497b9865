#pragma once

#include <QObject>
#include <QString>
#include <memory>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "capture/SondrelViewController.h"
#include "capture/view/FileListModel.h"
#include "shell/view/CircularTransitionBinding.h"
#include "shell/view/MultiChoiceSelectionModalBinding.h"

namespace quorl::view {

/// The capture screen for QML. Its making is the screen's first display. Main thread.
class SondrelBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the shell")
  Q_PROPERTY(quorl::view::FileListModel* files READ files CONSTANT)
  Q_PROPERTY(quorl::view::CircularTransitionBinding* transition READ transition CONSTANT)
  Q_PROPERTY(quorl::view::MultiChoiceSelectionModalBinding* choice READ choice NOTIFY choiceChanged)
  // Texts of which a part may be coloured: rich texts, and plain ones for a screen reader.
  Q_PROPERTY(QString configTitle READ configTitle NOTIFY changed)
  Q_PROPERTY(QString configPlainTitle READ configPlainTitle NOTIFY changed)
  Q_PROPERTY(QString chunkLabel READ chunkLabel NOTIFY changed)
  Q_PROPERTY(QString chunkPlainLabel READ chunkPlainLabel NOTIFY changed)
  Q_PROPERTY(QString maxLogsLabel READ maxLogsLabel NOTIFY changed)
  Q_PROPERTY(QString maxLogsPlainLabel READ maxLogsPlainLabel NOTIFY changed)
  Q_PROPERTY(QString highlightColor READ highlightColor WRITE setHighlightColor NOTIFY changed)
  Q_PROPERTY(double chunkMinimum READ chunkMinimum CONSTANT)
  Q_PROPERTY(double chunkMaximum READ chunkMaximum CONSTANT)
  Q_PROPERTY(double chunkValue READ chunkValue NOTIFY changed)
  Q_PROPERTY(double maxLogsMinimum READ maxLogsMinimum CONSTANT)
  Q_PROPERTY(double maxLogsMaximum READ maxLogsMaximum CONSTANT)
  Q_PROPERTY(double maxLogsValue READ maxLogsValue NOTIFY changed)
  Q_PROPERTY(bool isLoadingShown READ isLoadingShown NOTIFY loadingChanged)
  Q_PROPERTY(bool isLoadingAnimating READ isLoadingAnimating NOTIFY loadingChanged)
  Q_PROPERTY(QString loadingText READ loadingText NOTIFY loadingChanged)
  Q_PROPERTY(int blinkDurationMs READ blinkDurationMs CONSTANT)

 public:
  enum Action { Start, Stop, Reset };
  Q_ENUM(Action)

  explicit SondrelBinding(std::shared_ptr<SondrelViewController> screen, QObject* parent = nullptr);

  FileListModel* files() { return &files_; }
  CircularTransitionBinding* transition() { return &transition_; }
  /// The choice that is to be shown; null when there is none.
  MultiChoiceSelectionModalBinding* choice() { return choice_.get(); }
  QString configTitle() const;
  QString configPlainTitle() const;
  QString chunkLabel() const;
  QString chunkPlainLabel() const;
  QString maxLogsLabel() const;
  QString maxLogsPlainLabel() const;
  /// Of the coloured parts, as "#c2410c".
  QString highlightColor() const { return highlightColor_; }
  void setHighlightColor(const QString& color);
  double chunkMinimum() const { return screen_->chunkFileSlider().minimum(); }
  double chunkMaximum() const { return screen_->chunkFileSlider().maximum(); }
  double chunkValue() const { return screen_->chunkFileSlider().value(); }
  double maxLogsMinimum() const { return screen_->maxLogsSlider().minimum(); }
  double maxLogsMaximum() const { return screen_->maxLogsSlider().maximum(); }
  double maxLogsValue() const { return screen_->maxLogsSlider().value(); }
  bool isLoadingShown() const { return !screen_->loadingView().isHidden(); }
  bool isLoadingAnimating() const { return screen_->loadingView().isAnimating(); }
  QString loadingText() const;
  int blinkDurationMs() const { return qRound(SondrelViewController::kBlinkDurationS * 1000); }

  /// See `SondrelViewController::opacityOfBlink`.
  Q_INVOKABLE static double opacityOfBlink(double part) { return SondrelViewController::opacityOfBlink(part); }
  Q_INVOKABLE void tap(quorl::view::SondrelBinding::Action action);
  Q_INVOKABLE void tapConfig() { screen_->didTapConfig(); }
  Q_INVOKABLE void moveChunkSlider(double value) { screen_->didChangedChunkFileSliderValue(value); }
  Q_INVOKABLE void moveMaxLogsSlider(double value) { screen_->didChangedMaxLogsSlider(value); }
  /// The choice has left the window.
  Q_INVOKABLE void choiceDidClose();

 signals:
  void changed();
  void loadingChanged();
  void choiceChanged();
  /// The button of `action` blinks.
  void blinked(quorl::view::SondrelBinding::Action action);

 private:
  QString richText(const HighlightedText& text) const;
  void showChoice(std::shared_ptr<MultiChoiceSelectionModal> modal);

  const std::shared_ptr<SondrelViewController> screen_;
  FileListModel files_;
  CircularTransitionBinding transition_;
  std::unique_ptr<MultiChoiceSelectionModalBinding> choice_;
  QString highlightColor_;
  const Connection reloads_;
  const Connection changes_;
  const Connection loading_;
  const Connection blinks_;
  const Connection choices_;
};

}  // namespace quorl::view
