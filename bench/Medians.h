#pragma once

#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <benchmark/benchmark.h>

namespace quorl::bench {

/// False when the command line cannot be understood. Repetitions are interleaved, which spreads what else the machine
/// does over both sides.
bool initialize(int argc, char** argv);

/// Prints as the console does and keeps the medians of the repetitions. Benchmarks are named "<task>/<side>": what is
/// measured, and the baseline beside it.
class MedianReporter : public benchmark::ConsoleReporter {
 public:
  /// Of one side of a task, in its unit: by the clock on the wall, and of the processor.
  struct Times {
    double real = 0;
    double processor = 0;
  };

  MedianReporter(std::string side, std::string baseline) : side_(std::move(side)), baseline_(std::move(baseline)) {}

  void ReportRuns(const std::vector<Run>& runs) override;
  /// Nothing if it did not run.
  std::optional<Times> times(const std::string& task, const std::string& side) const;
  /// Of the task's medians to those of its baseline; nothing if one of the two did not run.
  std::optional<Times> ratio(const std::string& task) const;

 private:
  const std::string side_;
  const std::string baseline_;
  std::map<std::string, Times> medians_;
};

}  // namespace quorl::bench
