#include "hosts/simulator/network/Arithmetic.h"

#include <array>
#include <bit>
#include <cmath>
#include <cstddef>
#include <cstdint>

namespace quorl::simulator::network {
namespace {

constexpr double kLn2 = 0.693147180559945309417;
constexpr double kLn10 = 2.30258509299404568402;

/// Between 0 and 1.
double arcTangentOfFraction(double x) {
  // atan(x) = pi/6 + atan((x sqrt(3) - 1) / (sqrt(3) + x)) leaves at most tan(pi/12) for the series.
  constexpr double kSqrt3 = 1.73205080756887729353;
  const bool isReduced = x > 0.26794919243112270647;
  const double t = isReduced ? (x * kSqrt3 - 1.0) / (kSqrt3 + x) : x;
  const double square = t * t;
  double sum = 0;
  for (int n = 19; n >= 1; n -= 2) sum = 1.0 / n - square * sum;
  return (isReduced ? kPi / 6.0 : 0.0) + t * sum;
}

}  // namespace

double naturalLog(double x) {
  const auto bits = std::bit_cast<std::uint64_t>(x);
  int exponent = static_cast<int>(bits >> 52U) - 1023;
  double mantissa = std::bit_cast<double>((bits & 0x000FFFFFFFFFFFFFULL) | 0x3FF0000000000000ULL);
  if (mantissa > 1.41421356237309504880) {
    mantissa *= 0.5;
    ++exponent;
  }
  // ln(m) = 2 artanh((m - 1) / (m + 1))
  const double s = (mantissa - 1.0) / (mantissa + 1.0);
  const double square = s * s;
  double sum = 1.0 / 15.0;
  sum = sum * square + 1.0 / 13.0;
  sum = sum * square + 1.0 / 11.0;
  sum = sum * square + 1.0 / 9.0;
  sum = sum * square + 1.0 / 7.0;
  sum = sum * square + 1.0 / 5.0;
  sum = sum * square + 1.0 / 3.0;
  sum = sum * square + 1.0;
  return exponent * kLn2 + 2.0 * s * sum;
}

double log10Of(double x) {
  return naturalLog(x) / kLn10;
}

double exponential(double x) {
  const double whole = std::floor(x / kLn2 + 0.5);
  const double rest = x - whole * kLn2;
  double sum = 1.0;
  sum = sum * rest / 11.0 + 1.0;
  for (int n = 10; n >= 1; --n) sum = sum * rest * (1.0 / n) + 1.0;
  const auto exponent = static_cast<std::uint64_t>(static_cast<std::int64_t>(whole) + 1023);
  return sum * std::bit_cast<double>(exponent << 52U);
}

double tenTo(double x) {
  return exponential(x * kLn10);
}

double fromCentiDecibels(int centi) {
  // Whole decibels times hundredths.
  struct Tables {
    std::array<double, 400> whole{};
    std::array<double, 100> parts{};
    Tables() {
      for (int i = 0; i < 400; ++i) whole[static_cast<std::size_t>(i)] = fromDecibels(i - 300);
      for (int i = 0; i < 100; ++i) parts[static_cast<std::size_t>(i)] = fromDecibels(i / 100.0);
    }
  };
  static const Tables kTables;
  const auto above = static_cast<std::size_t>(centi + 30000);
  return kTables.whole[above / 100] * kTables.parts[above % 100];
}

double angleOf(double x, double y) {
  const double across = x < 0 ? -x : x;
  const double up = y < 0 ? -y : y;
  if (across == 0 && up == 0) return 0;
  double angle = up <= across ? arcTangentOfFraction(up / across) : kPi / 2.0 - arcTangentOfFraction(across / up);
  if (x < 0) angle = kPi - angle;
  return y < 0 ? -angle : angle;
}

int toCenti(double value) {
  // Cutting off is rounding down once everything is above zero.
  return static_cast<int>(value * 100.0 + 1000000.5) - 1000000;
}

}  // namespace quorl::simulator::network
