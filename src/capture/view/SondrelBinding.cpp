#include "capture/view/SondrelBinding.h"

#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {
namespace {

using Screen = SondrelViewController;

static_assert(static_cast<int>(Screen::Action::start) == SondrelBinding::Start &&
              static_cast<int>(Screen::Action::stop) == SondrelBinding::Stop &&
              static_cast<int>(Screen::Action::reset) == SondrelBinding::Reset);

/// A first display, before anything refers to what it makes.
std::shared_ptr<Screen> displayed(std::shared_ptr<Screen> screen) {
  screen->viewDidLoad();
  return screen;
}

}  // namespace

SondrelBinding::SondrelBinding(std::shared_ptr<SondrelViewController> screen, QObject* parent)
    : QObject(parent),
      screen_(displayed(std::move(screen))),
      files_(*screen_),
      transition_(screen_->transition()),
      reloads_(screen_->onReload([this] { files_.reload(); })),
      changes_(screen_->onChange([this] { emit changed(); })),
      loading_(screen_->loadingView().onChange([this] { emit loadingChanged(); })),
      blinks_(screen_->onBlink([this](Screen::Action action) { emit blinked(static_cast<Action>(action)); })),
      choices_(screen_->onPresentModal(
          [this](std::shared_ptr<MultiChoiceSelectionModal> modal) { showChoice(std::move(modal)); })) {}

QString SondrelBinding::richText(const HighlightedText& text) const {
  const QString before = toQt(text.before).toHtmlEscaped();
  const QString after = toQt(text.after).toHtmlEscaped();
  if (text.highlighted.empty()) return before + after;
  return QStringLiteral("%1<font color=\"%2\">%3</font>%4")
      .arg(before, highlightColor_, toQt(text.highlighted).toHtmlEscaped(), after);
}

QString SondrelBinding::configTitle() const {
  return richText(screen_->configButtonTitle());
}

QString SondrelBinding::configPlainTitle() const {
  return toQt(screen_->configButtonTitle().text());
}

QString SondrelBinding::chunkLabel() const {
  return richText(screen_->chunkFileLabel());
}

QString SondrelBinding::chunkPlainLabel() const {
  return toQt(screen_->chunkFileLabel().text());
}

QString SondrelBinding::maxLogsLabel() const {
  return richText(screen_->maxLogsLabel());
}

QString SondrelBinding::maxLogsPlainLabel() const {
  return toQt(screen_->maxLogsLabel().text());
}

void SondrelBinding::setHighlightColor(const QString& color) {
  if (color == highlightColor_) return;
  highlightColor_ = color;
  emit changed();
}

QString SondrelBinding::loadingText() const {
  return toQt(screen_->loadingView().loadingLabelText());
}

void SondrelBinding::tap(Action action) {
  switch (action) {
    case Start:
      screen_->didTapStart();
      return;
    case Stop:
      screen_->didTapStop();
      return;
    case Reset:
      screen_->didTapReset();
      return;
  }
}

void SondrelBinding::showChoice(std::shared_ptr<MultiChoiceSelectionModal> modal) {
  // One at a time: an answer that comes while a choice stands is dropped.
  if (choice_) return;
  choice_ = std::make_unique<MultiChoiceSelectionModalBinding>(std::move(modal));
  emit choiceChanged();
}

void SondrelBinding::choiceDidClose() {
  // QML is inside a handler of it.
  if (MultiChoiceSelectionModalBinding* closed = choice_.release()) closed->deleteLater();
  emit choiceChanged();
}

}  // namespace quorl::view
