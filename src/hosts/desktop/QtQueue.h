#pragma once

#include <QObject>
#include <memory>
#include <string>

#include "base/Queue.h"

namespace quorl::desktop {

/// A `Queue` on the event loop of the thread that makes it. Tasks that still wait when it goes away are dropped. It is
/// to be destroyed on its own thread, once no other thread calls it.
class QtQueue final : public Queue {
 public:
  explicit QtQueue(std::string label);
  ~QtQueue() override;
  QtQueue(const QtQueue&) = delete;
  QtQueue& operator=(const QtQueue&) = delete;

  void async(Task task) override;
  void asyncAfter(Duration delay, Task task) override;
  bool isCurrent() const override;
  const std::string& label() const override { return label_; }

 private:
  const std::string label_;
  const std::unique_ptr<QObject> receiver_;  // lives on the queue's thread; its events are the tasks
};

}  // namespace quorl::desktop
