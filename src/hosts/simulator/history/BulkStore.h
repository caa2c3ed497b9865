#pragma once

#include <cstdint>
#include <filesystem>
#include <memory>
#include <string>

#include <tl/expected.hpp>

#include "store/PersistanceStoreProtocol.h"
#include "store/StatementHandle.h"

struct sqlite3;

namespace quorl::simulator {

/// Takes the rows of metric sources in place of the product's store and writes them into the same file, in the same
/// form, but many in one transaction: for making a history at once instead of living through it.
///
/// It writes rows and does nothing else: a read completes with an error. Whoever hands in a row is not told what came
/// of it; after the first failure nothing more is written, and `finish` tells. One thread at a time, and no store may
/// have the file open meanwhile.
class BulkStore final : public PersistanceStoreProtocol {
 public:
  using Outcome = tl::expected<void, std::string>;

  /// Opens the file, making it (0600) with the table of rows if it is missing. The error says in a few words why that
  /// fails.
  static tl::expected<std::unique_ptr<BulkStore>, std::string> open(const std::filesystem::path& file);
  /// What is not finished is lost.
  ~BulkStore() override;
  BulkStore(const BulkStore&) = delete;
  BulkStore& operator=(const BulkStore&) = delete;

  /// The file may not grow beyond this many pages of the database from now on.
  void limitPages(int pages);
  /// Rows taken so far.
  std::uint64_t rows() const { return rows_; }
  bool hasFailed() const { return !failure_.empty(); }
  /// Ends the last transaction and leaves a file that is whole without its write-ahead log. The error is that of the
  /// first failure; rows of whole transactions before it are in the file.
  Outcome finish();

  void insertMetric(Metric metric, WriteCompletion completion) override;
  void fetchAvailableMetrics(std::int32_t subsId, AvailableMetricsCompletion completion) override;
  void fetchMetricContents(std::string_view metricTech, std::string_view metricName,
                           std::optional<std::string_view> attributeName, std::int32_t subsId,
                           MetricsCompletion completion) override;
  void fetchAttributeHistory(std::string_view metricName, std::string_view attributeName,
                             AttributeDetailTimeFrame timeFrame, MetricsCompletion completion) override;
  void fetchDashboard(std::int32_t subsId, DashboardCompletion completion) override;
  void exportMetrics(AttributeDetailTimeFrame timeFrame, ExportCompletion completion) override;

 private:
  struct CloseDatabase {
    void operator()(sqlite3* database) const;
  };

  explicit BulkStore(sqlite3* database) : database_(database) {}
  Outcome prepare();
  bool run(const char* sql);
  bool bind(const Metric& metric);
  void fail();

  std::unique_ptr<sqlite3, CloseDatabase> database_;
  StatementHandle insert_;
  std::uint64_t rows_ = 0;
  std::uint64_t rowsInTransaction_ = 0;
  Date lastDate_;  // rows of one metric share their time
  std::string lastDateText_;
  std::string failure_;
};

}  // namespace quorl::simulator
