#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdint>
#include <filesystem>
#include <iostream>
#include <iterator>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "Commands.h"
#include "Documents.h"
#include "JsonLine.h"
#include "Player.h"
#include "ProductRun.h"
#include "RemovedRows.h"
#include "RowCounter.h"
#include "ToolLog.h"
#include "hosts/simulator/CatalogueClass.h"
#include "hosts/simulator/Recording.h"
#include "hosts/simulator/SimulatedPhone.h"
#include "hosts/simulator/TimeShift.h"
#include "hosts/simulator/UsableDocuments.h"
#include "intake/MetricGroupV2.h"
#include "messages/MetricCodable.h"

namespace quorl::tool {
namespace {

using simulator::RecordedEvent;
using simulator::SimulatedPhone;

struct ReplayOptions {
  simulator::DeviceDescription device;
  std::string chipset;
  std::string deviceClass;
  std::string documents;
  std::vector<std::string> files;
  std::string telephonyScript;  // empty: a phone without a SIM
  bool rebaseTime = false;
  bool isVerbose = false;
};

struct Summary {
  std::uint64_t events = 0;
  std::uint64_t eventsWithoutRow = 0;
  std::uint64_t unreadablePayloads = 0;
  std::uint64_t rowsInserted = 0;
  std::uint64_t insertsFailed = 0;
  double seconds = 0;
};

/// All events of the files in order. Bad lines are told and counted in `faults`; a file that cannot be read ends it.
std::optional<std::vector<RecordedEvent>> readAll(const std::vector<std::string>& files, std::size_t& faults) {
  std::vector<RecordedEvent> events;
  for (const std::string& file : files) {
    auto recording = simulator::readRecording(std::filesystem::path(file));
    if (!recording) {
      complain(fmt::format("{}: {}", file, recording.error()));
      return std::nullopt;
    }
    for (const simulator::RecordingFault& fault : recording->faults)
      complain(fmt::format("{}:{}: {}", file, fault.line, fault.reason));
    faults += recording->faults.size();
    std::move(recording->events.begin(), recording->events.end(), std::back_inserter(events));
  }
  return events;
}

bool isReadable(const RecordedEvent& event, const MetricGroupV2& row) {
  const auto message = makeMessage(simulator::decodingClass(row));
  if (!message) return false;
  message->initWithData(event.payload);
  return message->isReadWhole();
}

/// Counts what becomes of an event by the catalogue, whatever the device then does with it.
void countEvent(const RecordedEvent& event, Summary& summary) {
  ++summary.events;
  bool hasRow = false;
  bool isReadableOnAllRows = true;
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
    if (event.metricID != row.zelkorId) continue;
    hasRow = true;
    isReadableOnAllRows = isReadableOnAllRows && isReadable(event, row);
  }
  if (!hasRow) ++summary.eventsWithoutRow;
  if (!isReadableOnAllRows) ++summary.unreadablePayloads;
}

void print(const Summary& summary) {
  std::cout << jsonLine({{"events", summary.events},
                         {"eventsWithoutRow", summary.eventsWithoutRow},
                         {"unreadablePayloads", summary.unreadablePayloads},
                         {"rowsInserted", summary.rowsInserted},
                         {"insertsFailed", summary.insertsFailed},
                         {"seconds", std::round(summary.seconds * 1000) / 1000}})
            << '\n';
}

int replay(const ReplayOptions& options) {
  std::size_t faults = 0;
  auto events = readAll(options.files, faults);
  if (!events) return kFailure;
  auto steps = readScript(options.telephonyScript, faults);
  if (!steps) return kFailure;
  if (const auto prepared = simulator::prepareDocuments(options.documents); !prepared) {
    complain(prepared.error());
    return kFailure;
  }
  if (options.rebaseTime) simulator::shiftToNow(*events, SystemClock().now());

  Summary summary;
  for (const RecordedEvent& event : *events) countEvent(event, summary);

  const RemovedRows removed(options.documents);
  // As the product, they live until the process ends.
  const auto log = installToolLog(options.isVerbose);
  static auto* phone =
      new SimulatedPhone({options.device, options.documents,
                          simulator::ResourceDirectories::ofThisProgram(QUORL_RESOURCE_DIRECTORY), options.isVerbose});
  ProductRun product(*phone);
  static const auto* rows = new RowCounter;
  const auto start = std::chrono::steady_clock::now();
  Player player(*phone, *std::move(steps));
  product.launch([&player] { player.goTo(std::chrono::milliseconds(0)); });
  const bool isTaken = player.play(*events);
  product.terminate();
  summary.seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
  summary.rowsInserted = rows->count();
  summary.insertsFailed = log->count();

  removed.tell();
  print(summary);
  if (const std::string lost = log->report(); !lost.empty()) complain(lost);
  if (!isTaken) complain("the baseband manager had no configuration; is the resource deviceconfig missing?");
  const auto folded = foldWriteAheadLog(options.documents);
  if (!folded) complain(folded.error());
  return faults == 0 && isTaken && folded && summary.insertsFailed == 0 ? kSuccess : kFailure;
}

}  // namespace

void addReplay(CommandLine& tool) {
  Command command = tool.addCommand("replay", "Play recordings into a database");
  command.setFooter(
      "Starts the product on a simulated phone, plays every event of the recordings in order, and prints one JSON\n"
      "summary. The rows are then in metricPartV11.sqlite in the documents directory. A line of a recording that is "
      "no\n"
      "event is reported and left out, and makes the exit code 1.");
  auto options = std::make_shared<ReplayOptions>();
  command.addOption("--chipset", options->chipset, "Baseband chipset; \"mav\" or \"ice\" in it selects the family")
      .required();
  command
      .addOption(
          "--documents", options->documents,
          "Directory for the database; made if it is missing, and its rows of thirty days ago and older are removed")
      .required()
      .notEmpty();
  const CommandOption deviceClass =
      command.addOption("--device-class", options->deviceClass, "Device class, such as Tabrin");
  command.addFlag("--internal-build", options->device.isInternalBuild, "Be an internal build");
  command.addFlag("--carrier-build", options->device.isCarrierBuild, "Be a carrier build");
  command.addFlag(
      "--rebase-time", options->rebaseTime,
      "Move the times in the payloads so that the last is now: rows of thirty days ago and older go at the next start");
  command.addOption("--telephony", options->telephonyScript, "Telephony script to play beside the recordings")
      .notEmpty();
  command.addFlag("--verbose", options->isVerbose, "Show the log on standard error");
  command.addOption("FILE", options->files, "Recordings, in the order of playing").required();
  command.setAction([options, deviceClass] {
    options->device.chipset = options->chipset;
    if (deviceClass.isGiven()) options->device.deviceClass = options->deviceClass;
    return replay(*options);
  });
}

}  // namespace quorl::tool
