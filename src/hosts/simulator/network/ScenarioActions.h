#pragma once

#include <cstdint>
#include <optional>

#include "hosts/simulator/network/Scenario.h"
#include "hosts/simulator/network/ScenarioLine.h"

namespace quorl::simulator::network {

/// What a line of the script does, from the word after its time on. Throws `BadScenarioLine`.
action::Action takeAction(ScenarioLine& line);

/// The slot an action is about, from 0, if it is about one.
std::optional<std::uint8_t> slotOf(const action::Action& action);

}  // namespace quorl::simulator::network
