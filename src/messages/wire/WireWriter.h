#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

namespace quorl {

/// Builds a payload in the Protocol Buffers wire format. Each write takes a value and its tag; `kNoKey` as tag writes
/// the bare value with no key. One thread.
class WireWriter {
 public:
  /// Where an open length-delimited value begins.
  using Mark = std::size_t;
  static constexpr std::uint32_t kNoKey = 0xFFFFFFFF;

  void writeUInt32(std::uint32_t value, std::uint32_t tag);
  void writeUInt64(std::uint64_t value, std::uint32_t tag);
  /// Plain: a negative value takes ten bytes.
  void writeInt32(std::int32_t value, std::uint32_t tag);
  /// Zigzag.
  void writeSInt32(std::int32_t value, std::uint32_t tag);
  void writeBool(bool value, std::uint32_t tag);
  void writeBytes(std::string_view value, std::uint32_t tag);
  void writeString(std::string_view value, std::uint32_t tag) { writeBytes(value, tag); }

  /// Opens a length-delimited value; `recallMark` closes it and fills in its length. Marks nest.
  Mark placeMark(std::uint32_t tag);
  void recallMark(Mark mark);

  const std::string& bytes() const { return bytes_; }
  std::string take() { return std::move(bytes_); }

 private:
  void key(std::uint32_t tag, std::uint32_t wireType);
  void varint(std::uint64_t value);

  std::string bytes_;
};

}  // namespace quorl
