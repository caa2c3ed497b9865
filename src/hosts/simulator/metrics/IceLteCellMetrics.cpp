#include <algorithm>

#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/MessageRef.h"
#include "messages/classes/lte_mobility.h"
#include "messages/classes/lte_neighbors.h"
#include "messages/classes/lte_serving_cell.h"

// LTE cells of family Ice: the serving one and its neighbours, measured and broadcast.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::Cell;
using network::CellMeasurement;
using network::ServingMeasurement;
using network::SubscriptionState;
using network::Technology;

namespace {

Payload iceServingCell(const Moment& moment) {
  const ServingMeasurement* serving = lteServing(moment.state);
  if (serving == nullptr) return std::nullopt;
  const Cell& cell = *serving->best.cell;
  KCellularLteScellInfo message;
  setCommon(message, moment);
  setLteServingCell(message, cell, resourceBlocks(cell) * 2);
  return payload(message);
}

Payload measurement(const Moment& moment) {
  constexpr std::size_t kReported = 2;
  const ServingMeasurement* serving = lteServing(moment.state);
  if (serving == nullptr) return std::nullopt;
  KCellularLteServingCellMeasurement message;
  setCommon(message, moment);
  message.setIsConnectedMode(isConnected(moment.state));
  const std::size_t antennas = std::min<std::size_t>(serving->antennas, kReported);
  for (std::size_t antenna = 0; antenna < antennas; ++antenna) {
    auto info = makeMessageRef<RxInfo>();
    info->setRssi(whole(serving->best.rssi + serving->antennaPower[antenna] - serving->best.power));
    info->setRscp(whole(serving->antennaPower[antenna]));
    info->setEcno(whole(serving->antennaQuality[antenna]));
    info->setFrameIndex(u32(antenna));
    message.addRxInfo(info);
  }
  return payload(message);
}

/// Frequencies of cells that were met, strongest first, each once.
std::vector<const CellMeasurement*> onePerFrequency(const std::vector<CellMeasurement>& measured,
                                                    Technology technology) {
  std::vector<const CellMeasurement*> chosen;
  for (const CellMeasurement& each : measured) {
    const auto isSame = [&each](const CellMeasurement* other) {
      return other->cell->downlinkChannel == each.cell->downlinkChannel;
    };
    if (each.cell->technology != technology || std::any_of(chosen.begin(), chosen.end(), isSame)) continue;
    chosen.push_back(&each);
    if (chosen.size() == kMostNeighbours) break;
  }
  return chosen;
}

MessageRef<NbrEutra> neighbourFrequency(const SubscriptionState& state, const Cell& cell) {
  const network::ReselectionParameters& parameters = state.reselection;
  auto frequency = makeMessageRef<NbrEutra>();
  frequency->setEarfcn(cell.downlinkChannel);
  frequency->setQRxlevMin(parameters.qRxLevMin);
  frequency->setQQualMin(parameters.qQualMin);
  frequency->setQOffset(0);
  frequency->setPmax(kMostLtePower);
  frequency->setDlBw(resourceBlocks(cell) * 2);
  frequency->setThresXHighP(u32(parameters.higherThreshold));
  frequency->setThresXLowP(u32(parameters.lowerThreshold));
  frequency->setPriority(cell.priority);
  frequency->setFrameType(cell.isTdd ? NbrEutra::TDD : NbrEutra::FDD);
  frequency->setBand(cell.band);
  frequency->setTReselection(parameters.reselectionSeconds);
  frequency->addPci(cell.physicalId);
  return frequency;
}

MessageRef<UtraReselectionInfo> umtsReselection(const SubscriptionState& state) {
  constexpr std::int32_t kLeastLevel = -115;
  auto info = makeMessageRef<UtraReselectionInfo>();
  info->setTReselection(state.reselection.reselectionSeconds);
  for (const CellMeasurement* each : onePerFrequency(state.otherNeighbours, Technology::Umts)) {
    auto cell = makeMessageRef<UtraNeighborCell>();
    cell->setUarfcn(each->cell->downlinkChannel);
    cell->setQRxlevMin(kLeastLevel);
    cell->setPriority(each->cell->priority);
    cell->setDuplexMode(UtraNeighborCell::KCELLULAR_FREQ_DIVISION_DUPLEX);
    info->addUtraNcell(cell);
  }
  return info;
}

MessageRef<GeraReselectionInfo> gsmReselection(const SubscriptionState& state) {
  constexpr std::int32_t kLeastLevel = -110;
  auto info = makeMessageRef<GeraReselectionInfo>();
  info->setTReselection(state.reselection.reselectionSeconds);
  for (const CellMeasurement* each : onePerFrequency(state.otherNeighbours, Technology::Gsm)) {
    auto cell = makeMessageRef<GeraNeighborCell>();
    cell->setArfcn(each->cell->downlinkChannel);
    cell->setQRxlevMin(kLeastLevel);
    cell->setPriority(each->cell->priority);
    info->addGeraNcell(cell);
  }
  return info;
}

Payload lteReselection(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  const ServingMeasurement* serving = lteServing(state);
  if (serving == nullptr) return std::nullopt;
  const Cell& cell = *serving->best.cell;
  const network::ReselectionParameters& parameters = state.reselection;
  KCellularLteSelReselCellInfo message;
  setCommon(message, moment);
  message.addMultiBandInfo(cell.band);
  message.setImsEmergencySupport(state.registration.isEmergencySupported ? 1 : 0);
  message.setAcBarringForEmergency(0);
  message.setQRxLevMin(parameters.qRxLevMin);
  message.setQQualMin(parameters.qQualMin);
  message.setQHyst(u32(parameters.hysteresis));
  message.setSNonIntraSearchP(u32(parameters.nonIntraSearch));
  message.setSIntraSearchP(u32(parameters.intraSearch));
  message.setThreshServingLowP(u32(parameters.servingLow));
  message.setPriorityOperatingFreq(cell.priority);
  for (const CellMeasurement* each : onePerFrequency(state.neighbours, Technology::Lte))
    if (each->cell->downlinkChannel != cell.downlinkChannel)
      message.addNbrEutra(neighbourFrequency(state, *each->cell));
  message.setDlEarfcn(cell.downlinkChannel);
  message.setPci(cell.physicalId);
  message.setDlBandwidth(bandwidthCode(cell));
  message.setDlRfBand(cell.band);
  std::size_t listed = 0;
  for (const CellMeasurement& each : state.neighbours) {
    if (each.cell->downlinkChannel != cell.downlinkChannel || listed == kMostNeighbours) continue;
    message.addIntraFreqPci(each.cell->physicalId);
    ++listed;
  }
  message.setUtraReselInfo(umtsReselection(state));
  message.setGeraReselInfo(gsmReselection(state));
  return payload(message);
}

Payload otherTechnologies(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  if (lteServing(state) == nullptr || state.otherNeighbours.empty()) return std::nullopt;
  KCellularLteNbrInterRatCellMeas message;
  setCommon(message, moment);
  std::size_t umtsCells = 0;
  std::size_t gsmCells = 0;
  for (const CellMeasurement& each : state.otherNeighbours) {
    if (each.cell->technology == Technology::Umts && umtsCells < kMostNeighbours) {
      auto cell = makeMessageRef<EgwErrcNbrUtraMeas>();
      cell->setUarfcn(each.cell->downlinkChannel);
      cell->setPsc(each.cell->physicalId);
      cell->setRscp(whole(each.power));
      cell->setEcno(ecnoCode(each.quality));
      message.addMeasNbrUtra(cell);
      ++umtsCells;
    } else if (each.cell->technology == Technology::Gsm && gsmCells < kMostNeighbours) {
      auto cell = makeMessageRef<EgwErrcNbrGeranMeas>();
      cell->setArfcn(each.cell->downlinkChannel);
      cell->setBsic(each.cell->physicalId);
      cell->setRxlev(rxlev(each.power));
      message.addMeasNbrGeran(cell);
      ++gsmCells;
    }
  }
  if (umtsCells + gsmCells == 0) return std::nullopt;
  return payload(message);
}

Payload lteNeighbours(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  if (lteServing(state) == nullptr || state.neighbours.empty()) return std::nullopt;
  KCellularLteNbrEutraCellMeas message;
  setCommon(message, moment);
  const std::size_t count = std::min(state.neighbours.size(), kMostNeighbours);
  for (std::size_t i = 0; i < count; ++i) {
    const CellMeasurement& each = state.neighbours[i];
    auto cell = makeMessageRef<EgwErrcNbrEutraMeas>();
    cell->setNbrEarfcn(each.cell->downlinkChannel);
    cell->setNbrPhysCellId(each.cell->physicalId);
    cell->setFreqBandInd(each.cell->band);
    cell->setNbrRsrp(whole(each.power));
    cell->setNbrRsrq(whole(each.quality));
    message.addMeasNbrEutra(cell);
  }
  return payload(message);
}

constexpr MetricKind kIceLteCellMetrics[] = {
    {3948738,
     on<event::ServingCellChanged, event::Measured>(),
     iceServingCell,
     /*isCurrent=*/true,
     {30000, 5000}},
    {3986177, on<event::Measured>(), measurement, /*isCurrent=*/true, {5000, 200}},
    {3986190, on<event::ServingCellChanged>(), lteReselection, /*isCurrent=*/true},
    {3986192, on<event::Measured>(), otherTechnologies, /*isCurrent=*/true, {20000, 1000}},
    {3986191, on<event::Measured>(), lteNeighbours, /*isCurrent=*/true, {10000, 400}},
};

}  // namespace

std::span<const MetricKind> iceLteCellKinds() {
  return kIceLteCellMetrics;
}

}  // namespace quorl::simulator::metrics
