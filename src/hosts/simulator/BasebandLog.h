#pragma once

#include <atomic>
#include <cstddef>
#include <deque>
#include <mutex>
#include <string>

namespace quorl::simulator {

/// What the baseband does, line by line, for whoever captures it: the modem writes, the log capture reads. Nothing is
/// kept while nobody captures; of what waits too long the oldest goes. Thread-safe.
class BasebandLog {
 public:
  /// Bytes that wait at most.
  static constexpr std::size_t kCapacity = 4 * 1024 * 1024;

  /// Lines count from now on; those that wait from before are gone.
  void open();
  void close();
  bool isOpen() const { return isOpen_.load(std::memory_order_relaxed); }

  /// A line without its end. A closed log takes none.
  void add(std::string line);
  /// The oldest lines, with their ends, that together have `bytes` bytes at most. A line that is longer than that on
  /// its own comes cut.
  std::string take(std::size_t bytes);

 private:
  std::atomic<bool> isOpen_{false};
  std::mutex mutex_;
  std::deque<std::string> lines_;  // with their ends; guarded by mutex_
  std::size_t bytes_ = 0;          // of all lines; guarded by mutex_
};

}  // namespace quorl::simulator
