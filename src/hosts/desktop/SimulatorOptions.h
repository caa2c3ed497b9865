#pragma once

#include <filesystem>
#include <optional>
#include <string>

#include <tl/expected.hpp>

#include "hosts/desktop/PlayedRadio.h"
#include "hosts/simulator/PhoneServices.h"

namespace quorl::desktop {

/// What the user of the simulator asked for. All of it is the host's: the product reads no option.
struct SimulatorOptions {
  simulator::DeviceDescription device;
  int sims = 2;
  std::filesystem::path recording;  // empty: the shipped one of the chipset's family
  std::filesystem::path telephony;  // empty: the shipped script, with as many SIMs as asked for
  double speed = 1;
  std::filesystem::path documents;
  bool isVerbose = false;
  // For a run that nobody watches.
  bool prints = false;
  std::filesystem::path screenshots;  // empty: none
  std::optional<double> seconds;      // after which the program ends

  /// How the options come out: those to run with, or the code to end with at once (help was shown, or a mistake told).
  static tl::expected<SimulatorOptions, int> parse(int argc, char** argv);
  /// Reads recording and script. The error is a line for the user.
  tl::expected<PlayedRadio::Programme, std::string> programme() const;
};

}  // namespace quorl::desktop
