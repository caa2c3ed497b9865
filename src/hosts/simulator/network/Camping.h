#pragma once

#include <vector>

#include "hosts/simulator/network/SubscriptionCore.h"

namespace quorl::simulator::network {

/// Broadcast parameters of a cell.
ReselectionParameters reselectionParametersOf(const Cell& cell);

/// Idle mode: search for a network, selection and reselection of cells (TS 36.304, TS 25.304, TS 45.008 in short).
class Camping {
 public:
  explicit Camping(SubscriptionCore& core) : core_(core) {}

  /// Looks for a cell after this long.
  void searchAfter(SimulatedMs milliseconds) { core_.after(Timer::Search, milliseconds); }
  /// `Timer::Search` has run out.
  void search();
  /// A round of measurements in idle.
  void measured();

  /// Takes the cell as the serving one, in idle or in a connection, and tells the users. Radio resource states are not
  /// its business.
  void take(const Cell& cell, event::ChangeReason reason);
  /// Gives up the serving cell and looks for another. In idle.
  void lose();
  /// Gives up the serving cell. In idle.
  void leave();
  /// The RRC state of the serving cell's technology is another; keeps the accounts.
  void enter(RrcState next, RrcCause cause);
  /// In idle on another cell, which may be of another technology.
  void camp(const Cell& cell, event::ChangeReason reason);

  /// The strongest suitable cell of a technology that was found, or null. `least`: SINR, or Ec/N0 of UMTS.
  const Cell* strongest(Technology technology, Centi least = -100000) const;
  static bool isSuitable(const CellMeasurement& measurement);

  /// Camped on a network that does not serve this SIM.
  bool isLimited() const { return isLimited_; }

 private:
  enum class Group : std::uint8_t { Home, Guest, Any };

  const Cell* choose(Group group) const;
  bool belongs(const Cell& cell, Group group) const;
  void scanForCdma(bool isNeeded);
  bool isBetter(const CellMeasurement& candidate) const;
  void readSystemInformation(const Cell& cell);

  struct Candidate {
    std::uint16_t cell;
    SimulatedMs sinceMs;
  };

  SubscriptionCore& core_;
  std::vector<Candidate> candidates_;
  SimulatedMs campedMs_ = 0;
  std::uint32_t unsuitableRounds_ = 0;
  std::uint32_t searches_ = 0;  // without result, in a row
  SimulatedMs lastHomeSearchMs_ = 0;
  bool isLimited_ = false;
};

}  // namespace quorl::simulator::network
