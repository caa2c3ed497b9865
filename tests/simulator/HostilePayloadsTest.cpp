#include <set>
#include <string>

#include <gtest/gtest.h>

#include "hosts/simulator/metrics/HostilePayloads.h"
#include "messages/classes/lte_rrc.h"
#include "messages/wire/WireWriter.h"

namespace quorl::simulator::metrics {
namespace {

ByteString attempt() {
  CellularLteRachAttempt message;
  message.setTimestamp(1700000000123);
  message.setSubsId(1);
  message.setRsrp(-97);
  WireWriter writer;
  message.writeTo(writer);
  return ByteString(writer.bytes());
}

bool isReadable(const ByteString& payload) {
  CellularLteRachAttempt message;
  message.initWithData(payload);
  return message.dictionaryRepresentation().has_value();
}

TEST(HostilePayloads, SixInARowAreDamagedInSixWays) {
  std::set<std::string> made;
  int unreadable = 0;
  for (std::uint32_t number = 0; number < 6; ++number) {
    const ByteString payload = damaged(attempt(), 7, number);
    made.insert(std::string(payload.view()));
    unreadable += isReadable(payload) ? 0 : 1;
  }
  EXPECT_EQ(made.size(), 6U);
  EXPECT_GE(unreadable, 4) << "turned bits and noise may happen to make sense";
}

TEST(HostilePayloads, AreTheSameForTheSameSaltAndNumberAlone) {
  for (std::uint32_t number = 0; number < 12; ++number)
    EXPECT_EQ(damaged(attempt(), 7, number), damaged(attempt(), 7, number));
  EXPECT_NE(damaged(attempt(), 7, 5), damaged(attempt(), 7, 11)) << "noise";
  EXPECT_NE(damaged(attempt(), 7, 5), damaged(attempt(), 8, 5));
}

TEST(HostilePayloads, CanBeMadeOfNothing) {
  int empty = 0;
  for (std::uint32_t number = 0; number < 12; ++number)
    empty += damaged(ByteString(), 7, number).view().empty() ? 1 : 0;
  EXPECT_EQ(empty, 2) << "there are no bits to turn";
}

TEST(HostilePayloads, OneThatIsInflatedStillReads) {
  const ByteString payload = inflated(attempt(), 1000000);
  EXPECT_GT(payload.view().size(), 1000000U);
  CellularLteRachAttempt message;
  message.initWithData(payload);
  ASSERT_TRUE(message.dictionaryRepresentation());
  EXPECT_EQ(message.rsrp(), -97);
}

}  // namespace
}  // namespace quorl::simulator::metrics
