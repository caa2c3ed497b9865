#pragma once

#include <atomic>
#include <list>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <utility>

#include <boost/asio/executor_work_guard.hpp>
#include <boost/asio/io_context.hpp>
#include <boost/asio/steady_timer.hpp>

#include "base/Queue.h"

namespace quorl {

/// A `Queue` on an Asio loop that somebody runs: `SerialQueue` on a thread of its own, a host on its main thread.
class LoopQueue : public Queue {
 public:
  explicit LoopQueue(std::string label);
  ~LoopQueue() override;
  LoopQueue(const LoopQueue&) = delete;
  LoopQueue& operator=(const LoopQueue&) = delete;

  void async(Task task) override;
  void asyncAfter(Duration delay, Task task) override;
  bool isCurrent() const override;
  const std::string& label() const override { return label_; }

  /// Runs tasks on the calling thread until `stop`. Only one thread at a time may run the loop.
  void run();
  /// Makes `run` return after the task at hand. May be called on any thread. `run` may be called again afterwards.
  void stop();

 protected:
  /// Lets `run` return once nothing waits any more, pending delays cancelled.
  void finish();

 private:
  const std::string label_;
  boost::asio::io_context loop_;
  boost::asio::executor_work_guard<boost::asio::io_context::executor_type> work_;
  std::mutex timersMutex_;
  std::list<boost::asio::steady_timer> timers_;  // guarded by timersMutex_
  bool finishing_ = false;                       // guarded by timersMutex_
  std::atomic<std::thread::id> runner_;
};

/// A `Queue` with a thread of its own. The destructor runs what is already queued, drops tasks that wait for their
/// time, and joins the thread; destroyed on its own thread, it detaches instead and the loop ends by itself.
class SerialQueue final : public Queue {
 public:
  explicit SerialQueue(std::string label);
  ~SerialQueue() override;

  void async(Task task) override;
  void asyncAfter(Duration delay, Task task) override;
  bool isCurrent() const override;
  const std::string& label() const override;

 private:
  class Loop;
  std::shared_ptr<Loop> loop_;
  std::thread thread_;
};

/// One thread for each queue.
class ThreadQueueFactory final : public QueueFactory {
 public:
  std::shared_ptr<Queue> makeSerialQueue(std::string label) override {
    return std::make_shared<SerialQueue>(std::move(label));
  }
};

}  // namespace quorl
