#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <span>

#include "hosts/simulator/Recording.h"
#include "hosts/simulator/metrics/MetricReporter.h"
#include "hosts/simulator/network/Modem.h"

namespace quorl::simulator {

/// A scenario, and which of its runs is meant.
struct ScenarioChoice {
  network::Scenario scenario;
  std::uint64_t seed = 1;
  metrics::Family family = metrics::Family::Mav;
};

/// What a phone's baseband manager delivers on the way through a scenario. Knows neither clock nor thread: whoever
/// owns it lets time pass. The same choice and start give the same events, byte for byte. One thread at a time.
class ScenarioRun {
 public:
  using Sink = std::function<void(RecordedEvent event)>;
  using Observer = network::Modem::Listener;

  /// `startMs`: the time since 1970 at which the run begins, for the times in the payloads.
  ScenarioRun(ScenarioChoice choice, std::uint64_t startMs);
  /// It is so many ms since 1970 now, and simulated time passes `speed` times as fast as the times in payloads.
  void keepTime(std::uint64_t sinceEpochMs, double speed) { reporter_.keepTime({sinceEpochMs, nowMs(), speed}); }

  /// Lets this much simulated time pass. `atMs` of an event counts from the start of the run. `observer` sees every
  /// event of the modem before its metrics are made; it may be empty.
  void advance(std::chrono::milliseconds duration, const Sink& sink, const Observer& observer = {});
  /// The current values of the metrics in `wanted`, of both subscriptions.
  void snapshot(std::span<const std::int64_t> wanted, const Sink& sink);

  network::SimulatedMs nowMs() const { return modem_.nowMs(); }
  const network::Modem& modem() const { return modem_; }

 private:
  network::Modem modem_;
  metrics::MetricReporter reporter_;
};

}  // namespace quorl::simulator
