#include "hosts/simulator/metrics/MetricFields.h"

#include <algorithm>
#include <iterator>
#include <string>

#include "hosts/simulator/network/RandomStream.h"
#include "messages/classes/shared_enums.h"
#include "messages/wire/WireWriter.h"

namespace quorl::simulator::metrics {

using network::Cell;
using network::ServingMeasurement;
using network::SubscriptionState;
using network::Technology;

namespace {

/// Every bit of the answer depends on every bit of the number, and 0 does not stay 0.
std::uint64_t scattered(std::uint64_t number) {
  return network::mixed(number + 0x9E3779B97F4A7C15U);
}

struct LteWidth {
  std::uint16_t mhzX10;
  std::uint32_t blocks;
};
constexpr LteWidth kLteWidths[] = {{14, 6}, {30, 15}, {50, 25}, {100, 50}, {150, 75}, {200, 100}};

/// Index of the widest that is not wider than the cell.
std::size_t widthIndex(const Cell& cell) {
  std::size_t index = 0;
  for (std::size_t i = 0; i < std::size(kLteWidths); ++i)
    if (kLteWidths[i].mhzX10 <= cell.bandwidthMhzX10) index = i;
  return index;
}

std::optional<std::int32_t> gsmBand(std::uint16_t band) {
  switch (band) {
    case 850:
      return SYS_BAND_GSM_850;
    case 900:
      return SYS_BAND_GSM_EGSM_900;
    case 1800:
      return SYS_BAND_GSM_DCS_1800;
    case 1900:
      return SYS_BAND_GSM_PCS_1900;
    default:
      return std::nullopt;
  }
}

std::optional<std::int32_t> umtsBand(std::uint16_t band) {
  constexpr std::int32_t kBands[] = {SYS_BAND_WCDMA_I_IMT_2000, SYS_BAND_WCDMA_II_PCS_1900, SYS_BAND_WCDMA_III_1700,
                                     SYS_BAND_WCDMA_IV_1700,    SYS_BAND_WCDMA_V_850,       SYS_BAND_WCDMA_VI_800,
                                     SYS_BAND_WCDMA_VII_2600,   SYS_BAND_WCDMA_VIII_900,    SYS_BAND_WCDMA_IX_1700};
  if (band < 1 || band > std::size(kBands)) return std::nullopt;
  return kBands[band - 1U];
}

std::optional<std::int32_t> lteBand(std::uint16_t band) {
  const bool isKnown = (band >= 1 && band <= 14) || (band >= 17 && band <= 21) || (band >= 24 && band <= 26) ||
                       (band >= 33 && band <= 43);
  if (!isKnown) return std::nullopt;
  return SYS_BAND_LTE_EUTRAN_BAND1 + band - 1;
}

}  // namespace

ByteString payload(const MetricCodable& message) {
  WireWriter writer;
  message.writeTo(writer);
  return ByteString(writer.bytes());
}

ByteString plmnBytes(const network::Plmn& plmn) {
  const auto octets = network::encoded(plmn);
  return ByteString(std::string(octets.begin(), octets.end()));
}

network::Plmn currentPlmn(const SubscriptionState& state) {
  return state.serving ? state.serving->best.cell->plmn : state.registration.plmn;
}

const ServingMeasurement* servingOn(const SubscriptionState& state, Technology technology) {
  // On the way to another technology the cell measured last is still one of the old.
  const bool isOnIt =
      state.serving && state.technology == technology && state.serving->best.cell->technology == technology;
  return isOnIt ? &*state.serving : nullptr;
}

const ServingMeasurement* lteServing(const SubscriptionState& state) {
  return servingOn(state, Technology::Lte);
}

const ServingMeasurement* nrServing(const SubscriptionState& state) {
  if (state.nr) return &state.nr->serving;
  return servingOn(state, Technology::Nr);
}

bool isConnected(const SubscriptionState& state) {
  return network::isConnectedState(state.rrc);
}

std::uint32_t resourceBlocks(const Cell& cell) {
  return kLteWidths[widthIndex(cell)].blocks;
}

std::uint32_t bandwidthCode(const Cell& cell) {
  return u32(widthIndex(cell));
}

std::uint32_t frequencyRange(const Cell& cell) {
  return cell.downlinkKhz > 7125000 ? 2 : 1;
}

std::uint32_t rxlev(network::Centi power) {
  return u32(std::clamp(whole(power) + 110, 0, 63));
}

std::uint32_t ecnoCode(network::Centi quality) {
  return u32(std::clamp(whole(2 * quality + 4900), 0, 49));
}

std::int32_t sysMode(Technology technology) {
  switch (technology) {
    case Technology::None:
      return SYS_MODE_NO_SRV;
    case Technology::Gsm:
      return SYS_MODE_GSM;
    case Technology::Umts:
      return SYS_MODE_WCDMA;
    case Technology::Lte:
      return SYS_MODE_LTE;
    case Technology::Nr:
      return SYS_MODE_NR5G;
  }
  return SYS_MODE_NO_SRV;
}

std::int32_t sysRat(Technology technology) {
  switch (technology) {
    case Technology::None:
    case Technology::Lte:
      return SYS_RAT_LTE;
    case Technology::Gsm:
      return SYS_RAT_GSM;
    case Technology::Umts:
      return SYS_RAT_UMTS;
    case Technology::Nr:
      return SYS_RAT_NR5G;
  }
  return SYS_RAT_LTE;
}

std::optional<std::int32_t> sysBand(const Cell& cell) {
  switch (cell.technology) {
    case Technology::None:
    case Technology::Nr:
      return std::nullopt;
    case Technology::Gsm:
      return gsmBand(cell.band);
    case Technology::Umts:
      return umtsBand(cell.band);
    case Technology::Lte:
      return lteBand(cell.band);
  }
  return std::nullopt;
}

std::int32_t serviceStatus(network::ServiceStatus status) {
  switch (status) {
    case network::ServiceStatus::None:
      return SYS_SRV_STATUS::SYS_SRV_STATUS_NONE;
    case network::ServiceStatus::NoService:
      return SYS_SRV_STATUS::SYS_SRV_STATUS_NO_SRV;
    case network::ServiceStatus::Limited:
      return SYS_SRV_STATUS::SYS_SRV_STATUS_LIMITED;
    case network::ServiceStatus::Service:
      return SYS_SRV_STATUS::SYS_SRV_STATUS_SRV;
    case network::ServiceStatus::PowerSave:
      return SYS_SRV_STATUS::SYS_SRV_STATUS_PWR_SAVE;
  }
  return SYS_SRV_STATUS::SYS_SRV_STATUS_NONE;
}

std::int32_t serviceDomain(network::ServiceDomain domain) {
  switch (domain) {
    case network::ServiceDomain::None:
      return SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_NO_SRV;
    case network::ServiceDomain::CsOnly:
      return SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_CS_ONLY;
    case network::ServiceDomain::PsOnly:
      return SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_PS_ONLY;
    case network::ServiceDomain::CsPs:
      return SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_CS_PS;
    case network::ServiceDomain::Camped:
      return SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_CAMPED;
  }
  return SYS_SRV_DOMAIN::SYS_SRV_DOMAIN_NO_SRV;
}

std::int32_t roamStatus(network::RoamStatus status) {
  return status == network::RoamStatus::On ? SYS_ROAM_STATUS::SYS_ROAM_STATUS_ON : SYS_ROAM_STATUS::SYS_ROAM_STATUS_OFF;
}

std::int32_t modulation(network::Modulation modulation) {
  switch (modulation) {
    case network::Modulation::Bpsk:
      return MODULATION_BPSK;
    case network::Modulation::Qpsk:
      return MODULATION_QPSK;
    case network::Modulation::Qam16:
      return MODULATION_16QAM;
    case network::Modulation::Qam64:
      return MODULATION_64QAM;
    case network::Modulation::Qam256:
      return MODULATION_256QAM;
    case network::Modulation::Qam1024:
      return MODULATION_1024QAM;
  }
  return MODULATION_UNKOWN;
}

std::int32_t motion(network::MotionState motion) {
  switch (motion) {
    case network::MotionState::Stationary:
      return MOTION_ST_STATIONARY;
    case network::MotionState::Pedestrian:
      return MOTION_ST_PEDESTRIAN;
    case network::MotionState::Driving:
      return MOTION_ST_DRIVING;
  }
  return MOTION_ST_STATIONARY;
}

std::uint32_t detail(const Moment& moment, std::uint64_t of, std::uint64_t what, std::uint32_t limit) {
  return u32(scattered(moment.salt ^ scattered(of ^ scattered(what))) % limit);
}

ByteString content(const Moment& moment, std::size_t length) {
  std::string octets;
  octets.reserve(length + sizeof(std::uint64_t));
  std::uint64_t state = moment.salt ^ scattered(moment.timestampMs) ^ length;
  while (octets.size() < length) {
    state = scattered(state);
    for (unsigned shift = 0; shift < 64; shift += 8) octets.push_back(static_cast<char>((state >> shift) & 0xFFU));
  }
  octets.resize(length);
  return ByteString(octets);
}

}  // namespace quorl::simulator::metrics
