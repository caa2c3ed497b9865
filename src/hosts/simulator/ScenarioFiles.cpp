#include "hosts/simulator/ScenarioFiles.h"

#include <set>
#include <system_error>
#include <utility>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "hosts/simulator/network/ScenarioReading.h"

namespace quorl::simulator {

namespace fs = std::filesystem;

namespace {

constexpr char kFolder[] = "scenarios";
constexpr std::string_view kEnding = ".scenario";

/// The first that is there; empty if none is.
fs::path fileOf(std::string_view name, const std::vector<fs::path>& resources) {
  for (const fs::path& directory : resources) {
    std::error_code ignored;
    fs::path file = directory / kFolder / std::string(name).append(kEnding);
    if (fs::is_regular_file(file, ignored)) return file;
  }
  return {};
}

bool isPath(std::string_view nameOrPath) {
  return nameOrPath.find('/') != std::string_view::npos || nameOrPath.ends_with(kEnding);
}

}  // namespace

std::vector<std::string> scenarioNames(const std::vector<fs::path>& resources) {
  std::set<std::string> names;
  for (const fs::path& directory : resources) {
    std::error_code ignored;
    for (const fs::directory_entry& entry : fs::directory_iterator(directory / kFolder, ignored))
      if (entry.path().extension() == kEnding) names.insert(entry.path().stem().string());
  }
  return {names.begin(), names.end()};
}

bool isScenario(std::string_view nameOrPath, const std::vector<fs::path>& resources) {
  return isPath(nameOrPath) || !fileOf(nameOrPath, resources).empty();
}

tl::expected<network::Scenario, std::vector<std::string>> findScenario(std::string_view nameOrPath,
                                                                       const std::vector<fs::path>& resources) {
  const fs::path file = isPath(nameOrPath) ? fs::path(nameOrPath) : fileOf(nameOrPath, resources);
  if (file.empty()) {
    const std::vector<std::string> known = scenarioNames(resources);
    return tl::unexpected(std::vector{
        known.empty() ? fmt::format("there is no scenario \"{}\", as the shipped ones are missing", nameOrPath)
                      : fmt::format("there is no scenario \"{}\", but {}", nameOrPath, fmt::join(known, ", "))});
  }
  network::ScenarioReading reading = network::readScenario(file);
  if (reading.problems.empty()) return std::move(reading.scenario);
  std::vector<std::string> texts;
  for (const network::ScenarioProblem& problem : reading.problems) texts.push_back(logText(problem));
  return tl::unexpected(std::move(texts));
}

}  // namespace quorl::simulator
