#pragma once

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <functional>
#include <string>

#include <tl/expected.hpp>

#include "base/Clock.h"
#include "hosts/simulator/LiveScenario.h"
#include "hosts/simulator/history/History.h"

// What the tool does with scenarios.

namespace quorl::tool {

/// How far something has come, from 0 to 1.
using Progress = std::function<void(double share)>;

struct RecordedScenario {
  std::uint64_t events = 0;
  double seconds = 0;
};

/// Writes a scenario's way to a file. The error says why the file cannot be written.
tl::expected<RecordedScenario, std::string> recordScenario(simulator::ScenarioChoice choice, Date start,
                                                           std::chrono::milliseconds length,
                                                           const std::filesystem::path& file, const Progress& progress);

struct MadeHistory {
  int sessions = 0;
  std::uint64_t events = 0;
  std::uint64_t rows = 0;
  double seconds = 0;
};

struct LivedScenario {
  std::uint64_t events = 0;
  std::uint64_t rows = 0;
  std::uint64_t insertsFailed = 0;
  double seconds = 0;
  std::string failedRows;      // a line for the user; empty if all rows are stored
  std::string recordingFault;  // a line for the user; empty if the recording is whole, or if there is none
};

/// The product on a phone without a screen. A process has one at most, as the product has no tear-down. Errors are
/// one line each.
class SimulatedProduct {
 public:
  /// `chipset` decides the family. The documents directory must be usable. `isVerbose` shows log and console.
  SimulatedProduct(std::string chipset, std::filesystem::path documents, bool isVerbose);
  SimulatedProduct(const SimulatedProduct&) = delete;
  SimulatedProduct& operator=(const SimulatedProduct&) = delete;

  /// To be called before `live`.
  tl::expected<MadeHistory, std::string> makeHistory(
      const simulator::HistoryPlan& plan, const std::function<void(const simulator::HistoryProgress&)>& progress);
  /// Launches the product, lets the scenario happen, and terminates it. Paced: by the options' speed; else as fast as
  /// the product takes it.
  tl::expected<LivedScenario, std::string> live(simulator::LiveScenario::Options options,
                                                std::chrono::milliseconds length, bool isPaced,
                                                const Progress& progress);

 private:
  class Phone;
  Phone& phone_;
  const std::filesystem::path documents_;
  const bool isVerbose_;
};

}  // namespace quorl::tool
