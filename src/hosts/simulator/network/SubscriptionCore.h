#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <limits>
#include <utility>
#include <vector>

#include "hosts/simulator/network/ModemEvent.h"
#include "hosts/simulator/network/ModemState.h"
#include "hosts/simulator/network/Network.h"
#include "hosts/simulator/network/RadioField.h"
#include "hosts/simulator/network/RandomStream.h"
#include "hosts/simulator/network/Receiver.h"
#include "hosts/simulator/network/Scenario.h"

namespace quorl::simulator::network {

/// What both subscriptions share: the phone.
struct Phone {
  SimulatedMs nowMs = 0;
  Surroundings place;
  double load = 0.4;  // share of the cells' capacity that others use
  std::uint8_t dataSlot = 0;
  std::array<bool, 2> isInCall{};
  std::uint8_t simsPresent = 0;
  std::uint32_t lastCallId = 0;
};

inline constexpr std::uint16_t kT310Ms = 1000;

enum class Timer : std::uint8_t {
  Measure,
  Search,
  Access,
  Setup,
  Release,
  Inactivity,
  HandoverCommand,
  HandoverExecution,
  OutOfSync,  // T310
  Reestablish,
  NrOutOfSync,
  GroupAddition,
  CarrierActivation,
  Registration,
  RegistrationRetry,
  PeriodicUpdate,
  NextSession,
  SessionEnd,
  NextCall,
  Call,
  Fallback,
  Tuner,
  StallEnd,
  Saving,
  Count,
};

/// Told of what happens to the radio of a subscription, in the order in which the users stand in the core.
class RadioUser {
 public:
  virtual ~RadioUser() = default;
  /// The serving cell is another, or is gone (null), in idle or in a connection.
  virtual void cellChanged(const Cell* /*from*/, const Cell* /*to*/) {}
  /// A connection stands.
  virtual void connected() {}
  /// One that was asked for does not come.
  virtual void connectionFailed() {}
  /// The connection is about to end; its cells are still in use.
  virtual void connectionEnding(RrcCause /*cause*/) {}
  /// There is no connection any more.
  virtual void connectionEnded(RrcCause /*cause*/) {}
};

/// State, timers, receiver and event outlet of a subscription, for the procedures that make it behave.
class SubscriptionCore {
 public:
  using Outlet = std::function<void(const ModemEvent&, const SubscriptionState&)>;
  static constexpr SimulatedMs kNever = std::numeric_limits<SimulatedMs>::max();

  SubscriptionCore(std::uint8_t subscription, const Scenario& played, const Network& cells, RadioField& field,
                   Phone& owner, std::uint64_t seed, Outlet outlet)
      : scenario(played),
        network(cells),
        phone(owner),
        sim(played.sims[subscription]),
        receiver(cells, field, seed, subscription),
        random(seed, 20U + subscription),
        outlet_(std::move(outlet)) {
    timers_.fill(kNever);
    state.subscription = subscription;
  }

  const Scenario& scenario;
  const Network& network;
  Phone& phone;
  const Sim& sim;
  Receiver receiver;
  RandomStream random;
  SubscriptionState state;
  std::vector<RadioUser*> users;
  std::vector<std::uint8_t> operators;  // that are listened to
  bool hasConnection = false;           // set up, and its end not told yet

  SimulatedMs now() const { return phone.nowMs; }
  const Cell* cell() const { return state.serving ? state.serving->best.cell : nullptr; }
  /// Whether a connection stands, with signalling and data.
  bool isConnected() const { return isConnectedState(state.rrc); }

  void after(Timer timer, SimulatedMs milliseconds) { due(timer) = now() + milliseconds; }
  void cancel(Timer timer) { due(timer) = kNever; }
  bool isRunning(Timer timer) const { return timers_[static_cast<std::size_t>(timer)] != kNever; }
  void cancelAll() { timers_.fill(kNever); }
  /// Time of the next timer, and which it is; of several at a time the first of the enumeration.
  std::pair<SimulatedMs, Timer> next() const {
    std::size_t first = 0;
    for (std::size_t i = 1; i < timers_.size(); ++i)
      if (timers_[i] < timers_[first]) first = i;
    return {timers_[first], static_cast<Timer>(first)};
  }
  /// Whole milliseconds between `low` and `high`.
  SimulatedMs delay(std::uint32_t low, std::uint32_t high) { return low + random.below(high - low + 1); }

  void emit(ModemEventBody body) {
    state.nowMs = now();
    state.surroundings = phone.place;
    state.subscriptions = phone.simsPresent;
    state.isDataPreferred = phone.dataSlot == state.subscription;
    outlet_(ModemEvent{now(), state.subscription, std::move(body)}, state);
  }
  /// A message of the serving cell.
  void say(event::AirMessageKind kind, bool isUplink, std::uint8_t bearer, std::uint16_t length) {
    say(cell(), kind, isUplink, bearer, length);
  }
  /// Only LTE and NR messages are told.
  void say(const Cell* on, event::AirMessageKind kind, bool isUplink, std::uint8_t bearer, std::uint16_t length) {
    if (on == nullptr || !isPacketCell(on->technology)) return;
    emit(event::AirMessage{on, kind, isUplink, bearer, length});
  }

  /// Tells of the end of the connection, if there is one.
  void tellConnectionEnded(event::ConnectionEnd end);
  /// Measures what is around, the serving cell included, and puts it into the state.
  void measure();

 private:
  SimulatedMs& due(Timer timer) { return timers_[static_cast<std::size_t>(timer)]; }

  std::array<SimulatedMs, static_cast<std::size_t>(Timer::Count)> timers_{};
  Outlet outlet_;
};

}  // namespace quorl::simulator::network
