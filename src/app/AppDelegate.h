#pragma once

#include <memory>

#include "shell/Window.h"

namespace quorl {

class ZelkorWrapper;

/// The application object: composes the product and carries it through its lifecycle. A host installs a `Platform`,
/// makes one of these, and calls the entry points from its main thread as the platform's events arrive.
///
/// What it makes lives as long as the process; there is no explicit tear-down.
class AppDelegate {
 public:
  /// Makes all objects, starts the channel, and always answers true. On a device that cannot name its baseband a
  /// dialog is shown, whose one button ends the process; the rest runs on behind it.
  bool onLaunch();
  /// Puts the subscription up and asks for a snapshot. Runs once right after every launch, too.
  void onBecomeActive();
  /// Withdraws the subscription; objects and store stay.
  void onEnterBackground();
  /// Withdraws the subscription.
  void onTerminate();
  void onResignActive() {}
  void onEnterForeground() {}

  /// Null before the launch.
  const std::unique_ptr<Window>& window() const { return window_; }
  /// Declared and never assigned: all use of the wrapper goes through its shared instance.
  ZelkorWrapper* zelkorManager() const { return zelkorManager_; }

 private:
  void withdraw();
  void presentBasebandError();

  std::unique_ptr<Window> window_;
  ZelkorWrapper* zelkorManager_ = nullptr;
};

}  // namespace quorl
