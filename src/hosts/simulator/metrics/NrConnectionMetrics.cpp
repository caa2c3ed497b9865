#include <algorithm>

#include "hosts/simulator/metrics/BandCombination.h"
#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/MessageRef.h"
#include "messages/classes/lte_statistics.h"
#include "messages/classes/nr_connection.h"
#include "messages/classes/nr_dual_connectivity.h"

// NR connections of family Mav: states, dual connectivity, failures, statistics, measurements saved.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::RrcState;
using network::ServingMeasurement;
using network::Technology;

namespace {

constexpr std::uint32_t kMostBearers = 4;

std::uint32_t nrStateNumber(RrcState state) {
  switch (state) {
    case RrcState::Connected:
      return 2;
    case RrcState::Inactive:
      return 1;
    default:  // all else is idle to NR
      return 0;
  }
}

Payload nrRrcState(const Moment& moment) {
  CellularNrRrcState message;
  setCommon(message, moment);
  if (const auto* changed = moment.get<event::RrcChanged>()) {
    if (changed->technology != Technology::Nr) return std::nullopt;
    message.setState(nrStateNumber(changed->state));
    message.setDeployment(changed->isNonStandAlone ? DEPLOYMENT_NSA : DEPLOYMENT_SA);
  } else {
    if (nrServing(moment.state) == nullptr) return std::nullopt;
    message.setState(moment.state.nr ? nrStateNumber(RrcState::Connected) : nrStateNumber(moment.state.rrc));
    message.setDeployment(moment.state.nr ? DEPLOYMENT_NSA : DEPLOYMENT_SA);
  }
  return payload(message);
}

Payload rrcResume(const Moment& moment) {
  const auto* resumed = moment.get<event::NrResumed>();
  if (resumed == nullptr) return std::nullopt;
  CellularNrRrcResume message;
  setCommon(message, moment);
  message.setResumeSuccessDuration(resumed->durationMs);
  message.setResumeRequestReason(u32(resumed->reason));
  message.setResumeSuccess(resumed->isSuccess);
  return payload(message);
}

/// Data bearers, split between LTE and NR while both are there.
MessageRef<DrbConfig> bearerConfig(const Moment& moment) {
  const bool isSplit = lteServing(moment.state) != nullptr;
  auto config = makeMessageRef<DrbConfig>();
  config->setIntegrityAlgo(ALGO::ALGO_AES);
  config->setCipheringAlgo(ALGO::ALGO_AES);
  for (const network::Bearer& each : moment.state.bearers) {
    auto bearer = makeMessageRef<PerDrbConfig>();
    bearer->setDrbId(each.id);
    bearer->setUlRlcPath(isSplit && each.isIms ? RB_PATH_LTE : RB_PATH_NR);
    bearer->setUlDataSplitThreshold(isSplit && !each.isIms ? 200 : 0);
    bearer->setUlPdcpDuplication(false);
    bearer->setUlRohcEnabled(each.isIms);
    bearer->setUlIntegrityEnabled(false);
    bearer->setUlCipheringEnabled(true);
    bearer->setUlMoreThanOneRlcPresent(isSplit && !each.isIms);
    bearer->setDlRlcPath(isSplit ? RB_PATH_LTE_AND_NR : RB_PATH_NR);
    bearer->setDlRohcEnabled(each.isIms);
    bearer->setDlIntegrityEnabled(false);
    bearer->setDlCipheringEnabled(true);
    config->addPerDrbConfig(bearer);
  }
  return config;
}

Payload scgAddition(const Moment& moment) {
  const auto* added = moment.get<event::SecondaryGroupAdded>();
  if (added == nullptr) return std::nullopt;
  CellularNrScgAddition message;
  setCommon(message, moment);
  message.setReason(added->isChange ? 1 : 0);
  message.setResult(added->isSuccess ? 0 : 1);
  message.setIsSrb3Configured(detail(moment, added->cell->siteIndex, 3, 2) == 1);
  message.addDrbConfig(bearerConfig(moment));
  message.setFreqRange(frequencyRange(*added->cell));
  message.setFreqBandInd(added->cell->band);
  return payload(message);
}

std::int32_t savingTrigger(network::SavingTrigger trigger) {
  switch (trigger) {
    case network::SavingTrigger::None:
      return SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_NONE;
    case network::SavingTrigger::Sleep:
      return SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_AP_SLEEP;
    case network::SavingTrigger::CellularData:
      return SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_CELLULAR_DATA;
    case network::SavingTrigger::VoiceCall:
      return SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_VOIP_CALL;
    case network::SavingTrigger::DataStall:
      return SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_Dravlin_STALL;
    case network::SavingTrigger::ScreenStatus:
      return SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_SCREEN_STATUS;
    case network::SavingTrigger::Setting:
      return SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_UI_SWITCH;
  }
  return SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_NONE;
}

Payload scgRemoval(const Moment& moment) {
  const auto* removed = moment.get<event::SecondaryGroupRemoved>();
  if (removed == nullptr) return std::nullopt;
  const bool isSaving = removed->reason == event::GroupRemoval::Saving;
  CellularNrScgRemoval message;
  setCommon(message, moment);
  message.setReason(u32(removed->reason));
  message.setResult(0);
  message.setDuration(removed->durationMs);
  message.setNumBeamFailure(removed->group.beamFailures);
  message.setNumBeamRecovery(removed->group.beamRecoveries);
  message.setRxBeamSwitch(removed->group.beamSwitches);
  message.setTxBeamSwitch(removed->group.beamSwitches / 2);
  message.setBandInd(removed->group.serving.best.cell->band);
  message.setIsDueToSdm(isSaving);
  message.setSdmTriggerCause(isSaving ? savingTrigger(moment.state.saving.trigger)
                                      : SDM_TRIGGER_CAUSE::SDM_TRIGGER_CAUSE_NONE);
  return payload(message);
}

std::int32_t failureReason(event::LinkFailureReason reason) {
  using Failure = CellularNrRadioLinkFailure;
  switch (reason) {
    case event::LinkFailureReason::T310Expiry:
      return Failure::NR5G_RLF_CAUSE_T310_EXPIRY;
    case event::LinkFailureReason::RandomAccess:
      return Failure::NR5G_RLF_CAUSE_RACH_PROBLEM;
    case event::LinkFailureReason::RetransmissionLimit:
      return Failure::NR5G_RLF_CAUSE_RLC_MAX_RETX;
    case event::LinkFailureReason::HandoverFailure:
      return Failure::NR5G_RLF_CAUSE_HANDOVER_FAILURE;
  }
  return Failure::NR5G_RLF_CAUSE_OTHER_FAILURE;
}

std::int32_t timerNumber(std::uint16_t timerMs) {
  using Failure = CellularNrRadioLinkFailure;
  constexpr struct {
    std::uint16_t ms;
    std::int32_t number;
  } kTimers[] = {
      {0, Failure::NR5G_RRC_TIMER_MS0},       {50, Failure::NR5G_RRC_TIMER_MS50},
      {100, Failure::NR5G_RRC_TIMER_MS100},   {200, Failure::NR5G_RRC_TIMER_MS200},
      {500, Failure::NR5G_RRC_TIMER_MS500},   {1000, Failure::NR5G_RRC_TIMER_MS1000},
      {2000, Failure::NR5G_RRC_TIMER_MS2000}, {4000, Failure::NR5G_RRC_TIMER_MS4000},
      {6000, Failure::NR5G_RRC_TIMER_MS6000},
  };
  const auto* found =
      std::find_if(std::begin(kTimers), std::end(kTimers), [&](const auto& each) { return each.ms == timerMs; });
  return found != std::end(kTimers) ? found->number : Failure::NR5G_RRC_TIMER_INVALID;
}

Payload radioLinkFailure(const Moment& moment) {
  const auto* failed = moment.get<event::RadioLinkFailed>();
  if (failed == nullptr || failed->cell->technology != Technology::Nr) return std::nullopt;
  CellularNrRadioLinkFailure message;
  setCommon(message, moment);
  message.setReason(failureReason(failed->reason));
  message.setExpiryTimerDuration(timerNumber(failed->timerMs));
  message.setRlmInSyncOutOfSyncThreshold(false);
  message.setMobilityState(motion(moment.state.surroundings.motion));
  message.setLastRsrp(whole(failed->lastPower));
  message.setDeployment(failed->isNonStandAlone ? DEPLOYMENT_NSA : DEPLOYMENT_SA);
  return payload(message);
}

MessageRef<RbInfo> bearerCounts(std::uint32_t id, std::uint64_t packets, std::uint64_t discards, std::int32_t path) {
  auto info = makeMessageRef<RbInfo>();
  info->setNumDiscardPdu(u32(discards));
  info->setNumSuccessfulPdu(u32(packets));
  info->setRbPathType(path);
  info->setRbMode(1);
  info->setRbId(id);
  return info;
}

/// Data goes over the first bearer, the others idle.
Payload uplinkPdcp(const Moment& moment) {
  if (nrServing(moment.state) == nullptr) return std::nullopt;
  const network::Counters& now = moment.state.counters;
  const network::Counters& before = moment.baseline->counters;
  const std::int32_t path = moment.state.nr ? RB_PATH_LTE_AND_NR : RB_PATH_NR;
  CellularNrUlPdcpStats message;
  setCommon(message, moment);
  std::uint32_t id = 1;
  for (const network::Bearer& bearer : moment.state.bearers) {
    const bool carriesData = !bearer.isIms;
    message.addDrb(bearerCounts(id, carriesData ? now.nrPdcpUplinkPackets - before.nrPdcpUplinkPackets : 0,
                                carriesData ? now.nrPdcpUplinkDiscards - before.nrPdcpUplinkDiscards : 0, path));
    if (++id > kMostBearers) break;
  }
  message.addSrb(bearerCounts(1, now.connectionsSignalling - before.connectionsSignalling, 0, RB_PATH_LTE));
  return payload(message);
}

Payload endcUsage(const Moment& moment) {
  constexpr std::uint64_t kBitsPerByte = 8;
  const auto* removed = moment.get<event::SecondaryGroupRemoved>();
  if (removed == nullptr) return std::nullopt;
  const std::uint64_t durationMs = std::max<std::uint64_t>(removed->durationMs, 1);
  CellularNrEndcUsageStats message;
  setCommon(message, moment);
  message.setMcgTput(u32(removed->group.masterBytes * kBitsPerByte / durationMs));
  message.setScgTput(u32(removed->group.secondaryBytes * kBitsPerByte / durationMs));
  message.setDrbConfig(bearerConfig(moment));
  message.setMcgDuration(removed->durationMs);
  message.setScgDuration(removed->durationMs);
  message.setDeployment(DEPLOYMENT_NSA);
  message.setReleaseTech(removed->reason == event::GroupRemoval::LinkFailure ? 1 : 0);
  return payload(message);
}

std::int32_t nrEndCause(event::ConnectionEnd end) {
  using Stats = CellularNrConnectionStats;
  switch (end) {
    case event::ConnectionEnd::Release:
      return Stats::CONN_INFO_FLUSH_REASON_RELEASE;
    case event::ConnectionEnd::Handover:
      return Stats::CONN_INFO_FLUSH_REASON_HO;
    case event::ConnectionEnd::Failure:
      return Stats::CONN_INFO_FLUSH_REASON_OTHER1;
  }
  return Stats::CONN_INFO_FLUSH_REASON_OTHER1;
}

Payload nrConnectionStats(const Moment& moment) {
  using Stats = CellularNrConnectionStats;
  const auto* ended = moment.get<event::ConnectionEnded>();
  if (ended == nullptr || ended->technology != Technology::Nr) return std::nullopt;
  const network::ConnectionUse& use = ended->use;
  const network::Cell& cell = *ended->cell;
  Stats message;
  setCommon(message, moment);
  message.setDuration(u32(ended->durationMs));
  message.setMaxUlMod(modulation(use.maxUplink));
  message.setMaxDlMod(modulation(use.maxDownlink));
  message.setConnectionType(ended->isNonStandAlone ? Stats::NR5G_MAC_QSH_METRIC_CONNECTION_NSA
                                                   : Stats::NR5G_MAC_QSH_METRIC_CONNECTION_SA);
  message.setMaxNwMimoLyr(cell.txPorts);
  message.setMaxUeRank(use.maxRank);
  message.setMaxRxAnt(4);
  message.setMaxSchdMimoLyr(use.maxLayersScheduled);
  message.setDurationOfConn(u32(ended->durationMs));
  message.setHasBwpSwitch(detail(moment, cell.index, 4, 4) == 0);
  message.setNr5gTotalNumCcs(use.maxCarriers);
  message.setNr5gTotalDlMimoLayers(use.maxTotalLayers);
  message.setNr5gBandCombo(combination({&cell}));
  message.setConnDuration(u32(ended->durationMs));
  message.setCause(nrEndCause(ended->end));
  return payload(message);
}

Payload savingActivation(const Moment& moment) {
  const auto* changed = moment.get<event::SavingChanged>();
  if (changed == nullptr) return std::nullopt;
  const network::NrSaving& saving = moment.state.saving;
  CellularNrSDMActivation message;
  setCommon(message, moment);
  message.setFr1MeasDisabled(saving.isFr1Disabled);
  message.setFr2MeasDisabled(saving.isFr2Disabled);
  message.setPrevFr1MeasDisabled(changed->previous.isFr1Disabled);
  message.setPrevFr2MeasDisabled(changed->previous.isFr2Disabled);
  message.setTriggerCause(savingTrigger(saving.trigger));
  message.setApNrRecomm(!saving.isFr1Disabled);
  message.setApNrRecommConfFactor(!saving.isFr1Disabled);
  const ServingMeasurement* lte = lteServing(moment.state);
  message.setSib24Configured(lte != nullptr && lte->best.cell->isNrAnchor);
  message.setDurationInPrevState(u32(moment.state.nowMs - changed->previous.sinceMs));
  return payload(message);
}

Payload savingRelease(const Moment& moment) {
  const auto* changed = moment.get<event::SavingChanged>();
  if (changed == nullptr || !changed->hasReleasedGroup) return std::nullopt;
  CellularNrSdmEndcRelease message;
  setCommon(message, moment);
  message.setTriggerCause(savingTrigger(moment.state.saving.trigger));
  return payload(message);
}

constexpr MetricKind kNrConnectionMetrics[] = {
    {806917, on<event::RrcChanged>(), nrRrcState, /*isCurrent=*/true},
    {806919, on<event::SecondaryGroupAdded>(), scgAddition},
    {806920, on<event::SecondaryGroupRemoved>(), scgRemoval},
    {806928, on<event::NrResumed>(), rrcResume},
    {806931, on<event::RadioLinkFailed>(), radioLinkFailure},
    {806932,
     on<event::Measured>(),
     uplinkPdcp,
     /*isCurrent=*/true,
     {60000, 200},
     /*counts=*/true},
    {806933, on<event::SecondaryGroupRemoved>(), endcUsage},
    {806934, on<event::ConnectionEnded>(), nrConnectionStats},
    {806936, on<event::SavingChanged>(), savingActivation},
    {806937, on<event::SavingChanged>(), savingRelease},
};

}  // namespace

std::span<const MetricKind> nrConnectionKinds() {
  return kNrConnectionMetrics;
}

}  // namespace quorl::simulator::metrics
