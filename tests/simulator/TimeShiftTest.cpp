#include <chrono>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "hosts/simulator/TimeShift.h"
#include "messages/Wire.h"

namespace quorl::simulator {
namespace {

class TimeShift : public testing::Test {
 protected:
  static RecordedEvent event(std::int64_t id, std::string_view payload) {
    RecordedEvent made;
    made.metricID = id;
    made.payload = ByteString(test::bytes(payload));
    return made;
  }
  std::vector<std::string> shifted(std::vector<RecordedEvent> events, std::int64_t nowMs = 2000) {
    shiftToNow(events, Date(std::chrono::milliseconds(nowMs)));
    std::vector<std::string> payloads;
    for (const RecordedEvent& each : events)
      payloads.push_back(each.payload ? test::hex(each.payload->view()) : "none");
    return payloads;
  }

  static constexpr std::int64_t kContext = 3986700;  // KCellularEmmContext
};

TEST_F(TimeShift, MovesAllTimesByTheSameSpanSoThatTheLatestIsNow) {
  // 1000 ms becomes 2000 ms, and 900 ms becomes 1900 ms, wherever the latest stands.
  EXPECT_EQ(shifted({event(kContext, "08 E8 07 10 02"), event(kContext, "08 84 07")}),
            (std::vector<std::string>{"08 D0 0F 10 02", "08 EC 0E"}));
}

TEST_F(TimeShift, KeepsEveryOtherByte) {
  // Unknown fields of each wire type, the timestamp in the middle, twice: the last one counts.
  EXPECT_EQ(
      shifted({event(kContext,
                     "F0 3F 05 F1 3F 01 02 03 04 05 06 07 08 F2 3F 02 AA BB F5 3F 01 02 03 04 08 01 08 E8 07 78 01")}),
      std::vector<std::string>{
          "F0 3F 05 F1 3F 01 02 03 04 05 06 07 08 F2 3F 02 AA BB F5 3F 01 02 03 04 08 D0 0F 08 D0 0F 78 01"});
}

TEST_F(TimeShift, LeavesAloneWhatHasNoReadableTime) {
  RecordedEvent bare;
  bare.metricID = kContext;
  EXPECT_EQ(shifted({event(kContext, "08 E8 07"), event(kContext, "08 E8 07 32 05"), event(kContext, "10 02"),
                     event(4711, "08 E8 07"), event(3985409, "08 E8 07"), bare}),
            (std::vector<std::string>{"08 D0 0F", "08 E8 07 32 05", "10 02", "08 E8 07", "08 E8 07", "none"}));
}

TEST_F(TimeShift, NeverGoesBelowTheBeginningOfTime) {
  EXPECT_EQ(shifted({event(kContext, "08 88 27"), event(kContext, "08 0A")}),
            (std::vector<std::string>{"08 D0 0F", "08 00"}));
}

TEST_F(TimeShift, WithoutAnyTimeDoesNothing) {
  EXPECT_EQ(shifted({event(kContext, "10 02")}), std::vector<std::string>{"10 02"});
  EXPECT_TRUE(shifted({}).empty());
}

}  // namespace
}  // namespace quorl::simulator
