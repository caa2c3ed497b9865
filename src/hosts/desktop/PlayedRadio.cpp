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
/// A hundred years: as good as never, and a clock can still count it.
constexpr milliseconds kFarthest = std::chrono::hours(24 * 36525);

/// How long a span of a recording takes at a speed.
milliseconds atSpeed(double span, double speed) {
  return milliseconds(
      static_cast<milliseconds::rep>(std::clamp(span / speed, 0.0, static_cast<double>(kFarthest.count()))));
}

PlayedRadio::Steps atSpeed(PlayedRadio::Steps steps, double speed) {
  for (simulator::TelephonyScriptStep& step : steps) step.at = atSpeed(static_cast<double>(step.at.count()), speed);
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
  const auto timeOf = [&](std::size_t index) { return static_cast<double>(state->events[index].atMs.value_or(0)); };
  const bool isAgain = state->next == state->events.size();
  if (isAgain) state->next = 0;
  const double before =
      isAgain ? -static_cast<double>(kPause.count()) : (state->next == 0 ? 0 : timeOf(state->next - 1));
  state->phone.mainQueue.asyncAfter(atSpeed(timeOf(state->next) - before, state->speed), [weak = std::weak_ptr(state)] {
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
