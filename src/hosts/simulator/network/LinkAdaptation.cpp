#include "hosts/simulator/network/LinkAdaptation.h"

#include <algorithm>
#include <array>
#include <cstddef>

#include "hosts/simulator/network/Arithmetic.h"

namespace quorl::simulator::network {
namespace {

/// TS 36.213 table 7.2.3-2: modulation and efficiency of CQI 1 to 15, and the SINR at which three quarters of the
/// channel's capacity give that efficiency, 1/100 dB.
struct Quality {
  Modulation modulation;
  double efficiency;  // bits for each symbol
  Centi sinr;
};
constexpr std::array kQualities{
    Quality{Modulation::Qpsk, 0.1523, -820},   Quality{Modulation::Qpsk, 0.3770, -380},
    Quality{Modulation::Qpsk, 0.8770, 100},    Quality{Modulation::Qam16, 1.4766, 460},
    Quality{Modulation::Qam16, 1.9141, 690},   Quality{Modulation::Qam16, 2.4063, 920},
    Quality{Modulation::Qam64, 2.7305, 1060},  Quality{Modulation::Qam64, 3.3223, 1310},
    Quality{Modulation::Qam64, 3.9023, 1550},  Quality{Modulation::Qam64, 4.5234, 1810},
    Quality{Modulation::Qam64, 5.1152, 2050},  Quality{Modulation::Qam256, 5.5547, 2230},
    Quality{Modulation::Qam256, 6.2266, 2500}, Quality{Modulation::Qam256, 6.9141, 2770},
    Quality{Modulation::Qam256, 7.4063, 2970},
};

std::uint8_t qualityIndicator(Centi sinr) {
  std::uint8_t cqi = 0;
  while (cqi < kQualities.size() && sinr >= kQualities[cqi].sinr) ++cqi;
  return cqi;
}

/// Layers share the power and disturb each other, so each further one needs a better channel.
std::uint8_t rankFor(Centi sinr, std::uint8_t most) {
  constexpr std::array<Centi, 4> kNeeded{-10000, 900, 1600, 2100};
  std::uint8_t rank = 1;
  while (rank < most && rank < kNeeded.size() && sinr >= kNeeded[rank]) ++rank;
  return rank;
}

Modulation uplinkModulation(Centi pathLoss) {
  if (pathLoss < 9500) return Modulation::Qam256;
  if (pathLoss < 11000) return Modulation::Qam64;
  if (pathLoss < 12500) return Modulation::Qam16;
  return Modulation::Qpsk;
}

std::uint32_t kbps(double megahertz, double efficiency) {
  return static_cast<std::uint32_t>(megahertz * efficiency * 1000.0);
}

}  // namespace

void adaptLink(ServingMeasurement& serving, const Cell& cell, double load) {
  const Centi sinr = serving.best.sinr;
  serving.uplink = Modulation::Qpsk;
  serving.downlink = Modulation::Qpsk;
  serving.rank = 1;
  const double share = 1.0 - 0.8 * load;
  switch (cell.technology) {
    case Technology::None:
      return;
    case Technology::Gsm:  // EDGE
      serving.cqi = 0;
      serving.downlinkKbps = sinr > 1500 ? 118 : 59;
      serving.uplinkKbps = serving.downlinkKbps / 4;
      return;
    case Technology::Umts: {  // HSPA: 30 steps of a dB in the original, told in the same 15 as LTE
      serving.cqi = static_cast<std::uint8_t>(std::clamp((serving.best.quality + 2000) / 120, 0, 15));
      serving.downlink = serving.cqi > 8 ? Modulation::Qam16 : Modulation::Qpsk;
      serving.downlinkKbps = static_cast<std::uint32_t>(serving.cqi * 900 * share);
      serving.uplinkKbps = serving.downlinkKbps / 3;
      return;
    }
    case Technology::Lte:
    case Technology::Nr:
      break;
  }
  serving.cqi = qualityIndicator(sinr);
  serving.rank = rankFor(sinr, std::min(cell.txPorts, serving.antennas));
  // A layer's own share of the power sets its modulation.
  constexpr std::array<Centi, 5> kSplit{0, 0, 300, 477, 602};
  const std::uint8_t perLayer = qualityIndicator(sinr - kSplit[serving.rank]);
  const std::size_t step = perLayer == 0 ? 0 : perLayer - 1U;
  serving.downlink = kQualities[step].modulation;
  serving.uplink = std::min(uplinkModulation(serving.pathLoss), Modulation::Qam256);
  const double megahertz = cell.bandwidthMhzX10 / 10.0 * (cell.isTdd ? 0.7 : 1.0);
  serving.downlinkKbps = perLayer == 0 ? 0 : kbps(megahertz, kQualities[step].efficiency * serving.rank * 0.75 * share);
  serving.uplinkKbps = kbps(cell.bandwidthMhzX10 / 10.0 * (cell.isTdd ? 0.25 : 0.4),
                            serving.uplink == Modulation::Qpsk ? 0.5 : 1.5 * share);
}

UplinkPower uplinkPower(const Cell& cell, Centi pathLoss, std::uint16_t blocks) {
  UplinkPower power;
  switch (cell.technology) {
    case Technology::None:
      break;
    case Technology::Gsm:
      power.total = std::clamp<Centi>(pathLoss - 10500 + 1300, 500, 3300);
      power.control = power.total;
      break;
    case Technology::Umts:
      power.control = std::clamp<Centi>(pathLoss - 11800, -5000, 2100);
      power.total = std::min<Centi>(power.control + 300, 2400);
      break;
    case Technology::Lte:
    case Technology::Nr: {
      const Centi wide = toCenti(toDecibels(static_cast<double>(std::max<std::uint16_t>(1, blocks))));
      power.total = std::clamp<Centi>(-9000 + wide + pathLoss * 8 / 10, -4000, 2300);
      power.control = std::clamp<Centi>(-10500 + pathLoss, -4000, 2300);
      break;
    }
  }
  return power;
}

}  // namespace quorl::simulator::network
