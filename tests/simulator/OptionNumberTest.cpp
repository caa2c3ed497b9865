#include <cstdint>
#include <limits>
#include <string>

#include <gtest/gtest.h>

#include "hosts/simulator/OptionNumber.h"

namespace quorl::simulator {
namespace {

std::string wholeFault(std::string text, std::uint64_t least, std::uint64_t most) {
  return wholeNumberFault(text, least, most);
}

TEST(OptionNumber, WholeNumbersAreDecimalDigitsWithinTheLimits) {
  constexpr std::uint64_t kMost = std::numeric_limits<std::uint64_t>::max();
  for (const char* text : {"0", "1", "18446744073709551615"}) EXPECT_EQ(wholeFault(text, 0, kMost), "") << text;
  for (const char* text : {"", "-1", "+1", "1.5", "0x10", "1 ", "nan", "18446744073709551616"})
    EXPECT_EQ(wholeFault(text, 0, kMost), std::string(text) + " is no whole number from 0 to 18446744073709551615");
  EXPECT_EQ(wholeFault("32", 1, 31), "32 is no whole number from 1 to 31");
  EXPECT_EQ(wholeFault("0", 1, 31), "0 is no whole number from 1 to 31");
}

TEST(OptionNumber, ZerosBeforeANumberAreNotOctal) {
  std::string text = "010";
  EXPECT_EQ(wholeNumberFault(text, 0, 31), "");
  EXPECT_EQ(text, "10");
}

TEST(OptionNumber, NumbersAreFiniteAndWithinTheLimits) {
  for (const char* text : {"0", "0.5", "1e1", "10"}) EXPECT_EQ(numberFault(text, 0, 10), "") << text;
  for (const char* text : {"", "nan", "-nan", "inf", "1e999", "-0.1", "10.1", "0,5", "1.5x"})
    EXPECT_EQ(numberFault(text, 0, 10), std::string(text) + " is no number from 0 to 10");
}

}  // namespace
}  // namespace quorl::simulator
