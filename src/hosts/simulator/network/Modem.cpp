#include "hosts/simulator/network/Modem.h"

#include <algorithm>
#include <array>
#include <utility>
#include <variant>

#include "hosts/simulator/network/Arithmetic.h"
#include "hosts/simulator/network/Route.h"
#include "hosts/simulator/network/Subscription.h"

namespace quorl::simulator::network {
namespace {

constexpr SimulatedMs kNever = SubscriptionCore::kNever;

}  // namespace

class Modem::World {
 public:
  World(Scenario scenario, std::uint64_t seed)
      : scenario_(std::move(scenario)),
        network_(scenario_),
        field_(scenario_, network_, seed),
        route_(scenario_),
        subscriptions_{{Subscription(0, scenario_, network_, field_, phone_, seed, outlet()),
                        Subscription(1, scenario_, network_, field_, phone_, seed, outlet())}} {
    phone_.load = scenario_.load;
    phone_.dataSlot = scenario_.sims[0].isPresent ? 0 : 1;
    for (const ScriptStep& step : scenario_.steps) due_.push_back(step.atMs);
    move();
  }

  void advance(std::chrono::milliseconds duration, const Listener& listener) {
    const SimulatedMs until = phone_.nowMs + static_cast<SimulatedMs>(std::max<std::int64_t>(0, duration.count()));
    listener_ = &listener;
    if (!isOn_) {
      isOn_ = true;
      for (Subscription& subscription : subscriptions_) subscription.powerOn();
    }
    while (runNext(until)) {
    }
    phone_.nowMs = until;
    listener_ = nullptr;
  }

  const Phone& phone() const { return phone_; }
  const Scenario& scenario() const { return scenario_; }
  const SubscriptionState& state(std::uint8_t subscription) const {
    return subscriptions_[subscription == 0 ? 0 : 1].state();
  }

 private:
  SubscriptionCore::Outlet outlet() {
    return [this](const ModemEvent& event, const SubscriptionState& state) { (*listener_)(event, state); };
  }

  /// The script comes before the subscriptions, these in their order.
  bool runNext(SimulatedMs until) {
    const auto first = std::min_element(due_.begin(), due_.end());
    const SimulatedMs script = first == due_.end() ? kNever : *first;
    const SimulatedMs zero = subscriptions_[0].nextDue();
    const SimulatedMs one = subscriptions_[1].nextDue();
    const SimulatedMs next = std::min({script, zero, one});
    if (next > until) return false;
    phone_.nowMs = next;
    move();
    if (script == next) {
      const auto number = static_cast<std::size_t>(first - due_.begin());
      const ScriptStep& step = scenario_.steps[number];
      *first = step.everyMs == 0 ? kNever : next + step.everyMs;
      std::visit([this](const auto& action) { perform(action); }, step.action);
    } else {
      subscriptions_[zero == next ? 0 : 1].runNext();
    }
    return true;
  }

  void move() {
    const Route::Place at = route_.at(phone_.nowMs);
    Surroundings& place = phone_.place;
    place.x = at.x;
    place.y = at.y;
    place.metresTravelled = at.metresTravelled;
    place.metresPerSecond = at.metresPerSecond;
    const double degrees = 90.0 - angleOf(at.directionX, at.directionY) * 180.0 / kPi;
    place.headingDegrees = static_cast<std::uint16_t>(static_cast<int>(degrees + 360.5) % 360);
    const MotionState motion = at.metresPerSecond <= 0    ? MotionState::Stationary
                               : at.metresPerSecond < 2.5 ? MotionState::Pedestrian
                                                          : MotionState::Driving;
    if (motion != place.motion) place.motionSinceMs = phone_.nowMs;
    place.motion = motion;
    place.zoneLoss = 0;
    for (const Zone& zone : scenario_.zones)
      if (zone.contains(at.x, at.y)) place.zoneLoss += zone.loss;
    warmUp();
  }

  /// The radio warms up while it sends, by up to 15 degrees within some minutes.
  void warmUp() {
    const auto isSending = [](const Subscription& subscription) { return subscription.state().isDataActive; };
    const bool isBusy = std::any_of(subscriptions_.begin(), subscriptions_.end(), isSending);
    const std::int32_t towards = isBusy ? 45000 : 30000;
    const auto elapsed = static_cast<double>(phone_.nowMs - warmedMs_);
    warmedMs_ = phone_.nowMs;
    temperature_ += (towards - temperature_) * (1.0 - exponential(-std::min(elapsed / 120000.0, 50.0)));
    phone_.place.radioMilliCelsius = static_cast<std::int32_t>(temperature_);
  }

  void perform(const action::PlaceCall& call) { subscriptions_[call.subscription].calls().place(call); }
  void perform(const action::UseData& use) { subscriptions_[use.subscription].data().use(use.seconds); }
  void perform(const action::SetScreen& screen) {
    if (phone_.place.isScreenOn == screen.isOn) return;
    phone_.place.isScreenOn = screen.isOn;
    for (Subscription& subscription : subscriptions_) subscription.screenChanged(screen.isOn);
  }
  void perform(const action::SetAirplane& airplane) {
    for (Subscription& subscription : subscriptions_) {
      if (airplane.isOn) {
        subscription.powerOff(OperatingMode::LowPower);
      } else {
        subscription.powerOn();
      }
    }
  }
  void perform(const action::SetSim& sim) {
    if (sim.isPresent) {
      subscriptions_[sim.subscription].insertSim();
    } else {
      subscriptions_[sim.subscription].removeSim();
    }
  }
  void perform(const action::SetDataSlot& slot) { phone_.dataSlot = slot.subscription; }
  void perform(const action::SetLoad& load) { phone_.load = load.share; }
  void perform(const action::StallData& stall) {
    subscriptions_[stall.subscription].data().stall(stall.seconds, stall.isDnsFailure);
  }
  void perform(const action::MetricTraffic& traffic) {
    const event::Cue cue{traffic.kind, traffic.count, traffic.bytes};
    (*listener_)(ModemEvent{phone_.nowMs, 0, cue}, subscriptions_[0].state());
  }

  const Scenario scenario_;
  const Network network_;
  RadioField field_;
  const Route route_;
  Phone phone_;
  const Listener* listener_ = nullptr;  // set while time passes
  std::array<Subscription, 2> subscriptions_;
  std::vector<SimulatedMs> due_;  // of each step of the script
  bool isOn_ = false;
  double temperature_ = 30000;
  SimulatedMs warmedMs_ = 0;
};

Modem::Modem(Scenario scenario, std::uint64_t seed) : world_(std::make_unique<World>(std::move(scenario), seed)) {}

Modem::~Modem() = default;

void Modem::advance(std::chrono::milliseconds duration, const Listener& listener) {
  world_->advance(duration, listener);
}

SimulatedMs Modem::nowMs() const {
  return world_->phone().nowMs;
}

const SubscriptionState& Modem::state(std::uint8_t subscription) const {
  return world_->state(subscription);
}

const Scenario& Modem::scenario() const {
  return world_->scenario();
}

}  // namespace quorl::simulator::network
