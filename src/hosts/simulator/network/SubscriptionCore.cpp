#include "hosts/simulator/network/SubscriptionCore.h"

#include <algorithm>

namespace quorl::simulator::network {
namespace {

constexpr std::size_t kMostOwn = 6;  // on the serving cell's own frequency: handovers are among them
constexpr std::size_t kMostOthers = 6;

/// Strongest first, without the serving cell. The own frequency has places of its own, since others may drown it.
void take(std::vector<CellMeasurement>& list, const std::vector<CellMeasurement>& found, const Cell* serving) {
  std::size_t own = kMostOwn;
  std::size_t others = kMostOthers;
  for (const CellMeasurement& measurement : found) {
    if (measurement.cell == serving) continue;
    const bool isOwn = serving != nullptr && measurement.cell->technology == serving->technology &&
                       measurement.cell->downlinkChannel == serving->downlinkChannel;
    std::size_t& places = isOwn ? own : others;
    if (places == 0) continue;
    --places;
    list.push_back(measurement);
  }
}

}  // namespace

void SubscriptionCore::tellConnectionEnded(event::ConnectionEnd end) {
  if (!hasConnection) return;
  hasConnection = false;
  ++state.counters.connectionsReleased;
  emit(event::ConnectionEnded{state.technology, cell(), end, now() - state.use.sinceMs, state.use, false});
}

void SubscriptionCore::measure() {
  receiver.listen(operators, phone.place, now(), phone.load, isConnected());
  state.neighbours.clear();
  state.otherNeighbours.clear();
  const Cell* serving = cell();
  for (const Technology technology : {Technology::Nr, Technology::Lte, Technology::Umts, Technology::Gsm}) {
    const bool isOwn = technology == state.technology;
    take(isOwn ? state.neighbours : state.otherNeighbours, receiver.found(technology), serving);
  }
  if (serving != nullptr) state.serving = receiver.serve(*serving);
}

}  // namespace quorl::simulator::network
