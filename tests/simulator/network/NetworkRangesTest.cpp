#include <algorithm>
#include <chrono>
#include <cmath>
#include <set>

#include <gtest/gtest.h>

#include "simulator/network/TestScenarios.h"

// The ranges are those of TS 36.133 9.1, TS 36.214, TS 38.133 10.1, TS 38.215, TS 25.133 9.1 and TS 45.008 8.1.

namespace quorl::simulator::network {
namespace {

using namespace std::chrono_literals;

/// Some millions of these are made: what holds costs next to nothing.
void expect(bool isSo, const char* what) {
  if (!isSo) ADD_FAILURE() << what;
}

void expectWithin(Centi value, Centi low, Centi high, const char* what) {
  if (value < low || value > high) ADD_FAILURE() << what << " " << value;
}

void expectRanges(const CellMeasurement& measurement) {
  const Cell& cell = *measurement.cell;
  switch (cell.technology) {
    case Technology::Lte:
      expectWithin(measurement.power, -14000, -4400, "RSRP");
      expectWithin(measurement.quality, -1950, -300, "RSRQ");
      expectWithin(measurement.sinr, -2300, 4000, "SINR");
      expect(cell.physicalId <= 503, "identity");
      break;
    case Technology::Nr:
      expectWithin(measurement.power, -15600, -3100, "SS-RSRP");
      expectWithin(measurement.quality, -4300, 2000, "SS-RSRQ");
      expectWithin(measurement.sinr, -2300, 4000, "SS-SINR");
      expect(cell.physicalId <= 1007, "identity");
      expect(measurement.beam < cell.beams, "beam");
      break;
    case Technology::Umts:
      expectWithin(measurement.power, -12000, -2500, "RSCP");
      expectWithin(measurement.quality, -2400, 0, "Ec/N0");
      expect(cell.physicalId <= 511, "identity");
      break;
    case Technology::Gsm:
      expectWithin(measurement.power, -11000, -4800, "RXLEV");
      expect(cell.physicalId <= 63, "identity");
      break;
    case Technology::None:
      ADD_FAILURE() << "a cell of no technology";
  }
}

/// RSRQ is N times RSRP over RSSI: TS 36.214 5.1.3, TS 38.215 5.1.3. At the ends of its range it is cut.
void expectAgreement(const CellMeasurement& measurement) {
  const Cell& cell = *measurement.cell;
  if (cell.technology != Technology::Lte && cell.technology != Technology::Nr) return;
  const bool isCut = measurement.quality <= -1950 || measurement.quality >= -300 || measurement.power <= -14000;
  if (isCut) return;
  const double blocks = 1000.0 * std::log10(cell.resourceBlocks);
  expect(std::abs(measurement.quality - (blocks + measurement.power - measurement.rssi)) <= 2.0,
         "RSRQ = N RSRP / RSSI");
}

void expectLink(const ServingMeasurement& serving) {
  const Cell& cell = *serving.best.cell;
  expectRanges(serving.best);
  expectAgreement(serving.best);
  Centi strongest = -100000;
  for (std::size_t antenna = 0; antenna < serving.antennas; ++antenna) {
    strongest = std::max(strongest, serving.antennaPower[antenna]);
    expect(serving.antennaSinr[antenna] <= serving.best.sinr, "an antenna's SINR");
    expect(serving.antennaQuality[antenna] <= serving.best.quality, "an antenna's RSRQ");
  }
  expect(strongest == serving.best.power, "the best antenna");
  expect(serving.cqi <= 15, "CQI");
  expect(serving.rank >= 1 && serving.rank <= std::min(cell.txPorts, serving.antennas), "rank");
  if (cell.technology != Technology::Lte && cell.technology != Technology::Nr) return;
  // What is scheduled follows from how well it is received.
  if (serving.best.sinr < 0) {
    expect(serving.rank == 1 && serving.downlink == Modulation::Qpsk, "a bad channel carries little");
  }
  expect(serving.downlink != Modulation::Qam256 || serving.best.sinr > 2200, "256QAM");
  expect(serving.rank < 4 || serving.best.sinr >= 2100, "four layers");
}

TEST(NetworkRangesTest, HoldOverASimulatedDay) {
  Modem modem(shippedScenario("city"), 11);
  std::size_t measurements = 0;
  std::set<Technology> technologies;
  std::set<std::uint8_t> ranks;
  std::set<Modulation> modulations;
  Centi weakest = 0;
  Centi strongest = -20000;
  modem.advance(24h, [&](const ModemEvent& event, const SubscriptionState& state) {
    if (as<event::Measured>(event) == nullptr) return;
    ++measurements;
    ASSERT_TRUE(state.serving);
    technologies.insert(state.technology);
    expectLink(*state.serving);
    weakest = std::min(weakest, state.serving->best.power);
    strongest = std::max(strongest, state.serving->best.power);
    ranks.insert(state.serving->rank);
    modulations.insert(state.serving->downlink);
    for (const CellMeasurement& neighbour : state.neighbours) {
      expectRanges(neighbour);
      expectAgreement(neighbour);
      expect(neighbour.cell != state.serving->best.cell, "its own neighbour");
      expect(neighbour.cell->technology == state.technology, "a neighbour of the same technology");
    }
    for (const CellMeasurement& neighbour : state.otherNeighbours) {
      expectRanges(neighbour);
      expect(neighbour.cell->technology != state.technology, "a neighbour of another technology");
    }
    for (const SecondaryCarrier& carrier : state.carriers) expectLink(carrier.serving);
    if (state.nr) expectLink(state.nr->serving);
    expectWithin(state.transmitPower, -5000, 3300, "transmit power");
    if (state.technology == Technology::Lte) expectWithin(state.transmitPower, -4000, 2300, "LTE transmit power");
    EXPECT_LT(state.surroundings.headingDegrees, 360);
    expectWithin(state.surroundings.radioMilliCelsius, 29000, 46000, "temperature");
  });
  // The day saw everything, or the ranges say little.
  EXPECT_GT(measurements, 100000U);
  EXPECT_EQ(technologies.size(), 4U);
  EXPECT_EQ(ranks.size(), 4U);
  EXPECT_GE(modulations.size(), 4U);
  EXPECT_LT(weakest, -11500);
  EXPECT_GT(strongest, -7000);
}

TEST(NetworkRangesTest, AHistogramCountsEachMeasurementOnce) {
  Modem modem(shippedScenario("city"), 2);
  std::uint64_t measured = 0;
  modem.advance(30min, [&](const ModemEvent& event, const SubscriptionState& state) {
    if (as<event::Measured>(event) != nullptr && event.subscription == 0 && state.technology == Technology::Lte)
      ++measured;
  });
  std::uint64_t counted = 0;
  for (const std::uint64_t bin : modem.state(0).counters.power[0].bins) counted += bin;
  EXPECT_GT(measured, 0U);
  EXPECT_EQ(counted, measured);
}

TEST(NetworkRangesTest, NeighboursAreSortedByStrength) {
  Modem modem(shippedScenario("busy"), 2);
  std::size_t compared = 0;
  modem.advance(10min, [&](const ModemEvent& event, const SubscriptionState& state) {
    if (as<event::Measured>(event) == nullptr) return;
    for (std::size_t i = 1; i < state.neighbours.size(); ++i, ++compared)
      EXPECT_GE(state.neighbours[i - 1].power, state.neighbours[i].power);
  });
  EXPECT_GT(compared, 0U);
}

}  // namespace
}  // namespace quorl::simulator::network
