#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "hosts/simulator/network/Network.h"
#include "hosts/simulator/network/RadioField.h"
#include "hosts/simulator/network/RandomStream.h"

namespace quorl::simulator::network {

/// A receiver of one subscription: filters what arrives (layer 3, TS 36.331 5.5.3.2), and works out of the filtered
/// powers everything that depends on them, so that RSRP, RSRQ, RSSI and SINR of a cell always agree.
class Receiver {
 public:
  Receiver(const Network& network, RadioField& field, std::uint64_t seed, std::uint8_t subscription);

  /// Measures the cells of these operators. `load` is the share of the cells' capacity in use. A connection measures
  /// often and filters more.
  void listen(const std::vector<std::uint8_t>& operators, const Surroundings& place, SimulatedMs nowMs, double load,
              bool isConnected);

  /// Cells of a technology that were found by the last `listen`, strongest first.
  const std::vector<CellMeasurement>& found(Technology technology) const;
  /// A cell whether or not it would be found anew; at the lower ends of the ranges when nothing arrives of it.
  CellMeasurement measure(const Cell& cell) const;
  /// A cell in use, antenna by antenna, with what it can carry.
  ServingMeasurement serve(const Cell& cell);

 private:
  struct Heard {
    double power = 0;   // filtered, dBm
    double linear = 0;  // mW
    SimulatedMs atMs = 0;
    std::uint8_t beam = 0;
    bool isHeard = false;
  };

  void hear(const RadioField::Received& received, double share);
  void find();

  const Network& network_;
  RadioField& field_;
  RandomStream antennas_;
  std::vector<double> noise_;                // by cell, mW
  std::vector<Heard> heard_;                 // by cell
  std::vector<double> channelPower_;         // by channel: sum of power and use, mW
  std::vector<double> channelInterference_;  // by channel: sum of what disturbs others, mW
  std::array<std::vector<CellMeasurement>, 5> found_;
  std::array<double, 4> antennaState_{};
  std::vector<std::vector<std::uint16_t>> heardOn_;  // by channel, while cells are looked for
  SimulatedMs nowMs_ = 0;
  double load_ = 0;
};

}  // namespace quorl::simulator::network
