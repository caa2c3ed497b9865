#pragma once

#include "app/AppDelegate.h"

namespace quorl {

/// The lifecycle of the process as a host drives it: calls the application object's entry points and tells observers of
/// the platform's lifecycle events, in the order in which a platform does. Main thread.
class ApplicationLoop {
 public:
  explicit ApplicationLoop(AppDelegate& application) : application_(application) {}

  /// Launches, then becomes active.
  void launch();
  void becomeActive();
  void resignActive() { application_.onResignActive(); }
  void enterBackground() { application_.onEnterBackground(); }
  void enterForeground() { application_.onEnterForeground(); }
  void terminate();

 private:
  AppDelegate& application_;
};

}  // namespace quorl
