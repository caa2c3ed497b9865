#include <limits>
#include <string>

#include <gtest/gtest.h>

#include "messages/Wire.h"
#include "messages/wire/WireReader.h"

namespace quorl {
namespace {

using test::bytes;

/// A reader with the bytes it reads.
struct Payload {
  explicit Payload(std::string_view hex) : content(bytes(hex)), reader(content) {}
  std::string content;
  WireReader reader;
};

TEST(WireReaderTest, VarintOfOneByte) {
  Payload payload("05");
  EXPECT_EQ(payload.reader.readVarint(), 5U);
  EXPECT_EQ(payload.reader.pos, 1U);
  EXPECT_FALSE(payload.reader.error);
}

TEST(WireReaderTest, VarintWithTheLargestValueTakesTenBytes) {
  Payload payload("FF FF FF FF FF FF FF FF FF 01");
  EXPECT_EQ(payload.reader.readVarint(), std::numeric_limits<std::uint64_t>::max());
  EXPECT_EQ(payload.reader.pos, 10U);
}

TEST(WireReaderTest, TenthByteGivesOnlyItsLowestBit) {
  Payload payload("80 80 80 80 80 80 80 80 80 03");
  EXPECT_EQ(payload.reader.readVarint(), std::uint64_t{1} << 63U);
}

TEST(WireReaderTest, VarintOfTheSameValueInMoreBytesThanNeeded) {
  Payload payload("85 80 00");
  EXPECT_EQ(payload.reader.readVarint(), 5U);
  EXPECT_EQ(payload.reader.pos, 3U);
}

TEST(WireReaderTest, VarintThatRunsIntoTheEndReadsAsZeroWithError) {
  for (const char* hex : {"", "80", "FF FF", "FF FF FF FF FF FF FF FF FF"}) {
    Payload payload(hex);
    EXPECT_EQ(payload.reader.readVarint(), 0U) << hex;
    EXPECT_TRUE(payload.reader.error) << hex;
    EXPECT_EQ(payload.reader.pos, payload.content.size()) << hex;
  }
}

TEST(WireReaderTest, VarintEndsAtANarrowedLength) {
  Payload payload("80 80 01 05");
  payload.reader.length = 2;
  EXPECT_EQ(payload.reader.readVarint(), 0U);
  EXPECT_TRUE(payload.reader.error);
  EXPECT_EQ(payload.reader.pos, 2U);
}

TEST(WireReaderTest, OverLongVarintReadsAsZeroWithoutErrorAndUsesTenBytes) {
  // With and without a byte behind it: the reading near the end takes another path.
  for (const char* hex : {"FF FF FF FF FF FF FF FF FF FF 07", "FF FF FF FF FF FF FF FF FF FF"}) {
    Payload payload(hex);
    EXPECT_EQ(payload.reader.readVarint(), 0U);
    EXPECT_FALSE(payload.reader.error);
    EXPECT_EQ(payload.reader.pos, 10U);
  }
}

TEST(WireReaderTest, EveryReadAfterAnErrorGivesZero) {
  Payload payload("05 96 01 00 00 00 00 00 00 00 00 00");
  payload.reader.error = true;
  EXPECT_EQ(payload.reader.readVarint(), 0U);
  EXPECT_EQ(payload.reader.readVarint(), 0U);
  EXPECT_TRUE(payload.reader.error);
}

TEST(WireReaderTest, PositionOfAllOnesIsPastEveryLength) {
  Payload payload("05");
  payload.reader.pos = std::numeric_limits<std::uint64_t>::max();
  payload.reader.length = std::numeric_limits<std::uint64_t>::max();
  EXPECT_EQ(payload.reader.readVarint(), 0U);
  EXPECT_TRUE(payload.reader.error);
}

TEST(WireReaderTest, ZigZagKeepsTheLowThirtyTwoBits) {
  struct Case {
    const char* hex;
    std::int32_t value;
  };
  for (const Case& c : {Case{"00", 0}, Case{"01", -1}, Case{"02", 1}, Case{"03", -2},
                        Case{"FE FF FF FF 0F", std::numeric_limits<std::int32_t>::max()},
                        Case{"FF FF FF FF 0F", std::numeric_limits<std::int32_t>::min()}, Case{"81 80 80 80 10", -1}}) {
    EXPECT_EQ(Payload(c.hex).reader.readZigZag32(), c.value) << c.hex;
  }
}

TEST(WireReaderTest, BytesAreTakenWhole) {
  Payload payload("03 01 00 FF 09");
  EXPECT_EQ(payload.reader.readBytes(), ByteString(bytes("01 00 FF")));
  EXPECT_EQ(payload.reader.pos, 4U);
}

TEST(WireReaderTest, BytesOfLengthZeroAreThereAndEmpty) {
  Payload payload("00");
  EXPECT_EQ(payload.reader.readBytes(), ByteString());
  EXPECT_FALSE(payload.reader.error);
}

TEST(WireReaderTest, BytesThatDoNotFitAreNoneWithError) {
  for (const char* hex : {"04 01 02 03", "80", "FF FF FF FF FF FF FF FF FF 01 00"}) {
    Payload payload(hex);
    EXPECT_EQ(payload.reader.readBytes(), std::nullopt) << hex;
    EXPECT_TRUE(payload.reader.error) << hex;
  }
}

TEST(WireReaderTest, StringKeepsUtf8) {
  Payload payload("06 47 C3 BC E2 82 AC");
  EXPECT_EQ(payload.reader.readString(), Text("G\u00FC\u20AC"));
}

TEST(WireReaderTest, IllFormedSequencesOfAStringBecomeReplacementCharacters) {
  EXPECT_EQ(Payload("03 61 FF 62").reader.readString(), Text("a\uFFFDb"));
  EXPECT_EQ(Payload("03 61 E2 82").reader.readString(), Text("a\uFFFD"));
  EXPECT_EQ(Payload("02 C0 80").reader.readString(), Text("\uFFFD\uFFFD"));
}

TEST(WireReaderTest, StringThatDoesNotFitIsNoneWithError) {
  Payload payload("02 61");
  EXPECT_EQ(payload.reader.readString(), std::nullopt);
  EXPECT_TRUE(payload.reader.error);
}

TEST(WireReaderTest, MarkNarrowsTheLengthAndRecallRestoresIt) {
  Payload payload("02 07 08 09");
  std::uint64_t mark = 0;
  ASSERT_TRUE(payload.reader.placeMark(mark));
  EXPECT_EQ(payload.reader.pos, 1U);
  EXPECT_EQ(payload.reader.length, 3U);
  payload.reader.recallMark(mark);
  EXPECT_EQ(payload.reader.length, 4U);
  EXPECT_EQ(payload.reader.pos, 1U) << "recalling does not move";
}

TEST(WireReaderTest, MarkBeyondTheEndIsRefusedAndLeavesTheLength) {
  for (const char* hex : {"04 07 08 09", "80", "FF FF FF FF FF FF FF FF FF 01 09"}) {
    Payload payload(hex);
    std::uint64_t mark = 0;
    EXPECT_FALSE(payload.reader.placeMark(mark)) << hex;
    EXPECT_EQ(payload.reader.length, payload.content.size()) << hex;
  }
}

struct SkipCase {
  const char* name;
  const char* hex;
  std::uint32_t wireType;
  bool isSkipped;
  std::uint64_t pos;  // of those that are skipped
};

void PrintTo(const SkipCase& c, std::ostream* out) {
  *out << c.name;
}

class WireReaderSkipTest : public testing::TestWithParam<SkipCase> {};

TEST_P(WireReaderSkipTest, ValueOfTagFive) {
  const SkipCase& c = GetParam();
  Payload payload(c.hex);
  EXPECT_EQ(payload.reader.skipValue(5, c.wireType), c.isSkipped);
  if (c.isSkipped) {
    EXPECT_EQ(payload.reader.pos, c.pos);
  }
}

INSTANTIATE_TEST_SUITE_P(
    , WireReaderSkipTest,
    testing::Values(
        SkipCase{"Varint", "96 01 00", 0, true, 2},
        SkipCase{"OverLongVarint", "FF FF FF FF FF FF FF FF FF FF 01", 0, true, 10},
        SkipCase{"TruncatedVarint", "96", 0, false, 0},
        SkipCase{"EightBytes", "01 02 03 04 05 06 07 08 09", 1, true, 8},
        SkipCase{"TruncatedEightBytes", "01 02 03 04 05 06 07", 1, false, 0},
        SkipCase{"LengthDelimited", "02 01 02 03", 2, true, 3},
        SkipCase{"LengthBeyondTheEnd", "04 01 02 03", 2, false, 0}, SkipCase{"TruncatedLength", "80", 2, false, 0},
        SkipCase{"HugeLength", "FF FF FF FF FF FF FF FF FF 01 00", 2, false, 0},
        SkipCase{"FourBytes", "01 02 03 04 05", 5, true, 4}, SkipCase{"TruncatedFourBytes", "01 02 03", 5, false, 0},
        SkipCase{"EmptyGroup", "2C 01", 3, true, 1},
        SkipCase{"GroupWithValues", "08 01 12 01 07 1D 01 02 03 04 2C 01", 3, true, 11},
        SkipCase{"GroupInAGroup", "33 08 01 34 2C 01", 3, true, 5},
        SkipCase{"GroupOfTheSameTagInAGroup", "2B 2C 2C 01", 3, true, 3},
        SkipCase{"GroupWithTheEndOfAnother", "34", 3, false, 0}, SkipCase{"GroupWithoutEnd", "08 01", 3, false, 0},
        SkipCase{"GroupWithATruncatedValue", "08", 3, false, 0}, SkipCase{"GroupWithATruncatedKey", "88", 3, false, 0},
        SkipCase{"GroupWithWireTypeSeven", "0F 2C", 3, false, 0},
        SkipCase{"EndOfAGroupWithoutStart", "00", 4, false, 0}, SkipCase{"WireTypeSix", "00", 6, false, 0},
        SkipCase{"WireTypeSeven", "00", 7, false, 0}),
    [](const auto& tested) { return std::string(tested.param.name); });

std::string nestedGroups(int depth) {
  // The first start was the key that led to the skipping.
  std::string content;
  for (int i = 1; i < depth; ++i) content += '\x2B';
  for (int i = 0; i < depth; ++i) content += '\x2C';
  return content;
}

TEST(WireReaderTest, GroupsNestAtMostAHundredDeep) {
  const std::string fits = nestedGroups(100);
  WireReader reader(fits);
  EXPECT_TRUE(reader.skipValue(5, 3));
  EXPECT_EQ(reader.pos, fits.size());

  const std::string tooDeep = nestedGroups(101);
  WireReader other(tooDeep);
  EXPECT_FALSE(other.skipValue(5, 3));
}

TEST(WireReaderTest, AMillionOpenGroupsAreRefusedWithoutHarm) {
  const std::string content(1'000'000, '\x2B');
  WireReader reader(content);
  EXPECT_FALSE(reader.skipValue(5, 3));
}

}  // namespace
}  // namespace quorl
