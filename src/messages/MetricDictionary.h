#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include "base/SharedBytes.h"

namespace quorl {

struct MetricEntry;

/// A floating-point value. One that a rule computed stays a float in text ("10.0"); a decoded one that holds a whole
/// number counts as an integer.
struct MetricFloat {
  float value = 0;
  bool isComputed = false;
  friend bool operator==(const MetricFloat&, const MetricFloat&) = default;
};

/// A repeated scalar. `bits` hold each element sign- or zero-extended to 64 bits.
struct NumberList {
  std::vector<std::uint64_t> bits;
  bool isSigned = false;
  friend bool operator==(const NumberList&, const NumberList&) = default;
};

/// The decoded form of a message: a map from text key to one value, copied deeply. Keys and enumerator names that come
/// from the message tables are shared, not copied.
///
/// Entries are kept in the order in which they were set. `walkOrder` gives the order of every walk that writes rows.
/// Dictionaries are small, so look-up is linear. One thread at a time.
class MetricDictionary {
 public:
  MetricDictionary();
  MetricDictionary(const MetricDictionary&);
  MetricDictionary(MetricDictionary&&) noexcept;
  MetricDictionary& operator=(const MetricDictionary&);
  MetricDictionary& operator=(MetricDictionary&&) noexcept;
  ~MetricDictionary();

  std::size_t size() const;
  bool empty() const { return size() == 0; }
  void reserve(std::size_t count);

  /// Replaces the value of `key` in place; a new key goes to the end.
  template <typename Value>
  void set(Text key, Value&& value);
  template <typename Value>
  void set(std::string_view key, Value&& value);
  /// Appends without looking for `key`, which must be new: for those who build a dictionary from a table.
  template <typename Value>
  void append(Text key, Value&& value);
  /// Removes `key` if it is there.
  void remove(std::string_view key);

  /// Null when the key is missing. Valid until the dictionary changes.
  const struct MetricValue* find(std::string_view key) const;
  struct MetricValue* find(std::string_view key);
  // The value of `key` as `MetricValue` answers it under the same name; nothing when the key is missing.
  std::optional<std::int64_t> integer(std::string_view key) const;
  std::optional<std::int32_t> integer32(std::string_view key) const;
  std::optional<float> number(std::string_view key) const;

  /// In the order in which they were set.
  const std::vector<MetricEntry>& entries() const { return entries_; }
  std::vector<MetricEntry>& entries() { return entries_; }

  /// The order of a walk: entries that give a row first, then byte strings and number lists, then what ends the walk
  /// (sub-messages and non-empty lists of them, then empty lists and empty texts), each group in the order in which
  /// the entries were set. So the rule that a nested value ends the walk costs no plain attribute. The pointers are
  /// valid until the dictionary changes.
  std::vector<const MetricEntry*> walkOrder() const;

  /// Same keys with same values, whatever the order.
  friend bool operator==(const MetricDictionary& a, const MetricDictionary& b);

 private:
  struct MetricValue& slot(std::string_view key, const Text* shared);

  std::vector<MetricEntry> entries_;
};

using MetricDictionaryList = std::vector<MetricDictionary>;

/// One value of a metric dictionary.
struct MetricValue : std::variant<std::int64_t, std::uint64_t, bool, MetricFloat, Text, ByteString, MetricDictionary,
                                  MetricDictionaryList, NumberList> {
  using variant::variant;
  using variant::operator=;

  /// The value as integer: any integer or boolean that fits 64 signed bits, and a decoded float that holds a whole
  /// number. Nothing for every other kind.
  std::optional<std::int64_t> integer() const;
  /// As `integer`, if it fits 32 signed bits.
  std::optional<std::int32_t> integer32() const;
  /// Any number, as a 32-bit float. Nothing for every other kind.
  std::optional<float> number() const;
  /// Whether it passes the integer test, 64-bit unsigned values beyond the signed range included.
  bool isInteger() const;
  /// Decimal text of a value that passes the integer test; empty for every other.
  std::string integerText() const;

  template <typename T>
  const T* get() const {
    return std::get_if<T>(static_cast<const variant*>(this));
  }
  template <typename T>
  T* get() {
    return std::get_if<T>(static_cast<variant*>(this));
  }
};

struct MetricEntry {
  Text key;
  MetricValue value;
};

/// Shortest decimal text that reads back as the same 32-bit float; always with a fraction ("10.0", "-12.5").
std::string floatText(float value);

/// For log lines: "[timestamp: 1000, guti: [mmegi: 300]]" in the order in which entries were set.
std::string logText(const MetricDictionary& dictionary);
std::string logText(const MetricValue& value);

template <typename Value>
void MetricDictionary::set(Text key, Value&& value) {
  slot(key.view(), &key) = MetricValue(std::forward<Value>(value));
}

template <typename Value>
void MetricDictionary::set(std::string_view key, Value&& value) {
  slot(key, nullptr) = MetricValue(std::forward<Value>(value));
}

template <typename Value>
void MetricDictionary::append(Text key, Value&& value) {
  entries_.emplace_back(std::move(key), std::forward<Value>(value));
}

}  // namespace quorl
