// The monthly export as the screen does it: the read on the database's queue, beside its statement stepped bare on the
// same connection in the same run, and then the text on the main thread. Tells the memory of both and how long the main
// thread is held. QUORL_BENCH_ROWS is the number of rows, QUORL_BENCH_DIR the directory of the file, which is made once
// and kept; without them, a hundred thousand and the working directory.

#include <chrono>
#include <cstddef>
#include <cstdlib>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include <benchmark/benchmark.h>
#include <fmt/format.h>

#include "Medians.h"
#include "Memory.h"
#include "StoreBench.h"
#include "screens/export/ExportText.h"
#include "store/MetricStatements.h"

namespace quorl {
namespace {

constexpr int kRepetitions = 5;
constexpr AttributeDetailTimeFrame kMonthly = AttributeDetailTimeFrame::monthly;

void read(SQLiteDatabase& database, bench::Phone& phone, const std::function<void(const ExportedMetrics&)>& handle) {
  phone.main.async([&] {
    database.exportMetrics(kMonthly, [&](const ExportedMetrics& rows, const std::optional<SQLiteError>& error) {
      if (error) std::abort();
      handle(rows);
      phone.main.stop();
    });
  });
  phone.main.run();
}

void measureMemory(benchmark::State& state, SQLiteDatabase& database, bench::Phone& phone) {
  using Seconds = std::chrono::duration<double>;
  const auto megabytes = [](std::size_t bytes) { return static_cast<double>(bytes) / 1e6; };
  for ([[maybe_unused]] auto _ : state) {
    bench::resetMostMemory();
    const std::size_t before = bench::memory();
    read(database, phone, [&](const ExportedMetrics& rows) {
      state.counters["rows"] = static_cast<double>(rows.size());
      state.counters["rows_MB"] = megabytes(bench::mostMemory() - before);
      const auto start = std::chrono::steady_clock::now();
      const std::string text = exportText(rows);
      state.counters["main_thread_s"] = Seconds(std::chrono::steady_clock::now() - start).count();
      state.counters["text_MB"] = megabytes(text.size());
      state.counters["peak_MB"] = megabytes(bench::mostMemory() - before);
    });
  }
}

}  // namespace
}  // namespace quorl

int main(int argc, char** argv) {
  using namespace quorl;
  if (!bench::initialize(argc, argv)) return 1;
  bench::Phone phone;
  const auto path = bench::monthOfRows(bench::directory(), bench::rowCount(), phone.fake.time.now());
  const std::shared_ptr<SQLiteDatabase> database = SQLiteDatabase::open(path.string()).value();
  bench::add("read/store", kRepetitions, [&](benchmark::State& state) {
    for ([[maybe_unused]] auto _ : state) read(*database, phone, [](const ExportedMetrics&) {});
  });
  bench::add("read/bare", kRepetitions, [&](benchmark::State& state) {
    for ([[maybe_unused]] auto _ : state) bench::stepBare(database->dbPointer(), exportStatement(kMonthly), "");
  });
  benchmark::RegisterBenchmark("read and text",
                               [&](benchmark::State& state) { measureMemory(state, *database, phone); })
      ->Iterations(1)
      ->UseRealTime()
      ->Unit(benchmark::kMillisecond);

  bench::MedianReporter reporter("store", "bare");
  benchmark::RunSpecifiedBenchmarks(&reporter);
  if (const auto ratio = reporter.ratio("read"))
    fmt::print("\nratio of medians, the store's read to its statement stepped bare: {:.2f}\n", ratio->real);
  return 0;
}
