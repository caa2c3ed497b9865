#include "messages/wire/WireWriter.h"

#include "messages/wire/WireType.h"

namespace quorl {

namespace {

std::string_view encodeVarint(std::uint64_t value, char (&buffer)[10]) {
  std::size_t size = 0;
  for (; value >= 0x80; value >>= 7U) buffer[size++] = static_cast<char>((value & 0x7FU) | 0x80U);
  buffer[size++] = static_cast<char>(value);
  return {buffer, size};
}

}  // namespace

void WireWriter::key(std::uint32_t tag, std::uint32_t wireType) {
  if (tag != kNoKey) varint((std::uint64_t{tag} << 3U) | wireType);
}

void WireWriter::varint(std::uint64_t value) {
  char buffer[10];
  bytes_ += encodeVarint(value, buffer);
}

void WireWriter::writeUInt32(std::uint32_t value, std::uint32_t tag) {
  writeUInt64(value, tag);
}

void WireWriter::writeUInt64(std::uint64_t value, std::uint32_t tag) {
  key(tag, wire_type::kVarint);
  varint(value);
}

void WireWriter::writeInt32(std::int32_t value, std::uint32_t tag) {
  writeUInt64(static_cast<std::uint64_t>(std::int64_t{value}), tag);
}

void WireWriter::writeSInt32(std::int32_t value, std::uint32_t tag) {
  const std::uint32_t sign = value < 0 ? 0xFFFFFFFF : 0;
  writeUInt64((static_cast<std::uint32_t>(value) << 1U) ^ sign, tag);
}

void WireWriter::writeBool(bool value, std::uint32_t tag) {
  writeUInt64(value ? 1 : 0, tag);
}

void WireWriter::writeBytes(std::string_view value, std::uint32_t tag) {
  key(tag, wire_type::kLengthDelimited);
  varint(value.size());
  bytes_ += value;
}

WireWriter::Mark WireWriter::placeMark(std::uint32_t tag) {
  key(tag, wire_type::kLengthDelimited);
  return bytes_.size();
}

void WireWriter::recallMark(Mark mark) {
  char buffer[10];
  bytes_.insert(mark, encodeVarint(bytes_.size() - mark, buffer));
}

}  // namespace quorl
