#include "hosts/simulator/TimeShift.h"

#include <algorithm>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "hosts/simulator/CatalogueClass.h"
#include "hosts/simulator/EpochTime.h"
#include "intake/MetricGroupV2.h"
#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"
#include "messages/wire/WireReader.h"
#include "messages/wire/WireWriter.h"

namespace quorl::simulator {
namespace {

constexpr std::uint32_t kVarint = 0;
constexpr std::uint32_t kEndOfGroup = 4;

/// Tag of the timestamp in the class that decodes a metric; the classes of one id agree on it.
std::optional<std::uint32_t> timestampTag(const RecordedEvent& event) {
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
    if (event.metricID != row.zelkorId) continue;
    const auto message = makeMessage(decodingClass(row));
    if (!message) continue;
    for (const FieldEntry& field : message->table().fields)
      if (field.key == "timestamp") return field.tag;
  }
  return std::nullopt;
}

/// Calls `visit` with begin, end and value of each timestamp in a payload. False if the payload cannot be read whole.
template <typename Visit>
bool forEachTimestamp(std::string_view payload, std::uint32_t tag, const Visit& visit) {
  WireReader reader(payload);
  while (reader.pos < reader.length) {
    const std::uint64_t key = reader.readVarint();
    const auto wireType = static_cast<std::uint32_t>(key & 7U);
    if (reader.error) return false;
    if (wireType == kEndOfGroup) return true;
    if (key >> 3U == tag && wireType == kVarint) {
      const std::uint64_t begin = reader.pos;
      const std::uint64_t value = reader.readVarint();
      if (reader.error) return false;
      visit(begin, reader.pos, value);
    } else if (!reader.skipValue(static_cast<std::uint32_t>(key >> 3U), wireType)) {
      return false;
    }
  }
  return true;
}

/// Milliseconds since 1970; nothing for a payload without one. Of several the last counts, as it does for a reader.
std::optional<std::uint64_t> timestampOf(const RecordedEvent& event) {
  if (!event.payload) return std::nullopt;
  const auto tag = timestampTag(event);
  std::optional<std::uint64_t> found;
  if (!tag || !forEachTimestamp(event.payload->view(), *tag,
                                [&found](std::uint64_t, std::uint64_t, std::uint64_t value) { found = value; }))
    return std::nullopt;
  return found;
}

ByteString withTimestamp(std::string_view payload, std::uint32_t tag, std::uint64_t timestamp) {
  WireWriter value;
  value.writeUInt64(timestamp, WireWriter::kNoKey);
  std::string shifted;
  std::uint64_t copied = 0;
  forEachTimestamp(payload, tag, [&](std::uint64_t begin, std::uint64_t end, std::uint64_t) {
    shifted.append(payload.substr(copied, begin - copied)).append(value.bytes());
    copied = end;
  });
  shifted.append(payload.substr(copied));
  return ByteString(shifted);
}

}  // namespace

void shiftToNow(std::vector<RecordedEvent>& events, Date now) {
  std::optional<std::uint64_t> latest;
  for (const RecordedEvent& event : events)
    if (const auto timestamp = timestampOf(event)) latest = std::max(latest.value_or(0), *timestamp);
  if (!latest) return;
  const std::uint64_t nowMs = millisecondsSince1970(now);
  for (RecordedEvent& event : events) {
    const auto timestamp = timestampOf(event);
    if (!timestamp) continue;
    const std::uint64_t age = *latest - *timestamp;
    event.payload = withTimestamp(event.payload->view(), *timestampTag(event), nowMs - std::min(age, nowMs));
  }
}

}  // namespace quorl::simulator
