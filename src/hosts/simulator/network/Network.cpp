#include "hosts/simulator/network/Network.h"

#include <algorithm>
#include <utility>

#include "hosts/simulator/network/Arithmetic.h"
#include "hosts/simulator/network/Bands.h"

namespace quorl::simulator::network {
namespace {

/// Physical layer identities are planned in groups of three sectors, as networks do.
std::uint16_t physicalIdOf(Technology technology, std::uint8_t operatorIndex, unsigned site, unsigned layer,
                           unsigned sector) {
  const unsigned group = site * 7 + layer * 29 + operatorIndex * 53U;
  switch (technology) {
    case Technology::None:
      return 0;
    case Technology::Gsm:  // network colour code of the operator, base station colour code
      return static_cast<std::uint16_t>((operatorIndex % 8U) * 8 + (site + sector) % 8);
    case Technology::Umts:
      return static_cast<std::uint16_t>((group * 3 + sector) % 512);
    case Technology::Lte:
      return static_cast<std::uint16_t>(group % 168 * 3 + sector % 3);
    case Technology::Nr:
      return static_cast<std::uint16_t>(group % 336 * 3 + sector % 3);
  }
  return 0;
}

std::uint64_t cellIdOf(Technology technology, std::uint8_t operatorIndex, unsigned site, unsigned layer,
                       unsigned sector) {
  const std::uint64_t local = layer * 8U + sector + 1;
  switch (technology) {
    case Technology::None:
      return 0;
    case Technology::Gsm:
      return (site * 64U + local) % 65535U + 1;
    case Technology::Umts:  // RNC and cell
      return (100ULL + operatorIndex) << 16U | (site * 64U + local);
    case Technology::Lte:  // eNB and cell
      return ((operatorIndex + 1ULL) << 12U | site) << 8U | local;
    case Technology::Nr:  // gNB of 24 bits and cell
      return ((operatorIndex + 1ULL) << 16U | site) << 12U | local;
  }
  return 0;
}

/// GSM carriers are reused at a distance; the others stand on one frequency everywhere.
std::uint32_t channelOf(const Layer& layer, unsigned site, unsigned sector) {
  return layer.technology == Technology::Gsm ? layer.channel + 2 * ((site * 3 + sector) % 12) : layer.channel;
}

/// Power of what the phone measures: LTE and NR one resource element of the carrier, UMTS the CPICH with a tenth of the
/// carrier, GSM the whole.
Centi elementPowerOf(const Layer& layer, std::uint16_t blocks) {
  switch (layer.technology) {
    case Technology::None:
    case Technology::Gsm:
      return layer.power;
    case Technology::Umts:
      return layer.power - 1000;
    case Technology::Lte:
    case Technology::Nr:
      return layer.power - toCenti(toDecibels(12.0 * blocks));
  }
  return layer.power;
}

}  // namespace

Network::Network(const Scenario& scenario) {
  ranges_.resize(scenario.operators.size());
  for (std::uint8_t number = 0; number < scenario.operators.size(); ++number) {
    ranges_[number].begin = static_cast<std::uint16_t>(cells_.size());
    for (std::size_t site = 0; site < scenario.sites.size(); ++site)
      if (scenario.sites[site].operatorIndex == number)
        addSite(scenario, scenario.sites[site], static_cast<std::uint16_t>(site));
    ranges_[number].end = static_cast<std::uint16_t>(cells_.size());
  }
}

void Network::addSite(const Scenario& scenario, const Site& site, std::uint16_t siteIndex) {
  const bool hasNr = std::any_of(site.layers.begin(), site.layers.end(), [&](std::uint16_t layer) {
    return scenario.layers[layer].technology == Technology::Nr;
  });
  const auto sectors = static_cast<unsigned>(std::max<std::size_t>(1, site.azimuths.size()));
  for (const std::uint16_t layerIndex : site.layers) {
    const Layer& layer = scenario.layers[layerIndex];
    for (unsigned number = 0; number < sectors; ++number) {
      const std::uint32_t channel = channelOf(layer, siteIndex, number);
      const ChannelFrequencies found =
          frequencies(layer.technology, layer.band, channel).value_or(ChannelFrequencies{});
      Cell cell;
      cell.index = static_cast<std::uint16_t>(cells_.size());
      cell.technology = layer.technology;
      cell.plmn = scenario.operators[site.operatorIndex].plmn;
      cell.band = layer.band;
      cell.downlinkChannel = channel;
      cell.uplinkChannel = found.uplinkChannel;
      cell.downlinkKhz = found.downlinkKhz;
      cell.uplinkKhz = found.uplinkKhz;
      cell.physicalId = physicalIdOf(layer.technology, site.operatorIndex, siteIndex, layerIndex, number);
      cell.areaCode = site.areaCode;
      cell.routingArea = static_cast<std::uint8_t>(site.areaCode % 251 + 1);
      cell.cellId = cellIdOf(layer.technology, site.operatorIndex, siteIndex, layerIndex, number);
      cell.bandwidthMhzX10 = layer.bandwidthMhzX10;
      cell.resourceBlocks = resourceBlocks(layer.technology, layer.bandwidthMhzX10, found.isTdd).value_or(0);
      cell.subCarrierSpacingKhz = layer.technology == Technology::Nr && found.isTdd ? 30 : 15;
      cell.isTdd = found.isTdd;
      cell.txPorts = layer.ports;
      cell.beams = layer.beams;
      cell.priority = layer.priority;
      cell.isStandAlone = layer.isStandAlone;
      cell.isNrAnchor = layer.technology == Technology::Lte && hasNr;
      cell.siteIndex = siteIndex;

      Sector sector;
      sector.x = site.x;
      sector.y = site.y;
      sector.height = site.height;
      sector.hasDirection = !site.azimuths.empty();
      // Azimuths run clockwise from north.
      if (sector.hasDirection) sector.azimuth = kPi / 2.0 - site.azimuths[number] * kPi / 180.0;
      sector.layer = layerIndex;
      sector.channelIndex = channelIndexOf(layer.technology, channel);
      sector.elementPower = elementPowerOf(layer, cell.resourceBlocks);
      cells_.push_back(cell);
      sectors_.push_back(sector);
    }
  }
}

std::uint16_t Network::channelIndexOf(Technology technology, std::uint32_t channel) {
  const std::pair key(technology, channel);
  const auto found = std::find(channelKeys_.begin(), channelKeys_.end(), key);
  if (found != channelKeys_.end()) return static_cast<std::uint16_t>(found - channelKeys_.begin());
  channelKeys_.push_back(key);
  return channels_++;
}

std::uint8_t Network::operatorOf(const Cell& cell) const {
  for (std::uint8_t number = 0; number < ranges_.size(); ++number)
    if (cell.index < ranges_[number].end) return number;
  return 0;
}

}  // namespace quorl::simulator::network
