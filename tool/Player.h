#pragma once

#include <chrono>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "hosts/simulator/Recording.h"
#include "hosts/simulator/SimulatedPhone.h"
#include "hosts/simulator/TelephonyScript.h"

namespace quorl::tool {

/// The steps of a telephony script in the order of time; none if `file` is empty. Bad lines are told to the user,
/// counted in `faults` and left out. Nothing if the file cannot be read, which the user is told as well.
std::optional<std::vector<simulator::TelephonyScriptStep>> readScript(const std::string& file, std::size_t& faults);

/// Plays recordings and telephony script by their times, as fast as the product takes them. Main thread.
class Player {
 public:
  /// `phone` must outlive the player.
  Player(simulator::SimulatedPhone& phone, std::vector<simulator::TelephonyScriptStep> steps);

  /// Does all steps that are due at `time`, one after the other and each to its end.
  void goTo(std::chrono::milliseconds time);
  /// Delivers the events in their order, each after the steps of its time, and then does the steps that are left.
  /// False if the baseband manager had no client for one of the events.
  bool play(const std::vector<simulator::RecordedEvent>& events);

 private:
  simulator::SimulatedPhone& phone_;
  const std::vector<simulator::TelephonyScriptStep> steps_;
  std::size_t nextStep_ = 0;
};

}  // namespace quorl::tool
