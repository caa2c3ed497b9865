#pragma once

#include <Qt>

#include "app/ApplicationLoop.h"

namespace quorl::desktop {

/// Turns the states of a Qt application into the product's lifecycle events. A window without the keyboard is inactive;
/// one that is hidden or suspended is in the background. Main thread.
class Lifecycle {
 public:
  explicit Lifecycle(AppDelegate& application) : loop_(application) {}

  /// Launches, which leaves the product active.
  void launch();
  /// A state that the product is in already does nothing.
  void stateDidChange(Qt::ApplicationState state);
  /// Nothing follows it.
  void terminate();

 private:
  enum class State { Launching, Active, Inactive, Background, Terminated };

  ApplicationLoop loop_;
  State state_ = State::Launching;
};

}  // namespace quorl::desktop
