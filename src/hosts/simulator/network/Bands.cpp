#include "hosts/simulator/network/Bands.h"

#include <algorithm>
#include <array>

namespace quorl::simulator::network {
namespace {

/// Frequencies in 100 kHz, channels as numbered.
struct LteBand {
  std::uint16_t band;
  std::uint32_t downlinkLow;
  std::uint32_t channelLow;
  std::uint32_t channelHigh;
  std::uint32_t uplinkLow;
  std::uint32_t uplinkChannelLow;  // 0: TDD
};
constexpr std::array kLteBands{
    LteBand{1, 21100, 0, 599, 19200, 18000},      LteBand{2, 19300, 600, 1199, 18500, 18600},
    LteBand{3, 18050, 1200, 1949, 17100, 19200},  LteBand{4, 21100, 1950, 2399, 17100, 19950},
    LteBand{5, 8690, 2400, 2649, 8240, 20400},    LteBand{7, 26200, 2750, 3449, 25000, 20750},
    LteBand{8, 9250, 3450, 3799, 8800, 21450},    LteBand{12, 7290, 5010, 5179, 6990, 23010},
    LteBand{13, 7460, 5180, 5279, 7770, 23180},   LteBand{20, 7910, 6150, 6449, 8320, 24150},
    LteBand{25, 19300, 8040, 8689, 18500, 26040}, LteBand{26, 8590, 8690, 9039, 8140, 26690},
    LteBand{38, 25700, 37750, 38249, 25700, 0},   LteBand{39, 18800, 38250, 38649, 18800, 0},
    LteBand{40, 23000, 38650, 39649, 23000, 0},   LteBand{41, 24960, 39650, 41589, 24960, 0},
    LteBand{42, 34000, 41590, 43589, 34000, 0},
};

/// MHz.
struct NrBand {
  std::uint16_t band;
  std::uint32_t low;
  std::uint32_t high;
  std::uint32_t duplexGap;  // downlink above uplink; 0: TDD
};
constexpr std::array kNrBands{
    NrBand{1, 2110, 2170, 190}, NrBand{3, 1805, 1880, 95}, NrBand{7, 2620, 2690, 120},
    NrBand{8, 925, 960, 45},    NrBand{28, 758, 803, 55},  NrBand{38, 2570, 2620, 0},
    NrBand{41, 2496, 2690, 0},  NrBand{77, 3300, 4200, 0}, NrBand{78, 3300, 3800, 0},
};

/// Channels are downlink frequencies in 200 kHz.
struct UmtsBand {
  std::uint16_t band;
  std::uint32_t channelLow;
  std::uint32_t channelHigh;
  std::uint32_t duplexGap;  // MHz
};
constexpr std::array kUmtsBands{UmtsBand{1, 10562, 10838, 190}, UmtsBand{2, 9662, 9938, 80},
                                UmtsBand{5, 4357, 4458, 45}, UmtsBand{8, 2937, 3088, 45}};
/// Bands V and VIII count from an offset: TS 25.101 table 5.1, 0 and 340 MHz.
constexpr std::uint32_t umtsOffsetKhz(std::uint16_t band) {
  return band == 8 ? 340000U : 0U;
}

struct GsmBand {
  std::uint16_t band;
  std::uint32_t channelLow;
  std::uint32_t channelHigh;
  std::uint32_t uplinkLowKhz;  // of channelLow
  std::uint32_t duplexGapKhz;
};
constexpr std::array kGsmBands{GsmBand{850, 128, 251, 824200, 45000}, GsmBand{900, 1, 124, 890200, 45000},
                               GsmBand{1800, 512, 885, 1710200, 95000}, GsmBand{1900, 512, 810, 1850200, 80000}};

template <typename Bands>
auto bandOf(const Bands& bands, std::uint16_t number) -> const typename Bands::value_type* {
  const auto found = std::find_if(bands.begin(), bands.end(), [&](const auto& band) { return band.band == number; });
  return found == bands.end() ? nullptr : &*found;
}

std::optional<ChannelFrequencies> lte(std::uint16_t number, std::uint32_t channel) {
  const LteBand* band = bandOf(kLteBands, number);
  if (band == nullptr || channel < band->channelLow || channel > band->channelHigh) return std::nullopt;
  const std::uint32_t above = channel - band->channelLow;
  ChannelFrequencies result;
  result.isTdd = band->uplinkChannelLow == 0;
  result.downlinkKhz = (band->downlinkLow + above) * 100;
  result.uplinkKhz = (band->uplinkLow + above) * 100;
  result.uplinkChannel = result.isTdd ? channel : band->uplinkChannelLow + above;
  return result;
}

std::uint32_t nrKhz(std::uint32_t channel) {
  return channel < 600000 ? channel * 5 : 3000000 + (channel - 600000) * 15;
}

std::optional<ChannelFrequencies> nr(std::uint16_t number, std::uint32_t channel) {
  const NrBand* band = bandOf(kNrBands, number);
  if (band == nullptr || channel > 2016666) return std::nullopt;  // above: FR2
  ChannelFrequencies result;
  result.downlinkKhz = nrKhz(channel);
  if (result.downlinkKhz < band->low * 1000 || result.downlinkKhz > band->high * 1000) return std::nullopt;
  result.isTdd = band->duplexGap == 0;
  result.uplinkKhz = result.downlinkKhz - band->duplexGap * 1000;
  result.uplinkChannel = channel - band->duplexGap * 200;  // all FDD bands lie below 3 GHz
  return result;
}

std::optional<ChannelFrequencies> umts(std::uint16_t number, std::uint32_t channel) {
  const UmtsBand* band = bandOf(kUmtsBands, number);
  if (band == nullptr || channel < band->channelLow || channel > band->channelHigh) return std::nullopt;
  ChannelFrequencies result;
  result.downlinkKhz = channel * 200 + umtsOffsetKhz(number);
  result.uplinkKhz = result.downlinkKhz - band->duplexGap * 1000;
  result.uplinkChannel = channel - band->duplexGap * 5;
  return result;
}

std::optional<ChannelFrequencies> gsm(std::uint16_t number, std::uint32_t channel) {
  const GsmBand* band = bandOf(kGsmBands, number);
  if (band == nullptr || channel < band->channelLow || channel > band->channelHigh) return std::nullopt;
  ChannelFrequencies result;
  result.uplinkKhz = band->uplinkLowKhz + (channel - band->channelLow) * 200;
  result.downlinkKhz = result.uplinkKhz + band->duplexGapKhz;
  result.uplinkChannel = channel;
  return result;
}

struct Width {
  std::uint16_t mhzX10;
  std::uint16_t blocks;
};
constexpr std::array kLteWidths{Width{14, 6},   Width{30, 15},  Width{50, 25},
                                Width{100, 50}, Width{150, 75}, Width{200, 100}};
constexpr std::array kNrWidths15{Width{50, 25}, Width{100, 52}, Width{150, 79}, Width{200, 106}};
constexpr std::array kNrWidths30{Width{200, 51},  Width{400, 106}, Width{500, 133}, Width{600, 162},
                                 Width{800, 217}, Width{900, 245}, Width{1000, 273}};

template <typename Widths>
std::optional<std::uint16_t> blocksOf(const Widths& widths, std::uint16_t mhzX10) {
  const auto found =
      std::find_if(widths.begin(), widths.end(), [&](const Width& width) { return width.mhzX10 == mhzX10; });
  if (found == widths.end()) return std::nullopt;
  return found->blocks;
}

std::optional<std::uint16_t> none(bool isRight) {
  return isRight ? std::optional<std::uint16_t>(0) : std::nullopt;
}

}  // namespace

std::optional<ChannelFrequencies> frequencies(Technology technology, std::uint16_t band, std::uint32_t channel) {
  switch (technology) {
    case Technology::None:
      return std::nullopt;
    case Technology::Gsm:
      return gsm(band, channel);
    case Technology::Umts:
      return umts(band, channel);
    case Technology::Lte:
      return lte(band, channel);
    case Technology::Nr:
      return nr(band, channel);
  }
  return std::nullopt;
}

std::optional<std::uint16_t> resourceBlocks(Technology technology, std::uint16_t bandwidthMhzX10, bool isTdd) {
  switch (technology) {
    case Technology::None:
      return std::nullopt;
    case Technology::Gsm:
      return none(bandwidthMhzX10 == 2);
    case Technology::Umts:
      return none(bandwidthMhzX10 == 50);
    case Technology::Lte:
      return blocksOf(kLteWidths, bandwidthMhzX10);
    case Technology::Nr:
      return isTdd ? blocksOf(kNrWidths30, bandwidthMhzX10) : blocksOf(kNrWidths15, bandwidthMhzX10);
  }
  return std::nullopt;
}

}  // namespace quorl::simulator::network
