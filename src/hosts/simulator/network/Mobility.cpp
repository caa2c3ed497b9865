#include "hosts/simulator/network/Mobility.h"

#include <algorithm>

namespace quorl::simulator::network {
namespace {

using Kind = event::AirMessageKind;
using Trigger = event::HandoverTrigger;

constexpr Centi kOffset = 300;  // A3, and event 1D of TS 25.331
constexpr Centi kHysteresis = 100;
constexpr Centi kWeakServing = -11000;  // A5, first threshold
constexpr Centi kGoodOther = -10500;    // A5, second threshold
constexpr Centi kWeakLte = -11700;      // B2, first threshold
constexpr Centi kGoodUmts = -10600;
constexpr Centi kGoodGsm = -9800;
constexpr std::uint32_t kN310 = 3;
constexpr std::uint32_t kN311 = 2;

/// TS 36.133 7.6: the control channel fails in a tenth of the cases below about -8 dB, in a fiftieth above -6 dB.
bool isOutOfSync(const CellMeasurement& measurement) {
  switch (measurement.cell->technology) {
    case Technology::Umts:
      return measurement.quality < -2000 || measurement.power < -11800;
    case Technology::Gsm:
      return measurement.power < -10700;
    case Technology::Lte:
    case Technology::Nr:
      return measurement.sinr < -800;
    case Technology::None:
      break;
  }
  return true;
}
bool isInSync(const CellMeasurement& measurement) {
  return !isOutOfSync(measurement) && (!isPacketCell(measurement.cell->technology) || measurement.sinr > -600);
}

SimulatedMs timeToTrigger(Trigger trigger) {
  return trigger == Trigger::A3 ? 320 : 640;
}

}  // namespace

void Mobility::measured() {
  if (core_.cell() == nullptr || !core_.isConnected()) return;
  superviseLink();
  if (core_.isConnected() && pending_.to == nullptr) look();
}

void Mobility::superviseLink() {
  const CellMeasurement& serving = core_.state.serving->best;
  if (isOutOfSync(serving)) {
    inSync_ = 0;
    if (++outOfSync_ >= kN310 && !core_.isRunning(Timer::OutOfSync)) core_.after(Timer::OutOfSync, kT310Ms);
  } else if (isInSync(serving)) {
    outOfSync_ = 0;
    if (++inSync_ >= kN311) core_.cancel(Timer::OutOfSync);
  }
}

void Mobility::outOfSyncTooLong() {
  if (core_.isConnected()) fail(event::LinkFailureReason::T310Expiry);
}

void Mobility::fail(event::LinkFailureReason reason) {
  Counters& counters = core_.state.counters;
  const Cell* cell = core_.cell();
  ++(cell->technology == Technology::Nr ? counters.nrLinkFailures : counters.linkFailures);
  core_.emit(event::RadioLinkFailed{cell, reason, kT310Ms, core_.state.serving->best.power, false});
  pending_ = {};
  candidates_.clear();
  core_.cancel(Timer::OutOfSync);
  core_.cancel(Timer::HandoverCommand);
  core_.cancel(Timer::HandoverExecution);
  connection_.reestablish(reason == event::LinkFailureReason::HandoverFailure ? RrcCause::ReestablishHandover
                                                                              : RrcCause::ReestablishLink);
}

bool Mobility::callsFor(const CellMeasurement& candidate, Trigger& trigger) const {
  const CellMeasurement& serving = core_.state.serving->best;
  const Cell& own = *serving.cell;
  const Cell& other = *candidate.cell;
  if (other.technology == Technology::Nr && !other.isStandAlone) return false;
  if (own.technology == other.technology) {
    const bool isSameCarrier = own.downlinkChannel == other.downlinkChannel || own.technology == Technology::Gsm;
    trigger = isSameCarrier ? Trigger::A3 : Trigger::A5;
    const Centi extra = own.technology == Technology::Gsm ? 300 : 0;
    if (isSameCarrier) return candidate.power - kHysteresis > serving.power + kOffset + extra;
    return serving.power + kHysteresis < kWeakServing && candidate.power - kHysteresis > kGoodOther;
  }
  trigger = Trigger::B2;
  const bool isInCall = core_.state.call.phase != CallPhase::None;
  if (isPacketCell(own.technology)) {
    if (serving.power + kHysteresis >= kWeakLte) return false;
    if (other.technology == Technology::Umts) return candidate.power - kHysteresis > kGoodUmts;
    if (other.technology == Technology::Gsm) return candidate.power - kHysteresis > kGoodGsm;
    return Camping::isSuitable(candidate) && candidate.power - kHysteresis > kGoodOther;
  }
  if (own.technology == Technology::Umts && other.technology == Technology::Gsm)
    return isInCall && serving.power + kHysteresis < -11000 && candidate.power - kHysteresis > kGoodGsm;
  // Data goes back to LTE as soon as there is any; a call stays until its end.
  trigger = Trigger::Redirection;
  return !isInCall && other.technology == Technology::Lte && candidate.power - kHysteresis > kGoodOther;
}

void Mobility::look() {
  std::vector<Candidate> still;
  const CellMeasurement* best = nullptr;
  Trigger bestTrigger = Trigger::A3;
  const auto consider = [&](const std::vector<CellMeasurement>& list) {
    for (const CellMeasurement& measurement : list) {
      Trigger trigger = Trigger::A3;
      if (!callsFor(measurement, trigger)) continue;
      const std::uint16_t index = measurement.cell->index;
      const auto known = std::find_if(candidates_.begin(), candidates_.end(), [&](const Candidate& candidate) {
        return candidate.cell == index && candidate.trigger == trigger;
      });
      const SimulatedMs since = known == candidates_.end() ? core_.now() : known->sinceMs;
      still.push_back({index, trigger, since});
      // Own technology comes first, each list by strength.
      if (best == nullptr && core_.now() - since >= timeToTrigger(trigger)) {
        best = &measurement;
        bestTrigger = trigger;
      }
    }
  };
  consider(core_.state.neighbours);
  consider(core_.state.otherNeighbours);
  candidates_ = std::move(still);
  if (best != nullptr) report(*best, bestTrigger);
}

void Mobility::report(const CellMeasurement& target, Trigger trigger) {
  candidates_.clear();
  core_.say(Kind::MeasurementReport, true, 1, static_cast<std::uint16_t>(12 + core_.random.below(24)));
  const bool isInCall = core_.state.call.phase != CallPhase::None;
  const bool isOtherTechnology = target.cell->technology != core_.state.technology;
  const bool isPrepared = isInCall || (isPacketCell(core_.state.technology) && connection_.isHeld());
  if (isOtherTechnology && !isPrepared) {  // the network sends the phone away instead of preparing the other side
    connection_.redirect(*target.cell);
    return;
  }
  pending_ = {core_.cell(),
              target.cell,
              trigger,
              core_.state.serving->best.power,
              target.power,
              static_cast<std::uint16_t>(timeToTrigger(trigger)),
              0,
              true};
  core_.after(Timer::HandoverCommand, core_.delay(50, 120));
}

void Mobility::commandReceived() {
  if (pending_.to == nullptr || !core_.isConnected() || core_.cell() != pending_.from) {
    pending_ = {};
    return;
  }
  // Too late: the command is lost, and the link fails by itself.
  if (core_.receiver.measure(*pending_.from).sinr < -1000 && isPacketCell(core_.state.technology)) {
    pending_ = {};
    return;
  }
  const bool isOtherTechnology = pending_.to->technology != core_.state.technology;
  core_.say(isOtherTechnology ? Kind::MobilityCommand : Kind::Reconfiguration, false, 1,
            static_cast<std::uint16_t>(70 + core_.random.below(120)));
  pending_.interruptionMs = static_cast<std::uint16_t>(core_.delay(25, 60));
  core_.after(Timer::HandoverExecution, pending_.interruptionMs);
}

void Mobility::executed() {
  if (pending_.to == nullptr || !core_.isConnected()) return;
  event::Handover done = pending_;
  pending_ = {};
  done.isSuccess = connection_.tryAccess(*done.to, event::RachReason::Handover, /*isContentionBased=*/false) ||
                   connection_.tryAccess(*done.to, event::RachReason::Handover, /*isContentionBased=*/false);
  Counters& counters = core_.state.counters;
  if (!done.isSuccess) {
    ++counters.handoverFailures;
    core_.emit(done);
    fail(event::LinkFailureReason::HandoverFailure);
    return;
  }
  ++counters.handovers;
  connection_.moveTo(*done.to);
  core_.emit(done);
  core_.say(Kind::ReconfigurationComplete, true, 1, 2);
}

void Mobility::forgetMeasurements() {
  candidates_.clear();
  outOfSync_ = 0;
  inSync_ = 0;
  core_.cancel(Timer::OutOfSync);
}

void Mobility::cellChanged(const Cell*, const Cell*) {
  forgetMeasurements();
}

void Mobility::connectionEnding(RrcCause) {
  pending_ = {};
  forgetMeasurements();
}

}  // namespace quorl::simulator::network
