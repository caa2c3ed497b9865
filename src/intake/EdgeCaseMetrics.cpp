#include <algorithm>
#include <iterator>

#include <fmt/format.h>

#include "intake/MetricService.h"
#include "messages/MetricCodable.h"
#include "shell/Logs.h"

// Metrics that are decoded by a class fixed here instead of the one that the catalogue names.

namespace quorl {
namespace {

constexpr char kHomePlmnListKey[] = "ehplmn_list";

/// Replaces the list of home networks by the text "MCC MNC". Each dictionary of the list sets or clears both codes, so
/// the last one decides. Without both the list stays.
void applyHomePlmnRule(MetricDictionary& dictionary) {
  const MetricValue* entry = dictionary.find(kHomePlmnListKey);
  const auto* list = entry != nullptr ? entry->get<MetricDictionaryList>() : nullptr;
  if (list == nullptr || list->empty()) return;
  const std::optional<std::int64_t> mcc = list->back().integer("MCC");
  const std::optional<std::int64_t> mnc = list->back().integer("MNC");
  if (!mcc || !mnc) return;
  dictionary.remove(kHomePlmnListKey);
  dictionary.set("PLMN", Text(fmt::format("{} {}", *mcc, *mnc)));
}

void removeOtaMsgCellKeys(MetricDictionary& dictionary) {
  for (const char* key : {"freq_range", "phy_cell_id", "dl_bw", "freq_band_ind"}) dictionary.remove(key);
}

struct EdgeCaseRule {
  std::int64_t metricId;
  std::string_view className;
  void (*apply)(MetricDictionary&);  // null: the dictionary stays as decoded
};

// 827746 is decoded by the class of the neighbouring id 827747, and 806743 by one whose name differs from the
// catalogue's in case. Both are meant.
constexpr EdgeCaseRule kEdgeCaseRules[] = {
    {827650, "CellularRegisteredPlmnStatus", applyHomePlmnRule},
    {827746, "CellularRatLacSrvInfo", nullptr},
    {806743, "CellularLteConnectionStats", nullptr},
    {806913, "CellularNrOtaMsg", removeOtaMsgCellKeys},
};

}  // namespace

std::optional<MetricDictionary> MetricService::handleEdgeCaseMetrics(std::int64_t metricId,
                                                                     const zelkor::KeyValueMessage& inputDictionary) {
  metricServiceLog.log("exception metric %{public}d", metricId);
  const auto* rule = std::find_if(std::begin(kEdgeCaseRules), std::end(kEdgeCaseRules),
                                  [&](const EdgeCaseRule& candidate) { return candidate.metricId == metricId; });
  if (rule == std::end(kEdgeCaseRules)) {
    metricRelatedLog.log("handleEdgeCaseMetrics - unable to process metricId: %{public}d ", metricId);
    return std::nullopt;
  }
  const std::unique_ptr<MetricCodable> message = makeMessage(rule->className);
  message->initWithData(inputDictionary.bytes(payloadKey));
  std::optional<MetricDictionary> dictionary = message->dictionaryRepresentation();
  if (dictionary && rule->apply != nullptr) rule->apply(*dictionary);
  return dictionary;
}

}  // namespace quorl
