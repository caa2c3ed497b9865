#pragma once

#include <cstddef>
#include <memory>
#include <mutex>
#include <vector>

#include "base/Queue.h"

namespace quorl {

/// Counts pieces of asynchronous work and tells when all of them have ended. Thread-safe; a copy is the same group.
class DispatchGroup {
 public:
  DispatchGroup() : state_(std::make_shared<State>()) {}

  void enter();
  /// Leaving more often than entering is a bug and ends the process.
  void leave();
  /// Queues `task` on `queue` as soon as the group is empty, which may be at once. `queue` must outlive the group.
  void notify(Queue& queue, Queue::Task task);

 private:
  struct Waiter {
    Queue* queue;
    Queue::Task task;
  };
  struct State {
    std::mutex mutex;
    std::size_t count = 0;
    std::vector<Waiter> waiters;
  };
  std::shared_ptr<State> state_;
};

}  // namespace quorl
