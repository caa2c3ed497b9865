#include "base/RepeatingTimer.h"

#include <utility>

namespace quorl {

struct RepeatingTimer::State {
  Queue& queue;
  Queue::Duration interval;
  Queue::Task tick;
};

RepeatingTimer::RepeatingTimer(Queue& queue, Queue::Duration interval, Queue::Task tick)
    : state_(std::make_shared<State>(State{queue, interval, std::move(tick)})) {
  schedule(state_);
}

void RepeatingTimer::schedule(const std::shared_ptr<State>& state) {
  state->queue.asyncAfter(state->interval, [weak = std::weak_ptr(state)] {
    const auto alive = weak.lock();
    if (!alive) return;
    schedule(alive);  // before the tick, so that a slow tick does not stretch the interval
    alive->tick();
  });
}

}  // namespace quorl
