#pragma once

#include <cstdint>
#include <utility>

#include "platform/ZelkorClient.h"

namespace quorl::test {

/// What the baseband manager delivers for a metric, with the two keys that intake cannot do without.
inline zelkor::KeyValueMessage metricEvent(std::int64_t metricId, ByteString payload) {
  zelkor::KeyValueMessage event;
  event.set(zelkor::kKeyMetricID, metricId);
  event.set(zelkor::kKeyPayload, std::move(payload));
  return event;
}

}  // namespace quorl::test
