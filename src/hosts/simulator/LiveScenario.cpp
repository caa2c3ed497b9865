#include "hosts/simulator/LiveScenario.h"

#include <algorithm>
#include <atomic>
#include <cmath>
#include <utility>

#include "hosts/simulator/EpochTime.h"
#include "hosts/simulator/TelephonyFeed.h"

namespace quorl::simulator {
namespace {

using std::chrono::milliseconds;

constexpr milliseconds kStep{50};
/// A machine that slept, or a clock that was set, does not make the world run after it.
constexpr double kLongestStepMs = 1000;

}  // namespace

/// Lives on as long as a task of it is queued. Everything but construction happens on the modem's queue.
class LiveScenario::Core : public std::enable_shared_from_this<Core> {
 public:
  Core(Options options, std::optional<RecordingWriter> writer, const Surroundings& surroundings)
      : speed_(options.speed),
        baseband_(surroundings.baseband),
        mainQueue_(surroundings.mainQueue),
        clock_(surroundings.clock),
        isBehind_(surroundings.isBehind),
        log_(surroundings.log),
        queue_(surroundings.queues.makeSerialQueue("modem")),
        telephony_(surroundings.telephony != nullptr ? std::optional<TelephonyFeed>(*surroundings.telephony)
                                                     : std::nullopt),
        run_(std::move(options.choice), millisecondsSince1970(surroundings.clock.now())),
        writer_(std::move(writer)) {}

  Queue& queue() { return *queue_; }

  template <typename Work>
  void async(Work work) {
    queue_->async([self = shared_from_this(), work = std::move(work)]() mutable { work(*self); });
  }

  void setObserver(Observer observer) { observer_ = std::move(observer); }

  void start() {
    if (isRunning_) return;
    isRunning_ = true;
    last_ = clock_.now();
    owedMs_ = 0;
    planStep();
  }
  void stop() { isRunning_ = false; }

  void advance(milliseconds duration) {
    run_.advance(
        duration,
        [this](const RecordedEvent& event) {
          if (log_ && log_->isOpen()) log_->add(recordingLine(event));
          if (baseband_.deliverSelected(event.message())) delivered(event);
        },
        [this](const network::ModemEvent& event, const network::SubscriptionState& state) {
          if (telephony_) telephony_->happened(event, state);
          if (observer_) observer_(event, state);
        });
  }

  void answer(const SnapshotRequest& request) {
    run_.snapshot(request.metrics, [this, &request](RecordedEvent event) {
      event.triggerRef = request.triggerRef;
      if (request.deliver(event.message())) delivered(event);
    });
  }

  /// Any thread.
  std::uint64_t events() const { return events_.load(std::memory_order_relaxed); }

  RecordingWriter::Outcome finishRecording() {
    if (!writer_) return {};
    RecordingWriter::Outcome outcome = writer_->close();
    writer_.reset();
    return outcome;
  }

 private:
  void delivered(const RecordedEvent& event) {
    events_.fetch_add(1, std::memory_order_relaxed);
    if (writer_) writer_->write(event);
  }

  /// The main queue stands between two steps.
  void planStep() {
    mainQueue_.async([weak = weak_from_this()] {
      const auto self = weak.lock();
      if (!self) return;
      self->queue_->asyncAfter(kStep, [weak] {
        if (const auto alive = weak.lock()) alive->step();
      });
    });
  }

  void step() {
    if (!isRunning_) return;
    const Date now = clock_.now();
    const double passedMs = std::chrono::duration<double, std::milli>(now - last_).count();
    const Date before = std::exchange(last_, now);
    if (isBehind_ && isBehind_()) return planStep();
    // Metrics bear the time of day at which they come, whatever the speed and however long the world stood still.
    run_.keepTime(millisecondsSince1970(before), speed_);
    owedMs_ += std::clamp(passedMs, 0.0, kLongestStepMs) * speed_;
    const double whole = std::floor(owedMs_);
    owedMs_ -= whole;
    advance(milliseconds(static_cast<milliseconds::rep>(whole)));
    planStep();
  }

  // Constant after construction.
  const double speed_;
  BasebandManager& baseband_;
  Queue& mainQueue_;
  const Clock& clock_;
  const std::function<bool()> isBehind_;
  const std::shared_ptr<BasebandLog> log_;
  const std::shared_ptr<Queue> queue_;
  std::atomic<std::uint64_t> events_{0};
  // On the queue alone.
  std::optional<TelephonyFeed> telephony_;
  ScenarioRun run_;
  std::optional<RecordingWriter> writer_;
  Observer observer_;
  Date last_;
  double owedMs_ = 0;  // simulated time that has not passed yet
  bool isRunning_ = false;
};

tl::expected<std::unique_ptr<LiveScenario>, std::string> LiveScenario::make(Options options,
                                                                            const Surroundings& surroundings) {
  std::optional<RecordingWriter> writer;
  if (options.recording) {
    auto opened = RecordingWriter::open(*options.recording);
    if (!opened) return tl::unexpected(options.recording->string() + ": " + opened.error());
    writer = *std::move(opened);
  }
  auto core = std::make_shared<Core>(std::move(options), std::move(writer), surroundings);
  surroundings.baseband.setSnapshotSource([weak = std::weak_ptr(core)](SnapshotRequest request) {
    if (const auto alive = weak.lock())
      alive->async([request = std::move(request)](Core& self) { self.answer(request); });
  });
  return std::unique_ptr<LiveScenario>(new LiveScenario(std::move(core)));
}

LiveScenario::LiveScenario(std::shared_ptr<Core> core) : core_(std::move(core)) {}

LiveScenario::~LiveScenario() {
  stop();
}

void LiveScenario::setObserver(Observer observer) {
  core_->async([observer = std::move(observer)](Core& core) mutable { core.setObserver(std::move(observer)); });
}

void LiveScenario::start() {
  core_->async([](Core& core) { core.start(); });
}

void LiveScenario::stop() {
  core_->async([](Core& core) { core.stop(); });
}

void LiveScenario::advance(milliseconds duration) {
  core_->async([duration](Core& core) { core.advance(duration); });
}

std::uint64_t LiveScenario::events() const {
  return core_->events();
}

void LiveScenario::finishRecording(std::function<void(RecordingWriter::Outcome outcome)> done) {
  core_->async([done = std::move(done)](Core& core) { done(core.finishRecording()); });
}

}  // namespace quorl::simulator
