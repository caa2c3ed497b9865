#pragma once

#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include <tl/expected.hpp>

#include "hosts/simulator/network/Scenario.h"

namespace quorl::simulator {

/// Names of the scenarios in the folder "scenarios" of the resources, sorted.
std::vector<std::string> scenarioNames(const std::vector<std::filesystem::path>& resources);

/// Whether this is a path, or the name of a scenario that is there.
bool isScenario(std::string_view nameOrPath, const std::vector<std::filesystem::path>& resources);

/// Reads a scenario of that folder by its name, or any file: what holds a '/' or ends with ".scenario" is a path. The
/// error is a line for each thing that is wrong.
tl::expected<network::Scenario, std::vector<std::string>> findScenario(
    std::string_view nameOrPath, const std::vector<std::filesystem::path>& resources);

}  // namespace quorl::simulator
