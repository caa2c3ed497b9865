#include "hosts/simulator/network/Carriers.h"

#include <algorithm>

namespace quorl::simulator::network {
namespace {

using Kind = event::AirMessageKind;

constexpr std::size_t kMostSecondary = 2;
constexpr Centi kCarrierAdd = -11200;
constexpr Centi kCarrierDrop = -11900;
constexpr Centi kGroupAdd = -10800;   // B1
constexpr Centi kGroupDrop = -11500;  // A2
constexpr Centi kGroupOffset = 400;   // A3 between NR cells
constexpr SimulatedMs kGroupTriggerMs = 320;
constexpr SimulatedMs kWeakMs = 640;
constexpr SimulatedMs kRecoveryMs = 1000;
constexpr SimulatedMs kQuietMs = 2000;

void widen(ConnectionUse& use, const ServingMeasurement& serving, std::size_t carriers, unsigned layers) {
  use.maxDownlink = std::max(use.maxDownlink, serving.downlink);
  use.maxUplink = std::max(use.maxUplink, serving.uplink);
  use.maxRank = std::max(use.maxRank, serving.rank);
  use.maxLayersScheduled = std::max(use.maxLayersScheduled, serving.rank);
  use.maxCarriers = std::max(use.maxCarriers, static_cast<std::uint8_t>(carriers));
  use.maxTotalLayers = std::max(use.maxTotalLayers, static_cast<std::uint8_t>(layers));
}

}  // namespace

void Carriers::measured() {
  const Cell* cell = core_.cell();
  if (cell == nullptr || core_.state.rrc != RrcState::Connected) return;
  if (cell->technology == Technology::Lte) {
    measureCarriers();
    measureGroup();
  }
  account();
}

void Carriers::account() {
  SubscriptionState& state = core_.state;
  const auto isActive = [](const SecondaryCarrier& carrier) { return carrier.state == CarrierState::Activated; };
  std::size_t carriers = 1;
  unsigned layers = state.serving->rank;
  for (const SecondaryCarrier& carrier : state.carriers) {
    if (!isActive(carrier)) continue;
    ++carriers;
    layers += carrier.serving.rank;
  }
  widen(state.use, *state.serving, carriers, layers);
  if (state.nr) widen(groupUse_, state.nr->serving, 1, state.nr->serving.rank);
}

void Carriers::measureCarriers() {
  SubscriptionState& state = core_.state;
  for (SecondaryCarrier& carrier : state.carriers) carrier.serving = core_.receiver.serve(*carrier.serving.best.cell);
  const std::size_t before = state.carriers.size();
  std::erase_if(state.carriers,
                [](const SecondaryCarrier& carrier) { return carrier.serving.best.power < kCarrierDrop; });
  bool hasChanged = state.carriers.size() != before;
  if (state.isDataActive) {
    quietSinceMs_ = core_.now();
    configureCarriers();
  } else if (core_.now() - quietSinceMs_ > kQuietMs) {
    for (SecondaryCarrier& carrier : state.carriers) {
      hasChanged = hasChanged || carrier.state == CarrierState::Activated;
      carrier.state = CarrierState::Configured;  // sCellDeactivationTimer has run out
    }
  }
  if (hasChanged) core_.emit(event::CarriersChanged{});
}

void Carriers::configureCarriers() {
  SubscriptionState& state = core_.state;
  const Cell& primary = *core_.cell();
  bool hasNew = false;
  bool isAnyQuiet = false;
  for (const CellMeasurement& measurement : core_.receiver.found(Technology::Lte)) {
    if (state.carriers.size() >= kMostSecondary) break;
    const Cell& cell = *measurement.cell;
    if (cell.siteIndex != primary.siteIndex || cell.downlinkChannel == primary.downlinkChannel ||
        measurement.power < kCarrierAdd)
      continue;
    const bool isUsed = std::any_of(state.carriers.begin(), state.carriers.end(), [&](const SecondaryCarrier& carrier) {
      return carrier.serving.best.cell->downlinkChannel == cell.downlinkChannel;
    });
    if (isUsed) continue;
    SecondaryCarrier carrier;
    carrier.index = static_cast<std::uint8_t>(state.carriers.size() + 1);
    carrier.state = CarrierState::Configured;
    carrier.serving = core_.receiver.serve(cell);
    state.carriers.push_back(carrier);
    hasNew = true;
  }
  for (const SecondaryCarrier& carrier : state.carriers)
    isAnyQuiet = isAnyQuiet || carrier.state == CarrierState::Configured;
  if (hasNew) {
    core_.say(Kind::Reconfiguration, false, 1, static_cast<std::uint16_t>(40 + core_.random.below(60)));
    core_.say(Kind::ReconfigurationComplete, true, 1, 2);
    core_.emit(event::CarriersChanged{});
  }
  if (isAnyQuiet && !core_.isRunning(Timer::CarrierActivation))
    core_.after(Timer::CarrierActivation, core_.delay(100, 400));
}

void Carriers::activateCarriers() {
  if (core_.state.carriers.empty() || !core_.state.isDataActive) return;
  std::uint8_t index = 0;
  for (SecondaryCarrier& carrier : core_.state.carriers) {
    carrier.state = CarrierState::Activated;
    carrier.index = ++index;
  }
  core_.emit(event::CarriersChanged{});
}

void Carriers::removeCarriers() {
  core_.cancel(Timer::CarrierActivation);
  if (core_.state.carriers.empty()) return;
  core_.state.carriers.clear();
  core_.emit(event::CarriersChanged{});
}

void Carriers::measureGroup() {
  SubscriptionState& state = core_.state;
  if (!state.nr) {
    lookForGroup();
    return;
  }
  SecondaryGroup& group = *state.nr;
  const CellMeasurement before = group.serving.best;
  group.serving = core_.receiver.serve(*before.cell);
  const CellMeasurement& now = group.serving.best;
  followBeam(before, now);
  if (now.sinr < -600 && core_.now() - recoveryMs_ >= kRecoveryMs) {
    // The serving beam fails before the cell does: TS 38.321 5.17.
    recoveryMs_ = core_.now();
    ++group.beamFailures;
    ++state.counters.beamFailures;
    if (connection_.tryAccess(*now.cell, event::RachReason::BeamRecovery, false)) ++group.beamRecoveries;
  }
  outOfSync_ = now.sinr < -800 ? outOfSync_ + 1 : 0;
  if (outOfSync_ >= 3 && !core_.isRunning(Timer::NrOutOfSync)) core_.after(Timer::NrOutOfSync, kT310Ms);
  if (outOfSync_ == 0) core_.cancel(Timer::NrOutOfSync);
  if (now.power >= kGroupDrop) {
    weakSinceMs_ = core_.now();
  } else if (core_.now() - weakSinceMs_ >= kWeakMs) {
    core_.say(Kind::MeasurementReport, true, 1, 18);
    removeGroup(event::GroupRemoval::Weak);
    return;
  }
  for (const CellMeasurement& other : core_.receiver.found(Technology::Nr)) {
    if (other.cell == now.cell || other.power < now.power + kGroupOffset) continue;
    if (groupCandidate_ != other.cell) {
      groupCandidate_ = other.cell;
      groupSinceMs_ = core_.now();
    } else if (core_.now() - groupSinceMs_ >= kGroupTriggerMs) {
      changeGroup(*other.cell);
    }
    return;
  }
  groupCandidate_ = nullptr;
}

void Carriers::followBeam(const CellMeasurement& before, const CellMeasurement& after) {
  // A beam has to be the best twice in a row: fading alone switches nothing.
  strangeBeams_ = after.beam == before.beam ? 0 : strangeBeams_ + 1;
  if (strangeBeams_ == 0) return;
  SecondaryGroup& group = *core_.state.nr;
  if (strangeBeams_ < 2) {
    group.serving.best.beam = before.beam;
    return;
  }
  strangeBeams_ = 0;
  ++group.beamSwitches;
  const SimulatedMs lasted = core_.now() - beamSinceMs_;
  beamSinceMs_ = core_.now();
  core_.emit(event::BeamSwitched{after.cell, before.beam, after.beam, static_cast<std::uint32_t>(lasted),
                                 before.power - 150, after.power});
}

void Carriers::lookForGroup() {
  const Cell& anchor = *core_.cell();
  const SubscriptionState& state = core_.state;
  const bool isWanted = anchor.isNrAnchor && state.isDataActive && !state.saving.isFr1Disabled &&
                        core_.phone.dataSlot == state.subscription && !core_.isRunning(Timer::GroupAddition);
  const auto& found = core_.receiver.found(Technology::Nr);
  if (!isWanted || found.empty() || found.front().power < kGroupAdd) {
    if (!core_.isRunning(Timer::GroupAddition)) groupCandidate_ = nullptr;
    return;
  }
  const Cell* best = found.front().cell;
  if (groupCandidate_ != best) {
    groupCandidate_ = best;
    groupSinceMs_ = core_.now();
  } else if (core_.now() - groupSinceMs_ >= kGroupTriggerMs) {
    core_.say(Kind::MeasurementReport, true, 1, 22);
    core_.after(Timer::GroupAddition, core_.delay(60, 140));
  }
}

void Carriers::addGroup() {
  SubscriptionState& state = core_.state;
  if (groupCandidate_ == nullptr || state.nr || state.rrc != RrcState::Connected) return;
  const Cell& cell = *groupCandidate_;
  groupCandidate_ = nullptr;
  core_.say(Kind::Reconfiguration, false, 1, static_cast<std::uint16_t>(220 + core_.random.below(300)));
  core_.say(Kind::ReconfigurationComplete, true, 1, 12);
  core_.say(&cell, Kind::Mib, false, 0, 3);
  core_.emit(event::SystemInformationRead{&cell, static_cast<std::uint8_t>(cell.cellId % 32)});
  if (!connection_.tryAccess(cell, event::RachReason::SecondaryGroup, false)) {
    ++state.counters.secondaryGroupFailures;
    core_.emit(event::SecondaryGroupAdded{&cell, false, false});
    return;
  }
  SecondaryGroup group;
  group.serving = core_.receiver.serve(cell);
  group.addedMs = core_.now();
  state.nr = group;
  state.use.hadSecondaryGroup = true;
  groupUse_ = ConnectionUse{};
  groupUse_.sinceMs = core_.now();
  weakSinceMs_ = beamSinceMs_ = core_.now();
  outOfSync_ = strangeBeams_ = 0;
  core_.emit(event::SecondaryGroupAdded{&cell, true, false});
  core_.emit(event::RrcChanged{Technology::Nr, RrcState::Connected, RrcState::None, 0, RrcCause::MoData, true});
}

void Carriers::changeGroup(const Cell& cell) {
  groupCandidate_ = nullptr;
  core_.say(Kind::MeasurementReport, true, 1, 20);
  core_.say(Kind::Reconfiguration, false, 1, 180);
  if (!connection_.tryAccess(cell, event::RachReason::SecondaryGroup, false)) {
    Counters& counters = core_.state.counters;
    ++counters.secondaryGroupFailures;
    ++counters.nrLinkFailures;
    core_.emit(event::SecondaryGroupAdded{&cell, false, true});
    core_.emit(event::RadioLinkFailed{&cell, event::LinkFailureReason::RandomAccess, kT310Ms,
                                      core_.state.nr->serving.best.power, true});
    removeGroup(event::GroupRemoval::LinkFailure);
    return;
  }
  core_.state.nr->serving = core_.receiver.serve(cell);
  weakSinceMs_ = beamSinceMs_ = core_.now();
  outOfSync_ = strangeBeams_ = 0;
  core_.emit(event::SecondaryGroupAdded{&cell, true, true});
}

void Carriers::groupOutOfSync() {
  if (!core_.state.nr) return;
  const CellMeasurement last = core_.state.nr->serving.best;
  ++core_.state.counters.nrLinkFailures;
  ++core_.state.counters.secondaryGroupFailures;
  core_.emit(event::RadioLinkFailed{last.cell, event::LinkFailureReason::T310Expiry, kT310Ms, last.power, true});
  removeGroup(event::GroupRemoval::LinkFailure);
}

void Carriers::removeGroup(event::GroupRemoval reason) {
  core_.cancel(Timer::GroupAddition);
  core_.cancel(Timer::NrOutOfSync);
  groupCandidate_ = nullptr;
  if (!core_.state.nr) return;
  const SecondaryGroup group = *core_.state.nr;
  core_.state.nr.reset();
  const std::uint64_t lasted = core_.now() - group.addedMs;
  const bool isFailure = reason == event::GroupRemoval::LinkFailure;
  core_.emit(event::SecondaryGroupRemoved{reason, static_cast<std::uint32_t>(lasted), group, groupUse_});
  core_.emit(event::ConnectionEnded{Technology::Nr, group.serving.best.cell,
                                    isFailure                                 ? event::ConnectionEnd::Failure
                                    : reason == event::GroupRemoval::Handover ? event::ConnectionEnd::Handover
                                                                              : event::ConnectionEnd::Release,
                                    lasted, groupUse_, true});
  core_.emit(event::RrcChanged{Technology::Nr, RrcState::None, RrcState::Connected, lasted,
                               isFailure ? RrcCause::ReleaseLinkFailure : RrcCause::ReleaseNormal, true});
}

void Carriers::setSaving(const NrSaving& saving) {
  const NrSaving previous = core_.state.saving;
  core_.state.saving = saving;
  core_.state.saving.sinceMs = core_.now();
  const bool hasReleased = saving.isFr1Disabled && core_.state.nr.has_value();
  if (hasReleased) removeGroup(event::GroupRemoval::Saving);
  core_.emit(event::SavingChanged{previous, hasReleased});
}

void Carriers::connectionEnding(RrcCause cause) {
  removeGroup(cause == RrcCause::ReleaseHandoverOut   ? event::GroupRemoval::Handover
              : cause == RrcCause::ReleaseLinkFailure ? event::GroupRemoval::LinkFailure
                                                      : event::GroupRemoval::Released);
  removeCarriers();
}

}  // namespace quorl::simulator::network
