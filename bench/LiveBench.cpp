// A phone in use that has a month of rows: metrics arrive, twenty a second, first with the list on the screen and then
// with the detail of one of them, the dashboard alive beside it. Tells how long a reading takes from its delivery to
// the screen, what it costs the processor, and for how long the main thread and the database's queue are held at most.
// QUORL_BENCH_ROWS is the number of rows (a hundred thousand), QUORL_BENCH_SECONDS the length of each part (30),
// QUORL_BENCH_DIR the directory of the file (the working directory), which is made once and kept; the run has a copy.
// QUORL_BENCH_FILE is a file to use in its place, one whose rows end about now.

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <fmt/format.h>
#include <sys/resource.h>

#include "Memory.h"
#include "StoreBench.h"
#include "app/HardwareManager.h"
#include "hosts/simulator/EpochTime.h"
#include "intake/MetricGroupV2.h"
#include "intake/MetricService.h"
#include "intake/ZelkorWrapper.h"
#include "messages/MessageTable.h"
#include "messages/wire/WireWriter.h"
#include "screens/dashboard/DashboardViewController.h"
#include "screens/metricdetail/MetricDetailViewModel.h"
#include "screens/metriclist/AllMetricsViewController.h"
#include "store/PersistanceStore.h"
#include "support/MetricEvent.h"
#include "support/TemporaryDirectory.h"

namespace quorl {
namespace {

using Steady = std::chrono::steady_clock;
using Milliseconds = std::chrono::duration<double, std::milli>;
using namespace std::chrono_literals;

constexpr std::size_t kMetricsPerSecond = 20;
constexpr Steady::duration kInterval = Steady::duration(1s) / kMetricsPerSecond;
constexpr std::size_t kFieldsOfMetric = 8;
constexpr Date kStart{1767605412s};  // 2026-01-05 09:30:12 UTC, when the month of rows ends

/// A clock that runs from the end of the month on.
class RunningClock final : public Clock {
 public:
  explicit RunningClock(Date start) : start_(start) {}
  Date now() const override { return start_ + std::chrono::duration_cast<Date::duration>(Steady::now() - begun_); }

 private:
  const Date start_;
  const Steady::time_point begun_ = Steady::now();
};

/// The month of rows that the run has a copy of.
struct Month {
  std::filesystem::path file;
  std::string name;
  Date end;
};

Month month() {
  if (const char* file = std::getenv("QUORL_BENCH_FILE"); file != nullptr) return {file, file, SystemClock().now()};
  const std::size_t rows = bench::rowCount();
  return {bench::monthOfRows(bench::directory(), rows, kStart), fmt::format("{} rows", rows), kStart};
}

/// A queue that keeps for how long one of its tasks held it at most.
class TimedQueue final : public Queue {
 public:
  explicit TimedQueue(std::shared_ptr<Queue> queue) : queue_(std::move(queue)) {}

  void async(Task task) override { queue_->async(timed(std::move(task))); }
  void asyncAfter(Duration delay, Task task) override { queue_->asyncAfter(delay, timed(std::move(task))); }
  bool isCurrent() const override { return queue_->isCurrent(); }
  const std::string& label() const override { return queue_->label(); }

  /// Since the last call.
  Milliseconds longest() { return Steady::duration(longest_->exchange(0)); }

 private:
  Task timed(Task task) const {
    return [task = std::move(task), longest = longest_] {
      const auto start = Steady::now();
      task();
      const Steady::rep took = (Steady::now() - start).count();
      if (took > longest->load()) longest->store(took);
    };
  }

  const std::shared_ptr<Queue> queue_;
  const std::shared_ptr<std::atomic<Steady::rep>> longest_ = std::make_shared<std::atomic<Steady::rep>>(0);
};

struct TimedQueues final : QueueFactory {
  std::shared_ptr<Queue> makeSerialQueue(std::string label) override {
    const bool isDatabase = label.starts_with("com.ardent.dbmanager");
    const auto queue = std::make_shared<TimedQueue>(std::make_shared<SerialQueue>(std::move(label)));
    if (isDatabase) database = queue;
    return queue;
  }
  std::shared_ptr<TimedQueue> database;
};

/// A metric of the catalogue with a payload that is made from its message's table.
struct Source {
  const MetricGroupV2* row;
  const MessageTable* table;
  std::uint32_t timestampTag;

