#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <string_view>

#include "base/Clock.h"
#include "intake/MetricGroupV2.h"
#include "intake/ZelkorWrapper.h"
#include "messages/MetricDictionary.h"
#include "store/PersistanceStoreProtocol.h"

namespace quorl {

/// Decodes each metric that the channel delivers and hands its attributes to the store, one row per attribute.
///
/// Holds no state that changes: a metric is handled from its own dictionary alone, once, on the main thread. It never
/// retries, queues or waits; whatever goes wrong with a metric ends in a log line, and the next one is handled like any
/// other. Main thread only, except for the constants.
class MetricService final : public ZelkorWrapperDelegate {
 public:
  static constexpr std::string_view metricIDKey = zelkor::kKeyMetricID;
  static constexpr std::string_view payloadKey = zelkor::kKeyPayload;
  static constexpr std::string_view profileIDKey = zelkor::kKeyProfileID;
  /// Metrics whose class and rule are fixed by `handleEdgeCaseMetrics`.
  static constexpr std::array<std::int64_t, 4> exceptionMetricIds{806743, 827746, 827650, 806913};
  /// Metrics that `parseIceMetric` rewrites on an Ice device.
  static constexpr std::array<std::string_view, 8> edgeCaseIceMetrics{"3CD313", "3CD50D", "3CD30B", "3CD009",
                                                                      "3CD102", "3CD105", "3C0013", "3CD302"};
  /// Downlink bandwidth in MHz by its code.
  static constexpr std::array<float, 6> dlbwlookup{1.4F, 3, 5, 10, 15, 20};
  /// Data only: nothing reads it, and its last entry repeats an earlier one.
  static constexpr std::array<std::string_view, 19> newMetricHexIds{
      "C4F57", "C5018", "C5019", "C7407", "C1002", "C300C", "C3E02", "C3E0B", "CA101", "CA103",
      "CA123", "CC006", "CC007", "CC008", "CC226", "C7505", "C500A", "C5004", "CC226"};

  /// Starts listening and then becomes the wrapper's delegate. `store` and `zelkor` must outlive the service.
  static std::shared_ptr<MetricService> make(PersistanceStoreProtocol& store, ZelkorWrapper& zelkor);
  MetricService(const MetricService&) = delete;
  MetricService& operator=(const MetricService&) = delete;

  ZelkorWrapper& zelkorShared() const { return zelkorShared_; }

  /// Trigger events carry nothing of interest.
  void eventsDidUpdate(const zelkor::KeyValueMessage& dictionary) override;
  void metricsDidUpdate(const zelkor::KeyValueMessage& dictionary) override;

  /// Walks the whole catalogue: each row of the metric's id decodes the payload anew and writes rows of its own. What
  /// earlier rows have written stays when a later one fails.
  void processMetric(const zelkor::KeyValueMessage& dictionary);

  /// The dictionary of a metric of `exceptionMetricIds`, decoded by its own rule. Nothing when the payload cannot be
  /// read whole, or for an id without rule.
  static std::optional<MetricDictionary> handleEdgeCaseMetrics(std::int64_t metricId,
                                                               const zelkor::KeyValueMessage& inputDictionary);

  /// Lifts the elements of the metric's list to the top and converts raw radio values to physical units. Of the top
  /// level only "subs_id" and what the metric's rule copies survive. An id without rule answers an empty dictionary.
  /// `hexId` is the metric id in upper-case hexadecimal.
  static MetricDictionary parseIceMetric(std::string_view hexId, const MetricDictionary& dictionary);

  /// Fills `result` from `source`: the entries of a sub-message that holds only integers go up one level under
  /// "outer_inner", all else stays as it is. An empty sub-message counts as one of integers, and so vanishes.
  static void flattenDictionaryIfNeeded(MetricDictionary source, MetricDictionary& result);

  /// The instant in "timestamp", which counts milliseconds since 1970. The current time when it is missing or no
  /// integer; the last instant that `Date` holds when it lies beyond.
  static Date collectionDate(const MetricDictionary& dictionary);

  /// Writes a row for each plain attribute, nested ones included, without waiting for the store. A dictionary without
  /// "subs_id" writes none. A nested, repeated or empty value ends the walk once its own rows are written.
  void insertMetricToDatabase(const MetricDictionary& dictionary, const MetricGroupV2& group, Date date);

 private:
  MetricService(PersistanceStoreProtocol& store, ZelkorWrapper& zelkor);

  bool processRow(std::int64_t metricId, std::string_view hexId, const MetricGroupV2& row,
                  const zelkor::KeyValueMessage& dictionary);
  bool processEdgeCaseRow(std::int64_t metricId, const MetricGroupV2& row, const zelkor::KeyValueMessage& dictionary);
  void insertNestedRows(const MetricValue& value, std::int32_t subsId, const MetricGroupV2& group, Date date);

  PersistanceStoreProtocol& persistanceStore_;
  ZelkorWrapper& zelkorShared_;
};

}  // namespace quorl
