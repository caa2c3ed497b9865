#pragma once

#include <cstddef>
#include <filesystem>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <benchmark/benchmark.h>

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

/// A directory of its own below `directory`, removed with all that is in it when this goes away.
class Directory {
 public:
  explicit Directory(const std::filesystem::path& directory);
  ~Directory();
  Directory(const Directory&) = delete;
  Directory& operator=(const Directory&) = delete;

  const std::filesystem::path& path() const { return path_; }

 private:
  std::filesystem::path path_;
};

/// Where files go: QUORL_BENCH_DIR, or `otherwise`.
std::vector<std::string> directories(std::vector<std::string> otherwise);

/// The number in the environment variable `name`, or `usual`.
std::size_t number(const char* name, std::size_t usual);
/// QUORL_BENCH_ROWS, or `usual`.
std::size_t rowCount(std::size_t usual);

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

/// Memory of the process in bytes by its name in the system's status: "VmRSS:" now, "VmHWM:" the most since the reset.
std::size_t memory(std::string_view field);
void resetMostMemory();

/// Keeps the medians of the repetitions, by name.
class MedianReporter : public benchmark::ConsoleReporter {
 public:
  /// Of one side of a task, in its unit: by the clock on the wall, and of the processor, of all threads.
  struct Times {
    double real = 0;
    double processor = 0;
  };

  void ReportRuns(const std::vector<Run>& runs) override;
  /// Of "<task>/store" and "<task>/bare"; nothing if it did not run.
  std::optional<Times> times(const std::string& task, const std::string& side) const;
  /// Of the store's medians to the bare ones; nothing if one of the two did not run.
  std::optional<Times> ratio(const std::string& task) const;

 private:
  std::map<std::string, Times> medians_;
};

/// False when the command line cannot be understood. Repetitions are interleaved, which spreads what else the machine
/// does over both sides.
bool initialize(int argc, char** argv);

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
