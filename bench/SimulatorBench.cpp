// How many metrics a second the simulated phone makes, and how many of them the product's intake turns into rows in the
// same time, in the same run; beside that the rows a second that a history gets in bulk, and those of a bare loop with
// the same statement. At the end both ratios are printed.

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <benchmark/benchmark.h>
#include <fmt/format.h>
#include <sqlite3.h>

#include "NoStore.h"
#include "StoreBench.h"
#include "base/Clock.h"
#include "hosts/simulator/EpochTime.h"
#include "hosts/simulator/ScenarioFiles.h"
#include "hosts/simulator/ScenarioRun.h"
#include "hosts/simulator/history/BulkIntake.h"
#include "hosts/simulator/history/History.h"
#include "intake/ZelkorWrapper.h"
#include "store/MetricStatements.h"
#include "support/FakePlatform.h"
#include "support/TemporaryDirectory.h"

namespace quorl::simulator {
namespace {

constexpr std::chrono::minutes kWay{10};
constexpr Date kStart{std::chrono::seconds(1767605400)};  // 2026-01-05 09:30:00 UTC

ScenarioChoice way(std::string_view name, metrics::Family family) {
  return {findScenario(name, {QUORL_SOURCE_DIR "/resources"}).value(), 1, family};
}

std::vector<RecordedEvent> eventsOf(const ScenarioChoice& choice) {
  std::vector<RecordedEvent> events;
  ScenarioRun run(choice, millisecondsSince1970(kStart));
  run.advance(kWay, [&events](RecordedEvent event) { events.push_back(std::move(event)); });
  return events;
}

std::string rateName(std::string_view what) {
  return std::string(what) + "/s";
}

void simulated(benchmark::State& state, const ScenarioChoice& choice) {
  std::uint64_t metrics = 0;
  for ([[maybe_unused]] auto _ : state) {
    ScenarioRun run(choice, millisecondsSince1970(kStart));
    run.advance(kWay, [&metrics](const RecordedEvent& event) {
      benchmark::DoNotOptimize(event);
      ++metrics;
    });
  }
  state.counters[rateName("metrics")] = benchmark::Counter(static_cast<double>(metrics), benchmark::Counter::kIsRate);
}

void taken(benchmark::State& state, const ScenarioChoice& choice) {
  const auto events = eventsOf(choice);
  bench::NoStore store;
  const auto service = MetricService::make(store, ZelkorWrapper::sharedInstance());
  std::uint64_t metrics = 0;
  for ([[maybe_unused]] auto _ : state) {
    for (const RecordedEvent& event : events) service->processMetric(event.message());
    metrics += events.size();
  }
  state.counters[rateName("metrics")] = benchmark::Counter(static_cast<double>(metrics), benchmark::Counter::kIsRate);
}

void history(benchmark::State& state, const ScenarioChoice& choice) {
  const test::TemporaryDirectory folder{"/dev/shm"};
  std::uint64_t rows = 0;
  for ([[maybe_unused]] auto _ : state) {
    const auto file = folder.path() / "history";
    const auto made = writeHistory(file, {choice, 1, kStart}, {});
    rows += made ? made->rows : 0;
    std::filesystem::remove(file);
  }
  state.counters[rateName("rows")] = benchmark::Counter(static_cast<double>(rows), benchmark::Counter::kIsRate);
}

void bareLoop(benchmark::State& state) {
  constexpr int kRows = 100000;
  const test::TemporaryDirectory folder{"/dev/shm"};
  const auto file = folder.path() / "bare";
  for ([[maybe_unused]] auto _ : state) {
    sqlite3* database = nullptr;
    sqlite3_open(file.c_str(), &database);
    bench::execute(database, "PRAGMA journal_mode=WAL");
    bench::execute(database, SQLTable<Metric>::createMetricTable);
    sqlite3_stmt* statement = nullptr;
    sqlite3_prepare_v2(database, SQLTable<Metric>::insertMetric, -1, &statement, nullptr);
    bench::execute(database, "BEGIN");
    for (int row = 0; row < kRows; ++row) {
      bench::bindShortRow(statement);
      sqlite3_step(statement);
      sqlite3_reset(statement);
    }
    bench::execute(database, "COMMIT");
    sqlite3_finalize(statement);
    sqlite3_close(database);
    std::filesystem::remove(file);
  }
  state.counters[rateName("rows")] =
      benchmark::Counter(static_cast<double>(state.iterations()) * kRows, benchmark::Counter::kIsRate);
}

class RateReporter : public benchmark::ConsoleReporter {
 public:
  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs)
      for (const auto& [name, counter] : run.counters) rates[run.run_name.function_name] = counter.value;
  }
  std::map<std::string, double> rates;
};

}  // namespace
}  // namespace quorl::simulator

int main(int argc, char** argv) {
  using namespace quorl::simulator;
  benchmark::Initialize(&argc, argv);
  quorl::test::FakePlatform platform;
  platform.properties.texts["BasebandChipset"] = "mav";
  const auto add = [](const char* name, auto body) {
    benchmark::RegisterBenchmark(name, body)->Unit(benchmark::kMillisecond)->UseRealTime();
  };
  const ScenarioChoice choice = way("busy", metrics::Family::Mav);
  add("simulated", [&choice](benchmark::State& state) { simulated(state, choice); });
  add("intake", [&choice](benchmark::State& state) { taken(state, choice); });
  add("history", [&choice](benchmark::State& state) { history(state, choice); });
  add("bare", [](benchmark::State& state) { bareLoop(state); });
  RateReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  auto& rates = reporter.rates;
  if (rates.contains("simulated") && rates.contains("intake"))
    fmt::print("\nmetrics simulated for each that intake takes\n  {:.2f}\n", rates["simulated"] / rates["intake"]);
  if (rates.contains("history") && rates.contains("bare"))
    fmt::print("\nrows of a history in bulk for each of a bare loop\n  {:.2f}\n", rates["history"] / rates["bare"]);
  return 0;
}
