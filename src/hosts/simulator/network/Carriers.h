#pragma once

#include "hosts/simulator/network/Connection.h"
#include "hosts/simulator/network/SubscriptionCore.h"

namespace quorl::simulator::network {

/// What an LTE connection uses beside its own cell: secondary carriers of the same site (TS 36.331 5.3.10.3b,
/// TS 36.321 5.13), and the NR secondary cell group of EN-DC (TS 37.340, TS 38.331 5.3.5).
class Carriers final : public RadioUser {
 public:
  Carriers(SubscriptionCore& core, Connection& connection) : core_(core), connection_(connection) {}

  /// A round of measurements in a connection.
  void measured();
  /// Whether NR may be measured and used changes.
  void setSaving(const NrSaving& saving);
  /// Timers.
  void activateCarriers();
  void addGroup();
  void groupOutOfSync();

  void connectionEnding(RrcCause cause) override;

 private:
  void measureCarriers();
  void configureCarriers();
  void removeCarriers();
  void measureGroup();
  void lookForGroup();
  void changeGroup(const Cell& cell);
  void removeGroup(event::GroupRemoval reason);
  void followBeam(const CellMeasurement& before, const CellMeasurement& after);
  void account();

  SubscriptionCore& core_;
  Connection& connection_;
  const Cell* groupCandidate_ = nullptr;
  SimulatedMs groupSinceMs_ = 0;
  SimulatedMs weakSinceMs_ = 0;
  SimulatedMs beamSinceMs_ = 0;
  SimulatedMs recoveryMs_ = 0;
  SimulatedMs quietSinceMs_ = 0;  // no data
  std::uint32_t outOfSync_ = 0;
  std::uint32_t strangeBeams_ = 0;
  ConnectionUse groupUse_;
};

}  // namespace quorl::simulator::network
