#pragma once

#include <cstddef>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include <benchmark/benchmark.h>
#include <sqlite3.h>

#include "base/SerialQueue.h"
#include "store/DBManager.h"
#include "support/FakePlatform.h"
#include "support/TimeZoneAndLocale.h"
#include "support/VirtualTimeVfs.h"

// What the benches of the store share.

namespace quorl::bench {

struct SilentConsole final : Console {
  void print(std::string_view /*line*/) override {}
};

/// A phone whose main queue is the bench's thread, in UTC. Its clock, SQLite's included, stands still, so that a month
/// of rows made once serves every later run.
struct Phone {
  Phone() { Platform::install(&platform); }

  test::FakePlatform fake;
  test::VirtualTimeVfs vfs{fake.time};
  test::ScopedTimeZone zone{"UTC"};
  ThreadQueueFactory queues;
  LoopQueue main{"main"};
  SilentConsole console;
  Platform platform{main,           main,           queues,          fake.time,   fake.properties,
                    fake.resources, fake.documents, fake.strings,    console,     fake.alerts,
                    fake.analytics, fake.share,     fake.pasteboard, fake.zelkor, fake.silentTelephony};
};

/// Where files go: QUORL_BENCH_DIR, or `otherwise`.
std::vector<std::string> directories(std::vector<std::string> otherwise);
/// QUORL_BENCH_DIR, or the working directory.
std::filesystem::path directory();

/// The number in the environment variable `name`, or `usual`.
std::size_t number(const char* name, std::size_t usual);
/// QUORL_BENCH_ROWS, or a hundred thousand.
std::size_t rowCount();

/// Runs statements whose rows do not matter.
void execute(sqlite3* database, const std::string& sql);
/// Steps a statement to its end and takes its columns: 'i' an integer, 't' a text, '-' none. Columns behind the named
/// ones are not taken.
void stepBare(sqlite3* database, const std::string& sql, std::string_view columns);
/// Binds one and the same row of short values to the store's statement of an insert.
void bindShortRow(sqlite3_stmt* insert);

// A month of what a Mav device reports all day: messages of eight attributes, most values short numbers, some
// enumerators, and in each message a time that no other has.

inline constexpr std::size_t kMetrics = 40;
inline constexpr std::size_t kRowsOfMessage = 8;
std::string metricTechOf(std::size_t metric);
std::string metricNameOf(std::size_t metric);
std::string attributeNameOf(std::size_t attribute);

/// The file of `rows` such rows over the thirty days up to `now`, and of the default pins, in `directory`. It
/// is made when it is not there, and stays for later runs.
std::filesystem::path monthOfRows(const std::filesystem::path& directory, std::size_t rows, Date now);

/// `body` once for each of many repetitions.
template <typename Body>
benchmark::internal::Benchmark* add(const std::string& name, int repetitions, const Body& body) {
  return benchmark::RegisterBenchmark(name.c_str(), body)
      ->Repetitions(repetitions)
      ->ReportAggregatesOnly()
      ->Iterations(1)
      ->UseRealTime()
      ->MeasureProcessCPUTime()
      ->Unit(benchmark::kMillisecond);
}

}  // namespace quorl::bench
