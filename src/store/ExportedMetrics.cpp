#include "store/ExportedMetrics.h"

#include <algorithm>
#include <cstring>
#include <deque>
#include <functional>
#include <limits>

#include "base/FatalStop.h"

namespace quorl {
namespace {

constexpr std::size_t kRowsPerBlock = 8192;
constexpr std::size_t kChunkSize = std::size_t{1} << 20;
constexpr std::size_t kRecentValues = 4096;

/// The last of a value's bytes: the length of a text that stands in the others, or this.
constexpr char kIsInArena = '\x7F';
constexpr std::size_t kLongestInline = 7;
/// In a value's other bytes: the chunk in three bytes, the place in it in four.
constexpr std::size_t kMostChunks = std::size_t{1} << 24;

}  // namespace

struct ExportedMetrics::Texts {
  std::deque<Series> series;  // nothing in it moves, so keys can point into it
  std::unordered_map<Key, std::uint32_t, KeyHash> indexOfSeries;
  std::vector<std::vector<char>> chunks;  // each text behind its length; no chunk grows beyond its first capacity
  std::array<Value, kRecentValues> recent{};
};

Metric ExportedMetric::metric() const {
  Metric metric;
  metric.id = id;
  metric.metricTech = metricTech;
  metric.metricName = metricName;
  metric.attributeName = attributeName;
  metric.attributeNameNonLocalized = attributeNameNonLocalized;
  metric.attributeValue = attributeValue;
  metric.collectedOn = collectedOn;
  metric.metricId = metricId;
  metric.subsId = subsId;
  return metric;
}

ExportedMetrics::ExportedMetrics() : texts_(std::make_shared<Texts>()) {}

std::size_t ExportedMetrics::KeyHash::operator()(const Key& key) const {
  std::size_t hash = 0;
  for (const std::string_view text : {key.metricTech, key.metricName, key.attributeNameNonLocalized, key.metricId})
    hash = hash * 31 + std::hash<std::string_view>()(text);
  return hash;
}

ExportedMetrics::Key ExportedMetrics::keyOf(const Series& series) {
  return {series.metricTech, series.metricName, series.attributeNameNonLocalized, series.metricId};
}

std::uint32_t ExportedMetrics::seriesOf(const Key& key, StringTable& strings) {
  std::deque<Series>& series = texts_->series;
  if (!series.empty()) {
    // The attributes of a metric come in the same order again and again.
    const std::uint32_t expected = series[lastSeries_].next;
    if (keyOf(series[expected]) == key) return lastSeries_ = expected;
  }
  const auto found = texts_->indexOfSeries.find(key);
  auto index = static_cast<std::uint32_t>(series.size());
  if (found != texts_->indexOfSeries.end()) {
    index = found->second;
  } else {
    Series added;
    added.metricTech = key.metricTech;
    added.metricName = key.metricName;
    added.attributeName = strings.localized(key.attributeNameNonLocalized);
    added.attributeNameNonLocalized = key.attributeNameNonLocalized;
    added.metricId = key.metricId;
    series.push_back(std::move(added));
    texts_->indexOfSeries.emplace(keyOf(series.back()), index);
  }
  series[lastSeries_].next = index;
  return lastSeries_ = index;
}

ExportedMetrics::Value ExportedMetrics::keep(std::string_view text) {
  Value value;
  if (text.size() <= kLongestInline) {
    std::copy(text.begin(), text.end(), value.bytes.begin());
    value.bytes.back() = static_cast<char>(text.size());
    return value;
  }
  Value& recent = texts_->recent[std::hash<std::string_view>()(text) % kRecentValues];
  if (textOf(recent) == text) return recent;

  if (text.size() > std::numeric_limits<std::uint32_t>::max()) fatalStop("ExportedMetrics: a value of 4 GB");
  const auto length = static_cast<std::uint32_t>(text.size());
  const std::size_t needed = sizeof length + text.size();
  std::vector<std::vector<char>>& chunks = texts_->chunks;
  if (chunks.empty() || chunks.back().capacity() - chunks.back().size() < needed) {
    if (chunks.size() == kMostChunks) fatalStop("ExportedMetrics: too many values");
    chunks.emplace_back().reserve(std::max(kChunkSize, needed));
  }
  const auto chunk = static_cast<std::uint32_t>(chunks.size() - 1);
  const auto place = static_cast<std::uint32_t>(chunks.back().size());
  chunks.back().resize(place + sizeof length);
  std::memcpy(chunks.back().data() + place, &length, sizeof length);
  chunks.back().insert(chunks.back().end(), text.begin(), text.end());

  std::memcpy(value.bytes.data(), &place, sizeof place);
  for (std::size_t i = 0; i < 3; ++i) value.bytes[4 + i] = static_cast<char>(chunk >> (8 * i) & 0xFF);
  value.bytes.back() = kIsInArena;
  recent = value;
  return value;
}

std::string_view ExportedMetrics::textOf(const Value& value) const {
  if (value.bytes.back() != kIsInArena) return {value.bytes.data(), static_cast<std::size_t>(value.bytes.back())};
  std::uint32_t place = 0;
  std::memcpy(&place, value.bytes.data(), sizeof place);
  std::size_t chunk = 0;
  for (std::size_t i = 0; i < 3; ++i)
    chunk |= static_cast<std::size_t>(static_cast<unsigned char>(value.bytes[4 + i])) << (8 * i);
  const char* const at = texts_->chunks[chunk].data() + place;
  std::uint32_t length = 0;
  std::memcpy(&length, at, sizeof length);
  return {at + sizeof length, length};
}

void ExportedMetrics::append(const ExportedMetric& row, StringTable& strings) {
  if (size_ % kRowsPerBlock == 0) blocks_.emplace_back().reserve(kRowsPerBlock);
  const std::uint32_t series =
      seriesOf({row.metricTech, row.metricName, row.attributeNameNonLocalized, row.metricId}, strings);
  blocks_.back().push_back({Uuid::make(), row.collectedOn, keep(row.attributeValue), series, row.subsId});
  ++size_;
}

ExportedMetric ExportedMetrics::row(std::size_t index) const {
  const Row& row = blocks_[index / kRowsPerBlock][index % kRowsPerBlock];
  const Series& series = texts_->series[row.series];
  return {row.id,
          series.metricTech,
          series.metricName,
          series.attributeName,
          series.attributeNameNonLocalized,
          textOf(row.value),
          row.collectedOn,
          series.metricId,
          row.subsId};
}

}  // namespace quorl
