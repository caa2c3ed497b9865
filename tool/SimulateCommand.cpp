#include <chrono>
#include <cmath>
#include <cstdint>
#include <filesystem>
#include <iostream>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "Commands.h"
#include "Documents.h"
#include "JsonLine.h"
#include "ProgressBar.h"
#include "RemovedRows.h"
#include "Simulation.h"
#include "base/DateText.h"
#include "hosts/simulator/PhoneServices.h"
#include "hosts/simulator/ScenarioFiles.h"
#include "hosts/simulator/UsableDocuments.h"

namespace quorl::tool {
namespace {

using simulator::ScenarioChoice;

struct SimulateOptions {
  std::string scenario;
  std::string family = "mav";
  std::string output;
  std::string documents;
  std::string record;
  std::string start;
  std::uint64_t seed = 1;
  double minutes = 10;
  double speed = 0;  // 0: as fast as possible
  int historyDays = 0;
  int sessionsPerDay = 4;
  double sessionMinutes = 3;
  bool hasMinutes = false;
  bool isVerbose = false;
};

std::optional<Date> startOf(const SimulateOptions& options) {
  constexpr std::chrono::seconds kUsual{1767605400};  // 2026-01-05 09:30:00 UTC
  return options.start.empty() ? Date(kUsual) : parseWallClock(options.start);
}

/// Why the options do not fit together; empty if they do.
std::string contradiction(const SimulateOptions& options) {
  if (options.output.empty() == options.documents.empty()) return "one of --output and --documents is needed";
  if (!options.output.empty() && options.historyDays > 0) return "--history-days needs --documents";
  if (!options.output.empty() && !options.record.empty()) return "--record needs --documents; --output is a recording";
  if (!options.output.empty() && options.speed > 0) return "--speed needs --documents";
  if (options.historyDays > 0 && !options.hasMinutes && (!options.record.empty() || options.speed > 0))
    return "--record and --speed need --minutes beside --history-days";
  if (!options.documents.empty() && !options.start.empty()) return "--start needs --output; --documents ends now";
  if (!startOf(options)) return fmt::format("{} is no time of the form yyyy-MM-dd HH:mm:ss", options.start);
  const std::string& recording = options.output.empty() ? options.record : options.output;
  if (recording.empty()) return {};
  const auto spared = simulator::spareDatabase(recording, options.documents);
  return spared ? std::string() : spared.error();
}

std::chrono::milliseconds lengthOf(const SimulateOptions& options) {
  return std::chrono::milliseconds(std::llround(options.minutes * 60000));
}

simulator::HistoryPlan historyOf(const SimulateOptions& options, const ScenarioChoice& choice, Date until) {
  const auto session = std::chrono::duration<double, std::ratio<60>>(options.sessionMinutes);
  return {choice, options.historyDays, until, options.sessionsPerDay,
          std::chrono::duration_cast<std::chrono::milliseconds>(session)};
}

int fail(std::string_view text) {
  complain(text);
  return kFailure;
}

double rounded(double value) {
  return std::round(value * 1000) / 1000;
}

int writeRecording(const SimulateOptions& options, ScenarioChoice choice) {
  const Date start = startOf(options).value();
  ProgressBar bar;
  const auto written = recordScenario(std::move(choice), start, lengthOf(options), options.output,
                                      [&bar](double share) { bar.show(share, "of the way"); });
  if (!written) return fail(fmt::format("{}: {}", options.output, written.error()));
  std::cout << jsonLine({{"events", written->events}, {"seconds", rounded(written->seconds)}}) << '\n';
  return kSuccess;
}

int fillDocuments(const SimulateOptions& options, const ScenarioChoice& choice) {
  if (const auto prepared = simulator::prepareDocuments(options.documents); !prepared) return fail(prepared.error());
  const Date until = SystemClock().now();
  SimulatedProduct product(options.family, options.documents, options.isVerbose);
  if (options.historyDays > 0) {
    ProgressBar bar;
    const auto made = product.makeHistory(historyOf(options, choice, until), [&bar](const auto& so) {
      bar.show(static_cast<double>(so.sessionsDone) / so.sessions, fmt::format("{} rows", so.rows));
    });
    if (!made) return fail(made.error());
    std::cout << jsonLine({{"sessions", made->sessions},
                           {"events", made->events},
                           {"rows", made->rows},
                           {"seconds", rounded(made->seconds)},
                           {"rowsPerSecond", std::round(static_cast<double>(made->rows) / made->seconds)}})
              << '\n';
    if (!options.hasMinutes) return kSuccess;
  }
  const std::optional<std::filesystem::path> recording =
      options.record.empty() ? std::nullopt : std::optional<std::filesystem::path>(options.record);
  const RemovedRows removed(options.documents);
  ProgressBar bar;
  const auto lived =
      product.live({choice, options.speed > 0 ? options.speed : 1, recording}, lengthOf(options),
                   /*isPaced=*/options.speed > 0, [&bar](double share) { bar.show(share, "of the way"); });
  removed.tell();
  if (!lived) return fail(lived.error());
  std::cout << jsonLine({{"events", lived->events},
                         {"rowsInserted", lived->rows},
                         {"insertsFailed", lived->insertsFailed},
                         {"seconds", rounded(lived->seconds)}})
            << '\n';
  const auto folded = foldWriteAheadLog(options.documents);
  for (const std::string& fault : {lived->failedRows, lived->recordingFault, folded ? std::string() : folded.error()})
    if (!fault.empty()) complain(fault);
  return lived->insertsFailed == 0 && lived->recordingFault.empty() && folded ? kSuccess : kFailure;
}

int simulate(const SimulateOptions& options) {
  if (const std::string why = contradiction(options); !why.empty()) {
    complain(why + " (see quorl-tool simulate --help)");
    return kWrongUse;
  }
  const auto resources = simulator::ResourceDirectories::ofThisProgram(QUORL_RESOURCE_DIRECTORY);
  auto scenario = simulator::findScenario(options.scenario, resources);
  if (!scenario) {
    for (const std::string& problem : scenario.error()) complain(problem);
    return simulator::isScenario(options.scenario, resources) ? kFailure : kWrongUse;
  }
  ScenarioChoice choice{*std::move(scenario), options.seed,
                        options.family == "ice" ? simulator::metrics::Family::Ice : simulator::metrics::Family::Mav};
  if (!options.output.empty()) return writeRecording(options, std::move(choice));
  return fillDocuments(options, choice);
}

}  // namespace

void addSimulate(CommandLine& tool) {
  Command command = tool.addCommand("simulate", "Send a simulated phone through a scenario");
  command.setFooter(
      "Writes what its baseband manager delivers as a recording, or fills a database: with --history-days a past in\n"
      "which the product was looked at some times a day, written in bulk; with --minutes what the product itself "
      "makes\n"
      "of the way. The same scenario, seed and family give the same recording, byte for byte.");
  auto options = std::make_shared<SimulateOptions>();
  command.addOption("--scenario", options->scenario, "Name of a scenario that ships with it, or a file")
      .required()
      .notEmpty();
  command.addOption("--seed", options->seed, "Which of the scenario's runs")
      .wholeWithin(0, std::numeric_limits<std::uint64_t>::max())
      .showDefault();
  command.addOption("--family", options->family, "Baseband family").oneOf({"mav", "ice"}).showDefault();
  const CommandOption minutes =
      command.addOption("--minutes", options->minutes, "Simulated minutes").within(0.0, 60.0 * 24 * 31).showDefault();
  command.addOption("--output", options->output, "Recording to write").notEmpty();
  command.addOption("--start", options->start, "Wall-clock time at which a recording begins, yyyy-MM-dd HH:mm:ss")
      .notEmpty();
  command
      .addOption(
          "--documents", options->documents,
          "Directory for a database; made if it is missing. The product removes its rows of thirty days ago and older")
      .notEmpty();
  command.addOption("--history-days", options->historyDays, "Days of history before now").wholeWithin(1, 31);
  command
      .addOption("--sessions-per-day", options->sessionsPerDay, "How often a day of the history the product was used")
      .wholeWithin(1, 24)
      .showDefault();
  command.addOption("--session-minutes", options->sessionMinutes, "For how long each time")
      .within(0.1, 720.0)
      .showDefault();
  command.addOption("--speed", options->speed, "Simulated seconds in a second; as fast as possible without it")
      .within(0.001, 100000.0);
  command.addOption("--record", options->record, "Recording of what the product was delivered").notEmpty();
  command.addFlag("--verbose", options->isVerbose, "Show the log on standard error");
  command.setAction([options, minutes] {
    options->hasMinutes = minutes.isGiven();
    return simulate(*options);
  });
}

}  // namespace quorl::tool
