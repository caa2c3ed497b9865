#pragma once

#include <memory>
#include <vector>

#include "base/Clock.h"
#include "base/Queue.h"
#include "hosts/simulator/BasebandManager.h"
#include "hosts/simulator/Recording.h"
#include "hosts/simulator/TelephonySimulator.h"

namespace quorl::desktop {

/// What a simulated phone hears: a recording that is played over and over, and a telephony script that is played once.
/// Main thread.
class PlayedRadio {
 public:
  using Steps = std::vector<simulator::TelephonyScriptStep>;
  struct Phone {
    simulator::BasebandManager& baseband;
    simulator::TelephonySimulator& telephony;
    Queue& mainQueue;
    const Clock& clock;
  };

  /// Plays events, in order of time, and steps so many times as fast as they were, which is above 0. The phone must
  /// outlive it. How the SIMs are found at the start is so from here on.
  PlayedRadio(std::vector<simulator::RecordedEvent> events, Steps steps, double speed, Phone phone);
  ~PlayedRadio();
  PlayedRadio(const PlayedRadio&) = delete;
  PlayedRadio& operator=(const PlayedRadio&) = delete;

  /// Starts to play. Each event bears the time of its delivery.
  void start();

 private:
  struct State;
  static void playNext(const std::shared_ptr<State>& state);

  const std::shared_ptr<State> state_;
};

}  // namespace quorl::desktop
