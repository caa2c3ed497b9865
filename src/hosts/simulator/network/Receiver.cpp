#include "hosts/simulator/network/Receiver.h"

#include <algorithm>
#include <cstddef>

#include "hosts/simulator/network/Arithmetic.h"
#include "hosts/simulator/network/LinkAdaptation.h"

namespace quorl::simulator::network {
namespace {

constexpr double kNoiseFigure = 7.0;
/// Thermal noise of -174 dBm/Hz over one subcarrier, the 3.84 MHz of UMTS, and the 200 kHz of GSM.
constexpr double kNoiseSubcarrier = -132.24 + kNoiseFigure;
constexpr double kNoiseUmts = -108.16 + kNoiseFigure;
constexpr double kNoiseGsm = -120.99 + kNoiseFigure;
/// Errors of transmitter and receiver keep the ratio below 32 dB however strong the cell is.
constexpr double kOwnDistortion = 0.00063;

constexpr double kWeakestFound = -127.0;
/// Cells of one frequency that a search tells apart in one round.
constexpr std::size_t kMostLookedAt = 6;

struct Range {
  double low;
  double high;
};
constexpr Range powerRange(Technology technology) {
  switch (technology) {
    case Technology::Gsm:
      return {-110.0, -48.0};
    case Technology::Umts:
      return {-120.0, -25.0};
    case Technology::Lte:
      return {-140.0, -44.0};
    case Technology::None:
    case Technology::Nr:
      break;
  }
  return {-156.0, -31.0};
}
constexpr Range qualityRange(Technology technology) {
  switch (technology) {
    case Technology::Umts:
      return {-24.0, 0.0};
    case Technology::Lte:
      return {-19.5, -3.0};
    case Technology::None:
    case Technology::Gsm:
    case Technology::Nr:
      break;
  }
  return {-43.0, 20.0};
}
constexpr Range kSinrRange{-23.0, 40.0};

Centi within(double value, Range range) {
  return toCenti(std::clamp(value, range.low, range.high));
}

double noiseOf(const Cell& cell) {
  switch (cell.technology) {
    case Technology::Gsm:
      return kNoiseGsm;
    case Technology::Umts:
      return kNoiseUmts;
    case Technology::None:
    case Technology::Lte:
    case Technology::Nr:
      break;
  }
  return kNoiseSubcarrier + (cell.subCarrierSpacingKhz == 30 ? 3.01 : 0.0);
}

/// Share of a cell's resource elements that carry power in a symbol with reference signals: of 12 in a block, 4 are
/// those of two ports, the others follow the load. UMTS: all channels together over the CPICH, a tenth of the carrier.
double occupancy(Technology technology, double load) {
  switch (technology) {
    case Technology::Umts:
      return 10.0 * (0.2 + 0.8 * load);
    case Technology::Lte:
    case Technology::Nr:
      return (4.0 + 8.0 * load) / 12.0;
    case Technology::None:
    case Technology::Gsm:
      break;
  }
  return 1.0;
}

/// Weakest that a search finds: TS 36.133 clause 8.1.2.2 and its kin.
bool isFindable(const CellMeasurement& measurement) {
  switch (measurement.cell->technology) {
    case Technology::Gsm:
      return measurement.power > -10800;
    case Technology::Umts:
      return measurement.power > -11700 && measurement.quality > -2000;
    case Technology::Lte:
    case Technology::Nr:
      return measurement.power > -12700 && measurement.sinr > -1000;
    case Technology::None:
      break;
  }
  return false;
}

bool isStronger(const CellMeasurement& left, const CellMeasurement& right) {
  return left.power != right.power ? left.power > right.power : left.cell->index < right.cell->index;
}

}  // namespace

Receiver::Receiver(const Network& network, RadioField& field, std::uint64_t seed, std::uint8_t subscription)
    : network_(network),
      field_(field),
      antennas_(seed, 10U + subscription),
      heard_(network.cells().size()),
      channelPower_(network.channels()),
      channelInterference_(network.channels()),
      heardOn_(network.channels()) {
  for (const Cell& cell : network.cells()) noise_.push_back(fromDecibels(noiseOf(cell)));
}

void Receiver::listen(const std::vector<std::uint8_t>& operators, const Surroundings& place, SimulatedMs nowMs,
                      double load, bool isConnected) {
  nowMs_ = nowMs;
  load_ = load;
  std::fill(channelPower_.begin(), channelPower_.end(), 0.0);
  std::fill(channelInterference_.begin(), channelInterference_.end(), 0.0);
  for (auto& list : heardOn_) list.clear();
  // Filter coefficient 4 of TS 36.331 for a connection; rounds in idle are six times as far apart.
  const double share = isConnected ? 0.5 : 0.8;
  for (const std::uint8_t number : operators)
    for (const RadioField::Received& received : field_.receive(number, place, nowMs)) hear(received, share);
  find();
}

void Receiver::hear(const RadioField::Received& received, double share) {
  Heard& heard = heard_[received.cell];
  const bool isFresh = !heard.isHeard || nowMs_ - heard.atMs > 3000;
  heard.power = isFresh ? received.power : heard.power + share * (received.power - heard.power);
  heard.linear = fromCentiDecibels(toCenti(heard.power));
  heard.atMs = nowMs_;
  heard.beam = received.beam;
  heard.isHeard = true;
  const Cell& cell = network_.cell(received.cell);
  const std::uint16_t channel = network_.sector(received.cell).channelIndex;
  channelPower_[channel] += heard.linear * occupancy(cell.technology, load_);
  channelInterference_[channel] += heard.linear * (0.1 + 0.9 * load_);
  if (heard.power > kWeakestFound) heardOn_[channel].push_back(received.cell);
}

void Receiver::find() {
  for (auto& list : found_) list.clear();
  for (std::vector<std::uint16_t>& cells : heardOn_) {
    const auto last = cells.begin() + static_cast<std::ptrdiff_t>(std::min(cells.size(), kMostLookedAt));
    std::partial_sort(cells.begin(), last, cells.end(), [this](std::uint16_t left, std::uint16_t right) {
      const double one = heard_[left].power;
      const double other = heard_[right].power;
      return one != other ? one > other : left < right;
    });
    for (auto cell = cells.begin(); cell != last; ++cell) {
      const CellMeasurement measurement = measure(network_.cell(*cell));
      if (isFindable(measurement))
        found_[static_cast<std::size_t>(measurement.cell->technology)].push_back(measurement);
    }
  }
  for (auto& list : found_) std::sort(list.begin(), list.end(), isStronger);
}

const std::vector<CellMeasurement>& Receiver::found(Technology technology) const {
  return found_[static_cast<std::size_t>(technology)];
}

CellMeasurement Receiver::measure(const Cell& cell) const {
  const Heard& heard = heard_[cell.index];
  const bool isHeard = heard.isHeard && heard.atMs == nowMs_;
  const Range powers = powerRange(cell.technology);
  const double power = isHeard ? heard.power : powers.low;
  const double linear = isHeard ? heard.linear : fromDecibels(power);
  const double noise = noise_[cell.index];
  const std::uint16_t channel = network_.sector(cell.index).channelIndex;
  CellMeasurement result;
  result.cell = &cell;
  result.beam = heard.beam;
  result.power = within(power, powers);

  const double own = isHeard ? linear * (0.1 + 0.9 * load_) : 0.0;
  const double disturbance = std::max(0.0, channelInterference_[channel] - own) + noise;
  result.sinr = within(-toDecibels(disturbance / linear + kOwnDistortion), kSinrRange);

  const double received = channelPower_[channel] + noise;
  switch (cell.technology) {
    case Technology::Lte:
    case Technology::Nr: {
      // TS 36.214 5.1.3: RSRQ is N times RSRP over RSSI, which covers all 12 subcarriers of N blocks.
      const double perElement = isHeard ? received : received + linear;
      result.quality = within(toDecibels(linear / perElement) - 10.7918, qualityRange(cell.technology));
      result.rssi = toCenti(toDecibels(12.0 * cell.resourceBlocks * perElement));
      break;
    }
    case Technology::Umts:  // TS 25.215 5.1.5: Ec/N0 is RSCP over RSSI
      result.quality = within(toDecibels(linear / received), qualityRange(cell.technology));
      result.sinr = std::max(result.quality, within(-100.0, kSinrRange));
      result.rssi = toCenti(toDecibels(received));
      break;
    case Technology::None:
    case Technology::Gsm:
      result.rssi = toCenti(toDecibels(received));
      break;
  }
  return result;
}

ServingMeasurement Receiver::serve(const Cell& cell) {
  ServingMeasurement result;
  result.best = measure(cell);
  // Antennas fade apart from each other and slowly.
  double best = -100;
  for (double& state : antennaState_) {
    state = 0.85 * state + 1.05 * antennas_.normal();
    best = std::max(best, state);
  }
  // Below 1 GHz the phone has no room for four.
  result.antennas = cell.downlinkKhz > 1000000 ? 4 : 2;
  const double bestInUse = result.antennas == 4 ? best : std::max(antennaState_[0], antennaState_[1]);
  const Range powers = powerRange(cell.technology);
  const Range qualities = qualityRange(cell.technology);
  for (std::size_t i = 0; i < result.antennas; ++i) {
    const double below = antennaState_[i] - bestInUse;
    result.antennaPower[i] = within(result.best.power / 100.0 + below, powers);
    // What disturbs fades with the wanted cell for the most part.
    result.antennaQuality[i] = within(result.best.quality / 100.0 + 0.2 * below, qualities);
    result.antennaSinr[i] = within(result.best.sinr / 100.0 + 0.4 * below, kSinrRange);
  }
  result.pathLoss = network_.sector(cell.index).elementPower - result.best.power;
  adaptLink(result, cell, load_);
  return result;
}

}  // namespace quorl::simulator::network
