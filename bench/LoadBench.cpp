// The whole product on hours of a scenario, as fast as it takes them: real threads, a real file, the tabs' screens and
// their timers alive, all of them by simulated time. Each simulated second is worked off before the next begins.
//
// Tells for each simulated hour the memory, the deepest each queue was, and the longest that one task held the main
// thread; in the end whether a row is missing. What ought to be there is counted by a process that only decodes.
//
//   bench_load [SCENARIO [MINUTES]]      six seconds of "busy" by default; QUORL_BENCH_DIR holds the rows

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <fmt/format.h>
#include <malloc.h>
#include <sys/wait.h>
#include <unistd.h>

#include "Memory.h"
#include "NoStore.h"
#include "StoreBench.h"
#include "app/AppDelegate.h"
#include "app/ApplicationLoop.h"
#include "app/HardwareManager.h"
#include "base/DateText.h"
#include "base/Log.h"
#include "base/NotificationCenter.h"
#include "hosts/simulator/Configuration.h"
#include "hosts/simulator/EpochTime.h"
#include "hosts/simulator/LiveScenario.h"
#include "hosts/simulator/PhoneServices.h"
#include "hosts/simulator/ScenarioFiles.h"
#include "hosts/simulator/TrackedQueue.h"
#include "intake/MetricService.h"
#include "intake/ZelkorWrapper.h"
#include "shell/BaseViewController.h"
#include "shell/NotificationNames.h"
#include "store/RawDatabase.h"
#include "support/TemporaryDirectory.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;
using simulator::LiveScenario;
using simulator::ScenarioChoice;
using Steady = std::chrono::steady_clock;
using std::chrono::milliseconds;

constexpr char kResources[] = QUORL_SOURCE_DIR "/resources";
constexpr double kLongestHoldMs = 100;

/// The time of the simulation. Delays end when it has passed over them.
class SimulatedTime final : public Clock {
 public:
  explicit SimulatedTime(Date start) : start_(start) {}
  Date now() const override { return start_ + milliseconds(passedMs_.load()); }
  void after(Queue::Duration delay, Queue::Task task) {
    const std::lock_guard lock(mutex_);
    delayed_.emplace(passedMs_.load() + std::chrono::ceil<milliseconds>(delay).count(), std::move(task));
  }
  /// Lets the time pass and runs what is due, which is to queue something.
  void pass(milliseconds duration) {
    const std::int64_t now = passedMs_ += duration.count();
    std::vector<Queue::Task> due;
    {
      const std::lock_guard lock(mutex_);
      const auto end = delayed_.upper_bound(now);
      for (auto at = delayed_.begin(); at != end; ++at) due.push_back(std::move(at->second));
      delayed_.erase(delayed_.begin(), end);
    }
    for (const Queue::Task& task : due) task();
  }

 private:
  const Date start_;
  std::atomic<std::int64_t> passedMs_{0};
  std::mutex mutex_;
  std::multimap<std::int64_t, Queue::Task> delayed_;  // guarded by mutex_
};

double threadMs() {
  timespec time{};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) * 1e3 + static_cast<double>(time.tv_nsec) / 1e6;
}

/// Another queue that is watched.
class WatchedQueue final : public Queue {
 public:
  /// Since the last look.
  struct Seen {
    std::size_t deepest = 0;    // tasks that waited at once
    double longestMs = 0;       // of one task, by the clock on the wall
    double longestOwnMs = 0;    // by the processor's time
    std::size_t longHolds = 0;  // tasks longer than the goal, by the processor's time

    void add(const Seen& other) {
      deepest = std::max(deepest, other.deepest);
      longestMs = std::max(longestMs, other.longestMs);
      longestOwnMs = std::max(longestOwnMs, other.longestOwnMs);
      longHolds += other.longHolds;
    }
  };

  WatchedQueue(std::shared_ptr<Queue> queue, std::shared_ptr<simulator::Activity> activity, SimulatedTime& time)
      : watched_(std::make_shared<Watched>()), queue_(std::move(queue)), activity_(std::move(activity)), time_(time) {}

