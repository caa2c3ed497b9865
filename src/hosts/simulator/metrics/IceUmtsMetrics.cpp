#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/MessageRef.h"
#include "messages/classes/gsm.h"
#include "messages/classes/lte_serving_cell.h"
#include "messages/classes/wcdma_cell.h"
#include "messages/classes/wcdma_connection.h"

// UMTS and GSM of family Ice.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::Cell;
using network::CellMeasurement;
using network::RrcCause;
using network::RrcState;
using network::ServingMeasurement;
using network::SubscriptionState;
using network::Technology;

namespace {

const ServingMeasurement* umtsServing(const SubscriptionState& state) {
  return servingOn(state, Technology::Umts);
}

std::int32_t umtsStateNumber(RrcState state) {
  using Message = KCellularWcdmaRrcConnectionState;
  switch (state) {
    case RrcState::None:
      return Message::KWCDMA_RRC_CONN_STATE_INACTIVE;
    case RrcState::Idle:
    case RrcState::Inactive:
      return Message::KWCDMA_RRC_CONN_STATE_IDLE;
    case RrcState::Connecting:
      return Message::KWCDMA_RRC_CONN_STATE_ESTABLISH;
    case RrcState::Connected:
    case RrcState::CellDch:
      return Message::KWCDMA_RRC_CONN_STATE_CELL_DCH;
    case RrcState::CellFach:
      return Message::KWCDMA_RRC_CONN_STATE_CELL_FACH;
    case RrcState::CellPch:
      return Message::KWCDMA_RRC_CONN_STATE_CELL_PCH;
    case RrcState::UraPch:
      return Message::KWCDMA_RRC_CONN_STATE_URA_PCH;
    case RrcState::Closing:
      return Message::KWCDMA_RRC_CONN_STATE_RELEASE;
  }
  return Message::KWCDMA_RRC_CONN_STATE_INVALID;
}

/// Nothing for a cause that ends a connection.
std::optional<std::int32_t> establishmentCause(RrcCause cause) {
  using Message = KCellularWcdmaRrcConnectionState;
  switch (cause) {
    case RrcCause::MoData:
      return Message::KRRC_EST_ORIG_BACKGND_CALL;
    case RrcCause::MoVoice:
      return Message::KRRC_EST_ORIG_CONV_CALL;
    case RrcCause::MoSignalling:
      return Message::KRRC_EST_HI_PRI_SIGNALLING;
    case RrcCause::MtAccess:
      return Message::KRRC_EST_TERM_CONV_CALL;
    case RrcCause::Emergency:
      return Message::KRRC_EST_EMERGENCY_CALL;
    case RrcCause::Registration:
      return Message::KRRC_EST_REGISTRATION;
    case RrcCause::InterRatReselection:
    case RrcCause::HandoverIn:
      return Message::KRRC_EST_INTER_RAT_CELL_RESELECT;
    case RrcCause::ReestablishLink:
    case RrcCause::ReestablishHandover:
      return Message::KRRC_EST_CALL_RE_ESTABLISH;
    default:
      return std::nullopt;
  }
}

/// Nothing for a cause that begins a connection.
std::optional<std::int32_t> releaseCause(RrcCause cause) {
  using Message = KCellularWcdmaRrcConnectionState;
  switch (cause) {
    case RrcCause::ReleaseInactivity:
      return Message::KRRC_REL_USER_INACTIVITY;
    case RrcCause::ReleaseNormal:
    case RrcCause::ReleaseHandoverOut:
      return Message::KRRC_REL_NORMAL_EVENT;
    case RrcCause::ReleaseRedirection:
      return Message::KRRC_REL_CONN_REJECT_REDIRECTION;
    case RrcCause::ReleaseLinkFailure:
      return Message::KRRC_REL_RL_FAILURE;
    case RrcCause::SetupNoResponse:
      return Message::KRRC_REL_RRC_CONN_ESTABLISHMENT_FAILURE;
    case RrcCause::SetupRejected:
      return Message::KRRC_REL_CONN_REJECT_CONGESTION;
    case RrcCause::NoService:
      return Message::KRRC_REL_RELEASE_OOSA;
    default:
      return std::nullopt;
  }
}

Payload connectionState(const Moment& moment) {
  RrcState state = moment.state.rrc;
  RrcCause cause = moment.state.rrcCause;
  if (const auto* changed = moment.get<event::RrcChanged>()) {
    if (changed->technology != Technology::Umts) return std::nullopt;
    state = changed->state;
    cause = changed->cause;
  } else if (umtsServing(moment.state) == nullptr) {
    return std::nullopt;
  }
  KCellularWcdmaRrcConnectionState message;
  setCommon(message, moment);
  message.setState(umtsStateNumber(state));
  if (const auto established = establishmentCause(cause)) message.setEstablishmentCause(*established);
  if (const auto released = releaseCause(cause)) message.setReleaseCause(*released);
  return payload(message);
}

Payload configuration(const Moment& moment) {
  const ServingMeasurement* serving = umtsServing(moment.state);
  if (serving == nullptr) return std::nullopt;
  KCellularWcdmaRrcConfiguration message;
  setCommon(message, moment);
  message.setDrxCycleLengthMs(moment.state.drx.pagingCycleMs);
  message.setIsMimoConfigured(false);
  message.setIsDcConfigured(detail(moment, serving->best.cell->siteIndex, 6, 2) == 1);
  return payload(message);
}

Payload umtsCell(const Moment& moment) {
  const ServingMeasurement* serving = umtsServing(moment.state);
  if (serving == nullptr) return std::nullopt;
  const Cell& cell = *serving->best.cell;
  KCellularWcdmaCellInfo message;
  setCommon(message, moment);
  setNetwork(message, cell.plmn);
  message.setLac(cell.areaCode);
  message.setCellId(u32(cell.cellId));
  if (const auto band = sysBand(cell)) message.setWcdmaBand(*band);
  message.setDlUarfcn(cell.downlinkChannel);
  message.setPsc(cell.physicalId);
  message.setHspa(KCellularWcdmaCellInfo::SYS_HS_IND_HSDPA_HSUPA_SUPP_CELL);
  return payload(message);
}

Payload umtsMeasurement(const Moment& moment) {
  const ServingMeasurement* serving = umtsServing(moment.state);
  if (serving == nullptr) return std::nullopt;
  KCellularWcdmaScellMeasurement message;
  setCommon(message, moment);
  message.setConnectedMode(isConnected(moment.state));
  auto info = makeMessageRef<RxInfo>();
  info->setRssi(whole(serving->best.rssi));
  info->setRscp(whole(serving->best.power));
  info->setEcno(whole(serving->best.quality));
  info->setFrameIndex(u32(moment.state.nowMs / 10 % 4096));
  message.addRxInfo(info);
  return payload(message);
}

Payload umtsPower(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  if (umtsServing(state) == nullptr || !isConnected(state)) return std::nullopt;
  KCellularWcdmaTxPower message;
  setCommon(message, moment);
  auto info = makeMessageRef<TxPowerInfo>();
  info->setDpcchTxPower(whole(state.transmitPowerControl));
  info->setTotalTxPower(whole(state.transmitPower));
  info->setFrameIndex(u32(state.nowMs / 10 % 4096));
  message.addTxPowerInfo(info);
  return payload(message);
}

Payload umtsReselection(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  const ServingMeasurement* serving = umtsServing(state);
  if (serving == nullptr) return std::nullopt;
  const network::ReselectionParameters& parameters = state.reselection;
  KCellularWcdmaSelReselCellInfo message;
  setCommon(message, moment);
  message.setHsdpaCapable(1);
  message.setEdchCapable(1);
  message.setDuplexMode(KCellularWcdmaSelReselCellInfo::FDD);
  message.addMultiBandInfo(serving->best.cell->band);
  message.setImsEmergencySupport(0);
  message.setCellBarred(0);
  message.setSRxlev(whole(serving->best.power) - parameters.qRxLevMin);
  message.setSQual(whole(serving->best.quality) - parameters.qQualMin);
  message.setSIntrasearch(parameters.intraSearch);
  message.setSIntersearch(parameters.nonIntraSearch);
  message.setSSearchRat(parameters.servingLow);
  message.setSCellPrio(serving->best.cell->priority);
  std::size_t listed = 0;
  for (const CellMeasurement& each : state.neighbours) {
    if (each.cell->downlinkChannel == serving->best.cell->downlinkChannel || listed++ == kMostNeighbours) continue;
    auto frequency = makeMessageRef<UtraFreqInfo>();
    frequency->setUarfcn(each.cell->downlinkChannel);
    frequency->setPrio(each.cell->priority);
    message.addUtraPrioInfo(frequency);
  }
  for (const CellMeasurement& each : state.otherNeighbours) {
    if (each.cell->technology == Technology::Lte) {
      auto frequency = makeMessageRef<EutraFreqInfo>();
      frequency->setEarfcn(each.cell->downlinkChannel);
      frequency->setPrio(each.cell->priority);
      message.addEutraPrioInfo(frequency);
    } else if (each.cell->technology == Technology::Gsm) {
      auto frequency = makeMessageRef<GsmFreqInfo>();
      frequency->setArfcn(each.cell->downlinkChannel);
      frequency->setPrio(each.cell->priority);
      message.addGsmPrioInfo(frequency);
    }
  }
  return payload(message);
}

void addUmtsNeighbour(KCellularWcdmaNbrCellMeas& message, const CellMeasurement& measured) {
  constexpr std::int32_t kLevelOffset = 116;
  auto cell = makeMessageRef<UtraCellMeasResult>();
  cell->setUarfcn(measured.cell->downlinkChannel);
  cell->setBand(measured.cell->band);
  cell->setPsc(measured.cell->physicalId);
  cell->setEcno(ecnoCode(measured.quality));
  cell->setRscp(whole(measured.power) + kLevelOffset);
  message.addMeasUtraResult(cell);
}

void addOtherNeighbour(KCellularWcdmaNbrCellMeas& message, const CellMeasurement& measured) {
  if (measured.cell->technology == Technology::Gsm) {
    auto cell = makeMessageRef<GsmCellMeasResult>();
    cell->setArfcn(measured.cell->downlinkChannel);
    cell->setBsic(measured.cell->physicalId);
    cell->setRxlev(rxlev(measured.power));
    message.addMeasGsmResult(cell);
  } else if (measured.cell->technology == Technology::Lte) {
    auto cell = makeMessageRef<LteCellMeasResult>();
    cell->setEarfcn(measured.cell->downlinkChannel);
    cell->setPhyCellId(measured.cell->physicalId);
    cell->setEutraBand(measured.cell->band);
    cell->setRsrp(whole(measured.power));
    cell->setRsrq(whole(measured.quality));
    message.addMeasLteResult(cell);
  }
}

Payload umtsNeighbours(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  if (umtsServing(state) == nullptr) return std::nullopt;
  KCellularWcdmaNbrCellMeas message;
  setCommon(message, moment);
  const std::size_t count = std::min(state.neighbours.size(), kMostNeighbours);
  for (std::size_t i = 0; i < count; ++i) addUmtsNeighbour(message, state.neighbours[i]);
  const std::size_t others = std::min(state.otherNeighbours.size(), kMostNeighbours);
  for (std::size_t i = 0; i < others; ++i) addOtherNeighbour(message, state.otherNeighbours[i]);
  return payload(message);
}

Payload gsmCell(const Moment& moment) {
  using Message = KCellularGsmScellInfo;
  const ServingMeasurement* serving = servingOn(moment.state, Technology::Gsm);
  if (serving == nullptr) return std::nullopt;
  const Cell& cell = *serving->best.cell;
  Message message;
  setCommon(message, moment);
  setNetwork(message, cell.plmn);
  message.setLac(cell.areaCode);
  message.setCellId(u32(cell.cellId));
  if (const auto band = sysBand(cell)) message.setGsmBand(*band);
  message.setArfcn(cell.downlinkChannel);
  message.setBsic(cell.physicalId);
  message.setState(isConnected(moment.state) ? Message::DEDICATED_STATE : Message::NON_DEDICATED_STATE);
  return payload(message);
}

constexpr MetricKind kIceUmtsMetrics[] = {
    {3985682, on<event::RrcChanged>(), connectionState, /*isCurrent=*/true},
    {3985683, on<event::ServingCellChanged, event::DrxChanged>(), configuration, /*isCurrent=*/true},
    {3944460, on<event::ServingCellChanged>(), umtsCell, /*isCurrent=*/true},
    {3985666, on<event::Measured>(), umtsMeasurement, /*isCurrent=*/true, {5000, 200}},
    {3985667, on<event::Measured>(), umtsPower, /*isCurrent=*/true, {5000, 200}},
    {3985668, on<event::ServingCellChanged>(), umtsReselection, /*isCurrent=*/true},
    {3985669, on<event::Measured>(), umtsNeighbours, /*isCurrent=*/true, {10000, 400}},
    {3943948, on<event::ServingCellChanged, event::RrcChanged>(), gsmCell, /*isCurrent=*/true},
};

}  // namespace

std::span<const MetricKind> iceUmtsKinds() {
  return kIceUmtsMetrics;
}

}  // namespace quorl::simulator::metrics
