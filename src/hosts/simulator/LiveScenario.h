#pragma once

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include <tl/expected.hpp>

#include "base/Clock.h"
#include "base/Queue.h"
#include "hosts/simulator/BasebandLog.h"
#include "hosts/simulator/BasebandManager.h"
#include "hosts/simulator/RecordingWriter.h"
#include "hosts/simulator/ScenarioRun.h"
#include "hosts/simulator/TelephonySimulator.h"

namespace quorl::simulator {

/// Lets a scenario happen beside the product: its metrics come out of the baseband manager as it goes, a query brings
/// a snapshot of them, the telephony service tells of the same world, and the metrics can be recorded.
///
/// The modem lives on a serial queue of its own. It waits for the main queue between two steps, and stands still while
/// the phone is behind, so a product that cannot keep up makes the simulated time slower and nothing piles up.
class LiveScenario {
 public:
  struct Options {
    ScenarioChoice choice;
    double speed = 1;                                  // simulated seconds in a second, more than 0
    std::optional<std::filesystem::path> recording{};  // what is delivered is written there
  };
  struct Surroundings {
    BasebandManager& baseband;
    TelephonySimulator* telephony;  // null: it tells of another world, or of none
    QueueFactory& queues;
    Queue& mainQueue;
    const Clock& clock;
    /// Whether the phone has more to do than it gets done. Asked on the modem's queue; empty: it never has.
    std::function<bool()> isBehind{};
    /// Takes all that the baseband measures and meets, whatever is delivered of it, as lines of a recording; may be
    /// null.
    std::shared_ptr<BasebandLog> log{};
  };
  using Observer = ScenarioRun::Observer;

  /// The error says why the recording cannot be written. The surroundings must outlive it. Time stands until `start`
  /// or `advance`; queries are answered from now on.
  static tl::expected<std::unique_ptr<LiveScenario>, std::string> make(Options options,
                                                                       const Surroundings& surroundings);
  /// Stops, and waits for nothing: a step at hand ends by itself.
  ~LiveScenario();
  LiveScenario(const LiveScenario&) = delete;
  LiveScenario& operator=(const LiveScenario&) = delete;

  /// Sees every event of the modem with the state after it, on the modem's queue. To be set before time passes.
  void setObserver(Observer observer);

  // Any thread; each goes through the modem's queue.

  /// Lets simulated time pass with the clock, by the speed, until `stop`.
  void start();
  void stop();
  /// Lets this much simulated time pass at once.
  void advance(std::chrono::milliseconds duration);
  /// Events delivered so far.
  std::uint64_t events() const;
  /// Ends the recording. `done` is called on the modem's queue with what has come of it.
  void finishRecording(std::function<void(RecordingWriter::Outcome outcome)> done);

 private:
  class Core;
  explicit LiveScenario(std::shared_ptr<Core> core);

  const std::shared_ptr<Core> core_;
};

}  // namespace quorl::simulator
