#include "hosts/simulator/TelephonyFeed.h"

#include <string>
#include <utility>
#include <variant>
#include <vector>

namespace quorl::simulator {
namespace {

namespace telephony = telephony_event;
using network::Technology;

constexpr network::SimulatedMs kCellMs = 30000;
/// Option 3 of TR 38.801: NR beside LTE.
constexpr std::int64_t kNonStandAlone = 3;

HVSubscriptionSlot slotOf(const network::SubscriptionState& state) {
  return state.subscription + 1;
}

std::string nameOf(Technology technology) {
  switch (technology) {
    case Technology::Gsm:
      return "GSM";
    case Technology::Umts:
      return "UMTS";
    case Technology::Lte:
      return "LTE";
    case Technology::Nr:
      return "NR";
    case Technology::None:
      break;
  }
  return "";
}

/// Nearest whole dB.
std::int64_t whole(network::Centi level) {
  return (level - 50) / 100;  // levels are negative
}

HVDataConnectionStatus statusOf(network::event::DataConnectionStatus status) {
  using From = network::event::DataConnectionStatus;
  switch (status) {
    case From::Disconnected:
      return HVDataConnectionStatus::Disconnected;
    case From::Connecting:
      return HVDataConnectionStatus::Connecting;
    case From::Connected:
      return HVDataConnectionStatus::Connected;
    case From::Disconnecting:
      return HVDataConnectionStatus::Disconnecting;
  }
  return HVDataConnectionStatus::Unknown;
}

}  // namespace

HVCellInfo TelephonyFeed::cellInfo(const network::SubscriptionState& state) {
  HVCellInfo info;
  if (!state.serving) return info;
  const network::CellMeasurement& measurement = state.serving->best;
  const network::Cell& cell = *measurement.cell;
  const std::string technology = nameOf(cell.technology);
  const bool isPacket = network::isPacketCell(cell.technology);
  HVCellDictionary dictionary{
      {"kHVCellMonitorCellType", "kHVCellMonitorCellTypeServing"},
      {"kHVCellMonitorRadioAccessTechnology", "kHVCellMonitorRadioAccessTechnology" + technology},
      {"kHVCellMonitorCellRadioAccessTechnology", technology},
      {"kHVCellMonitorMCC", std::int64_t{cell.plmn.mcc}},
      {"kHVCellMonitorMNC", std::int64_t{cell.plmn.mnc}},
      {isPacket ? "kHVCellMonitorTAC" : "kHVCellMonitorLAC", std::int64_t{cell.areaCode}},
      {"kHVCellMonitorCellId", static_cast<std::int64_t>(cell.cellId)},
      {"kHVCellMonitorBandInfo", std::int64_t{cell.band}},
  };
  if (isPacket) dictionary.emplace_back("kHVCellMonitorBandwidth", std::int64_t{cell.resourceBlocks});
  dictionary.emplace_back("kHVCellMonitorUARFCN", std::int64_t{cell.downlinkChannel});
  dictionary.emplace_back("kHVCellMonitorDeploymentType", state.nr ? kNonStandAlone : std::int64_t{0});
  dictionary.emplace_back("kHVCellMonitorRSRP", whole(measurement.power));
  if (isPacket) dictionary.emplace_back("kHVCellMonitorRSRQ", whole(measurement.quality));
  info.legacyInfo.emplace().emplace_back(std::move(dictionary));
  return info;
}

HVBandInfo TelephonyFeed::bandInfo(const network::SubscriptionState& state) {
  HVBandInfo info;
  if (state.serving) {
    const network::Cell& cell = *state.serving->best.cell;
    HVBandDictionary active;
    std::vector<std::int64_t> bands{cell.band};
    for (const network::SecondaryCarrier& carrier : state.carriers) bands.push_back(carrier.serving.best.cell->band);
    active.emplace_back(nameOf(cell.technology), std::move(bands));
    if (state.nr) active.emplace_back("NR", std::vector<std::int64_t>{state.nr->serving.best.cell->band});
    info.activeBands = std::move(active);
  }
  info.supportedBands = HVBandDictionary{
      {"LTE", {1, 3, 7, 8, 20, 28, 38, 40}}, {"NR", {1, 28, 41, 78}}, {"UMTS", {1, 8}}, {"GSM", {900, 1800}}};
  return info;
}

void TelephonyFeed::tellSignal(const network::SubscriptionState& state) {
  std::optional<std::int64_t> rsrp;
  if (state.serving) rsrp = whole(state.serving->best.power);
  Told& told = told_[state.subscription];
  if (rsrp == told.rsrp) return;
  told.rsrp = rsrp;
  telephony_.perform(telephony::Signal{slotOf(state), rsrp});
}

void TelephonyFeed::tellCell(const network::SubscriptionState& state) {
  tellSignal(state);
  told_[state.subscription].cellMs = state.nowMs;
  telephony_.perform(telephony::Bands{slotOf(state), bandInfo(state)});
  telephony_.perform(telephony::Cell{slotOf(state), cellInfo(state), true});
}

void TelephonyFeed::happened(const network::ModemEvent& event, const network::SubscriptionState& state) {
  namespace radio = network::event;
  if (const auto* sim = std::get_if<radio::SimChanged>(&event.body)) {
    told_[state.subscription] = {};
    if (!sim->isPresent) {
      telephony_.perform(telephony::SimRemoved{slotOf(state)});
      return;
    }
    telephony_.perform(telephony::SimInserted{slotOf(state), state.carrier});
    telephony_.perform(telephony::Bands{slotOf(state), bandInfo(state)});
  } else if (std::holds_alternative<radio::ServingCellChanged>(event.body)) {
    tellCell(state);
  } else if (const auto* added = std::get_if<radio::SecondaryGroupAdded>(&event.body)) {
    if (added->isSuccess) tellCell(state);
  } else if (std::holds_alternative<radio::SecondaryGroupRemoved>(event.body)) {
    tellCell(state);
  } else if (std::holds_alternative<radio::CarriersChanged>(event.body)) {
    telephony_.perform(telephony::Bands{slotOf(state), bandInfo(state)});
  } else if (std::holds_alternative<radio::Measured>(event.body)) {
    if (state.nowMs - told_[state.subscription].cellMs >= kCellMs) {
      tellCell(state);
    } else {
      tellSignal(state);
    }
  } else if (const auto* data = std::get_if<radio::DataConnectionChanged>(&event.body)) {
    telephony_.perform(telephony::Connection{slotOf(state),
                                             data->isIms ? HVDataConnectionType::Ims : HVDataConnectionType::Internet,
                                             statusOf(data->status)});
  }
}

}  // namespace quorl::simulator
