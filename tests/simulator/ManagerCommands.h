#pragma once

#include <cstdint>

#include "platform/ZelkorClient.h"

// Commands as the client sends them to the baseband manager.

namespace quorl::test {

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
