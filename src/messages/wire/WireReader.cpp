#include "messages/wire/WireReader.h"

#include <string>

#include <unicode/utf8.h>

#include "messages/wire/WireType.h"

namespace quorl {

namespace {

constexpr int kMaxVarintBytes = 10;

/// Length of the character that begins at `at`; 0 if it is ill-formed, with `at` behind the ill-formed sequence.
std::size_t nextCharacter(std::string_view text, std::size_t& at) {
  const auto* bytes = reinterpret_cast<const std::uint8_t*>(text.data());
  const std::size_t begin = at;
  UChar32 character = 0;
  U8_NEXT(bytes, at, text.size(), character);
  return character < 0 ? 0 : at - begin;
}

bool isWellFormed(std::string_view text) {
  for (std::size_t at = 0; at < text.size();) {
    if (static_cast<std::uint8_t>(text[at]) < 0x80)
      ++at;
    else if (nextCharacter(text, at) == 0)
      return false;
  }
  return true;
}

std::string repaired(std::string_view text) {
  std::string result;
  for (std::size_t at = 0; at < text.size();) {
    const std::size_t begin = at;
    const std::size_t size = nextCharacter(text, at);
    result += size == 0 ? std::string_view("\xEF\xBF\xBD") : text.substr(begin, size);
  }
  return result;
}

}  // namespace

std::uint64_t WireReader::readVarintByByte() {
  std::uint64_t value = 0;
  unsigned shift = 0;
  for (int i = 0; i < kMaxVarintBytes; ++i, shift += 7) {
    std::uint8_t byte = 0;
    if (pos >= length)
      error = true;
    else
      byte = bytes[pos++];
    value |= static_cast<std::uint64_t>(byte & 0x7FU) << shift;
    if (byte < 0x80) return error ? 0 : value;
  }
  return 0;
}

std::optional<ByteString> WireReader::readBytes() {
  std::uint64_t size = 0;
  if (!readLength(size)) return std::nullopt;
  std::optional<ByteString> result(std::in_place, view(size));
  pos += size;
  return result;
}

std::optional<Text> WireReader::readString() {
  std::uint64_t size = 0;
  if (!readLength(size)) return std::nullopt;
  const std::string_view text = view(size);
  pos += size;
  return isWellFormed(text) ? Text(text) : Text(repaired(text));
}

bool WireReader::skipBytes(std::uint64_t count) {
  if (count > length - pos) return false;
  pos += count;
  return true;
}

bool WireReader::skipValue(std::uint32_t tag, std::uint32_t wireType) {
  std::uint64_t size = 0;
  switch (wireType) {
    case wire_type::kVarint:
      readVarint();
      return !error;
    case wire_type::kFixed64:
      return skipBytes(8);
    case wire_type::kLengthDelimited:
      return readLength(size) && skipBytes(size);
    case wire_type::kStartGroup:
      return skipGroup(tag, 1);
    case wire_type::kFixed32:
      return skipBytes(4);
    default:
      return false;
  }
}

bool WireReader::skipGroup(std::uint32_t tag, int depth) {
  if (depth > kMaxGroupDepth) return false;
  while (pos < length) {
    const std::uint64_t key = readKey();
    if (error) return false;
    const auto innerTag = static_cast<std::uint32_t>(key >> 3U);
    const auto wireType = static_cast<std::uint32_t>(key & 7U);
    if (wireType == wire_type::kEndGroup) return innerTag == tag;
    if (wireType == wire_type::kStartGroup ? !skipGroup(innerTag, depth + 1) : !skipValue(innerTag, wireType))
      return false;
  }
  return false;
}

}  // namespace quorl
