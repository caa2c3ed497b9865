#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/MessageRef.h"
#include "messages/classes/registration.h"
#include "messages/classes/service_status.h"
#include "messages/classes/sim.h"

// Service, registration and SIM of family Mav.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::Cell;
using network::SubscriptionState;

namespace {

Payload regAttempt(const Moment& moment) {
  constexpr std::uint32_t kHome = 0;
  constexpr std::uint32_t kVisited = 2;
  const auto* attempt = moment.get<event::RegistrationAttempted>();
  if (attempt == nullptr) return std::nullopt;
  const Cell& cell = *attempt->cell;
  CellularRegAttempt message;
  setCommon(message, moment);
  message.setHplmn(plmnBytes(moment.state.home));
  message.setAttemptedPlmn(plmnBytes(cell.plmn));
  message.setCellId(u32(cell.cellId));
  message.setAttemptedPlmnCategory(attempt->isHome ? kHome : kVisited);
  message.setRegServiceDomain(serviceDomain(moment.state.domain));
  message.setActiveRat(sysRat(cell.technology));
  message.setServiceStatus(serviceStatus(moment.state.service));
  message.setRejectCause(attempt->rejectCause);
  message.setDlFreq(cell.downlinkChannel);
  message.setFreqBandInd(cell.band);
  message.setLac(cell.areaCode);
  message.setIsRegAccepted(attempt->isAccepted);
  message.setIsHplmn(attempt->isHome);
  message.setIsEhplmn(false);
  constexpr std::uint8_t kPlmnNotAllowed = 11;  // TS 24.301 9.9.3.9
  message.setIsPlmnForbiden(attempt->rejectCause == kPlmnNotAllowed);
  message.setIsRoamingSteererPlmn(false);
  message.setIsHplmnScanTriggered(!attempt->isHome);
  message.setRoamingDuration(attempt->isHome ? 0 : u32((moment.state.nowMs - moment.state.serviceSinceMs) / 1000));
  message.setHplmnScanDuration(0);
  message.setHplmnSearchPeriod(30);
  auto border = makeMessageRef<BorderDbStat>();
  border->setTotalDbLifeSecs(u32(moment.state.nowMs / 1000));
  border->setFetchCnt(u32(moment.state.counters.registrations));
  border->addFetchStateDurationSecs(1 + detail(moment, cell.areaCode, 5, 60));
  message.setBdStat(border);
  return payload(message);
}

Payload registeredPlmn(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  if (!state.isSimPresent) return std::nullopt;
  CellularRegisteredPlmnStatus message;
  setCommon(message, moment);
  message.setRoamStatus(roamStatus(state.roaming));
  message.setHMCC(state.home.mcc);
  message.setHMNC(state.home.mnc);
  if (state.registration.state == network::RegistrationState::Registered) {
    message.setRMCC(state.registration.plmn.mcc);
    message.setRMNC(state.registration.plmn.mnc);
  }
  auto home = makeMessageRef<MCCMNCPair>();
  home->setMCC(state.home.mcc);
  home->setMNC(state.home.mnc);
  message.addEhplmnList(home);
  return payload(message);
}

Payload ratLacService(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  if (!state.serving) return std::nullopt;
  const Cell& cell = *state.serving->best.cell;
  CellularRatLacSrvInfo message;
  setCommon(message, moment);
  message.setVersion(4);
  message.setStandbyPref(state.subscriptions > 1 ? 1 : 0);
  message.setCellId(u32(cell.cellId));
  message.setLac(cell.areaCode);
  message.setSysMode(sysMode(state.technology));
  message.setSrvStatus(serviceStatus(state.service));
  message.setSrvDomain(serviceDomain(state.domain));
  message.setRoamStatus(roamStatus(state.roaming));
  message.setAsubsId(state.subscription);
  message.setElapsedMs(u32(state.nowMs - state.serviceSinceMs));
  message.setUpperLayerIndication(cell.isNrAnchor);
  message.setScgEverConfigured(state.use.hadSecondaryGroup);
  message.setUiNr5gSwitch(1);
  message.setDynNr5gEnabling(state.saving.isFr1Disabled ? 0 : 1);
  return payload(message);
}

Payload serviceState(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  CellularServiceStatus message;
  setCommon(message, moment);
  message.setSysMode(sysMode(state.technology));
  message.setSrvStatus(serviceStatus(state.service));
  message.setSrvDomain(serviceDomain(state.domain));
  message.setRoamStatus(roamStatus(state.roaming));
  const auto* changed = moment.get<event::ServiceChanged>();
  message.setDurationMs(changed != nullptr ? u32(changed->previousMs) : u32(state.nowMs - state.serviceSinceMs));
  return payload(message);
}

std::int32_t operatingMode(network::OperatingMode mode) {
  switch (mode) {
    case network::OperatingMode::PowerOff:
      return SYS_OPRT_MODE::SYS_OPRT_MODE_PWROFF;
    case network::OperatingMode::Online:
      return SYS_OPRT_MODE::SYS_OPRT_MODE_ONLINE;
    case network::OperatingMode::LowPower:
      return SYS_OPRT_MODE::SYS_OPRT_MODE_LPM;
  }
  return SYS_OPRT_MODE::SYS_OPRT_MODE_NONE;
}

Payload operatingModeState(const Moment& moment) {
  CellularSysOprtMode message;
  setCommon(message, moment);
  message.setMode(operatingMode(moment.state.mode));
  const auto* changed = moment.get<event::OperatingModeChanged>();
  message.setDurationMs(changed != nullptr ? u32(changed->previousMs)
                                           : u32(moment.state.nowMs - moment.state.modeSinceMs));
  return payload(message);
}

Payload simHplmn(const Moment& moment) {
  if (!moment.state.isSimPresent) return std::nullopt;
  CellularSimHplmn message;
  setCommon(message, moment);
  setNetwork(message, moment.state.home);
  return payload(message);
}

constexpr MetricKind kServiceMetrics[] = {
    {827652, on<event::RegistrationAttempted>(), regAttempt},
    {827650, on<event::PlmnChanged>(), registeredPlmn, /*isCurrent=*/true},
    {827747, on<event::ServiceChanged, event::ServingCellChanged, event::PlmnChanged>(), ratLacService,
     /*isCurrent=*/true},
    {827746, on<event::ServiceChanged, event::PlmnChanged>(), ratLacService, /*isCurrent=*/true},
    {827648, on<event::ServiceChanged>(), serviceState, /*isCurrent=*/true},
    {827649, on<event::OperatingModeChanged>(), operatingModeState, /*isCurrent=*/true},
    {827651, on<event::SimChanged>(), simHplmn, /*isCurrent=*/true},
};

}  // namespace

std::span<const MetricKind> serviceKinds() {
  return kServiceMetrics;
}

}  // namespace quorl::simulator::metrics
