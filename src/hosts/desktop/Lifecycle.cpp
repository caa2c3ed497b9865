#include "hosts/desktop/Lifecycle.h"

namespace quorl::desktop {

void Lifecycle::launch() {
  loop_.launch();
  state_ = State::Active;
}

void Lifecycle::stateDidChange(Qt::ApplicationState state) {
  if (state_ == State::Launching || state_ == State::Terminated) return;
  switch (state) {
    case Qt::ApplicationActive:
      if (state_ == State::Active) return;
      if (state_ == State::Background) loop_.enterForeground();
      loop_.becomeActive();
      state_ = State::Active;
      return;
    case Qt::ApplicationInactive:
      // Out of the background it comes through "active".
      if (state_ != State::Active) return;
      loop_.resignActive();
      state_ = State::Inactive;
      return;
    case Qt::ApplicationHidden:
    case Qt::ApplicationSuspended:
      if (state_ == State::Background) return;
      if (state_ == State::Active) loop_.resignActive();
      loop_.enterBackground();
      state_ = State::Background;
      return;
  }
}

void Lifecycle::terminate() {
  if (state_ == State::Launching || state_ == State::Terminated) return;
  loop_.terminate();
  state_ = State::Terminated;
}

}  // namespace quorl::desktop
