#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "platform/ZelkorClient.h"

// Commands as the client sends them to the baseband manager.

namespace quorl::test {

/// A configuration that lists these metrics, written as a JSON list.
inline std::string configurationOf(std::string_view metrics) {
  return R"({"applicationId":2,"payloadType":0,"profileId":0,)"
         R"("triggers":[{"triggerId":5202011,"triggerType":0,"triggerRef":9999}],"metrics":)" +
         std::string(metrics) + "}";
}

inline zelkor::KeyValueMessage addConfiguration(std::string_view content) {
  zelkor::KeyValueMessage message;
  message.set(zelkor::kKeyAppID, std::int64_t{2});
  message.set(zelkor::kKeyPayload, ByteString(content));
  message.set(zelkor::kKeyPayloadType, std::int64_t{0});
  return message;
}

inline zelkor::KeyValueMessage clearConfiguration() {
  zelkor::KeyValueMessage message;
  message.set(zelkor::kKeyAppID, std::int64_t{2});
  return message;
}

inline zelkor::KeyValueMessage queryMetric() {
  zelkor::KeyValueMessage message = clearConfiguration();
  message.set(zelkor::kKeyPayloadType, std::int64_t{0});
  message.set(zelkor::kKeyTriggerRef, std::int64_t{9999});
  message.set(zelkor::kKeyTriggerType, std::int64_t{0});
  message.set(zelkor::kKeyTriggerID, std::int64_t{5202011});
  message.set(zelkor::kKeyProfileID, std::int64_t{0});
  message.set(zelkor::kKeyMetricID, std::int64_t{0});
  return message;
}

}  // namespace quorl::test
