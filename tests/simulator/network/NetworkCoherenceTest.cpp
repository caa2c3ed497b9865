#include <algorithm>
#include <array>
#include <bit>
#include <chrono>
#include <cstdint>
#include <deque>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

#include "simulator/network/TestScenarios.h"

namespace quorl::simulator::network {
namespace {

using namespace std::chrono_literals;

/// Every shipped scenario, driven for three quarters of an hour.
class NetworkCoherenceTest : public ::testing::TestWithParam<const char*> {
 protected:
  void drive(const Modem::Listener& listener) {
    Modem modem(shippedScenario(GetParam()), 3);
    modem.advance(45min, listener);
  }
  static bool isScenario(std::string_view name) { return name == GetParam(); }
};

INSTANTIATE_TEST_SUITE_P(Scenarios, NetworkCoherenceTest, ::testing::ValuesIn(kShippedScenarios),
                         [](const auto& parameter) {
                           std::string name = parameter.param;
                           std::erase(name, '-');
                           return name;
                         });

TEST_P(NetworkCoherenceTest, EventsComeInTheOrderOfTheirTime) {
  SimulatedMs last = 0;
  drive([&](const ModemEvent& event, const SubscriptionState& state) {
    EXPECT_GE(event.atMs, last);
    last = event.atMs;
    if (as<event::Cue>(event) == nullptr) {
      EXPECT_EQ(state.nowMs, event.atMs);
      EXPECT_EQ(state.subscription, event.subscription);
    }
  });
  EXPECT_GT(last, 2600000U);
}

/// What was measured in one round of a connection.
struct Round {
  SimulatedMs atMs = 0;
  const Cell* serving = nullptr;
  Centi servingPower = 0;
  std::map<const Cell*, Centi> others;
};

TEST_P(NetworkCoherenceTest, AHandoverFollowsMeasurementsThatCallForIt) {
  std::array<std::deque<Round>, 2> rounds;
  std::size_t handovers = 0;
  drive([&](const ModemEvent& event, const SubscriptionState& state) {
    auto& history = rounds[event.subscription];
    if (as<event::Measured>(event) != nullptr && state.serving) {
      Round round{event.atMs, state.serving->best.cell, state.serving->best.power, {}};
      for (const CellMeasurement& other : state.neighbours) round.others[other.cell] = other.power;
      for (const CellMeasurement& other : state.otherNeighbours) round.others[other.cell] = other.power;
      history.push_back(std::move(round));
      if (history.size() > 30) history.pop_front();
    }
    const auto* handover = as<event::Handover>(event);
    if (handover == nullptr) return;
    ++handovers;
    // The round whose report led to it, and those of the time to trigger before.
    auto reported = history.rbegin();
    while (reported != history.rend() &&
           (reported->serving != handover->from || reported->servingPower != handover->servingPower ||
            !reported->others.contains(handover->to) || reported->others.at(handover->to) != handover->targetPower))
      ++reported;
    ASSERT_NE(reported, history.rend()) << "at " << event.atMs;
    EXPECT_LE(event.atMs - reported->atMs, 300U);
    for (auto round = reported; round != history.rend(); ++round) {
      if (round->atMs + handover->timeToTriggerMs < reported->atMs) break;
      ASSERT_TRUE(round->others.contains(handover->to)) << "at " << event.atMs;
      const Centi target = round->others.at(handover->to);
      EXPECT_EQ(round->serving, handover->from);
      switch (handover->trigger) {
        case event::HandoverTrigger::A3:
          EXPECT_GT(target, round->servingPower + 400) << "at " << event.atMs;
          break;
        case event::HandoverTrigger::A5:
          EXPECT_LT(round->servingPower, -11100);
          EXPECT_GT(target, -10400);
          break;
        case event::HandoverTrigger::B2:
          EXPECT_LT(round->servingPower, -11000);
          EXPECT_NE(handover->from->technology, handover->to->technology);
          break;
        case event::HandoverTrigger::B1:
        case event::HandoverTrigger::Redirection:
          ADD_FAILURE() << "not a handover's trigger";
      }
    }
    if (handover->isSuccess) {
      ASSERT_TRUE(state.serving);
      EXPECT_EQ(state.serving->best.cell, handover->to);
    }
  });
  if (!isScenario("weak-indoor")) {
    EXPECT_GT(handovers, 5U);
  }
}

TEST_P(NetworkCoherenceTest, AConnectionEndsBeforeTheNextBegins) {
  struct Link {
    bool isOpen = false;
    RrcState state = RrcState::None;
    SimulatedMs sinceMs = 0;
  };
  std::array<Link, 2> links;
  std::size_t connections = 0;
  drive([&](const ModemEvent& event, const SubscriptionState& state) {
    Link& link = links[event.subscription];
    if (const auto* changed = as<event::RrcChanged>(event); changed != nullptr && !changed->isNonStandAlone) {
      EXPECT_EQ(changed->previous, link.state) << "at " << event.atMs;
      EXPECT_EQ(changed->previousMs, event.atMs - link.sinceMs);
      EXPECT_EQ(changed->state, state.rrc);
      const bool isUp = changed->state == RrcState::Connected || changed->state == RrcState::CellDch;
      const bool isAgain = changed->previous == RrcState::CellFach || changed->previous == RrcState::CellPch ||
                           changed->previous == RrcState::UraPch || changed->cause == RrcCause::ReestablishLink ||
                           changed->cause == RrcCause::ReestablishHandover;
      if (isUp) {
        EXPECT_EQ(link.isOpen, isAgain) << "at " << event.atMs;
        link.isOpen = true;
        ++connections;
      }
      if (changed->state == RrcState::Idle || changed->state == RrcState::None ||
          changed->state == RrcState::Inactive) {
        EXPECT_FALSE(link.isOpen) << "at " << event.atMs;
      }
      link.state = changed->state;
      link.sinceMs = event.atMs;
    } else if (const auto* ended = as<event::ConnectionEnded>(event); ended != nullptr && !ended->isNonStandAlone) {
      EXPECT_TRUE(link.isOpen) << "at " << event.atMs;
      link.isOpen = false;
    } else if (const auto* handover = as<event::Handover>(event); handover != nullptr && handover->isSuccess) {
      // On the new cell it goes on; the other technologies have told so by their state.
      link.isOpen = true;
    }
  });
  EXPECT_GT(connections, 20U);
}

TEST_P(NetworkCoherenceTest, CountersNeverRunBack) {
  using Numbers = std::array<std::uint64_t, sizeof(Counters) / sizeof(std::uint64_t)>;
  std::array<Numbers, 2> last{};
  drive([&](const ModemEvent& event, const SubscriptionState& state) {
    const auto now = std::bit_cast<Numbers>(state.counters);
    Numbers& before = last[state.subscription];
    for (std::size_t i = 0; i < now.size(); ++i)
      ASSERT_GE(now[i], before[i]) << "counter " << i << " at " << event.atMs;
    before = now;
  });
  EXPECT_GT(std::bit_cast<Counters>(last[0]).downlinkBytes, 1000000U);
  EXPECT_GT(std::bit_cast<Counters>(last[0]).registrations, 0U);
}

TEST_P(NetworkCoherenceTest, TheSecondaryGroupComesAndGoesWithItsConnection) {
  std::array<std::optional<SimulatedMs>, 2> added;
  std::size_t removals = 0;
  drive([&](const ModemEvent& event, const SubscriptionState& state) {
    auto& since = added[event.subscription];
    if (const auto* addition = as<event::SecondaryGroupAdded>(event); addition != nullptr && addition->isSuccess) {
      EXPECT_EQ(since.has_value(), addition->isChange) << "at " << event.atMs;
      ASSERT_TRUE(state.nr);
      EXPECT_EQ(state.technology, Technology::Lte);
      EXPECT_EQ(state.rrc, RrcState::Connected);
      EXPECT_TRUE(state.serving->best.cell->isNrAnchor);
      EXPECT_EQ(addition->cell->technology, Technology::Nr);
      EXPECT_EQ(addition->cell->plmn, state.serving->best.cell->plmn);
      EXPECT_FALSE(state.saving.isFr1Disabled);
      if (!since) since = event.atMs;
    } else if (const auto* removal = as<event::SecondaryGroupRemoved>(event)) {
      ASSERT_TRUE(since) << "at " << event.atMs;
      EXPECT_EQ(removal->durationMs, event.atMs - *since);
      EXPECT_LE(removal->group.beamRecoveries, removal->group.beamFailures);
      EXPECT_FALSE(state.nr);
      since.reset();
      ++removals;
    } else if (as<event::RrcChanged>(event) != nullptr && state.rrc == RrcState::Idle) {
      EXPECT_FALSE(since) << "at " << event.atMs;
    }
  });
  if (isScenario("city")) {
    EXPECT_GT(removals, 0U);
  }
}

TEST_P(NetworkCoherenceTest, CarriersAreOthersOfTheSameSite) {
  std::size_t seen = 0;
  drive([&](const ModemEvent& event, const SubscriptionState& state) {
    if (as<event::CarriersChanged>(event) == nullptr || state.carriers.empty()) return;
    EXPECT_EQ(state.rrc, RrcState::Connected);
    const Cell& primary = *state.serving->best.cell;
    std::set<std::uint32_t> channels{primary.downlinkChannel};
    for (const SecondaryCarrier& carrier : state.carriers) {
      const Cell& cell = *carrier.serving.best.cell;
      EXPECT_EQ(cell.siteIndex, primary.siteIndex);
      EXPECT_EQ(cell.technology, Technology::Lte);
      EXPECT_TRUE(channels.insert(cell.downlinkChannel).second) << "at " << event.atMs;
      EXPECT_NE(carrier.state, CarrierState::Deconfigured);
      ++seen;
    }
  });
  if (isScenario("busy")) {
    EXPECT_GT(seen, 0U);
  }
}

TEST_P(NetworkCoherenceTest, ACallGoesThroughItsStepsToItsEnd) {
  std::optional<std::uint32_t> current;
  std::uint8_t owner = 0;
  event::CallStep last = event::CallStep::Ended;
  std::uint32_t lastId = 0;
  std::size_t ended = 0;
  drive([&](const ModemEvent& event, const SubscriptionState& state) {
    const auto* progress = as<event::CallProgress>(event);
    if (progress == nullptr) return;
    const Call& call = state.call;
    if (progress->step == event::CallStep::Dialled || progress->step == event::CallStep::Paged) {
      EXPECT_FALSE(current) << "two calls at once, at " << event.atMs;
      EXPECT_GT(call.id, lastId);
      current = lastId = call.id;
      owner = event.subscription;
      EXPECT_EQ(call.isOutgoing, progress->step == event::CallStep::Dialled);
    } else {
      ASSERT_TRUE(current) << "at " << event.atMs;
      EXPECT_EQ(call.id, *current);
      EXPECT_EQ(event.subscription, owner);
      if (progress->step != event::CallStep::HandedOver && progress->step != event::CallStep::FallbackOrdered) {
        EXPECT_GT(progress->step, last) << "at " << event.atMs;
      }
    }
    if (progress->step != event::CallStep::HandedOver) last = progress->step;
    if (progress->step != event::CallStep::Ended) return;
    ++ended;
    current.reset();
    ASSERT_TRUE(call.endedMs);
    EXPECT_GE(*call.endedMs, call.startedMs);
    SimulatedMs before = call.startedMs;
    for (const auto& moment : {call.fallbackMs, call.setupMs, call.alertedMs, call.connectedMs, call.endedMs}) {
      if (!moment) continue;
      EXPECT_GE(*moment, before);
      before = *moment;
    }
    const bool isAnswered = call.connectedMs.has_value();
    switch (call.end) {
      case CallEnd::LocalHangUp:
      case CallEnd::RemoteHangUp:
        EXPECT_TRUE(isAnswered);
        EXPECT_EQ(call.releaseCause, 16);
        break;
      case CallEnd::Cancelled:
      case CallEnd::NoAnswer:
      case CallEnd::SetupFailed:
      case CallEnd::FallbackFailed:
        EXPECT_FALSE(isAnswered);
        EXPECT_NE(call.releaseCause, 16);
        break;
      case CallEnd::Dropped:
        EXPECT_NE(call.releaseCause, 16);
        break;
    }
  });
  EXPECT_GT(ended, 3U);
}

TEST_P(NetworkCoherenceTest, ServiceIsToldAsItIs) {
  std::array<ServiceStatus, 2> told{ServiceStatus::NoService, ServiceStatus::NoService};
  std::array<SimulatedMs, 2> since{};
  drive([&](const ModemEvent& event, const SubscriptionState& state) {
    ServiceStatus& last = told[event.subscription];
    if (const auto* changed = as<event::ServiceChanged>(event)) {
      EXPECT_EQ(changed->previous, last) << "at " << event.atMs;
      EXPECT_EQ(changed->previousMs, event.atMs - since[event.subscription]);
      last = state.service;
      since[event.subscription] = event.atMs;
    }
    if (as<event::Measured>(event) == nullptr) return;
    EXPECT_EQ(state.service, last);
    const bool isServed = state.serving && state.registration.state == RegistrationState::Registered &&
                          state.registration.plmn == state.serving->best.cell->plmn;
    EXPECT_EQ(state.service == ServiceStatus::Service, isServed) << "at " << event.atMs;
  });
}

TEST_P(NetworkCoherenceTest, ALinkFailureHasABadLinkBeforeIt) {
  std::array<std::optional<SimulatedMs>, 2> lastBad;
  std::size_t failures = 0;
  drive([&](const ModemEvent& event, const SubscriptionState& state) {
    if (!state.serving) return;
    const CellMeasurement& serving = state.serving->best;
    auto& bad = lastBad[event.subscription];
    if (as<event::ServingCellChanged>(event) != nullptr) bad.reset();
    if (as<event::Measured>(event) != nullptr && serving.sinr < -800) bad = event.atMs;
    const auto* failed = as<event::RadioLinkFailed>(event);
    if (failed == nullptr || failed->isNonStandAlone || failed->reason != event::LinkFailureReason::T310Expiry) return;
    EXPECT_EQ(serving.cell, failed->cell);
    if (serving.cell->technology != Technology::Lte && serving.cell->technology != Technology::Nr) return;
    // T310 began with a bad round; it may run out while the link is just getting better.
    ASSERT_TRUE(bad) << "at " << event.atMs;
    EXPECT_LE(event.atMs - *bad, failed->timerMs) << "at " << event.atMs;
    ++failures;
  });
  if (isScenario("tunnel")) {
    EXPECT_GT(failures, 0U);
  }
}

}  // namespace
}  // namespace quorl::simulator::network
