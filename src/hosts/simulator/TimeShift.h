#pragma once

#include <vector>

#include "base/Clock.h"
#include "hosts/simulator/Recording.h"

namespace quorl::simulator {

/// Moves the "timestamp" of every payload by the same span, so that the latest of them is `now`; all else in a payload
/// stays as it is, byte for byte. Events without a readable time are left alone.
void shiftToNow(std::vector<RecordedEvent>& events, Date now);

}  // namespace quorl::simulator
