#include "recording/RecordingMaker.h"

#include <algorithm>
#include <utility>

#include "hosts/simulator/Configuration.h"
#include "recording/EventKinds.h"

namespace quorl::tool {
namespace {

constexpr std::uint32_t kLengthMs = 600000;

struct Moment {
  std::uint32_t atMs;
  std::uint32_t subsId;
  const EventKind* kind;
};

std::vector<std::span<const EventKind>> kindsOf(BasebandFamily family) {
  switch (family) {
    case BasebandFamily::Mav:
      return {nrKinds(), lteKinds(), serviceKinds(), circuitSwitchedKinds()};
    case BasebandFamily::Ice:
      return {iceLteKinds(), iceCircuitSwitchedKinds(), iceNasKinds()};
  }
  return {};
}

/// When each kind comes. The subscriptions take turns.
std::vector<Moment> schedule(BasebandFamily family, RadioWorld& world) {
  std::vector<Moment> moments;
  for (const std::span<const EventKind> kinds : kindsOf(family)) {
    for (const EventKind& kind : kinds) {
      std::uint32_t turn = world.count(0, 1);
      for (std::uint32_t at = world.count(0, kind.everyMs / 2); at < kLengthMs;
           at += kind.everyMs - kind.everyMs / 8 + world.count(0, kind.everyMs / 4))
        moments.push_back({at, turn++ % 2, &kind});
    }
  }
  std::stable_sort(moments.begin(), moments.end(), [](const Moment& a, const Moment& b) { return a.atMs < b.atMs; });
  return moments;
}

}  // namespace

std::vector<simulator::RecordedEvent> makeRecording(BasebandFamily family, std::uint64_t seed) {
  constexpr std::int64_t kTriggerRef = 9999;
  RadioWorld world(seed);
  std::vector<simulator::RecordedEvent> events;
  for (const Moment& moment : schedule(family, world)) {
    world.goTo(moment.atMs, moment.subsId);
    simulator::RecordedEvent event;
    event.atMs = moment.atMs;
    event.metricID = moment.kind->metricID;
    event.payload = moment.kind->make(world);
    event.triggerRef = kTriggerRef;
    event.profileID = 0;
    event.appID = simulator::Configuration::kApplicationId;
    events.push_back(std::move(event));
  }
  return events;
}

}  // namespace quorl::tool
