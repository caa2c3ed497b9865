#include "messages/classes/lte_carrier_aggregation.h"
#include "messages/classes/lte_neighbors.h"
#include "messages/classes/lte_rrc.h"
#include "messages/classes/lte_serving_cell.h"
#include "recording/EventKinds.h"

// LTE metrics of the family Ice.

namespace quorl::tool {
namespace {

ByteString iceLteRrcState(RadioWorld& world) {
  using State = KCellularLteRrcState;
  State message;
  setCommon(message, world);
  const bool isConnected = world.chance(50);
  message.setState(isConnected ? KLTE_RRC_STATE_CONNECTED : KLTE_RRC_STATE_IDLE);
  message.setPrevState(isConnected ? KLTE_RRC_STATE_ATMPT_CONNECTION : KLTE_RRC_STATE_ENDING);
  message.setPrevStateDurMs(world.count(40, 30000));
  message.setCause(isConnected ? State::KLTE_RRC_CAUSE_EST_MO_DATA : State::KLTE_RRC_CAUSE_REL_OTHER);
  return payload(message);
}

ByteString iceLteServingCell(RadioWorld& world) {
  KCellularLteScellInfo message;
  setCommon(message, world);
  setLteServingCell(message, world, world.lte().resourceBlocks * 2);
  return payload(message);
}

ByteString measurement(RadioWorld& world) {
  KCellularLteServingCellMeasurement message;
  setCommon(message, world);
  message.setIsConnectedMode(world.chance(50));
  for (std::uint32_t frame = 0; frame < 2; ++frame) {
    auto info = makeMessageRef<RxInfo>();
    const std::int32_t level = world.lteRsrp();
    info->setRssi(level + 28);
    info->setRscp(level);
    info->setEcno(world.rsrqAt(level));
    info->setFrameIndex(frame);
    message.addRxInfo(info);
  }
  return payload(message);
}

/// 0 to 5 for 1.4 to 20 MHz.
std::uint32_t bandwidthCode(const LteCell& cell) {
  switch (cell.resourceBlocks) {
    case 6:
      return 0;
    case 15:
      return 1;
    case 25:
      return 2;
    case 50:
      return 3;
    case 75:
      return 4;
    default:
      return 5;
  }
}

ByteString aggregation(RadioWorld& world) {
  using Carrier = SecondaryComponentCarrier;
  KCellularLteCarrierAggregationStatus message;
  setCommon(message, world);
  const std::uint32_t carriers = world.count(1, 3);
  for (std::uint32_t index = 0; index < carriers; ++index) {
    const LteCell& cell = world.lte(index + 1);
    auto carrier = makeMessageRef<Carrier>();
    carrier->setIndex(index + 1);
    carrier->setState(world.oneOf({Carrier::SCC_STATE_CONFIGURED_DEACTIVATED, Carrier::SCC_STATE_ACTIVATED}));
    carrier->setPci(cell.pci);
    carrier->setDlEarfcn(cell.dlEarfcn);
    carrier->setDlRfBand(cell.band);
    carrier->setDlBandwidth(bandwidthCode(cell));
    carrier->setHasUplink(index == 0);
    if (index == 0) {
      carrier->setUlEarfcn(cell.ulEarfcn);
      carrier->setUlRfBand(cell.band);
      carrier->setUlBandwidth(bandwidthCode(cell));
    }
    const std::int32_t level = world.lteRsrp();
    carrier->setRsrp(level * 100 + world.number(0, 99));
    carrier->setRsrq(world.rsrqAt(level) * 100 + world.number(0, 99));
    carrier->setSnr(world.sinrAt(level));
    carrier->setRssi((level + 28) * 100 + world.number(0, 99));
    message.addSccList(carrier);
  }
  return payload(message);
}

ByteString cdrx(RadioWorld& world) {
  KCellularLteCdrxConfig message;
  setCommon(message, world);
  message.setCellStatus(1);
  message.setOnDurationMs(world.oneOf({4U, 8U, 10U}));
  message.setDrxInactivityMs(world.oneOf({40U, 80U, 100U}));
  message.setDrxRetxTimerMs(8);
  message.setLongDrxCycleMs(world.oneOf({160U, 320U}));
  message.setShortDrxCycleMs(40);
  message.setDrxShortCycleNum(world.count(1, 4));
  message.setRrcState(world.oneOf({KLTE_RRC_STATE_CONNECTED, KLTE_RRC_STATE_IDLE}));
  message.setCdrxConfigStatus(1);
  message.setTransmissionMode(world.count(3, 4));
  return payload(message);
}

MessageRef<NbrEutra> neighbourFrequency(RadioWorld& world) {
  const LteCell& cell = world.lte(2);
  auto frequency = makeMessageRef<NbrEutra>();
  frequency->setEarfcn(cell.dlEarfcn);
  frequency->setQRxlevMin(-124);
  frequency->setQQualMin(-18);
  frequency->setQOffset(0);
  frequency->setPmax(23);
  frequency->setDlBw(cell.resourceBlocks * 2);
  frequency->setThresXHighP(world.count(8, 22));
  frequency->setThresXLowP(world.count(4, 12));
  frequency->setPriority(world.count(1, 7));
  frequency->setFrameType(NbrEutra::FDD);
  frequency->setBand(cell.band);
  frequency->setTReselection(1);
  frequency->addPci(cell.pci);
  return frequency;
}

ByteString reselection(RadioWorld& world) {
  KCellularLteSelReselCellInfo message;
  setCommon(message, world);
  const LteCell& cell = world.lte();
  message.addMultiBandInfo(cell.band);
  message.setImsEmergencySupport(1);
  message.setAcBarringForEmergency(0);
  message.setQRxLevMin(-124);
  message.setQQualMin(-18);
  message.setQHyst(world.count(2, 6));
  message.setSNonIntraSearchP(world.count(4, 20));
  message.setSIntraSearchP(world.count(30, 62));
  message.setThreshServingLowP(world.count(2, 10));
  message.setPriorityOperatingFreq(world.count(4, 7));
  message.addNbrEutra(neighbourFrequency(world));
  message.setDlEarfcn(cell.dlEarfcn);
  message.setPci(cell.pci);
  message.setDlBandwidth(bandwidthCode(cell));
  message.setDlRfBand(cell.band);
  message.addIntraFreqPci(world.lte(1).pci);
  auto utra = makeMessageRef<UtraReselectionInfo>();
  utra->setTReselection(1);
  auto utraCell = makeMessageRef<UtraNeighborCell>();
  utraCell->setUarfcn(world.umts().uarfcn);
  utraCell->setQRxlevMin(-115);
  utraCell->setPriority(2);
  utraCell->setDuplexMode(UtraNeighborCell::KCELLULAR_FREQ_DIVISION_DUPLEX);
  utra->addUtraNcell(utraCell);
  message.setUtraReselInfo(utra);
  auto gera = makeMessageRef<GeraReselectionInfo>();
  gera->setTReselection(2);
  auto geraCell = makeMessageRef<GeraNeighborCell>();
  geraCell->setArfcn(world.gsm().arfcn);
  geraCell->setQRxlevMin(-110);
  geraCell->setPriority(1);
  gera->addGeraNcell(geraCell);
  message.setGeraReselInfo(gera);
  return payload(message);
}

ByteString carriers(RadioWorld& world) {
  KCellularLteComponentCarrierInfo message;
  setCommon(message, world);
  message.setPccEarfcn(world.lte().dlEarfcn);
  message.setScc0Earfcn(world.lte(1).dlEarfcn);
  message.setPccBandwidth(bandwidthCode(world.lte()));
  message.setScc0Bandwidth(bandwidthCode(world.lte(1)));
  message.setPccRfBand(world.lte().band);
  message.setScc0RfBand(world.lte(1).band);
  for (std::size_t ahead = 0; ahead < 2; ++ahead) {
    auto carrier = makeMessageRef<ComponentCarrierInfo>();
    carrier->setDlEarfcn(world.lte(ahead).dlEarfcn);
    carrier->setDlBandwidth(static_cast<std::int32_t>(bandwidthCode(world.lte(ahead))));
    carrier->setDlRfBand(world.lte(ahead).band);
    message.addCarrierInfo(carrier);
  }
  return payload(message);
}

ByteString txPower(RadioWorld& world) {
  KCellularLteTxPower message;
  setCommon(message, world);
  for (std::uint32_t frame = 0; frame < 2; ++frame) {
    auto info = makeMessageRef<TxPowerInfo>();
    info->setDpcchTxPower(world.number(-30, 10));
    info->setTotalTxPower(world.number(-12, 23));
    info->setFrameIndex(frame);
    message.addTxPowerInfo(info);
  }
  message.setVolteCallId(Text("invented-call-a"));
  message.setLastPcellDlBand(world.lte().band);
  message.setLastScellUlBand(world.lte(1).band);
  message.setLastPcellDlBw(world.oneOf({N50, N75, N100}));
  message.setLastScellUlBw(world.oneOf({N25, N50}));
  return payload(message);
}

ByteString otherTechnologies(RadioWorld& world) {
  KCellularLteNbrInterRatCellMeas message;
  setCommon(message, world);
  auto utra = makeMessageRef<EgwErrcNbrUtraMeas>();
  utra->setUarfcn(world.umts().uarfcn);
  utra->setPsc(world.umts().psc);
  utra->setRscp(world.umtsRscp());
  utra->setEcno(world.count(10, 40));
  message.addMeasNbrUtra(utra);
  auto geran = makeMessageRef<EgwErrcNbrGeranMeas>();
  geran->setArfcn(world.gsm().arfcn);
  geran->setBsic(world.gsm().bsic);
  geran->setRxlev(world.count(10, 50));
  message.addMeasNbrGeran(geran);
  return payload(message);
}

ByteString neighbours(RadioWorld& world) {
  KCellularLteNbrEutraCellMeas message;
  setCommon(message, world);
  const std::uint32_t cells = world.count(1, 3);
  for (std::uint32_t ahead = 1; ahead <= cells; ++ahead) {
    auto cell = makeMessageRef<EgwErrcNbrEutraMeas>();
    const std::int32_t level = world.lteRsrp() - 6;
    cell->setNbrEarfcn(world.lte(ahead).dlEarfcn);
    cell->setNbrPhysCellId(world.lte(ahead).pci);
    cell->setFreqBandInd(world.lte(ahead).band);
    cell->setNbrRsrp(level);
    cell->setNbrRsrq(world.rsrqAt(level));
    message.addMeasNbrEutra(cell);
  }
  return payload(message);
}

constexpr EventKind kIceLteEvents[] = {
    {3952132, kOftenMs, iceLteRrcState},
    {3948738, kOftenMs, iceLteServingCell},
    {3986177, kOftenMs, measurement},
    {3986195, kOftenMs, aggregation},
    {3952152, kNowAndThenMs, cdrx},
    {3986190, kNowAndThenMs, reselection},
    {3986187, kNowAndThenMs, carriers},
    {3986178, kOftenMs, txPower},
    {3986192, kNowAndThenMs, otherTechnologies},
    {3986191, kOftenMs, neighbours},
};

}  // namespace

std::span<const EventKind> iceLteKinds() {
  return kIceLteEvents;
}

}  // namespace quorl::tool
