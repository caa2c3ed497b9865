#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

namespace quorl {

/// A serial executor: tasks run one at a time, in the order in which they were queued.
///
/// A task never runs inside the call that queues it. `async` and `asyncAfter` may be called on any thread.
/// A task that throws is a bug and ends the process.
class Queue {
 public:
  using Task = std::function<void()>;
  using Duration = std::chrono::nanoseconds;

  virtual ~Queue() = default;

  /// Runs `task` after all tasks that are already waiting.
  virtual void async(Task task) = 0;
  /// Queues `task` once `delay` has passed. Tasks still waiting for their time when the queue ends are dropped.
  virtual void asyncAfter(Duration delay, Task task) = 0;
  /// True on the thread (or in the step) that runs this queue's tasks now.
  virtual bool isCurrent() const = 0;
  /// For logs and debuggers.
  virtual const std::string& label() const = 0;
};

/// Makes the serial queues that the product owns (database, baseband client library), so that a host decides
/// whether each gets a thread and tests can step them.
class QueueFactory {
 public:
  virtual ~QueueFactory() = default;
  virtual std::shared_ptr<Queue> makeSerialQueue(std::string label) = 0;
};

}  // namespace quorl
