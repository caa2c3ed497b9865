#include "hosts/simulator/network/Health.h"

namespace quorl::simulator::network {
namespace {

constexpr SimulatedMs kWindowMs = 300000;
constexpr SimulatedMs kFloorMs = 10000;
constexpr SimulatedMs kSettledMs = 4000;

LinkQuality judge(const CellMeasurement& measurement) {
  switch (measurement.cell->technology) {
    case Technology::Gsm:
      return measurement.power > -9000 ? LinkQuality::Poor : LinkQuality::Bad;
    case Technology::Umts:
      return measurement.quality > -1200 && measurement.power > -10200   ? LinkQuality::Good
             : measurement.quality > -1700 && measurement.power > -11200 ? LinkQuality::Poor
                                                                         : LinkQuality::Bad;
    case Technology::Lte:
    case Technology::Nr:
      return measurement.sinr > 200 && measurement.power > -10800    ? LinkQuality::Good
             : measurement.sinr > -500 && measurement.power > -11900 ? LinkQuality::Poor
                                                                     : LinkQuality::Bad;
    case Technology::None:
      break;
  }
  return LinkQuality::Unknown;
}

}  // namespace

void Health::powerOn() {
  windowMs_ = floorSinceMs_ = lostSinceMs_ = core_.now();
  core_.after(Timer::Tuner, core_.delay(5000, 40000));
}

void Health::powerOff() {
  core_.cancel(Timer::Tuner);
  core_.state.linkQuality = LinkQuality::Unknown;
  core_.state.linkQualitySinceMs = core_.now();
}

void Health::measured() {
  judgeLink();
  watchFloor();
  watchCounters();
}

void Health::judgeLink() {
  SubscriptionState& state = core_.state;
  const LinkQuality now = state.serving ? judge(state.serving->best) : LinkQuality::Unknown;
  if (now != candidate_) {
    candidate_ = now;
    candidateMs_ = core_.now();
  }
  if (candidate_ == state.linkQuality || core_.now() - candidateMs_ < kSettledMs) return;
  event::LinkQualityChanged changed;
  changed.previous = state.linkQuality;
  changed.previousMs = core_.now() - state.linkQualitySinceMs;
  changed.reason = state.counters.rachFailures != rachFailuresSeen_     ? event::LinkReason::RachFailures
                   : core_.isConnected() && state.transmitPower >= 2200 ? event::LinkReason::HighPower
                                                                        : event::LinkReason::Signal;
  rachFailuresSeen_ = state.counters.rachFailures;
  state.linkQuality = candidate_;
  state.linkQualitySinceMs = core_.now();
  core_.emit(changed);
}

void Health::watchFloor() {
  const SubscriptionState& state = core_.state;
  const bool isLow = isPacketCell(state.technology) && state.serving && state.serving->best.power < -12000;
  if (!isLow) {
    floorSinceMs_ = core_.now();
    isFloorTold_ = false;
  } else if (!isFloorTold_ && core_.now() - floorSinceMs_ >= kFloorMs) {
    isFloorTold_ = true;
    core_.emit(event::HealthFinding{event::HealthKind::PowerFloor, 1});
  }
}

void Health::watchCounters() {
  if (core_.now() - windowMs_ >= kWindowMs) {
    windowMs_ = core_.now();
    for (Watch& watch : watches_) {
      watch.before = core_.state.counters.*watch.counter;
      watch.isTold = false;
    }
  }
  for (Watch& watch : watches_) {
    const std::uint64_t since = core_.state.counters.*watch.counter - watch.before;
    if (watch.isTold || since < watch.limit) continue;
    watch.isTold = true;
    core_.emit(event::HealthFinding{watch.kind, static_cast<std::uint32_t>(since)});
  }
}

void Health::cellChanged(const Cell* from, const Cell* to) {
  if (to == nullptr) {
    lostSinceMs_ = core_.now();
    return;
  }
  // Service came back after minutes in which the searches were ever fewer.
  if (from == nullptr && core_.now() - lostSinceMs_ > 60000 && lostSinceMs_ > 0)
    core_.emit(event::HealthFinding{event::HealthKind::NoSearch, 1});
  if (core_.state.tuner.technology != to->technology || core_.state.tuner.band != to->band) tune();
}

void Health::gripChanged() {
  const bool isAtHead = core_.state.call.phase != CallPhase::None;
  // Free space, hands, and beside the head.
  scenario_ = static_cast<std::uint8_t>(isAtHead ? 4 + core_.random.below(7) : core_.random.below(4));
  if (core_.cell() != nullptr && scenario_ != core_.state.tuner.scenario) tune();
  core_.after(Timer::Tuner, core_.delay(30000, 240000));
}

void Health::tune() {
  SubscriptionState& state = core_.state;
  event::TunerChanged changed;
  changed.previous = state.tuner;
  changed.previousMs = core_.now() - state.tunerSinceMs;
  const Cell& cell = *core_.cell();
  state.tuner.technology = cell.technology;
  state.tuner.band = cell.band;
  state.tuner.scenario = scenario_;
  state.tuner.antenna = static_cast<std::uint8_t>(core_.random.below(4));
  state.tuner.vswrMagnitude = static_cast<std::uint16_t>(20 + core_.random.below(scenario_ == 0 ? 30 : 90));
  state.tuner.vswrPhase = static_cast<std::uint16_t>(core_.random.below(360));
  state.tunerSinceMs = core_.now();
  core_.emit(changed);
}

}  // namespace quorl::simulator::network
