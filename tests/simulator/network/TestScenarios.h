#pragma once

#include <filesystem>
#include <sstream>
#include <string>
#include <variant>

#include <gtest/gtest.h>

#include "hosts/simulator/network/Modem.h"
#include "hosts/simulator/network/ScenarioReading.h"

namespace quorl::simulator::network {

/// By their names, sorted.
inline constexpr const char* kShippedScenarios[] = {"busy",     "city",   "dual-sim",   "hostile",
                                                    "motorway", "tunnel", "weak-indoor"};

/// A scenario that ships with the product. One with a bad line fails the test.
inline Scenario shippedScenario(const std::string& name) {
  const auto reading =
      readScenario(std::filesystem::path(QUORL_SOURCE_DIR) / "resources" / "scenarios" / (name + ".scenario"));
  for (const ScenarioProblem& problem : reading.problems) ADD_FAILURE() << logText(problem);
  return reading.scenario;
}

/// The scenario that a text describes. A bad line fails the test.
inline Scenario scenarioOf(const std::string& text) {
  std::istringstream input(text);
  const auto reading = readScenario(input, "test.scenario");
  for (const ScenarioProblem& problem : reading.problems) ADD_FAILURE() << logText(problem);
  return reading.scenario;
}

/// The event as one of a kind, or null.
template <typename Event>
const Event* as(const ModemEvent& event) {
  return std::get_if<Event>(&event.body);
}

}  // namespace quorl::simulator::network
