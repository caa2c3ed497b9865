#include "hosts/simulator/network/Route.h"

#include <algorithm>
#include <cmath>

namespace quorl::simulator::network {

Route::Route(const Scenario& scenario) : start_(scenario.route.front()) {
  const std::vector<Waypoint>& points = scenario.route;
  if (points.size() < 2) return;
  for (std::size_t i = 1; i < points.size(); ++i) addLeg(points[i - 1], points[i], points[i].metresPerSecond);
  switch (scenario.routeEnd) {
    case RouteEnd::Stop:
      break;
    case RouteEnd::Loop:
      addLeg(points.back(), points.front(), points.front().metresPerSecond);
      isEndless_ = true;
      break;
    case RouteEnd::Return:
      for (std::size_t i = points.size() - 1; i > 0; --i) addLeg(points[i], points[i - 1], points[i].metresPerSecond);
      isEndless_ = true;
      break;
  }
  // Rounding of a leg's time is at most a millisecond; a lap without length would have no time to divide by.
  lapMs_ = std::max<SimulatedMs>(1, lapMs_);
}

void Route::addLeg(const Waypoint& from, const Waypoint& to, double metresPerSecond) {
  Leg leg;
  const double dx = to.x - from.x;
  const double dy = to.y - from.y;
  leg.metres = std::sqrt(dx * dx + dy * dy);
  leg.startMs = lapMs_;
  leg.moveMs =
      metresPerSecond > 0 ? static_cast<SimulatedMs>(std::floor(leg.metres / metresPerSecond * 1000.0 + 0.5)) : 0;
  leg.waitMs = to.waitMs;
  leg.from = from;
  leg.to = to;
  leg.metresBefore = lapMetres_;
  lapMs_ += leg.moveMs + leg.waitMs;
  lapMetres_ += leg.metres;
  legs_.push_back(leg);
}

Route::Place Route::at(SimulatedMs time) const {
  Place place;
  if (legs_.empty()) {
    place.x = start_.x;
    place.y = start_.y;
    return place;
  }
  const SimulatedMs laps = isEndless_ ? time / lapMs_ : 0;
  const SimulatedMs within = isEndless_ ? time % lapMs_ : std::min(time, lapMs_);
  const auto after = std::upper_bound(legs_.begin(), legs_.end(), within,
                                      [](SimulatedMs value, const Leg& leg) { return value < leg.startMs; });
  const Leg& leg = *std::prev(after);
  const SimulatedMs inLeg = within - leg.startMs;
  const bool isMoving = inLeg < leg.moveMs;
  const double share = isMoving ? static_cast<double>(inLeg) / static_cast<double>(leg.moveMs) : 1.0;
  place.x = leg.from.x + (leg.to.x - leg.from.x) * share;
  place.y = leg.from.y + (leg.to.y - leg.from.y) * share;
  place.metresTravelled = static_cast<double>(laps) * lapMetres_ + leg.metresBefore + leg.metres * share;
  if (isMoving) place.metresPerSecond = leg.metres * 1000.0 / static_cast<double>(leg.moveMs);
  if (leg.metres > 0) {
    place.directionX = (leg.to.x - leg.from.x) / leg.metres;
    place.directionY = (leg.to.y - leg.from.y) / leg.metres;
  }
  return place;
}

}  // namespace quorl::simulator::network
