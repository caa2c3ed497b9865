#pragma once

#include <cstdint>

#include "hosts/simulator/network/ModemEvent.h"

namespace quorl::simulator::metrics {

/// Logical channels that carry RRC messages.
enum class AirChannel : std::uint8_t {
  Bcch,
  BcchShared,
  Pcch,
  DownlinkCommon,
  DownlinkDedicated,
  UplinkCommon,
  UplinkDedicated
};

/// A message's channel and its number on it: its place in the choice of the channel's message type.
struct AirType {
  AirChannel channel = AirChannel::Pcch;
  std::uint8_t number = 0;
};

/// TS 36.331 6.2.1. What only NR has counts as its counterpart.
AirType lteAirType(network::event::AirMessageKind kind);
/// TS 38.331 6.2.1.
AirType nrAirType(network::event::AirMessageKind kind);

}  // namespace quorl::simulator::metrics
