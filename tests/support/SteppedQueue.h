#pragma once

#include <chrono>
#include <cstddef>
#include <deque>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "base/Clock.h"
#include "base/Queue.h"

namespace quorl::test {

class SteppedQueue;

/// A wall clock that moves only when a test says so, and the stepped queues that live by it. Everything runs on the
/// test's thread. Declare it before all that uses it.
class VirtualTime final : public Clock, public QueueFactory {
 public:
  /// 2026-01-05 09:30:12 UTC, a Monday, unless told otherwise.
  explicit VirtualTime(Date start = Date(std::chrono::seconds(1767605412)));

  Date now() const override { return now_; }
  /// Moves the wall clock alone, as when the user sets it. Delays are not touched.
  void setNow(Date now) { now_ = now; }

  /// Lets `duration` pass: runs all that is queued, then each delayed task at its time, in order of time, and what
  /// follows from it.
  void advance(std::chrono::nanoseconds duration);
  /// Runs the queues, in the order in which they were made and one task each in turn, until nothing is left to do at
  /// this moment. Answers how many tasks ran.
  std::size_t settle();

  std::shared_ptr<Queue> makeSerialQueue(std::string label) override;
  std::shared_ptr<SteppedQueue> makeStepped(std::string label);
  /// All queues that were made and still live, in order.
  std::vector<std::shared_ptr<SteppedQueue>> queues() const;
  /// The first of these whose label begins so. There must be one.
  SteppedQueue& queueLabelled(std::string_view beginning) const;

 private:
  friend class SteppedQueue;
  struct Delayed {
    std::weak_ptr<SteppedQueue> queue;
    Queue::Task task;
  };

  Date now_;
  std::chrono::nanoseconds elapsed_{0};
  std::multimap<std::chrono::nanoseconds, Delayed> delayed_;
  std::vector<std::weak_ptr<SteppedQueue>> queues_;
};

/// A queue that runs its tasks when a test says so, on the test's thread.
class SteppedQueue final : public Queue, public std::enable_shared_from_this<SteppedQueue> {
 public:
  SteppedQueue(VirtualTime& time, std::string label) : time_(time), label_(std::move(label)) {}

  void async(Task task) override { tasks_.push_back(std::move(task)); }
  void asyncAfter(Duration delay, Task task) override;
  bool isCurrent() const override { return isRunning_; }
  const std::string& label() const override { return label_; }

  /// Runs the first waiting task. False when none waits, or while the queue hangs.
  bool step();
  std::size_t waiting() const { return tasks_.size(); }
  /// While it hangs no task runs, as behind one that never ends.
  void setHanging(bool isHanging) { isHanging_ = isHanging; }

 private:
  VirtualTime& time_;
  const std::string label_;
  std::deque<Task> tasks_;
  bool isRunning_ = false;
  bool isHanging_ = false;
};

}  // namespace quorl::test
