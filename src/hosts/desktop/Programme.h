#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "hosts/simulator/Recording.h"
#include "hosts/simulator/ScenarioRun.h"
#include "hosts/simulator/TelephonyScript.h"

namespace quorl::desktop {

/// What a simulated phone is to live through.
struct Programme {
  std::optional<simulator::ScenarioChoice> scenario;  // none: metrics come from the recording
  std::vector<simulator::RecordedEvent> events;       // the recording, in order of time; played over and over
  /// A script that is played once; none: telephony tells of the scenario.
  std::optional<std::vector<simulator::TelephonyScriptStep>> telephony;
  double speed = 1;                               // above 0
  std::optional<std::filesystem::path> record{};  // what the scenario delivers is written there
  std::vector<std::string> faults{};              // lines of the files that were left out, for the user
};

}  // namespace quorl::desktop
