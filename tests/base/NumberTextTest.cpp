#include <cmath>
#include <limits>

#include <gtest/gtest.h>

#include "base/NumberText.h"

namespace quorl {
namespace {

TEST(NumberTextTest, ADecimalIntegerIsReadAsAWhole) {
  EXPECT_EQ(decimalInteger("0"), 0);
  EXPECT_EQ(decimalInteger("-12"), -12);
  EXPECT_EQ(decimalInteger("+7"), 7);
  EXPECT_EQ(decimalInteger("9223372036854775807"), std::numeric_limits<std::int64_t>::max());
}

TEST(NumberTextTest, AnythingElseIsNoDecimalInteger) {
  for (const char* text : {"", "+", "-", "+-1", " 1", "1 ", "1.0", "0x1", "one", "9223372036854775808"})
    EXPECT_EQ(decimalInteger(text), std::nullopt) << text;
}

TEST(NumberTextTest, AnIntegerPrefixTakesTheLeadingDigits) {
  EXPECT_EQ(integerPrefix("12"), 12);
  EXPECT_EQ(integerPrefix("12.9"), 12);
  EXPECT_EQ(integerPrefix("-85 dBm"), -85);
  EXPECT_EQ(integerPrefix("  +3x"), 3);
}

TEST(NumberTextTest, ATextWithoutLeadingDigitsReadsZero) {
  for (const char* text : {"", "LTE", "-", "+-1", ".5", "- 1"}) EXPECT_EQ(integerPrefix(text), 0) << text;
}

TEST(NumberTextTest, AnIntegerPrefixStopsAtTheLimits) {
  EXPECT_EQ(integerPrefix("99999999999999999999"), std::numeric_limits<std::int64_t>::max());
  EXPECT_EQ(integerPrefix("-99999999999999999999"), std::numeric_limits<std::int64_t>::min());
  EXPECT_EQ(integerPrefix("-9223372036854775808"), std::numeric_limits<std::int64_t>::min());
}

TEST(NumberTextTest, ARealPrefixTakesDigitsAndFraction) {
  EXPECT_EQ(realPrefix("5.5"), 5.5);
  EXPECT_EQ(realPrefix("-97.25 dBm"), -97.25);
  EXPECT_EQ(realPrefix(" 7MHz"), 7);
  EXPECT_EQ(realPrefix(".5"), 0.5);
  EXPECT_EQ(realPrefix("1.0e+15"), 1e15);
}

TEST(NumberTextTest, ATextWithoutANumberReadsZeroAsReal) {
  for (const char* text : {"", "LTE", "-", ".", "inf", "nan", "--1"}) EXPECT_EQ(realPrefix(text), 0) << text;
}

TEST(NumberTextTest, ARealThatDoesNotFitIsInfiniteOrZero) {
  EXPECT_EQ(realPrefix("1e999"), std::numeric_limits<double>::infinity());
  EXPECT_EQ(realPrefix("-1e999"), -std::numeric_limits<double>::infinity());
  EXPECT_EQ(realPrefix("1e-999"), 0);
}

}  // namespace
}  // namespace quorl
