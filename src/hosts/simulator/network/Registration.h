#pragma once

#include "hosts/simulator/network/Connection.h"
#include "hosts/simulator/network/SubscriptionCore.h"

namespace quorl::simulator::network {

/// Registration with the network: attach, updates of the tracking, routing and location area, and the service that
/// comes of it (TS 24.301, TS 24.008).
class Registration final : public RadioUser {
 public:
  Registration(SubscriptionCore& core, Camping& camping, Connection& connection)
      : core_(core), camping_(camping), connection_(connection) {}

  void powerOn();
  /// Power off, or the SIM is out: nothing is registered any more.
  void forget();
  /// Timers.
  void answered();
  void retry() { check(); }
  void periodicUpdateDue();

  void cellChanged(const Cell* from, const Cell* to) override;
  void connected() override;
  void connectionFailed() override;
  void connectionEnded(RrcCause cause) override;

  /// Tells of the service when it is another than the last told.
  void updateService();

 private:
  RegistrationProcedure needed() const;
  void check();
  void start(RegistrationProcedure procedure);
  void accepted(const Cell& cell);
  void rejected(const Cell& cell);
  bool isForbidden(const Cell& cell) const;

  SubscriptionCore& core_;
  Camping& camping_;
  Connection& connection_;
  RegistrationProcedure wanted_ = RegistrationProcedure::None;
  RegistrationProcedure running_ = RegistrationProcedure::None;
  Technology registeredOn_ = Technology::None;
  Technology toldTechnology_ = Technology::None;
};

}  // namespace quorl::simulator::network
