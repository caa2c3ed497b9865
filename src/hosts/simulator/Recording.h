#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <istream>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <tl/expected.hpp>

#include "platform/KeyValueMessage.h"

namespace quorl::simulator {

/// One metric event of a recording. Every key may be missing, as it may on the channel.
struct RecordedEvent {
  std::optional<std::int64_t> metricID;
  std::optional<ByteString> payload;
  std::optional<std::int64_t> triggerRef;
  std::optional<std::int64_t> profileID;
  std::optional<std::int64_t> appID;
  std::optional<std::uint64_t> atMs;  // time since the start of the recording, in milliseconds; not on the channel

  /// The event as the baseband manager delivers it: the keys that are there, and no others.
  zelkor::KeyValueMessage message() const;

  friend bool operator==(const RecordedEvent&, const RecordedEvent&) = default;
};

/// Reads one line. The error says in a few words why the line is no event.
tl::expected<RecordedEvent, std::string> parseRecordingLine(std::string_view line);

/// The event as one line, without its line break.
std::string recordingLine(const RecordedEvent& event);

/// A line that is no event.
struct RecordingFault {
  std::size_t line = 0;  // counted from 1
  std::string reason;
};

/// A recording, read whole: its events in order, and the lines that were left out.
struct Recording {
  std::vector<RecordedEvent> events;
  std::vector<RecordingFault> faults;
};

/// Reads to the end of `input`; a line that is no event is left out and the rest goes on.
Recording readRecording(std::istream& input);
/// The error says why the file cannot be read.
tl::expected<Recording, std::string> readRecording(const std::filesystem::path& file);

}  // namespace quorl::simulator
