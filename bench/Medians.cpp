#include "Medians.h"

namespace quorl::bench {

bool initialize(int argc, char** argv) {
  std::vector<char*> arguments(argv, argv + argc);
  std::string interleave = "--benchmark_enable_random_interleaving=true";
  arguments.insert(arguments.begin() + 1, interleave.data());
  int count = static_cast<int>(arguments.size());
  benchmark::Initialize(&count, arguments.data());
  return !benchmark::ReportUnrecognizedArguments(count, arguments.data());
}

void MedianReporter::ReportRuns(const std::vector<Run>& runs) {
  ConsoleReporter::ReportRuns(runs);
  for (const Run& run : runs)
    if (run.aggregate_name == "median")
      medians_[run.run_name.function_name] = {run.GetAdjustedRealTime(), run.GetAdjustedCPUTime()};
}

std::optional<MedianReporter::Times> MedianReporter::times(const std::string& task, const std::string& side) const {
  const auto found = medians_.find(task + "/" + side);
  return found == medians_.end() ? std::nullopt : std::optional(found->second);
}

std::optional<MedianReporter::Times> MedianReporter::ratio(const std::string& task) const {
  const auto measured = times(task, side_);
  const auto baseline = times(task, baseline_);
  if (!measured || !baseline) return std::nullopt;
  return Times{measured->real / baseline->real, measured->processor / baseline->processor};
}

}  // namespace quorl::bench
