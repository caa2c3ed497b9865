#include "hosts/simulator/network/Camping.h"

#include <algorithm>
#include <array>

namespace quorl::simulator::network {
namespace {

using Kind = event::AirMessageKind;

constexpr std::array kByPreference{Technology::Nr, Technology::Lte, Technology::Umts, Technology::Gsm};
/// Home is looked for again this long after another network was taken.
constexpr SimulatedMs kHomeSearchMs = 120000;

Centi received(const CellMeasurement& measurement, const ReselectionParameters& parameters) {
  return measurement.power - parameters.qRxLevMin * 100;
}

}  // namespace

ReselectionParameters reselectionParametersOf(const Cell& cell) {
  switch (cell.technology) {
    case Technology::Gsm:  // RXLEV-ACCESS-MIN and the hysteresis of TS 45.008 6.4
      return {-104, 0, 6, 0, 0, 0, 0, 10, 5};
    case Technology::Umts:
      return {-115, -18, 4, 10, 8, 6, 8, 6, 1};
    case Technology::Nr:  // entered late and left late, or each shadow would change the core network
      return {-122, -20, 4, 62, 10, 8, 20, 8, 2};
    case Technology::Lte:
    case Technology::None:
      break;
  }
  return {-124, -18, 4, 62, 10, 8, 12, 8, 1};
}

bool Camping::isSuitable(const CellMeasurement& measurement) {
  const Cell& cell = *measurement.cell;
  if (cell.technology == Technology::Nr && !cell.isStandAlone) return false;
  const ReselectionParameters parameters = reselectionParametersOf(cell);
  if (received(measurement, parameters) <= 0) return false;
  return cell.technology == Technology::Gsm || cell.technology == Technology::Nr ||
         measurement.quality > parameters.qQualMin * 100;
}

const Cell* Camping::strongest(Technology technology, Centi least) const {
  for (const CellMeasurement& measurement : core_.receiver.found(technology))
    if (isSuitable(measurement) && measurement.sinr >= least) return measurement.cell;
  return nullptr;
}

bool Camping::belongs(const Cell& cell, Group group) const {
  const std::uint8_t number = core_.network.operatorOf(cell);
  const auto& guests = core_.sim.roaming;
  switch (group) {
    case Group::Home:
      return number == core_.sim.operatorIndex;
    case Group::Guest:
      return std::find(guests.begin(), guests.end(), number) != guests.end();
    case Group::Any:
      return true;
  }
  return false;
}

const Cell* Camping::choose(Group group) const {
  for (const Technology technology : kByPreference)
    for (const CellMeasurement& measurement : core_.receiver.found(technology))
      if (isSuitable(measurement) && belongs(*measurement.cell, group)) return measurement.cell;
  return nullptr;
}

void Camping::scanForCdma(bool isNeeded) {
  const auto isSame = [](const CdmaSystem& left, const CdmaSystem& right) {
    return left.systemId == right.systemId && left.baseId == right.baseId;
  };
  const Surroundings& place = core_.phone.place;
  std::vector<CdmaSystem> found;
  for (const CdmaStation& station : core_.scenario.cdmaStations) {
    const double dx = station.x - place.x;
    const double dy = station.y - place.y;
    // Inside, the old base stations end as everything else does.
    const double reach = place.zoneLoss > 2000 ? station.metres * 0.2 : station.metres;
    if (dx * dx + dy * dy <= reach * reach) found.push_back(station.system);
  }
  auto& known = core_.state.cdma;
  const bool hasChanged = !std::equal(known.begin(), known.end(), found.begin(), found.end(), isSame);
  known = std::move(found);
  if (hasChanged || (isNeeded && !known.empty())) core_.emit(event::CdmaScanned{});
}

void Camping::search() {
  core_.operators.clear();
  for (std::uint8_t number = 0; number < core_.network.operators(); ++number) core_.operators.push_back(number);
  core_.measure();
  const Cell* cell = nullptr;
  Group group = Group::Home;
  for (const Group candidate : {Group::Home, Group::Guest, Group::Any}) {
    cell = choose(candidate);
    group = candidate;
    if (cell != nullptr) break;
  }
  const bool isFirst = searches_ == 0;
  scanForCdma(isFirst && (cell == nullptr || core_.cell() == nullptr));
  lastHomeSearchMs_ = core_.now();
  if (cell == nullptr) {
    ++searches_;
    // Searches come ever more seldom, to save the battery.
    searchAfter(std::min<SimulatedMs>(2000ULL << std::min(searches_, 4U), 30000));
    if (core_.cell() != nullptr) leave();
    return;
  }
  searches_ = 0;
  isLimited_ = group == Group::Any;
  core_.operators.assign(1, core_.network.operatorOf(*cell));
  if (cell == core_.cell()) return;
  camp(*cell, event::ChangeReason::Selection);
}

void Camping::camp(const Cell& cell, event::ChangeReason reason) {
  const bool isOtherTechnology = core_.state.technology != cell.technology;
  if (isOtherTechnology && core_.state.rrc != RrcState::None) {
    core_.tellConnectionEnded(event::ConnectionEnd::Release);
    enter(RrcState::None, RrcCause::None);
  }
  readSystemInformation(cell);
  // The state of the new technology is there before anybody is told of the cell.
  if (isOtherTechnology) {
    core_.state.technology = cell.technology;
    enter(RrcState::Idle, RrcCause::None);
  }
  take(cell, reason);
}

void Camping::readSystemInformation(const Cell& cell) {
  core_.say(&cell, Kind::Mib, false, 0, 3);
  core_.say(&cell, Kind::Sib1, false, 0, static_cast<std::uint16_t>(18 + core_.random.below(60)));
  core_.say(&cell, Kind::SystemInformation, false, 0, static_cast<std::uint16_t>(30 + core_.random.below(90)));
  core_.emit(event::SystemInformationRead{&cell, static_cast<std::uint8_t>(cell.cellId % 32)});
}

void Camping::take(const Cell& cell, event::ChangeReason reason) {
  SubscriptionState& state = core_.state;
  const Cell* from = core_.cell();
  state.technology = cell.technology;
  core_.operators.assign(1, core_.network.operatorOf(cell));
  state.serving = core_.receiver.serve(cell);
  state.reselection = reselectionParametersOf(cell);
  if (from != nullptr && from->technology != cell.technology) state.transmitPower = state.transmitPowerControl = 0;
  std::erase_if(state.neighbours, [&](const CellMeasurement& neighbour) { return neighbour.cell == &cell; });
  if (from != nullptr && from->technology != cell.technology) core_.measure();
  candidates_.clear();
  campedMs_ = core_.now();
  unsuitableRounds_ = 0;
  core_.emit(event::ServingCellChanged{from, &cell, reason});
  for (RadioUser* user : core_.users) user->cellChanged(from, &cell);
}

void Camping::leave() {
  const Cell* from = core_.cell();
  if (from == nullptr) return;
  core_.tellConnectionEnded(event::ConnectionEnd::Release);
  enter(RrcState::None, RrcCause::NoService);
  core_.state.serving.reset();
  core_.state.technology = Technology::None;
  core_.state.neighbours.clear();
  core_.state.otherNeighbours.clear();
  candidates_.clear();
  isLimited_ = false;
  core_.emit(event::ServingCellChanged{from, nullptr, event::ChangeReason::Lost});
  for (RadioUser* user : core_.users) user->cellChanged(from, nullptr);
}

void Camping::lose() {
  leave();
  searches_ = 0;
  searchAfter(core_.delay(400, 1200));
}

void Camping::enter(RrcState next, RrcCause cause) {
  SubscriptionState& state = core_.state;
  const RrcState previous = state.rrc;
  if (previous == next) return;
  const std::uint64_t lasted = core_.now() - state.rrcSinceMs;
  Counters& counters = state.counters;
  const auto from = static_cast<std::size_t>(previous);
  const auto to = static_cast<std::size_t>(next);
  if (state.technology == Technology::Lte) {
    counters.lteStateMs[from] += lasted;
    ++counters.lteStateVisits[to];
  } else if (state.technology == Technology::Umts) {
    counters.umtsStateMs[from] += lasted;
    ++counters.umtsStateVisits[to];
  }
  state.rrc = next;
  state.rrcCause = cause;
  state.rrcSinceMs = core_.now();
  core_.emit(event::RrcChanged{state.technology, next, previous, lasted, cause, false});
}

bool Camping::isBetter(const CellMeasurement& candidate) const {
  const Cell& own = *core_.cell();
  const Cell& other = *candidate.cell;
  const ReselectionParameters& parameters = core_.state.reselection;
  const ServingMeasurement& serving = *core_.state.serving;
  const Centi level = received(candidate, reselectionParametersOf(other));
  // Priorities: TS 36.304 5.2.4.5. Of equal ones the better rank wins: 5.2.4.6.
  if (other.priority > own.priority) return level > parameters.higherThreshold * 100;
  if (other.priority < own.priority)
    return received(serving.best, parameters) < parameters.servingLow * 100 && level > parameters.lowerThreshold * 100;
  return candidate.power > serving.best.power + parameters.hysteresis * 100;
}

void Camping::measured() {
  if (core_.cell() == nullptr) return;
  if (!isSuitable(core_.state.serving->best)) {
    // TS 36.304 and TS 36.133 4.2.2.1: after some rounds everything is a candidate.
    if (++unsuitableRounds_ >= 2) {
      for (const Technology technology : kByPreference) {
        const Cell* next = strongest(technology);
        if (next == nullptr || next == core_.cell()) continue;
        ++core_.state.counters.reselections;
        camp(*next, event::ChangeReason::Reselection);
        return;
      }
      lose();
      return;
    }
  } else {
    unsuitableRounds_ = 0;
  }
  const bool isAway = isLimited_ || core_.network.operatorOf(*core_.cell()) != core_.sim.operatorIndex;
  if (isAway && core_.now() - lastHomeSearchMs_ > kHomeSearchMs) {
    searchAfter(0);
    return;
  }
  const Cell* best = nullptr;
  std::vector<Candidate> still;
  const auto consider = [&](const std::vector<CellMeasurement>& list) {
    for (const CellMeasurement& measurement : list) {
      if (!isSuitable(measurement) || !isBetter(measurement)) continue;
      const std::uint16_t index = measurement.cell->index;
      const auto known = std::find_if(candidates_.begin(), candidates_.end(),
                                      [&](const Candidate& candidate) { return candidate.cell == index; });
      const SimulatedMs since = known == candidates_.end() ? core_.now() : known->sinceMs;
      still.push_back({index, since});
      // Lists are sorted by strength, so the first of the highest priority wins.
      if (core_.now() - since >= core_.state.reselection.reselectionSeconds * 1000ULL &&
          (best == nullptr || measurement.cell->priority > best->priority))
        best = measurement.cell;
    }
  };
  consider(core_.state.neighbours);
  consider(core_.state.otherNeighbours);
  candidates_ = std::move(still);
  if (best == nullptr || core_.now() - campedMs_ < 1000) return;
  ++core_.state.counters.reselections;
  camp(*best, event::ChangeReason::Reselection);
}

}  // namespace quorl::simulator::network
