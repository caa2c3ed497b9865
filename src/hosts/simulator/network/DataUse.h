#pragma once

#include "hosts/simulator/network/Connection.h"
#include "hosts/simulator/network/SubscriptionCore.h"

namespace quorl::simulator::network {

/// Data sessions: they ask for a connection, move bytes as fast as the link allows, and stall at times.
class DataUse final : public RadioUser {
 public:
  DataUse(SubscriptionCore& core, Connection& connection) : core_(core), connection_(connection) {}

  void powerOn();
  void use(double seconds);
  void stall(double seconds, bool isDnsFailure);
  /// Power off, or the SIM is out.
  void drop();
  /// A round of measurements, in idle too.
  void measured();
  /// Timers.
  void sessionOver();
  void nextDue();
  void stallOver();

  void cellChanged(const Cell* from, const Cell* to) override;
  void connected() override;
  void connectionFailed() override;
  void connectionEnded(RrcCause cause) override;

 private:
  void ask();
  void drawNext();
  void move(SimulatedMs milliseconds);

  SubscriptionCore& core_;
  Connection& connection_;
  bool isInSession_ = false;
  bool isTerminated_ = false;  // the other side began
  SimulatedMs movedMs_ = 0;
  SimulatedMs starvingSinceMs_ = 0;
  SimulatedMs stalledSinceMs_ = 0;
};

}  // namespace quorl::simulator::network
