#pragma once

#include <cstdint>
#include <vector>

#include "hosts/simulator/Recording.h"

namespace quorl::tool {

enum class BasebandFamily { Mav, Ice };

/// Ten invented minutes of a device of one family: every metric of the family that can be decoded, several times for
/// each of both subscriptions. The same for the same seed.
std::vector<simulator::RecordedEvent> makeRecording(BasebandFamily family, std::uint64_t seed);

}  // namespace quorl::tool
