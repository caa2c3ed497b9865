#pragma once

#include "hosts/simulator/network/Scenario.h"

namespace quorl::simulator::network {

inline constexpr double kPhoneHeight = 1.5;  // metres above the ground

/// Loss between a site and a phone at `kPhoneHeight`, TR 38.901 clause 7.4. What depends on the carrier alone is
/// computed once.
class PathLoss {
 public:
  PathLoss(Environment environment, double gigahertz, double siteHeight);

  /// Distance along the ground in metres, 10 at least, and the logarithm to base 10 of the direct distance. dB.
  double inSight(double ground, double logDistance) const;
  double outOfSight(double ground, double logDistance) const;

  /// How likely a phone at this distance sees the site: table 7.4.2-1.
  static double chanceOfSight(Environment environment, double ground);

  /// Deviations of the shadowing in dB (table 7.4.1-1) and its correlation distance in metres (table 7.5-6).
  static double deviationInSight(Environment environment);
  static double deviationOutOfSight(Environment environment);
  static double correlationDistance(Environment environment);

 private:
  Environment environment_;
  double breakPoint_;
  double nearOffset_;
  double nearSlope_;
  double farOffset_;
  double hiddenOffset_;
  double hiddenSlope_;
};

}  // namespace quorl::simulator::network
