#include "messages/classes/gsm.h"
#include "messages/classes/lte_serving_cell.h"
#include "messages/classes/wcdma_cell.h"
#include "messages/classes/wcdma_connection.h"
#include "recording/EventKinds.h"

// UMTS and GSM metrics of the family Ice.

namespace quorl::tool {
namespace {

ByteString umtsState(RadioWorld& world) {
  using State = KCellularWcdmaRrcConnectionState;
  State message;
  setCommon(message, world);
  message.setState(world.oneOf({State::KWCDMA_RRC_CONN_STATE_IDLE, State::KWCDMA_RRC_CONN_STATE_CELL_FACH,
                                State::KWCDMA_RRC_CONN_STATE_CELL_DCH}));
  message.setEstablishmentCause(world.oneOf({State::KRRC_EST_ORIG_CONV_CALL, State::KRRC_EST_REGISTRATION}));
  message.setReleaseCause(world.oneOf({State::KRRC_REL_NORMAL_EVENT, State::KRRC_REL_USER_INACTIVITY}));
  return payload(message);
}

ByteString umtsConfiguration(RadioWorld& world) {
  KCellularWcdmaRrcConfiguration message;
  setCommon(message, world);
  message.setDrxCycleLengthMs(world.oneOf({640U, 1280U, 2560U}));
  message.setIsMimoConfigured(false);
  message.setIsDcConfigured(world.chance(50));
  return payload(message);
}

ByteString umtsCell(RadioWorld& world) {
  KCellularWcdmaCellInfo message;
  setCommon(message, world);
  setNetwork(message, world);
  message.setLac(world.umts().lac);
  message.setCellId(world.umts().cellId);
  message.setWcdmaBand(SYS_BAND_WCDMA_I_IMT_2000);
  message.setDlUarfcn(world.umts().uarfcn);
  message.setPsc(world.umts().psc);
  message.setHspa(KCellularWcdmaCellInfo::SYS_HS_IND_HSDPA_HSUPA_SUPP_CELL);
  return payload(message);
}

ByteString umtsMeasurement(RadioWorld& world) {
  KCellularWcdmaScellMeasurement message;
  setCommon(message, world);
  message.setConnectedMode(world.chance(50));
  for (std::uint32_t frame = 0; frame < 2; ++frame) {
    auto info = makeMessageRef<RxInfo>();
    const std::int32_t level = world.umtsRscp();
    info->setRssi(level + 8);
    info->setRscp(level);
    info->setEcno(world.number(-14, -3));
    info->setFrameIndex(frame);
    message.addRxInfo(info);
  }
  return payload(message);
}

ByteString umtsPower(RadioWorld& world) {
  KCellularWcdmaTxPower message;
  setCommon(message, world);
  auto info = makeMessageRef<TxPowerInfo>();
  info->setDpcchTxPower(world.number(-40, 10));
  info->setTotalTxPower(world.number(-30, 24));
  info->setFrameIndex(0);
  message.addTxPowerInfo(info);
  return payload(message);
}

ByteString umtsReselection(RadioWorld& world) {
  KCellularWcdmaSelReselCellInfo message;
  setCommon(message, world);
  message.setHsdpaCapable(1);
  message.setEdchCapable(1);
  message.setDuplexMode(KCellularWcdmaSelReselCellInfo::FDD);
  message.addMultiBandInfo(1);
  message.setImsEmergencySupport(0);
  message.setCellBarred(0);
  message.setSRxlev(world.number(10, 40));
  message.setSQual(world.number(4, 18));
  message.setSIntrasearch(10);
  message.setSIntersearch(8);
  message.setSSearchRat(4);
  message.setSCellPrio(2);
  auto eutra = makeMessageRef<EutraFreqInfo>();
  eutra->setEarfcn(world.lte().dlEarfcn);
  eutra->setPrio(5);
  message.addEutraPrioInfo(eutra);
  auto utra = makeMessageRef<UtraFreqInfo>();
  utra->setUarfcn(world.umts(1).uarfcn);
  utra->setPrio(2);
  message.addUtraPrioInfo(utra);
  auto gsm = makeMessageRef<GsmFreqInfo>();
  gsm->setArfcn(world.gsm().arfcn);
  gsm->setPrio(1);
  message.addGsmPrioInfo(gsm);
  return payload(message);
}

ByteString umtsNeighbours(RadioWorld& world) {
  KCellularWcdmaNbrCellMeas message;
  setCommon(message, world);
  for (std::size_t ahead = 1; ahead < 3; ++ahead) {
    auto cell = makeMessageRef<UtraCellMeasResult>();
    cell->setUarfcn(world.umts(ahead).uarfcn);
    cell->setBand(1);
    cell->setPsc(world.umts(ahead).psc);
    cell->setEcno(world.count(8, 40));
    cell->setRscp(world.umtsRscp() + 116);
    message.addMeasUtraResult(cell);
  }
  auto gsm = makeMessageRef<GsmCellMeasResult>();
  gsm->setArfcn(world.gsm().arfcn);
  gsm->setBsic(world.gsm().bsic);
  gsm->setRxlev(world.count(10, 50));
  message.addMeasGsmResult(gsm);
  auto lte = makeMessageRef<LteCellMeasResult>();
  const std::int32_t level = world.lteRsrp();
  lte->setEarfcn(world.lte().dlEarfcn);
  lte->setPhyCellId(world.lte().pci);
  lte->setEutraBand(world.lte().band);
  lte->setRsrp(level);
  lte->setRsrq(world.rsrqAt(level));
  message.addMeasLteResult(lte);
  return payload(message);
}

ByteString gsmCell(RadioWorld& world) {
  KCellularGsmScellInfo message;
  setCommon(message, world);
  setNetwork(message, world);
  message.setLac(world.gsm().lac);
  message.setCellId(world.gsm().cellId);
  message.setGsmBand(SYS_BAND_GSM_EGSM_900);
  message.setArfcn(world.gsm().arfcn);
  message.setBsic(world.gsm().bsic);
  message.setState(world.chance(20) ? KCellularGsmScellInfo::DEDICATED_STATE
                                    : KCellularGsmScellInfo::NON_DEDICATED_STATE);
  return payload(message);
}

constexpr EventKind kIceCircuitSwitchedEvents[] = {
    {3985682, kOftenMs, umtsState},           {3985683, kNowAndThenMs, umtsConfiguration},
    {3944460, kNowAndThenMs, umtsCell},       {3985666, kOftenMs, umtsMeasurement},
    {3985667, kNowAndThenMs, umtsPower},      {3985668, kNowAndThenMs, umtsReselection},
    {3985669, kNowAndThenMs, umtsNeighbours}, {3943948, kNowAndThenMs, gsmCell},
};

}  // namespace

std::span<const EventKind> iceCircuitSwitchedKinds() {
  return kIceCircuitSwitchedEvents;
}

}  // namespace quorl::tool
