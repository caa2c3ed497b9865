#pragma once

#include <array>

#include "hosts/simulator/network/SubscriptionCore.h"

namespace quorl::simulator::network {

/// What the phone notices of itself: quality of the link, failures that come too often, the state of the antenna tuner.
class Health final : public RadioUser {
 public:
  explicit Health(SubscriptionCore& core) : core_(core) {}

  void powerOn();
  void powerOff();
  /// A round of measurements, in idle too.
  void measured();
  /// Timer.
  void gripChanged();

  void cellChanged(const Cell* from, const Cell* to) override;

 private:
  /// A counter and what it was at the start of a window; findings come once a window.
  struct Watch {
    event::HealthKind kind;
    std::uint64_t Counters::*counter;
    std::uint64_t limit;
    std::uint64_t before = 0;
    bool isTold = false;
  };

  void judgeLink();
  void watchCounters();
  void watchFloor();
  void tune();

  SubscriptionCore& core_;
  std::array<Watch, 6> watches_{{
      {event::HealthKind::FrequentLinkFailures, &Counters::linkFailures, 3},
      {event::HealthKind::FrequentRachFailures, &Counters::rachFailures, 5},
      {event::HealthKind::FrequentNrLinkFailures, &Counters::nrLinkFailures, 3},
      {event::HealthKind::FrequentNrRachFailures, &Counters::nrRachFailures, 3},
      {event::HealthKind::RepeatedGroupFailures, &Counters::secondaryGroupFailures, 3},
      {event::HealthKind::RepeatedBeamFailures, &Counters::beamFailures, 5},
  }};
  SimulatedMs windowMs_ = 0;
  SimulatedMs floorSinceMs_ = 0;
  SimulatedMs lostSinceMs_ = 0;
  bool isFloorTold_ = false;
  LinkQuality candidate_ = LinkQuality::Unknown;
  SimulatedMs candidateMs_ = 0;
  std::uint64_t rachFailuresSeen_ = 0;
  std::uint8_t scenario_ = 0;
};

}  // namespace quorl::simulator::network