  /// The metric as it is delivered at `time`.
  zelkor::KeyValueMessage event(Date time) const {
    WireWriter writer;
    std::size_t count = 0;
    for (const FieldEntry& field : table->fields) {
      if (field.tag == timestampTag) {
        writer.writeUInt64(simulator::millisecondsSince1970(time), field.tag);
      } else if (field.key == "subs_id") {
        writer.writeUInt32(0, field.tag);
      } else if (field.kind < FieldKind::Bytes && field.kind != FieldKind::SInt32 && count++ < kFieldsOfMetric) {
        writer.writeUInt32(static_cast<std::uint32_t>(count % 2), field.tag);
      }
    }
    return test::metricEvent(row->zelkorId, ByteString(writer.bytes()));
  }
};

std::vector<Source> sources() {
  std::map<std::int64_t, int> rowsOfId;
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) ++rowsOfId[row.zelkorId];
  std::vector<Source> sources;
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
    const auto& exceptions = MetricService::exceptionMetricIds;
    if (rowsOfId[row.zelkorId] > 1 || std::find(exceptions.begin(), exceptions.end(), row.zelkorId) != exceptions.end())
      continue;
    const auto tables = allMessageTables();
    const auto table = std::find_if(tables.begin(), tables.end(),
                                    [&](const MessageTable* known) { return known->className == row.className; });
    if (table == tables.end()) continue;
    const auto fieldOf = [&](std::string_view key) {
      return std::find_if((*table)->fields.begin(), (*table)->fields.end(),
                          [&](const FieldEntry& field) { return field.key == key; });
    };
    const auto timestamp = fieldOf("timestamp");
    if (timestamp == (*table)->fields.end() || fieldOf("subs_id") == (*table)->fields.end()) continue;
    sources.push_back({&row, *table, timestamp->tag});
    if (sources.size() == kMetricsPerSecond) break;
  }
  return sources;
}

/// The product on real threads, with a copy of the month of rows.
struct Site {
  explicit Site(const Month& month) : clock(month.end), directory(bench::directory()) {
    std::filesystem::copy(month.file, directory.path() / "metricPartV11.sqlite");
    fake.documents.directory = directory.path();
    fake.properties.texts["BasebandChipset"] = "mav";
    Platform::install(&platform);
    store = std::make_shared<PersistanceStore>(HardwareManager::shared(), ZelkorWrapper::sharedInstance());
  }

  test::ScopedTimeZone zone{"UTC"};
  RunningClock clock;
  test::VirtualTimeVfs vfs{clock};
  test::TemporaryDirectory directory;
  test::FakePlatform fake;
  TimedQueues queues;
  std::shared_ptr<LoopQueue> loop = std::make_shared<LoopQueue>("main");
  TimedQueue main{loop};
  SerialQueue background{"background"};
  bench::SilentConsole console;
  Platform platform{main,           background,     queues,          clock,       fake.properties,
                    fake.resources, fake.documents, fake.strings,    console,     fake.alerts,
                    fake.analytics, fake.share,     fake.pasteboard, fake.zelkor, fake.silentTelephony};
  std::shared_ptr<PersistanceStore> store;
};

double processorSeconds() {
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  const auto seconds = [](const timeval& time) {
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
  };
  return seconds(usage.ru_utime) + seconds(usage.ru_stime);
}

/// One part of the run: delivers, and measures until the last reading is on the screen or its time is over.
class Part {
 public:
  /// What is on the screen for a metric; nothing if it does not stand there.
  using Shown = std::function<std::optional<Date>(const Source& source)>;

  Part(Site& site, const std::vector<Source>& metrics, std::size_t count, Shown shown)
      : site_(site), metrics_(metrics), count_(count), shown_(std::move(shown)) {}

  /// To be called whenever the screen has changed.
  void screenDidChange() {
    std::erase_if(pending_, [&](const Pending& pending) {
      const std::optional<Date> shown = shown_(*pending.source);
      if (!shown || *shown < pending.second) return false;
      taken_.push_back(Steady::now() - pending.delivered);
      return true;
    });
    if (delivered_ == count_ && pending_.empty()) site_.loop->stop();
  }
  void run() {
    site_.main.longest();
    site_.queues.database->longest();
    const double processor = processorSeconds();
    const std::size_t memory = bench::memory();
    begun_ = Steady::now();
    site_.loop->async([&] { deliver(); });
    site_.loop->run();
    const Milliseconds elapsed = Steady::now() - begun_;
    std::sort(taken_.begin(), taken_.end());
    const auto at = [&](double share) {
      if (taken_.empty()) return 0.0;
      return taken_[static_cast<std::size_t>(share * static_cast<double>(taken_.size() - 1))].count();
    };
    fmt::print(
        "  {:>5} delivered, {:>5} seen on the screen, {:>4} never: median {:.2f} ms, 99th percentile {:.2f} ms, "
        "longest {:.2f} ms\n"
        "  processor {:.2f} % of one core, memory {:+.1f} MB, held at most: main thread {:.2f} ms, database's "
        "queue {:.2f} ms\n",
        delivered_, taken_.size(), pending_.size(), at(0.5), at(0.99), at(1),
        (processorSeconds() - processor) * 1e5 / elapsed.count(),
        (static_cast<double>(bench::memory()) - static_cast<double>(memory)) / 1e6, site_.main.longest().count(),
        site_.queues.database->longest().count());
    std::fflush(stdout);
  }

