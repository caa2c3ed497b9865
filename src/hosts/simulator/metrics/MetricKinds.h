#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <type_traits>
#include <variant>

#include "base/SharedBytes.h"
#include "hosts/simulator/network/ModemEvent.h"
#include "hosts/simulator/network/ModemState.h"

// Which metrics a simulated modem reports, on what occasion, and how each payload is made.

namespace quorl::simulator::metrics {

/// A set of kinds of modem event.
using EventSet = std::uint64_t;

template <typename Event, typename Variant>
struct IndexIn;
template <typename Event, typename... Others>
struct IndexIn<Event, std::variant<Others...>> {
  static constexpr std::size_t value = [] {
    std::size_t index = 0;
    bool isFound = false;
    ((isFound = isFound || std::is_same_v<Event, Others>, index += isFound ? 0 : 1), ...);
    return index;
  }();
};

template <typename... Events>
constexpr EventSet on() {
  return ((EventSet{1} << IndexIn<Events, network::ModemEventBody>::value) | ...);
}

inline EventSet setOf(const network::ModemEventBody& event) {
  return EventSet{1} << event.index();
}

/// Counters as they were when a metric was last reported.
struct Baseline {
  network::SimulatedMs atMs = 0;
  network::Counters counters;
};

/// What a payload is made from. An event, or none when the metric is asked for as it stands now.
struct Moment {
  const network::SubscriptionState& state;
  const network::ModemEventBody* event = nullptr;
  std::uint64_t timestampMs = 0;       // since 1970
  std::uint64_t salt = 0;              // of the run, for what the world leaves open
  const Baseline* baseline = nullptr;  // of metrics that count; never null for those

  template <typename Event>
  const Event* get() const {
    return event != nullptr ? std::get_if<Event>(event) : nullptr;
  }
};

/// How often a metric comes on rounds of measurements, at most.
struct Pace {
  std::uint32_t idleMs = 0;
  std::uint32_t connectedMs = 0;
};

struct MetricKind {
  std::int64_t metricId = 0;
  EventSet occasions = 0;
  /// Nothing when there is nothing to report at this moment, such as a metric of a technology that is not in use.
  std::optional<ByteString> (*make)(const Moment& moment) = nullptr;
  bool isCurrent = false;  // has a value at any time, so a query brings it
  Pace pace{};             // for `Measured`; other occasions are reported at once
  bool counts = false;     // reports what has come since its last report
};

// Family Mav.
std::span<const MetricKind> nrCellKinds();
std::span<const MetricKind> nrConnectionKinds();
std::span<const MetricKind> lteKinds();
std::span<const MetricKind> serviceKinds();
std::span<const MetricKind> healthKinds();
std::span<const MetricKind> circuitSwitchedKinds();
// Family Ice.
std::span<const MetricKind> iceLteCellKinds();
std::span<const MetricKind> iceLteConnectionKinds();
std::span<const MetricKind> iceUmtsKinds();
std::span<const MetricKind> iceRegistrationKinds();

}  // namespace quorl::simulator::metrics
