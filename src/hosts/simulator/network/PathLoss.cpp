#include "hosts/simulator/network/PathLoss.h"

#include <algorithm>

#include "hosts/simulator/network/Arithmetic.h"

namespace quorl::simulator::network {
namespace {

constexpr double kLightMetresPerNanosecond = 0.299792458;
// Rural: buildings of 5 m, streets of 20 m. 5 to the 1.72 is 15.93.
constexpr double kRuralDistanceTerm = 0.03 * 15.93;
constexpr double kRuralOffset = 0.044 * 15.93;
constexpr double kRuralPerMetre = 0.002 * 0.69897;

}  // namespace

PathLoss::PathLoss(Environment environment, double gigahertz, double siteHeight) : environment_(environment) {
  const double logFrequency = log10Of(gigahertz);
  const double drop = siteHeight - kPhoneHeight;
  // An effective environment height of 1 m (note 1 of table 7.4.1-1); rural has its own formula (note 5).
  breakPoint_ = environment == Environment::RuralMacro
                    ? 2.0 * kPi * siteHeight * kPhoneHeight * gigahertz / kLightMetresPerNanosecond
                    : 4.0 * (siteHeight - 1.0) * (kPhoneHeight - 1.0) * gigahertz / kLightMetresPerNanosecond;
  const double logBreak = log10Of(breakPoint_ * breakPoint_ + drop * drop);
  switch (environment) {
    case Environment::UrbanMacro:
      nearOffset_ = 28.0 + 20.0 * logFrequency;
      nearSlope_ = 22.0;
      farOffset_ = nearOffset_ - 9.0 * logBreak;
      hiddenOffset_ = 13.54 + 20.0 * logFrequency;
      hiddenSlope_ = 39.08;
      break;
    case Environment::StreetCanyon:
      nearOffset_ = 32.4 + 20.0 * logFrequency;
      nearSlope_ = 21.0;
      farOffset_ = nearOffset_ - 9.5 * logBreak;
      hiddenOffset_ = 22.4 + 21.3 * logFrequency;
      hiddenSlope_ = 35.3;
      break;
    case Environment::RuralMacro: {
      const double logHeight = log10Of(siteHeight);
      nearOffset_ = 20.0 * log10Of(40.0 * kPi * gigahertz / 3.0) - kRuralOffset;
      nearSlope_ = 20.0 + kRuralDistanceTerm;
      farOffset_ =
          nearOffset_ + nearSlope_ * log10Of(breakPoint_) + kRuralPerMetre * breakPoint_ - 40.0 * log10Of(breakPoint_);
      const double shape = 5.0 / siteHeight;
      hiddenSlope_ = 43.42 - 3.1 * logHeight;
      hiddenOffset_ = 161.04 - 7.1 * 1.30103 + 7.5 * 0.69897 - (24.37 - 3.7 * shape * shape) * logHeight -
                      3.0 * hiddenSlope_ + 20.0 * logFrequency + 0.0009;
      break;
    }
  }
}

double PathLoss::inSight(double ground, double logDistance) const {
  const double perMetre = environment_ == Environment::RuralMacro ? kRuralPerMetre : 0.0;
  return ground <= breakPoint_ ? nearOffset_ + nearSlope_ * logDistance + perMetre * ground
                               : farOffset_ + 40.0 * logDistance;
}

double PathLoss::outOfSight(double ground, double logDistance) const {
  return std::max(inSight(ground, logDistance), hiddenOffset_ + hiddenSlope_ * logDistance);
}

double PathLoss::chanceOfSight(Environment environment, double ground) {
  if (environment == Environment::RuralMacro) return ground <= 10.0 ? 1.0 : exponential(-(ground - 10.0) / 1000.0);
  if (ground <= 18.0) return 1.0;
  const double reach = environment == Environment::UrbanMacro ? 63.0 : 36.0;
  return 18.0 / ground + exponential(-ground / reach) * (1.0 - 18.0 / ground);
}

double PathLoss::deviationInSight(Environment) {
  return 4.0;
}

double PathLoss::deviationOutOfSight(Environment environment) {
  switch (environment) {
    case Environment::UrbanMacro:
      return 6.0;
    case Environment::StreetCanyon:
      return 7.82;
    case Environment::RuralMacro:
      return 8.0;
  }
  return 6.0;
}

double PathLoss::correlationDistance(Environment environment) {
  switch (environment) {
    case Environment::UrbanMacro:
      return 50.0;
    case Environment::StreetCanyon:
      return 13.0;
    case Environment::RuralMacro:
      return 120.0;
  }
  return 50.0;
}

}  // namespace quorl::simulator::network
