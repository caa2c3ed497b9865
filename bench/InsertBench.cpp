// A row from the main thread into the database and back: hand-over to the database's queue, insert, completion on the
// main queue, beside a bare loop of prepare, bind, step and finalise of the same statement, in the same run. At the end
// the ratios of the medians are printed. QUORL_BENCH_DIR names the directory; without it, it is the working directory
// and then /dev/shm.

#include <cstdlib>
#include <filesystem>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <benchmark/benchmark.h>
#include <fmt/format.h>
#include <sqlite3.h>
#include <stdlib.h>

#include "base/DateText.h"
#include "base/SerialQueue.h"
#include "store/DBManager.h"
#include "store/MetricStatements.h"
#include "support/FakePlatform.h"

namespace quorl {
namespace {

constexpr int kRepetitions = 41;

struct ThreadedQueues final : QueueFactory {
  std::shared_ptr<Queue> makeSerialQueue(std::string label) override {
    return std::make_shared<SerialQueue>(std::move(label));
  }
};

/// A phone whose main queue is the bench's thread.
struct Phone {
  Phone() { Platform::install(&platform); }

  test::FakePlatform fake;
  ThreadedQueues queues;
  LoopQueue main{"main"};
  Platform platform{main,           main,           queues,          fake.time,    fake.properties,
                    fake.resources, fake.documents, fake.strings,    fake.console, fake.alerts,
                    fake.analytics, fake.share,     fake.pasteboard, fake.zelkor,  fake.silentTelephony};
};

/// A new database with its tables, in a directory of its own below `directory`.
class Site {
 public:
  explicit Site(const std::filesystem::path& directory) {
    std::string name = (directory / "quorl-bench-XXXXXX").string();
    if (mkdtemp(name.data()) == nullptr) std::abort();
    path_ = name;
    database = SQLiteDatabase::open((path_ / "file.sqlite").string()).value();
    sqlite3_exec(database->dbPointer(), SQLTable<Metric>::createMetricTable, nullptr, nullptr, nullptr);
  }
  ~Site() {
    database.reset();
    std::filesystem::remove_all(path_);
  }
  Site(const Site&) = delete;
  Site& operator=(const Site&) = delete;

  std::shared_ptr<SQLiteDatabase> database;

 private:
  std::filesystem::path path_;
};

std::vector<Metric> makeRows(std::size_t count) {
  static constexpr const char* kAttributes[] = {"dl_freq", "prio_of_camped_lte_band", "rsrp",
                                                "kHVCellMonitorCellRadioAccessTechnology"};
  std::vector<Metric> rows(count);
  for (std::size_t i = 0; i < count; ++i) {
    rows[i].metricTech = "LTE";
    rows[i].metricName = "Serving Cell Info";
    rows[i].attributeName = rows[i].attributeNameNonLocalized = kAttributes[i % 4];
    rows[i].attributeValue = std::to_string(5230 + i);
    rows[i].attributeValueType = "INT";
    rows[i].collectedOn = Date(std::chrono::seconds(1767605412 + i));
    rows[i].metricId = "803010";
    rows[i].subsId = static_cast<std::int32_t>(i % 2);
  }
  return rows;
}

void wholePath(benchmark::State& state, Phone& phone, const std::filesystem::path& directory, std::size_t count) {
  const Site site(directory);
  const std::vector<Metric> rows = makeRows(count);
  for ([[maybe_unused]] auto _ : state) {
    std::size_t left = count;
    phone.main.async([&] {
      for (const Metric& row : rows) {
        site.database->insertMetric(row, [&](bool success, const std::optional<SQLiteError>& /*error*/) {
          if (!success) std::abort();
          if (--left == 0) phone.main.stop();
        });
      }
    });
    phone.main.run();
  }
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(count));
}

void bareLoop(benchmark::State& state, const std::filesystem::path& directory, std::size_t count) {
  const Site site(directory);
  sqlite3* const database = site.database->dbPointer();
  const std::vector<Metric> rows = makeRows(count);
  std::vector<std::string> times;
  for (const Metric& row : rows) times.push_back(wallClockText(row.collectedOn));
  for ([[maybe_unused]] auto _ : state) {
    for (std::size_t i = 0; i < count; ++i) {
      const Metric& row = rows[i];
      sqlite3_stmt* statement = nullptr;
      sqlite3_prepare_v2(database, SQLTable<Metric>::insertMetric, -1, &statement, nullptr);
      const auto bindText = [&](int index, const std::string& value) {
        sqlite3_bind_text(statement, index, value.c_str(), -1, SQLITE_STATIC);
      };
      bindText(1, row.metricTech);
      bindText(2, row.metricName);
      bindText(3, row.attributeName);
      bindText(4, row.attributeValue);
      bindText(5, row.attributeValueType);
      sqlite3_bind_int(statement, 6, row.graphable ? 1 : 0);
      bindText(7, row.metricId);
      sqlite3_bind_int(statement, 8, row.subsId);
      bindText(9, times[i]);
      if (sqlite3_step(statement) != SQLITE_DONE) std::abort();
      sqlite3_finalize(statement);
    }
  }
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(count));
}

class MedianReporter : public benchmark::ConsoleReporter {
 public:
  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs)
      if (run.aggregate_name == "median") medians[run.run_name.function_name] = run.GetAdjustedRealTime();
  }

  std::map<std::string, double> medians;
};

}  // namespace
}  // namespace quorl

int main(int argc, char** argv) {
  using namespace quorl;
  // Interleaved repetitions spread what else the machine does over both sides.
  std::vector<char*> arguments(argv, argv + argc);
  std::string interleave = "--benchmark_enable_random_interleaving=true";
  arguments.insert(arguments.begin() + 1, interleave.data());
  int argumentCount = static_cast<int>(arguments.size());
  benchmark::Initialize(&argumentCount, arguments.data());
  if (benchmark::ReportUnrecognizedArguments(argumentCount, arguments.data())) return 1;

  std::vector<std::string> directories{".", "/dev/shm"};
  if (const char* directory = std::getenv("QUORL_BENCH_DIR")) directories = {directory};

  Phone phone;
  for (const std::string& directory : directories) {
    // A commit on a disk waits for the disk.
    const std::size_t count = directory == "/dev/shm" ? 1000 : 50;
    const auto add = [&](const char* side, const auto& body) {
      benchmark::RegisterBenchmark(("insert " + directory + side).c_str(), body)
          ->Repetitions(kRepetitions)
          ->ReportAggregatesOnly()
          ->Iterations(1)
          ->UseRealTime()
          ->Unit(benchmark::kMillisecond);
    };
    add("/store", [&, directory, count](benchmark::State& state) { wholePath(state, phone, directory, count); });
    add("/bare", [directory, count](benchmark::State& state) { bareLoop(state, directory, count); });
  }
  MedianReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);

  fmt::print("\nratio of medians, the store to the bare loop\n");
  for (const std::string& directory : directories) {
    const auto store = reporter.medians.find("insert " + directory + "/store");
    const auto bare = reporter.medians.find("insert " + directory + "/bare");
    if (store == reporter.medians.end() || bare == reporter.medians.end()) continue;
    fmt::print("  {:<12} {:.2f}\n", directory, store->second / bare->second);
  }
  return 0;
}
