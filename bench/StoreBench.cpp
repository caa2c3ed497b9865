#include "StoreBench.h"

#include <array>
#include <chrono>
#include <cstdlib>
#include <fstream>
#include <utility>

#include <fmt/format.h>
#include <malloc.h>
#include <sqlite3.h>
#include <stdlib.h>

#include "base/DateText.h"
#include "store/DefaultDashboard.h"
#include "store/MetricStatements.h"

namespace quorl::bench {
namespace {

constexpr std::size_t kDays = 30;

void run(sqlite3* database, const std::string& sql) {
  if (sqlite3_exec(database, sql.c_str(), nullptr, nullptr, nullptr) != SQLITE_OK) std::abort();
}

/// Binds one row after the other to the parameters of the insert.
class Readings {
 public:
  void bindNext(sqlite3_stmt* statement, std::size_t index, Date time) {
    static constexpr const char* kEnumerators[] = {"kHVCellMonitorCellTypeServing", "MODULATION_256QAM",
                                                   "SYS_SRV_STATUS_SRV"};
    const std::size_t message = index / kRowsOfMessage;
    const std::size_t metric = message % kMetrics;
    const std::size_t attribute = index % kRowsOfMessage;
    texts_[0] = metricTechOf(metric);
    texts_[1] = metricNameOf(metric);
    texts_[2] = attributeNameOf(attribute);
    if (attribute == 0) {
      texts_[3] = std::to_string(time.time_since_epoch().count() / 1000 + static_cast<std::int64_t>(index));
    } else if (attribute == 1) {
      texts_[3] = kEnumerators[metric % 3];
    } else {
      texts_[3] = std::to_string(static_cast<long>(index * 7919 % 20000) - 140);
    }
    texts_[4] = attribute == 1 ? "STRING" : "INT";
    texts_[5] = std::to_string(806900 + metric);
    texts_[6] = wallClockText(time);
    for (const auto& [parameter, text] : {std::pair(1, 0), {2, 1}, {3, 2}, {4, 3}, {5, 4}, {7, 5}, {9, 6}}) {
      const std::string& value = texts_[static_cast<std::size_t>(text)];
      sqlite3_bind_text(statement, parameter, value.c_str(), static_cast<int>(value.size()), SQLITE_STATIC);
    }
    sqlite3_bind_int(statement, 6, attribute == 1 ? 0 : 1);
    sqlite3_bind_int(statement, 8, static_cast<int>(message / 3 % 2));
  }

 private:
  std::array<std::string, 7> texts_;
};

void fill(const std::filesystem::path& path, std::size_t rows, Date end) {
  const std::shared_ptr<SQLiteDatabase> database = SQLiteDatabase::open(path.string()).value();
  sqlite3* const connection = database->dbPointer();
  run(connection, "PRAGMA synchronous=OFF");
  run(connection, SQLTable<Metric>::createMetricTable);
  run(connection, SQLTable<Metric>::createDashboardTable);
  run(connection, "BEGIN");
  for (const Metric& pin : defaultDashboard(/*isMavDevice=*/true, end))
    run(connection, SQLTable<Metric>::insertDashboardItem(
                        {pin.metricTech, pin.metricId, pin.metricName, pin.attributeName, pin.subsId}));
  const auto span = std::chrono::duration_cast<Date::duration>(std::chrono::hours(24 * kDays - 1));
  sqlite3_stmt* statement = nullptr;
  sqlite3_prepare_v2(connection, SQLTable<Metric>::insertMetric, -1, &statement, nullptr);
  Readings readings;
  for (std::size_t i = 0; i < rows; ++i) {
    const std::size_t left = (rows - i) / kRowsOfMessage * kRowsOfMessage;
    readings.bindNext(
        statement, i,
        end - std::chrono::duration_cast<Date::duration>(std::chrono::duration<double>(span) *
                                                         static_cast<double>(left) / static_cast<double>(rows)));
    if (sqlite3_step(statement) != SQLITE_DONE) std::abort();
    sqlite3_reset(statement);
  }
  sqlite3_finalize(statement);
  run(connection, "COMMIT");
  run(connection, "PRAGMA wal_checkpoint(TRUNCATE)");
}

}  // namespace

Directory::Directory(const std::filesystem::path& directory) {
  std::string name = (directory / "quorl-bench-XXXXXX").string();
  if (mkdtemp(name.data()) == nullptr) std::abort();
  path_ = name;
}

Directory::~Directory() {
  std::filesystem::remove_all(path_);
}

std::vector<std::string> directories(std::vector<std::string> otherwise) {
  if (const char* directory = std::getenv("QUORL_BENCH_DIR")) return {directory};
  return otherwise;
}

std::size_t number(const char* name, std::size_t usual) {
  const char* text = std::getenv(name);
  return text != nullptr ? std::strtoull(text, nullptr, 10) : usual;
}

std::size_t rowCount(std::size_t usual) {
  return number("QUORL_BENCH_ROWS", usual);
}

std::string metricTechOf(std::size_t metric) {
  static constexpr const char* kTechs[] = {"LTE", "5G", "MISC", "RAT"};
  return kTechs[metric % 4];
}

std::string metricNameOf(std::size_t metric) {
  return fmt::format("Serving Metric {}", metric);
}

std::string attributeNameOf(std::size_t attribute) {
  return attribute == 0 ? "timestamp" : fmt::format("some_attribute_name_{}", attribute);
}

std::filesystem::path monthOfRows(const std::filesystem::path& directory, std::size_t rows, Date now) {
  const std::filesystem::path path = directory / fmt::format("quorl-bench-month-{}.sqlite", rows);
  if (std::filesystem::exists(path)) return path;
  const Directory scratch(directory);  // a run that is cut short leaves no half of a file
  const std::filesystem::path unfinished = scratch.path() / "file.sqlite";
  fill(unfinished, rows, now);
  std::filesystem::rename(unfinished, path);
  return path;
}

std::size_t memory(std::string_view field) {
  std::ifstream status("/proc/self/status");
  for (std::string line; std::getline(status, line);)
    if (line.starts_with(field)) return std::strtoull(line.c_str() + field.size(), nullptr, 10) * 1024;
  return 0;
}

void resetMostMemory() {
  malloc_trim(0);
  std::ofstream("/proc/self/clear_refs") << 5;
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
  const auto store = times(task, "store");
  const auto bare = times(task, "bare");
  if (!store || !bare) return std::nullopt;
  return Times{store->real / bare->real, store->processor / bare->processor};
}

bool initialize(int argc, char** argv) {
  std::vector<char*> arguments(argv, argv + argc);
  std::string interleave = "--benchmark_enable_random_interleaving=true";
  arguments.insert(arguments.begin() + 1, interleave.data());
  int count = static_cast<int>(arguments.size());
  benchmark::Initialize(&count, arguments.data());
  return !benchmark::ReportUnrecognizedArguments(count, arguments.data());
}

}  // namespace quorl::bench
