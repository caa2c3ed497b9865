#include <chrono>
#include <map>
#include <string>
#include <variant>

#include <gtest/gtest.h>

#include "simulator/network/TestScenarios.h"

// What each scenario is there to show.

namespace quorl::simulator::network {
namespace {

using namespace std::chrono_literals;

/// Counts of what happened in a drive.
struct Drive {
  std::map<std::size_t, std::size_t> events;  // by kind
  std::map<Technology, std::size_t> measurements;
  std::map<CallEnd, std::size_t> ends;
  std::size_t reestablished = 0;
  std::size_t rejected = 0;
  std::size_t fellBack = 0;
  std::size_t handedToCircuit = 0;
  std::size_t ignoredPages = 0;
  std::size_t networkChanges = 0;
  std::size_t nrResumptions = 0;
  std::map<event::CueKind, std::size_t> cues;

  template <typename Event>
  std::size_t count() const {
    const auto found = events.find(ModemEventBody(Event{}).index());
    return found == events.end() ? 0 : found->second;
  }
};

Drive drive(const std::string& scenario, std::chrono::milliseconds duration, std::uint64_t seed = 1) {
  Drive result;
  Modem modem(shippedScenario(scenario), seed);
  modem.advance(duration, [&](const ModemEvent& event, const SubscriptionState& state) {
    ++result.events[event.body.index()];
    if (as<event::Measured>(event) != nullptr) ++result.measurements[state.technology];
    if (const auto* changed = as<event::RrcChanged>(event))
      result.reestablished +=
          changed->state == RrcState::Connected && changed->cause == RrcCause::ReestablishLink ? 1U : 0U;
    if (const auto* attempt = as<event::RegistrationAttempted>(event)) result.rejected += attempt->isAccepted ? 0U : 1U;
    if (const auto* page = as<event::PageResponseFailed>(event))
      result.ignoredPages += page->cause == event::PageFailure::Ignored ? 1U : 0U;
    if (as<event::PlmnChanged>(event) != nullptr) ++result.networkChanges;
    if (const auto* resumed = as<event::NrResumed>(event)) result.nrResumptions += resumed->isSuccess ? 1U : 0U;
    if (const auto* cue = as<event::Cue>(event)) result.cues[cue->kind] += cue->count;
    const auto* call = as<event::CallProgress>(event);
    if (call == nullptr || call->step != event::CallStep::Ended) return;
    ++result.ends[state.call.end];
    result.fellBack += state.call.isFallback && state.call.connectedMs ? 1U : 0U;
    result.handedToCircuit += state.call.wasHandedToCircuit ? 1U : 0U;
  });
  return result;
}

TEST(ShippedScenariosTest, TheCityHasEveryKindOfEvent) {
  const Drive city = drive("city", 3h);
  // The last kind is a cue, which only a script gives.
  for (std::size_t kind = 0; kind + 1 < std::variant_size_v<ModemEventBody>; ++kind)
    EXPECT_TRUE(city.events.contains(kind)) << "kind " << kind;
  EXPECT_EQ(city.measurements.size(), 4U) << "GSM, UMTS, LTE and NR";
  EXPECT_GT(city.fellBack, 0U);
  EXPECT_GT(city.ignoredPages, 0U);
}

TEST(ShippedScenariosTest, TheMotorwayCrossesABorderAndAStretchWithoutLte) {
  const Drive motorway = drive("motorway", 90min);
  EXPECT_GE(motorway.networkChanges, 3U);
  EXPECT_GT(motorway.rejected, 0U);
  EXPECT_GT(motorway.handedToCircuit, 0U);
  EXPECT_GT(motorway.measurements.at(Technology::Umts), 500U);
  EXPECT_GT(motorway.count<event::CdmaScanned>(), 0U);
}

TEST(ShippedScenariosTest, TheTunnelBreaksLinksAndCalls) {
  const Drive tunnel = drive("tunnel", 1h);
  EXPECT_GT(tunnel.count<event::RadioLinkFailed>(), 5U);
  EXPECT_GT(tunnel.reestablished, 0U);
  EXPECT_GT(tunnel.ends.at(CallEnd::Dropped), 0U);
  EXPECT_GT(tunnel.count<event::HealthFinding>(), 0U);
}

TEST(ShippedScenariosTest, DeepInsideCallsFallBack) {
  const Drive indoor = drive("weak-indoor", 2h);
  EXPECT_GT(indoor.fellBack, 2U);
  EXPECT_GT(indoor.measurements.at(Technology::Umts), 500U);
  EXPECT_GT(indoor.measurements.at(Technology::Gsm), 100U);
  EXPECT_GT(indoor.count<event::LinkQualityChanged>(), 5U);
}

TEST(ShippedScenariosTest, TwoSimsComeAndGo) {
  const Drive walk = drive("dual-sim", 1h);
  EXPECT_GE(walk.count<event::SimChanged>(), 6U);
  EXPECT_GT(walk.ignoredPages, 0U);
  EXPECT_GT(walk.nrResumptions, 0U);
}

TEST(ShippedScenariosTest, TheHostileBasebandIsCuedInTime) {
  Drive hostile = drive("hostile", 10min);
  EXPECT_EQ(hostile.cues[event::CueKind::Malformed], 20U * 120U);
  EXPECT_EQ(hostile.cues[event::CueKind::Oversized], 2U * 30U);
  EXPECT_EQ(hostile.cues[event::CueKind::Burst], 5000U * 20U);
  EXPECT_GT(hostile.count<event::OperatingModeChanged>(), 10U);
}

TEST(ShippedScenariosTest, RushHourIsBusy) {
  const Drive busy = drive("busy", 10min);
  EXPECT_GT(busy.count<event::Handover>(), 10U);
  EXPECT_GT(busy.count<event::CarriersChanged>(), 50U);
  EXPECT_GT(busy.count<event::Measured>(), 3000U);
}

}  // namespace
}  // namespace quorl::simulator::network
