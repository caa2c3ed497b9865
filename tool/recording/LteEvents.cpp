#include <string>

#include "messages/classes/lte_rrc.h"
#include "messages/classes/lte_serving_cell.h"
#include "messages/classes/lte_signalling.h"
#include "messages/classes/lte_statistics.h"
#include "recording/EventKinds.h"

// LTE metrics of the family Mav.

namespace quorl::tool {
namespace {

ByteString lteServingCell(RadioWorld& world) {
  CellularLteScellInfo message;
  setCommon(message, world);
  setLteServingCell(message, world, world.lte().resourceBlocks);
  message.setAllowedAccess(1);
  message.setCellIsApo(false);
  return payload(message);
}

ByteString lteOtaMsg(RadioWorld& world) {
  using Message = CellularLteOtaMsg;
  Message message;
  setCommon(message, world);
  setNetwork(message, world);
  const LteCell& cell = world.lte();
  message.setPhyCellId(cell.pci);
  message.setFreq(cell.dlEarfcn);
  message.setRbId(world.count(0, 2));
  if (world.chance(50)) {
    message.setChannelType(Message::UL_DCCH);
    message.setUlDcchMsg(world.oneOf({Message::lte_rrc_measurementReport, Message::lte_rrc_ulInformationTransfer,
                                      Message::lte_rrc_rrcConnectionReconfigurationComplete}));
  } else {
    message.setChannelType(Message::DL_DCCH);
    message.setDlDcchMsg(world.oneOf({Message::lte_rrc_rrcConnectionReconfiguration,
                                      Message::lte_rrc_dlInformationTransfer, Message::lte_rrc_rrcConnectionRelease}));
  }
  message.setMsgType(world.count(0, 12));
  const std::uint32_t length = world.count(6, 40);
  message.setLength(length);
  message.setContent(world.bytes(length));
  message.setDlBw(cell.resourceBlocks);
  message.setCellId(cell.cellId);
  message.setFreqBandInd(cell.band);
  message.setTrackingAreaCode(cell.tac);
  message.setUpperLayerIndication(world.chance(60));
  message.setScgEverConfigured(world.chance(60));
  return payload(message);
}

ByteString lteRachAttempt(RadioWorld& world) {
  using Attempt = CellularLteRachAttempt;
  Attempt message;
  setCommon(message, world);
  const LteCell& cell = world.lte();
  message.setRetxCounter(world.count(0, 4));
  message.setRachResult(world.chance(85) ? Attempt::LTE_RACH_RESULT_SUCCESS : Attempt::LTE_RACH_RESULT_FAIL_AT_MESG2);
  message.setContentionBased(world.chance(70));
  message.setPMax(23);
  message.setRsrp(world.lteRsrp());
  message.setEarfcn(cell.dlEarfcn);
  message.setTac(cell.tac);
  message.setCellId(cell.cellId);
  message.setCellIsApo(false);
  message.setAccbState(0);
  message.setScellIndex(0);
  message.setTxPowerLimited(world.chance(10));
  return payload(message);
}

ByteString stateHistory(RadioWorld& world) {
  CellularLteRrcStateHist message;
  setCommon(message, world);
  std::uint32_t total = 0;
  for (const LTE_RRC_STATE state : {LTE_RRC_IDLE_CAMPED, LTE_RRC_CONNECTING, LTE_RRC_CONNECTED}) {
    auto part = makeMessageRef<StateHist>();
    const std::uint32_t spent = state == LTE_RRC_CONNECTING ? world.count(40, 900) : world.count(5000, 60000);
    part->setRrcState(state);
    part->setInStateCount(world.count(1, 9));
    part->setInStateMs(spent);
    message.addStateHist(part);
    total += spent;
  }
  message.setTotalDurationMs(total);
  return payload(message);
}

ByteString levelHistogram(RadioWorld& world) {
  CellularLteRsrpRsrqSinrHist message;
  setCommon(message, world);
  message.setDuration(world.count(10000, 60000));
  message.setMinRsrpDbm(-130);
  message.setMinRsrqDb(-20);
  message.setMinSinrDbx2(-20);
  for (int bin = 0; bin < 8; ++bin) {
    message.addRsrp0(world.count(0, 60));
    message.addRsrp1(world.count(0, 60));
    message.addRsrq0(world.count(0, 60));
    message.addRsrq1(world.count(0, 60));
    message.addSinr0(world.count(0, 60));
    message.addSinr1(world.count(0, 60));
  }
  return payload(message);
}

MessageRef<BandCombo> combo(RadioWorld& world, std::uint32_t components) {
  auto made = makeMessageRef<BandCombo>();
  made->setNumBandComponents(components);
  for (std::uint32_t i = 0; i < components; ++i) {
    auto component = makeMessageRef<BandComponentInCombo>();
    component->setBand(world.lte(i).band);
    component->setDlBwClass(1);
    component->setAggregatedDlBw(world.lte(i).resourceBlocks);
    component->setUlBwClass(i == 0 ? 1 : 0);
    made->addBandInfo(component);
  }
  return made;
}

ByteString lteConnectionStats(RadioWorld& world) {
  using Stats = CellularLteConnectionStats;
  Stats message;
  setCommon(message, world);
  const std::uint32_t carriers = world.count(1, 3);
  message.setDuration(world.count(5000, 60000));
  message.setMaxUlMod(world.oneOf({MODULATION_16QAM, MODULATION_64QAM}));
  message.setMaxDlMod(world.oneOf({MODULATION_64QAM, MODULATION_256QAM}));
  message.setMaxNwMimoLyr(4);
  message.setMaxUeRank(world.count(1, 4));
  message.setMaxRxAnt(4);
  message.setMaxSchdMimoLyr(world.count(1, 4));
  message.setLteTotalNumCcs(carriers);
  message.setLteTotalDlMimoLayers(carriers * 2);
  message.setLteBandCombo(combo(world, carriers));
  auto ability = makeMessageRef<NwUeCapMimoStat>();
  ability->setNwMimoCap(4);
  ability->setUeMimoCap(4);
  ability->setMaxUeRank(world.count(1, 4));
  ability->setMaxRxAnt(4);
  ability->setMaxSchdMimoLyr(world.count(1, 4));
  message.addNwUeCapStat(ability);
  message.setCause(world.oneOf({Stats::CONN_INFO_CAUSE_RELEASE, Stats::CONN_INFO_CAUSE_HO}));
  message.setConnDuration(world.count(4000, 60000));
  return payload(message);
}

constexpr EventKind kLteEvents[] = {
    {803010, kOftenMs, lteServingCell},      {803011, kOftenMs, lteOtaMsg},
    {803104, kNowAndThenMs, lteRachAttempt}, {806674, kNowAndThenMs, stateHistory},
    {806660, kNowAndThenMs, levelHistogram}, {806743, kNowAndThenMs, lteConnectionStats},
};

}  // namespace

std::span<const EventKind> lteKinds() {
  return kLteEvents;
}

}  // namespace quorl::tool
