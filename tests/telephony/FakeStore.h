#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "base/Queue.h"
#include "telephony/StoreForRows.h"

namespace quorl::test {

/// A store in memory that keeps what a test wants to look at. Completions come on the main queue, as the real one's do.
class FakeStore final : public StoreForRows {
 public:
  struct Read {
    std::string metricTech;
    std::string metricName;
    std::optional<std::string> attributeName;
    std::int32_t subsId;
  };

  explicit FakeStore(Queue& mainQueue) : mainQueue_(mainQueue) {}

  void insertMetric(Metric metric, WriteCompletion completion) override {
    inserted.push_back(std::move(metric));
    mainQueue_.async([completion = std::move(completion), error = insertError] { completion(!error, error); });
  }

  void fetchMetricContents(std::string_view metricTech, std::string_view metricName,
                           std::optional<std::string_view> attributeName, std::int32_t subsId,
                           MetricsCompletion completion) override {
    reads.push_back({std::string(metricTech), std::string(metricName),
                     attributeName ? std::optional<std::string>(*attributeName) : std::nullopt, subsId});
    auto answer = [completion = std::move(completion), rows = latest(metricName, subsId), error = readError] {
      completion(error ? std::vector<Metric>() : rows, error);
    };
    if (holdsReads) {
      held.push_back(std::move(answer));
    } else {
      mainQueue_.async(std::move(answer));
    }
  }

  /// Completes the reads that were held back.
  void release() {
    for (auto& answer : std::exchange(held, {})) mainQueue_.async(std::move(answer));
  }

  /// Values by attribute of the rows of one metric, as they came in.
  std::vector<std::pair<std::string, std::string>> values(std::string_view metricName) const {
    std::vector<std::pair<std::string, std::string>> result;
    for (const Metric& row : inserted)
      if (row.metricName == metricName) result.emplace_back(row.attributeName, row.attributeValue);
    return result;
  }

  std::vector<Metric> inserted;
  std::vector<Read> reads;
  std::optional<SQLiteError> insertError;
  std::optional<SQLiteError> readError;
  bool holdsReads = false;
  std::vector<std::function<void()>> held;

 private:
  std::vector<Metric> latest(std::string_view metricName, std::int32_t subsId) const {
    std::map<std::string, Metric> byAttribute;
    for (const Metric& row : inserted)
      if (row.metricName == metricName && row.subsId == subsId) byAttribute.insert_or_assign(row.attributeName, row);
    std::vector<Metric> rows;
    for (auto& [attribute, row] : byAttribute) rows.push_back(std::move(row));
    return rows;
  }

  Queue& mainQueue_;
};

}  // namespace quorl::test
