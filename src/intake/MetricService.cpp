#include "intake/MetricService.h"

#include <algorithm>
#include <string>
#include <utility>

#include <fmt/format.h>

#include "app/HardwareManager.h"
#include "messages/MetricCodable.h"
#include "shell/Logs.h"

namespace quorl {
namespace {

constexpr char kMarker[] = "validator - metric name: %@, dictionary: %@";

/// A metric id as log lines show an optional value.
struct OptionalMetricId {
  std::int64_t value;
};

std::string logText(const OptionalMetricId& id) {
  return fmt::format("Optional({})", id.value);
}

/// Technology and name of a row, run together.
struct TechAndName {
  const MetricGroupV2& row;
};

std::string logText(const TechAndName& text) {
  return std::string(text.row.tech).append(text.row.name);
}

/// A row that could not be decoded. The word exception is all there is of one.
void logException(std::int64_t metricId) {
  metricServiceLog.log("MetricService - processMetric - exception - metricID %{public}d", metricId);
}

template <typename Container, typename Value>
bool contains(const Container& container, const Value& value) {
  return std::find(container.begin(), container.end(), value) != container.end();
}

}  // namespace

std::shared_ptr<MetricService> MetricService::make(PersistanceStoreProtocol& store, ZelkorWrapper& zelkor) {
  const std::shared_ptr<MetricService> service(new MetricService(store, zelkor));
  zelkor.setDelegate(service);
  metricServiceLog.log("MetricService -  init()");
  return service;
}

// Listening needs no delegate: what arrives before there is one is dropped.
MetricService::MetricService(PersistanceStoreProtocol& store, ZelkorWrapper& zelkor)
    : persistanceStore_(store), zelkorShared_(zelkor) {
  zelkorShared_.listen();
}

void MetricService::eventsDidUpdate(const zelkor::KeyValueMessage& /*dictionary*/) {}

void MetricService::metricsDidUpdate(const zelkor::KeyValueMessage& dictionary) {
  processMetric(dictionary);
}

void MetricService::processMetric(const zelkor::KeyValueMessage& dictionary) {
  const std::optional<std::int64_t> metricId = dictionary.integer(metricIDKey);
  if (!metricId) {
    metricRelatedLog.log("Metric validator - processMetric - invalid metricId");
    return;
  }
  const std::string hexId = fmt::format("{:2X}", static_cast<std::uint64_t>(*metricId));
  metricRelatedLog.log("MetricValidator - processMetric - metricId: %{public}d - metric dictionary: %{public}@", hexId,
                       dictionary);

  const bool isException = contains(exceptionMetricIds, *metricId);
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
    if (row.zelkorId != *metricId) continue;
    const bool goesOn =
        isException ? processEdgeCaseRow(*metricId, row, dictionary) : processRow(*metricId, hexId, row, dictionary);
    if (!goesOn) return;
  }
}

/// Answers whether rows further down are to be visited.
bool MetricService::processEdgeCaseRow(std::int64_t metricId, const MetricGroupV2& row,
                                       const zelkor::KeyValueMessage& dictionary) {
  std::optional<MetricDictionary> answer = handleEdgeCaseMetrics(metricId, dictionary);
  if (!answer) return false;
  const Date date = collectionDate(*answer);
  MetricDictionary flat;
  flattenDictionaryIfNeeded(std::move(*answer), flat);
  insertMetricToDatabase(flat, row, date);
  return true;
}

/// Answers whether rows further down are to be visited.
bool MetricService::processRow(std::int64_t metricId, std::string_view hexId, const MetricGroupV2& row,
                               const zelkor::KeyValueMessage& dictionary) {
  const std::unique_ptr<MetricCodable> message = makeMessage(row.className);
  if (!message) {
    logException(metricId);
    return true;
  }
  message->initWithData(dictionary.bytes(payloadKey));
  std::optional<MetricDictionary> decoded = message->dictionaryRepresentation();
  if (!decoded) {
    logException(metricId);
    return true;
  }
  metricServiceLog.log("MetricService - processMetric - ClassFromName %{public}s", row.className);
  if (decoded->empty()) {
    metricServiceLog.log("dictionary is empty  ---> %{public}s", OptionalMetricId{metricId});
    return false;
  }
  metricRelatedLog.log("marker: %{public}s, metricName: %{public}s, dictionaryCount: %{public}@", kMarker,
                       TechAndName{row}, decoded->size());

  // Taken from what was decoded: the Ice rules drop the top level.
  const Date date = collectionDate(*decoded);
  MetricDictionary flat;
  flattenDictionaryIfNeeded(std::move(*decoded), flat);
  if (HardwareManager::shared().isIceDevice() && contains(edgeCaseIceMetrics, hexId))
    flat = parseIceMetric(hexId, flat);
  insertMetricToDatabase(flat, row, date);
  return true;
}

}  // namespace quorl
