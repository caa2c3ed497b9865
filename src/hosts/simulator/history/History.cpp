#include "hosts/simulator/history/History.h"

#include <algorithm>
#include <chrono>
#include <random>
#include <system_error>
#include <utility>
#include <vector>

#include "base/DateText.h"
#include "hosts/simulator/EpochTime.h"
#include "hosts/simulator/history/BulkIntake.h"
#include "hosts/simulator/history/HistoryDraft.h"

namespace quorl::simulator {
namespace {

using std::chrono::milliseconds;

constexpr std::chrono::hours kDay{24};
constexpr std::chrono::hours kMorning{7};
constexpr std::chrono::hours kWakingHours{15};
/// When the product's delayed refresh asks for a snapshot.
constexpr milliseconds kRefresh{10000};

/// Local midnight of the day of `date`; without one, that of UTC.
Date startOfDay(Date date) {
  const std::string text = wallClockText(date);
  if (const auto start = parseWallClockDay(text.substr(0, 10))) return *start;
  return std::chrono::floor<std::chrono::days>(date);
}

std::vector<std::int64_t> currentMetrics(metrics::Family family) {
  std::vector<std::int64_t> ids;
  for (const metrics::MetricKind& kind : metrics::kindsOf(family))
    if (kind.isCurrent) ids.push_back(kind.metricId);
  return ids;
}

/// Lets one session happen. Each is a way through the scenario of its own.
bool playSession(const HistoryPlan& plan, std::uint64_t number, Date start, BulkIntake& intake) {
  ScenarioChoice choice = plan.choice;
  choice.seed += number;
  ScenarioRun run(std::move(choice), millisecondsSince1970(start));
  bool isGood = true;
  const auto take = [&](const RecordedEvent& event) { isGood = isGood && intake.take(event); };
  const milliseconds length =
      std::min<milliseconds>(plan.session, std::chrono::duration_cast<milliseconds>(plan.until - start));
  const milliseconds beforeRefresh = std::min(kRefresh, length);
  run.advance(beforeRefresh, take);
  run.snapshot(currentMetrics(plan.choice.family), take);
  run.advance(length - beforeRefresh, take);
  return isGood;
}

/// Fills a file, which errors call `name`.
tl::expected<HistoryProgress, std::string> fill(const std::filesystem::path& database,
                                                const std::filesystem::path& name, const HistoryPlan& plan,
                                                const std::function<void(const HistoryProgress&)>& progress,
                                                const std::function<bool()>& isStopped) {
  auto intake = BulkIntake::open(database, name);
  if (!intake) return tl::unexpected(std::move(intake.error()));
  const std::vector<Date> times = sessionTimes(plan);
  HistoryProgress so;
  so.sessions = static_cast<int>(times.size());
  for (std::size_t i = 0; i < times.size(); ++i) {
    if (isStopped && isStopped()) return tl::unexpected(name.string() + ": stopped before its end");
    if (!playSession(plan, i, times[i], **intake)) break;
    ++so.sessionsDone;
    so.events = (*intake)->events();
    so.rows = (*intake)->rows();
    if (progress) progress(so);
  }
  if (auto finished = (*intake)->finish(); !finished) return tl::unexpected(std::move(finished.error()));
  return so;
}

}  // namespace

std::vector<Date> sessionTimes(const HistoryPlan& plan) {
  std::mt19937_64 random(plan.choice.seed);
  const Date earliest = plan.until - plan.days * kDay;
  const milliseconds share = milliseconds(kWakingHours) / std::max(plan.sessionsPerDay, 1);
  const milliseconds slack = std::max<milliseconds>(share - plan.session, milliseconds(1));
  std::vector<Date> times;
  // Noon is on the same day whatever a change of the clocks does.
  for (Date noon = startOfDay(earliest) + kDay / 2; startOfDay(noon) < plan.until; noon += kDay) {
    for (int session = 0; session < plan.sessionsPerDay; ++session) {
      const milliseconds late(static_cast<milliseconds::rep>(random() % static_cast<std::uint64_t>(slack.count())));
      const Date start = startOfDay(noon) + kMorning + session * share + late;
      if (start >= earliest && start < plan.until) times.push_back(start);
    }
  }
  return times;
}

tl::expected<HistoryProgress, std::string> writeHistory(const std::filesystem::path& database, const HistoryPlan& plan,
                                                        const std::function<void(const HistoryProgress&)>& progress,
                                                        const std::function<bool()>& isStopped) {
  removeAbandonedHistories(database);
  std::error_code ignored;
  if (std::filesystem::exists(database, ignored)) return fill(database, database, plan, progress, isStopped);
  const auto draft = HistoryDraft::of(database);
  if (!draft) return tl::unexpected(database.string() + ": " + draft.error());
  auto made = fill((*draft)->file(), database, plan, progress, isStopped);
  if (!made) return made;
  if (const auto published = (*draft)->publish(); !published)
    return tl::unexpected(database.string() + ": " + published.error());
  return made;
}

void removeAbandonedHistories(const std::filesystem::path& database) {
  HistoryDraft::removeAbandoned(database);
}

}  // namespace quorl::simulator
