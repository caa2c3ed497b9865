#include "hosts/simulator/ScenarioRun.h"

#include <utility>

#include "hosts/simulator/Configuration.h"

namespace quorl::simulator {
namespace {

constexpr std::int64_t kTriggerRef = 9999;
constexpr std::int64_t kProfile = 0;

metrics::MetricReporter::Sink delivering(const ScenarioRun::Sink& sink) {
  return [&sink](metrics::ReportedMetric metric) {
    RecordedEvent event;
    event.atMs = metric.atMs;
    event.metricID = metric.metricId;
    event.payload = std::move(metric.payload);
    event.triggerRef = kTriggerRef;
    event.profileID = kProfile;
    event.appID = Configuration::kApplicationId;
    sink(std::move(event));
  };
}

}  // namespace

ScenarioRun::ScenarioRun(ScenarioChoice choice, std::uint64_t startMs)
    : modem_(std::move(choice.scenario), choice.seed), reporter_(choice.family, choice.seed, startMs) {}

void ScenarioRun::advance(std::chrono::milliseconds duration, const Sink& sink, const Observer& observer) {
  const auto deliver = delivering(sink);
  modem_.advance(duration, [&](const network::ModemEvent& event, const network::SubscriptionState& state) {
    if (observer) observer(event, state);
    reporter_.take(event, state, deliver);
  });
}

void ScenarioRun::snapshot(std::span<const std::int64_t> wanted, const Sink& sink) {
  const auto deliver = delivering(sink);
  for (const std::uint8_t subscription : {std::uint8_t{0}, std::uint8_t{1}})
    reporter_.snapshot(modem_.state(subscription), modem_.nowMs(), wanted, deliver);
}

}  // namespace quorl::simulator
