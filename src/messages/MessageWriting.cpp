#include <bit>

#include <fmt/format.h>

#include "messages/MessageFields.h"
#include "messages/MetricCodable.h"
#include "messages/wire/WireWriter.h"

namespace quorl {

using fields::hasFlag;
using fields::member;

namespace {

template <typename T, typename Write>
void writeList(WireWriter& writer, const ListRecord<T>& list, const FieldEntry& field, Write write) {
  if (!field.isPacked) {
    for (std::uint64_t i = 0; i < list.count; ++i) write(list.list[i], field.tag);
  } else if (list.count > 0) {
    const WireWriter::Mark mark = writer.placeMark(field.tag);
    for (std::uint64_t i = 0; i < list.count; ++i) write(list.list[i], WireWriter::kNoKey);
    writer.recallMark(mark);
  }
}

void writeSubMessage(WireWriter& writer, const MetricCodable& message, std::uint32_t tag) {
  const WireWriter::Mark mark = writer.placeMark(tag);
  message.writeTo(writer);
  writer.recallMark(mark);
}

/// For a scalar with a clear flag nothing is to be written; every other kind tells by its member.
bool isAbsentScalar(const MetricCodable& message, const FieldEntry& field) {
  return field.flag != 0 && !hasFlag(message, field);
}

/// The number of present scalars and of all other fields.
std::size_t countPossibleEntries(const MetricCodable& message, const MessageTable& table) {
  std::size_t count = table.fields.size() - table.flagCount;
  for (std::size_t i = 0; i < table.flagWords(); ++i)
    count += static_cast<std::size_t>(
        std::popcount(member<std::uint32_t>(message, table.flagOffset + i * sizeof(std::uint32_t))));
  return count;
}

}  // namespace

void MetricCodable::writeTo(WireWriter& writer) const {
  for (const FieldEntry& field : table().fields) {
    if (isAbsentScalar(*this, field)) continue;
    const std::size_t offset = field.offset;
    const std::uint32_t tag = field.tag;
    switch (field.kind) {
      case FieldKind::UInt32:
        writer.writeUInt32(member<std::uint32_t>(*this, offset), tag);
        break;
      case FieldKind::UInt64:
        writer.writeUInt64(member<std::uint64_t>(*this, offset), tag);
        break;
      case FieldKind::Int32:
      case FieldKind::Enumeration:
        writer.writeInt32(member<std::int32_t>(*this, offset), tag);
        break;
      case FieldKind::SInt32:
        writer.writeSInt32(member<std::int32_t>(*this, offset), tag);
        break;
      case FieldKind::Bool:
        writer.writeBool(member<bool>(*this, offset), tag);
        break;
      case FieldKind::Bytes:
        if (const auto& bytes = member<std::optional<ByteString>>(*this, offset)) writer.writeBytes(bytes->view(), tag);
        break;
      case FieldKind::String:
        if (const auto& text = member<std::optional<Text>>(*this, offset)) writer.writeString(text->view(), tag);
        break;
      case FieldKind::Message:
        if (const auto& child = member<AnyMessageRef>(*this, offset)) writeSubMessage(writer, *child.message(), tag);
        break;
      case FieldKind::RepeatedMessage: {
        const auto& array = member<AnyMessageArray>(*this, offset);
        for (std::size_t i = 0; i < array.count(); ++i)
          writeSubMessage(writer, *array.elementAtIndex(i).message(), tag);
        break;
      }
      case FieldKind::RepeatedUInt32:
        writeList(writer, member<UInt32List>(*this, offset), field,
                  [&](std::uint32_t value, std::uint32_t key) { writer.writeUInt32(value, key); });
        break;
      case FieldKind::RepeatedUInt64:
        writeList(writer, member<UInt64List>(*this, offset), field,
                  [&](std::uint64_t value, std::uint32_t key) { writer.writeUInt64(value, key); });
        break;
      case FieldKind::RepeatedSInt32:
        writeList(writer, member<SInt32List>(*this, offset), field,
                  [&](std::int32_t value, std::uint32_t key) { writer.writeSInt32(value, key); });
        break;
    }
  }
}

std::optional<MetricDictionary> MetricCodable::dictionaryRepresentation() const {
  if (!isReadWhole_) return std::nullopt;
  std::optional<MetricDictionary> dictionary(std::in_place);
  represent(*dictionary, table());
  return dictionary;
}

void MetricCodable::represent(MetricDictionary& dictionary, const MessageTable& table) const {
  dictionary.reserve(countPossibleEntries(*this, table));
  for (const FieldEntry& field : table.fields) {
    if (isAbsentScalar(*this, field)) continue;
    const std::size_t offset = field.offset;
    const Text key = Text::fromLiteral(field.key);
    switch (field.kind) {
      case FieldKind::UInt32:
        dictionary.append(key, std::uint64_t{member<std::uint32_t>(*this, offset)});
        break;
      case FieldKind::UInt64:
        dictionary.append(key, member<std::uint64_t>(*this, offset));
        break;
      case FieldKind::Int32:
      case FieldKind::SInt32:
        dictionary.append(key, std::int64_t{member<std::int32_t>(*this, offset)});
        break;
      case FieldKind::Bool:
        dictionary.append(key, member<bool>(*this, offset));
        break;
      case FieldKind::Enumeration:
        dictionary.append(key, field.enumeration->name(member<std::int32_t>(*this, offset)));
        break;
      case FieldKind::Bytes:
        if (const auto& bytes = member<std::optional<ByteString>>(*this, offset)) dictionary.append(key, *bytes);
        break;
      case FieldKind::String:
        if (const auto& text = member<std::optional<Text>>(*this, offset)) dictionary.append(key, *text);
        break;
      case FieldKind::Message:
        if (const auto& child = member<AnyMessageRef>(*this, offset)) {
          MetricDictionary inner;
          child.message()->represent(inner, *field.message);
          dictionary.append(key, std::move(inner));
        }
        break;
      case FieldKind::RepeatedMessage: {
        const auto& array = member<AnyMessageArray>(*this, offset);
        if (array.count() == 0) break;
        MetricDictionaryList list(array.count());
        for (std::size_t i = 0; i < list.size(); ++i)
          array.elementAtIndex(i).message()->represent(list[i], *field.message);
        dictionary.append(key, std::move(list));
        break;
      }
      case FieldKind::RepeatedUInt32:
        dictionary.append(key, numbers(member<UInt32List>(*this, offset)));
        break;
      case FieldKind::RepeatedUInt64:
        dictionary.append(key, numbers(member<UInt64List>(*this, offset)));
        break;
      case FieldKind::RepeatedSInt32:
        dictionary.append(key, numbers(member<SInt32List>(*this, offset)));
        break;
    }
  }
}

std::string MetricCodable::description() const {
  const std::optional<MetricDictionary> dictionary = dictionaryRepresentation();
  return fmt::format("<{}> {}", table().className, dictionary ? logText(*dictionary) : "(null)");
}

}  // namespace quorl
