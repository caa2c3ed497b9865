#include "hosts/desktop/SimulatorOptions.h"

#include <QStandardPaths>
#include <algorithm>
#include <cstdint>
#include <memory>
#include <utility>
#include <variant>
#include <vector>

#include <CLI/CLI.hpp>
#include <fmt/format.h>
#include <fmt/ranges.h>

#include "hosts/desktop/PlayedRadio.h"
#include "hosts/desktop/Tell.h"
#include "hosts/simulator/OptionNumber.h"
#include "hosts/simulator/Recording.h"
#include "hosts/simulator/ScenarioFiles.h"
#include "hosts/simulator/TelephonyScript.h"
#include "shell/view/QtText.h"

namespace quorl::desktop {
namespace {

using simulator::metrics::Family;

constexpr char kUnknownChipset[] = "none";
constexpr char kUsualScenario[] = "city";
constexpr double kShortestRun = 0.001;
constexpr double kLongestRun = 1e9;

/// Whole numbers with both limits included; `range` is for the help.
CLI::Validator within(std::uint64_t least, std::uint64_t most, std::string range) {
  return {[=](std::string& text) { return simulator::wholeNumberFault(text, least, most); }, std::move(range)};
}

std::vector<std::filesystem::path> resources() {
  return simulator::ResourceDirectories::ofThisProgram(QUORL_RESOURCE_DIRECTORY);
}

std::optional<std::filesystem::path> shipped(const std::string& file) {
  for (const auto& directory : resources())
    if (std::filesystem::exists(directory / file)) return directory / file;
  return std::nullopt;
}

/// Whether a step is about a SIM that the phone has.
bool concerns(const simulator::TelephonyScriptStep& step, int sims) {
  return std::visit(
      [sims](const auto& event) {
        if constexpr (requires { event.slot; })
          return event.slot <= sims;
        else
          return true;
      },
      step.event);
}

bool concerns(const simulator::network::ScriptStep& step, int sims) {
  return std::visit(
      [sims](const auto& action) {
        if constexpr (requires { action.subscription; })
          return action.subscription < sims;
        else
          return true;
      },
      step.action);
}

/// Leaves SIMs beyond the first `sims` out.
template <typename Step>
void keepSims(std::vector<Step>& steps, std::optional<int> sims) {
  if (sims) std::erase_if(steps, [sims](const Step& step) { return !concerns(step, *sims); });
}

std::string joined(const std::vector<std::string>& texts, const char* between) {
  return fmt::format("{}", fmt::join(texts, between));
}

std::optional<Family> familyOf(const simulator::DeviceDescription& device) {
  const std::string chipset = device.chipset.value_or("");
  if (chipset.find("ice") != std::string::npos) return Family::Ice;
  if (chipset.find("mav") != std::string::npos) return Family::Mav;
  return std::nullopt;
}

/// What is wrong with a name that no scenario has; empty for any other, and for the path of a file.
std::string faultOfScenario(const std::string& name) {
  if (simulator::isScenario(name, resources())) return {};
  const auto found = simulator::findScenario(name, resources());
  return found ? std::string() : joined(found.error(), "\n");
}

tl::expected<simulator::ScenarioChoice, std::string> scenarioOf(const SimulatorOptions& options) {
  auto scenario = simulator::findScenario(options.scenario.empty() ? kUsualScenario : options.scenario, resources());
  if (!scenario) return tl::unexpected(joined(scenario.error(), "\n"));
  if (options.sims)
    for (std::size_t slot = static_cast<std::size_t>(*options.sims); slot < scenario->sims.size(); ++slot)
      scenario->sims[slot].isPresent = false;
  keepSims(scenario->steps, options.sims);
  return simulator::ScenarioChoice{*std::move(scenario), options.seed, familyOf(options.device).value_or(Family::Mav)};
}

tl::expected<std::vector<simulator::RecordedEvent>, std::string> recordingOf(const std::filesystem::path& file,
                                                                             std::vector<std::string>& faults) {
  auto read = simulator::readRecording(file);
  if (!read) return tl::unexpected(fmt::format("{}: {}", file.string(), read.error()));
  for (const auto& fault : read->faults)
    faults.push_back(fmt::format("{}:{}: {}", file.string(), fault.line, fault.reason));
  return std::move(read->events);
}

tl::expected<PlayedRadio::Steps, std::string> scriptOf(const SimulatorOptions& options,
                                                       std::vector<std::string>& faults) {
  const auto file = options.telephony.empty() ? shipped("telephony/two-sims.jsonl") : std::optional(options.telephony);
  if (!file) return tl::unexpected(std::string("the shipped telephony script is missing; name one with --telephony"));
  simulator::TelephonyScript script = simulator::readTelephonyScript(*file);
  for (simulator::TelephonyScriptProblem& problem : script.problems) {
    problem.file = file->string();  // as the user has named it
    if (problem.line == 0) return tl::unexpected(logText(problem));
    faults.push_back(logText(problem));
  }
  keepSims(script.steps, options.sims);
  return std::move(script.steps);
}

}  // namespace

tl::expected<SimulatorOptions, int> SimulatorOptions::parse(int argc, char** argv) {
  SimulatorOptions options;
  std::string chipset = "mav20";
  std::string deviceClass;
  CLI::App app("Quorl on a phone that exists only in software.");
  app.set_version_flag("--version", "quorl-simulator " QUORL_VERSION, "Print the version and exit");
  app.add_option(
         "--chipset", chipset,
         "Baseband chipset; \"mav\" or \"ice\" in it selects the family, \"none\" is a device that does not say")
      ->capture_default_str();
  app.add_flag("--internal-build", options.device.isInternalBuild, "Be an internal build");
  app.add_flag("--carrier-build", options.device.isCarrierBuild, "Be a carrier build");
  app.add_option("--device-class", deviceClass, "Device class; Tabrin is a tablet");
  app.add_option("--sims", options.sims, "How many SIMs the phone has at most; as many as the scenario if not given")
      ->transform(within(0, 2, "0 TO 2"));
  app.add_option("--scenario", options.scenario,
                 fmt::format("Scenario to go through: {}, or a file; the usual one is {}",
                             joined(simulator::scenarioNames(resources()), ", "), kUsualScenario))
      ->check(CLI::Validator(faultOfScenario, ""));
  app.add_option("--seed", options.seed, "Which of the scenario's runs")
      ->transform(within(0, UINT64_MAX, "0 OR MORE"))
      ->capture_default_str();
  auto* recording =
      app.add_option("--recording", options.recording, "Recording to play over and over in place of a scenario")
          ->check(CLI::ExistingFile)
          ->excludes("--scenario");
  app.add_option("--telephony", options.telephony,
                 "Telephony script to play once; what the scenario has, or beside a recording the shipped one, if not "
                 "given")
      ->check(CLI::ExistingFile);
  app.add_option("--record", options.record, "Write what the scenario delivers to this recording")->excludes(recording);
  app.add_option("--history-days", options.historyDays, "Days of history that the phone has before its first start")
      ->transform(within(0, 31, "0 TO 31"))
      ->capture_default_str();
  app.add_option("--speed", options.speed, "How many times as fast as life everything goes")
      ->check([](const std::string& text) { return simulator::numberFault(text, 0.01, 1000); }, "0.01 TO 1000")
      ->capture_default_str();
  app.add_option("--documents", options.documents, "Directory for the database; made if it is missing");
  app.add_flag("--verbose", options.isVerbose, "Show the log on standard error");
  app.add_flag("--print", options.prints, "Print dashboard and metric list as they refresh");
  app.add_option("--screenshots", options.screenshots, "Write pictures of the tabs here before the end");
  app.add_option("--seconds", options.seconds, "End after this time")
      ->check([](const std::string& text) { return simulator::numberFault(text, kShortestRun, kLongestRun); },
              fmt::format("{} TO {}", kShortestRun, kLongestRun));
  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    if (error.get_exit_code() == 0) return tl::unexpected(app.exit(error));  // asks for the help
    tell(std::string(error.what()) + " (see quorl-simulator --help)");
    return tl::unexpected(kWrongUse);
  }
  if (chipset != kUnknownChipset) options.device.chipset = chipset;
  if (!deviceClass.empty()) options.device.deviceClass = deviceClass;
  options.device.systemClasses = {"Sondrel"};
  if (options.documents.empty())
    options.documents =
        view::fromQt(QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation)) + "/quorl-simulator";
  return options;
}

