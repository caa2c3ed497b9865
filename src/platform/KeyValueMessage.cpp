#include "platform/KeyValueMessage.h"

#include <algorithm>

#include <fmt/format.h>

namespace quorl::zelkor {

void KeyValueMessage::set(std::string_view key, KeyValue value) {
  const auto found = std::find_if(entries_.begin(), entries_.end(), [&](const Entry& e) { return e.first == key; });
  if (found != entries_.end()) {
    found->second = std::move(value);
  } else {
    entries_.emplace_back(std::string(key), std::move(value));
  }
}

const KeyValue* KeyValueMessage::find(std::string_view key) const {
  const auto found = std::find_if(entries_.begin(), entries_.end(), [&](const Entry& e) { return e.first == key; });
  return found == entries_.end() ? nullptr : &found->second;
}

std::optional<std::int64_t> KeyValueMessage::integer(std::string_view key) const {
  const KeyValue* value = find(key);
  if (value == nullptr) return std::nullopt;
  const auto* number = std::get_if<std::int64_t>(value);
  return number == nullptr ? std::nullopt : std::optional(*number);
}

std::optional<ByteString> KeyValueMessage::bytes(std::string_view key) const {
  const KeyValue* value = find(key);
  if (value == nullptr) return std::nullopt;
  const auto* bytes = std::get_if<ByteString>(value);
  return bytes == nullptr ? std::nullopt : std::optional(*bytes);
}

std::string logText(const KeyValueMessage& message) {
  std::string text = "{";
  for (const auto& [key, value] : message.entries()) {
    if (text.size() > 1) text += "; ";
    text += key;
    text += " = ";
    if (const auto* number = std::get_if<std::int64_t>(&value)) {
      text += fmt::format("{}", *number);
    } else if (const auto* bytes = std::get_if<ByteString>(&value)) {
      text += fmt::format("<{} bytes>", bytes->size());
    } else {
      text += "null";
    }
  }
  return text + "}";
}

}  // namespace quorl::zelkor
