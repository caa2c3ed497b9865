#pragma once

#include <cstddef>
#include <filesystem>
#include <istream>
#include <string>
#include <string_view>
#include <vector>

#include "hosts/simulator/network/Scenario.h"

// The text form of scenarios, told in docs/scenarios.md.

namespace quorl::simulator::network {

/// What is wrong with a line.
struct ScenarioProblem {
  std::string file;
  std::size_t line = 0;  // from 1; 0 for the file as a whole
  std::string reason;
};

/// "city.scenario:3: no layer of that name: b33", or "city.scenario: no sim" for the file as a whole.
std::string logText(const ScenarioProblem& problem);

struct ScenarioReading {
  Scenario scenario;                      // to be used only without problems
  std::vector<ScenarioProblem> problems;  // in the order of the lines, those of the whole file last
};

/// Reads a scenario; `name` is for the problems. Never throws.
ScenarioReading readScenario(std::istream& input, std::string_view name);
/// The same from a file; the problems have its path as given.
ScenarioReading readScenario(const std::filesystem::path& file);

}  // namespace quorl::simulator::network