  void async(Task task) override {
    activity_->begin();
    {
      const std::lock_guard lock(watched_->mutex);
      watched_->seen.deepest = std::max(watched_->seen.deepest, ++watched_->waiting);
    }
    queue_->async([watched = watched_, activity = activity_, task = std::move(task)]() mutable {
      const auto begun = Steady::now();
      const double ownBegun = threadMs();
      task();
      task = nullptr;
      const double ownMs = threadMs() - ownBegun;
      const double ms = std::chrono::duration<double, std::milli>(Steady::now() - begun).count();
      {
        const std::lock_guard lock(watched->mutex);
        --watched->waiting;
        watched->seen.add({0, ms, ownMs, ownMs > kLongestHoldMs ? 1U : 0U});
      }
      activity->end();
    });
  }
  void asyncAfter(Duration delay, Task task) override {
    time_.after(delay, [this, task = std::move(task)]() mutable { async(std::move(task)); });
  }
  bool isCurrent() const override { return queue_->isCurrent(); }
  const std::string& label() const override { return queue_->label(); }

  Seen look() {
    const std::lock_guard lock(watched_->mutex);
    return std::exchange(watched_->seen, {});
  }

 private:
  struct Watched {
    std::mutex mutex;
    std::size_t waiting = 0;  // guarded by mutex
    Seen seen;                // guarded by mutex
  };
  const std::shared_ptr<Watched> watched_;
  const std::shared_ptr<Queue> queue_;
  const std::shared_ptr<simulator::Activity> activity_;
  SimulatedTime& time_;
};

class WatchedQueues final : public QueueFactory {
 public:
  WatchedQueues(std::shared_ptr<simulator::Activity> activity, SimulatedTime& time)
      : activity_(std::move(activity)), time_(time) {}
  std::shared_ptr<Queue> makeSerialQueue(std::string label) override {
    const bool isDatabase = label.starts_with("com.ardent.dbmanager");
    auto queue = std::make_shared<WatchedQueue>(std::make_shared<SerialQueue>(std::move(label)), activity_, time_);
    if (isDatabase) database_ = queue;
    return made_.emplace_back(std::move(queue));
  }
  WatchedQueue& database() { return *database_; }

 private:
  const std::shared_ptr<simulator::Activity> activity_;
  SimulatedTime& time_;
  std::shared_ptr<WatchedQueue> database_;
  std::vector<std::shared_ptr<Queue>> made_;  // tasks that wait for their time know theirs by address
};

/// Counts inserts that failed; renders nothing else.
struct FailureLog final : LogSink {
  bool isEnabled(std::string_view /*category*/, LogLevel level) const override { return level == LogLevel::Error; }
  void write(std::string_view /*category*/, LogLevel /*level*/, std::string_view text) override {
    if (text.starts_with("error occurred while inserting")) ++failures;
  }
  std::atomic<std::size_t> failures{0};
};

/// Only counts.
class CountingStore final : public bench::NoStore {
 public:
  void insertMetric(Metric metric, WriteCompletion /*completion*/) override {
    // A damaged payload may name a year that the table cannot hold.
    if (parseWallClock(wallClockText(metric.collectedOn))) {
      ++rows;
    } else {
      ++impossibleRows;
    }
  }

  std::size_t rows = 0;
  std::size_t impossibleRows = 0;
};

struct Expected {
  std::size_t events = 0;
  std::size_t rows = 0;
  std::size_t impossibleRows = 0;
};

/// What the way gives, in a process of its own.
class Expectation {
 public:
  Expectation(const ScenarioChoice& choice, Date start, milliseconds length) {
    if (pipe(ends_) != 0) std::abort();
    process_ = fork();
    if (process_ != 0) return;
    const Expected expected = count(choice, start, length);
    std::_Exit(::write(ends_[1], &expected, sizeof expected) == sizeof expected ? 0 : 1);
  }
  Expected wait() {
    Expected expected;
    if (::read(ends_[0], &expected, sizeof expected) != sizeof expected) std::abort();
    waitpid(process_, nullptr, 0);
    return expected;
  }

