#include "hosts/simulator/SondrelSimulator.h"

#include <algorithm>
#include <functional>
#include <optional>
#include <utility>

#include <fmt/format.h>

#include "base/RepeatingTimer.h"
#include "hosts/simulator/ChunkFolder.h"

namespace quorl::simulator {
namespace {

constexpr double kBytesPerUnit = 1024;
constexpr double kLargestChunk = 1024 * 1024;  // units

/// Whom the callbacks go to. Main thread.
struct Listener {
  std::weak_ptr<SondrelDelegate> delegate;
};

}  // namespace

/// What happens on the worker queue.
class SondrelSimulator::Capture {
 public:
  Capture(const Options& options, Queue& mainQueue, Queue& worker, const Clock& clock,
          std::shared_ptr<Listener> listener)
      : options_(options),
        mainQueue_(mainQueue),
        worker_(worker),
        clock_(clock),
        listener_(std::move(listener)),
        folder_(options.folder, options.capacity) {}

  void start(const SondrelConfiguration& configuration) {
    reportBatch();
    if (const auto fault = faultOf(configuration)) return tellError({*fault});
    if (const auto opened = folder_.open(); !opened) {
      end();
      return tellError(opened.error());
    }
    configuration_ = configuration;
    timer_.reset();
    if (options_.log) options_.log->open();
    timer_.emplace(worker_, options_.chunkInterval, [this] { writeChunk(); });
    tell([configuration](SondrelDelegate& delegate) {
      delegate.didStateChanged(sondrel_state::kStarted, std::nullopt, configuration);
    });
  }

  void stop() {
    if (!timer_) return;
    reportBatch();
    end();
    tellStopped();
  }

  void reset() {
    waiting_.clear();
    if (const auto opened = folder_.open(); !opened) return tellError(opened.error());
    folder_.keepAtMost(0);
  }

  void getConfigurationList() {
    std::vector<SondrelObject> list(options_.configurations.begin(), options_.configurations.end());
    tell([list = std::move(list)](SondrelDelegate& delegate) { delegate.configurationListAvailable(list); });
  }

 private:
  void end() {
    timer_.reset();
    if (options_.log) options_.log->close();
  }

  std::optional<std::string> faultOf(const SondrelConfiguration& configuration) const {
    const std::string name = configuration.activeConfig().value_or("");
    const auto& known = options_.configurations;
    if (std::find(known.begin(), known.end(), name) == known.end())
      return fmt::format("There is no log configuration \"{}\".", name);
    const double size = configuration.chunkFileSize().value_or(0);
    if (!(size >= 1 && size <= kLargestChunk)) return fmt::format("A chunk cannot have {} KB.", size);
    const double count = configuration.maxNumberOfLogs().value_or(0);
    if (!(count >= 1)) return fmt::format("There cannot be {} log files.", count);
    return std::nullopt;
  }

  void writeChunk() {
    const auto bytes = static_cast<std::uint64_t>(configuration_.chunkFileSize().value_or(0) * kBytesPerUnit);
    const double count = std::min(configuration_.maxNumberOfLogs().value_or(0), 1e9);
    const auto file =
        folder_.write(configuration_.activeConfig().value_or(""), bytes, clock_.now(),
                      [this](std::size_t most) { return options_.log ? options_.log->take(most) : std::string(); });
    if (!file) {
      reportBatch();
      end();
      tell([error = file.error()](SondrelDelegate& delegate) { delegate.didCollectLogs(std::nullopt, error); });
      tellStopped();
      return;
    }
    folder_.keepAtMost(static_cast<std::size_t>(count));
    waiting_.emplace_back(*file);
    if (waiting_.size() >= options_.chunksPerBatch) reportBatch();
  }

  void reportBatch() {
    if (waiting_.empty()) return;
    tell([batch = std::exchange(waiting_, {})](SondrelDelegate& delegate) {
      delegate.didCollectLogs(batch, std::nullopt);
    });
  }

  void tellStopped() {
    tell([](SondrelDelegate& delegate) {
      delegate.didStateChanged(sondrel_state::kStopped, std::nullopt, std::nullopt);
    });
  }

  void tellError(const SondrelError& error) {
    tell([error](SondrelDelegate& delegate) { delegate.didStateChanged(sondrel_state::kError, error, std::nullopt); });
  }

  void tell(std::function<void(SondrelDelegate&)> call) {
    mainQueue_.async([listener = listener_, call = std::move(call)] {
      if (const auto delegate = listener->delegate.lock()) call(*delegate);
    });
  }

  const Options options_;
  Queue& mainQueue_;
  Queue& worker_;
  const Clock& clock_;
  const std::shared_ptr<Listener> listener_;
  ChunkFolder folder_;
  SondrelConfiguration configuration_;
  std::vector<SondrelObject> waiting_;   // for their batch to be whole
  std::optional<RepeatingTimer> timer_;  // while a capture runs
};

/// The main thread's end of a capture.
class SondrelSimulator::Library final : public Sondrel {
 public:
  explicit Library(const SondrelSimulator& simulator)
      : worker_(simulator.worker_),
        capture_(std::make_shared<Capture>(simulator.options_, simulator.mainQueue_, *worker_, simulator.clock_,
                                           listener_)) {}
  // The capture ends on the thread of its timer.
  ~Library() override {
    worker_->async([capture = std::move(capture_)]() mutable { capture.reset(); });
  }
  Library(const Library&) = delete;
  Library& operator=(const Library&) = delete;

  void setDelegate(std::weak_ptr<SondrelDelegate> delegate) override { listener_->delegate = std::move(delegate); }
  void start(const SondrelConfiguration& configuration) override {
    worker_->async([capture = capture_, configuration] { capture->start(configuration); });
  }
  void stop() override {
    worker_->async([capture = capture_] { capture->stop(); });
  }
  void reset() override {
    worker_->async([capture = capture_] { capture->reset(); });
  }
  void getConfigurationList() override {
    worker_->async([capture = capture_] { capture->getConfigurationList(); });
  }

 private:
  const std::shared_ptr<Queue> worker_;
  const std::shared_ptr<Listener> listener_ = std::make_shared<Listener>();
  std::shared_ptr<Capture> capture_;
};

std::vector<std::string> SondrelSimulator::defaultConfigurations() {
  return {"Default", "Voice", "Data Throughput", "Mobility", "Registration", "RF and Power", "Everything"};
}

SondrelSimulator::Options SondrelSimulator::ofPhone(const std::filesystem::path& documents,
                                                    std::shared_ptr<BasebandLog> log) {
  Options options;
  options.folder = documents / "Sondrel";
  options.log = std::move(log);
  return options;
}

SondrelSimulator::SondrelSimulator(Options options, Queue& mainQueue, QueueFactory& queues, const Clock& clock)
    : options_(std::move(options)),
      mainQueue_(mainQueue),
      clock_(clock),
      worker_(queues.makeSerialQueue("simulated capture")) {}

SondrelSimulator::~SondrelSimulator() = default;

std::unique_ptr<Sondrel> SondrelSimulator::makeSondrel() {
  return std::make_unique<Library>(*this);
}

}  // namespace quorl::simulator
