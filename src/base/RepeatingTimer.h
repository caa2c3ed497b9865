#pragma once

#include <memory>

#include "base/Queue.h"

namespace quorl {

/// Runs a task on a queue again and again, the first time after one interval. Ends when it goes away: destroyed on the
/// queue's own thread, no tick follows; on another thread, a tick that has begun may still finish.
class RepeatingTimer {
 public:
  /// `queue` must outlive the timer. A tick may destroy the timer.
  RepeatingTimer(Queue& queue, Queue::Duration interval, Queue::Task tick);
  ~RepeatingTimer() = default;
  RepeatingTimer(const RepeatingTimer&) = delete;
  RepeatingTimer& operator=(const RepeatingTimer&) = delete;

 private:
  struct State;
  static void schedule(const std::shared_ptr<State>& state);

  std::shared_ptr<State> state_;
};

}  // namespace quorl
