#include "hosts/desktop/PlayedRadio.h"

#include <algorithm>
#include <chrono>
#include <cstddef>
#include <utility>

#include "hosts/simulator/TimeShift.h"
#include "platform/ZelkorClient.h"

namespace quorl::desktop {
namespace {

using std::chrono::milliseconds;

/// Between the end of the recording and its next beginning.
constexpr milliseconds kPause{1000};

PlayedRadio::Steps atSpeed(PlayedRadio::Steps steps, double speed) {
  for (simulator::TelephonyScriptStep& step : steps)
    step.at = milliseconds(static_cast<milliseconds::rep>(static_cast<double>(step.at.count()) / speed));
  return steps;
}

}  // namespace

struct PlayedRadio::State {
  std::vector<simulator::RecordedEvent> events;
  double speed;
  Phone phone;
  std::size_t next = 0;
};

PlayedRadio::PlayedRadio(std::vector<simulator::RecordedEvent> events, Steps steps, double speed, Phone phone)
    : state_(std::make_shared<State>(State{std::move(events), speed, phone})) {
  phone.telephony.play(atSpeed(std::move(steps), speed), phone.mainQueue);
}

PlayedRadio::~PlayedRadio() = default;

void PlayedRadio::start() {
  if (!state_->events.empty()) playNext(state_);
}

void PlayedRadio::playNext(const std::shared_ptr<State>& state) {
  const auto timeOf = [&](std::size_t index) { return milliseconds(state->events[index].atMs.value_or(0)); };
  const bool isAgain = state->next == state->events.size();
  if (isAgain) state->next = 0;
  const milliseconds before = isAgain ? -kPause : (state->next == 0 ? milliseconds(0) : timeOf(state->next - 1));
  const auto wait = std::chrono::duration<double, std::milli>(timeOf(state->next) - before) / state->speed;
  state->phone.mainQueue.asyncAfter(std::chrono::duration_cast<Queue::Duration>(std::max(wait, wait.zero())),
                                    [weak = std::weak_ptr(state)] {
                                      const auto self = weak.lock();
                                      if (!self) return;
                                      std::vector<simulator::RecordedEvent> event = {self->events[self->next++]};
                                      simulator::shiftToNow(event, self->phone.clock.now());
                                      // Without a client it is gone, as on the device.
                                      self->phone.baseband.deliver(zelkor::kEventMetric, event.front().message());
                                      playNext(self);
                                    });
}

}  // namespace quorl::desktop
