#include "RunDocuments.h"

#include <csignal>
#include <system_error>
#include <thread>
#include <utility>

#include <fmt/format.h>

#include "base/Uuid.h"

namespace quorl::tool {

namespace fs = std::filesystem;

namespace {

void removeWhole(const fs::path& directory) {
  constexpr int kAttempts = 3;  // the product may be making files in it
  std::error_code error;
  for (int i = 0; i < kAttempts; ++i)
    if (fs::remove_all(directory, error); !error) return;
}

/// The signals that end a process at its user's wish, but for those that whoever started it wants ignored.
sigset_t endingSignals() {
  sigset_t signals;
  sigemptyset(&signals);
  for (const int signal : {SIGINT, SIGTERM, SIGHUP}) {
    struct sigaction action {};
    if (sigaction(signal, nullptr, &action) == 0 && action.sa_handler != SIG_IGN) sigaddset(&signals, signal);
  }
  return signals;
}

/// A thread waits for the signal, since a handler could not remove anything.
void removeWhenInterrupted(const fs::path& directory, const std::shared_ptr<std::mutex>& inUse) {
  const sigset_t signals = endingSignals();
  pthread_sigmask(SIG_BLOCK, &signals, nullptr);
  std::thread([directory, inUse, signals] {
    int signal = 0;
    if (sigwait(&signals, &signal) != 0) return;
    const std::lock_guard lock(*inUse);
    removeWhole(directory);
    pthread_sigmask(SIG_UNBLOCK, &signals, nullptr);
    raise(signal);
  }).detach();
}

}  // namespace

tl::expected<std::unique_ptr<RunDocuments>, std::string> RunDocuments::make(const std::string& named) {
  if (!named.empty()) return std::unique_ptr<RunDocuments>(new RunDocuments(named, /*isNamed=*/true));
  std::error_code error;
  const fs::path parent = fs::temp_directory_path(error);
  if (error)
    return tl::unexpected(fmt::format("there is no directory for temporary files (TMPDIR): {}", error.message()));
  return std::unique_ptr<RunDocuments>(
      new RunDocuments(parent / ("quorl-carriers-" + Uuid::make().string()), /*isNamed=*/false));
}

RunDocuments::RunDocuments(fs::path path, bool isNamed)
    : path_(std::move(path)), isNamed_(isNamed), inUse_(std::make_shared<std::mutex>()), using_(*inUse_) {
  if (!isNamed_) removeWhenInterrupted(path_, inUse_);
}

RunDocuments::~RunDocuments() {
  if (isNamed_) return;
  if (!using_) using_.lock();
  removeWhole(path_);
}

void RunDocuments::settled() {
  using_.unlock();
}

}  // namespace quorl::tool
