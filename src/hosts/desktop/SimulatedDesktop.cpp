#include "hosts/desktop/SimulatedDesktop.h"

#include <QCoreApplication>
#include <chrono>
#include <future>
#include <memory>
#include <utility>

#include "hosts/desktop/QtQueue.h"
#include "screens/export/view/SaveText.h"

namespace quorl::desktop {
namespace {

/// More tasks than this that wait mean that the phone gets less done than it is given: most of them are rows, a few
/// milliseconds of synchronising to disk each.
constexpr std::size_t kMostTasks = 400;
constexpr std::chrono::seconds kLongestRest{2};

std::unique_ptr<Console> orSilent(std::unique_ptr<Console> console) {
  return console ? std::move(console) : std::make_unique<simulator::StandardErrorConsole>(/*isShown=*/false);
}

}  // namespace

SimulatedDesktop::SimulatedDesktop(simulator::DeviceDescription device, const std::filesystem::path& documents,
                                   std::unique_ptr<Console> console)
    : activity_(std::make_shared<simulator::Activity>([] {})),
      queues_(activity_),
      mainQueue_(std::make_shared<QtQueue>("main"), activity_),
      backgroundQueue_(queues_.makeSerialQueue("background")),
      device_(std::move(device)),
      resourceFolders_(simulator::ResourceDirectories::ofThisProgram(QUORL_RESOURCE_DIRECTORY)),
      resources_(resourceFolders_),
      documents_(documents),
      strings_(resourceFolders_),
      console_(orSilent(std::move(console))),
      telephony_(queues_),
      sondrel_(simulator::SondrelSimulator::ofPhone(documents, log_), mainQueue_, queues_, clock_),
      platform_{mainQueue_,  *backgroundQueue_, queues_,    clock_,   device_,    resources_,
                documents_,  strings_,          *console_,  alerts_,  analytics_, view::SaveText::shared(),
                pasteboard_, baseband_,         telephony_, &sondrel_} {
  Platform::install(&platform_);
}

SimulatedDesktop::~SimulatedDesktop() {
  Platform::install(nullptr);
}

tl::expected<void, std::string> SimulatedDesktop::tuneIn(Programme programme) {
  const bool hasScript = programme.telephony.has_value();
  if (hasScript || !programme.events.empty())
    played_.emplace(std::move(programme.events), std::move(programme.telephony).value_or(PlayedRadio::Steps()),
                    programme.speed, PlayedRadio::Phone{baseband_, telephony_, mainQueue_, clock_});
  if (programme.scenario) {
    auto made =
        simulator::LiveScenario::make({*std::move(programme.scenario), programme.speed, std::move(programme.record)},
                                      {baseband_, hasScript ? nullptr : &telephony_, queues_, mainQueue_, clock_,
                                       [activity = activity_] { return activity->count() > kMostTasks; }, log_});
    if (!made) return tl::unexpected(std::move(made.error()));
    scenario_ = *std::move(made);
    scenario_->advance(std::chrono::milliseconds(1));
  }
  comeToRest();
  return {};
}

void SimulatedDesktop::startRadio() {
  if (played_) played_->start();
  if (scenario_) scenario_->start();
}

SimulatedDesktop::Ending SimulatedDesktop::stopRadio() {
  using Outcome = simulator::RecordingWriter::Outcome;
  played_.reset();
  // The modem tells from its own queue, and may do so after a rest that did not come.
  const auto ended = std::make_shared<std::promise<Outcome>>();
  std::future<Outcome> outcome = ended->get_future();
  if (scenario_) {
    scenario_->stop();
    scenario_->finishRecording([ended](Outcome so) { ended->set_value(std::move(so)); });
  } else {
    ended->set_value({});
  }
  const bool isAtRest = workOff();
  const bool isTold = outcome.wait_for(std::chrono::seconds(0)) == std::future_status::ready;
  return {isTold ? outcome.get() : tl::unexpected(std::string("not ended in time")), isAtRest};
}

void SimulatedDesktop::comeToRest() const {
  const auto end = std::chrono::steady_clock::now() + kLongestRest;
  while (!activity_->isAtRest() && std::chrono::steady_clock::now() < end)
    QCoreApplication::processEvents(QEventLoop::AllEvents, 10);
}

/// Gives up when the tasks have not become fewer for a while.
bool SimulatedDesktop::workOff() const {
  std::size_t fewest = activity_->count();
  auto end = std::chrono::steady_clock::now() + kLongestRest;
  while (!activity_->isAtRest()) {
    QCoreApplication::processEvents(QEventLoop::AllEvents, 10);
    const auto now = std::chrono::steady_clock::now();
    if (const std::size_t count = activity_->count(); count < fewest) {
      fewest = count;
      end = now + kLongestRest;
    }
    if (now >= end) return activity_->isAtRest();
  }
  return true;
}

void SimulatedDesktop::deliver(const simulator::RecordedEvent& event) {
  baseband_.deliver(zelkor::kEventMetric, event.message());
}

}  // namespace quorl::desktop
