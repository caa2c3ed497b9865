#pragma once

#include <cstddef>
#include <optional>

#include "base/SharedBytes.h"
#include "messages/MessageRef.h"
#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"
#include "messages/wire/ListRecord.h"

// How the engine reaches the members of a message by its field table. For the engine only.
namespace quorl::fields {

template <typename T>
T& member(MetricCodable& message, std::size_t offset) {
  return *reinterpret_cast<T*>(reinterpret_cast<std::byte*>(&message) + offset);
}
template <typename T>
const T& member(const MetricCodable& message, std::size_t offset) {
  return *reinterpret_cast<const T*>(reinterpret_cast<const std::byte*>(&message) + offset);
}

inline bool hasFlag(const MetricCodable& message, const FieldEntry& field) {
  return (member<std::uint32_t>(message, field.flagOffset) & field.flag) != 0;
}
inline void setFlag(MetricCodable& message, const FieldEntry& field) {
  member<std::uint32_t>(message, field.flagOffset) |= field.flag;
}

/// Calls `visit` with the member of `field` in each of `messages`, as its stored type. Enumerations and both signed
/// kinds are std::int32_t.
template <typename Visit, typename... Messages>
decltype(auto) visitMember(const FieldEntry& field, Visit&& visit, Messages&... messages) {
  switch (field.kind) {
    case FieldKind::UInt32:
      return visit(member<std::uint32_t>(messages, field.offset)...);
    case FieldKind::UInt64:
      return visit(member<std::uint64_t>(messages, field.offset)...);
    case FieldKind::Int32:
    case FieldKind::SInt32:
    case FieldKind::Enumeration:
      return visit(member<std::int32_t>(messages, field.offset)...);
    case FieldKind::Bool:
      return visit(member<bool>(messages, field.offset)...);
    case FieldKind::Bytes:
      return visit(member<std::optional<ByteString>>(messages, field.offset)...);
    case FieldKind::String:
      return visit(member<std::optional<Text>>(messages, field.offset)...);
    case FieldKind::Message:
      return visit(member<AnyMessageRef>(messages, field.offset)...);
    case FieldKind::RepeatedMessage:
      return visit(member<AnyMessageArray>(messages, field.offset)...);
    case FieldKind::RepeatedUInt32:
      return visit(member<UInt32List>(messages, field.offset)...);
    case FieldKind::RepeatedUInt64:
      return visit(member<UInt64List>(messages, field.offset)...);
    case FieldKind::RepeatedSInt32:
      return visit(member<SInt32List>(messages, field.offset)...);
  }
  __builtin_unreachable();
}

}  // namespace quorl::fields
