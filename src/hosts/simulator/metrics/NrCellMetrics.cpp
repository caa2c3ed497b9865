#include "hosts/simulator/metrics/AirMessages.h"
#include "hosts/simulator/metrics/BeamFields.h"
#include "messages/classes/lte_signalling.h"

// The NR cell of family Mav: system information, messages over the air, serving cell, random access, beams.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::Cell;
using network::ServingMeasurement;
using network::Technology;

MessageRef<ServingCellBeamInfo> beamFields(const Moment& moment, const Cell& cell, std::uint8_t beam,
                                           network::Centi power) {
  constexpr network::Centi kBeamGain = 200;  // of the receive beam over the cell's level
  auto info = makeMessageRef<ServingCellBeamInfo>();
  info->setCellPci(cell.physicalId);
  info->setSsbIndex(beam);
  const std::uint32_t receiveBeam = detail(moment, cell.index, beam, 16);
  info->addRxBeamId(receiveBeam);
  info->addRxBeamId(receiveBeam + 16);
  info->setNumDetectedTxBeams(1 + detail(moment, cell.index, moment.timestampMs, cell.beams));
  info->setAntennaPanelIndex(beam % 2U);
  info->setCellRsrp(whole(power));
  const ServingMeasurement* serving = nrServing(moment.state);
  if (serving != nullptr && serving->best.cell == &cell) info->setCellRsrq(whole(serving->best.quality));
  info->setRasterArfcn(cell.downlinkChannel);
  info->setRxBeamRsrp(whole(power + kBeamGain));
  return info;
}

