#include <limits>

#include <gtest/gtest.h>

#include "messages/Wire.h"
#include "messages/wire/WireWriter.h"

namespace quorl {
namespace {

using test::hex;

constexpr std::int32_t kMin = std::numeric_limits<std::int32_t>::min();

TEST(WireWriterTest, EachKindWritesKeyAndValue) {
  WireWriter writer;
  writer.writeUInt32(300, 1);
  writer.writeUInt64(std::numeric_limits<std::uint64_t>::max(), 2);
  writer.writeInt32(-1, 3);
  writer.writeSInt32(-1, 4);
  writer.writeBool(true, 5);
  writer.writeBytes(std::string_view("\x00\xFF", 2), 6);
  writer.writeString("ab", 16);
  EXPECT_EQ(hex(writer.bytes()),
            "08 AC 02 "
            "10 FF FF FF FF FF FF FF FF FF 01 "
            "18 FF FF FF FF FF FF FF FF FF 01 "
            "20 01 "
            "28 01 "
            "32 02 00 FF "
            "82 01 02 61 62");
}

TEST(WireWriterTest, SmallestSignedValues) {
  WireWriter writer;
  writer.writeSInt32(kMin, 1);
  writer.writeInt32(kMin, 2);
  EXPECT_EQ(hex(writer.bytes()), "08 FF FF FF FF 0F 10 80 80 80 80 F8 FF FF FF FF 01");
}

TEST(WireWriterTest, AllOnesTagWritesTheBareValue) {
  WireWriter writer;
  writer.writeUInt32(1, WireWriter::kNoKey);
  writer.writeUInt64(2, WireWriter::kNoKey);
  writer.writeInt32(3, WireWriter::kNoKey);
  writer.writeSInt32(4, WireWriter::kNoKey);
  writer.writeBool(false, WireWriter::kNoKey);
  writer.writeBytes("a", WireWriter::kNoKey);
  EXPECT_EQ(hex(writer.bytes()), "01 02 03 08 00 01 61");
}

TEST(WireWriterTest, RecallingFillsInTheLength) {
  WireWriter writer;
  const auto mark = writer.placeMark(2);
  writer.writeUInt32(1, 1);
  writer.recallMark(mark);
  writer.writeUInt32(7, 3);
  EXPECT_EQ(hex(writer.bytes()), "12 02 08 01 18 07");
}

TEST(WireWriterTest, AnEmptyMarkedValueHasLengthZero) {
  WireWriter writer;
  writer.recallMark(writer.placeMark(2));
  EXPECT_EQ(hex(writer.bytes()), "12 00");
}

TEST(WireWriterTest, MarksNestAndLengthsMayTakeTwoBytes) {
  WireWriter writer;
  const auto outer = writer.placeMark(1);
  const auto inner = writer.placeMark(2);
  writer.writeBytes(std::string(130, 'x'), WireWriter::kNoKey);
  writer.recallMark(inner);
  writer.recallMark(outer);
  // 130 bytes behind their own length of two bytes, then the two marks.
  EXPECT_EQ(hex(writer.bytes()).substr(0, 23), "0A 87 01 12 84 01 82 01");
  EXPECT_EQ(writer.bytes().size(), 3U + 3U + 2U + 130U);
}

}  // namespace
}  // namespace quorl
