#include "hosts/simulator/Recording.h"

#include <cerrno>
#include <fstream>
#include <system_error>
#include <utility>

#include <fmt/format.h>
#include <nlohmann/json.hpp>

#include "hosts/simulator/Base64.h"
#include "hosts/simulator/JsonNumber.h"
#include "platform/ZelkorClient.h"

namespace quorl::simulator {
namespace {

using OrderedJson = nlohmann::ordered_json;

constexpr std::string_view kAtMs = "atMs";

std::optional<ByteString> payloadBytes(const OrderedJson& value) {
  if (!value.is_string()) return std::nullopt;
  const auto bytes = base64Bytes(value.get_ref<const std::string&>());
  return bytes ? std::optional(ByteString(*bytes)) : std::nullopt;
}

std::optional<std::int64_t>* integerSlot(RecordedEvent& event, std::string_view key) {
  if (key == zelkor::kKeyMetricID) return &event.metricID;
  if (key == zelkor::kKeyTriggerRef) return &event.triggerRef;
  if (key == zelkor::kKeyProfileID) return &event.profileID;
  if (key == zelkor::kKeyAppID) return &event.appID;
  return nullptr;
}

/// Takes one entry into the event. The answer says what is wrong with it, if anything is.
std::optional<std::string> take(RecordedEvent& event, const std::string& key, const OrderedJson& value) {
  if (std::optional<std::int64_t>* slot = integerSlot(event, key)) {
    *slot = integer(value);
    if (!*slot) return fmt::format("{} is no integer of 64 bits", key);
  } else if (key == zelkor::kKeyPayload) {
    event.payload = payloadBytes(value);
    if (!event.payload) return fmt::format("{} is no base64 text", key);
  } else if (key == kAtMs) {
    if (!value.is_number_unsigned()) return fmt::format("{} is no whole number of milliseconds", key);
    event.atMs = value.get<std::uint64_t>();
  } else {
    return fmt::format("there is no key \"{}\"", key);
  }
  return std::nullopt;
}

void setIfThere(zelkor::KeyValueMessage& message, std::string_view key, const std::optional<std::int64_t>& value) {
  if (value) message.set(key, *value);
}

}  // namespace

zelkor::KeyValueMessage RecordedEvent::message() const {
  zelkor::KeyValueMessage message;
  setIfThere(message, zelkor::kKeyTriggerRef, triggerRef);
  setIfThere(message, zelkor::kKeyProfileID, profileID);
  setIfThere(message, zelkor::kKeyAppID, appID);
  setIfThere(message, zelkor::kKeyMetricID, metricID);
  if (payload) message.set(zelkor::kKeyPayload, *payload);
  return message;
}

tl::expected<RecordedEvent, std::string> parseRecordingLine(std::string_view line) {
  const OrderedJson object = OrderedJson::parse(line.begin(), line.end(), nullptr, /*allow_exceptions=*/false);
  if (object.is_discarded()) return tl::unexpected(std::string("not JSON"));
  if (!object.is_object()) return tl::unexpected(std::string("no JSON object"));
  RecordedEvent event;
  for (const auto& [key, value] : object.items())
    if (auto fault = take(event, key, value)) return tl::unexpected(*std::move(fault));
  return event;
}

std::string recordingLine(const RecordedEvent& event) {
  OrderedJson object = OrderedJson::object();
  const auto put = [&object](std::string_view key, const auto& value) {
    if (value) object[std::string(key)] = *value;
  };
  put(kAtMs, event.atMs);
  put(zelkor::kKeyMetricID, event.metricID);
  if (event.payload) object[std::string(zelkor::kKeyPayload)] = base64Text(event.payload->view());
  put(zelkor::kKeyTriggerRef, event.triggerRef);
  put(zelkor::kKeyProfileID, event.profileID);
  put(zelkor::kKeyAppID, event.appID);
  return object.dump();
}

Recording readRecording(std::istream& input) {
  Recording recording;
  std::string line;
  for (std::size_t number = 1; std::getline(input, line); ++number) {
    if (auto event = parseRecordingLine(line)) {
      recording.events.push_back(*std::move(event));
    } else {
      recording.faults.push_back({number, std::move(event.error())});
    }
  }
  return recording;
}

tl::expected<Recording, std::string> readRecording(const std::filesystem::path& file) {
  std::error_code error;
  if (std::filesystem::is_directory(file, error)) return tl::unexpected(std::string("is a directory"));
  errno = 0;
  std::ifstream input(file, std::ios::binary);
  if (!input) return tl::unexpected(std::generic_category().message(errno != 0 ? errno : ENOENT));
  Recording recording = readRecording(input);
  if (input.bad()) return tl::unexpected(std::string("cannot be read to its end"));
  return recording;
}

}  // namespace quorl::simulator
