#include <string>

#include <gtest/gtest.h>

#include "Hexadecimal.h"
#include "NearestNames.h"

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

}  // namespace
}  // namespace quorl::tool
