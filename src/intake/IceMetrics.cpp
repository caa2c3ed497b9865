#include <algorithm>
#include <iterator>
#include <utility>

#include <fmt/format.h>

#include "intake/AttributeKeys.h"
#include "intake/MetricService.h"
#include "shell/Logs.h"

// Ice metrics carry their values in a repeated sub-message. The rules here lift its elements to the top and convert raw
// radio values to physical units. Integer steps are 64-bit, float steps 32-bit arithmetic.

namespace quorl {
namespace {

constexpr char kConnectedModeKey[] = "connected_mode";

MetricFloat computed(float value) {
  return MetricFloat{value, /*isComputed=*/true};
}

/// Adds `offset` to an integer; wraps at the ends of its range.
void shift(MetricDictionary& element, std::string_view key, std::int64_t offset) {
  if (const auto value = element.integer(key))
    element.set(key,
                static_cast<std::int64_t>(static_cast<std::uint64_t>(*value) + static_cast<std::uint64_t>(offset)));
}

/// Hundredths to whole units, truncating toward zero.
void fromHundredths(MetricDictionary& element, std::string_view key) {
  if (const auto value = element.integer(key)) element.set(key, *value / 100);
}

void convertCarrier(MetricDictionary& element, const MetricDictionary& top) {
  if (const MetricValue* timestamp = top.find(kTimestampKey)) element.set(kTimestampKey, *timestamp);
  fromHundredths(element, "rsrp");
  if (const auto rsrq = element.number("rsrq")) element.set("rsrq", computed(*rsrq / 100.0F));
  fromHundredths(element, "rssi");
  if (const auto code = element.integer("dl_bandwidth")) {
    if (*code >= 0 && *code < std::ssize(MetricService::dlbwlookup)) {
      element.set("dl_bandwidth", computed(MetricService::dlbwlookup[static_cast<std::size_t>(*code)]));
    } else {
      element.remove("dl_bandwidth");
    }
  }
}

void convertGsmNeighbor(MetricDictionary& element, const MetricDictionary& /*top*/) {
  shift(element, "rxlev", -110);
}

void convertRxInfo(MetricDictionary& element, const MetricDictionary& top) {
  if (const MetricValue* mode = top.find(kConnectedModeKey)) {
    element.set(kConnectedModeKey, *mode);
  } else {
    element.remove(kConnectedModeKey);
  }
}

void convertUtraNeighbor(MetricDictionary& element, const MetricDictionary& /*top*/) {
  shift(element, "rscp", -116);
  if (const auto ecno = element.number("ecno")) element.set("ecno", computed(*ecno * 0.5F + -24.5F));
}

/// One dictionary of the entries of all; for a key that repeats the later value wins.
MetricDictionary mergePlain(MetricDictionaryList elements) {
  MetricDictionary merged;
  for (MetricDictionary& element : elements)
    for (MetricEntry& entry : element.entries()) merged.set(std::move(entry.key), std::move(entry.value));
  return merged;
}

/// Keeps the elements apart by putting "0-section-", "1-section-" before their keys.
///
/// The list begins with an empty dictionary, and of the empty ones each takes away what stands at its place in a list
/// that has become shorter meanwhile. So an empty element costs the one behind it, and stays.
MetricDictionary mergeNumbered(MetricDictionaryList elements) {
  elements.insert(elements.begin(), MetricDictionary());
  std::vector<std::size_t> emptyPlaces;
  for (std::size_t i = 0; i < elements.size(); ++i)
    if (elements[i].empty()) emptyPlaces.push_back(i);
  for (const std::size_t place : emptyPlaces)
    if (place < elements.size()) elements.erase(elements.begin() + static_cast<std::ptrdiff_t>(place));

  MetricDictionary merged;
  for (std::size_t k = 0; k < elements.size(); ++k)
    for (MetricEntry& entry : elements[k].entries())
      merged.append(Text(fmt::format("{}-section-{}", k, entry.key.view())), std::move(entry.value));
  return merged;
}

struct IceRule {
  std::string_view hexId;
  std::string_view listKey;
  void (*convert)(MetricDictionary& element, const MetricDictionary& top);  // null: elements stay as they are
  MetricDictionary (*merge)(MetricDictionaryList elements);
};

constexpr IceRule kIceRules[] = {
    {"3CD50D", "bearer_contexts", nullptr, mergePlain},
    {"3CD313", "scc_list", convertCarrier, mergeNumbered},
    {"3CD30B", "carrier_info", nullptr, mergePlain},
    {"3CD009", "gsm_ncell_meas", convertGsmNeighbor, mergePlain},
    {"3CD102", "rx_info", convertRxInfo, mergePlain},
    {"3CD105", "meas_utra_result", convertUtraNeighbor, mergePlain},
    {"3C0013", "ef", nullptr, mergePlain},
    {"3CD302", "tx_power_info", nullptr, mergePlain},
};

}  // namespace

MetricDictionary MetricService::parseIceMetric(std::string_view hexId, const MetricDictionary& dictionary) {
  metricServiceLog.log("MetricService - parseIceMetric - metricID %{public}@", hexId);
  const auto* rule = std::find_if(std::begin(kIceRules), std::end(kIceRules),
                                  [&](const IceRule& candidate) { return candidate.hexId == hexId; });
  MetricDictionary result;
  if (rule == std::end(kIceRules)) return result;

  const MetricValue* value = dictionary.find(rule->listKey);
  if (const auto* list = value != nullptr ? value->get<MetricDictionaryList>() : nullptr) {
    MetricDictionaryList elements = *list;
    if (rule->convert != nullptr)
      for (MetricDictionary& element : elements)
        if (!element.empty()) rule->convert(element, dictionary);
    result = rule->merge(std::move(elements));
  }
  if (dictionary.integer32(kSubsIdKey)) result.set(kSubsIdKey, *dictionary.find(kSubsIdKey));
  return result;
}

}  // namespace quorl
