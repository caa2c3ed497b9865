#include "base/SerialQueue.h"

#include <utility>

#include <boost/asio/post.hpp>

namespace quorl {

namespace asio = boost::asio;

LoopQueue::LoopQueue(std::string label) : label_(std::move(label)), loop_(1), work_(asio::make_work_guard(loop_)) {}

LoopQueue::~LoopQueue() = default;

void LoopQueue::async(Task task) {
  asio::post(loop_, std::move(task));
}

void LoopQueue::asyncAfter(Duration delay, Task task) {
  // The lock covers async_wait too: a timer is not safe against being cancelled by `finish` meanwhile.
  const std::lock_guard lock(timersMutex_);
  if (finishing_) return;
  const auto timer =
      timers_.emplace(timers_.end(), loop_, std::chrono::duration_cast<asio::steady_timer::duration>(delay));
  timer->async_wait([this, timer, task = std::move(task)](const boost::system::error_code& error) {
    {
      const std::lock_guard erasing(timersMutex_);
      timers_.erase(timer);
    }
    if (!error) task();
  });
}

bool LoopQueue::isCurrent() const {
  return runner_.load(std::memory_order_relaxed) == std::this_thread::get_id();
}

void LoopQueue::run() {
  runner_.store(std::this_thread::get_id(), std::memory_order_relaxed);
  loop_.run();
  runner_.store(std::thread::id(), std::memory_order_relaxed);
  loop_.restart();
}

void LoopQueue::stop() {
  loop_.stop();
}

void LoopQueue::finish() {
  {
    const std::lock_guard lock(timersMutex_);
    finishing_ = true;
    for (asio::steady_timer& timer : timers_) timer.cancel();
  }
  work_.reset();
}

class SerialQueue::Loop final : public LoopQueue {
 public:
  using LoopQueue::finish;
  using LoopQueue::LoopQueue;
};

SerialQueue::SerialQueue(std::string label) : loop_(std::make_shared<Loop>(std::move(label))) {
  thread_ = std::thread([loop = loop_] { loop->run(); });
}

SerialQueue::~SerialQueue() {
  const bool onOwnThread = isCurrent();
  loop_->finish();
  if (onOwnThread) {
    thread_.detach();
  } else {
    thread_.join();
  }
}

void SerialQueue::async(Task task) {
  loop_->async(std::move(task));
}

void SerialQueue::asyncAfter(Duration delay, Task task) {
  loop_->asyncAfter(delay, std::move(task));
}

bool SerialQueue::isCurrent() const {
  return loop_->isCurrent();
}

const std::string& SerialQueue::label() const {
  return loop_->label();
}

}  // namespace quorl
