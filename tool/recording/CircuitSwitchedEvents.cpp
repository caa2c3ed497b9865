#include "messages/classes/call_end.h"
#include "messages/classes/call_fallback.h"
#include "messages/classes/cdma.h"
#include "messages/classes/gsm.h"
#include "messages/classes/wcdma_connection.h"
#include "recording/EventKinds.h"

// Calls and the older technologies of the family Mav.

namespace quorl::tool {
namespace {

ByteString cdmaCell(RadioWorld& world) {
  CellularCdmaCellInfo message;
  setCommon(message, world);
  setNetwork(message, world);
  message.setRat(SYS_MODE_CDMA);
  message.setSrvStatus(SYS_SRV_STATUS::SYS_SRV_STATUS_SRV);
  message.setIs95Sid(4200);
  message.setIs95Nid(world.count(1, 60));
  message.setSectorId(world.bytes(16));
  message.setBand(SYS_BAND_BC0);
  message.setChannel(world.oneOf({283U, 384U, 777U}));
  message.setBaseId(world.count(100, 900));
  message.setZoneId(1);
  message.setHdrSrvStatus(SYS_SRV_STATUS::SYS_SRV_STATUS_NO_SRV);
  message.setHdrHybrid(false);
  message.setPilotPn(world.count(0, 511));
  return payload(message);
}

ByteString gsmWcdmaCell(RadioWorld& world) {
  using Cell = CellularGsmWcdmaCellInfo;
  Cell message;
  setCommon(message, world);
  setNetwork(message, world);
  message.setSrvStatus(SYS_SRV_STATUS::SYS_SRV_STATUS_SRV);
  message.setSrvDomain(SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_CS_PS);
  if (world.chance(60)) {
    message.setRat(SYS_MODE_WCDMA);
    message.setLac(world.umts().lac);
    message.setCellId(world.umts().cellId);
    message.setWcdmaBand(SYS_BAND_WCDMA_I_IMT_2000);
    message.setDlUarfcn(world.umts().uarfcn);
    message.setPsc(world.umts().psc);
    message.setHspa(Cell::SYS_HS_IND_HSDPA_HSUPA_SUPP_CELL);
  } else {
    message.setRat(SYS_MODE_GSM);
    message.setLac(world.gsm().lac);
    message.setCellId(world.gsm().cellId);
    message.setGsmBand(SYS_BAND_GSM_EGSM_900);
    message.setGsmArfcn(world.gsm().arfcn);
  }
  message.setFmtId(1);
  return payload(message);
}

ByteString wcdmaState(RadioWorld& world) {
  CellularWcdmaRrcState message;
  setCommon(message, world);
  message.setRrcState(world.oneOf({WCDMA_RRC_STATE_DISCONNECTED, WCDMA_RRC_STATE_CELL_FACH}));
  message.setNewRrcState(world.oneOf({WCDMA_RRC_STATE_CONNECTING, WCDMA_RRC_STATE_CELL_DCH}));
  message.setPrevStateDurMs(world.count(200, 60000));
  return payload(message);
}

ByteString callEnd(RadioWorld& world) {
  using Call = CellularCallEndDetails;
  Call message;
  setCommon(message, world);
  setNetwork(message, world);
  const bool isConnected = world.chance(80);
  message.setCallEvent(Call::CM_CALL_EVENT_END);
  message.setCallId(world.count(1, 7));
  message.setDirection(world.oneOf({CM_CALL_DIRECTION_MO, CM_CALL_DIRECTION_MT}));
  message.setSrvType(Call::CM_SRV_TYPE_LTE);
  message.setSysMode(SYS_MODE_LTE);
  message.setCallState(Call::CM_CALL_STATE_CONV);
  message.setEndStatus(world.oneOf({16, 25, 29}));
  message.setCallDuration(isConnected ? world.number(4, 400) : 0);
  message.setCcCause(isConnected ? 16 : 31);
  message.setAntenna(ARTD_ANT0);
  message.setCallType(Call::CM_CALL_TYPE_VOICE);
  message.setEstablished(true);
  message.setConnected(isConnected);
  message.setLteCellId(world.lte().cellId);
  message.setLteLac(world.lte().tac);
  message.setMrabEver(world.chance(20));
  message.setMrabEnd(false);
  message.setBand(SYS_BAND_LTE_EUTRAN_BAND3);
  message.setRfChannel(world.lte().dlEarfcn);
  message.setSetupSysMode(SYS_MODE_LTE);
  message.setSetupDirection(CM_CALL_DIRECTION_MO);
  message.setMsOrigToConf(world.count(300, 1500));
  message.setMsOrigToEnd(world.count(4000, 400000));
  message.setMsStartToAlert(world.count(900, 3000));
  message.setRssiDbm(world.lteRsrp() + 28);
  message.setTxPwrDbm(world.number(-10, 23));
  auto capacitive = makeMessageRef<CapEvent>();
  capacitive->setCapState(CapEvent::CFG_HEAD);
  capacitive->setMsBeforeCallEnd(world.count(500, 9000));
  message.addCapEvent(capacitive);
  auto measured = makeMessageRef<RfMeasInfo>();
  measured->setMag(world.number(-20, 0));
  measured->setPhase(world.number(-180, 180));
  measured->setTxPwrDb2(world.number(-20, 46));
  message.addRfMeasInfo(measured);
  message.setTransId(Text(world.chance(50) ? "invented-call-a" : "invented-call-b"));
  message.setVersion(3);
  return payload(message);
}

ByteString pageFailure(RadioWorld& world) {
  using Failure = CellularCsCallGwlPageRespFail;
  Failure message;
  setCommon(message, world);
  message.setVersion(2);
  message.setPageRat(Failure::PAGE_RAT_LTE);
  message.setCause(world.oneOf({Failure::MT_CSFB_FAIL, Failure::MT_RRC_CONN_EST_FAIL, Failure::MT_PAGING_IGNORED}));
  message.setIsImsiPage(0);
  message.setCsfbFailureType(Failure::EMM_REJECT_CAUSE);
  message.setCsfbFailureEmmCause(Failure::LTE_NAS_CONGESTION);
  message.setCsfbIsLacMismatch(world.chance(20));
  message.setLteRegLac(world.lte().tac);
  message.setTac(world.lte().tac);
  message.setLteCellId(world.lte().cellId);
  message.setAttemptArfcn(world.gsm().arfcn);
  message.setIsAttemptBandPcs(false);
  message.setAttemptLac(world.gsm().lac);
  message.setAttemptCellId(world.gsm().cellId);
  message.setNumRedirFreq(2);
  message.addRedirArfcn(world.gsm(1).arfcn);
  message.addRedirArfcn(world.gsm(2).arfcn);
  return payload(message);
}

constexpr EventKind kCircuitSwitchedEvents[] = {
    {790530, kSeldomMs, cdmaCell}, {798732, kNowAndThenMs, gsmWcdmaCell}, {802306, kNowAndThenMs, wcdmaState},
    {835590, kSeldomMs, callEnd},  {835592, kSeldomMs, pageFailure},
};

}  // namespace

std::span<const EventKind> circuitSwitchedKinds() {
  return kCircuitSwitchedEvents;
}

}  // namespace quorl::tool
