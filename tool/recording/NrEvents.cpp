#include "messages/classes/lte_signalling.h"
#include "messages/classes/lte_statistics.h"
#include "messages/classes/nr_cell.h"
#include "messages/classes/nr_connection.h"
#include "messages/classes/nr_dual_connectivity.h"
#include "recording/EventKinds.h"

// 5G metrics of the family Mav.

namespace quorl::tool {
namespace {

/// Band n78 and n1 both lie in frequency range 1.
constexpr std::uint32_t kFrequencyRange1 = 1;

ByteString sysInfoBlocks(RadioWorld& world) {
  CellularNrSysInfoBlocks message;
  setCommon(message, world);
  setNetwork(message, world);
  const NrCell& cell = world.nr();
  message.setCellId(cell.cellId);
  message.setFreq(cell.arfcn);
  message.setPhyCellId(cell.pci);
  message.setFreqBandInd(cell.band);
  message.setTrackingAreaCode(cell.tac);
  message.setValueTag(world.count(0, 31));
  auto mib = makeMessageRef<Mib>();
  mib->setSubCarrierSpacing(cell.band == 78 ? 30 : 15);
  mib->setSsbSubCarrierOffset(world.count(0, 11));
  mib->setMibContent(world.bytes(3));
  message.setMib(mib);
  auto sib = makeMessageRef<Sib>();
  sib->setBitMask(1);
  sib->setContent(world.bytes(12));
  message.addSib(sib);
  return payload(message);
}

ByteString nrOtaMsg(RadioWorld& world) {
  CellularNrOtaMsg message;
  setCommon(message, world);
  setNetwork(message, world);
  const NrCell& cell = world.nr();
  message.setPhyCellId(cell.pci);
  message.setFreq(cell.arfcn);
  message.setRbId(world.count(0, 3));
  message.setChannel(world.number(1, 8));
  message.setMsgType(world.count(0, 15));
  const std::uint32_t length = world.count(8, 48);
  message.setLength(length);
  message.setContent(world.bytes(length));
  message.setDlBw(cell.bandwidthMHz);
  message.setCellId(cell.cellId);
  message.setFreqBandInd(cell.band);
  message.setTrackingAreaCode(cell.tac);
  message.setDeployment(DEPLOYMENT_NSA);
  message.setFreqRange(kFrequencyRange1);
  message.setLteGci(world.lte().cellId);
  message.setLteBw(world.lte().resourceBlocks);
  message.setBwp(world.count(0, 1));
  message.setSsbCount(world.count(4, 8));
  message.setSubCarrierSpacing(cell.band == 78 ? 30 : 15);
  message.setTddUlDlConfigurationCommon(cell.band == 78 ? 1 : 0);
  message.setSplitBearerEver(world.chance(70));
  return payload(message);
}

ByteString nrServingCell(RadioWorld& world) {
  CellularNrScellInfo message;
  setCommon(message, world);
  setNetwork(message, world);
  const NrCell& cell = world.nr();
  message.setPhyCellId(cell.pci);
  message.setDlFreq(cell.arfcn);
  message.setUlFreq(cell.band == 78 ? cell.arfcn : 390000);
  message.setDlBw(cell.bandwidthMHz);
  message.setUlBw(cell.bandwidthMHz);
  message.setCellId(cell.cellId);
  message.setAllowedAccess(1);
  message.setTrackingAreaCode(cell.tac);
  return payload(message);
}

MessageRef<ServingCellBeamInfo> beam(RadioWorld& world, const NrCell& cell) {
  auto info = makeMessageRef<ServingCellBeamInfo>();
  const std::int32_t rsrp = world.nrRsrp();
  info->setCellPci(cell.pci);
  info->setSsbIndex(world.count(0, 7));
  info->addRxBeamId(world.count(0, 15));
  info->addRxBeamId(world.count(16, 31));
  info->setNumDetectedTxBeams(world.count(1, 6));
  info->setAntennaPanelIndex(world.count(0, 1));
  info->setCellRsrp(rsrp);
  info->setCellRsrq(world.rsrqAt(rsrp));
  info->setRasterArfcn(cell.arfcn);
  info->setRxBeamRsrp(rsrp + 2);
  return info;
}

ByteString nrRachAttempt(RadioWorld& world) {
  CellularNrRachAttempt message;
  setCommon(message, world);
  const NrCell& cell = world.nr();
  message.setNumAttempt(world.count(1, 4));
  message.setRachResult(world.chance(85) ? 0 : 1);
  message.setRachContention(world.count(0, 1));
  message.setSsbId(world.count(0, 7));
  message.setCsiRsId(0);
  message.setCarrierId(world.count(0, 1));
  message.setLastTxPower(world.number(-12, 23));
  message.setTac(cell.tac);
  message.setCellId(cell.cellId);
  message.setAccbState(0);
  message.setRachReason(world.count(0, 5));
  message.setTxPowerDiff(world.number(-4, 4));
  message.setDcMode(1);
  message.setFreqRange(kFrequencyRange1);
  message.setFreqBandInd(cell.band);
  message.addServingCellBeamInfo(beam(world, cell));
  return payload(message);
}

ByteString nrRrcState(RadioWorld& world) {
  CellularNrRrcState message;
  setCommon(message, world);
  message.setState(world.count(0, 2));
  message.setDeployment(world.oneOf({DEPLOYMENT_SA, DEPLOYMENT_NSA}));
  return payload(message);
}

MessageRef<DrbConfig> bearerConfig(RadioWorld& world) {
  auto config = makeMessageRef<DrbConfig>();
  config->setIntegrityAlgo(ALGO::ALGO_AES);
  config->setCipheringAlgo(world.oneOf({ALGO::ALGO_AES, ALGO::ALGO_SNOW3G}));
  auto bearer = makeMessageRef<PerDrbConfig>();
  bearer->setDrbId(world.count(1, 4));
  bearer->setUlRlcPath(world.oneOf({RB_PATH_NR, RB_PATH_LTE_AND_NR}));
  bearer->setUlDataSplitThreshold(world.oneOf({0U, 100U, 200U, 400U}));
  bearer->setUlPdcpDuplication(false);
  bearer->setUlRohcEnabled(false);
  bearer->setUlIntegrityEnabled(false);
  bearer->setUlCipheringEnabled(true);
  bearer->setUlMoreThanOneRlcPresent(world.chance(50));
  bearer->setDlRlcPath(RB_PATH_LTE_AND_NR);
  bearer->setDlRohcEnabled(false);
  bearer->setDlIntegrityEnabled(false);
  bearer->setDlCipheringEnabled(true);
  config->addPerDrbConfig(bearer);
  return config;
}

ByteString scgAddition(RadioWorld& world) {
  CellularNrScgAddition message;
  setCommon(message, world);
  message.setReason(world.count(0, 3));
  message.setResult(world.chance(90) ? 0 : 1);
  message.setIsSrb3Configured(world.chance(40));
  message.addDrbConfig(bearerConfig(world));
  message.setFreqRange(kFrequencyRange1);
  message.setFreqBandInd(world.nr().band);
  return payload(message);
}

ByteString scgRemoval(RadioWorld& world) {
  CellularNrScgRemoval message;
  setCommon(message, world);
  message.setReason(world.count(0, 4));
  message.setResult(0);
  message.setDuration(world.count(2000, 40000));
  message.setNumBeamFailure(world.count(0, 2));
  message.setNumBeamRecovery(world.count(0, 2));
  message.setRxBeamSwitch(world.count(0, 12));
  message.setTxBeamSwitch(world.count(0, 6));
  message.setBandInd(world.nr().band);
  message.setIsDueToSdm(world.chance(30));
  message.setSdmTriggerCause(
      world.oneOf({SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_NONE, SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_AP_SLEEP,
                   SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_SCREEN_STATUS}));
  return payload(message);
}

ByteString beamSwitch(RadioWorld& world) {
  CellularNrBeamSwitch message;
  setCommon(message, world);
  message.setDurationBeforeSwitch(world.count(200, 20000));
  message.addOldBeamInfo(beam(world, world.nr()));
  message.addThenewBeamInfo(beam(world, world.nr()));
  message.setMotionState(world.oneOf({MOTION_ST_STATIONARY, MOTION_ST_PEDESTRIAN, MOTION_ST_DRIVING}));
  message.setDopplerEstimate(world.count(0, 180));
  message.setBandInd(world.nr().band);
  return payload(message);
}

ByteString rrcResume(RadioWorld& world) {
  CellularNrRrcResume message;
  setCommon(message, world);
  message.setResumeSuccessDuration(world.count(15, 90));
  message.setResumeRequestReason(world.count(0, 4));
  message.setResumeSuccess(world.chance(92));
  return payload(message);
}

ByteString radioLinkFailure(RadioWorld& world) {
  using Failure = CellularNrRadioLinkFailure;
  Failure message;
  setCommon(message, world);
  message.setReason(world.oneOf({Failure::NR5G_RLF_CAUSE_T310_EXPIRY, Failure::NR5G_RLF_CAUSE_RACH_PROBLEM,
                                 Failure::NR5G_RLF_CAUSE_RLC_MAX_RETX}));
  message.setExpiryTimerDuration(world.oneOf({Failure::NR5G_RRC_TIMER_MS1000, Failure::NR5G_RRC_TIMER_MS2000}));
  message.setRlmInSyncOutOfSyncThreshold(world.chance(50));
  message.setMobilityState(world.oneOf({MOTION_ST_MOVING, MOTION_ST_DRIVING}));
  message.setLastRsrp(world.number(-124, -108));
  message.setDeployment(DEPLOYMENT_NSA);
  return payload(message);
}

MessageRef<RbInfo> bearerCounts(RadioWorld& world, std::uint32_t id) {
  auto info = makeMessageRef<RbInfo>();
  info->setNumDiscardPdu(world.count(0, 12));
  info->setNumSuccessfulPdu(world.count(500, 90000));
  info->setRbPathType(world.oneOf({RB_PATH_NR, RB_PATH_LTE, RB_PATH_LTE_AND_NR}));
  info->setRbMode(world.count(0, 2));
  info->setRbId(id);
  return info;
}

ByteString uplinkPdcp(RadioWorld& world) {
  CellularNrUlPdcpStats message;
  setCommon(message, world);
  message.addDrb(bearerCounts(world, 1));
  message.addDrb(bearerCounts(world, 2));
  message.addSrb(bearerCounts(world, 3));
  return payload(message);
}

ByteString endcUsage(RadioWorld& world) {
  CellularNrEndcUsageStats message;
  setCommon(message, world);
  message.setMcgTput(world.count(2000, 60000));
  message.setScgTput(world.count(20000, 900000));
  message.setDrbConfig(bearerConfig(world));
  message.setMcgDuration(world.count(1000, 30000));
  message.setScgDuration(world.count(1000, 30000));
  message.setDeployment(DEPLOYMENT_NSA);
  message.setReleaseTech(world.count(0, 2));
  return payload(message);
}

MessageRef<BandCombo> nrCombo(RadioWorld& world) {
  auto combo = makeMessageRef<BandCombo>();
  combo->setNumBandComponents(1);
  auto component = makeMessageRef<BandComponentInCombo>();
  component->setBand(world.nr().band);
  component->setDlBwClass(1);
  component->setAggregatedDlBw(world.nr().bandwidthMHz);
  component->setUlBwClass(1);
  combo->addBandInfo(component);
  return combo;
}

ByteString nrConnectionStats(RadioWorld& world) {
  using Stats = CellularNrConnectionStats;
  Stats message;
  setCommon(message, world);
  message.setDuration(world.count(5000, 60000));
  message.setMaxUlMod(world.oneOf({MODULATION_16QAM, MODULATION_64QAM}));
  message.setMaxDlMod(world.oneOf({MODULATION_64QAM, MODULATION_256QAM}));
  message.setConnectionType(Stats::NR5G_MAC_QSH_METRIC_CONNECTION_NSA);
  message.setMaxNwMimoLyr(4);
  message.setMaxUeRank(world.count(1, 4));
  message.setMaxRxAnt(4);
  message.setMaxSchdMimoLyr(world.count(1, 4));
  message.setDurationOfConn(world.count(4000, 60000));
  message.setHasBwpSwitch(world.chance(20));
  message.setNr5gTotalNumCcs(1);
  message.setNr5gTotalDlMimoLayers(world.count(1, 4));
  message.setNr5gBandCombo(nrCombo(world));
  message.setConnDuration(world.count(4000, 60000));
  message.setCause(world.oneOf({Stats::CONN_INFO_FLUSH_REASON_RELEASE, Stats::CONN_INFO_FLUSH_REASON_HO}));
  return payload(message);
}

ByteString sdmActivation(RadioWorld& world) {
  CellularNrSDMActivation message;
  setCommon(message, world);
  message.setFr1MeasDisabled(world.chance(50));
  message.setFr2MeasDisabled(true);
  message.setPrevFr1MeasDisabled(world.chance(50));
  message.setPrevFr2MeasDisabled(true);
  message.setTriggerCause(
      world.oneOf({SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_AP_SLEEP, SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_CELLULAR_DATA}));
  message.setApNrRecomm(world.chance(70));
  message.setApNrRecommConfFactor(world.chance(70));
  message.setSib24Configured(world.chance(60));
  message.setDurationInPrevState(world.count(500, 90000));
  return payload(message);
}

ByteString sdmRelease(RadioWorld& world) {
  CellularNrSdmEndcRelease message;
  setCommon(message, world);
  message.setTriggerCause(
      world.oneOf({SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_AP_SLEEP, SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_UI_SWITCH}));
  return payload(message);
}

constexpr EventKind kNrEvents[] = {
    {806912, kSeldomMs, sysInfoBlocks},     {806913, kOftenMs, nrOtaMsg},        {806914, kOftenMs, nrServingCell},
    {806915, kNowAndThenMs, nrRachAttempt}, {806917, kOftenMs, nrRrcState},      {806919, kNowAndThenMs, scgAddition},
    {806920, kNowAndThenMs, scgRemoval},    {806922, kNowAndThenMs, beamSwitch}, {806928, kNowAndThenMs, rrcResume},
    {806931, kSeldomMs, radioLinkFailure},  {806932, kNowAndThenMs, uplinkPdcp}, {806933, kNowAndThenMs, endcUsage},
    {806934, kOftenMs, nrConnectionStats},  {806936, kSeldomMs, sdmActivation},  {806937, kSeldomMs, sdmRelease},
};

}  // namespace

std::span<const EventKind> nrKinds() {
  return kNrEvents;
}

}  // namespace quorl::tool
