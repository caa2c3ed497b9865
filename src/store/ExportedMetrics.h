#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "platform/Services.h"
#include "store/Metric.h"

namespace quorl {

/// One row of an export, without copies of its texts. Its value type is empty, it is neither graphable nor bookmarked,
/// and it has no section.
struct ExportedMetric {
  Uuid id;
  std::string_view metricTech;
  std::string_view metricName;
  std::string_view attributeName;  // localised
  std::string_view attributeNameNonLocalized;
  std::string_view attributeValue;
  Date collectedOn;
  std::string_view metricId;
  std::int32_t subsId = 0;

  /// The same as a record of its own.
  Metric metric() const;
};

/// The records of an export, millions of them, in little memory: of what they describe only few differ, so a row holds
/// a number for that and its value. A copy shares the texts. Read on any thread once it is filled.
class ExportedMetrics {
 public:
  ExportedMetrics();

  /// Adds a row with a new id, and with the attribute's name as `strings` has it for `row.attributeNameNonLocalized`.
  /// Copies the texts.
  void append(const ExportedMetric& row, StringTable& strings);

  std::size_t size() const { return size_; }
  bool empty() const { return size_ == 0; }
  /// Row `index`, which must exist. Its texts are valid for as long as this object or a copy of it is.
  ExportedMetric row(std::size_t index) const;

 private:
  /// What many rows have in common.
  struct Series {
    std::string metricTech;
    std::string metricName;
    std::string attributeName;
    std::string attributeNameNonLocalized;
    std::string metricId;
    std::uint32_t next = 0;  // the series that came behind this one last time
  };
  struct Key {
    std::string_view metricTech;
    std::string_view metricName;
    std::string_view attributeNameNonLocalized;
    std::string_view metricId;
    bool operator==(const Key&) const = default;
  };
  struct KeyHash {
    std::size_t operator()(const Key& key) const;
  };
  /// A short text itself, or where a longer one stands in the arena.
  struct Value {
    std::array<char, 8> bytes{};
  };
  struct Row {
    Uuid id;
    Date collectedOn;
    Value value;
    std::uint32_t series;
    std::int32_t subsId;
  };
  struct Texts;

  static Key keyOf(const Series& series);
  std::uint32_t seriesOf(const Key& key, StringTable& strings);
  Value keep(std::string_view text);
  std::string_view textOf(const Value& value) const;

  std::shared_ptr<Texts> texts_;
  std::vector<std::vector<Row>> blocks_;  // of one size, so that growing never moves a row
  std::size_t size_ = 0;
  std::uint32_t lastSeries_ = 0;
};

}  // namespace quorl
