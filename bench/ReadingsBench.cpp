// Answers from memory beside the statements', compared and not timed: QUORL_BENCH_STEPS random steps on a small table
// (ten thousand without it), then every read over QUORL_BENCH_ROWS rows (a hundred thousand) of few instants, more than
// SQLite sorts at once. Prints the first answer that differs, and then ends with 1.

#include <chrono>
#include <cstddef>
#include <memory>
#include <string>

#include <fmt/format.h>

#include "StoreBench.h"
#include "store/MetricStatements.h"
#include "store/ReadingsDriver.h"
#include "support/TemporaryDirectory.h"

namespace quorl {
namespace {

/// A phone in virtual time, and its database.
struct Site {
  Site() {
    bench::execute(database->dbPointer(), "PRAGMA synchronous=OFF");
    bench::execute(database->dbPointer(), SQLTable<Metric>::createMetricTable);
    bench::execute(database->dbPointer(), SQLTable<Metric>::createDashboardTable);
  }

  test::FakePlatform platform;
  test::VirtualTimeVfs vfs{platform.time};
  test::ScopedTimeZone zone{"UTC"};
  const test::TemporaryDirectory directory{bench::directory()};
  const std::string path = (directory.path() / "file.sqlite").string();
  const std::shared_ptr<SQLiteDatabase> database = SQLiteDatabase::open(path).value();
};

bool report(const char* what, const test::ReadingsDriver& driver, std::chrono::steady_clock::time_point start) {
  fmt::print("{}: {} reads, {} from memory, {:.1f} s\n", what, driver.reads(), driver.readsFromMemory(),
             std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count());
  if (!driver.difference().empty()) fmt::print("{}\n", driver.difference());
  return driver.difference().empty();
}

bool takeSteps(std::size_t steps) {
  const auto start = std::chrono::steady_clock::now();
  Site site;
  test::ReadingsDriver driver(/*seed=*/20260105, site.platform, site.database, site.path);
  for (std::size_t i = 0; i < steps && driver.difference().empty(); ++i) driver.step();
  return report(fmt::format("{} steps", steps).c_str(), driver, start);
}

bool readManyRows(std::size_t rows) {
  const auto start = std::chrono::steady_clock::now();
  Site site;
  bench::execute(
      site.database->dbPointer(),
      fmt::format(
          "WITH RECURSIVE counter(n) AS (SELECT 0 UNION ALL SELECT n + 1 FROM counter WHERE n + 1 < {}) "
          "INSERT INTO Metric (metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
          "is_attribute_graphable, metric_id, subs_id, collected_on) "
          "SELECT CASE n * 7919 % 2 WHEN 0 THEN 'LTE' ELSE '5G' END, "
          "CASE n * 104729 % 3 WHEN 0 THEN 'Serving Cell Info' WHEN 1 THEN 'Ota Msg' ELSE 'Rach Attempt' END, "
          "CASE n * 1299709 % 5 WHEN 0 THEN 'dl_freq' WHEN 1 THEN 'ul_freq' WHEN 2 THEN 'rsrp' WHEN 3 THEN 'Zeta' "
          "ELSE '' END, '' || n, 'INT', 1, '803010', n * 15485863 % 2, "
          "datetime('2026-01-05 08:00:00', '+' || (n * 32452843 % 17) || ' seconds') FROM counter",
          rows));
  test::ReadingsDriver driver(/*seed=*/1, site.platform, site.database, site.path);
  driver.readEverything();
  return report(fmt::format("{} rows", rows).c_str(), driver, start);
}

}  // namespace
}  // namespace quorl

int main() {
  using namespace quorl;
  const bool isSame = takeSteps(bench::number("QUORL_BENCH_STEPS", 10'000));
  return readManyRows(bench::rowCount()) && isSame ? 0 : 1;
}
