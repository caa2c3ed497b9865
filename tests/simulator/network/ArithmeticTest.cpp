#include <array>
#include <bit>
#include <cmath>
#include <cstdint>
#include <numbers>

#include <gtest/gtest.h>

#include "hosts/simulator/network/Arithmetic.h"
#include "hosts/simulator/network/RandomStream.h"

namespace quorl::simulator::network {
namespace {

TEST(ArithmeticTest, AgreesWithTheLibraryToTwelveDigits) {
  for (double x = 1e-9; x < 1e9; x *= 1.37) {
    EXPECT_NEAR(naturalLog(x), std::log(x), 1e-12 * (1.0 + std::abs(std::log(x)))) << x;
    EXPECT_NEAR(log10Of(x), std::log10(x), 1e-12 * (1.0 + std::abs(std::log10(x)))) << x;
  }
  for (double x = -200; x < 200; x += 0.731) EXPECT_NEAR(exponential(x) / std::exp(x), 1.0, 1e-12) << x;
  for (double x = -30; x < 30; x += 0.137) EXPECT_NEAR(tenTo(x) / std::pow(10.0, x), 1.0, 1e-12) << x;
  for (int centi = -16000; centi < 3000; centi += 7)
    EXPECT_NEAR(fromCentiDecibels(centi) / std::pow(10.0, centi / 1000.0), 1.0, 1e-12) << centi;
}

TEST(ArithmeticTest, AnglesGoAllTheWayAround) {
  for (double angle = -3.1; angle < 3.1; angle += 0.05)
    EXPECT_NEAR(angleOf(3.0 * std::cos(angle), 3.0 * std::sin(angle)), angle, 1e-10);
  EXPECT_EQ(angleOf(0, 0), 0);
  EXPECT_NEAR(angleOf(0, 1), std::numbers::pi / 2, 1e-12);
  EXPECT_NEAR(angleOf(0, -1), -std::numbers::pi / 2, 1e-12);
  EXPECT_NEAR(angleOf(-1, 0), std::numbers::pi, 1e-12);
}

TEST(ArithmeticTest, HundredthsAreTheNearestAndHalvesGoUp) {
  EXPECT_EQ(toCenti(-87.124), -8712);
  EXPECT_EQ(toCenti(-87.126), -8713);
  EXPECT_EQ(toCenti(0.25), 25);
  EXPECT_EQ(toCenti(-0.125), -12);
  EXPECT_EQ(toCenti(0.125), 13);
}

TEST(ArithmeticTest, ResultsAreTheSameBitsOnEveryMachine) {
  std::uint64_t mixed = 0;
  const auto mix = [&](double value) { mixed = mixed * 31 + std::bit_cast<std::uint64_t>(value); };
  for (int i = 1; i < 500; ++i) {
    mix(naturalLog(i * 0.37));
    mix(exponential(i * 0.11 - 20));
    mix(angleOf(i - 250.5, 77 - i * 0.5));
  }
  RandomStream stream(42, 7);
  for (int i = 0; i < 500; ++i) mix(stream.normal());
  EXPECT_EQ(mixed, 15510886999308723195ULL);
}

TEST(RandomStreamTest, NormalNumbersHaveTheirMoments) {
  RandomStream stream(1, 1);
  double sum = 0;
  double squares = 0;
  int beyondTwo = 0;
  constexpr int kDraws = 200000;
  for (int i = 0; i < kDraws; ++i) {
    const double value = stream.normal();
    sum += value;
    squares += value * value;
    beyondTwo += std::abs(value) > 2.0 ? 1 : 0;
  }
  EXPECT_NEAR(sum / kDraws, 0.0, 0.01);
  EXPECT_NEAR(squares / kDraws, 1.0, 0.015);
  EXPECT_NEAR(beyondTwo / static_cast<double>(kDraws), 0.0455, 0.002);
}

TEST(RandomStreamTest, BelowReachesEveryNumberAndNoOther) {
  RandomStream stream(3, 1);
  std::array<int, 6> seen{};
  for (int i = 0; i < 6000; ++i) ++seen.at(stream.below(6));
  for (const int count : seen) EXPECT_NEAR(count, 1000, 150);
}

TEST(RandomStreamTest, PurposesHaveStreamsOfTheirOwn) {
  RandomStream one(5, 1);
  RandomStream other(5, 2);
  EXPECT_NE(one.bits(), other.bits());
}

TEST(RandomStreamTest, WaitingTimesHaveTheirMean) {
  RandomStream stream(9, 4);
  double sum = 0;
  for (int i = 0; i < 100000; ++i) sum += stream.waiting(30.0);
  EXPECT_NEAR(sum / 100000, 30.0, 0.5);
}

}  // namespace
}  // namespace quorl::simulator::network
