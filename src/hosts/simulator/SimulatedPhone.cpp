#include "hosts/simulator/SimulatedPhone.h"

#include <utility>

namespace quorl::simulator {

SimulatedPhone::SimulatedPhone(Options options)
    : loop_(std::make_shared<LoopQueue>("main")),
      // Weak: a task that waits in the loop for its time holds the activity.
      activity_(std::make_shared<Activity>([weak = std::weak_ptr(loop_)] {
        if (const auto loop = weak.lock()) loop->stop();
      })),
      queues_(activity_),
      mainQueue_(loop_, activity_),
      backgroundQueue_(queues_.makeSerialQueue("background")),
      device_(std::move(options.device)),
      resources_(options.resources),
      documents_(options.documents),
      strings_(options.resources),
      console_(options.isConsoleShown),
      alerts_(alertConsole_, mainQueue_),
      telephony_(queues_),
      platform_{mainQueue_, *backgroundQueue_, queues_,    clock_, device_,     resources_, documents_, strings_,
                console_,   alerts_,           analytics_, share_, pasteboard_, baseband_,  telephony_} {
  if (device_.hasClass("Sondrel")) {
    sondrel_.emplace(SondrelSimulator::ofPhone(options.documents, log_), mainQueue_, queues_, clock_);
    platform_.sondrel = &*sondrel_;
  }
  Platform::install(&platform_);
}

SimulatedPhone::~SimulatedPhone() {
  Platform::install(nullptr);
}

tl::expected<LiveScenario*, std::string> SimulatedPhone::live(LiveScenario::Options options) {
  auto made = LiveScenario::make(std::move(options), {baseband_, &telephony_, queues_, mainQueue_, clock_, {}, log_});
  if (!made) return tl::unexpected(std::move(made.error()));
  scenario_ = *std::move(made);
  return scenario_.get();
}

void SimulatedPhone::runUntilAtRest() {
  // Coming to rest stops the loop. A stop that comes between two rounds ends the next one early, hence the question.
  while (!activity_->isAtRest()) loop_->run();
}

}  // namespace quorl::simulator
