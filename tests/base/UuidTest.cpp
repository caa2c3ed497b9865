#include <gtest/gtest.h>

#include "base/Uuid.h"

namespace quorl {
namespace {

TEST(UuidTest, TextHasFiveUpperCaseGroups) {
  const Uuid id{{0x6D, 0x9C, 0x1C, 0x4A, 0, 0, 0x40, 0, 0x80, 0, 0, 0, 0, 0, 0, 0xEF}};
  EXPECT_EQ(id.string(), "6D9C1C4A-0000-4000-8000-0000000000EF");
}

TEST(UuidTest, NewOnesDifferAndAreRandomVersionFour) {
  const Uuid a = Uuid::make();
  EXPECT_NE(a, Uuid::make());
  EXPECT_EQ(a.bytes[6] >> 4, 4);
  EXPECT_EQ(a.bytes[8] >> 6, 2);
}

}  // namespace
}  // namespace quorl
