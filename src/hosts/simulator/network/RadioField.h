#pragma once

#include <cstdint>
#include <vector>

#include "hosts/simulator/network/Network.h"
#include "hosts/simulator/network/PathLoss.h"
#include "hosts/simulator/network/RandomStream.h"
#include "hosts/simulator/network/Scenario.h"

namespace quorl::simulator::network {

/// How strongly the cells arrive where the phone is.
///
/// Power of a cell is what its sector sends there (antenna of TR 36.814 table A.2.1.1-2), less the path loss of
/// TR 38.901, blended between in and out of sight as the sight of a site comes and goes along the way (clause 7.6.3),
/// less what buildings and tunnels take, plus shadowing and fast variation. Shadowing falls off exponentially along the
/// way (Gudmundson: Correlation model for shadow fading in mobile radio systems, 1991), and half of its variance is
/// common to all sites (TR 36.814 table A.2.1.1-3: correlation of 0.5 between sites, 1 between sectors).
class RadioField {
 public:
  struct Received {
    std::uint16_t cell = 0;
    std::uint8_t beam = 0;
    double power = 0;  // dBm
  };

  RadioField(const Scenario& scenario, const Network& network, std::uint64_t seed);

  /// All cells of an operator above about -136 dBm, in the order of the network. Time and way must not run back. Asked
  /// twice at a time it gives the same.
  const std::vector<Received>& receive(std::uint8_t operatorIndex, const Surroundings& place, SimulatedMs nowMs);

 private:
  struct Carrier {
    PathLoss loss;
    double wallFactor;  // of a wall's loss at 2 GHz
    std::uint16_t begin;
    std::uint16_t end;  // its cells, one each sector
  };
  struct Mast {
    double x = 0;
    double y = 0;
    double drop = 0;  // of the antenna above the phone
    double shadow = 0;
    double sight = 0;
    std::uint64_t zones = 0;  // it stands in, one bit each
    std::vector<Carrier> carriers;
  };
  struct Field {
    std::vector<Mast> masts;
    double commonShadow = 0;
    double metres = 0;
    SimulatedMs atMs = 0;
    bool isFilled = false;
    std::vector<Received> received;
  };

  void buildMasts(Field& field, std::uint8_t operatorIndex, const Scenario& scenario);
  void moveOn(Field& field, double metres);
  void fill(Field& field, const Surroundings& place);
  void fillMast(Field& field, const Mast& mast, const Surroundings& place, double variation);

  std::uint64_t zonesAt(double x, double y) const;
  /// What the walls of the zones take in dB at 2 GHz: those around the phone and not around the mast.
  double wallsBetween(const Mast& mast, std::uint64_t phoneZones) const;

  const Network& network_;
  const std::vector<Zone> zones_;
  const Environment environment_;
  RandomStream shadows_;
  RandomStream variations_;
  std::vector<Field> fields_;  // one for each operator
  std::uint64_t phoneZones_ = 0;
};

}  // namespace quorl::simulator::network
