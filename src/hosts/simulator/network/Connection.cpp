#include "hosts/simulator/network/Connection.h"

#include <algorithm>

namespace quorl::simulator::network {
namespace {

using Kind = event::AirMessageKind;

constexpr SimulatedMs kInactivityMs = 10000;
constexpr SimulatedMs kSearchMs = 3000;  // T311
constexpr std::uint8_t kMostAttempts = 4;

/// How often random access fails, by what is received of the cell.
double chanceOfFailure(const CellMeasurement& measurement) {
  const Centi margin = measurement.cell->technology == Technology::Umts  ? measurement.quality + 1500
                       : measurement.cell->technology == Technology::Gsm ? measurement.power + 10200
                                                                         : measurement.sinr + 300;
  if (margin > 300) return 0.01;
  if (margin > 0) return 0.05;
  return margin > -400 ? 0.35 : 0.8;
}

}  // namespace

bool Connection::tryAccess(const Cell& cell, event::RachReason reason, bool isContentionBased) {
  using Result = event::RachResult;
  const CellMeasurement measurement = core_.receiver.measure(cell);
  const double draw = core_.random.uniform();
  const double failing = chanceOfFailure(measurement);
  event::RachAttempt attempt;
  attempt.cell = &cell;
  attempt.reason = reason;
  attempt.isContentionBased = isContentionBased;
  attempt.power = measurement.power;
  attempt.beam = measurement.beam;
  const Centi pathLoss = core_.network.sector(cell.index).elementPower - measurement.power;
  attempt.isPowerLimited = pathLoss > 12500;
  attempt.preambles = static_cast<std::uint8_t>(1 + core_.random.below(attempt.isPowerLimited ? 5 : 2));
  // Each preamble is 2 dB above the one before it: TS 36.321 5.1.3 with a target of -104 dBm.
  attempt.transmitPower = std::clamp<Centi>(pathLoss - 10400 + 200 * (attempt.preambles - 1), -4000, 2300);
  if (draw < failing * 0.7) {
    attempt.result = Result::NoResponse;
    attempt.preambles = 10;
  } else if (draw < failing) {
    attempt.result = isContentionBased ? Result::NoContentionAnswer : Result::NoResponse;
  } else if (isContentionBased && draw < failing + 0.004) {
    attempt.result = Result::ContentionLost;
  }
  const bool isSuccess = attempt.result == Result::Success;
  Counters& counters = core_.state.counters;
  ++counters.rachAttempts;
  if (!isSuccess) ++(cell.technology == Technology::Nr ? counters.nrRachFailures : counters.rachFailures);
  core_.state.transmitPower = attempt.transmitPower;
  if (cell.technology != Technology::Gsm) core_.emit(attempt);
  return isSuccess;
}

bool Connection::request(RrcCause cause) {
  const Cell* cell = core_.cell();
  if (cell == nullptr) return false;
  switch (core_.state.rrc) {
    case RrcState::Connected:
    case RrcState::CellDch:
      touch();
      return true;
    case RrcState::CellFach:
    case RrcState::CellPch:
    case RrcState::UraPch:  // a cell update takes the connection back to its channel
      camping_.enter(RrcState::CellDch, cause);
      touch();
      return true;
    case RrcState::Connecting:
    case RrcState::Closing:
      if (pending_ == RrcCause::None) pending_ = cause;
      return true;
    case RrcState::None:
      return false;
    case RrcState::Idle:
    case RrcState::Inactive:
      break;
  }
  Counters& counters = core_.state.counters;
  isResumption_ = core_.state.rrc == RrcState::Inactive;
  cause_ = cause;
  pending_ = RrcCause::None;
  askedMs_ = core_.now();
  ++counters.connectionRequests;
  if (cause == RrcCause::MtAccess) {
    ++counters.connectionsTerminated;
  } else if (cause == RrcCause::Registration || cause == RrcCause::MoSignalling) {
    ++counters.connectionsSignalling;
  } else {
    ++counters.connectionsOriginated;
  }
  camping_.enter(RrcState::Connecting, cause);
  startAccess(event::RachReason::InitialAccess);
  return true;
}

void Connection::startAccess(event::RachReason reason) {
  reason_ = reason;
  attempts_ = 0;
  core_.after(Timer::Access, core_.delay(15, 45));
}

void Connection::accessTried() {
  const Cell* cell = core_.cell();
  if (cell == nullptr || core_.state.rrc != RrcState::Connecting) return;
  ++attempts_;
  if (!tryAccess(*cell, reason_, /*isContentionBased=*/true)) {
    if (attempts_ < kMostAttempts) {
      core_.after(Timer::Access, core_.delay(60, 240));
    } else {
      accessFailed();
    }
    return;
  }
  const bool isAgain = reason_ == event::RachReason::Reestablishment;
  core_.say(isAgain         ? Kind::ReestablishmentRequest
            : isResumption_ ? Kind::ResumeRequest
                            : Kind::ConnectionRequest,
            true, 0, 6);
  core_.after(Timer::Setup, core_.delay(20, 60));
}

void Connection::accessFailed() {
  if (reason_ == event::RachReason::Reestablishment) {
    core_.after(Timer::Reestablish, 0);  // as long as T311 runs
    return;
  }
  if (isResumption_) core_.emit(event::NrResumed{false, static_cast<std::uint32_t>(core_.now() - askedMs_), cause_});
  idleAgain(RrcCause::SetupNoResponse);
  for (RadioUser* user : core_.users) user->connectionFailed();
}

void Connection::setUp() {
  if (core_.state.rrc != RrcState::Connecting || core_.cell() == nullptr) return;
  if (reason_ == event::RachReason::Reestablishment) {
    core_.say(Kind::Reestablishment, false, 0, 9);
    core_.say(Kind::ReestablishmentComplete, true, 1, 4);
    core_.cancel(Timer::Reestablish);
    camping_.enter(RrcState::Connected, cause_);
    touch();
    for (RadioUser* user : core_.users) user->connected();
    return;
  }
  // Cells under load turn some away.
  if (!isResumption_ && cause_ != RrcCause::Emergency && core_.random.chance(0.01 * core_.phone.load)) {
    core_.say(Kind::ConnectionReject, false, 0, 3);
    idleAgain(RrcCause::SetupRejected);
    for (RadioUser* user : core_.users) user->connectionFailed();
    return;
  }
  begin(cause_);
}

void Connection::begin(RrcCause cause) {
  SubscriptionState& state = core_.state;
  if (isResumption_) {
    core_.say(Kind::Resume, false, 1, 24);
    core_.say(Kind::ResumeComplete, true, 1, 8);
  } else {
    core_.say(Kind::ConnectionSetup, false, 0, 28);
    core_.say(Kind::ConnectionSetupComplete, true, 1, static_cast<std::uint16_t>(20 + core_.random.below(80)));
  }
  ++state.counters.connectionsCompleted;
  core_.hasConnection = true;
  state.use = ConnectionUse{};
  state.use.sinceMs = core_.now();
  camping_.enter(usesCellStates(state.technology) ? RrcState::CellDch : RrcState::Connected, cause);
  if (isResumption_) {
    core_.emit(event::NrResumed{true, static_cast<std::uint32_t>(core_.now() - askedMs_), cause});
    isResumption_ = false;
  } else {
    core_.say(Kind::SecurityModeCommand, false, 1, 3);
    core_.say(Kind::SecurityModeComplete, true, 1, 2);
    core_.say(Kind::Reconfiguration, false, 1, static_cast<std::uint16_t>(60 + core_.random.below(180)));
    core_.say(Kind::ReconfigurationComplete, true, 1, 2);
  }
  connectedDrx(true);
  touch();
  core_.after(Timer::Measure, core_.delay(40, 200));
  for (RadioUser* user : core_.users) user->connected();
}

void Connection::connectedDrx(bool isConnected) {
  DrxConfiguration drx;
  drx.pagingCycleMs = core_.state.technology == Technology::Umts ? 640 : 1280;
  if (isConnected && isPacketCell(core_.state.technology)) {
    drx.isConnectedDrx = true;
    drx.onDurationMs = 10;
    drx.inactivityMs = 100;
    drx.retransmissionMs = 8;
    drx.longCycleMs = 320;
    drx.shortCycleMs = 40;
    drx.shortCycles = 2;
  }
  const bool hasChanged =
      drx.isConnectedDrx != core_.state.drx.isConnectedDrx || drx.pagingCycleMs != core_.state.drx.pagingCycleMs;
  core_.state.drx = drx;
  if (hasChanged) core_.emit(event::DrxChanged{});
}

void Connection::letGo() {
  if (holders_ > 0) --holders_;
  if (holders_ == 0) touch();
}

void Connection::touch() {
  const bool isPacket = isPacketCell(core_.state.technology);
  if (core_.isConnected()) core_.after(Timer::Inactivity, isPacket ? kInactivityMs : kInactivityMs / 2);
}

void Connection::releaseAfter(SimulatedMs milliseconds) {
  if (core_.isConnected() && !isHeld()) core_.after(Timer::Inactivity, milliseconds);
}

void Connection::inactive() {
  if (isHeld()) {
    touch();
    return;
  }
  switch (core_.state.rrc) {
    case RrcState::CellDch:  // by way of the states that cost less and less
      camping_.enter(RrcState::CellFach, RrcCause::ReleaseInactivity);
      core_.after(Timer::Inactivity, kInactivityMs / 2);
      return;
    case RrcState::CellFach:
      camping_.enter(core_.random.chance(0.5) ? RrcState::CellPch : RrcState::UraPch, RrcCause::ReleaseInactivity);
      core_.after(Timer::Inactivity, 3 * kInactivityMs);
      return;
    case RrcState::Connected:
      if (core_.state.technology == Technology::Nr) {
        core_.say(Kind::ConnectionRelease, false, 1, 30);  // with suspension
        for (RadioUser* user : core_.users) user->connectionEnding(RrcCause::ReleaseInactivity);
        core_.tellConnectionEnded(event::ConnectionEnd::Release);
        camping_.enter(RrcState::Inactive, RrcCause::ReleaseInactivity);
        connectedDrx(false);
        core_.after(Timer::Inactivity, 6 * kInactivityMs);
        for (RadioUser* user : core_.users) user->connectionEnded(RrcCause::ReleaseInactivity);
        return;
      }
      release(RrcCause::ReleaseInactivity);
      return;
    case RrcState::CellPch:
    case RrcState::UraPch:
      release(RrcCause::ReleaseInactivity);
      return;
    case RrcState::Inactive:
      idleAgain(RrcCause::ReleaseNormal);
      return;
    case RrcState::None:
    case RrcState::Idle:
    case RrcState::Connecting:
    case RrcState::Closing:
      return;
  }
}

void Connection::release(RrcCause cause) {
  if (core_.state.rrc == RrcState::None || core_.state.rrc == RrcState::Idle) return;
  core_.cancel(Timer::Inactivity);
  core_.cancel(Timer::OutOfSync);
  for (RadioUser* user : core_.users) user->connectionEnding(cause);
  core_.say(Kind::ConnectionRelease, false, 1, target_ != nullptr ? 12 : 4);
  cause_ = cause;
  if (isPacketCell(core_.state.technology)) camping_.enter(RrcState::Closing, cause);
  core_.after(Timer::Release, core_.delay(20, 60));
}

void Connection::redirect(const Cell& target) {
  target_ = &target;
  release(RrcCause::ReleaseRedirection);
}

void Connection::released() {
  end(event::ConnectionEnd::Release, cause_);
}

void Connection::end(event::ConnectionEnd end, RrcCause cause) {
  core_.tellConnectionEnded(end);
  const Cell* target = target_;
  target_ = nullptr;
  idleAgain(cause);
  for (RadioUser* user : core_.users) user->connectionEnded(cause);
  if (target != nullptr) {
    camping_.camp(*target, event::ChangeReason::Redirection);
  } else if (pending_ != RrcCause::None && core_.state.rrc == RrcState::Idle) {
    request(pending_);
  }
}

void Connection::idleAgain(RrcCause cause) {
  for (const Timer timer : {Timer::Access, Timer::Setup, Timer::Release, Timer::Inactivity, Timer::OutOfSync,
                            Timer::Reestablish, Timer::HandoverCommand, Timer::HandoverExecution})
    core_.cancel(timer);
  camping_.enter(RrcState::Idle, cause);
  isResumption_ = false;
  connectedDrx(false);
}

void Connection::moveTo(const Cell& target) {
  const bool isOtherTechnology = target.technology != core_.state.technology;
  for (RadioUser* user : core_.users) user->connectionEnding(RrcCause::ReleaseHandoverOut);
  core_.tellConnectionEnded(event::ConnectionEnd::Handover);
  if (isOtherTechnology) {
    camping_.enter(RrcState::None, RrcCause::ReleaseHandoverOut);
    core_.state.technology = target.technology;
  }
  core_.hasConnection = true;
  core_.state.use = ConnectionUse{};
  core_.state.use.sinceMs = core_.now();
  if (isOtherTechnology)
    camping_.enter(usesCellStates(target.technology) ? RrcState::CellDch : RrcState::Connected, RrcCause::HandoverIn);
  camping_.take(target, event::ChangeReason::Handover);
  if (isOtherTechnology) connectedDrx(true);
  touch();
}

void Connection::reestablish(RrcCause cause) {
  for (RadioUser* user : core_.users) user->connectionEnding(RrcCause::ReleaseLinkFailure);
  core_.cancel(Timer::Inactivity);
  cause_ = cause;
  searchUntilMs_ = core_.now() + kSearchMs;
  if (!isPacketCell(core_.state.technology)) {
    end(event::ConnectionEnd::Failure, RrcCause::ReleaseLinkFailure);
    return;
  }
  camping_.enter(RrcState::Connecting, cause);
  core_.after(Timer::Reestablish, core_.delay(120, 300));
}

void Connection::reestablishTried() {
  if (core_.state.rrc != RrcState::Connecting) return;
  core_.measure();
  const Cell* cell = camping_.strongest(core_.state.technology, -600);
  if (cell != nullptr) {
    if (cell != core_.cell()) camping_.take(*cell, event::ChangeReason::Reestablishment);
    startAccess(event::RachReason::Reestablishment);
    return;
  }
  if (core_.now() < searchUntilMs_) {
    core_.after(Timer::Reestablish, 200);
    return;
  }
  end(event::ConnectionEnd::Failure, RrcCause::ReleaseLinkFailure);
  camping_.lose();
}

void Connection::drop() {
  holders_ = 0;
  pending_ = RrcCause::None;
  target_ = nullptr;
  if (core_.state.rrc == RrcState::None || core_.state.rrc == RrcState::Idle) return;
  for (RadioUser* user : core_.users) user->connectionEnding(RrcCause::NoService);
  end(event::ConnectionEnd::Failure, RrcCause::NoService);
}

}  // namespace quorl::simulator::network
