#include <string>

#include <gtest/gtest.h>

#include "hosts/simulator/BasebandLog.h"

namespace quorl::simulator {
namespace {

TEST(BasebandLogTest, WhatWaitsTooLongGoesOldestFirst) {
  BasebandLog log;
  log.add("closed");
  EXPECT_EQ(log.take(100), "");
  log.open();
  log.add("oldest");
  log.add(std::string(BasebandLog::kCapacity - 3, 'x'));
  log.add("n");
  EXPECT_EQ(log.take(10), std::string(10, 'x')) << "a line that is too long comes cut";
  EXPECT_EQ(log.take(10), "n\n");
  log.add("left over");
  log.open();
  EXPECT_EQ(log.take(100), "");
}

}  // namespace
}  // namespace quorl::simulator
