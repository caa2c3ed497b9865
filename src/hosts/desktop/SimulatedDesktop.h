#pragma once

#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <tl/expected.hpp>

#include "base/Clock.h"
#include "hosts/desktop/PlayedRadio.h"
#include "hosts/desktop/Programme.h"
#include "hosts/desktop/QtPasteboard.h"
#include "hosts/simulator/BasebandManager.h"
#include "hosts/simulator/LiveScenario.h"
#include "hosts/simulator/PhoneServices.h"
#include "hosts/simulator/SondrelSimulator.h"
#include "hosts/simulator/TelephonySimulator.h"
#include "hosts/simulator/TrackedQueue.h"
#include "platform/Platform.h"
#include "shell/view/AlertsBinding.h"

namespace quorl::desktop {

/// A phone in software behind a window of the desktop: the simulator's baseband, telephony and log capture, the
/// desktop's event loop, clipboard and dialogs. The thread that makes it is the main thread.
///
/// The product's process-wide objects refer to it, so it has to outlive all of them; a program keeps it to its end.
class SimulatedDesktop {
 public:
  /// Installs itself as the process's platform. There is no radio yet, and no SIM. What the product prints goes to
  /// `console`, or nowhere.
  SimulatedDesktop(simulator::DeviceDescription device, const std::filesystem::path& documents,
                   std::unique_ptr<Console> console = nullptr);
  ~SimulatedDesktop();
  SimulatedDesktop(const SimulatedDesktop&) = delete;
  SimulatedDesktop& operator=(const SimulatedDesktop&) = delete;

  /// Finds the phone as it is at the start of the programme: its SIMs and cells; no time passes. Once at most. The
  /// error says why the recording of it cannot be written.
  tl::expected<void, std::string> tuneIn(Programme programme);
  /// Lets the programme go on with the time of day.
  void startRadio();
  struct Ending {
    tl::expected<void, std::string> recording;  // the error says why it is not whole; none without a recording
    bool isAtRest = true;                       // all that was delivered is worked off
  };
  /// Ends it, and runs the event loop for as long as what was delivered is being worked off.
  Ending stopRadio();
  /// Runs the event loop until the phone has come to rest, for two seconds at most.
  void comeToRest() const;

  view::AlertsBinding& alerts() { return alerts_; }
  /// Delivers one event as it is, beside what the radio plays.
  void deliver(const simulator::RecordedEvent& event);
  /// False while a task of any queue waits or runs, apart from those that wait for their time.
  bool isAtRest() const { return activity_->isAtRest(); }

 private:
  bool workOff() const;

  const std::shared_ptr<simulator::Activity> activity_;
  simulator::TrackedQueueFactory queues_;
  simulator::TrackedQueue mainQueue_;
  const std::shared_ptr<Queue> backgroundQueue_;
  SystemClock clock_;
  simulator::DescribedDevice device_;
  const std::vector<std::filesystem::path> resourceFolders_;
  simulator::ResourceDirectories resources_;
  simulator::FixedDocumentsDirectory documents_;
  simulator::GettextStrings strings_;
  const std::unique_ptr<Console> console_;
  view::AlertsBinding alerts_;
  simulator::LoggedAnalytics analytics_;
  QtPasteboard pasteboard_;
  simulator::BasebandManager baseband_;
  simulator::TelephonySimulator telephony_;
  const std::shared_ptr<simulator::BasebandLog> log_ = std::make_shared<simulator::BasebandLog>();
  simulator::SondrelSimulator sondrel_;
  Platform platform_;
  std::unique_ptr<simulator::LiveScenario> scenario_;
  std::optional<PlayedRadio> played_;
};

}  // namespace quorl::desktop
