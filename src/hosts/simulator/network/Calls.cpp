#include "hosts/simulator/network/Calls.h"

namespace quorl::simulator::network {
namespace {

using Kind = event::AirMessageKind;
using Step = event::CallStep;

// Causes of TS 24.008 10.5.4.11.
constexpr std::uint8_t kNormalClearing = 16;
constexpr std::uint8_t kNoAnswer = 19;
constexpr std::uint8_t kNetworkOutOfOrder = 38;
constexpr std::uint8_t kTemporaryFailure = 41;

constexpr SimulatedMs kRingingMs = 25000;

}  // namespace

void Calls::powerOn() {
  drawNext();
}

void Calls::drawNext() {
  core_.cancel(Timer::NextCall);
  if (core_.sim.callsPerHour > 0)
    core_.after(Timer::NextCall, 1000 + static_cast<SimulatedMs>(core_.random.waiting(3.6e6 / core_.sim.callsPerHour)));
}

void Calls::nextDue() {
  action::PlaceCall call;
  call.subscription = core_.state.subscription;
  call.isOutgoing = core_.random.chance(0.6);
  call.talkSeconds = core_.random.waiting(core_.sim.talkSeconds);
  call.isAnswered = core_.random.chance(0.85);
  drawNext();
  place(call);
}

void Calls::tell(Step step) {
  core_.emit(event::CallProgress{step});
}

void Calls::failPage(event::PageFailure cause, const Cell* attempted) {
  const Cell* on = pagedOn_ != nullptr ? pagedOn_ : core_.cell();
  core_.emit(event::PageResponseFailed{on != nullptr ? on->technology : Technology::None, on, attempted, cause});
}

void Calls::place(const action::PlaceCall& call) {
  SubscriptionState& state = core_.state;
  if (!state.isSimPresent || isActive()) return;
  const Cell* cell = core_.cell();
  if (!call.isOutgoing) {
    // Nobody pages a phone that the network has lost.
    if (cell == nullptr || state.service != ServiceStatus::Service) return;
    pagedOn_ = cell;
    ++state.counters.pages;
    core_.say(Kind::Paging, false, 0, 8);
    core_.emit(event::Paged{});
    // One radio serves both SIMs: a call on one keeps the other from answering.
    if (core_.phone.isInCall[0] || core_.phone.isInCall[1]) {
      failPage(event::PageFailure::Ignored, nullptr);
      return;
    }
  } else if (core_.phone.isInCall[0] || core_.phone.isInCall[1]) {
    return;
  }
  wanted_ = call;
  stage_ = Stage::Access;
  needsFallback_ = returnsAfterwards_ = false;
  measurements_ = 0;
  state.call = Call{};
  state.call.id = ++core_.phone.lastCallId;
  state.call.isOutgoing = call.isOutgoing;
  state.call.phase = CallPhase::Setup;
  state.call.startedMs = core_.now();
  state.call.setupTechnology = state.call.technology = state.technology;
  state.call.cell = cell;
  ++state.counters.calls;
  core_.phone.isInCall[state.subscription] = true;
  choosePath();
  tell(call.isOutgoing ? Step::Dialled : Step::Paged);
  if (cell == nullptr || state.service != ServiceStatus::Service) {
    finish(CallEnd::SetupFailed, kNetworkOutOfOrder);
    return;
  }
  connection_.hold();
  isHolding_ = true;
  const bool isThere = core_.isConnected() && state.rrc != RrcState::CellFach;
  if (!connection_.request(call.isOutgoing ? RrcCause::MoVoice : RrcCause::MtAccess)) {
    finish(CallEnd::SetupFailed, kNetworkOutOfOrder);
  } else if (isThere) {
    connected();
  }
}

void Calls::choosePath() {
  Call& call = core_.state.call;
  switch (core_.state.technology) {
    case Technology::Lte:
      needsFallback_ = !core_.state.registration.isImsRegistered;
      call.kind = needsFallback_ ? CallKind::FallenBack : CallKind::VoLte;
      break;
    case Technology::Nr:  // voice over NR needs a good cell, else the call goes to LTE
      needsFallback_ = !core_.sim.hasVoiceOverLte || core_.state.serving->best.power < -9500;
      call.kind = !core_.sim.hasVoiceOverLte ? CallKind::FallenBack : needsFallback_ ? CallKind::VoLte : CallKind::VoNr;
      break;
    case Technology::None:
    case Technology::Gsm:
    case Technology::Umts:
      call.kind = CallKind::CircuitSwitched;
      break;
  }
  call.isFallback = needsFallback_;
}

void Calls::connected() {
  if (stage_ != Stage::Access && stage_ != Stage::Moved) return;
  if (stage_ == Stage::Access && needsFallback_) {
    stage_ = Stage::FallingBack;
    core_.state.call.fallbackMs = core_.now();
    tell(Step::FallbackOrdered);
    core_.after(Timer::Fallback, core_.delay(80, 200));
    return;
  }
  stage_ = Stage::SettingUp;
  core_.after(Timer::Call, core_.delay(250, 700));
}

void Calls::fallBackDue() {
  if (stage_ != Stage::FallingBack) return;
  const Cell* target = nullptr;
  if (core_.state.technology == Technology::Nr) {
    target = camping_.strongest(Technology::Lte);
  } else {
    target = camping_.strongest(Technology::Umts);
    if (target == nullptr) target = camping_.strongest(Technology::Gsm);
  }
  if (target == nullptr) {
    if (!wanted_.isOutgoing) failPage(event::PageFailure::FallbackFailed, nullptr);
    finish(CallEnd::FallbackFailed, kTemporaryFailure);
    return;
  }
  returnsAfterwards_ = true;
  connection_.redirect(*target);
}

void Calls::cellChanged(const Cell* from, const Cell* to) {
  if (!isActive()) return;
  Call& call = core_.state.call;
  if (to == nullptr) {
    finish(stage_ == Stage::Talking ? CallEnd::Dropped : CallEnd::SetupFailed, kTemporaryFailure);
    return;
  }
  call.cell = to;
  if (stage_ == Stage::FallingBack && !core_.isConnected()) {
    // From NR to LTE, and without voice there on to UMTS or GSM.
    needsFallback_ = to->technology == Technology::Lte && !core_.sim.hasVoiceOverLte;
    stage_ = needsFallback_ ? Stage::Access : Stage::Moved;
    call.technology = to->technology;
    if (!connection_.request(wanted_.isOutgoing ? RrcCause::MoVoice : RrcCause::MtAccess))
      finish(CallEnd::FallbackFailed, kTemporaryFailure);
    return;
  }
  if (from == nullptr || !core_.isConnected()) return;
  ++call.handovers;
  if (from->technology == to->technology) return;
  call.technology = to->technology;
  if (isPacketCell(from->technology) && !isPacketCell(to->technology)) {
    call.kind = CallKind::CircuitSwitched;
    call.wasHandedToCircuit = true;
    returnsAfterwards_ = true;
  } else if (call.kind == CallKind::VoNr && to->technology == Technology::Lte) {
    call.kind = CallKind::VoLte;
  }
  tell(Step::HandedOver);
}

void Calls::stepDue() {
  Call& call = core_.state.call;
  switch (stage_) {
    case Stage::None:
    case Stage::Access:
    case Stage::FallingBack:
    case Stage::Moved:
      return;
    case Stage::SettingUp:
      call.setupMs = core_.now();
      tell(Step::SetUp);
      stage_ = Stage::Ringing;
      core_.after(Timer::Call, core_.delay(600, 2200));
      return;
    case Stage::Ringing:
      call.alertedMs = core_.now();
      call.phase = CallPhase::Alerting;
      tell(Step::Alerting);
      stage_ = wanted_.isAnswered ? Stage::Answering : Stage::Unanswered;
      core_.after(Timer::Call, wanted_.isAnswered ? core_.delay(2000, 9000) : kRingingMs);
      return;
    case Stage::Unanswered:
      finish(core_.random.chance(0.5) ? CallEnd::NoAnswer : CallEnd::Cancelled, kNoAnswer);
      return;
    case Stage::Answering:
      call.connectedMs = core_.now();
      call.phase = CallPhase::Conversation;
      ++core_.state.counters.callsConnected;
      tell(Step::Connected);
      stage_ = Stage::Talking;
      core_.after(Timer::Call, 1 + static_cast<SimulatedMs>(wanted_.talkSeconds * 1000.0));
      return;
    case Stage::Talking:
      finish(core_.random.chance(0.5) ? CallEnd::LocalHangUp : CallEnd::RemoteHangUp, kNormalClearing);
      return;
  }
}

void Calls::measured() {
  if (stage_ != Stage::Talking || !core_.state.serving) return;
  // 50 packets of speech a second; half of the time the other side is silent.
  Call& call = core_.state.call;
  const bool isSpeech = ++measurements_ % 10 < 5;
  const Centi sinr = core_.state.serving->best.sinr;
  const double losing = sinr > 300 ? 0.001 : sinr > -300 ? 0.02 : 0.15;
  for (int packet = 0; packet < (isSpeech ? 10 : 1); ++packet) {
    if (core_.random.chance(losing)) {
      ++call.packetsLost;
    } else {
      ++(isSpeech ? call.speechPacketsReceived : call.silencePacketsReceived);
    }
  }
}

void Calls::connectionFailed() {
  if (!isActive()) return;
  if (!wanted_.isOutgoing && stage_ == Stage::Access) failPage(event::PageFailure::ConnectionFailed, nullptr);
  if (!wanted_.isOutgoing && stage_ == Stage::Moved) failPage(event::PageFailure::FallbackFailed, core_.cell());
  finish(stage_ == Stage::Moved ? CallEnd::FallbackFailed : CallEnd::SetupFailed, kNetworkOutOfOrder);
}

void Calls::connectionEnded(RrcCause cause) {
  if (!isActive()) {
    if (returnsAfterwards_) goBack();
    return;
  }
  if (cause == RrcCause::ReleaseRedirection) return;
  if (!wanted_.isOutgoing && stage_ < Stage::Ringing) failPage(event::PageFailure::ConnectionLost, nullptr);
  finish(stage_ == Stage::Talking ? CallEnd::Dropped : CallEnd::SetupFailed, kTemporaryFailure);
}

void Calls::goBack() {
  // The network tells the phone to return to LTE at once, not by reselection.
  returnsAfterwards_ = false;
  if (core_.state.rrc != RrcState::Idle || isPacketCell(core_.state.technology)) return;
  core_.measure();
  const Cell* target = camping_.strongest(Technology::Lte);
  if (target != nullptr) camping_.camp(*target, event::ChangeReason::Redirection);
}

void Calls::finish(CallEnd end, std::uint8_t releaseCause) {
  SubscriptionState& state = core_.state;
  Call& call = state.call;
  stage_ = Stage::None;
  pagedOn_ = nullptr;
  core_.cancel(Timer::Call);
  core_.cancel(Timer::Fallback);
  call.phase = CallPhase::None;
  call.endedMs = core_.now();
  call.end = end;
  call.releaseCause = releaseCause;
  if (state.technology != Technology::None) call.technology = state.technology;
  if (state.serving) {
    call.cell = state.serving->best.cell;
    call.lastPower = state.serving->best.power;
    call.lastQuality = state.serving->best.quality;
    call.lastRssi = state.serving->best.rssi;
  }
  call.lastTransmitPower = state.transmitPower;
  if (end == CallEnd::Dropped) ++state.counters.callsDropped;
  core_.phone.isInCall[state.subscription] = false;
  tell(Step::Ended);
  if (!isHolding_) return;
  isHolding_ = false;
  connection_.letGo();
  // A circuit-switched channel goes with its call; a packet connection has its own time.
  if (core_.isConnected() && !isPacketCell(state.technology) && !connection_.isHeld())
    connection_.release(RrcCause::ReleaseNormal);
}

void Calls::drop() {
  core_.cancel(Timer::NextCall);
  returnsAfterwards_ = false;
  if (isActive()) finish(CallEnd::Dropped, kNetworkOutOfOrder);
}

}  // namespace quorl::simulator::network
