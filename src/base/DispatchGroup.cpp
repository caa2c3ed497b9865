#include "base/DispatchGroup.h"

#include <utility>

#include "base/FatalStop.h"

namespace quorl {

void DispatchGroup::enter() {
  const std::lock_guard lock(state_->mutex);
  ++state_->count;
}

void DispatchGroup::leave() {
  std::vector<Waiter> ready;
  {
    const std::lock_guard lock(state_->mutex);
    if (state_->count == 0) fatalStop("DispatchGroup: left more often than entered");
    if (--state_->count == 0) ready.swap(state_->waiters);
  }
  for (Waiter& waiter : ready) waiter.queue->async(std::move(waiter.task));
}

void DispatchGroup::notify(Queue& queue, Queue::Task task) {
  {
    const std::lock_guard lock(state_->mutex);
    if (state_->count != 0) {
      state_->waiters.push_back({&queue, std::move(task)});
      return;
    }
  }
  queue.async(std::move(task));
}

}  // namespace quorl
