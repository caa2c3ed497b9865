#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <mutex>
#include <string>

#include "base/Queue.h"
#include "base/SerialQueue.h"

namespace quorl::simulator {

/// Counts the tasks of a set of queues that wait or run, so that a host can tell when all of them have come to rest.
/// Thread-safe.
class Activity {
 public:
  /// `onRest` is called each time the last task has ended, on that task's thread.
  explicit Activity(std::function<void()> onRest) : onRest_(std::move(onRest)) {}

  void begin();
  void end();
  bool isAtRest() const { return count() == 0; }
  /// Tasks that wait or run.
  std::size_t count() const;

 private:
  const std::function<void()> onRest_;
  mutable std::mutex mutex_;
  std::size_t count_ = 0;  // guarded by mutex_
};

/// Another queue whose tasks are counted from the call that queues them to their end. A task that waits for its time
/// counts from when it is due: a phone whose only plans are for later is at rest.
class TrackedQueue final : public Queue {
 public:
  TrackedQueue(std::shared_ptr<Queue> queue, std::shared_ptr<Activity> activity)
      : queue_(std::move(queue)), activity_(std::move(activity)) {}

  void async(Task task) override;
  void asyncAfter(Duration delay, Task task) override;
  bool isCurrent() const override { return queue_->isCurrent(); }
  const std::string& label() const override { return queue_->label(); }

 private:
  const std::shared_ptr<Queue> queue_;
  const std::shared_ptr<Activity> activity_;
};

/// One thread for each queue, each of them counted.
class TrackedQueueFactory final : public QueueFactory {
 public:
  explicit TrackedQueueFactory(std::shared_ptr<Activity> activity) : activity_(std::move(activity)) {}
  std::shared_ptr<Queue> makeSerialQueue(std::string label) override;

 private:
  const std::shared_ptr<Activity> activity_;
  ThreadQueueFactory threads_;
};

}  // namespace quorl::simulator
