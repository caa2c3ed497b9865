#pragma once

#include <vector>

#include "hosts/simulator/network/Scenario.h"

namespace quorl::simulator::network {

/// The way of the phone: where it is at which time.
class Route {
 public:
  struct Place {
    double x = 0;
    double y = 0;
    double metresTravelled = 0;
    double metresPerSecond = 0;
    double directionX = 0;  // of length 1; the last one while it waits
    double directionY = 1;
  };

  explicit Route(const Scenario& scenario);
  Place at(SimulatedMs time) const;

 private:
  struct Leg {
    SimulatedMs startMs = 0;
    SimulatedMs moveMs = 0;
    SimulatedMs waitMs = 0;  // at its end
    Waypoint from;
    Waypoint to;
    double metres = 0;
    double metresBefore = 0;
  };
  void addLeg(const Waypoint& from, const Waypoint& to, double metresPerSecond);

  std::vector<Leg> legs_;
  SimulatedMs lapMs_ = 0;
  double lapMetres_ = 0;
  Waypoint start_;
  bool isEndless_ = false;
};

}  // namespace quorl::simulator::network
