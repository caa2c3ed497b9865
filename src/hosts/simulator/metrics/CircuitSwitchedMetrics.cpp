#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/MessageRef.h"
#include "messages/classes/call_end.h"
#include "messages/classes/call_fallback.h"
#include "messages/classes/cdma.h"
#include "messages/classes/gsm.h"
#include "messages/classes/wcdma_connection.h"

// Calls and the older technologies of family Mav.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::Call;
using network::Cell;
using network::RrcState;
using network::SubscriptionState;
using network::Technology;

namespace {

Payload cdmaCell(const Moment& moment) {
  constexpr std::size_t kSectorIdSize = 16;
  if (moment.state.cdma.empty()) return std::nullopt;
  const network::CdmaSystem& system = moment.state.cdma.front();
  CellularCdmaCellInfo message;
  setCommon(message, moment);
  message.setMcc(system.mcc);
  message.setRat(SYS_MODE_CDMA);
  message.setSrvStatus(serviceStatus(moment.state.service));
  message.setIs95Sid(system.systemId);
  message.setIs95Nid(system.networkId);
  message.setSectorId(content(moment, kSectorIdSize));
  message.setBand(SYS_BAND_BC0 + system.bandClass);
  message.setChannel(system.channel);
  message.setBaseId(system.baseId);
  message.setZoneId(1);
  message.setHdrSrvStatus(SYS_SRV_STATUS::SYS_SRV_STATUS_NO_SRV);
  message.setHdrHybrid(false);
  message.setPilotPn(system.pilot);
  return payload(message);
}

Payload gsmWcdmaCell(const Moment& moment) {
  using Message = CellularGsmWcdmaCellInfo;
  const SubscriptionState& state = moment.state;
  const bool isUmts = state.technology == Technology::Umts;
  if (!state.serving || (!isUmts && state.technology != Technology::Gsm)) return std::nullopt;
  const Cell& cell = *state.serving->best.cell;
  Message message;
  setCommon(message, moment);
  setNetwork(message, cell.plmn);
  message.setSrvStatus(serviceStatus(state.service));
  message.setSrvDomain(serviceDomain(state.domain));
  message.setRat(sysMode(state.technology));
  message.setLac(cell.areaCode);
  message.setCellId(u32(cell.cellId));
  const std::optional<std::int32_t> band = sysBand(cell);
  if (isUmts) {
    if (band) message.setWcdmaBand(*band);
    message.setDlUarfcn(cell.downlinkChannel);
    message.setPsc(cell.physicalId);
    message.setHspa(Message::SYS_HS_IND_HSDPA_HSUPA_SUPP_CELL);
  } else {
    if (band) message.setGsmBand(*band);
    message.setGsmArfcn(cell.downlinkChannel);
  }
  message.setFmtId(1);
  return payload(message);
}

std::int32_t umtsState(RrcState state) {
  switch (state) {
    case RrcState::Connecting:
      return WCDMA_RRC_STATE_CONNECTING;
    case RrcState::CellFach:
      return WCDMA_RRC_STATE_CELL_FACH;
    case RrcState::Connected:
    case RrcState::CellDch:
      return WCDMA_RRC_STATE_CELL_DCH;
    case RrcState::CellPch:
      return WCDMA_RRC_STATE_CELL_PCH;
    case RrcState::UraPch:
      return WCDMA_RRC_STATE_URA_PCH;
    case RrcState::None:
    case RrcState::Idle:
    case RrcState::Closing:
    case RrcState::Inactive:
      return WCDMA_RRC_STATE_DISCONNECTED;
  }
  return WCDMA_RRC_STATE_DISCONNECTED;
}

Payload wcdmaState(const Moment& moment) {
  const auto* changed = moment.get<event::RrcChanged>();
  if (changed == nullptr || changed->technology != Technology::Umts) return std::nullopt;
  CellularWcdmaRrcState message;
  setCommon(message, moment);
  message.setRrcState(umtsState(changed->previous));
  message.setNewRrcState(umtsState(changed->state));
  message.setPrevStateDurMs(u32(changed->previousMs));
  return payload(message);
}

std::int32_t serviceType(Technology technology) {
  switch (technology) {
    case Technology::None:
      return CellularCallEndDetails::CM_SRV_TYPE_NONE;
    case Technology::Gsm:
      return CellularCallEndDetails::CM_SRV_TYPE_GSM;
    case Technology::Umts:
      return CellularCallEndDetails::CM_SRV_TYPE_UMTS;
    case Technology::Lte:
    case Technology::Nr:
      return CellularCallEndDetails::CM_SRV_TYPE_LTE;
  }
  return CellularCallEndDetails::CM_SRV_TYPE_NONE;
}

std::int32_t endStatus(network::CallEnd end) {
  switch (end) {
    case network::CallEnd::LocalHangUp:
    case network::CallEnd::Cancelled:
      return 29;
    case network::CallEnd::RemoteHangUp:
    case network::CallEnd::NoAnswer:
      return 25;
    case network::CallEnd::SetupFailed:
    case network::CallEnd::Dropped:
    case network::CallEnd::FallbackFailed:
      return 16;
  }
  return 16;
}

/// Milliseconds from one moment of a call to a later one.
std::optional<std::uint32_t> between(std::optional<network::SimulatedMs> from, std::optional<network::SimulatedMs> to) {
  if (!from || !to || *to < *from) return std::nullopt;
  return u32(*to - *from);
}

void setCallTimes(CellularCallEndDetails& message, const Call& call) {
  if (const auto ms = between(call.startedMs, call.fallbackMs)) message.setMsOrigToFb(*ms);
  if (const auto ms = between(call.startedMs, call.setupMs)) message.setMsOrigToConf(*ms);
  if (const auto ms = between(call.startedMs, call.endedMs)) message.setMsOrigToEnd(*ms);
  if (const auto ms = between(call.startedMs, call.alertedMs)) message.setMsStartToAlert(*ms);
  if (const auto ms = between(call.fallbackMs, call.setupMs)) message.setMsFbToSetup(*ms);
  if (const auto ms = between(call.setupMs, call.endedMs)) message.setMsSetupToEnd(*ms);
  if (!call.isOutgoing)
    if (const auto ms = between(call.startedMs, call.setupMs)) message.setMsPageToSetup(*ms);
}

void setCallCell(CellularCallEndDetails& message, const Call& call) {
  if (call.cell == nullptr) return;
  const Cell& cell = *call.cell;
  setNetwork(message, cell.plmn);
  if (network::isPacketCell(call.technology)) {
    message.setLteCellId(u32(cell.cellId));
    message.setLteLac(cell.areaCode);
  } else {
    message.setCellId(u32(cell.cellId));
    message.setLac(cell.areaCode);
    if (call.technology == Technology::Umts) message.setPsc(cell.physicalId);
  }
  if (const auto band = sysBand(cell)) message.setBand(*band);
  message.setRfChannel(cell.downlinkChannel);
}

Payload callEnd(const Moment& moment) {
  using Message = CellularCallEndDetails;
  const auto* progress = moment.get<event::CallProgress>();
  if (progress == nullptr || progress->step != event::CallStep::Ended) return std::nullopt;
  const Call& call = moment.state.call;
  const std::int32_t direction = call.isOutgoing ? CM_CALL_DIRECTION_MO : CM_CALL_DIRECTION_MT;
  Message message;
  setCommon(message, moment);
  message.setCallEvent(Message::CM_CALL_EVENT_END);
  message.setCallId(call.id);
  message.setDirection(direction);
  message.setSrvType(serviceType(call.technology));
  message.setSysMode(sysMode(call.technology));
  message.setCallState(call.connectedMs ? Message::CM_CALL_STATE_CONV : Message::CM_CALL_STATE_ORIG);
  message.setEndStatus(endStatus(call.end));
  const auto talkedMs = between(call.connectedMs, call.endedMs);
  message.setCallDuration(talkedMs ? static_cast<std::int32_t>(*talkedMs / 1000) : 0);
  message.setCcCause(call.releaseCause);
  message.setAntenna(static_cast<std::int32_t>(moment.state.tuner.antenna));
  message.setCallType(Message::CM_CALL_TYPE_VOICE);
  message.setEstablished(call.setupMs.has_value());
  message.setConnected(call.connectedMs.has_value());
  setCallCell(message, call);
  message.setMrabEver(moment.state.isDataActive);
  message.setMrabEnd(moment.state.isDataActive);
  message.setSetupSysMode(sysMode(call.setupTechnology));
  message.setSetupDirection(direction);
  message.setFb(call.isFallback);
  setCallTimes(message, call);
  if (call.technology == Technology::Umts) message.setEcioDbx2(whole(call.lastQuality * 2));
  message.setRssiDbm(whole(call.lastRssi));
  message.setTxPwrDbm(whole(call.lastTransmitPower));
  auto capacitive = makeMessageRef<CapEvent>();
  capacitive->setCapState(CapEvent::CFG_HEAD);
  capacitive->setMsBeforeCallEnd(talkedMs.value_or(0) / 2);
  message.addCapEvent(capacitive);
  message.setHoType(call.handovers > 0 ? 1 : 0);
  auto measured = makeMessageRef<RfMeasInfo>();
  measured->setMag(moment.state.tuner.vswrMagnitude);
  measured->setPhase(moment.state.tuner.vswrPhase);
  measured->setTxPwrDb2(whole(call.lastTransmitPower * 2));
  message.addRfMeasInfo(measured);
  message.setIsSrvccSuccess(call.wasHandedToCircuit ? 1 : 0);
  if (call.wasHandedToCircuit) message.setSrvccTargetRat(sysRat(call.technology));
  message.setLastMotionState(u32(motion(moment.state.surroundings.motion)));
  message.setMsSinceLastMotionState(u32(moment.state.nowMs - moment.state.surroundings.motionSinceMs));
  message.setTransId(Text("invented-call-" + std::to_string(call.id)));
  message.setVersion(3);
  return payload(message);
}

Payload pageFailure(const Moment& moment) {
  using Failure = CellularCsCallGwlPageRespFail;
  const auto* failed = moment.get<event::PageResponseFailed>();
  if (failed == nullptr) return std::nullopt;
  constexpr std::int32_t kCauses[] = {Failure::MT_RRC_CONN_EST_FAIL, Failure::MT_RRC_CONN_LOST, Failure::MT_CSFB_FAIL,
                                      Failure::MT_PAGING_IGNORED};
  Failure message;
  setCommon(message, moment);
  message.setVersion(2);
  message.setPageRat(failed->pagedOn == Technology::Gsm    ? Failure::PAGE_RAT_GSM
                     : failed->pagedOn == Technology::Umts ? Failure::PAGE_RAT_WCDMA
                                                           : Failure::PAGE_RAT_LTE);
  message.setCause(kCauses[static_cast<std::size_t>(failed->cause)]);
  message.setIsImsiPage(0);
  const bool isFallback = failed->cause == event::PageFailure::FallbackFailed;
  message.setCsfbFailureType(isFallback ? Failure::EMM_REJECT_CAUSE : Failure::AS_REJECT_CAUSE);
  if (isFallback) message.setCsfbFailureEmmCause(Failure::LTE_NAS_CONGESTION);
  message.setCsfbIsLacMismatch(failed->attemptedCell != nullptr && failed->cell != nullptr &&
                               failed->attemptedCell->areaCode != failed->cell->areaCode);
  if (failed->cell != nullptr) {
    message.setLteRegLac(failed->cell->areaCode);
    message.setTac(failed->cell->areaCode);
    message.setLteCellId(u32(failed->cell->cellId));
  }
  if (const Cell* attempted = failed->attemptedCell) {
    message.setAttemptArfcn(attempted->downlinkChannel);
    message.setIsAttemptBandPcs(attempted->band == 1900);
    message.setAttemptLac(attempted->areaCode);
    message.setAttemptCellId(u32(attempted->cellId));
    message.setNumRedirFreq(1);
    message.addRedirArfcn(attempted->downlinkChannel);
  }
  return payload(message);
}

constexpr MetricKind kCircuitSwitchedMetrics[] = {
    {790530, on<event::CdmaScanned>(), cdmaCell},
    {798732, on<event::ServingCellChanged, event::Measured>(), gsmWcdmaCell, /*isCurrent=*/true, {30000, 10000}},
    {802306, on<event::RrcChanged>(), wcdmaState},
    {835590, on<event::CallProgress>(), callEnd},
    {835592, on<event::PageResponseFailed>(), pageFailure},
};

}  // namespace

std::span<const MetricKind> circuitSwitchedKinds() {
  return kCircuitSwitchedMetrics;
}

}  // namespace quorl::simulator::metrics
