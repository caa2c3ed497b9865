#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/MessageRef.h"
#include "messages/classes/rf_health.h"

// Link quality, stalls, the health monitor and the antenna tuner of family Mav.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::RrcState;
using network::ServingMeasurement;
using network::SubscriptionState;
using network::Technology;

namespace {

/// As percentages, as applications are told.
std::int32_t linkQualityNumber(network::LinkQuality quality) {
  switch (quality) {
    case network::LinkQuality::Unknown:
      return -1;
    case network::LinkQuality::Bad:
      return 10;
    case network::LinkQuality::Poor:
      return 50;
    case network::LinkQuality::Good:
      return 100;
  }
  return -1;
}

std::int32_t powerEvent(event::LinkReason reason, bool isUmts) {
  using Change = CellularLqmStateChange;
  switch (reason) {
    case event::LinkReason::Signal:
      return isUmts ? Change::LQM_EVENT_WCDMA_POOR_SIGNAL_CONDITION : Change::LQM_EVENT_LTE_POOR_SIGNAL_CONDITION;
    case event::LinkReason::RachFailures:
      return isUmts ? Change::LQM_EVENT_WCDMA_RACH_FAILURE : Change::LQM_EVENT_RACH_FAILURE;
    case event::LinkReason::RetransmissionLimit:
      return Change::LQM_EVENT_RLC_MAX_RETX;
    case event::LinkReason::HighPower:
      return isUmts ? Change::LQM_EVENT_WCDMA_HI_POWER : Change::LQM_EVENT_LTE_HI_POWER;
    case event::LinkReason::Rejected:
      return Change::LQM_EVENT_MAX;
  }
  return Change::LQM_EVENT_MAX;
}

std::int32_t congestionReason(event::LinkReason reason) {
  using Change = CellularLqmStateChange;
  switch (reason) {
    case event::LinkReason::Signal:
    case event::LinkReason::HighPower:
      return Change::LQM_CONGESTION_REASON_POOR_SIGNAL_CONDITIONS;
    case event::LinkReason::RachFailures:
      return Change::LQM_CONGESTION_REASON_RACH_FAILURES;
    case event::LinkReason::RetransmissionLimit:
      return Change::LQM_CONGESTION_REASON_RLC_MAX_RETX;
    case event::LinkReason::Rejected:
      return Change::LQM_CONGESTION_REASON_RRC_REJECT;
  }
  return Change::LQM_CONGESTION_REASON_MAX;
}

MessageRef<RachConnInfo> accessCounts(const SubscriptionState& state) {
  const network::Counters& counters = state.counters;
  auto access = makeMessageRef<RachConnInfo>();
  access->setFailRachAttempts(u32(counters.rachFailures));
  access->setTotalRachAttempts(u32(counters.rachAttempts));
  access->setTotalMoRrcConn(u32(counters.connectionsOriginated));
  access->setTotalMtRrcConn(u32(counters.connectionsTerminated));
  access->setTotalSigRrcConn(u32(counters.connectionsSignalling));
  if (counters.connectionRequests > 0)
    access->setAvgInterRrcConnDuration(u32(state.nowMs / 1000 / counters.connectionRequests));
  return access;
}

Payload linkQuality(const Moment& moment) {
  using Change = CellularLqmStateChange;
  const auto* changed = moment.get<event::LinkQualityChanged>();
  if (changed == nullptr) return std::nullopt;
  const SubscriptionState& state = moment.state;
  const bool isUmts = state.technology == Technology::Umts;
  Change message;
  setCommon(message, moment);
  setNetwork(message, currentPlmn(state));
  message.setDurationSec(u32(changed->previousMs / 1000));
  message.setLqmType(linkQualityNumber(state.linkQuality));
  message.setSysMode(sysMode(state.technology));
  message.setIsScreenOn(state.surroundings.isScreenOn);
  message.setRachConnInfo(accessCounts(state));
  if (const ServingMeasurement* serving = lteServing(state)) {
    auto channel = makeMessageRef<LteChannelInfo>();
    channel->setRsrp(whole(serving->best.power));
    channel->setRsrq(whole(serving->best.quality));
    channel->setSnr(whole(serving->best.sinr));
    channel->setSinr(whole(serving->best.sinr));
    message.addLteChanInfo(channel);
  }
  message.setBbInHiPowerState(changed->reason == event::LinkReason::HighPower);
  message.setHiPowerEvent(powerEvent(changed->reason, isUmts));
  message.setSwimWorkoutActive(false);
  message.setHiPowerExitReason(Change::LQM_HPM_EXIT_REASON_SIGNAL_IMPROVEMENT);
  message.setCongestionReason(congestionReason(changed->reason));
  if (state.serving) message.setCellId(u32(state.serving->best.cell->cellId));
  message.setFgAppActiveDuringCongestion(state.surroundings.isScreenOn);
  return payload(message);
}

Payload dataStall(const Moment& moment) {
  const auto* stall = moment.get<event::DataStall>();
  if (stall == nullptr) return std::nullopt;
  const SubscriptionState& state = moment.state;
  CellularLqmDataStall message;
  setCommon(message, moment);
  message.setDataStallOccured(stall->hasBegun);
  message.setDnsFailureOccured(stall->isDnsFailure);
  message.setMediaPreWarningHint(false);
  message.setSysMode(u32(sysMode(state.technology)));
  message.setLqmState(u32(state.linkQuality));
  message.setServCellState(state.serving ? 1 : 0);
  message.setRrcState(u32(state.rrc));
  message.setIsDcActive(state.nr.has_value());
  return payload(message);
}

std::int32_t healthType(event::HealthKind kind, bool isNr) {
  using Monitor = CellularHealthMonitor;
  switch (kind) {
    case event::HealthKind::NoSearch:
      return Monitor::HEALTH_MONITOR_TYPE_NO_SEARCH;
    case event::HealthKind::DataStalled:
      return Monitor::HEALTH_MONITOR_TYPE_DATA_STALLED;
    case event::HealthKind::RepeatedGroupFailures:
      return Monitor::HEALTH_MONITOR_TYPE_5G_REPEATED_SCG_FAILURES;
    case event::HealthKind::RepeatedBeamFailures:
      return Monitor::HEALTH_MONITOR_TYPE_5G_REPEATED_BEAM_FAILURES;
    case event::HealthKind::FrequentLinkFailures:
      return Monitor::HEALTH_MONITOR_FREQUENT_LTE_RLF;
    case event::HealthKind::FrequentRachFailures:
      return Monitor::HEALTH_MONITO_FREQUENT_LTE_RACH_FAILURES;
    case event::HealthKind::FrequentNrLinkFailures:
      return Monitor::HEALTH_MONITOR_FREQUENT_NR_RLF;
    case event::HealthKind::FrequentNrRachFailures:
      return Monitor::HEALTH_MONITOR_FREQUENT_NR_RACH_FAILURES;
    case event::HealthKind::PowerFloor:
      return isNr ? Monitor::HEALTH_MONITOR_NR5G_RSRP_FLOOR : Monitor::HEALTH_MONITOR_LTE_RSRP_FLOOR;
    case event::HealthKind::SimError:
      return Monitor::HEALTH_MONITOR_TYPE_SIM_ERROR;
  }
  return Monitor::HEALTH_MONITOR_TYPE_NO_SEARCH;
}

Payload health(const Moment& moment) {
  using Monitor = CellularHealthMonitor;
  const auto* finding = moment.get<event::HealthFinding>();
  if (finding == nullptr) return std::nullopt;
  const SubscriptionState& state = moment.state;
  const auto countOf = [finding](event::HealthKind kind) { return finding->kind == kind ? finding->occurrences : 0; };
  Monitor message;
  setCommon(message, moment);
  message.setRat(sysMode(state.technology));
  if (finding->kind == event::HealthKind::DataStalled) message.setDataStallType(Monitor::AP_DL_DATA_STALL);
  message.setLastSearchRat(sysMode(state.technology));
  message.setHmType(healthType(finding->kind, state.technology == Technology::Nr));
  message.setDcActive(state.nr.has_value());
  if (state.serving) {
    message.setLacTac(state.serving->best.cell->areaCode);
    message.setCellId(state.serving->best.cell->cellId);
  }
  message.setRepeatedScgFailures(countOf(event::HealthKind::RepeatedGroupFailures));
  message.setRepeatedBeamFailures(countOf(event::HealthKind::RepeatedBeamFailures));
  message.setRepeatedLteRlfFailures(countOf(event::HealthKind::FrequentLinkFailures));
  message.setRepeatedLteRachFailures(countOf(event::HealthKind::FrequentRachFailures));
  message.setRepeatedNrRlfFailures(countOf(event::HealthKind::FrequentNrLinkFailures));
  message.setRepeatedNrRachFailures(countOf(event::HealthKind::FrequentNrRachFailures));
  message.setRxChain(0);
  message.setFbrxRsrpRat(state.technology == Technology::Nr ? Monitor::RF_TECH_ID_NR5G : Monitor::RF_TECH_ID_LTE);
  if (const ServingMeasurement* nr = nrServing(state)) message.setFreqRange(frequencyRange(*nr->best.cell));
  return payload(message);
}

MessageRef<TunerState> tunerFields(const network::TunerState& tuner) {
  auto fields = makeMessageRef<TunerState>();
  fields->setRat(sysMode(tuner.technology));
  fields->setTxBand(tuner.band);
  fields->setPortBodypositionFs(tuner.antenna);
  fields->setScenarioDecision(tuner.scenario);
  fields->setDeembedVswrMag(tuner.vswrMagnitude);
  fields->setDeembedVswrPhase(tuner.vswrPhase);
  fields->setAccessory(tuner.hasAccessory ? 1 : 0);
  return fields;
}

Payload tuner(const Moment& moment) {
  constexpr std::uint32_t kTimeoutMs = 1000;
  const auto* changed = moment.get<event::TunerChanged>();
  if (changed == nullptr) return std::nullopt;
  CellularRfTunerEvent message;
  setCommon(message, moment);
  message.setOldState(tunerFields(changed->previous));
  message.setThenewState(tunerFields(moment.state.tuner));
  message.setElapsedMs(u32(changed->previousMs));
  message.setTimeoutMs(kTimeoutMs);
  return payload(message);
}

constexpr MetricKind kHealthMetrics[] = {
    {827656, on<event::LinkQualityChanged>(), linkQuality},
    {827683, on<event::DataStall>(), dataStall},
    {816135, on<event::HealthFinding>(), health},
    {816389, on<event::TunerChanged>(), tuner},
};

}  // namespace

std::span<const MetricKind> healthKinds() {
  return kHealthMetrics;
}

}  // namespace quorl::simulator::metrics
