#pragma once

#include <functional>
#include <future>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "base/SerialQueue.h"

namespace quorl::test {

/// Runs `work` on the queue's thread, and waits for its end.
inline void runOn(Queue& queue, const std::function<void()>& work) {
  std::promise<void> done;
  queue.async([&] {
    work();
    done.set_value();
  });
  done.get_future().wait();
}

/// Keeps the queues that it made, so that a test can wait for their threads: one may still be handing its last answer
/// to the main queue when that answer has long been taken.
class ThreadedQueues final : public QueueFactory {
 public:
  std::shared_ptr<Queue> makeSerialQueue(std::string label) override {
    return made_.emplace_back(std::make_shared<SerialQueue>(std::move(label)));
  }
  /// Waits until each has come to the end of what it has now.
  void drain() {
    for (const auto& queue : made_) runOn(*queue, [] {});
  }
  /// The same, and lets go of them: a task may hold the last reference to its own queue; now there is none left.
  void join() {
    drain();
    made_.clear();
  }

 private:
  std::vector<std::shared_ptr<Queue>> made_;
};

}  // namespace quorl::test
