#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "messages/classes/nas_context.h"
#include "messages/wire/WireWriter.h"
#include "support/MetricEvent.h"

namespace quorl::test {

inline constexpr std::int64_t kNasMetricId = 3986700;
inline constexpr std::size_t kRowsOfNasEvent = 3;

/// A metric of an Ice device that becomes a row for each of its fields: "timestamp", "reg_status" and "subs_id".
/// Without a timestamp it is as old as its arrival, and a field that is left out is a row less.
inline zelkor::KeyValueMessage nasEvent(std::optional<std::uint64_t> timestampMs, bool hasStatus = true) {
  KCellularEmmContext message;
  if (timestampMs) message.setTimestamp(*timestampMs);
  if (hasStatus) message.setRegStatus(0);
  message.setSubsId(0);
  WireWriter writer;
  message.writeTo(writer);
  return metricEvent(kNasMetricId, ByteString(writer.bytes()));
}

}  // namespace quorl::test
