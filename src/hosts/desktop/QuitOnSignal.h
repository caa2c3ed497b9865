#pragma once

#include <QSocketNotifier>
#include <chrono>
#include <functional>
#include <memory>

namespace quorl::desktop {

/// Lets the program end as with a closed window when the process is asked to end (SIGINT, SIGTERM, SIGHUP), so that
/// what is being stored and recorded gets there. A second signal ends the process at once; one that the process was
/// started to ignore stays ignored. Main thread; one at a time.
class QuitOnSignal {
 public:
  QuitOnSignal();
  ~QuitOnSignal();
  QuitOnSignal(const QuitOnSignal&) = delete;
  QuitOnSignal& operator=(const QuitOnSignal&) = delete;

  /// Whether a signal has come, waiting `within` for one.
  bool isAsked(std::chrono::milliseconds within = std::chrono::milliseconds(0)) const;
  /// Calls `end` from the event loop, once, when a signal comes or if it has come already.
  void whenAsked(std::function<void()> end);

 private:
  std::unique_ptr<QSocketNotifier> notifier_;
};

}  // namespace quorl::desktop
