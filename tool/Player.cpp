#include "Player.h"

#include <cstdint>
#include <filesystem>
#include <limits>
#include <utility>

#include "Commands.h"

namespace quorl::tool {

using simulator::RecordedEvent;
using simulator::SimulatedPhone;
using simulator::TelephonyScriptStep;

namespace {

/// The longest time there is, if that many milliseconds are more.
std::chrono::milliseconds clamped(std::uint64_t count) {
  using Count = std::chrono::milliseconds::rep;
  return std::chrono::milliseconds(std::in_range<Count>(count) ? static_cast<Count>(count)
                                                               : std::numeric_limits<Count>::max());
}

}  // namespace

std::optional<std::vector<TelephonyScriptStep>> readScript(const std::string& file, std::size_t& faults) {
  if (file.empty()) return std::vector<TelephonyScriptStep>();
  simulator::TelephonyScript script = simulator::readTelephonyScript(std::filesystem::path(file));
  bool isReadable = true;
  for (simulator::TelephonyScriptProblem& problem : script.problems) {
    problem.file = file;  // as the user has named it
    complain(logText(problem));
    isReadable = isReadable && problem.line > 0;
  }
  faults += script.problems.size();
  return isReadable ? std::optional(std::move(script.steps)) : std::nullopt;
}

Player::Player(SimulatedPhone& phone, std::vector<TelephonyScriptStep> steps)
    : phone_(phone), steps_(std::move(steps)) {}

void Player::goTo(std::chrono::milliseconds time) {
  for (; nextStep_ < steps_.size() && steps_[nextStep_].at <= time; ++nextStep_) {
    phone_.runUntilAtRest();
    phone_.telephony().perform(steps_[nextStep_].event);
    phone_.runUntilAtRest();
  }
}

bool Player::play(const std::vector<RecordedEvent>& events) {
  // A long recording does not pile up in front of the store.
  constexpr std::size_t kPortion = 256;
  bool isTaken = true;
  for (std::size_t at = 0; at < events.size(); ++at) {
    if (events[at].atMs) goTo(clamped(*events[at].atMs));
    isTaken = phone_.baseband().deliver(zelkor::kEventMetric, events[at].message()) && isTaken;
    if (at % kPortion == kPortion - 1) phone_.runUntilAtRest();
  }
  phone_.runUntilAtRest();
  goTo(std::chrono::milliseconds::max());
  return isTaken;
}

}  // namespace quorl::tool