namespace {

Payload sysInfoBlocks(const Moment& moment) {
  const auto* read = moment.get<event::SystemInformationRead>();
  if (read == nullptr || read->cell->technology != Technology::Nr) return std::nullopt;
  const Cell& cell = *read->cell;
  CellularNrSysInfoBlocks message;
  setCommon(message, moment);
  setNetwork(message, cell.plmn);
  message.setCellId(u32(cell.cellId));
  message.setFreq(cell.downlinkChannel);
  message.setPhyCellId(cell.physicalId);
  message.setFreqBandInd(cell.band);
  message.setTrackingAreaCode(cell.areaCode);
  message.setValueTag(read->valueTag);
  auto mib = makeMessageRef<Mib>();
  mib->setSubCarrierSpacing(cell.subCarrierSpacingKhz);
  mib->setSsbSubCarrierOffset(detail(moment, cell.index, 1, 12));
  mib->setMibContent(content(moment, 3));
  message.setMib(mib);
  auto sib = makeMessageRef<Sib>();
  sib->setBitMask(1);
  sib->setContent(content(moment, 24));
  message.addSib(sib);
  return payload(message);
}

std::int32_t channelNumber(AirChannel channel) {
  switch (channel) {
    case AirChannel::Bcch:
      return 1;
    case AirChannel::BcchShared:
      return 2;
    case AirChannel::DownlinkCommon:
      return 3;
    case AirChannel::DownlinkDedicated:
      return 4;
    case AirChannel::Pcch:
      return 5;
    case AirChannel::UplinkCommon:
      return 6;
    case AirChannel::UplinkDedicated:
      return 8;
  }
  return 0;
}

Payload nrOtaMsg(const Moment& moment) {
  const auto* air = moment.get<event::AirMessage>();
  if (air == nullptr || air->cell->technology != Technology::Nr) return std::nullopt;
  const Cell& cell = *air->cell;
  const AirType type = nrAirType(air->kind);
  CellularNrOtaMsg message;
  setCommon(message, moment);
  setNetwork(message, cell.plmn);
  message.setPhyCellId(cell.physicalId);
  message.setFreq(cell.downlinkChannel);
  message.setRbId(air->bearer);
  message.setChannel(channelNumber(type.channel));
  message.setMsgType(type.number);
  message.setLength(air->length);
  message.setContent(content(moment, air->length));
  message.setDlBw(resourceBlocks(cell));
  message.setCellId(u32(cell.cellId));
  message.setFreqBandInd(cell.band);
  message.setTrackingAreaCode(cell.areaCode);
  const ServingMeasurement* lte = lteServing(moment.state);
  message.setDeployment(lte != nullptr ? DEPLOYMENT_NSA : DEPLOYMENT_SA);
  message.setFreqRange(frequencyRange(cell));
  if (lte != nullptr) {
    message.setLteGci(u32(lte->best.cell->cellId));
    message.setLteBw(resourceBlocks(*lte->best.cell));
  }
  message.setBwp(detail(moment, cell.index, 2, 2));
  message.setSsbCount(cell.beams);
  message.setSubCarrierSpacing(cell.subCarrierSpacingKhz);
  message.setTddUlDlConfigurationCommon(cell.isTdd ? 1 : 0);
  message.setSplitBearerEver(moment.state.use.hadSecondaryGroup);
  return payload(message);
}

Payload nrServingCell(const Moment& moment) {
  const ServingMeasurement* serving = nrServing(moment.state);
  if (serving == nullptr) return std::nullopt;
  const Cell& cell = *serving->best.cell;
  CellularNrScellInfo message;
  setCommon(message, moment);
  setServingCell(message, cell, resourceBlocks(cell));
  message.setAllowedAccess(1);
  return payload(message);
}

Payload nrRachAttempt(const Moment& moment) {
  constexpr network::Centi kOpenLoopPower = 1000;
  const auto* attempt = moment.get<event::RachAttempt>();
  if (attempt == nullptr || attempt->cell->technology != Technology::Nr) return std::nullopt;
  const Cell& cell = *attempt->cell;
  CellularNrRachAttempt message;
  setCommon(message, moment);
  message.setNumAttempt(attempt->preambles);
  message.setRachResult(u32(attempt->result));
  message.setRachContention(attempt->isContentionBased ? 1 : 0);
  message.setSsbId(attempt->beam);
  message.setCsiRsId(0);
  message.setCarrierId(0);
  message.setLastTxPower(whole(attempt->transmitPower));
  message.setTac(cell.areaCode);
  message.setCellId(u32(cell.cellId));
  message.setAccbState(0);
  message.setRachReason(u32(attempt->reason));
  message.setTxPowerDiff(whole(attempt->transmitPower - kOpenLoopPower));
  message.setDcMode(lteServing(moment.state) != nullptr ? 1 : 0);
  message.setFreqRange(frequencyRange(cell));
  message.setFreqBandInd(cell.band);
  message.addServingCellBeamInfo(beamFields(moment, cell, attempt->beam, attempt->power));
  return payload(message);
}

Payload beamSwitch(const Moment& moment) {
  constexpr double kSpeedOfLight = 299792458.0;
  const auto* turn = moment.get<event::BeamSwitched>();
  if (turn == nullptr) return std::nullopt;
  const Cell& cell = *turn->cell;
  CellularNrBeamSwitch message;
  setCommon(message, moment);
  message.setDurationBeforeSwitch(turn->durationBeforeMs);
  message.addOldBeamInfo(beamFields(moment, cell, turn->from, turn->fromPower));
  message.addThenewBeamInfo(beamFields(moment, cell, turn->to, turn->toPower));
  message.setMotionState(motion(moment.state.surroundings.motion));
  const double hertz = static_cast<double>(cell.downlinkKhz) * 1000.0;
  message.setDopplerEstimate(u32(moment.state.surroundings.metresPerSecond * hertz / kSpeedOfLight));
  message.setBandInd(cell.band);
  return payload(message);
}

constexpr MetricKind kNrCellMetrics[] = {
    {806912, on<event::SystemInformationRead>(), sysInfoBlocks},
    {806913, on<event::AirMessage>(), nrOtaMsg},
    {806914,
     on<event::ServingCellChanged, event::SecondaryGroupAdded, event::Measured>(),
     nrServingCell,
     /*isCurrent=*/true,
     {30000, 600}},
    {806915, on<event::RachAttempt>(), nrRachAttempt},
    {806922, on<event::BeamSwitched>(), beamSwitch},
};

}  // namespace

std::span<const MetricKind> nrCellKinds() {
  return kNrCellMetrics;
}

}  // namespace quorl::simulator::metrics
