#include "hosts/desktop/QtQueue.h"

#include <QMetaObject>
#include <QThread>
#include <QTimer>
#include <algorithm>
#include <chrono>
#include <utility>

namespace quorl::desktop {
namespace {

using std::chrono::milliseconds;
using std::chrono::steady_clock;

/// Timers of the event loop count in 32 bits: 24.8 days.
constexpr std::chrono::hours kLongestTimer{24 * 24};

void runAt(steady_clock::time_point due, QObject* receiver, Queue::Task task) {
  const auto left = std::max(std::chrono::ceil<milliseconds>(due - steady_clock::now()), milliseconds(0));
  const bool isLast = left <= kLongestTimer;
  QTimer::singleShot(std::min<milliseconds>(left, kLongestTimer), Qt::PreciseTimer, receiver,
                     [due, receiver, isLast, task = std::move(task)]() mutable noexcept {
                       if (isLast) return task();
                       runAt(due, receiver, std::move(task));
                     });
}

}  // namespace

QtQueue::QtQueue(std::string label) : label_(std::move(label)), receiver_(std::make_unique<QObject>()) {}

QtQueue::~QtQueue() = default;

void QtQueue::async(Task task) {
  // A task that throws ends the process, here rather than somewhere in the event loop.
  QMetaObject::invokeMethod(
      receiver_.get(), [task = std::move(task)]() noexcept { task(); }, Qt::QueuedConnection);
}

void QtQueue::asyncAfter(Duration delay, Task task) {
  // The timer belongs to the queue's thread, the time counts from this call.
  const auto due = steady_clock::now() + delay;
  async([receiver = receiver_.get(), due, task = std::move(task)]() mutable { runAt(due, receiver, std::move(task)); });
}

bool QtQueue::isCurrent() const {
  return QThread::currentThread() == receiver_->thread();
}

}  // namespace quorl::desktop
