#include "hosts/simulator/Configuration.h"

#include <algorithm>
#include <optional>
#include <string>
#include <utility>

#include <fmt/format.h>
#include <nlohmann/json.hpp>

#include "hosts/simulator/JsonNumber.h"

namespace quorl::simulator {
namespace {

using Json = nlohmann::json;
using Fault = std::optional<CommandFault>;

constexpr std::int64_t kPayloadType = 0;

constexpr const char* kKeys[] = {"applicationId", "payloadType", "profileId", "triggers", "metrics"};
constexpr const char* kTriggerKeys[] = {"triggerId", "triggerType", "triggerRef"};

CommandFault keyFault(std::string text) {
  return {CommandCode::ConfigurationKey, std::move(text)};
}

CommandFault valueFault(std::string text) {
  return {CommandCode::ConfigurationValue, std::move(text)};
}

/// What is wrong with the keys of an object, which must be those of the list and no others.
template <std::size_t N>
Fault keysFault(const Json& object, const char* const (&keys)[N], std::string_view where) {
  for (const char* key : keys)
    if (!object.contains(key)) return keyFault(fmt::format("{}{} is missing", where, key));
  for (const auto& [key, value] : object.items()) {
    const bool isKnown =
        std::any_of(std::begin(keys), std::end(keys), [&name = key](const char* known) { return name == known; });
    if (!isKnown) return keyFault(fmt::format("{}there is no key \"{}\"", where, key));
  }
  return std::nullopt;
}

Fault readInteger(const Json& object, const char* key, std::string_view where, std::int64_t& result) {
  const auto value = integer(object[key]);
  if (!value) return keyFault(fmt::format("{}{} is no integer", where, key));
  result = *value;
  return std::nullopt;
}

Fault readFixed(const Json& object, const char* key, std::int64_t wanted) {
  std::int64_t value = 0;
  if (auto fault = readInteger(object, key, "", value)) return fault;
  if (value != wanted) return valueFault(fmt::format("{} is {} and must be {}", key, value, wanted));
  return std::nullopt;
}

Fault readTriggers(const Json& list, std::vector<Configuration::Trigger>& triggers) {
  if (!list.is_array()) return keyFault("triggers is no list");
  for (const Json& entry : list) {
    const std::string where = fmt::format("trigger {}: ", triggers.size() + 1);
    if (!entry.is_object()) return keyFault(where + "no JSON object");
    if (auto fault = keysFault(entry, kTriggerKeys, where)) return fault;
    Configuration::Trigger trigger;
    if (auto fault = readInteger(entry, "triggerId", where, trigger.id)) return fault;
    if (auto fault = readInteger(entry, "triggerType", where, trigger.type)) return fault;
    if (auto fault = readInteger(entry, "triggerRef", where, trigger.ref)) return fault;
    triggers.push_back(trigger);
  }
  return std::nullopt;
}

Fault readMetrics(const Json& list, std::vector<std::int64_t>& metrics) {
  if (!list.is_array()) return keyFault("metrics is no list");
  for (const Json& entry : list) {
    const auto id = integer(entry);
    if (!id) return keyFault(fmt::format("metric {} of the list is no integer", metrics.size() + 1));
    if (*id <= 0) return valueFault(fmt::format("{} is no metric id", *id));
    if (std::find(metrics.begin(), metrics.end(), *id) != metrics.end())
      return valueFault(fmt::format("metric {} is listed twice", *id));
    metrics.push_back(*id);
  }
  if (metrics.empty()) return valueFault("no metric is listed");
  return std::nullopt;
}

Fault readAll(const Json& object, Configuration& configuration) {
  if (auto fault = keysFault(object, kKeys, "")) return fault;
  if (auto fault = readFixed(object, "applicationId", Configuration::kApplicationId)) return fault;
  if (auto fault = readFixed(object, "payloadType", kPayloadType)) return fault;
  if (auto fault = readInteger(object, "profileId", "", configuration.profileId)) return fault;
  if (auto fault = readTriggers(object["triggers"], configuration.triggers)) return fault;
  return readMetrics(object["metrics"], configuration.metrics);
}

}  // namespace

bool Configuration::selects(std::int64_t metricId) const {
  return std::find(metrics.begin(), metrics.end(), metricId) != metrics.end();
}

tl::expected<Configuration, CommandFault> parseConfiguration(std::string_view content) {
  if (content.empty())
    return tl::unexpected(CommandFault{CommandCode::EmptyConfiguration, "the configuration is empty"});
  const Json object = Json::parse(content.begin(), content.end(), nullptr, /*allow_exceptions=*/false);
  if (!object.is_object())
    return tl::unexpected(CommandFault{CommandCode::UnreadableConfiguration, "the configuration is no JSON object"});
  Configuration configuration;
  if (auto fault = readAll(object, configuration)) return tl::unexpected(*std::move(fault));
  return configuration;
}

}  // namespace quorl::simulator
