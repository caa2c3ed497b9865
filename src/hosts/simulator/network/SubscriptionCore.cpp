#include "hosts/simulator/network/SubscriptionCore.h"

#include <algorithm>

namespace quorl::simulator::network {
namespace {

constexpr std::size_t kMostNeighbours = 8;
constexpr std::size_t kMostOthers = 6;  // of each technology

void take(std::vector<CellMeasurement>& list, const std::vector<CellMeasurement>& found, const Cell* serving,
          std::size_t most) {
  for (const CellMeasurement& measurement : found) {
    if (most == 0) return;
    if (measurement.cell == serving) continue;
    list.push_back(measurement);
    --most;
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
    take(isOwn ? state.neighbours : state.otherNeighbours, receiver.found(technology), serving,
         isOwn ? kMostNeighbours : kMostOthers);
  }
  if (serving != nullptr) state.serving = receiver.serve(*serving);
}

}  // namespace quorl::simulator::network
