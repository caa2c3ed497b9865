#include "hosts/simulator/metrics/MetricReporter.h"

#include <algorithm>
#include <utility>

#include "hosts/simulator/metrics/HostilePayloads.h"
#include "hosts/simulator/metrics/MetricFields.h"

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::SubscriptionState;

std::vector<MetricKind> kindsOf(Family family) {
  std::vector<MetricKind> kinds;
  const auto add = [&kinds](std::span<const MetricKind> more) { kinds.insert(kinds.end(), more.begin(), more.end()); };
  switch (family) {
    case Family::Mav:
      add(nrCellKinds());
      add(nrConnectionKinds());
      add(lteKinds());
      add(serviceKinds());
      add(healthKinds());
      add(circuitSwitchedKinds());
      break;
    case Family::Ice:
      add(iceLteCellKinds());
      add(iceLteConnectionKinds());
      add(iceUmtsKinds());
      add(iceRegistrationKinds());
      break;
  }
  return kinds;
}

MetricReporter::MetricReporter(Family family, std::uint64_t salt, std::uint64_t startMs) : salt_(salt), time_{startMs} {
  for (const MetricKind& kind : kindsOf(family)) tracked_.push_back({kind, {}, {}});
}

void MetricReporter::report(Tracked& tracked, const SubscriptionState& state, network::SimulatedMs nowMs,
                            const network::ModemEventBody* event, const Sink& sink) {
  const std::size_t slot = state.subscription;
  const Moment moment{state, event, time_.at(nowMs), salt_, &tracked.baseline[slot]};
  std::optional<ByteString> payload = tracked.kind.make(moment);
  if (!payload) return;
  tracked.lastMs[slot] = nowMs + 1;
  if (tracked.kind.counts) tracked.baseline[slot] = {nowMs, state.counters};
  last_ = {nowMs, tracked.kind.metricId, *std::move(payload)};
  sink(last_);
}

void MetricReporter::take(const network::ModemEvent& event, const SubscriptionState& state, const Sink& sink) {
  if (const auto* cue = std::get_if<event::Cue>(&event.body)) return obey(*cue, event.atMs, sink);
  const EventSet set = setOf(event.body);
  const bool isRound = std::holds_alternative<event::Measured>(event.body);
  const bool isBusy = isConnected(state);
  for (Tracked& tracked : tracked_) {
    if ((tracked.kind.occasions & set) == 0) continue;
    const std::uint64_t lastMs = tracked.lastMs[state.subscription];
    const std::uint32_t paceMs = isBusy ? tracked.kind.pace.connectedMs : tracked.kind.pace.idleMs;
    if (isRound && lastMs != 0 && event.atMs + 1 < lastMs + paceMs) continue;
    report(tracked, state, event.atMs, &event.body, sink);
  }
}

void MetricReporter::snapshot(const SubscriptionState& state, network::SimulatedMs nowMs,
                              std::span<const std::int64_t> wanted, const Sink& sink) {
  if (!state.isSimPresent) return;
  for (Tracked& tracked : tracked_) {
    const bool isWanted = std::find(wanted.begin(), wanted.end(), tracked.kind.metricId) != wanted.end();
    if (tracked.kind.isCurrent && isWanted) report(tracked, state, nowMs, nullptr, sink);
  }
}

/// Traffic that has nothing to do with the radio, as a broken or malicious manager might deliver.
void MetricReporter::obey(const event::Cue& cue, network::SimulatedMs nowMs, const Sink& sink) const {
  for (std::uint32_t number = 0; number < cue.count; ++number) {
    switch (cue.kind) {
      case event::CueKind::Malformed:
        sink({nowMs, last_.metricId, damaged(last_.payload, salt_ ^ nowMs, number)});
        break;
      case event::CueKind::Oversized:
        sink({nowMs, last_.metricId, inflated(last_.payload, cue.bytes)});
        break;
      case event::CueKind::Burst:
        sink({nowMs, last_.metricId, last_.payload});
        break;
    }
  }
}

}  // namespace quorl::simulator::metrics
