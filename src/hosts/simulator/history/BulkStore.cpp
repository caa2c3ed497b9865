#include "hosts/simulator/history/BulkStore.h"

#include <utility>

#include <fcntl.h>
#include <sqlite3.h>
#include <sys/stat.h>

#include "base/DateText.h"
#include "hosts/simulator/Descriptor.h"
#include "store/MetricBinding.h"
#include "store/MetricStatements.h"

namespace quorl::simulator {
namespace {

constexpr std::uint64_t kRowsOfATransaction = 50000;
constexpr int kBusyTimeoutMs = 5000;

/// As the store does: rows hold cell identities. The journal files take over the mode, so it is right before them.
void keepForUserAlone(const std::filesystem::path& file) {
  const Descriptor made(::open(file.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, S_IRUSR | S_IWUSR));
  if (made.isOpen()) ::fchmod(made.number(), S_IRUSR | S_IWUSR);
}

SQLiteError cannotRead() {
  return {SQLiteError::Case::Prepare, "rows are only written here"};
}

}  // namespace

void BulkStore::CloseDatabase::operator()(sqlite3* database) const {
  sqlite3_close(database);
}

BulkStore::~BulkStore() = default;

tl::expected<std::unique_ptr<BulkStore>, std::string> BulkStore::open(const std::filesystem::path& file) {
  keepForUserAlone(file);
  sqlite3* database = nullptr;
  const int flags = SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_NOMUTEX;
  const int code = sqlite3_open_v2(file.c_str(), &database, flags, nullptr);
  std::unique_ptr<BulkStore> store(new BulkStore(database));
  if (code != SQLITE_OK) return tl::unexpected(std::string(sqlite3_errmsg(database)));
  if (auto prepared = store->prepare(); !prepared) return tl::unexpected(std::move(prepared.error()));
  return store;
}

BulkStore::Outcome BulkStore::prepare() {
  sqlite3_busy_timeout(database_.get(), kBusyTimeoutMs);
  // One wait for the disk at the end instead of one for each transaction.
  if (run("PRAGMA journal_mode=WAL") && run("PRAGMA synchronous=NORMAL") && run(SQLTable<Metric>::createMetricTable)) {
    sqlite3_stmt* statement = nullptr;
    if (sqlite3_prepare_v2(database_.get(), SQLTable<Metric>::insertMetric, -1, &statement, nullptr) == SQLITE_OK) {
      insert_.reset(statement);
      return {};
    }
  }
  return tl::unexpected(std::string(sqlite3_errmsg(database_.get())));
}

bool BulkStore::run(const char* sql) {
  return sqlite3_exec(database_.get(), sql, nullptr, nullptr, nullptr) == SQLITE_OK;
}

void BulkStore::limitPages(int pages) {
  run(("PRAGMA max_page_count = " + std::to_string(pages)).c_str());
}

void BulkStore::fail() {
  if (failure_.empty()) failure_ = sqlite3_errmsg(database_.get());
}

bool BulkStore::bind(const Metric& metric) {
  if (lastDateText_.empty() || metric.collectedOn != lastDate_) {
    lastDate_ = metric.collectedOn;
    lastDateText_ = wallClockText(metric.collectedOn);
  }
  return bindMetric(insert_.get(), metric, lastDateText_) == 0;
}

void BulkStore::insertMetric(Metric metric, WriteCompletion /*completion*/) {
  if (hasFailed()) return;
  if (rowsInTransaction_ == 0 && !run("BEGIN")) return fail();
  const bool isWritten = bind(metric) && sqlite3_step(insert_.get()) == SQLITE_DONE;
  if (!isWritten) fail();
  sqlite3_reset(insert_.get());
  if (!isWritten) return;
  ++rows_;
  if (++rowsInTransaction_ < kRowsOfATransaction) return;
  rowsInTransaction_ = 0;
  if (!run("COMMIT")) fail();
}

BulkStore::Outcome BulkStore::finish() {
  if (!hasFailed() && rowsInTransaction_ > 0 && !run("COMMIT")) fail();
  rowsInTransaction_ = 0;
  if (hasFailed()) run("ROLLBACK");
  insert_.reset();
  if (!run("PRAGMA wal_checkpoint(TRUNCATE)")) fail();
  database_.reset();
  if (hasFailed()) return tl::unexpected(failure_);
  return {};
}

void BulkStore::fetchAvailableMetrics(std::int32_t /*subsId*/, AvailableMetricsCompletion completion) {
  completion({}, cannotRead());
}

void BulkStore::fetchMetricContents(std::string_view /*metricTech*/, std::string_view /*metricName*/,
                                    std::optional<std::string_view> /*attributeName*/, std::int32_t /*subsId*/,
                                    MetricsCompletion completion) {
  completion({}, cannotRead());
}

void BulkStore::fetchAttributeHistory(std::string_view /*metricName*/, std::string_view /*attributeName*/,
                                      AttributeDetailTimeFrame /*timeFrame*/, MetricsCompletion completion) {
  completion({}, cannotRead());
}

void BulkStore::fetchDashboard(std::int32_t /*subsId*/, DashboardCompletion completion) {
  completion({}, cannotRead());
}

void BulkStore::exportMetrics(AttributeDetailTimeFrame /*timeFrame*/, ExportCompletion completion) {
  completion({}, cannotRead());
}

}  // namespace quorl::simulator
