#include <utility>

#include "base/Log.h"
#include "messages/KBBMetricUtility.h"
#include "messages/MessageFields.h"
#include "messages/wire/WireReader.h"
#include "messages/wire/WireType.h"

namespace quorl {

namespace {

constexpr Logger logger{"metric-related"};

using fields::member;
using fields::setFlag;

template <typename T, typename Read>
bool readList(WireReader& reader, ListRecord<T>& list, std::uint64_t wireType, Read read) {
  if (wireType != wire_type::kLengthDelimited) {
    list.add(read());
    return true;
  }
  std::uint64_t mark = 0;
  if (!reader.placeMark(mark)) return false;
  while (reader.pos < reader.length && !reader.error) list.add(read());
  reader.recallMark(mark);
  return true;
}

bool isScalar(FieldKind kind) {
  return kind <= FieldKind::Bool;
}

/// Stores a varint in the member of a scalar field.
void storeScalar(MetricCodable& message, const FieldEntry& field, std::uint64_t value) {
  if (field.kind <= FieldKind::SInt32) {
    // One store for all kinds of 32 bits; enumerations keep a value that they do not have.
    const auto low = static_cast<std::uint32_t>(value);
    const auto zigZag = static_cast<std::uint32_t>(WireReader::decodeZigZag(low));
    member<std::uint32_t>(message, field.offset) = field.kind == FieldKind::SInt32 ? zigZag : low;
  } else if (field.kind == FieldKind::UInt64) {
    member<std::uint64_t>(message, field.offset) = value;
  } else {
    member<bool>(message, field.offset) = value != 0;
  }
}

}  // namespace

void MetricCodable::initWithData(const std::optional<ByteString>& payload) {
  WireReader reader(payload ? payload->view() : std::string_view{});
  readFields(reader, table());
}

bool MetricCodable::readFrom(WireReader& reader) {
  return readFields(reader, table());
}

bool MetricCodable::readFields(WireReader& reader, const MessageTable& table) {
  bool canGoOn = true;
  while (reader.pos < reader.length) {
    if (reader.error) break;
    const std::uint64_t key = reader.readKey();
    const std::uint64_t wireType = key & 7U;
    if (reader.error || wireType == wire_type::kEndGroup) break;
    const auto tag = static_cast<std::uint32_t>(key >> 3U);
    const FieldEntry* field = table.find(tag);
    // The wire type is not compared with the field's.
    if (field != nullptr && isScalar(field->kind)) {
      // First the flag: a scalar counts as present even if its value cannot be read.
      setFlag(*this, *field);
      storeScalar(*this, *field, reader.readVarint());
    } else if (field != nullptr) {
      canGoOn = readField(reader, *field, wireType);
    } else if (!table.acceptsMetricIdTags && KBBMetricUtility::isValidMetricIdTag(tag, table)) {
      const auto value = static_cast<std::uint32_t>(reader.readVarint());
      logger.log("Unknown tag: %x:%u", tag, value);
    } else {
      canGoOn = reader.skipValue(tag, static_cast<std::uint32_t>(wireType));
    }
    if (!canGoOn) break;
  }
  if (canGoOn && !reader.error) return true;
  isReadWhole_ = false;
  return false;
}

bool MetricCodable::readField(WireReader& reader, const FieldEntry& field, std::uint64_t wireType) {
  const std::size_t offset = field.offset;
  switch (field.kind) {
    case FieldKind::UInt32:
    case FieldKind::Int32:
    case FieldKind::Enumeration:
    case FieldKind::SInt32:
    case FieldKind::UInt64:
    case FieldKind::Bool:
      break;  // read in place by the loop
    case FieldKind::Bytes:
      member<std::optional<ByteString>>(*this, offset) = reader.readBytes();
      return true;
    case FieldKind::String:
      member<std::optional<Text>>(*this, offset) = reader.readString();
      return true;
    case FieldKind::Message: {
      auto& child = member<AnyMessageRef>(*this, offset);
      child = AnyMessageRef(std::unique_ptr<MetricCodable>(field.message->make()));
      return readChild(reader, *child.message(), *field.message);
    }
    case FieldKind::RepeatedMessage: {
      MetricCodable& child = member<AnyMessageArray>(*this, offset)
                                 .addElement(AnyMessageRef(std::unique_ptr<MetricCodable>(field.message->make())));
      return readChild(reader, child, *field.message);
    }
    case FieldKind::RepeatedUInt32:
      return readList(reader, member<UInt32List>(*this, offset), wireType,
                      [&] { return static_cast<std::uint32_t>(reader.readVarint()); });
    case FieldKind::RepeatedUInt64:
      return readList(reader, member<UInt64List>(*this, offset), wireType, [&] { return reader.readVarint(); });
    case FieldKind::RepeatedSInt32:
      return readList(reader, member<SInt32List>(*this, offset), wireType, [&] { return reader.readZigZag32(); });
  }
  return false;
}

bool MetricCodable::readChild(WireReader& reader, MetricCodable& child, const MessageTable& table) {
  std::uint64_t mark = 0;
  // After a failure the reader's length stays narrowed; nobody reads on.
  if (!reader.placeMark(mark) || !child.readFields(reader, table)) return false;
  reader.recallMark(mark);
  return true;
}

}  // namespace quorl
