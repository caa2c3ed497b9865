#include "hosts/desktop/QtQueue.h"

#include <QMetaObject>
#include <QThread>
#include <QTimer>
#include <algorithm>
#include <chrono>
#include <utility>

namespace quorl::desktop {

QtQueue::QtQueue(std::string label) : label_(std::move(label)), receiver_(std::make_unique<QObject>()) {}

QtQueue::~QtQueue() = default;

void QtQueue::async(Task task) {
  // A task that throws ends the process, here rather than somewhere in the event loop.
  QMetaObject::invokeMethod(
      receiver_.get(), [task = std::move(task)]() noexcept { task(); }, Qt::QueuedConnection);
}

void QtQueue::asyncAfter(Duration delay, Task task) {
  // The timer belongs to the queue's thread, the time counts from this call.
  const auto due = std::chrono::steady_clock::now() + delay;
  async([receiver = receiver_.get(), due, task = std::move(task)]() mutable {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(due - std::chrono::steady_clock::now());
    QTimer::singleShot(std::max(left, std::chrono::milliseconds(0)), Qt::PreciseTimer, receiver,
                       [task = std::move(task)]() noexcept { task(); });
  });
}

bool QtQueue::isCurrent() const {
  return QThread::currentThread() == receiver_->thread();
}

}  // namespace quorl::desktop
