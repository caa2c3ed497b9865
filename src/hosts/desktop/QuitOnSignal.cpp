#include "hosts/desktop/QuitOnSignal.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <utility>

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

namespace quorl::desktop {
namespace {

constexpr std::array kSignals{SIGINT, SIGTERM, SIGHUP};

// A handler can use nothing but what the whole process has.
std::array<int, 2> ends{-1, -1};

void replaceHandler(int signal, void (*from)(int), void (*to)(int)) {
  struct sigaction action {};
  if (sigaction(signal, nullptr, &action) != 0 || action.sa_handler != from) return;
  action = {};
  action.sa_handler = to;
  action.sa_flags = SA_RESTART;
  sigaction(signal, &action, nullptr);
}

/// The next signal, whichever it is, finds the process as if there had been no handler.
void wake(int /*signal*/) {
  const int error = errno;
  const char byte = 0;
  [[maybe_unused]] const ssize_t written = write(ends[1], &byte, 1);
  for (const int signal : kSignals) replaceHandler(signal, wake, SIG_DFL);
  errno = error;
}

}  // namespace

QuitOnSignal::QuitOnSignal() {
  if (pipe2(ends.data(), O_CLOEXEC | O_NONBLOCK) != 0) return;
  for (const int signal : kSignals) replaceHandler(signal, SIG_DFL, wake);
}

QuitOnSignal::~QuitOnSignal() {
  for (const int signal : kSignals) replaceHandler(signal, wake, SIG_DFL);
  notifier_.reset();
  for (int& end : ends) {
    if (end >= 0) close(end);
    end = -1;
  }
}

bool QuitOnSignal::isAsked(std::chrono::milliseconds within) const {
  pollfd wish{ends[0], POLLIN, 0};
  return poll(&wish, 1, static_cast<int>(within.count())) > 0;
}

void QuitOnSignal::whenAsked(std::function<void()> end) {
  if (ends[0] < 0) return;
  notifier_ = std::make_unique<QSocketNotifier>(ends[0], QSocketNotifier::Read);
  QObject::connect(notifier_.get(), &QSocketNotifier::activated, [notifier = notifier_.get(), end = std::move(end)] {
    notifier->setEnabled(false);
    end();
  });
}

}  // namespace quorl::desktop
