#include "hosts/simulator/network/Registration.h"

#include <algorithm>

namespace quorl::simulator::network {
namespace {

using Kind = event::AirMessageKind;
using Procedure = RegistrationProcedure;

constexpr std::uint32_t kT3412Seconds = 3240;
constexpr std::uint32_t kT3312Seconds = 3240;
constexpr std::uint8_t kPlmnNotAllowed = 11;
constexpr SimulatedMs kT3411Ms = 10000;

/// Tracking areas come in lists; a location or routing area stands alone.
bool hasAreaList(Technology technology) {
  return isPacketCell(technology);
}

}  // namespace

void Registration::powerOn() {
  updateService();
}

void Registration::forget() {
  RegistrationContext& context = core_.state.registration;
  const Plmn last = context.plmn;
  const bool wasRegistered = context.state == RegistrationState::Registered;
  context = RegistrationContext{};
  registeredOn_ = Technology::None;
  wanted_ = running_ = Procedure::None;
  for (const Timer timer : {Timer::Registration, Timer::RegistrationRetry, Timer::PeriodicUpdate}) core_.cancel(timer);
  if (wasRegistered) core_.state.previousPlmn = last;
  if (!core_.state.bearers.empty()) {
    core_.state.bearers.clear();
    core_.emit(event::DataConnectionChanged{false, event::DataConnectionStatus::Disconnected});
    core_.emit(event::BearersChanged{});
  }
  updateService();
}

bool Registration::isForbidden(const Cell& cell) const {
  return camping_.isLimited() || cell.plmn == Plmn{};
}

Procedure Registration::needed() const {
  const Cell* cell = core_.cell();
  if (cell == nullptr || !core_.state.isSimPresent) return Procedure::None;
  const RegistrationContext& context = core_.state.registration;
  const bool isCombined = !core_.sim.hasVoiceOverLte && cell->technology == Technology::Lte;
  if (context.state == RegistrationState::Denied && context.plmn == cell->plmn) return Procedure::None;
  if (context.state != RegistrationState::Registered || !(context.plmn == cell->plmn))
    return isCombined ? Procedure::CombinedAttach : Procedure::Attach;
  const auto& areas = context.areas;
  const bool isKnown = hasAreaList(cell->technology)
                           ? std::find(areas.begin(), areas.end(), cell->areaCode) != areas.end()
                           : context.areaCode == cell->areaCode;
  if (isKnown && registeredOn_ == cell->technology) return Procedure::None;
  return isCombined ? Procedure::CombinedAreaUpdate : Procedure::AreaUpdate;
}

void Registration::check() {
  if (running_ != Procedure::None) return;
  const Procedure procedure = needed();
  if (procedure == Procedure::None) {
    updateService();
    return;
  }
  wanted_ = procedure;
  if (core_.state.registration.state != RegistrationState::Registered)
    core_.state.registration.state = RegistrationState::InProgress;
  updateService();
  if (core_.isConnected()) {
    start(procedure);
  } else {
    connection_.request(RrcCause::Registration);
  }
}

void Registration::periodicUpdateDue() {
  if (core_.state.registration.state != RegistrationState::Registered || core_.cell() == nullptr) return;
  core_.after(Timer::PeriodicUpdate, core_.state.registration.periodicTimerSeconds * 1000ULL);
  if (running_ != Procedure::None) return;
  wanted_ = Procedure::PeriodicUpdate;
  if (core_.isConnected()) {
    start(wanted_);
  } else {
    connection_.request(RrcCause::MoSignalling);
  }
}

void Registration::cellChanged(const Cell*, const Cell* to) {
  if (to == nullptr) {
    running_ = Procedure::None;
    core_.cancel(Timer::Registration);
    updateService();
    return;
  }
  check();
}

void Registration::connected() {
  if (wanted_ != Procedure::None && running_ == Procedure::None) start(wanted_);
}

void Registration::connectionFailed() {
  if (wanted_ == Procedure::None) return;
  wanted_ = Procedure::None;
  core_.after(Timer::RegistrationRetry, kT3411Ms);
}

void Registration::connectionEnded(RrcCause) {
  if (running_ != Procedure::None) {  // cut off
    running_ = Procedure::None;
    core_.cancel(Timer::Registration);
  }
  if (needed() != Procedure::None && !core_.isRunning(Timer::RegistrationRetry))
    core_.after(Timer::RegistrationRetry, 1000);
}

void Registration::start(Procedure procedure) {
  wanted_ = Procedure::None;
  running_ = procedure;
  core_.state.registration.procedure = procedure;
  core_.say(Kind::UplinkTransfer, true, 1, static_cast<std::uint16_t>(24 + core_.random.below(70)));
  core_.after(Timer::Registration, core_.delay(180, 600));
}

void Registration::answered() {
  const Cell* cell = core_.cell();
  if (running_ == Procedure::None || cell == nullptr || !core_.isConnected()) {
    running_ = Procedure::None;
    return;
  }
  core_.say(Kind::DownlinkTransfer, false, 1, static_cast<std::uint16_t>(30 + core_.random.below(90)));
  if (isForbidden(*cell)) {
    rejected(*cell);
  } else {
    accepted(*cell);
  }
  running_ = Procedure::None;
  // Nothing but signalling: the network does not keep such a connection.
  if (!connection_.isHeld()) connection_.releaseAfter(core_.delay(800, 2000));
}

void Registration::accepted(const Cell& cell) {
  SubscriptionState& state = core_.state;
  RegistrationContext& context = state.registration;
  const bool isAttach = running_ == Procedure::Attach || running_ == Procedure::CombinedAttach;
  const bool wasRegistered = context.state == RegistrationState::Registered;
  const Plmn before = context.plmn;
  if (wasRegistered && !(before == cell.plmn)) state.previousPlmn = before;
  context.state = RegistrationState::Registered;
  context.procedure = running_;
  context.rejectCause = 0;
  context.plmn = cell.plmn;
  context.areaCode = cell.areaCode;
  context.areas.clear();
  if (hasAreaList(cell.technology)) context.areas.push_back(cell.areaCode);
  if (running_ != Procedure::PeriodicUpdate || context.temporaryId == 0) {
    context.temporaryId = static_cast<std::uint32_t>(core_.random.bits()) | 0xC0000000U;
    context.circuitTemporaryId = static_cast<std::uint32_t>(core_.random.bits());
  }
  context.groupId = static_cast<std::uint16_t>(0x8000U + cell.plmn.mnc);
  context.code = static_cast<std::uint8_t>(cell.areaCode % 4 + 1);
  context.periodicTimerSeconds = hasAreaList(cell.technology) ? kT3412Seconds : kT3312Seconds;
  context.isImsVoiceSupported = hasAreaList(cell.technology) && core_.sim.hasVoiceOverLte;
  context.isImsRegistered = context.isImsVoiceSupported;
  context.isEmergencySupported = hasAreaList(cell.technology);
  registeredOn_ = cell.technology;
  ++state.counters.registrations;
  core_.after(Timer::PeriodicUpdate, context.periodicTimerSeconds * 1000ULL);
  const bool isHome = core_.network.operatorOf(cell) == core_.sim.operatorIndex;
  core_.emit(event::RegistrationAttempted{running_, &cell, true, 0, isHome});
  if (!wasRegistered || !(before == cell.plmn)) core_.emit(event::PlmnChanged{before, cell.plmn});
  updateService();
  const std::size_t bearers = context.isImsVoiceSupported ? 2 : 1;
  if (!isAttach && state.bearers.size() == bearers) return;
  const auto host = static_cast<std::uint8_t>(2 + state.subscription * 100U + core_.random.below(90));
  state.bearers.assign(1, Bearer{5, "internet.example", {192, 0, 2, host}, false});
  if (bearers == 2) state.bearers.push_back(Bearer{6, "ims.example", {198, 51, 100, host}, true});
  core_.emit(event::DataConnectionChanged{false, event::DataConnectionStatus::Connected});
  if (bearers == 2) core_.emit(event::DataConnectionChanged{true, event::DataConnectionStatus::Connected});
  core_.emit(event::BearersChanged{});
}

void Registration::rejected(const Cell& cell) {
  RegistrationContext& context = core_.state.registration;
  const Procedure procedure = running_;
  context = RegistrationContext{};
  context.state = RegistrationState::Denied;
  context.procedure = procedure;
  context.rejectCause = kPlmnNotAllowed;
  context.plmn = cell.plmn;
  registeredOn_ = Technology::None;
  core_.cancel(Timer::PeriodicUpdate);
  core_.emit(event::RegistrationAttempted{procedure, &cell, false, kPlmnNotAllowed, false});
  updateService();
}

void Registration::updateService() {
  SubscriptionState& state = core_.state;
  ServiceStatus status = ServiceStatus::NoService;
  ServiceDomain domain = ServiceDomain::None;
  RoamStatus roaming = RoamStatus::Off;
  const Cell* cell = core_.cell();
  if (cell != nullptr) {
    const bool isServed =
        state.registration.state == RegistrationState::Registered && state.registration.plmn == cell->plmn;
    status = isServed ? ServiceStatus::Service : ServiceStatus::Limited;
    domain = ServiceDomain::Camped;
    if (isServed)
      domain =
          isPacketCell(cell->technology) && core_.sim.hasVoiceOverLte ? ServiceDomain::PsOnly : ServiceDomain::CsPs;
    if (isServed && core_.network.operatorOf(*cell) != core_.sim.operatorIndex) roaming = RoamStatus::On;
  }
  if (status == state.service && domain == state.domain && roaming == state.roaming &&
      toldTechnology_ == state.technology)
    return;
  const event::ServiceChanged changed{state.service, core_.now() - state.serviceSinceMs};
  state.service = status;
  state.domain = domain;
  state.roaming = roaming;
  state.serviceSinceMs = core_.now();
  toldTechnology_ = state.technology;
  core_.emit(changed);
}

}  // namespace quorl::simulator::network
