#pragma once

#include <QSocketNotifier>
#include <memory>

namespace quorl::desktop {

/// Ends the event loop as a closed window would when the process is asked to end (SIGINT, SIGTERM, SIGHUP), so that
/// what is being stored and recorded gets there. A second signal ends the process at once. Main thread; one at a time.
class QuitOnSignal {
 public:
  QuitOnSignal();
  ~QuitOnSignal();
  QuitOnSignal(const QuitOnSignal&) = delete;
  QuitOnSignal& operator=(const QuitOnSignal&) = delete;

 private:
  std::unique_ptr<QSocketNotifier> notifier_;
};

}  // namespace quorl::desktop
