#pragma once

#include <vector>

#include "hosts/simulator/network/Connection.h"
#include "hosts/simulator/network/SubscriptionCore.h"

namespace quorl::simulator::network {

/// Moves a connection from cell to cell: measurement events with their time to trigger (TS 36.331 5.5.4), handovers,
/// and the supervision of the radio link (TS 36.331 5.3.11).
class Mobility final : public RadioUser {
 public:
  Mobility(SubscriptionCore& core, Connection& connection) : core_(core), connection_(connection) {}

  /// A round of measurements in a connection.
  void measured();
  /// Timers.
  void commandReceived();
  void executed();
  void outOfSyncTooLong();

  void cellChanged(const Cell* from, const Cell* to) override;
  void connectionEnding(RrcCause cause) override;

 private:
  struct Candidate {
    std::uint16_t cell;
    event::HandoverTrigger trigger;
    SimulatedMs sinceMs;
  };

  void superviseLink();
  void look();
  bool callsFor(const CellMeasurement& candidate, event::HandoverTrigger& trigger) const;
  void report(const CellMeasurement& target, event::HandoverTrigger trigger);
  void fail(event::LinkFailureReason reason);
  void forgetMeasurements();

  SubscriptionCore& core_;
  Connection& connection_;
  std::vector<Candidate> candidates_;
  event::Handover pending_;  // reported; `to` null: none
  std::uint32_t outOfSync_ = 0;
  std::uint32_t inSync_ = 0;
};

}  // namespace quorl::simulator::network
