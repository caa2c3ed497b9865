#include <array>
#include <utility>

#include "hosts/simulator/metrics/AirMessages.h"
#include "hosts/simulator/metrics/BandCombination.h"
#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/classes/lte_rrc.h"
#include "messages/classes/lte_serving_cell.h"
#include "messages/classes/lte_signalling.h"

// LTE metrics of family Mav.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::Cell;
using network::RrcState;
using network::ServingMeasurement;
using network::Technology;

MessageRef<BandCombo> combination(const std::vector<const Cell*>& cells) {
  constexpr std::uint32_t kOneCarrierClass = 1;  // class A (TS 36.101 5.6A)
  auto made = makeMessageRef<BandCombo>();
  made->setNumBandComponents(u32(cells.size()));
  for (std::size_t i = 0; i < cells.size(); ++i) {
    auto component = makeMessageRef<BandComponentInCombo>();
    component->setBand(cells[i]->band);
    component->setDlBwClass(kOneCarrierClass);
    component->setAggregatedDlBw(cells[i]->bandwidthMhzX10 / 10U);
    component->setUlBwClass(i == 0 ? kOneCarrierClass : 0);
    made->addBandInfo(component);
  }
  return made;
}

namespace {

Payload lteServingCell(const Moment& moment) {
  const ServingMeasurement* serving = lteServing(moment.state);
  if (serving == nullptr) return std::nullopt;
  const Cell& cell = *serving->best.cell;
  CellularLteScellInfo message;
  setCommon(message, moment);
  setLteServingCell(message, cell, resourceBlocks(cell));
  message.setAllowedAccess(1);
  message.setCellIsApo(false);
  return payload(message);
}

void setAirType(CellularLteOtaMsg& message, AirType type) {
  using Message = CellularLteOtaMsg;
  message.setMsgType(type.number);
  switch (type.channel) {
    case AirChannel::Bcch:
      return message.setChannelType(Message::BCCH_BCH);
    case AirChannel::BcchShared:
      return message.setChannelType(Message::BCCH_DL_SCH);
    case AirChannel::Pcch:
      return message.setChannelType(Message::PCCH);
    case AirChannel::DownlinkCommon:
      message.setDlCcchMsg(type.number);
      return message.setChannelType(Message::DL_CCCH);
    case AirChannel::DownlinkDedicated:
      message.setDlDcchMsg(type.number);
      return message.setChannelType(Message::DL_DCCH);
    case AirChannel::UplinkCommon:
      message.setUlCcchMsg(type.number);
      return message.setChannelType(Message::UL_CCCH);
    case AirChannel::UplinkDedicated:
      message.setUlDcchMsg(type.number);
      return message.setChannelType(Message::UL_DCCH);
  }
}

Payload lteOtaMsg(const Moment& moment) {
  const auto* air = moment.get<event::AirMessage>();
  if (air == nullptr || air->cell->technology != Technology::Lte) return std::nullopt;
  const Cell& cell = *air->cell;
  CellularLteOtaMsg message;
  setCommon(message, moment);
  setNetwork(message, cell.plmn);
  message.setPhyCellId(cell.physicalId);
  message.setFreq(cell.downlinkChannel);
  message.setRbId(air->bearer);
  setAirType(message, lteAirType(air->kind));
  message.setLength(air->length);
  message.setContent(content(moment, air->length));
  message.setDlBw(resourceBlocks(cell));
  message.setCellId(u32(cell.cellId));
  message.setFreqBandInd(cell.band);
  message.setTrackingAreaCode(cell.areaCode);
  message.setUpperLayerIndication(cell.isNrAnchor);
  message.setScgEverConfigured(moment.state.use.hadSecondaryGroup);
  return payload(message);
}

Payload lteRachAttempt(const Moment& moment) {
  using Attempt = CellularLteRachAttempt;
  const auto* attempt = moment.get<event::RachAttempt>();
  if (attempt == nullptr || attempt->cell->technology != Technology::Lte) return std::nullopt;
  constexpr std::int32_t kResults[] = {Attempt::LTE_RACH_RESULT_SUCCESS, Attempt::LTE_RACH_RESULT_FAIL_AT_MESG2,
                                       Attempt::LTE_RACH_RESULT_FAIL_AT_MESG4_CTT,
                                       Attempt::LTE_RACH_RESULT_FAIL_AT_MESG4, Attempt::LTE_RACH_RESULT_ABORTED};
  const Cell& cell = *attempt->cell;
  Attempt message;
  setCommon(message, moment);
  message.setRetxCounter(attempt->preambles - 1U);
  message.setRachResult(kResults[static_cast<std::size_t>(attempt->result)]);
  message.setContentionBased(attempt->isContentionBased);
  message.setPMax(kMostLtePower);
  message.setRsrp(whole(attempt->power));
  message.setEarfcn(cell.downlinkChannel);
  message.setTac(cell.areaCode);
  message.setCellId(u32(cell.cellId));
  message.setCellIsApo(false);
  message.setAccbState(0);
  message.setScellIndex(0);
  message.setTxPowerLimited(attempt->isPowerLimited);
  return payload(message);
}

Payload stateHistory(const Moment& moment) {
  constexpr std::pair<RrcState, std::int32_t> kStates[] = {{RrcState::None, LTE_RRC_IDLE_NOT_CAMPED},
                                                           {RrcState::Idle, LTE_RRC_IDLE_CAMPED},
                                                           {RrcState::Connecting, LTE_RRC_CONNECTING},
                                                           {RrcState::Connected, LTE_RRC_CONNECTED},
                                                           {RrcState::Closing, LTE_RRC_CLOSING}};
  const network::Counters& now = moment.state.counters;
  const network::Counters& before = moment.baseline->counters;
  CellularLteRrcStateHist message;
  setCommon(message, moment);
  std::uint64_t total = 0;
  for (const auto& [state, number] : kStates) {
    const auto index = static_cast<std::size_t>(state);
    const std::uint64_t visits = now.lteStateVisits[index] - before.lteStateVisits[index];
    const std::uint64_t spent = now.lteStateMs[index] - before.lteStateMs[index];
    if (visits == 0 && spent == 0) continue;
    auto part = makeMessageRef<StateHist>();
    part->setRrcState(number);
    part->setInStateCount(u32(visits));
    part->setInStateMs(u32(spent));
    message.addStateHist(part);
    total += spent;
  }
  if (total == 0) return std::nullopt;
  message.setTotalDurationMs(u32(total));
  return payload(message);
}

/// Hands the number of samples of each bin since the last report to `add`.
template <typename Histogram, typename Add>
void forEachNew(const Histogram& now, const Histogram& before, const Add& add) {
  for (std::size_t bin = 0; bin < now.bins.size(); ++bin) add(u32(now.bins[bin] - before.bins[bin]));
}

Payload levelHistogram(const Moment& moment) {
  const network::Counters& now = moment.state.counters;
  const network::Counters& before = moment.baseline->counters;
  if (now.measurements == before.measurements) return std::nullopt;
  CellularLteRsrpRsrqSinrHist message;
  setCommon(message, moment);
  message.setDuration(u32(moment.state.nowMs - moment.baseline->atMs));
  message.setMinRsrpDbm(network::PowerHistogram::kLowest / 100);
  message.setMinRsrqDb(network::QualityHistogram::kLowest / 100);
  message.setMinSinrDbx2(network::SinrHistogram::kLowest / 50);
  forEachNew(now.power[0], before.power[0], [&](std::uint32_t count) { message.addRsrp0(count); });
  forEachNew(now.power[1], before.power[1], [&](std::uint32_t count) { message.addRsrp1(count); });
  forEachNew(now.power[2], before.power[2], [&](std::uint32_t count) { message.addRsrp2(count); });
  forEachNew(now.power[3], before.power[3], [&](std::uint32_t count) { message.addRsrp3(count); });
  forEachNew(now.quality[0], before.quality[0], [&](std::uint32_t count) { message.addRsrq0(count); });
  forEachNew(now.quality[1], before.quality[1], [&](std::uint32_t count) { message.addRsrq1(count); });
  forEachNew(now.quality[2], before.quality[2], [&](std::uint32_t count) { message.addRsrq2(count); });
  forEachNew(now.quality[3], before.quality[3], [&](std::uint32_t count) { message.addRsrq3(count); });
  forEachNew(now.sinr[0], before.sinr[0], [&](std::uint32_t count) { message.addSinr0(count); });
  forEachNew(now.sinr[1], before.sinr[1], [&](std::uint32_t count) { message.addSinr1(count); });
  forEachNew(now.sinr[2], before.sinr[2], [&](std::uint32_t count) { message.addSinr2(count); });
  forEachNew(now.sinr[3], before.sinr[3], [&](std::uint32_t count) { message.addSinr3(count); });
  return payload(message);
}

std::int32_t lteEndCause(event::ConnectionEnd end) {
  using Stats = CellularLteConnectionStats;
  switch (end) {
    case event::ConnectionEnd::Release:
      return Stats::CONN_INFO_CAUSE_RELEASE;
    case event::ConnectionEnd::Handover:
      return Stats::CONN_INFO_CAUSE_HO;
    case event::ConnectionEnd::Failure:
      return Stats::CONN_INFO_CAUSE_OTHER;
  }
  return Stats::CONN_INFO_CAUSE_OTHER;
}

Payload lteConnectionStats(const Moment& moment) {
  constexpr std::uint32_t kAntennas = 4;
  const auto* ended = moment.get<event::ConnectionEnded>();
  if (ended == nullptr || ended->technology != Technology::Lte) return std::nullopt;
  const network::ConnectionUse& use = ended->use;
  const std::uint32_t duration = u32(ended->durationMs);
  CellularLteConnectionStats message;
  setCommon(message, moment);
  message.setDuration(duration);
  message.setMaxUlMod(modulation(use.maxUplink));
  message.setMaxDlMod(modulation(use.maxDownlink));
  message.setMaxNwMimoLyr(ended->cell->txPorts);
  message.setMaxUeRank(use.maxRank);
  message.setMaxRxAnt(kAntennas);
  message.setMaxSchdMimoLyr(use.maxLayersScheduled);
  message.setLteTotalNumCcs(use.maxCarriers);
  message.setLteTotalDlMimoLayers(use.maxTotalLayers);
  std::vector<const Cell*> cells{ended->cell};
  for (const network::SecondaryCarrier& carrier : moment.state.carriers) cells.push_back(carrier.serving.best.cell);
  message.setLteBandCombo(combination(cells));
  auto ability = makeMessageRef<NwUeCapMimoStat>();
  ability->setNwMimoCap(ended->cell->txPorts);
  ability->setUeMimoCap(kAntennas);
  ability->setMaxUeRank(use.maxRank);
  ability->setMaxRxAnt(kAntennas);
  ability->setMaxSchdMimoLyr(use.maxLayersScheduled);
  message.addNwUeCapStat(ability);
  message.setCause(lteEndCause(ended->end));
  message.setConnDuration(duration);
  return payload(message);
}

constexpr MetricKind kLteMetrics[] = {
    {803010,
     on<event::ServingCellChanged, event::Measured>(),
     lteServingCell,
     /*isCurrent=*/true,
     {30000, 600}},
    {803011, on<event::AirMessage>(), lteOtaMsg},
    {803104, on<event::RachAttempt>(), lteRachAttempt},
    {806674, on<event::Measured>(), stateHistory, /*isCurrent=*/true, {120000, 60000}, /*counts=*/true},
    {806660, on<event::Measured>(), levelHistogram, /*isCurrent=*/true, {20000, 200}, /*counts=*/true},
    {806743, on<event::ConnectionEnded>(), lteConnectionStats},
};

}  // namespace

std::span<const MetricKind> lteKinds() {
  return kLteMetrics;
}

}  // namespace quorl::simulator::metrics
