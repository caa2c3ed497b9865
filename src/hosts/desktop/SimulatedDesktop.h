#pragma once

#include <filesystem>
#include <memory>
#include <optional>
#include <vector>

#include "base/Clock.h"
#include "hosts/desktop/PlayedRadio.h"
#include "hosts/desktop/QtPasteboard.h"
#include "hosts/simulator/BasebandManager.h"
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
  /// Installs itself as the process's platform. SIMs are as the programme has them at its start.
  SimulatedDesktop(simulator::DeviceDescription device, const std::filesystem::path& documents,
                   PlayedRadio::Programme programme);
  ~SimulatedDesktop();
  SimulatedDesktop(const SimulatedDesktop&) = delete;
  SimulatedDesktop& operator=(const SimulatedDesktop&) = delete;

  view::AlertsBinding& alerts() { return alerts_; }
  PlayedRadio& radio() { return radio_; }
  /// Delivers one event as it is, beside what the radio plays.
  void deliver(const simulator::RecordedEvent& event);
  /// False while a task of any queue waits or runs, apart from those that wait for their time.
  bool isAtRest() const { return activity_->isAtRest(); }

 private:
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
  simulator::StandardErrorConsole console_;
  view::AlertsBinding alerts_;
  simulator::LoggedAnalytics analytics_;
  QtPasteboard pasteboard_;
  simulator::BasebandManager baseband_;
  simulator::TelephonySimulator telephony_;
  simulator::SondrelSimulator sondrel_;
  PlayedRadio radio_;
  Platform platform_;
};

}  // namespace quorl::desktop
