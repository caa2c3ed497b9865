#pragma once

#include <cstdint>
#include <utility>
#include <vector>

#include "hosts/simulator/network/Cell.h"
#include "hosts/simulator/network/Scenario.h"

namespace quorl::simulator::network {

/// The cells of a scenario. They are numbered by operator, site, layer and sector in this order, and stay where they
/// are as long as the network.
class Network {
 public:
  /// What of a cell the phone never learns.
  struct Sector {
    double x = 0;  // of its site
    double y = 0;
    double height = 0;
    double azimuth = 0;  // radians, counter-clockwise from east
    bool hasDirection = false;
    std::uint16_t layer = 0;
    std::uint16_t channelIndex = 0;  // cells on the same carrier frequency share it
    Centi elementPower = 0;          // RS EPRE, CPICH or BCCH carrier, dBm
  };

  explicit Network(const Scenario& scenario);
  Network(const Network&) = delete;
  Network& operator=(const Network&) = delete;

  const std::vector<Cell>& cells() const { return cells_; }
  const Cell& cell(std::uint16_t index) const { return cells_[index]; }
  const Sector& sector(std::uint16_t index) const { return sectors_[index]; }
  /// Cells of one operator are consecutive.
  struct Range {
    std::uint16_t begin = 0;
    std::uint16_t end = 0;
  };
  Range cellsOf(std::uint8_t operatorIndex) const { return ranges_[operatorIndex]; }
  std::uint8_t operators() const { return static_cast<std::uint8_t>(ranges_.size()); }
  std::uint8_t operatorOf(const Cell& cell) const;
  std::uint16_t channels() const { return channels_; }

 private:
  void addSite(const Scenario& scenario, const Site& site, std::uint16_t siteIndex);
  std::uint16_t channelIndexOf(Technology technology, std::uint32_t channel);

  std::vector<Cell> cells_;
  std::vector<Sector> sectors_;
  std::vector<Range> ranges_;
  std::vector<std::pair<Technology, std::uint32_t>> channelKeys_;
  std::uint16_t channels_ = 0;
};

}  // namespace quorl::simulator::network
