#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <initializer_list>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "intake/MetricService.h"
#include "intake/Payload.h"
#include "messages/MetricDictionary.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"
#include "support/RowsOnlyStore.h"

namespace quorl::test {

inline constexpr std::int64_t kActiveBearers = 0x3CD50D;

/// A store that keeps what it is given and completes when a test says so.
class RecordingStore final : public RowsOnlyStore {
 public:
  void insertMetric(Metric metric, WriteCompletion completion) override;
  void fetchMetricContents(std::string_view metricTech, std::string_view metricName,
                           std::optional<std::string_view> attributeName, std::int32_t subsId,
                           MetricsCompletion completion) override;

  /// Completes the oldest insert that has not been completed.
  void completesNext(bool success, std::optional<SQLiteError> error = std::nullopt);
  void completesAll();

  std::vector<Metric> rows;
  /// Called after each insert.
  std::function<void()> onInsert = [] {};

 private:
  std::deque<WriteCompletion> waiting_;
};

using Entries = std::initializer_list<std::pair<std::string_view, MetricValue>>;
MetricDictionary dictionaryOf(Entries entries);
/// A list of dictionaries as a value.
MetricValue listOf(std::initializer_list<MetricDictionary> elements);
MetricValue textOf(std::string_view text);
MetricValue bytesOf(std::string_view bytes);
MetricValue numbersOf(std::initializer_list<std::uint64_t> numbers);
inline MetricValue integerOf(std::int64_t value) {
  return value;
}
inline MetricValue decodedFloat(float value) {
  return MetricFloat{value, /*isComputed=*/false};
}
inline MetricValue computedFloat(float value) {
  return MetricFloat{value, /*isComputed=*/true};
}

/// A metric service on a fake device, with a store that records. The device is a Mav one unless told otherwise before
/// the service starts.
class IntakeTest : public ::testing::Test {
 protected:
  ~IntakeTest() override;

  void deviceIs(std::string chipset) { host.properties.texts["BasebandChipset"] = std::move(chipset); }
  void deviceIsIce() { deviceIs("ice7"); }
  void deviceIsMav() { deviceIs("mav20"); }
  /// Makes the service. Lines of its construction are left out of `log`.
  void serviceStarts();

  /// A metric comes from the baseband manager and is handled.
  void metricArrives(std::int64_t metricId, const Payload& payload);
  void metricArrives(zelkor::KeyValueMessage message);
  static zelkor::KeyValueMessage metricMessage(std::int64_t metricId, const Payload& payload);

  /// Rows as "attribute=value TYPE", of one metric name if told.
  std::vector<std::string> rows(std::optional<std::string_view> metricName = std::nullopt) const;
  /// "tech/name" of the rows, each run of equal ones once.
  std::vector<std::string> rowGroups() const;
  /// Lines "unknown attributevalue".
  std::vector<std::string> unknownValueLines() const;

  FakePlatform host;
  LogRecorder log;
  RecordingStore store;
  std::shared_ptr<MetricService> service;
};

}  // namespace quorl::test
