#pragma once

// Functions of the C library differ in their last bits from machine to machine, and a last bit is enough to send a
// handover elsewhere. These are made of IEEE additions, multiplications, divisions and square roots alone, which are
// exact everywhere, and so have the same result everywhere. Errors stay below 1e-12 of the result.

namespace quorl::simulator::network {

inline constexpr double kPi = 3.14159265358979323846;

/// Of a positive, normal number.
double naturalLog(double x);
double log10Of(double x);
/// Between -700 and 700.
double exponential(double x);
/// Ten to the x, for x between -300 and 300.
double tenTo(double x);
/// Decibels to a ratio, and back.
inline double fromDecibels(double decibels) {
  return tenTo(decibels / 10.0);
}
/// Of hundredths of a decibel, -30000 to 9999; some times faster.
double fromCentiDecibels(int centi);
inline double toDecibels(double ratio) {
  return 10.0 * log10Of(ratio);
}
/// Angle of the direction (x, y) in radians, counter-clockwise from the x axis, -pi to pi; 0 for (0, 0).
double angleOf(double x, double y);
/// Nearest whole hundredth of a value between -9999 and 9999; halves go up.
int toCenti(double value);

}  // namespace quorl::simulator::network