tl::expected<Programme, std::string> SimulatorOptions::programme() const {
  Programme programme;
  programme.speed = speed;
  if (recording.empty()) {
    auto chosen = scenarioOf(*this);
    if (!chosen) return tl::unexpected(std::move(chosen.error()));
    programme.scenario = *std::move(chosen);
    if (!record.empty()) programme.record = record;
  } else {
    auto events = recordingOf(recording, programme.faults);
    if (!events) return tl::unexpected(std::move(events.error()));
    programme.events = *std::move(events);
  }
  if (recording.empty() && telephony.empty()) return programme;
  auto steps = scriptOf(*this, programme.faults);
  if (!steps) return tl::unexpected(std::move(steps.error()));
  programme.telephony = *std::move(steps);
  return programme;
}

std::unique_ptr<Console> SimulatorOptions::console() const {
  if (prints) return std::make_unique<simulator::StandardErrorConsole>(/*isShown=*/isVerbose);
  return std::make_unique<simulator::StandardOutputConsole>();
}

std::optional<simulator::HistoryPlan> SimulatorOptions::history(const Programme& programme, Date until) const {
  if (!familyOf(device) || !programme.scenario || historyDays == 0) return std::nullopt;
  return simulator::HistoryPlan{*programme.scenario, historyDays, until};
}

}  // namespace quorl::desktop
