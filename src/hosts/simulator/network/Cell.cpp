#include "hosts/simulator/network/Cell.h"

namespace quorl::simulator::network {

std::array<std::uint8_t, 3> encoded(const Plmn& plmn) {
  const auto digit = [](unsigned number, unsigned weight) { return number / weight % 10U; };
  const unsigned mcc = plmn.mcc;
  const unsigned mnc = plmn.mnc;
  const bool isLong = plmn.mncDigits == 3;
  const unsigned third = isLong ? digit(mnc, 1) : 15U;
  const unsigned first = digit(mnc, isLong ? 100 : 10);
  const unsigned second = digit(mnc, isLong ? 10 : 1);
  return {static_cast<std::uint8_t>(digit(mcc, 10) << 4U | digit(mcc, 100)),
          static_cast<std::uint8_t>(third << 4U | digit(mcc, 1)), static_cast<std::uint8_t>(second << 4U | first)};
}

}  // namespace quorl::simulator::network
