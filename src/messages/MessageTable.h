#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

#include "base/SharedBytes.h"

namespace quorl {

class MetricCodable;
struct MessageTable;

/// How a field is stored, read and written.
enum class FieldKind : std::uint8_t {
  // Those of 32 bits first, then the other scalars: the reader tells them by their order.
  UInt32,
  Int32,
  Enumeration,
  SInt32,
  UInt64,
  Bool,
  Bytes,
  String,
  Message,
  RepeatedMessage,
  RepeatedUInt32,
  RepeatedUInt64,
  RepeatedSInt32,
};

/// An enumeration's names and values. Constant; any thread.
struct EnumTable {
  struct Entry {
    std::int32_t value;
    std::string_view name;
  };

  /// The enumerator's name, or "(unknown: %i)" with the value for an integer that is not a value of the enumeration.
  Text name(std::int32_t value) const {
    // Most enumerations have no gap, so that the value itself tells the place.
    const auto place = static_cast<std::size_t>(std::int64_t{value} - entries.front().value);
    if (place < entries.size() && entries[place].value == value) return Text::fromLiteral(entries[place].name);
    return nameBySearch(value);
  }
  /// The enumerator's value; the default for a name that is not in the enumeration.
  std::int32_t value(std::string_view name) const;

  std::span<const Entry> entries;  // ascending by value
  std::int32_t defaultValue;

 private:
  Text nameBySearch(std::int32_t value) const;
};

/// One field of a message class. Offsets are those of the members from the beginning of the message.
struct FieldEntry {
  std::uint32_t tag;
  std::uint32_t flag;  // bit in the word of presence flags at `flagOffset`; 0 for a kind without flag
  std::uint16_t flagOffset;
  std::uint16_t offset;
  FieldKind kind;
  bool isPacked;
  std::string_view key;
  const MessageTable* message;   // of a message field
  const EnumTable* enumeration;  // of an enumeration field
};

/// What the engine knows of a message class: its fields in the order in which they are written.
struct MessageTable {
  /// The field of a tag, or null.
  const FieldEntry* find(std::uint32_t tag) const {
    const std::size_t index = tag < indexByTag.size() ? indexByTag[tag] : 0;
    return index == 0 ? nullptr : &fields[index - 1];
  }

  std::size_t flagWords() const { return (flagCount + 31U) / 32U; }

  std::string_view className;
  std::span<const FieldEntry> fields;
  std::uint16_t flagOffset;  // of the words of presence flags, which stand in a row
  std::uint16_t flagCount;
  std::span<const std::uint8_t> indexByTag;  // index in `fields` plus one; 0 for a tag of no field
  bool acceptsMetricIdTags;                  // the reader does not refuse tags that are metric ids
  MetricCodable* (*make)();
};

/// The tables of all message classes, ascending by class name.
std::span<const MessageTable* const> allMessageTables();

}  // namespace quorl
