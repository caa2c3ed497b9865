#include "support/SteppedQueue.h"

#include <stdexcept>
#include <utility>

namespace quorl::test {

VirtualTime::VirtualTime(Date start) : now_(start) {}

void VirtualTime::advance(std::chrono::nanoseconds duration) {
  const std::chrono::nanoseconds end = elapsed_ + duration;
  settle();
  while (!delayed_.empty() && delayed_.begin()->first <= end) {
    auto node = delayed_.extract(delayed_.begin());
    now_ += std::chrono::duration_cast<Date::duration>(node.key() - elapsed_);
    elapsed_ = node.key();
    if (const auto queue = node.mapped().queue.lock()) queue->async(std::move(node.mapped().task));
    settle();
  }
  now_ += std::chrono::duration_cast<Date::duration>(end - elapsed_);
  elapsed_ = end;
}

std::size_t VirtualTime::settle() {
  std::size_t count = 0;
  for (bool ran = true; ran;) {
    ran = false;
    for (const auto& queue : queues()) {
      if (queue->step()) {
        ran = true;
        ++count;
      }
    }
  }
  return count;
}

std::shared_ptr<Queue> VirtualTime::makeSerialQueue(std::string label) {
  return makeStepped(std::move(label));
}

std::shared_ptr<SteppedQueue> VirtualTime::makeStepped(std::string label) {
  auto queue = std::make_shared<SteppedQueue>(*this, std::move(label));
  queues_.push_back(queue);
  return queue;
}

std::vector<std::shared_ptr<SteppedQueue>> VirtualTime::queues() const {
  std::vector<std::shared_ptr<SteppedQueue>> live;
  for (const auto& weak : queues_)
    if (auto queue = weak.lock()) live.push_back(std::move(queue));
  return live;
}

SteppedQueue& VirtualTime::queueLabelled(std::string_view beginning) const {
  for (const auto& queue : queues())
    if (queue->label().starts_with(beginning)) return *queue;
  throw std::runtime_error("no queue " + std::string(beginning));
}

void SteppedQueue::asyncAfter(Duration delay, Task task) {
  time_.delayed_.emplace(time_.elapsed_ + delay, VirtualTime::Delayed{weak_from_this(), std::move(task)});
}

bool SteppedQueue::step() {
  if (tasks_.empty() || isHanging_) return false;
  Task task = std::move(tasks_.front());
  tasks_.pop_front();
  isRunning_ = true;
  task();
  isRunning_ = false;
  return true;
}

}  // namespace quorl::test
