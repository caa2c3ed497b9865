#include <algorithm>
#include <chrono>
#include <cstdint>
#include <map>
#include <string>

#include <gtest/gtest.h>

#include "simulator/network/TestScenarios.h"

namespace quorl::simulator::network {
namespace {

using namespace std::chrono_literals;

/// FNV-1a over everything that a listener can see and that is a number.
class Fingerprint {
 public:
  void add(const ModemEvent& event, const SubscriptionState& state) {
    add(event.atMs);
    add(event.body.index());
    add(event.subscription);
    add(static_cast<std::uint64_t>(state.rrc));
    add(static_cast<std::uint64_t>(state.service));
    add(static_cast<std::uint64_t>(state.transmitPower));
    add(static_cast<std::uint64_t>(static_cast<std::int64_t>(state.surroundings.x * 100.0)));
    add(static_cast<std::uint64_t>(state.surroundings.radioMilliCelsius));
    add(state.counters.downlinkBytes);
    add(state.registration.temporaryId);
    if (state.serving) add(*state.serving);
    if (state.nr) add(state.nr->serving);
    for (const CellMeasurement& neighbour : state.neighbours) add(neighbour);
    for (const CellMeasurement& neighbour : state.otherNeighbours) add(neighbour);
    for (const SecondaryCarrier& carrier : state.carriers) add(carrier.serving);
  }
  std::uint64_t value() const { return value_; }

 private:
  void add(std::uint64_t number) { value_ = (value_ ^ number) * 1099511628211ULL; }
  void add(const CellMeasurement& measurement) {
    add(measurement.cell->index);
    for (const Centi level : {measurement.power, measurement.quality, measurement.sinr, measurement.rssi})
      add(static_cast<std::uint64_t>(level));
    add(measurement.beam);
  }
  void add(const ServingMeasurement& serving) {
    add(serving.best);
    for (const Centi level : serving.antennaPower) add(static_cast<std::uint64_t>(level));
    add(serving.cqi);
    add(serving.rank);
    add(serving.downlinkKbps);
  }

  std::uint64_t value_ = 14695981039346656037ULL;
};

std::uint64_t fingerprint(const std::string& scenario, std::uint64_t seed, std::chrono::milliseconds step) {
  Modem modem(shippedScenario(scenario), seed);
  Fingerprint result;
  for (std::chrono::milliseconds passed = 0ms; passed < 10min; passed += step)
    modem.advance(std::min<std::chrono::milliseconds>(step, 10min - passed),
                  [&](const ModemEvent& event, const SubscriptionState& state) { result.add(event, state); });
  return result.value();
}

TEST(NetworkRepeatTest, ASeedGivesTheSameOnEveryMachine) {
  // Made once; another number here means that recordings made before cannot be made again.
  const std::map<std::string, std::uint64_t> pinned{
      {"busy", 6856014306209371174ULL},        {"city", 3712855240620793831ULL},
      {"dual-sim", 11688644895166086239ULL},   {"hostile", 10552994239886508067ULL},
      {"motorway", 6644619916473110083ULL},    {"tunnel", 13857353788868773432ULL},
      {"weak-indoor", 9727911697473763457ULL},
  };
  for (const char* name : kShippedScenarios) EXPECT_EQ(fingerprint(name, 7, 10min), pinned.at(name)) << name;
}

TEST(NetworkRepeatTest, HowTheTimeIsCutMakesNoDifference) {
  EXPECT_EQ(fingerprint("tunnel", 5, 10min), fingerprint("tunnel", 5, 137ms));
}

TEST(NetworkRepeatTest, AnotherSeedIsAnotherDrive) {
  EXPECT_NE(fingerprint("city", 1, 10min), fingerprint("city", 2, 10min));
}

}  // namespace
}  // namespace quorl::simulator::network
