// The monthly export as the screen does it: the read on the database's queue, beside its statement stepped bare on the
// same connection in the same run, and then the text on the main thread. Tells the memory of both and how long the main
// thread is held. The table holds a hundred thousand rows over thirty days, or QUORL_BENCH_ROWS of them.
// QUORL_BENCH_DIR names the directory of the file; without it, it is the working directory.

#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <benchmark/benchmark.h>
#include <fmt/format.h>
#include <malloc.h>
#include <sqlite3.h>
#include <stdlib.h>

#include "app/HardwareManager.h"
#include "base/DateText.h"
#include "base/SerialQueue.h"
#include "screens/export/ExportText.h"
#include "store/DBManager.h"
#include "store/MetricStatements.h"
#include "support/FakePlatform.h"

namespace quorl {
namespace {

constexpr int kRepetitions = 5;
constexpr std::size_t kUsualRows = 100'000;
constexpr std::size_t kDays = 30;
constexpr std::size_t kRowsPerSecond = 8;  // attributes of one message
constexpr AttributeDetailTimeFrame kMonthly = AttributeDetailTimeFrame::monthly;

struct ThreadedQueues final : QueueFactory {
  std::shared_ptr<Queue> makeSerialQueue(std::string label) override {
    return std::make_shared<SerialQueue>(std::move(label));
  }
};

struct SilentConsole final : Console {
  void print(std::string_view /*line*/) override {}
};

/// A phone whose main queue is the bench's thread.
struct Phone {
  Phone() { Platform::install(&platform); }

  test::FakePlatform fake;
  ThreadedQueues queues;
  LoopQueue main{"main"};
  SilentConsole console;
  Platform platform{main,           main,           queues,          fake.time,   fake.properties,
                    fake.resources, fake.documents, fake.strings,    console,     fake.alerts,
                    fake.analytics, fake.share,     fake.pasteboard, fake.zelkor, fake.silentTelephony};
};

/// What a Mav device reports all day: messages of eight attributes, most values short numbers, some enumerators, and
/// in each message a time that no other has.
class Readings {
 public:
  void bindNext(sqlite3_stmt* statement, std::size_t index, Date time) {
    static constexpr const char* kTechs[] = {"LTE", "5G", "MISC", "RAT"};
    static constexpr const char* kEnumerators[] = {"kHVCellMonitorCellTypeServing", "MODULATION_256QAM",
                                                   "SYS_SRV_STATUS_SRV"};
    const std::size_t message = index / kRowsPerSecond;
    const std::size_t metric = message % 40;
    const std::size_t attribute = index % kRowsPerSecond;
    tech_ = kTechs[metric % 4];
    name_ = fmt::format("Serving Metric {}", metric);
    attribute_ = attribute == 0 ? "timestamp" : fmt::format("some_attribute_name_{}", attribute);
    if (attribute == 0) {
      value_ = std::to_string(time.time_since_epoch().count() / 1000 + static_cast<std::int64_t>(index));
    } else if (attribute == 1) {
      value_ = kEnumerators[metric % 3];
    } else {
      value_ = std::to_string(static_cast<long>(index * 7919 % 20000) - 140);
    }
    metricId_ = std::to_string(806900 + metric);
    time_ = wallClockText(time);
    bind(statement, 1, tech_);
    bind(statement, 2, name_);
    bind(statement, 3, attribute_);
    bind(statement, 4, value_);
    bind(statement, 5, type_);
    sqlite3_bind_int(statement, 6, 0);
    bind(statement, 7, metricId_);
    sqlite3_bind_int(statement, 8, static_cast<int>(message / 3 % 2));
    bind(statement, 9, time_);
  }

 private:
  static void bind(sqlite3_stmt* statement, int index, const std::string& text) {
    sqlite3_bind_text(statement, index, text.c_str(), static_cast<int>(text.size()), SQLITE_STATIC);
  }

  std::string tech_, name_, attribute_, value_, type_ = "INT", metricId_, time_;
};

class Site {
 public:
  explicit Site(std::size_t rows) {
    const char* directory = std::getenv("QUORL_BENCH_DIR");
    std::string name = (std::filesystem::path(directory ? directory : ".") / "quorl-bench-XXXXXX").string();
    if (mkdtemp(name.data()) == nullptr) std::abort();
    path_ = name;
    database = SQLiteDatabase::open((path_ / "file.sqlite").string()).value();
    run(SQLTable<Metric>::createMetricTable);
    fill(rows);
  }
  ~Site() {
    database.reset();
    std::filesystem::remove_all(path_);
  }
  Site(const Site&) = delete;
  Site& operator=(const Site&) = delete;

  std::shared_ptr<SQLiteDatabase> database;

