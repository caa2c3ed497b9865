#pragma once

#include <filesystem>
#include <memory>
#include <optional>
#include <vector>

#include <tl/expected.hpp>

#include "base/Clock.h"
#include "base/SerialQueue.h"
#include "hosts/simulator/BasebandManager.h"
#include "hosts/simulator/LiveScenario.h"
#include "hosts/simulator/PhoneServices.h"
#include "hosts/simulator/SondrelSimulator.h"
#include "hosts/simulator/TelephonySimulator.h"
#include "hosts/simulator/TrackedQueue.h"
#include "platform/Platform.h"

namespace quorl::simulator {

/// A phone that exists only in software and has no screen: every service of a platform, on real threads and the
/// system's clock. The thread that makes it is its main thread, and the main queue runs only inside `runUntilAtRest`.
///
/// The product's process-wide objects refer to it, so it has to outlive all of them; a program keeps it to its end.
class SimulatedPhone {
 public:
  struct Options {
    DeviceDescription device;
    std::filesystem::path documents;
    std::vector<std::filesystem::path> resources;
    bool isConsoleShown = true;  // what the product prints; dialogs are shown in any case
  };

  /// Installs itself as the process's platform.
  explicit SimulatedPhone(Options options);
  ~SimulatedPhone();
  SimulatedPhone(const SimulatedPhone&) = delete;
  SimulatedPhone& operator=(const SimulatedPhone&) = delete;

  BasebandManager& baseband() { return baseband_; }
  /// Has no SIM at first.
  TelephonySimulator& telephony() { return telephony_; }
  DocumentsDirectory& documents() { return documents_; }
  Console& console() { return console_; }
  const KeptShare& share() const { return share_; }

  /// Puts a scenario behind baseband manager and telephony, in place of whoever would hand in events; once at most. Its
  /// time stands at first. The error says why its recording cannot be written.
  tl::expected<LiveScenario*, std::string> live(LiveScenario::Options options);

  /// Runs the main queue until no queue of the phone has anything left to do now. Work that waits for its time is not
  /// waited for.
  void runUntilAtRest();

 private:
  std::shared_ptr<LoopQueue> loop_;
  std::shared_ptr<Activity> activity_;
  TrackedQueueFactory queues_;
  TrackedQueue mainQueue_;
  std::shared_ptr<Queue> backgroundQueue_;
  SystemClock clock_;
  DescribedDevice device_;
  ResourceDirectories resources_;
  FixedDocumentsDirectory documents_;
  GettextStrings strings_;
  StandardErrorConsole console_;
  StandardErrorConsole alertConsole_;
  PrintedAlerts alerts_;
  LoggedAnalytics analytics_;
  KeptShare share_;
  KeptPasteboard pasteboard_;
  BasebandManager baseband_;
  TelephonySimulator telephony_;
  const std::shared_ptr<BasebandLog> log_ = std::make_shared<BasebandLog>();
  std::optional<SondrelSimulator> sondrel_;  // where the device has such a class
  Platform platform_;
  std::unique_ptr<LiveScenario> scenario_;
};

}  // namespace quorl::simulator
