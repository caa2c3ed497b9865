#include "hosts/simulator/TrackedQueue.h"

#include <utility>

namespace quorl::simulator {

void Activity::begin() {
  const std::lock_guard lock(mutex_);
  ++count_;
}

void Activity::end() {
  {
    const std::lock_guard lock(mutex_);
    if (--count_ > 0) return;
  }
  onRest_();
}

std::size_t Activity::count() const {
  const std::lock_guard lock(mutex_);
  return count_;
}

void TrackedQueue::async(Task task) {
  activity_->begin();
  queue_->async([activity = activity_, task = std::move(task)]() mutable {
    task();
    // What the task holds goes first: its destructors may queue more.
    task = nullptr;
    activity->end();
  });
}

void TrackedQueue::asyncAfter(Duration delay, Task task) {
  queue_->asyncAfter(delay, [activity = activity_, task = std::move(task)]() mutable {
    activity->begin();
    task();
    task = nullptr;
    activity->end();
  });
}

std::shared_ptr<Queue> TrackedQueueFactory::makeSerialQueue(std::string label) {
  return std::make_shared<TrackedQueue>(threads_.makeSerialQueue(std::move(label)), activity_);
}

}  // namespace quorl::simulator
