#pragma once

#include "hosts/simulator/network/Calls.h"
#include "hosts/simulator/network/Camping.h"
#include "hosts/simulator/network/Carriers.h"
#include "hosts/simulator/network/Connection.h"
#include "hosts/simulator/network/DataUse.h"
#include "hosts/simulator/network/Health.h"
#include "hosts/simulator/network/Mobility.h"
#include "hosts/simulator/network/Registration.h"
#include "hosts/simulator/network/SubscriptionCore.h"

namespace quorl::simulator::network {

/// One subscription of the modem: its procedures, and the order in which they hear of time and measurements.
class Subscription {
 public:
  Subscription(std::uint8_t number, const Scenario& scenario, const Network& network, RadioField& field, Phone& phone,
               std::uint64_t seed, SubscriptionCore::Outlet outlet);
  Subscription(const Subscription&) = delete;
  Subscription& operator=(const Subscription&) = delete;

  const SubscriptionState& state() const { return core_.state; }
  SimulatedMs nextDue() const { return core_.next().first; }
  /// Does what the next timer, which is due now, calls for.
  void runNext();

  void powerOn();
  void powerOff(OperatingMode mode);
  void insertSim();
  void removeSim();
  void screenChanged(bool isOn);
  Calls& calls() { return calls_; }
  DataUse& data() { return data_; }

 private:
  void measure();
  void start();
  void stop();
  void changeMode(OperatingMode mode);

  SubscriptionCore core_;
  Camping camping_;
  Connection connection_;
  Mobility mobility_;
  Carriers carriers_;
  Registration registration_;
  DataUse data_;
  Calls calls_;
  Health health_;
};

}  // namespace quorl::simulator::network
