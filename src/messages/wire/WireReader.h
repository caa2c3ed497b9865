#pragma once

#include <bit>
#include <cstdint>
#include <cstring>
#include <optional>
#include <string_view>

#include "base/SharedBytes.h"

namespace quorl {

/// A payload being read in the Protocol Buffers wire format.
///
/// A failed read sets `error` and answers 0 or nothing; nothing throws, and no byte at or past `length` is touched.
/// Does not own the bytes. One thread.
class WireReader {
 public:
  explicit WireReader(std::string_view payload)
      : bytes(reinterpret_cast<const std::uint8_t*>(payload.data())),
        length(payload.size()),
        wideReadLimit_(payload.size() < kWord ? 0 : payload.size() - kWord + 1) {}

  /// A varint of at most ten bytes. One that runs into the end sets `error` and reads as 0. Of one whose tenth byte
  /// still has its top bit set, ten bytes are used up and the result is 0, which is no error.
  std::uint64_t readVarint() {
    // Eight bytes at once without a branch on the varint's length, which no processor can foresee.
    if (std::endian::native == std::endian::little && pos < wideReadLimit_ && !error) {
      std::uint64_t word = 0;
      std::memcpy(&word, bytes + pos, kWord);
      const std::uint64_t ends = ~word & 0x8080808080808080U;
      const auto end = pos + static_cast<std::uint64_t>(std::countr_zero(ends)) / 8 + 1;
      if (ends != 0 && end <= length) {
        pos = end;
        return joinSevenBitGroups(word & (ends ^ (ends - 1)));
      }
    }
    return readVarintByByte();
  }
  /// As `readVarint`; faster for keys, most of which are one byte.
  std::uint64_t readKey() {
    if (pos < length && bytes[pos] < 0x80 && !error) return bytes[pos++];
    return readVarint();
  }
  std::int32_t readZigZag32() { return decodeZigZag(static_cast<std::uint32_t>(readVarint())); }
  static std::int32_t decodeZigZag(std::uint32_t value) {
    return static_cast<std::int32_t>((value >> 1U) ^ (0U - (value & 1U)));
  }

  /// A length-delimited byte string; nothing, with `error` set, when it does not fit.
  std::optional<ByteString> readBytes();
  /// The same as UTF-8 text. Each ill-formed sequence reads as U+FFFD, so that a text is always well-formed.
  std::optional<Text> readString();

  /// Reads a length and narrows `length` to the end of that length-delimited value; `mark` keeps what it was. False,
  /// with `length` left alone, if the value does not fit.
  bool placeMark(std::uint64_t& mark) {
    std::uint64_t size = 0;
    if (!readLength(size)) return false;
    mark = length;
    length = pos + size;
    return true;
  }
  /// Ends what `placeMark` began. `pos` stays where the reading of the value ended.
  void recallMark(std::uint64_t mark) { length = mark; }

  /// Moves past one value. False if it cannot: a truncated value, wire types 6 and 7, an end of a group without its
  /// start, a group with the wrong end or groups nested deeper than `kMaxGroupDepth`.
  bool skipValue(std::uint32_t tag, std::uint32_t wireType);

  static constexpr int kMaxGroupDepth = 100;

  const std::uint8_t* bytes;
  std::uint64_t pos = 0;
  std::uint64_t length;
  bool error = false;

 private:
  static constexpr std::uint64_t kWord = 8;

  /// The low seven bits of each byte, the first byte lowest.
  static std::uint64_t joinSevenBitGroups(std::uint64_t word) {
    word &= 0x7F7F7F7F7F7F7F7FU;
    word = (word & 0x007F007F007F007FU) | ((word & 0x7F007F007F007F00U) >> 1U);
    word = (word & 0x00003FFF00003FFFU) | ((word & 0x3FFF00003FFF0000U) >> 2U);
    return (word & 0x000000000FFFFFFFU) | ((word & 0x0FFFFFFF00000000U) >> 4U);
  }
  std::uint64_t readVarintByByte();
  /// False, with `error` set, if no length can be read or the value does not end at or before `length`.
  bool readLength(std::uint64_t& size) {
    size = readVarint();
    if (error) return false;
    if (size > length - pos) error = true;
    return !error;
  }
  std::string_view view(std::uint64_t size) const { return {reinterpret_cast<const char*>(bytes) + pos, size}; }
  bool skipBytes(std::uint64_t count);
  bool skipGroup(std::uint32_t tag, int depth);

  const std::uint64_t wideReadLimit_;  // below it, eight bytes of the payload can be read at once
};

}  // namespace quorl