 private:
  struct Pending {
    const Source* source;
    Date second;
    Steady::time_point delivered;
  };

  void deliver() {
    const Source& source = metrics_[delivered_ % metrics_.size()];
    const Date now = site_.clock.now();
    zelkor::KeyValueMessage event = source.event(now);
    if (shown_(source)) pending_.push_back({&source, std::chrono::floor<std::chrono::seconds>(now), Steady::now()});
    site_.fake.zelkor.deliver(zelkor::kEventMetric, std::move(event));
    if (++delivered_ < count_) {
      const auto due = begun_ + kInterval * static_cast<std::int64_t>(delivered_);
      site_.loop->asyncAfter(std::max<Steady::duration>(due - Steady::now(), 0s), [this] { deliver(); });
    } else {
      site_.loop->asyncAfter(kLongestWait, [this, part = std::weak_ptr(life_)] {
        if (!part.expired()) site_.loop->stop();
      });
    }
  }

  static constexpr auto kLongestWait = 5s;

  Site& site_;
  const std::vector<Source>& metrics_;
  const std::size_t count_;
  const Shown shown_;
  const std::shared_ptr<const bool> life_ = std::make_shared<const bool>(true);
  Steady::time_point begun_;
  std::size_t delivered_ = 0;
  std::vector<Pending> pending_;
  std::vector<Milliseconds> taken_;
};

/// Stops the main loop when so many reads, each begun when the one before has answered, are through; by then the
/// database has done what was asked of it before. On the main queue.
void stopAfterReads(Site& site, int rounds) {
  if (rounds == 0) return site.loop->stop();
  site.store->fetchDashboard(
      0, [&, rounds](const auto& /*items*/, const auto& /*error*/) { stopAfterReads(site, rounds - 1); });
}

void showList(Site& site, const std::vector<Source>& metrics, std::size_t seconds, AllMetricsViewController& list) {
  fmt::print("list on the screen, {} s\n", seconds);
  Part part(site, metrics, seconds * kMetricsPerSecond, [&](const Source& source) -> std::optional<Date> {
    for (const AllMetricsDataSource& group : list.table())
      for (const AllMetricsRowItem& item : group.rowItems)
        if (item.metricName == source.row->name && group.metricTech == source.row->tech) return item.timeStamp;
    return std::nullopt;
  });
  const Connection connection = list.onChange([&] { part.screenDidChange(); });
  part.run();
}

void showDetail(Site& site, const std::vector<Source>& metrics, std::size_t seconds) {
  fmt::print("detail of one metric on the screen, {} s\n", seconds);
  const MetricGroupV2& metric = *metrics.front().row;
  const auto detail =
      MetricDetailViewModel::make(site.store, std::string(metric.tech), std::string(metric.name), 0, site.clock.now());
  site.loop->async([&] { stopAfterReads(site, 4); });
  site.loop->run();
  Part part(site, metrics, seconds * kMetricsPerSecond, [&](const Source& source) -> std::optional<Date> {
    if (source.row != &metric || detail->metrics().empty()) return std::nullopt;
    return detail->metrics().front().collectedOn;
  });
  const Connection connection = detail->onChange([&] { part.screenDidChange(); });
  part.run();
}

[[noreturn]] void run() {
  const std::size_t seconds = bench::number("QUORL_BENCH_SECONDS", 30);
  const Month rows = month();
  Site site(rows);
  const std::vector<Source> metrics = sources();

  const auto begun = Steady::now();
  const auto dashboard = DashboardViewController::make(site.store);
  const auto list = AllMetricsViewController::make(site.store);
  site.loop->async([&] { stopAfterReads(site, 4); });
  site.loop->run();
  // Each metric once, so that it stands on the list; then two reads, from which on nothing is read for the first time.
  for (const Source& source : metrics) site.fake.zelkor.deliver(zelkor::kEventMetric, source.event(site.clock.now()));
  site.loop->asyncAfter(1s, [&] { stopAfterReads(site, 4); });
  site.loop->run();
  fmt::print("{}, {} metrics a second; {:.1f} s until the screens stand, 1 s of them waiting\n", rows.name,
             kMetricsPerSecond, Milliseconds(Steady::now() - begun).count() / 1e3);
  std::fflush(stdout);

  showList(site, metrics, seconds, *list);
  showDetail(site, metrics, seconds);
  fmt::print("most memory {:.1f} MB\n", static_cast<double>(bench::mostMemory()) / 1e6);
  std::fflush(stdout);
  // Like the product, the run ends without taking itself apart: reads may still wait.
  std::filesystem::remove_all(site.directory.path());
  std::_Exit(0);
}

}  // namespace
}  // namespace quorl

int main() {
  quorl::run();
}
