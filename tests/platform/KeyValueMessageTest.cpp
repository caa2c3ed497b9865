#include <gtest/gtest.h>

#include "platform/KeyValueMessage.h"

namespace quorl::zelkor {
namespace {

KeyValueMessage sample() {
  KeyValueMessage message;
  message.set("kKeyMetricID", std::int64_t{806915});
  message.set("kKeyPayload", ByteString("identity"));
  message.set("kKeyAppID", std::monostate());
  return message;
}

TEST(KeyValueMessageTest, AKeyThatIsSetAgainKeepsItsPlace) {
  KeyValueMessage message = sample();
  message.set("kKeyMetricID", std::int64_t{7});
  ASSERT_EQ(message.entries().size(), 3U);
  EXPECT_EQ(message.entries().front().first, "kKeyMetricID");
  EXPECT_EQ(message.integer("kKeyMetricID"), 7);
}

TEST(KeyValueMessageTest, AValueIsAnsweredAsItsOwnKindOnly) {
  const KeyValueMessage message = sample();
  EXPECT_EQ(message.integer("kKeyMetricID"), 806915);
  EXPECT_EQ(message.bytes("kKeyMetricID"), std::nullopt);
  EXPECT_EQ(message.bytes("kKeyPayload"), ByteString("identity"));
  EXPECT_EQ(message.integer("kKeyPayload"), std::nullopt);
  EXPECT_EQ(message.integer("kKeyAppID"), std::nullopt);
  EXPECT_EQ(message.bytes("kKeyAppID"), std::nullopt);
}

TEST(KeyValueMessageTest, AMissingKeyDiffersFromANullValue) {
  EXPECT_EQ(sample().find("kKeyProfileID"), nullptr);
  EXPECT_EQ(sample().integer("kKeyProfileID"), std::nullopt);
  const KeyValueMessage message = sample();
  EXPECT_NE(message.find("kKeyAppID"), nullptr);
}

TEST(KeyValueMessageTest, LogTextShowsTheLengthOfByteStringsOnly) {
  EXPECT_EQ(logText(sample()), "{kKeyMetricID = 806915; kKeyPayload = <8 bytes>; kKeyAppID = null}");
  EXPECT_EQ(logText(KeyValueMessage()), "{}");
}

}  // namespace
}  // namespace quorl::zelkor
