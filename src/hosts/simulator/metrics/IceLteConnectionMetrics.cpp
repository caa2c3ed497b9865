#include <algorithm>

#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/MessageRef.h"
#include "messages/classes/lte_carrier_aggregation.h"
#include "messages/classes/lte_rrc.h"
#include "messages/classes/lte_serving_cell.h"

// LTE connections of family Ice: states, carriers, DRX, transmit power.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::Cell;
using network::RrcCause;
using network::RrcState;
using network::SecondaryCarrier;
using network::ServingMeasurement;
using network::SubscriptionState;
using network::Technology;

namespace {

std::int32_t lteStateNumber(RrcState state) {
  switch (state) {
    case RrcState::Idle:
      return KLTE_RRC_STATE_IDLE;
    case RrcState::Connecting:
      return KLTE_RRC_STATE_ATMPT_CONNECTION;
    case RrcState::Connected:
      return KLTE_RRC_STATE_CONNECTED;
    case RrcState::Closing:
      return KLTE_RRC_STATE_ENDING;
    case RrcState::None:
    case RrcState::Inactive:
    case RrcState::CellFach:
    case RrcState::CellDch:
    case RrcState::CellPch:
    case RrcState::UraPch:
      return KLTE_RRC_STATE_NULL;
  }
  return KLTE_RRC_STATE_NULL;
}

std::int32_t causeNumber(RrcCause cause) {
  using State = KCellularLteRrcState;
  switch (cause) {
    case RrcCause::None:
      return State::KLTE_RRC_CAUSE_NA;
    case RrcCause::MoData:
    case RrcCause::MoVoice:
      return State::KLTE_RRC_CAUSE_EST_MO_DATA;
    case RrcCause::MoSignalling:
    case RrcCause::Registration:
    case RrcCause::InterRatReselection:
      return State::KLTE_RRC_CAUSE_EST_MO_SIGNAL;
    case RrcCause::MtAccess:
      return State::KLTE_RRC_CAUSE_EST_MT_ACC;
    case RrcCause::Emergency:
      return State::KLTE_RRC_CAUSE_EST_EMERGENCY;
    case RrcCause::HandoverIn:
      return State::KLTE_RRC_CAUSE_EST_SUCC_MOB_TO_EUTRAN;
    case RrcCause::ReestablishLink:
      return State::KLTE_RRC_CAUSE_REEST_OTHER_FAIL_T310_EXP;
    case RrcCause::ReestablishHandover:
      return State::KLTE_RRC_CAUSE_REEST_HO_FAIL;
    case RrcCause::ReleaseInactivity:
    case RrcCause::ReleaseNormal:
      return State::KLTE_RRC_CAUSE_REL_OTHER;
    case RrcCause::ReleaseRedirection:
      return State::KLTE_RRC_CAUSE_REL_CSFB_HIGH_PRIO;
    case RrcCause::ReleaseHandoverOut:
      return State::KLTE_RRC_CAUSE_REL_SUCC_MOB_FROM_EUTRAN;
    case RrcCause::ReleaseLinkFailure:
      return State::KLTE_RRC_CAUSE_REL_T310_EXP;
    case RrcCause::SetupNoResponse:
      return State::KLTE_RRC_CAUSE_EST_FAIL_NO_RESP_FROM_CELL;
    case RrcCause::SetupRejected:
      return State::KLTE_RRC_CAUSE_EST_FAIL_REJ;
    case RrcCause::NoService:
      return State::KLTE_RRC_CAUSE_NO_SERVICE;
  }
  return State::KLTE_RRC_CAUSE_NA;
}

Payload lteRrcState(const Moment& moment) {
  KCellularLteRrcState message;
  setCommon(message, moment);
  if (const auto* changed = moment.get<event::RrcChanged>()) {
    if (changed->technology != Technology::Lte) return std::nullopt;
    message.setState(lteStateNumber(changed->state));
    message.setPrevState(lteStateNumber(changed->previous));
    message.setPrevStateDurMs(u32(changed->previousMs));
    message.setCause(causeNumber(changed->cause));
  } else {
    if (lteServing(moment.state) == nullptr) return std::nullopt;
    message.setState(lteStateNumber(moment.state.rrc));
    message.setCause(causeNumber(moment.state.rrcCause));
  }
  return payload(message);
}

std::int32_t carrierState(network::CarrierState state) {
  using Carrier = SecondaryComponentCarrier;
  switch (state) {
    case network::CarrierState::Deconfigured:
      return Carrier::SCC_STATE_DECONFIGURED;
    case network::CarrierState::Configured:
      return Carrier::SCC_STATE_CONFIGURED_DEACTIVATED;
    case network::CarrierState::Activated:
      return Carrier::SCC_STATE_ACTIVATED;
  }
  return Carrier::SCC_STATE_DECONFIGURED;
}

Payload aggregation(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  // Rounds of measurements bring it only while there is something to measure.
  const bool isRound = moment.get<event::Measured>() != nullptr;
  if (lteServing(state) == nullptr || (isRound && state.carriers.empty())) return std::nullopt;
  KCellularLteCarrierAggregationStatus message;
  setCommon(message, moment);
  for (const SecondaryCarrier& each : state.carriers) {
    const Cell& cell = *each.serving.best.cell;
    auto carrier = makeMessageRef<SecondaryComponentCarrier>();
    carrier->setIndex(each.index);
    carrier->setState(carrierState(each.state));
    carrier->setPci(cell.physicalId);
    carrier->setDlEarfcn(cell.downlinkChannel);
    carrier->setDlRfBand(cell.band);
    carrier->setDlBandwidth(bandwidthCode(cell));
    carrier->setHasUplink(each.hasUplink);
    if (each.hasUplink) {
      carrier->setUlEarfcn(cell.uplinkChannel);
      carrier->setUlRfBand(cell.band);
      carrier->setUlBandwidth(bandwidthCode(cell));
    }
    carrier->setRsrp(each.serving.best.power);
    carrier->setRsrq(each.serving.best.quality);
    carrier->setSnr(whole(each.serving.best.sinr));
    carrier->setRssi(each.serving.best.rssi);
    message.addSccList(carrier);
  }
  return payload(message);
}

MessageRef<ComponentCarrierInfo> carrierFields(const Cell& cell) {
  auto carrier = makeMessageRef<ComponentCarrierInfo>();
  carrier->setDlEarfcn(cell.downlinkChannel);
  carrier->setDlBandwidth(static_cast<std::int32_t>(bandwidthCode(cell)));
  carrier->setDlRfBand(cell.band);
  return carrier;
}

Payload carriers(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  const ServingMeasurement* serving = lteServing(state);
  if (serving == nullptr) return std::nullopt;
  const Cell& primary = *serving->best.cell;
  KCellularLteComponentCarrierInfo message;
  setCommon(message, moment);
  message.setPccEarfcn(primary.downlinkChannel);
  message.setPccBandwidth(bandwidthCode(primary));
  message.setPccRfBand(primary.band);
  message.addCarrierInfo(carrierFields(primary));
  if (!state.carriers.empty()) {
    const Cell& first = *state.carriers[0].serving.best.cell;
    message.setScc0Earfcn(first.downlinkChannel);
    message.setScc0Bandwidth(bandwidthCode(first));
    message.setScc0RfBand(first.band);
  }
  if (state.carriers.size() > 1) {
    const Cell& second = *state.carriers[1].serving.best.cell;
    message.setScc1Earfcn(second.downlinkChannel);
    message.setScc1Bandwidth(bandwidthCode(second));
    message.setScc1RfBand(second.band);
  }
  for (const SecondaryCarrier& each : state.carriers) message.addCarrierInfo(carrierFields(*each.serving.best.cell));
  return payload(message);
}

Payload connectedDrx(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  const ServingMeasurement* serving = lteServing(state);
  if (serving == nullptr) return std::nullopt;
  const network::DrxConfiguration& drx = state.drx;
  KCellularLteCdrxConfig message;
  setCommon(message, moment);
  message.setCellStatus(1);
  message.setOnDurationMs(drx.onDurationMs);
  message.setDrxInactivityMs(drx.inactivityMs);
  message.setDrxRetxTimerMs(drx.retransmissionMs);
  message.setLongDrxCycleMs(drx.longCycleMs);
  message.setShortDrxCycleMs(drx.shortCycleMs);
  message.setDrxShortCycleNum(drx.shortCycles);
  message.setRrcState(lteStateNumber(state.rrc));
  message.setCdrxConfigStatus(drx.isConnectedDrx ? 1 : 0);
  message.setTransmissionMode(serving->rank > 1 ? 3 : 2);
  return payload(message);
}

Payload txPower(const Moment& moment) {
  constexpr std::int32_t kWidths[] = {N6, N15, N25, N50, N75, N100};
  const SubscriptionState& state = moment.state;
  const ServingMeasurement* serving = lteServing(state);
  if (serving == nullptr || !isConnected(state)) return std::nullopt;
  const Cell& primary = *serving->best.cell;
  KCellularLteTxPower message;
  setCommon(message, moment);
  auto info = makeMessageRef<TxPowerInfo>();
  info->setDpcchTxPower(whole(state.transmitPowerControl));
  info->setTotalTxPower(whole(state.transmitPower));
  info->setFrameIndex(u32(state.nowMs / 10 % 1024));
  message.addTxPowerInfo(info);
  if (state.call.phase != network::CallPhase::None)
    message.setVolteCallId(Text("invented-call-" + std::to_string(state.call.id)));
  message.setLastPcellDlBand(primary.band);
  message.setLastPcellDlBw(kWidths[bandwidthCode(primary)]);
  const auto sending = std::find_if(state.carriers.begin(), state.carriers.end(),
                                    [](const SecondaryCarrier& each) { return each.hasUplink; });
  if (sending != state.carriers.end()) {
    const Cell& secondary = *sending->serving.best.cell;
    message.setLastScellUlBand(secondary.band);
    message.setLastScellUlBw(kWidths[bandwidthCode(secondary)]);
  }
  return payload(message);
}

constexpr MetricKind kIceLteConnectionMetrics[] = {
    {3952132, on<event::RrcChanged>(), lteRrcState, /*isCurrent=*/true},
    {3986195,
     on<event::CarriersChanged, event::ServingCellChanged, event::Measured>(),
     aggregation,
     /*isCurrent=*/true,
     {10000, 400}},
    {3986187, on<event::CarriersChanged, event::ServingCellChanged>(), carriers, /*isCurrent=*/true},
    {3952152, on<event::DrxChanged>(), connectedDrx, /*isCurrent=*/true},
    {3986178, on<event::Measured>(), txPower, /*isCurrent=*/true, {5000, 200}},
};

}  // namespace

std::span<const MetricKind> iceLteConnectionKinds() {
  return kIceLteConnectionMetrics;
}

}  // namespace quorl::simulator::metrics
