#include <algorithm>
#include <chrono>
#include <limits>
#include <string>
#include <utility>

#include <fmt/format.h>

#include "base/NotificationCenter.h"
#include "intake/AttributeKeys.h"
#include "intake/MetricService.h"
#include "platform/Platform.h"
#include "shell/Logs.h"
#include "shell/NotificationNames.h"

namespace quorl {
namespace {

constexpr char kIntType[] = "INT";
constexpr char kStringType[] = "STRING";
constexpr char kDateType[] = "DATE";

/// The entries of a sub-message that was flattened, for the log.
struct FlattenedPairs {
  const MetricDictionary& dictionary;
};

std::string logText(const FlattenedPairs& pairs) {
  std::string text = "[";
  for (const MetricEntry& entry : pairs.dictionary.entries()) {
    if (text.size() > 1) text += ", ";
    text += fmt::format("(\"{}\", {})", entry.key.view(), logText(entry.value));
  }
  return text + "]";
}

bool holdsOnlyIntegers(const MetricDictionary& dictionary) {
  const auto& entries = dictionary.entries();
  return std::all_of(entries.begin(), entries.end(), [](const MetricEntry& entry) { return entry.value.isInteger(); });
}

/// What a row says of a value. Both texts are empty for a nested value and for an empty list.
struct TypedValue {
  std::string value;
  const char* type = "";
};

/// Nothing for a kind that no row can hold.
std::optional<TypedValue> typedValue(const MetricValue& value) {
  if (value.isInteger()) return TypedValue{value.integerText(), kIntType};
  if (const auto* number = value.get<MetricFloat>()) return TypedValue{floatText(number->value), kIntType};
  if (const auto* text = value.get<Text>()) {
    const bool looksLikeDate = text->view().find_first_of("/:") != std::string_view::npos;
    return TypedValue{text->string(), looksLikeDate ? kDateType : kStringType};
  }
  if (value.get<MetricDictionary>() != nullptr || value.get<MetricDictionaryList>() != nullptr) return TypedValue{};
  if (const auto* numbers = value.get<NumberList>(); numbers != nullptr && numbers->bits.empty()) return TypedValue{};
  return std::nullopt;
}

}  // namespace

void MetricService::flattenDictionaryIfNeeded(MetricDictionary source, MetricDictionary& result) {
  metricServiceLog.log("MetricService - flattenDictionaryIfNeeded - metricDictionary %{public}@", source);
  result.reserve(result.size() + source.size());
  for (const MetricEntry* walked : source.walkOrder()) {
    const auto* nested = walked->value.get<MetricDictionary>();
    if (nested == nullptr || !holdsOnlyIntegers(*nested)) {
      // The walk sees constants; `source` is this call's own.
      MetricEntry& entry = source.entries()[static_cast<std::size_t>(walked - source.entries().data())];
      result.set(entry.key, std::move(entry.value));
      continue;
    }
    metricServiceLog.log("flattened : %{public}@", FlattenedPairs{*nested});
    for (const MetricEntry* inner : nested->walkOrder())
      result.set(fmt::format("{}_{}", walked->key.view(), inner->key.view()), inner->value);
  }
}

Date MetricService::collectionDate(const MetricDictionary& dictionary) {
  const std::optional<std::int64_t> milliseconds = dictionary.integer(kTimestampKey);
  if (!milliseconds) return Platform::current().clock.now();
  constexpr std::int64_t kLimit = std::numeric_limits<std::int64_t>::max() / 1000;
  return Date(std::chrono::milliseconds(std::clamp(*milliseconds, -kLimit, kLimit)));
}

void MetricService::insertMetricToDatabase(const MetricDictionary& dictionary, const MetricGroupV2& group, Date date) {
  const std::optional<std::int32_t> subsId = dictionary.integer32(kSubsIdKey);
  if (!subsId) return;
  metricServiceLog.log("subsId  ---> %{public}d", *subsId);

  for (const MetricEntry* entry : dictionary.walkOrder()) {
    std::optional<TypedValue> typed = typedValue(entry->value);
    if (!typed) {
      metricServiceLog.error("unknown attributevalue  ---> %{public}s", entry->value);
      continue;
    }
    insertNestedRows(entry->value, *subsId, group, date);
    if (typed->value.empty()) {
      metricServiceLog.log("attribute value or value type is empty");
      return;
    }
    metricServiceLog.log(
        "metricTech: %{public}s, metricName: %{public}s, attributeName: %{public}s, attributeValue: %{public}s, "
        "attibuteValueType: %{public}s)",
        group.tech, group.name, entry->key.view(), typed->value, typed->type);

    Metric metric;
    metric.id = Uuid::make();
    metric.metricTech = group.tech;
    metric.metricName = group.name;
    metric.attributeName = entry->key.view();
    metric.attributeNameNonLocalized = entry->key.view();
    metric.attributeValue = std::move(typed->value);
    metric.attributeValueType = typed->type;
    metric.collectedOn = date;
    metric.metricId = fmt::format_int(group.zelkorId).str();
    metric.subsId = *subsId;
    metric.graphable = isGraphable(group.name, entry->key.view());
    databaseLog.log("MetricService - insertMetricToDatabase - metricTech %{public}s - metricName %{public}s",
                    group.tech, group.name);

    PersistanceStoreProtocol::WriteCompletion completion = [row = metric](bool success,
                                                                          std::optional<SQLiteError> error) {
      if (!success) {
        metricServiceLog.error("error occurred while inserting  ---> %{public}s", error);
        return;
      }
      NotificationCenter::defaultCenter().post(notification::kNewZelkorMetric, {{notification::kMetricObjectKey, row}});
    };
    persistanceStore_.insertMetric(std::move(metric), std::move(completion));
  }
}

/// The rows of a sub-message or of each element of a list of them; nothing for any other value. The outer key is lost.
void MetricService::insertNestedRows(const MetricValue& value, std::int32_t subsId, const MetricGroupV2& group,
                                     Date date) {
  if (const auto* nested = value.get<MetricDictionary>()) {
    MetricDictionary child = *nested;
    child.set(kSubsIdKey, std::int64_t{subsId});
    insertMetricToDatabase(child, group, date);
  } else if (const auto* list = value.get<MetricDictionaryList>()) {
    for (const MetricDictionary& element : *list) {
      MetricDictionary flat;
      flattenDictionaryIfNeeded(element, flat);
      flat.set(kSubsIdKey, std::int64_t{subsId});
      insertMetricToDatabase(flat, group, date);
    }
  }
}

}  // namespace quorl
