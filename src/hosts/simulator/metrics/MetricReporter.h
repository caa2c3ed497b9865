#pragma once

#include <array>
#include <cmath>
#include <cstdint>
#include <functional>
#include <span>
#include <vector>

#include "base/SharedBytes.h"
#include "hosts/simulator/metrics/MetricKinds.h"

namespace quorl::simulator::metrics {

enum class Family : std::uint8_t { Mav, Ice };

/// All kinds of metric that a family reports, in the order in which a query brings them.
std::vector<MetricKind> kindsOf(Family family);

struct ReportedMetric {
  network::SimulatedMs atMs = 0;
  std::int64_t metricId = 0;
  ByteString payload;
};

/// Which time of day a modem's time is.
struct TimeOfDay {
  std::uint64_t sinceEpochMs = 0;  // at `modemMs`
  network::SimulatedMs modemMs = 0;
  double speed = 1;  // of the modem's time, more than 0

  std::uint64_t at(network::SimulatedMs nowMs) const {
    const double passed = static_cast<double>(nowMs) - static_cast<double>(modemMs);
    return sinceEpochMs + static_cast<std::uint64_t>(std::llround(passed / speed));
  }
};

/// Makes metrics of what happens in a modem: for each event those that it calls for, in the order of the family's
/// kinds, and on a query those that have a value now.
///
/// The same events give the same metrics, byte for byte, wherever and whenever. One thread at a time.
class MetricReporter {
 public:
  using Sink = std::function<void(ReportedMetric metric)>;

  /// `startMs` is the time since 1970 at which the modem's time 0 lies.
  MetricReporter(Family family, std::uint64_t salt, std::uint64_t startMs);
  /// The times in payloads are such from now on.
  void keepTime(const TimeOfDay& time) { time_ = time; }

  /// What the event calls for. `state` is its subscription's, right after it.
  void take(const network::ModemEvent& event, const network::SubscriptionState& state, const Sink& sink);
  /// The metrics of `wanted` that have a value now, in the order of the kinds. Nothing for a subscription without SIM.
  /// `nowMs`: the modem's time; a state says when it last changed.
  void snapshot(const network::SubscriptionState& state, network::SimulatedMs nowMs,
                std::span<const std::int64_t> wanted, const Sink& sink);

 private:
  struct Tracked {
    MetricKind kind;
    std::array<std::uint64_t, 2> lastMs{};  // by subscription, one past the time of the last report; 0: none yet
    std::array<Baseline, 2> baseline;
  };

  void report(Tracked& tracked, const network::SubscriptionState& state, network::SimulatedMs nowMs,
              const network::ModemEventBody* event, const Sink& sink);
  void obey(const network::event::Cue& cue, network::SimulatedMs nowMs, const Sink& sink) const;

  const std::uint64_t salt_;
  TimeOfDay time_;
  std::vector<Tracked> tracked_;
  ReportedMetric last_;  // what a damaged payload is made from
};

}  // namespace quorl::simulator::metrics
