#pragma once

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <functional>
#include <string>
#include <vector>

#include <tl/expected.hpp>

#include "base/Clock.h"
#include "hosts/simulator/ScenarioRun.h"

namespace quorl::simulator {

/// A past in which somebody looked at the product some times a day, on the way through a scenario: metrics come only
/// while it is in the foreground.
struct HistoryPlan {
  ScenarioChoice choice;
  int days = 1;                                                 // up to `until`
  Date until;                                                   // nothing is later than this
  int sessionsPerDay = 4;                                       // spread over the waking hours
  std::chrono::milliseconds session = std::chrono::minutes(3);  // length of one
};

struct HistoryProgress {
  int sessionsDone = 0;
  int sessions = 0;
  std::uint64_t events = 0;
  std::uint64_t rows = 0;
};

/// Writes the rows of a history into a database file, in bulk. A file that is missing is made beside its place and
/// comes there whole or not at all, and never over one that has come there meanwhile; one that is there gets the rows
/// added. `progress` is called after each session, `isStopped` asked before each; both may be empty. The error says in
/// one line what went wrong, or that it was stopped; of a file that was there before, it keeps what was written so far.
///
/// Main thread, on an installed platform whose device is of the plan's family, and before the product is started.
tl::expected<HistoryProgress, std::string> writeHistory(const std::filesystem::path& database, const HistoryPlan& plan,
                                                        const std::function<void(const HistoryProgress&)>& progress,
                                                        const std::function<bool()>& isStopped = {});

/// Removes what killed programs have left of histories for this file.
void removeAbandonedHistories(const std::filesystem::path& database);

/// When the sessions of a plan begin, earliest first. The same plan gives the same times.
std::vector<Date> sessionTimes(const HistoryPlan& plan);

}  // namespace quorl::simulator
