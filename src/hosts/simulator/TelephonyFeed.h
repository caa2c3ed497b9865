#pragma once

#include <array>
#include <optional>

#include "hosts/simulator/TelephonySimulator.h"
#include "hosts/simulator/network/ModemEvent.h"

namespace quorl::simulator {

/// Makes the telephony service tell of the same world as the baseband: SIMs and their carriers, the serving cell, the
/// signal, the bands in use and the data connections of a simulated modem.
///
/// One thread at a time. The simulator must outlive it.
class TelephonyFeed {
 public:
  explicit TelephonyFeed(TelephonySimulator& telephony) : telephony_(telephony) {}

  /// To be called with every event of the modem, in their order. A cell monitor update goes out when the cell or its
  /// deployment changes, and while there is one every 30 simulated seconds; the signal follows every dB.
  void happened(const network::ModemEvent& event, const network::SubscriptionState& state);

  /// The cell dictionary of a subscription; none without a serving cell.
  static HVCellInfo cellInfo(const network::SubscriptionState& state);
  /// Bands in use now, and those of the simulated phone.
  static HVBandInfo bandInfo(const network::SubscriptionState& state);

 private:
  void tellCell(const network::SubscriptionState& state);
  void tellSignal(const network::SubscriptionState& state);

  struct Told {
    std::optional<std::int64_t> rsrp;
    network::SimulatedMs cellMs = 0;
  };

  TelephonySimulator& telephony_;
  std::array<Told, 2> told_;
};

}  // namespace quorl::simulator