 private:
  static Expected count(const ScenarioChoice& choice, Date start, milliseconds length) {
    test::FakePlatform phone;
    phone.properties.texts["BasebandChipset"] = "mav";
    std::ifstream file(std::string(kResources) + "/Quorl2.deviceconfig");
    const auto configuration = simulator::parseConfiguration(std::string{std::istreambuf_iterator<char>(file), {}});
    if (!configuration) std::abort();
    CountingStore store;
    const auto service = MetricService::make(store, ZelkorWrapper::sharedInstance());
    simulator::ScenarioRun run(choice, simulator::millisecondsSince1970(start));
    Expected expected;
    for (milliseconds passed{0}; passed < length; passed += 1s)
      run.advance(1s, [&](const simulator::RecordedEvent& event) {
        if (!event.metricID || !configuration->selects(*event.metricID)) return;
        ++expected.events;
        service->processMetric(event.message());
      });
    expected.rows = store.rows;
    expected.impossibleRows = store.impossibleRows;
    return expected;
  }

  int ends_[2] = {};
  pid_t process_ = 0;
};

/// The phone, with the bench's thread as its main thread.
struct Site {
  explicit Site(Date start, const std::filesystem::path& folder) : time(start), documents(folder) {
    Platform::install(&platform);
  }
  void settle() {
    while (!activity->isAtRest()) loop->run();
  }

  test::ScopedTimeZone zone{"UTC"};
  SimulatedTime time;
  std::shared_ptr<LoopQueue> loop = std::make_shared<LoopQueue>("main");
  std::shared_ptr<simulator::Activity> activity =
      std::make_shared<simulator::Activity>([loop = std::weak_ptr(loop)] { loop.lock()->stop(); });
  WatchedQueues queues{activity, time};
  WatchedQueue main{loop, activity, time};
  std::shared_ptr<Queue> background = queues.makeSerialQueue("background");
  simulator::DescribedDevice device{{"mav", std::nullopt, true, false, {}}};
  simulator::ResourceDirectories resources{{kResources}};
  simulator::FixedDocumentsDirectory documents;
  simulator::GettextStrings strings{{kResources}};
  bench::SilentConsole console;
  simulator::PrintedAlerts alerts{console, main};
  simulator::LoggedAnalytics analytics;
  simulator::KeptShare share;
  simulator::KeptPasteboard pasteboard;
  simulator::BasebandManager baseband;
  simulator::TelephonySimulator telephony{queues};
  Platform platform{main,    *background, queues,    time,  device,     resources, documents, strings,
                    console, alerts,      analytics, share, pasteboard, baseband,  telephony};
};

double megabytes(std::size_t bytes) {
  return static_cast<double>(bytes) / 1e6;
}

/// What the process has asked for and not given back, of what the allocator holds for it, in megabytes.
double inUse() {
  const struct mallinfo2 heap = mallinfo2();
  return megabytes(heap.uordblks + heap.hblkhd);
}

/// How the run went along.
struct Pace {
  double seconds = 0;  // of the whole run, by the clock on the wall
  double longestSecondMs = 0;
  std::size_t slowSeconds = 0;  // simulated seconds that took longer than one
  WatchedQueue::Seen main;
  std::size_t mostMemory = 0;  // in bytes, looked at once a simulated minute
};

/// Lets the simulated time pass second by second, and prints a line for each hour.
Pace drive(Site& site, LiveScenario& live, milliseconds length, const std::size_t& announced) {
  fmt::print("{:>7} {:>9} {:>10} {:>8} {:>9} {:>12} {:>12} {:>22} {:>10}\n", "hour", "events", "rows", "RSS MB",
             "in use MB", "main deepest", "db deepest", "main hold ms (cpu)", "> 100 ms");
  Pace pace;
  const auto begun = Steady::now();
  const milliseconds section = std::min<milliseconds>(length, 1h);
  for (milliseconds passed{0}; passed < length;) {
    const auto secondBegun = Steady::now();
    live.advance(1s);
    site.settle();
    site.time.pass(1s);
    site.settle();
    const double secondMs = std::chrono::duration<double, std::milli>(Steady::now() - secondBegun).count();
    pace.longestSecondMs = std::max(pace.longestSecondMs, secondMs);
    if (secondMs > 1000) ++pace.slowSeconds;
    passed += 1s;
    if (passed % 1min == 0s) pace.mostMemory = std::max(pace.mostMemory, bench::memory());
    if (passed % section != 0s && passed < length) continue;
    const auto main = site.main.look();
    const auto database = site.queues.database().look();
    pace.main.add(main);
    fmt::print("{:>7.2f} {:>9} {:>10} {:>8.1f} {:>9.1f} {:>12} {:>12} {:>13.1f} ({:>6.1f}) {:>10}\n",
               static_cast<double>(passed.count()) / 3.6e6, live.events(), announced, megabytes(bench::memory()),
               inUse(), main.deepest, database.deepest, main.longestMs, main.longestOwnMs, main.longHolds);
    std::fflush(stdout);
  }
  pace.seconds = std::chrono::duration<double>(Steady::now() - begun).count();
  return pace;
}