 private:
  void run(const char* sql) {
    if (sqlite3_exec(database->dbPointer(), sql, nullptr, nullptr, nullptr) != SQLITE_OK) std::abort();
  }
  void fill(std::size_t rows) {
    // The limits are SQLite's own idea of now.
    const Date end = SystemClock().now();
    const auto span = std::chrono::duration_cast<Date::duration>(std::chrono::hours(24 * kDays - 1));
    run("BEGIN");
    sqlite3_stmt* statement = nullptr;
    sqlite3_prepare_v2(database->dbPointer(), SQLTable<Metric>::insertMetric, -1, &statement, nullptr);
    Readings readings;
    for (std::size_t i = 0; i < rows; ++i) {
      const auto left = static_cast<std::int64_t>((rows - i) / kRowsPerSecond * kRowsPerSecond);
      readings.bindNext(statement, i, end - span * left / static_cast<std::int64_t>(rows));
      if (sqlite3_step(statement) != SQLITE_DONE) std::abort();
      sqlite3_reset(statement);
    }
    sqlite3_finalize(statement);
    run("COMMIT");
    run("PRAGMA wal_checkpoint(TRUNCATE)");
  }

  std::filesystem::path path_;
};

/// Memory of the process in bytes: now, or the most since the last reset.
std::size_t memory(std::string_view field) {
  std::ifstream status("/proc/self/status");
  for (std::string line; std::getline(status, line);)
    if (line.starts_with(field)) return std::strtoull(line.c_str() + field.size() + 1, nullptr, 10) * 1024;
  return 0;
}

void resetMostMemory() {
  malloc_trim(0);
  std::ofstream("/proc/self/clear_refs") << 5;
}

void read(SQLiteDatabase& database, Phone& phone, const std::function<void(const ExportedMetrics&)>& handle) {
  phone.main.async([&] {
    database.exportMetrics(kMonthly, [&](const ExportedMetrics& rows, const std::optional<SQLiteError>& error) {
      if (error) std::abort();
      handle(rows);
      phone.main.stop();
    });
  });
  phone.main.run();
}

void stepBare(SQLiteDatabase& database) {
  sqlite3_stmt* statement = nullptr;
  if (sqlite3_prepare_v2(database.dbPointer(), exportStatement(kMonthly), -1, &statement, nullptr) != SQLITE_OK)
    std::abort();
  while (sqlite3_step(statement) == SQLITE_ROW) continue;
  sqlite3_finalize(statement);
}

void measureMemory(benchmark::State& state, SQLiteDatabase& database, Phone& phone) {
  using Seconds = std::chrono::duration<double>;
  const auto megabytes = [](std::size_t bytes) { return static_cast<double>(bytes) / 1e6; };
  for ([[maybe_unused]] auto _ : state) {
    resetMostMemory();
    const std::size_t before = memory("VmRSS:");
    read(database, phone, [&](const ExportedMetrics& rows) {
      state.counters["rows"] = static_cast<double>(rows.size());
      state.counters["rows_MB"] = megabytes(memory("VmHWM:") - before);
      const auto start = std::chrono::steady_clock::now();
      const std::string text = exportText(rows);
      state.counters["main_thread_s"] = Seconds(std::chrono::steady_clock::now() - start).count();
      state.counters["text_MB"] = megabytes(text.size());
      state.counters["peak_MB"] = megabytes(memory("VmHWM:") - before);
    });
  }
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

std::size_t rowCount() {
  const char* text = std::getenv("QUORL_BENCH_ROWS");
  return text != nullptr ? std::strtoull(text, nullptr, 10) : kUsualRows;
}

}  // namespace
}  // namespace quorl

int main(int argc, char** argv) {
  using namespace quorl;
  std::vector<char*> arguments(argv, argv + argc);
  // Interleaved repetitions spread what else the machine does over both sides.
  std::string interleave = "--benchmark_enable_random_interleaving=true";
  arguments.insert(arguments.begin() + 1, interleave.data());
  int argumentCount = static_cast<int>(arguments.size());
  benchmark::Initialize(&argumentCount, arguments.data());
  if (benchmark::ReportUnrecognizedArguments(argumentCount, arguments.data())) return 1;

  Phone phone;
  HardwareManager::shared();
  const Site site(rowCount());
  SQLiteDatabase& database = *site.database;
  const auto add = [](const char* name, const auto& body) {
    benchmark::RegisterBenchmark(name, body)
        ->Repetitions(kRepetitions)
        ->ReportAggregatesOnly()
        ->Iterations(1)
        ->UseRealTime()
        ->Unit(benchmark::kMillisecond);
  };
  add("read/store", [&](benchmark::State& state) {
    for ([[maybe_unused]] auto _ : state) read(database, phone, [](const ExportedMetrics&) {});
  });
  add("read/bare", [&](benchmark::State& state) {
    for ([[maybe_unused]] auto _ : state) stepBare(database);
  });
  benchmark::RegisterBenchmark("read and text", [&](benchmark::State& state) { measureMemory(state, database, phone); })
      ->Iterations(1)
      ->UseRealTime()
      ->Unit(benchmark::kMillisecond);

  MedianReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  const auto store = reporter.medians.find("read/store");
  const auto bare = reporter.medians.find("read/bare");
  if (store != reporter.medians.end() && bare != reporter.medians.end())
    fmt::print("\nratio of medians, the store's read to its statement stepped bare: {:.2f}\n",
               store->second / bare->second);
  return 0;
}
