#pragma once

#include <cstdint>
#include <optional>

#include "hosts/simulator/network/Cell.h"

// Channel numbers and the frequencies they stand for.

namespace quorl::simulator::network {

struct ChannelFrequencies {
  std::uint32_t downlinkKhz = 0;
  std::uint32_t uplinkKhz = 0;
  std::uint32_t uplinkChannel = 0;
  bool isTdd = false;
};

/// LTE: TS 36.101 5.7.3. NR: TS 38.104 5.4.2.1. UMTS: TS 25.101 5.4.4. GSM: TS 45.005 clause 2. Nothing if the band is
/// not known or the channel lies outside of it.
std::optional<ChannelFrequencies> frequencies(Technology technology, std::uint16_t band, std::uint32_t channel);

/// Resource blocks of a carrier: TS 36.101 table 5.6-1, TS 38.101-1 table 5.3.2-1. Nothing for a bandwidth that the
/// technology does not have; 0 for UMTS and GSM, whose bandwidths are 50 and 2.
std::optional<std::uint16_t> resourceBlocks(Technology technology, std::uint16_t bandwidthMhzX10, bool isTdd);

}  // namespace quorl::simulator::network