void print(const Pace& pace, milliseconds length) {
  fmt::print("{:.0f} s, {:.0f} times as fast as life; longest second {:.0f} ms, {} seconds took more than one\n",
             pace.seconds, static_cast<double>(length.count()) / 1e3 / pace.seconds, pace.longestSecondMs,
             pace.slowSeconds);
  fmt::print(
      "main thread held for {:.1f} ms at most ({:.1f} ms of the processor), {} times for more than {:.0f} ms of "
      "the processor\n",
      pace.main.longestMs, pace.main.longestOwnMs, pace.main.longHolds, kLongestHoldMs);
  fmt::print("RSS {:.1f} MB at most by the minute, {:.1f} MB at any time\n", megabytes(pace.mostMemory),
             megabytes(bench::mostMemory()));
}

[[noreturn]] void run(const std::string& name, milliseconds length) {
  auto scenario = simulator::findScenario(name, {kResources});
  if (!scenario) {
    for (const std::string& problem : scenario.error()) fmt::print(stderr, "{}\n", problem);
    std::exit(1);
  }
  const Date start = std::chrono::floor<milliseconds>(SystemClock().now() - length);
  const ScenarioChoice choice{*std::move(scenario), 1, simulator::metrics::Family::Mav};
  Expectation expectation(choice, start, length);

  const test::TemporaryDirectory directory(bench::directory());
  Site site(start, directory.path());
  const auto log = std::make_shared<FailureLog>();
  installLogSink(log);
  auto live = LiveScenario::make({choice, 1, std::nullopt},
                                 {site.baseband, &site.telephony, site.queues, site.main, site.time});
  if (!live) std::abort();
  // Queries would bring more than the way alone gives.
  site.baseband.setSnapshotSource({});
  std::size_t announced = 0;
  const auto observation = NotificationCenter::defaultCenter().observe(
      notification::kNewZelkorMetric, [&announced](const Notification& /*news*/) { ++announced; });
  auto* application = new AppDelegate;
  ApplicationLoop(*application).launch();
  BaseViewController& screens = *application->window()->rootViewController()->rootScreen();
  screens.viewDidLoad();
  screens.menuBarDidSelectItemAt(1);
  site.settle();

  fmt::print("{}, {} simulated minutes\n", name, length.count() / 60000);
  const Pace pace = drive(site, **live, length, announced);
  ApplicationLoop(*application).terminate();
  site.settle();

  const Expected expected = expectation.wait();
  const std::string stored = test::RawDatabase(directory.path() / "metricPartV11.sqlite")
                                 .column("SELECT count(*) FROM Metric WHERE metric_tech != 'RAT'")
                                 .at(0);
  print(pace, length);
  const bool isWhole = expected.events == (*live)->events() && expected.rows == announced &&
                       std::to_string(announced) == stored && log->failures == expected.impossibleRows;
  fmt::print(
      "expected {} events, {} rows, {} with an impossible time; delivered {}, announced {}, stored {}, failed {}: "
      "{}\n",
      expected.events, expected.rows, expected.impossibleRows, (*live)->events(), announced, stored,
      log->failures.load(), isWhole ? "nothing is lost" : "ROWS ARE MISSING");
  std::fflush(stdout);
  std::filesystem::remove_all(directory.path());
  // Like the product, the run ends without taking itself apart.
  std::_Exit(isWhole ? 0 : 1);
}

}  // namespace
}  // namespace quorl

int main(int argc, char** argv) {
  const bool isNamed = argc > 1 && argv[1][0] != '-';
  const double minutes = isNamed && argc > 2 ? std::strtod(argv[2], nullptr) : 0.1;
  quorl::run(isNamed ? argv[1] : "busy", std::chrono::seconds(std::max(1LL, std::llround(minutes * 60))));
}
