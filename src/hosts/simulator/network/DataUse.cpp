#include "hosts/simulator/network/DataUse.h"

#include <algorithm>

#include "hosts/simulator/network/LinkAdaptation.h"

namespace quorl::simulator::network {
namespace {

/// Data that does not flow for this long counts as stalled.
constexpr SimulatedMs kStarvingMs = 4000;
constexpr std::uint64_t kPacketBytes = 1400;

}  // namespace

void DataUse::powerOn() {
  drawNext();
}

void DataUse::drawNext() {
  core_.cancel(Timer::NextSession);
  if (core_.sim.sessionsPerHour > 0)
    core_.after(Timer::NextSession,
                500 + static_cast<SimulatedMs>(core_.random.waiting(3.6e6 / core_.sim.sessionsPerHour)));
}

void DataUse::nextDue() {
  const double seconds = core_.random.waiting(core_.sim.sessionSeconds);
  isTerminated_ = core_.random.chance(0.3);
  drawNext();
  // The other SIM has only signalling and short messages.
  const bool isOwn = core_.phone.dataSlot == core_.state.subscription;
  use(isOwn ? seconds : std::min(seconds, 1.0));
}

void DataUse::use(double seconds) {
  SubscriptionState& state = core_.state;
  if (state.service != ServiceStatus::Service) return;
  if (!isInSession_) {
    isInSession_ = true;
    connection_.hold();
  }
  core_.after(Timer::SessionEnd, std::max<SimulatedMs>(300, static_cast<SimulatedMs>(seconds * 1000.0)));
  ask();
}

void DataUse::ask() {
  if (!isInSession_) return;
  if (core_.isConnected()) {
    connected();
    return;
  }
  if (isTerminated_ && core_.state.rrc == RrcState::Idle) {
    ++core_.state.counters.pages;
    core_.say(event::AirMessageKind::Paging, false, 0, 8);
    core_.emit(event::Paged{});
  }
  connection_.request(isTerminated_ ? RrcCause::MtAccess : RrcCause::MoData);
}

void DataUse::connected() {
  if (!isInSession_ || core_.state.isDataActive) return;
  core_.state.isDataActive = true;
  movedMs_ = starvingSinceMs_ = core_.now();
}

void DataUse::sessionOver() {
  if (!isInSession_) return;
  isInSession_ = false;
  isTerminated_ = false;
  core_.state.isDataActive = false;
  stallOver();
  connection_.letGo();
}

void DataUse::connectionFailed() {
  if (isInSession_) sessionOver();
}

void DataUse::connectionEnded(RrcCause cause) {
  core_.state.isDataActive = false;
  // After a redirection the session goes on where the phone is sent; after a failure its user tries again later.
  if (isInSession_ && cause != RrcCause::ReleaseRedirection) sessionOver();
}

void DataUse::cellChanged(const Cell*, const Cell* to) {
  if (!isInSession_) return;
  if (to == nullptr) {
    sessionOver();
  } else if (core_.state.rrc == RrcState::Idle) {
    ask();
  }
}

void DataUse::drop() {
  core_.cancel(Timer::NextSession);
  core_.cancel(Timer::SessionEnd);
  if (isInSession_) sessionOver();
}

void DataUse::measured() {
  SubscriptionState& state = core_.state;
  if (!state.serving || !core_.isConnected()) return;
  const Cell& cell = *state.serving->best.cell;
  const bool isBusy = state.isDataActive && !state.isDataStalled;
  const auto blocks = static_cast<std::uint16_t>(isBusy ? std::max(1, cell.resourceBlocks / 5) : 2);
  const UplinkPower power = uplinkPower(cell, state.serving->pathLoss, blocks);
  state.transmitPower = power.total;
  state.transmitPowerControl = power.control;
  if (!isBusy) {
    state.serving->downlinkKbps = state.serving->uplinkKbps = 0;
    movedMs_ = core_.now();
    return;
  }
  connection_.touch();
  move(core_.now() - movedMs_);
  movedMs_ = core_.now();
  if (state.serving->downlinkKbps >= 32) starvingSinceMs_ = core_.now();
  if (core_.now() - starvingSinceMs_ >= kStarvingMs) stall(core_.random.between(3.0, 20.0), core_.random.chance(0.2));
}

void DataUse::move(SimulatedMs milliseconds) {
  SubscriptionState& state = core_.state;
  // kbit/s times ms are bits.
  std::uint64_t master = state.serving->downlinkKbps * milliseconds / 8;
  for (const SecondaryCarrier& carrier : state.carriers)
    if (carrier.state == CarrierState::Activated) master += carrier.serving.downlinkKbps * milliseconds / 8;
  std::uint64_t secondary = 0;
  std::uint64_t uplink = state.serving->uplinkKbps * milliseconds / 8 / 8;
  Counters& counters = state.counters;
  const auto discards = [&](Centi sinr, std::uint64_t packets) {
    return sinr < 0 ? static_cast<std::uint64_t>(core_.random.below(static_cast<std::uint32_t>(packets / 20 + 2)))
                    : std::uint64_t{0};
  };
  if (state.nr) {
    SecondaryGroup& group = *state.nr;
    secondary = group.serving.downlinkKbps * milliseconds / 8;
    const std::uint64_t nrUplink = group.serving.uplinkKbps * milliseconds / 8 / 8;
    const std::uint64_t packets = nrUplink / kPacketBytes + 1;
    counters.nrPdcpUplinkPackets += packets;
    counters.nrPdcpUplinkDiscards += discards(group.serving.best.sinr, packets);
    group.masterBytes += master;
    group.secondaryBytes += secondary;
    uplink += nrUplink;
  }
  const std::uint64_t packets = uplink / kPacketBytes + 1;
  const std::uint64_t lost = discards(state.serving->best.sinr, packets);
  if (state.technology == Technology::Nr) {
    counters.nrPdcpUplinkPackets += packets;
    counters.nrPdcpUplinkDiscards += lost;
  } else {
    counters.pdcpUplinkPackets += packets;
    counters.pdcpUplinkDiscards += lost;
  }
  counters.downlinkBytes += master + secondary;
  counters.uplinkBytes += uplink;
}

void DataUse::stall(double seconds, bool isDnsFailure) {
  SubscriptionState& state = core_.state;
  if (state.isDataStalled || state.service != ServiceStatus::Service) return;
  state.isDataStalled = true;
  stalledSinceMs_ = core_.now();
  ++state.counters.dataStalls;
  core_.after(Timer::StallEnd, static_cast<SimulatedMs>(seconds * 1000.0) + 1);
  core_.emit(event::DataStall{true, isDnsFailure, 0});
  core_.emit(event::HealthFinding{event::HealthKind::DataStalled, 1});
}

void DataUse::stallOver() {
  core_.cancel(Timer::StallEnd);
  if (!core_.state.isDataStalled) return;
  core_.state.isDataStalled = false;
  starvingSinceMs_ = movedMs_ = core_.now();
  core_.emit(event::DataStall{false, false, core_.now() - stalledSinceMs_});
}

}  // namespace quorl::simulator::network
