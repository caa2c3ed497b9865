#pragma once

#include <cmath>
#include <cstdint>

#include "hosts/simulator/network/Arithmetic.h"

namespace quorl::simulator::network {

/// Mixes the bits of a number: the finalizer of SplitMix64 (Steele, Lea, Flood: Fast splittable pseudorandom number
/// generators, 2014).
inline std::uint64_t mixed(std::uint64_t z) {
  z = (z ^ (z >> 30U)) * 0xBF58476D1CE4E5B9ULL;
  z = (z ^ (z >> 27U)) * 0x94D049BB133111EBULL;
  return z ^ (z >> 31U);
}

/// Random numbers that are the same everywhere; the distributions of the standard library are not. Each purpose has a
/// stream of its own, so that a draw more for one changes none of the others. Every number costs one step.
class RandomStream {
 public:
  RandomStream(std::uint64_t seed, std::uint64_t purpose) : state_(mixed(seed ^ mixed(purpose + 1))) {}

  std::uint64_t bits() {
    state_ += 0x9E3779B97F4A7C15ULL;
    return mixed(state_);
  }
  /// 0 to 1, neither of them.
  double uniform() { return (static_cast<double>(bits() >> 12U) + 0.5) * 0x1p-52; }
  double between(double low, double high) { return low + (high - low) * uniform(); }
  /// 0 to `count` - 1.
  std::uint32_t below(std::uint32_t count) { return static_cast<std::uint32_t>(((bits() >> 32U) * count) >> 32U); }
  bool chance(double probability) { return uniform() < probability; }
  /// Times between events that come `mean` apart.
  double waiting(double mean) { return -mean * naturalLog(uniform()); }
  /// Mean 0, deviation 1.
  double normal() { return normalQuantile(uniform()); }

  /// P. J. Acklam's rational approximation of the inverse normal distribution, relative error below 1.2e-9.
  static double normalQuantile(double p) {
    if (p < 0.02425) return tail(p);
    if (p > 1.0 - 0.02425) return -tail(1.0 - p);
    const double q = p - 0.5;
    const double r = q * q;
    return (((((-39.69683028665376 * r + 220.9460984245205) * r - 275.9285104469687) * r + 138.3577518672690) * r -
             30.66479806614716) *
                r +
            2.506628277459239) *
           q /
           (((((-54.47609879822406 * r + 161.5858368580409) * r - 155.6989798598866) * r + 66.80131188771972) * r -
             13.28068155288572) *
                r +
            1.0);
  }

 private:
  static double tail(double p) {
    const double q = std::sqrt(-2.0 * naturalLog(p));
    return (((((-0.007784894002430293 * q - 0.3223964580411365) * q - 2.400758277161838) * q - 2.549732539343734) * q +
             4.374664141464968) *
                q +
            2.938163982698783) /
           ((((0.007784695709041462 * q + 0.3224671290700398) * q + 2.445134137142996) * q + 3.754408661907416) * q +
            1.0);
  }

  std::uint64_t state_;
};

}  // namespace quorl::simulator::network
