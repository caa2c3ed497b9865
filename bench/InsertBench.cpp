// A row from the main thread into the database and back: hand-over to the database's queue, insert, completion on the
// main queue, beside a bare loop of prepare, bind, step and finalise of the same statement, in the same run. At the end
// the ratios of the medians are printed. QUORL_BENCH_DIR names the directory; without it, it is the working directory
// and then /dev/shm.

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <benchmark/benchmark.h>
#include <fmt/format.h>

#include "Medians.h"
#include "StoreBench.h"
#include "base/DateText.h"
#include "store/DBManager.h"
#include "store/MetricStatements.h"
#include "support/TemporaryDirectory.h"

namespace quorl {
namespace {

constexpr int kRepetitions = 41;

/// A new database with its table of metrics.
class Site {
 public:
  explicit Site(const std::filesystem::path& directory) : directory_(directory) {
    database = SQLiteDatabase::open((directory_.path() / "file.sqlite").string()).value();
    bench::execute(database->dbPointer(), SQLTable<Metric>::createMetricTable);
  }

 private:
  const test::TemporaryDirectory directory_;  // goes after the database

 public:
  std::shared_ptr<SQLiteDatabase> database;
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

void wholePath(benchmark::State& state, bench::Phone& phone, const std::filesystem::path& directory,
               std::size_t count) {
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

}  // namespace
}  // namespace quorl

int main(int argc, char** argv) {
  using namespace quorl;
  if (!bench::initialize(argc, argv)) return 1;
  const std::vector<std::string> directories = bench::directories({".", "/dev/shm"});
  bench::Phone phone;
  for (const std::string& directory : directories) {
    // A commit on a disk waits for the disk.
    const std::size_t count = directory == "/dev/shm" ? 1000 : 50;
    const std::string task = "insert " + directory;
    bench::add(task + "/store", kRepetitions,
               [&, directory, count](benchmark::State& state) { wholePath(state, phone, directory, count); });
    bench::add(task + "/bare", kRepetitions,
               [directory, count](benchmark::State& state) { bareLoop(state, directory, count); });
  }
  bench::MedianReporter reporter("store", "bare");
  benchmark::RunSpecifiedBenchmarks(&reporter);

  fmt::print("\nratio of medians, the store to the bare loop\n");
  for (const std::string& directory : directories) {
    const auto ratio = reporter.ratio("insert " + directory);
    if (ratio) fmt::print("  {:<12} {:.2f}\n", directory, ratio->real);
  }
  return 0;
}
