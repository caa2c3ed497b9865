// Every read over a month of rows, beside the same statement stepped bare, all columns that the read takes included, in
// a work item of the same queue, in the same run. At the end the medians and their ratios are printed, of the time on
// the wall and of the processor's, which others on the machine disturb less, and the memory that the longest export
// takes. QUORL_BENCH_ROWS is the number of rows, QUORL_BENCH_DIR the directory of the file, which is made once and
// kept; without them, a hundred thousand and the working directory.

#include <cstddef>
#include <cstdlib>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <benchmark/benchmark.h>
#include <fmt/format.h>

#include "Medians.h"
#include "Memory.h"
#include "StoreBench.h"
#include "store/MetricStatements.h"

namespace quorl {
namespace {

constexpr int kRepetitions = 7;

using Done = std::function<void()>;

class ReadBench {
 public:
  ReadBench(bench::Phone& phone, std::shared_ptr<SQLiteDatabase> database)
      : phone_(phone), database_(std::move(database)) {}

  /// `read` starts a read of the database and calls its argument when that has completed.
  void add(const std::string& task, const std::string& sql, std::string columns,
           const std::function<void(Done done)>& read) {
    tasks_.push_back(task);
    bench::add(task + "/store", kRepetitions, [this, read](benchmark::State& state) {
      for ([[maybe_unused]] auto _ : state) untilDone(read);
    });
    bench::add(task + "/bare", kRepetitions, [this, sql, columns = std::move(columns)](benchmark::State& state) {
      for ([[maybe_unused]] auto _ : state) {
        untilDone([&](Done done) {
          database_->queue().async([&, done = std::move(done)] {
            bench::stepBare(database_->dbPointer(), sql, columns);
            phone_.main.async(done);
          });
        });
      }
    });
  }
  /// A completion of any read, which must succeed.
  static auto into(Done done) {
    return [done = std::move(done)](const auto& /*result*/, const std::optional<SQLiteError>& error) {
      if (error) std::abort();
      done();
    };
  }
  /// Starts `read` on the main queue and runs that until it is done.
  void untilDone(const std::function<void(Done done)>& read) {
    phone_.main.async([&] { read([&] { phone_.main.stop(); }); });
    phone_.main.run();
  }
  const std::vector<std::string>& tasks() const { return tasks_; }

 private:
  bench::Phone& phone_;
  const std::shared_ptr<SQLiteDatabase> database_;
  std::vector<std::string> tasks_;
};

}  // namespace
}  // namespace quorl

int main(int argc, char** argv) {
  using namespace quorl;
  using Table = SQLTable<Metric>;
  if (!bench::initialize(argc, argv)) return 1;
  bench::Phone phone;
  const auto path = bench::monthOfRows(bench::directory(), bench::rowCount(), phone.fake.time.now());
  const std::shared_ptr<SQLiteDatabase> database = SQLiteDatabase::open(path.string()).value();
  ReadBench reads(phone, database);

  constexpr std::size_t kMetric = 4;
  const std::string tech = bench::metricTechOf(kMetric);
  const std::string name = bench::metricNameOf(kMetric);
  const std::string attribute = bench::attributeNameOf(3);
  reads.add("available metrics", Table::availableMetrics(0), "ttti",
            [&](Done done) { database->fetchAvailableMetrics(0, ReadBench::into(std::move(done))); });
  reads.add("contents of a metric", Table::metricContents(tech, name, std::nullopt, 0), "-tttttitit", [&](Done done) {
    database->fetchMetricContents(tech, name, std::nullopt, 0, ReadBench::into(std::move(done)));
  });
  reads.add("contents of an attribute", Table::metricContents(tech, name, attribute, 0), "-tttttitit", [&](Done done) {
    database->fetchMetricContents(tech, name, attribute, 0, ReadBench::into(std::move(done)));
  });
  constexpr std::pair<const char*, AttributeDetailTimeFrame> kTimeFrames[] = {
      {"daily", AttributeDetailTimeFrame::daily},
      {"weekly", AttributeDetailTimeFrame::weekly},
      {"monthly", AttributeDetailTimeFrame::monthly}};
  for (const auto& [frame, timeFrame] : kTimeFrames) {
    reads.add(fmt::format("{} history", frame), Table::attributeHistory(name, attribute, timeFrame, 0), "ttttttit",
              [&, timeFrame = timeFrame](Done done) {
                database->fetchAttributeHistory(name, attribute, timeFrame, ReadBench::into(std::move(done)));
              });
  }
  reads.add("dashboard", Table::dashboard(0), "tttti",
            [&](Done done) { database->fetchDashboard(0, ReadBench::into(std::move(done))); });
  for (const auto& [frame, timeFrame] : kTimeFrames) {
    reads.add(fmt::format("{} export", frame), exportStatement(timeFrame), "ttttitt",
              [&, timeFrame = timeFrame](Done done) {
                database->exportMetrics(timeFrame, ReadBench::into(std::move(done)));
              });
  }

  bench::MedianReporter reporter("store", "bare");
  benchmark::RunSpecifiedBenchmarks(&reporter);
  fmt::print("\n{:<26}{:>14}{:>14}{:>10}{:>12}\n", "medians", "store, ms", "bare, ms", "ratio", "of CPU");
  for (const std::string& task : reads.tasks()) {
    const auto ratio = reporter.ratio(task);
    if (!ratio) continue;
    fmt::print("{:<26}{:>14.2f}{:>14.2f}{:>10.3f}{:>12.3f}\n", task, reporter.times(task, "store")->real,
               reporter.times(task, "bare")->real, ratio->real, ratio->processor);
  }

  bench::resetMostMemory();
  const std::size_t before = bench::memory();
  std::size_t rows = 0;
  reads.untilDone([&](Done done) {
    database->exportMetrics(AttributeDetailTimeFrame::monthly,
                            [&, done = std::move(done)](const ExportedMetrics& metrics, const auto& /*error*/) {
                              rows = metrics.size();
                              done();
                            });
  });
  fmt::print("\nmonthly export: {} rows, peak {:.0f} MB above the {:.0f} MB before\n", rows,
             static_cast<double>(bench::mostMemory() - before) / 1e6, static_cast<double>(before) / 1e6);
  return 0;
}
