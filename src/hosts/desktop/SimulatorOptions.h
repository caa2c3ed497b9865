#pragma once

#include <cstdint>
#include <filesystem>
#include <memory>
#include <optional>
#include <string>

#include <tl/expected.hpp>

#include "base/Clock.h"
#include "hosts/desktop/Programme.h"
#include "hosts/simulator/PhoneServices.h"
#include "hosts/simulator/history/History.h"

namespace quorl::desktop {

/// What the user of the simulator asked for. All of it is the host's: the product reads no option.
struct SimulatorOptions {
  static constexpr int kWrongUse = 2;  // exit code: nothing was tried

  simulator::DeviceDescription device;
  std::optional<int> sims;  // most SIMs; as many as scenario or script have if not given
  std::string scenario;     // name or file; empty: the city, unless there is a recording
  std::uint64_t seed = 1;
  std::filesystem::path recording;  // in place of a scenario; empty: none
  std::filesystem::path telephony;  // empty: the scenario's, beside a recording the shipped one
  std::filesystem::path record;     // empty: nothing is recorded
  double speed = 1;
  int historyDays = 7;  // before the first start
  std::filesystem::path documents;
  bool isVerbose = false;
  // For a run that nobody watches.
  bool prints = false;
  std::filesystem::path screenshots;  // empty: none
  std::optional<double> seconds;      // after which the program ends

  /// How the options come out: those to run with, or the code to end with at once (help was shown, or a mistake told).
  static tl::expected<SimulatorOptions, int> parse(int argc, char** argv);
  /// Reads scenario, recording and script. Lines of the latter two that are wrong are left out, and told in `faults`;
  /// the error, for what cannot be used at all, is text for the user, a line for each mistake.
  tl::expected<Programme, std::string> programme() const;
  /// Where the product's own prints go: standard output, unless that is for what is printed here. Then they are shown
  /// with the log.
  std::unique_ptr<Console> console() const;
  /// The past that a phone with this programme has had; none for a recording, and on a device of unknown family.
  std::optional<simulator::HistoryPlan> history(const Programme& programme, Date until) const;
};

}  // namespace quorl::desktop
