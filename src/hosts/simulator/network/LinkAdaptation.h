#pragma once

#include "hosts/simulator/network/Cell.h"

namespace quorl::simulator::network {

/// Fills what the link can carry, by the SINR and the path loss: CQI, rank, modulation and rates. `load` is the share
/// of the cell that others use.
void adaptLink(ServingMeasurement& serving, const Cell& cell, double load);

/// Power for data in the uplink, of all blocks in use, and for control, dBm: TS 36.213 5.1.1 and 5.1.2 with P0 of -90
/// and -105 dBm and a share of the path loss of 0.8, at most 23 dBm. UMTS: TS 25.214 5.1.2. GSM: as ordered, 5 to
/// 33 dBm.
struct UplinkPower {
  Centi total = 0;
  Centi control = 0;
};
UplinkPower uplinkPower(const Cell& cell, Centi pathLoss, std::uint16_t blocks);

}  // namespace quorl::simulator::network
