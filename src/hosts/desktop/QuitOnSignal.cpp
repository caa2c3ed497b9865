#include "hosts/desktop/QuitOnSignal.h"

#include <QCoreApplication>
#include <array>
#include <csignal>

#include <fcntl.h>
#include <unistd.h>

namespace quorl::desktop {
namespace {

constexpr std::array kSignals{SIGINT, SIGTERM, SIGHUP};

// A handler can use nothing but what the whole process has.
std::array<int, 2> ends{-1, -1};

void wake(int /*signal*/) {
  const char byte = 0;
  [[maybe_unused]] const ssize_t written = write(ends[1], &byte, 1);
}

}  // namespace

QuitOnSignal::QuitOnSignal() {
  if (pipe2(ends.data(), O_CLOEXEC | O_NONBLOCK) != 0) return;
  notifier_ = std::make_unique<QSocketNotifier>(ends[0], QSocketNotifier::Read);
  QObject::connect(notifier_.get(), &QSocketNotifier::activated, [] { QCoreApplication::quit(); });
  struct sigaction action {};
  action.sa_handler = wake;
  action.sa_flags = static_cast<int>(SA_RESETHAND | SA_RESTART);
  for (const int signal : kSignals) sigaction(signal, &action, nullptr);
}

QuitOnSignal::~QuitOnSignal() {
  if (!notifier_) return;
  for (const int signal : kSignals) std::signal(signal, SIG_DFL);
  notifier_.reset();
  for (int& end : ends) {
    close(end);
    end = -1;
  }
}

}  // namespace quorl::desktop
