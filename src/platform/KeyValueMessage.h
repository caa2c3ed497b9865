#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include "base/SharedBytes.h"

namespace quorl::zelkor {

/// What a key of a key-value message holds. The null value stands where a value could not be made.
using KeyValue = std::variant<std::monostate, std::int64_t, ByteString>;

/// The form of everything exchanged with the baseband manager: text keys, each with a signed 64-bit integer or a byte
/// string, in the order in which they were set. Messages have a handful of keys, so look-up is linear.
class KeyValueMessage {
 public:
  using Entry = std::pair<std::string, KeyValue>;

  /// Replaces the value of a key in place; a new key goes to the end.
  void set(std::string_view key, KeyValue value);
  /// Null when the key is missing.
  const KeyValue* find(std::string_view key) const;
  /// Nothing when the key is missing or is no integer.
  std::optional<std::int64_t> integer(std::string_view key) const;
  /// Nothing when the key is missing or is no byte string.
  std::optional<ByteString> bytes(std::string_view key) const;

  const std::vector<Entry>& entries() const { return entries_; }

  friend bool operator==(const KeyValueMessage&, const KeyValueMessage&) = default;

 private:
  std::vector<Entry> entries_;
};

/// "{kKeyMetricID = 806915; kKeyPayload = <12 bytes>}": lengths instead of contents, since payloads can be large and
/// carry identities.
std::string logText(const KeyValueMessage& message);

}  // namespace quorl::zelkor
