#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "base/SharedBytes.h"

namespace quorl::test {

/// Writes a metric's payload field by field in the wire format.
class Payload {
 public:
  Payload& number(std::uint32_t tag, std::uint64_t value) {
    key(tag, 0);
    varint(value);
    return *this;
  }
  /// Zigzag form.
  Payload& signedNumber(std::uint32_t tag, std::int64_t value) {
    return number(tag, (static_cast<std::uint64_t>(value) << 1) ^ static_cast<std::uint64_t>(value >> 63));
  }
  /// Plain form, in which a negative number takes ten bytes.
  Payload& plainNumber(std::uint32_t tag, std::int64_t value) { return number(tag, static_cast<std::uint64_t>(value)); }
  Payload& bytes(std::uint32_t tag, std::string_view value) {
    key(tag, 2);
    varint(value.size());
    raw(value);
    return *this;
  }
  Payload& message(std::uint32_t tag, const Payload& child) { return bytes(tag, child.data_); }

  Payload& key(std::uint32_t tag, std::uint32_t wireType) {
    varint((std::uint64_t{tag} << 3) | wireType);
    return *this;
  }
  Payload& varint(std::uint64_t value) {
    for (; value >= 0x80; value >>= 7) data_ += static_cast<char>((value & 0x7F) | 0x80);
    data_ += static_cast<char>(value);
    return *this;
  }
  Payload& raw(std::string_view bytes) {
    data_ += bytes;
    return *this;
  }

  const std::string& data() const { return data_; }

 private:
  std::string data_;
};

}  // namespace quorl::test
