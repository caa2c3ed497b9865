#include "hosts/desktop/SimulatorOptions.h"

#include <QStandardPaths>
#include <algorithm>
#include <utility>
#include <variant>
#include <vector>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "hosts/simulator/TelephonyScript.h"
#include "shell/view/QtText.h"

namespace quorl::desktop {
namespace {

constexpr char kUnknownChipset[] = "none";

std::optional<std::filesystem::path> shipped(const std::string& file) {
  for (const auto& directory : simulator::ResourceDirectories::ofThisProgram(QUORL_RESOURCE_DIRECTORY))
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

}  // namespace

tl::expected<SimulatorOptions, int> SimulatorOptions::parse(int argc, char** argv) {
  SimulatorOptions options;
  std::string chipset = "mav20";
  std::string deviceClass;
  CLI::App app("Quorl on a phone that exists only in software.");
  app.add_option(
         "--chipset", chipset,
         "Baseband chipset; \"mav\" or \"ice\" in it selects the family, \"none\" is a device that does not say")
      ->capture_default_str();
  app.add_flag("--internal-build", options.device.isInternalBuild, "Be an internal build");
  app.add_flag("--carrier-build", options.device.isCarrierBuild, "Be a carrier build");
  app.add_option("--device-class", deviceClass, "Device class; Tabrin is a tablet");
  app.add_option("--sims", options.sims, "How many SIMs the phone has")->check(CLI::Range(0, 2))->capture_default_str();
  app.add_option("--recording", options.recording, "Recording to play over and over; the shipped one if not given")
      ->check(CLI::ExistingFile);
  app.add_option("--telephony", options.telephony, "Telephony script to play once; the shipped one if not given")
      ->check(CLI::ExistingFile);
  app.add_option("--speed", options.speed, "How many times as fast recording and script are played")
      ->check(CLI::Range(0.01, 1000.0))
      ->capture_default_str();
  app.add_option("--documents", options.documents, "Directory for the database; made if it is missing");
  app.add_flag("--verbose", options.isVerbose, "Show the log on standard error");
  app.add_flag("--print", options.prints, "Print dashboard and metric list as they refresh");
  app.add_option("--screenshots", options.screenshots, "Write pictures of the tabs here before the end");
  app.add_option("--seconds", options.seconds, "End after this time")->check(CLI::PositiveNumber);
  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    return tl::unexpected(app.exit(error));
  }
  if (chipset != kUnknownChipset) options.device.chipset = chipset;
  if (!deviceClass.empty()) options.device.deviceClass = deviceClass;
  options.device.systemClasses = {"Sondrel"};
  if (options.documents.empty())
    options.documents =
        view::fromQt(QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation)) + "/quorl-simulator";
  return options;
}

tl::expected<PlayedRadio::Programme, std::string> SimulatorOptions::programme() const {
  PlayedRadio::Programme programme;
  programme.speed = speed;
  const bool isIce = device.chipset && device.chipset->find("ice") != std::string::npos;
  const auto recordingFile =
      recording.empty() ? shipped(isIce ? "recordings/ice.jsonl" : "recordings/mav.jsonl") : std::optional(recording);
  if (!recordingFile) return tl::unexpected(std::string("the shipped recording is missing; name one with --recording"));
  auto read = simulator::readRecording(*recordingFile);
  if (!read) return tl::unexpected(fmt::format("{}: {}", recordingFile->string(), read.error()));
  if (!read->faults.empty())
    return tl::unexpected(
        fmt::format("{}:{}: {}", recordingFile->string(), read->faults.front().line, read->faults.front().reason));
  programme.events = std::move(read->events);

  const auto scriptFile = telephony.empty() ? shipped("telephony/two-sims.jsonl") : std::optional(telephony);
  if (!scriptFile)
    return tl::unexpected(std::string("the shipped telephony script is missing; name one with --telephony"));
  simulator::TelephonyScript script = simulator::readTelephonyScript(*scriptFile);
  if (!script.problems.empty()) return tl::unexpected(logText(script.problems.front()));
  std::copy_if(script.steps.begin(), script.steps.end(), std::back_inserter(programme.steps),
               [this](const auto& step) { return concerns(step, sims); });
  return programme;
}

}  // namespace quorl::desktop
