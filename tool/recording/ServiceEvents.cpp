#include "messages/classes/registration.h"
#include "messages/classes/rf_health.h"
#include "messages/classes/service_status.h"
#include "messages/classes/sim.h"
#include "recording/EventKinds.h"

// Service, registration, SIM, RF and health metrics of the family Mav.

namespace quorl::tool {
namespace {

ByteString linkQuality(RadioWorld& world) {
  using Change = CellularLqmStateChange;
  Change message;
  setCommon(message, world);
  setNetwork(message, world);
  const std::int32_t rsrp = world.lteRsrp();
  message.setDurationSec(world.count(5, 240));
  message.setLqmType(world.oneOf({10, 50, 100}));
  message.setSysMode(SYS_MODE_LTE);
  message.setIsScreenOn(world.chance(60));
  auto access = makeMessageRef<RachConnInfo>();
  access->setFailRachAttempts(world.count(0, 3));
  access->setTotalRachAttempts(world.count(4, 30));
  access->setTotalMoRrcConn(world.count(1, 20));
  access->setTotalMtRrcConn(world.count(0, 8));
  access->setTotalSigRrcConn(world.count(0, 5));
  access->setAvgInterRrcConnDuration(world.count(2, 90));
  message.setRachConnInfo(access);
  auto channel = makeMessageRef<LteChannelInfo>();
  channel->setRsrp(rsrp);
  channel->setRsrq(world.rsrqAt(rsrp));
  channel->setSnr(world.sinrAt(rsrp));
  channel->setSinr(world.sinrAt(rsrp));
  message.addLteChanInfo(channel);
  message.setBbInHiPowerState(world.chance(20));
  message.setHiPowerEvent(world.oneOf({Change::LQM_EVENT_LTE_HI_POWER, Change::LQM_EVENT_LTE_POOR_SIGNAL_CONDITION}));
  message.setSwimWorkoutActive(false);
  message.setHiPowerExitReason(Change::LQM_HPM_EXIT_REASON_SIGNAL_IMPROVEMENT);
  message.setCongestionReason(Change::LQM_CONGESTION_REASON_TRICKLING_GRANT);
  message.setCellId(world.lte().cellId);
  message.setFgAppActiveDuringCongestion(world.chance(30));
  return payload(message);
}

ByteString regAttempt(RadioWorld& world) {
  CellularRegAttempt message;
  setCommon(message, world);
  const bool isAccepted = world.chance(85);
  message.setHplmn(world.plmn());
  message.setAttemptedPlmn(world.plmn());
  message.setCellId(world.lte().cellId);
  message.setAttemptedPlmnCategory(world.count(0, 3));
  message.setRegServiceDomain(SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_CS_PS);
  message.setActiveRat(SYS_RAT_LTE);
  message.setServiceStatus(isAccepted ? SYS_SRV_STATUS::SYS_SRV_STATUS_SRV : SYS_SRV_STATUS::SYS_SRV_STATUS_LIMITED);
  message.setRejectCause(isAccepted ? 0 : 15);
  message.setDlFreq(world.lte().dlEarfcn);
  message.setFreqBandInd(world.lte().band);
  message.setLac(world.lte().tac);
  message.setIsRegAccepted(isAccepted);
  message.setIsHplmn(true);
  message.setIsEhplmn(false);
  message.setIsPlmnForbiden(false);
  message.setIsRoamingSteererPlmn(false);
  message.setIsHplmnScanTriggered(false);
  message.setRoamingDuration(0);
  message.setHplmnScanDuration(0);
  message.setHplmnSearchPeriod(30);
  auto border = makeMessageRef<BorderDbStat>();
  border->setTotalDbLifeSecs(world.count(100, 9000));
  border->setFetchCnt(world.count(0, 4));
  border->addFetchStateDurationSecs(world.count(1, 60));
  message.setBdStat(border);
  return payload(message);
}

ByteString registeredPlmn(RadioWorld& world) {
  CellularRegisteredPlmnStatus message;
  setCommon(message, world);
  message.setRoamStatus(SYS_ROAM_STATUS::SYS_ROAM_STATUS_OFF);
  message.setHMCC(world.mcc());
  message.setHMNC(world.mnc());
  message.setRMCC(world.mcc());
  message.setRMNC(world.mnc());
  for (std::uint32_t network = 0; network < 2; ++network) {
    auto home = makeMessageRef<MCCMNCPair>();
    home->setMCC(world.mcc());
    home->setMNC(world.mnc() + network * 10);
    message.addEhplmnList(home);
  }
  return payload(message);
}

ByteString ratLacService(RadioWorld& world) {
  CellularRatLacSrvInfo message;
  setCommon(message, world);
  message.setVersion(4);
  message.setStandbyPref(0);
  message.setCellId(world.lte().cellId);
  message.setLac(world.lte().tac);
  message.setSysMode(SYS_MODE_LTE);
  message.setSrvStatus(SYS_SRV_STATUS::SYS_SRV_STATUS_SRV);
  message.setSrvDomain(SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_CS_PS);
  message.setRoamStatus(SYS_ROAM_STATUS::SYS_ROAM_STATUS_OFF);
  message.setAsubsId(world.subsId());
  message.setLac2nd(world.lte(2).tac);
  message.setSysMode2nd(SYS_MODE_LTE);
  message.setSrvStatus2nd(SYS_SRV_STATUS::SYS_SRV_STATUS_SRV);
  message.setSrvDomain2nd(SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_CS_PS);
  message.setCellId2nd(world.lte(2).cellId);
  message.setElapsedMs(world.count(1000, 90000));
  message.setUpperLayerIndication(world.chance(60));
  message.setScgEverConfigured(world.chance(60));
  message.setUiNr5gSwitch(1);
  message.setDynNr5gEnabling(1);
  return payload(message);
}

ByteString health(RadioWorld& world) {
  using Monitor = CellularHealthMonitor;
  Monitor message;
  setCommon(message, world);
  message.setRat(SYS_MODE_LTE);
  message.setDataStallType(world.oneOf({Monitor::AP_DL_DATA_STALL, Monitor::AP_UL_DATA_STALL}));
  message.setLastSearchRat(SYS_MODE_LTE);
  message.setHmType(world.oneOf({Monitor::HEALTH_MONITOR_TYPE_DATA_STALLED, Monitor::HEALTH_MONITOR_FREQUENT_LTE_RLF,
                                 Monitor::HEALTH_MONITOR_FREQUENT_NR_RACH_FAILURES}));
  message.setDcActive(world.chance(50));
  message.setLacTac(world.lte().tac);
  message.setCellId(world.lte().cellId);
  message.setRepeatedScgFailures(world.count(0, 3));
  message.setRepeatedBeamFailures(world.count(0, 3));
  message.setRepeatedLteRlfFailures(world.count(0, 4));
  message.setRepeatedLteRachFailures(world.count(0, 4));
  message.setRepeatedNrRlfFailures(world.count(0, 4));
  message.setRepeatedNrRachFailures(world.count(0, 4));
  message.setRepeatedNrCellInvalidationOccurences(world.count(0, 2));
  message.setRepeatedNrCellInvalidationPci(world.nr().pci);
  message.setRepeatedNrCellInvalidationArfcn(world.nr().arfcn);
  message.setRepeatedNrCellInvalidationBand(world.nr().band);
  message.addCountOfInvalidationReason(world.count(0, 2));
  message.setRxChain(world.count(0, 3));
  message.setFbrxRsrpRat(Monitor::RF_TECH_ID_LTE);
  message.setFreqRange(1);
  return payload(message);
}

ByteString dataStall(RadioWorld& world) {
  CellularLqmDataStall message;
  setCommon(message, world);
  message.setDataStallOccured(world.chance(50));
  message.setDnsFailureOccured(world.chance(40));
  message.setMediaPreWarningHint(false);
  message.setSysMode(SYS_MODE_LTE);
  message.setLqmState(world.count(0, 3));
  message.setServCellState(world.count(0, 2));
  message.setRrcState(world.count(1, 4));
  message.setIsDcActive(world.chance(50));
  return payload(message);
}

ByteString serviceStatus(RadioWorld& world) {
  CellularServiceStatus message;
  setCommon(message, world);
  message.setSysMode(world.oneOf({SYS_MODE_LTE, SYS_MODE_NR5G}));
  message.setSrvStatus(SYS_SRV_STATUS::SYS_SRV_STATUS_SRV);
  message.setSrvDomain(SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_CS_PS);
  message.setRoamStatus(SYS_ROAM_STATUS::SYS_ROAM_STATUS_OFF);
  message.setDurationMs(world.count(1000, 120000));
  return payload(message);
}

ByteString operatingMode(RadioWorld& world) {
  CellularSysOprtMode message;
  setCommon(message, world);
  message.setMode(world.oneOf({SYS_OPRT_MODE::SYS_OPRT_MODE_ONLINE, SYS_OPRT_MODE::SYS_OPRT_MODE_LPM}));
  message.setDurationMs(world.count(1000, 120000));
  return payload(message);
}

ByteString simHplmn(RadioWorld& world) {
  CellularSimHplmn message;
  setCommon(message, world);
  setNetwork(message, world);
  return payload(message);
}

MessageRef<TunerState> tunerState(RadioWorld& world) {
  auto state = makeMessageRef<TunerState>();
  // Without these two a state is all integers, which rows then name after it.
  if (world.chance(50)) {
    state->setRat(SYS_MODE_LTE);
    state->setScenarioDecision(world.oneOf({TunerState::FREE_SPACE_SCENARIO, TunerState::RHH_SCENARIO}));
  }
  state->setTxBand(world.lte().band);
  state->setPortBodypositionFs(world.count(0, 3));
  state->setDeembedVswrMag(world.count(10, 40));
  state->setDeembedVswrPhase(world.count(0, 359));
  state->setAccessory(world.count(0, 1));
  return state;
}

ByteString tunerEvent(RadioWorld& world) {
  CellularRfTunerEvent message;
  setCommon(message, world);
  message.setOldState(tunerState(world));
  message.setThenewState(tunerState(world));
  message.setElapsedMs(world.count(100, 20000));
  message.setTimeoutMs(1000);
  return payload(message);
}

constexpr EventKind kServiceEvents[] = {
    {827656, kNowAndThenMs, linkQuality},   {827652, kSeldomMs, regAttempt},        {827650, kSeldomMs, registeredPlmn},
    {827746, kNowAndThenMs, ratLacService}, {827747, kNowAndThenMs, ratLacService}, {816135, kSeldomMs, health},
    {827683, kSeldomMs, dataStall},         {827648, kNowAndThenMs, serviceStatus}, {827649, kSeldomMs, operatingMode},
    {827651, kSeldomMs, simHplmn},          {816389, kNowAndThenMs, tunerEvent},
};

}  // namespace

std::span<const EventKind> serviceKinds() {
  return kServiceEvents;
}

}  // namespace quorl::tool
