#include "hosts/simulator/network/RadioField.h"

#include <algorithm>
#include <cmath>

#include "hosts/simulator/network/Arithmetic.h"

namespace quorl::simulator::network {
namespace {

constexpr double kAntennaGain = 14.0;             // dBi, TR 36.814 table A.2.1.1-2
constexpr double kLeastCouplingLoss = 70.0;       // however near: TR 36.942 table 4.8
constexpr double kBeamGain = 6.0;                 // of an NR cell with several beams, over the sector
constexpr double kWeakest = -136.0;               // what is below disturbs nobody
constexpr double kHalf = 0.70710678118654752440;  // root of 1/2: half of the variance

/// Losses of walls rise with frequency as those of concrete, 5 + 4 f dB (TR 38.901 table 7.4.3-1); 1 at 2 GHz.
double wallFactorAt(double gigahertz) {
  return (5.0 + 4.0 * gigahertz) / 13.0;
}

double sectorLoss(double degrees) {
  const double steep = degrees / 70.0;
  return std::min(12.0 * steep * steep, 25.0);
}

}  // namespace

RadioField::RadioField(const Scenario& scenario, const Network& network, std::uint64_t seed)
    : network_(network),
      zones_(scenario.zones),
      environment_(scenario.environment),
      shadows_(seed, 1),
      variations_(seed, 2),
      fields_(scenario.operators.size()) {
  for (std::uint8_t number = 0; number < fields_.size(); ++number) buildMasts(fields_[number], number, scenario);
}

void RadioField::buildMasts(Field& field, std::uint8_t operatorIndex, const Scenario& scenario) {
  const Network::Range range = network_.cellsOf(operatorIndex);
  std::uint16_t cell = range.begin;
  while (cell < range.end) {
    const Network::Sector& first = network_.sector(cell);
    const std::uint16_t site = network_.cell(cell).siteIndex;
    Mast mast;
    mast.x = first.x;
    mast.y = first.y;
    mast.drop = first.height - kPhoneHeight;
    mast.zones = zonesAt(first.x, first.y);
    mast.shadow = shadows_.normal();
    mast.sight = shadows_.normal();
    while (cell < range.end && network_.cell(cell).siteIndex == site) {
      const std::uint16_t begin = cell;
      const std::uint16_t layer = network_.sector(begin).layer;
      while (cell < range.end && network_.cell(cell).siteIndex == site && network_.sector(cell).layer == layer) ++cell;
      const double gigahertz = network_.cell(begin).downlinkKhz / 1e6;
      mast.carriers.push_back(
          {PathLoss(scenario.environment, gigahertz, first.height), wallFactorAt(gigahertz), begin, cell});
    }
    field.masts.push_back(std::move(mast));
  }
  field.commonShadow = shadows_.normal();
}

const std::vector<RadioField::Received>& RadioField::receive(std::uint8_t operatorIndex, const Surroundings& place,
                                                             SimulatedMs nowMs) {
  Field& field = fields_[operatorIndex];
  if (field.isFilled && field.atMs == nowMs) return field.received;
  moveOn(field, place.metresTravelled);
  fill(field, place);
  field.atMs = nowMs;
  field.isFilled = true;
  return field.received;
}

void RadioField::moveOn(Field& field, double metres) {
  const double way = metres - field.metres;
  if (way <= 0) return;
  field.metres = metres;
  const double kept = exponential(-std::min(way / PathLoss::correlationDistance(environment_), 50.0));
  const double fresh = std::sqrt(1.0 - kept * kept);
  // Sight comes and goes over 50 m and more (table 7.6.3.1-2).
  const double sightKept = exponential(-std::min(way / 50.0, 50.0));
  const double sightFresh = std::sqrt(1.0 - sightKept * sightKept);
  field.commonShadow = kept * field.commonShadow + fresh * shadows_.normal();
  for (Mast& mast : field.masts) {
    mast.shadow = kept * mast.shadow + fresh * shadows_.normal();
    mast.sight = sightKept * mast.sight + sightFresh * shadows_.normal();
  }
}

std::uint64_t RadioField::zonesAt(double x, double y) const {
  std::uint64_t zones = 0;
  for (std::size_t i = 0; i < zones_.size(); ++i)
    if (zones_[i].contains(x, y)) zones |= std::uint64_t{1} << i;
  return zones;
}

double RadioField::wallsBetween(const Mast& mast, std::uint64_t phoneZones) const {
  double loss = 0;
  for (std::size_t i = 0; i < zones_.size(); ++i)
    if (((phoneZones & ~mast.zones) >> i & 1U) != 0) loss += zones_[i].loss / 100.0;
  return loss;
}

void RadioField::fill(Field& field, const Surroundings& place) {
  field.received.clear();
  phoneZones_ = zonesAt(place.x, place.y);
  // What averaging over a wide carrier and a measurement's period leaves of the fast fading.
  const double variation = place.motion == MotionState::Stationary ? 0.6 : 1.3;
  for (const Mast& mast : field.masts) fillMast(field, mast, place, variation);
}

void RadioField::fillMast(Field& field, const Mast& mast, const Surroundings& place, double variation) {
  const double dx = place.x - mast.x;
  const double dy = place.y - mast.y;
  const double ground = std::max(10.0, std::sqrt(dx * dx + dy * dy));
  const double logDistance = 0.5 * log10Of(ground * ground + mast.drop * mast.drop);
  const double bearing = angleOf(dx, dy);
  const double chance = PathLoss::chanceOfSight(environment_, ground);
  const double hidden = 1.0 / (1.0 + exponential(-1.702 * mast.sight));  // evenly spread over 0 to 1, to a per cent
  const double sight = std::clamp(0.5 + (chance - hidden) * 4.0, 0.0, 1.0);
  const double deviation =
      sight * PathLoss::deviationInSight(environment_) + (1.0 - sight) * PathLoss::deviationOutOfSight(environment_);
  const double shadow = deviation * kHalf * (field.commonShadow + mast.shadow);
  const double wall = wallsBetween(mast, phoneZones_);
  for (const Carrier& carrier : mast.carriers) {
    const double loss = sight * carrier.loss.inSight(ground, logDistance) +
                        (1.0 - sight) * carrier.loss.outOfSight(ground, logDistance) + wall * carrier.wallFactor;
    const double ahead = network_.sector(carrier.begin).elementPower / 100.0 + kAntennaGain - loss + shadow;
    if (ahead < kWeakest) continue;
    for (std::uint16_t index = carrier.begin; index < carrier.end; ++index) {
      const Network::Sector& sector = network_.sector(index);
      double degrees = 0;
      if (sector.hasDirection) {
        degrees = (bearing - sector.azimuth) * 180.0 / kPi;
        while (degrees > 180.0) degrees -= 360.0;
        while (degrees < -180.0) degrees += 360.0;
      }
      Received received;
      received.cell = index;
      received.power = ahead - (sector.hasDirection ? sectorLoss(degrees) : 3.0);
      if (received.power < kWeakest) continue;
      received.power += variation * variations_.normal();
      const std::uint8_t beams = network_.cell(index).beams;
      if (beams > 1) {
        // Beams share the 120 degrees of the sector evenly; each falls off by 3 dB towards the next.
        const double width = 120.0 / beams;
        const double beamPosition = std::clamp((degrees + 60.0) / width, 0.0, beams - 0.001);
        received.beam = static_cast<std::uint8_t>(beamPosition);
        const double aside = 2.0 * (beamPosition - received.beam - 0.5);
        received.power += kBeamGain - 3.0 * aside * aside;
      }
      received.power = std::min(received.power, sector.elementPower / 100.0 - kLeastCouplingLoss);
      field.received.push_back(received);
    }
  }
}

}  // namespace quorl::simulator::network
