#include <string>

#include <gtest/gtest.h>

#include "Hexadecimal.h"
#include "NearestNames.h"
#include "TimeShift.h"
#include "messages/MetricCodable.h"

namespace quorl::tool {
namespace {

TEST(Hexadecimal, ReadsBackEveryByte) {
  std::string bytes;
  for (int value = 0; value < 256; ++value) bytes.push_back(static_cast<char>(value));
  EXPECT_EQ(hexBytes(hexText(bytes)), bytes);
  EXPECT_EQ(hexText("\x08\xe8"), "08e8");
}

TEST(Hexadecimal, TakesBlanksBetweenBytesOnly) {
  EXPECT_EQ(hexBytes(" 08\te8 \r"), "\x08\xe8");
  for (const char* text : {"0", "080", "0 8", "0x08", "08,E8", "g0"}) EXPECT_EQ(hexBytes(text), std::nullopt) << text;
  EXPECT_EQ(hexBytes(std::string("0\0", 2)), std::nullopt);
}

TEST(EditDistance, CountsSingleCharacters) {
  EXPECT_EQ(editDistance("", ""), 0U);
  EXPECT_EQ(editDistance("abc", ""), 3U);
  EXPECT_EQ(editDistance("", "abc"), 3U);
  EXPECT_EQ(editDistance("kitten", "sitting"), 3U);
  EXPECT_EQ(editDistance("Guti", "guti"), 1U);
}

TEST(NearestNames, ComeNearestFirstThenInTheirOrder) {
  EXPECT_EQ(nearestNames("cat", {"dog", "cart", "hat", "cat"}, 3),
            (std::vector<std::string_view>{"cat", "cart", "hat"}));
  EXPECT_EQ(nearestNames("cat", {"dog"}, 3), std::vector<std::string_view>{"dog"});
}

class TimeShift : public testing::Test {
 protected:
  static simulator::RecordedEvent event(std::int64_t id, std::string_view hex) {
    simulator::RecordedEvent made;
    made.metricID = id;
    made.payload = ByteString(hexBytes(hex).value());
    return made;
  }
  std::vector<std::string> shifted(std::vector<simulator::RecordedEvent> events, std::int64_t nowMs = 2000) {
    shiftToNow(events, Date(std::chrono::milliseconds(nowMs)));
    std::vector<std::string> payloads;
    for (const simulator::RecordedEvent& each : events)
      payloads.push_back(each.payload ? hexText(each.payload->view()) : "none");
    return payloads;
  }

  static constexpr std::int64_t kContext = 3986700;  // KCellularEmmContext
};

TEST_F(TimeShift, MovesAllTimesBySameSpanSoThatTheLatestIsNow) {
  // 1000 ms becomes 2000 ms, and 900 ms becomes 1900 ms, wherever the latest stands.
  EXPECT_EQ(shifted({event(kContext, "08e8071002"), event(kContext, "088407")}),
            (std::vector<std::string>{"08d00f1002", "08ec0e"}));
}

TEST_F(TimeShift, KeepsEveryOtherByte) {
  // Unknown fields of each wire type, the timestamp in the middle, twice: the last one counts.
  EXPECT_EQ(shifted({event(kContext, "f03f05f13f0102030405060708f23f02aabbf53f01020304080108e8077801")}),
            std::vector<std::string>{"f03f05f13f0102030405060708f23f02aabbf53f0102030408d00f08d00f7801"});
}

TEST_F(TimeShift, LeavesAloneWhatHasNoReadableTime) {
  simulator::RecordedEvent bare;
  bare.metricID = kContext;
  EXPECT_EQ(shifted({event(kContext, "08e807"), event(kContext, "08e8073205"), event(kContext, "1002"),
                     event(4711, "08e807"), event(3985409, "08e807"), bare}),
            (std::vector<std::string>{"08d00f", "08e8073205", "1002", "08e807", "08e807", "none"}));
}

TEST_F(TimeShift, NeverGoesBelowTheBeginningOfTime) {
  EXPECT_EQ(shifted({event(kContext, "088827"), event(kContext, "080a")}),
            (std::vector<std::string>{"08d00f", "0800"}));
}

TEST_F(TimeShift, WithoutAnyTimeDoesNothing) {
  EXPECT_EQ(shifted({event(kContext, "1002")}), std::vector<std::string>{"1002"});
  EXPECT_TRUE(shifted({}).empty());
}

}  // namespace
}  // namespace quorl::tool
