#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>

#include "hosts/simulator/network/ModemEvent.h"
#include "hosts/simulator/network/ModemState.h"
#include "hosts/simulator/network/Scenario.h"

namespace quorl::simulator::network {

/// A phone's radio on its way through the network of a scenario: one modem with two subscriptions.
///
/// The same scenario and seed give the same events and states on every machine, however the time is cut into calls of
/// `advance`. Knows no clock, no thread and no message class. One thread at a time.
class Modem {
 public:
  /// Takes an event with the state of its subscription right after it. Must not call the modem.
  using Listener = std::function<void(const ModemEvent&, const SubscriptionState&)>;

  /// Powered off at time 0; the first `advance` powers it on. The scenario must be one that `readScenario` gave without
  /// problems.
  Modem(Scenario scenario, std::uint64_t seed);
  ~Modem();
  Modem(const Modem&) = delete;
  Modem& operator=(const Modem&) = delete;

  /// Lets this much time pass. Events come in order of their time.
  void advance(std::chrono::milliseconds duration, const Listener& listener);

  SimulatedMs nowMs() const;
  /// Of subscription 0 or 1, whether or not it has a SIM.
  const SubscriptionState& state(std::uint8_t subscription) const;
  const Scenario& scenario() const;

 private:
  class World;
  const std::unique_ptr<World> world_;
};

}  // namespace quorl::simulator::network
