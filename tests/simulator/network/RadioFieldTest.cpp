#include <cmath>
#include <numbers>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "hosts/simulator/network/Bands.h"
#include "hosts/simulator/network/PathLoss.h"
#include "hosts/simulator/network/RadioField.h"
#include "hosts/simulator/network/Route.h"
#include "simulator/network/TestScenarios.h"

namespace quorl::simulator::network {
namespace {

TEST(PathLossTest, FollowsTheTablesOfTr38901) {
  // Urban macro, 2 GHz, site of 25 m: 28.0 + 22 log(d) + 20 log(f), beyond the break point 40 log(d).
  const PathLoss urban(Environment::UrbanMacro, 2.0, 25.0);
  EXPECT_NEAR(urban.inSight(100, std::log10(102.7)), 28.0 + 22.0 * std::log10(102.7) + 20.0 * std::log10(2.0), 0.01);
  const double breakPoint = 4.0 * 24.0 * 0.5 * 2.0e9 / 299792458.0;
  const double far =
      28.0 + 40.0 * std::log10(2000) + 20.0 * std::log10(2.0) - 9.0 * std::log10(breakPoint * breakPoint + 23.5 * 23.5);
  EXPECT_NEAR(urban.inSight(2000, std::log10(2000)), far, 0.01);
  EXPECT_NEAR(urban.outOfSight(500, std::log10(500)), 13.54 + 39.08 * std::log10(500) + 20.0 * std::log10(2.0), 0.01);

  const PathLoss street(Environment::StreetCanyon, 3.5, 10.0);
  EXPECT_NEAR(street.inSight(50, std::log10(50)), 32.4 + 21.0 * std::log10(50) + 20.0 * std::log10(3.5), 0.01);
  EXPECT_NEAR(street.outOfSight(200, std::log10(200)), 22.4 + 35.3 * std::log10(200) + 21.3 * std::log10(3.5), 0.01);

  const PathLoss rural(Environment::RuralMacro, 0.8, 35.0);
  const double roofs = std::pow(5.0, 1.72);
  const double near = 20.0 * std::log10(40.0 * std::numbers::pi * 500 * 0.8 / 3.0) + 0.03 * roofs * std::log10(500) -
                      0.044 * roofs + 0.002 * std::log10(5.0) * 500;
  EXPECT_NEAR(rural.inSight(500, std::log10(500)), near, 0.01);
  const double hidden = 161.04 - 7.1 * std::log10(20.0) + 7.5 * std::log10(5.0) -
                        (24.37 - 3.7 * (5.0 / 35.0) * (5.0 / 35.0)) * std::log10(35.0) +
                        (43.42 - 3.1 * std::log10(35.0)) * (std::log10(4000) - 3.0) + 20.0 * std::log10(0.8) -
                        (3.2 * std::pow(std::log10(11.75 * 1.5), 2) - 4.97);
  EXPECT_NEAR(rural.outOfSight(4000, std::log10(4000)), hidden, 0.01);
}

TEST(PathLossTest, SightGetsRarerWithTheDistance) {
  for (const auto environment : {Environment::UrbanMacro, Environment::StreetCanyon, Environment::RuralMacro}) {
    EXPECT_EQ(PathLoss::chanceOfSight(environment, 5), 1.0);
    double last = 1.0;
    for (double metres = 20; metres < 3000; metres *= 1.5) {
      const double chance = PathLoss::chanceOfSight(environment, metres);
      EXPECT_LT(chance, last);
      EXPECT_GT(chance, 0.0);
      last = chance;
    }
  }
}

TEST(BandsTest, ChannelsStandForTheirFrequencies) {
  const auto lte = frequencies(Technology::Lte, 3, 1300);
  ASSERT_TRUE(lte);
  EXPECT_EQ(lte->downlinkKhz, 1815000U);
  EXPECT_EQ(lte->uplinkKhz, 1720000U);
  EXPECT_EQ(lte->uplinkChannel, 19300U);
  const auto nr = frequencies(Technology::Nr, 78, 636666);
  ASSERT_TRUE(nr);
  EXPECT_EQ(nr->downlinkKhz, 3549990U);
  EXPECT_TRUE(nr->isTdd);
  EXPECT_EQ(nr->uplinkChannel, 636666U);
  const auto low = frequencies(Technology::Nr, 28, 155000);
  ASSERT_TRUE(low);
  EXPECT_EQ(low->downlinkKhz, 775000U);
  EXPECT_EQ(low->uplinkKhz, 720000U);
  EXPECT_EQ(low->uplinkChannel, 144000U);
  const auto umts = frequencies(Technology::Umts, 8, 3012);
  ASSERT_TRUE(umts);
  EXPECT_EQ(umts->downlinkKhz, 942400U);
  EXPECT_EQ(umts->uplinkChannel, 2787U);
  const auto gsm = frequencies(Technology::Gsm, 900, 62);
  ASSERT_TRUE(gsm);
  EXPECT_EQ(gsm->downlinkKhz, 947400U);
  EXPECT_FALSE(frequencies(Technology::Lte, 3, 300));
  EXPECT_FALSE(frequencies(Technology::Nr, 78, 155000));
  EXPECT_FALSE(frequencies(Technology::Umts, 3, 1));
}

TEST(RouteTest, GoesFromPointToPointAndWaits) {
  const Scenario scenario = scenarioOf(
      "network n 001-01 N\nlayer n b3 lte band=3 channel=1300 width=20\nsite n 0 0 layers=b3 area=1\nsim 1 n\n"
      "route return\npoint 0 0 speed=36\npoint 100 0 speed=36 wait=5\npoint 100 50 speed=18\n");
  const Route route(scenario);
  EXPECT_NEAR(route.at(5000).x, 50, 0.01);
  EXPECT_NEAR(route.at(5000).metresPerSecond, 10, 0.01);
  EXPECT_NEAR(route.at(12000).x, 100, 0.01);
  EXPECT_EQ(route.at(12000).metresPerSecond, 0);
  EXPECT_NEAR(route.at(20000).y, 25, 0.01);
  EXPECT_NEAR(route.at(25000 + 2500).y, 37.5, 0.01) << "on its way back";
  double last = 0;
  for (SimulatedMs time = 0; time < 200000; time += 700) {
    const double travelled = route.at(time).metresTravelled;
    EXPECT_GE(travelled, last);
    last = travelled;
  }
  EXPECT_GT(last, 900);
}

/// One site with two cells, which send alike in all directions; tests put the phone where they want it.
constexpr const char* kPlain = R"(
network n 001-01 N
layer n b3 lte band=3 channel=1300 width=20
layer n b20 lte band=20 channel=6300 width=10
site n 0 0 layers=b3,b20 area=1 sectors=none
sim 1 n
point 0 1500
)";

constexpr const char* kHall = "zone hall -5000 300 5000 350 loss=20\n";

/// What is received of a cell, in dBm; -200 where it is too weak to be received.
double powerAt(RadioField& field, const Surroundings& place, SimulatedMs now, std::uint16_t cell) {
  for (const RadioField::Received& received : field.receive(0, place, now))
    if (received.cell == cell) return received.power;
  return -200;
}

TEST(RadioFieldTest, ShadowsAreAlikeNearbyAndNotFurtherOn) {
  const Scenario scenario = scenarioOf(kPlain);
  const Network network(scenario);
  // Samples every 10 m on a circle around the site: the distance never changes.
  std::vector<double> levels;
  RadioField field(scenario, network, 5);
  Surroundings place;
  for (int i = 0; i < 30000; ++i) {
    const double angle = i * 10.0 / 1500.0;
    place.x = 1500.0 * std::cos(angle);
    place.y = 1500.0 * std::sin(angle);
    place.metresTravelled = i * 10.0;
    place.motion = MotionState::Driving;
    levels.push_back(powerAt(field, place, static_cast<SimulatedMs>(i), 0));
  }
  double mean = 0;
  for (const double level : levels) mean += level / static_cast<double>(levels.size());
  const auto correlation = [&](std::size_t lag) {
    double product = 0;
    double variance = 0;
    for (std::size_t i = 0; i + lag < levels.size(); ++i) {
      product += (levels[i] - mean) * (levels[i + lag] - mean);
      variance += (levels[i] - mean) * (levels[i] - mean);
    }
    return product / variance;
  };
  // exp(-d / 50 m), somewhat less for the fast variation.
  EXPECT_NEAR(correlation(1), 0.80, 0.08);
  EXPECT_NEAR(correlation(5), 0.36, 0.08);
  EXPECT_NEAR(correlation(30), 0.0, 0.08);
}

TEST(RadioFieldTest, AskedTwiceAtOneTimeItAnswersTheSame) {
  const Scenario scenario = scenarioOf(kPlain);
  const Network network(scenario);
  RadioField field(scenario, network, 5);
  Surroundings place;
  place.y = 700;
  const double first = powerAt(field, place, 10, 0);
  EXPECT_EQ(powerAt(field, place, 10, 0), first);
  EXPECT_NE(powerAt(field, place, 20, 0), first);
}

TEST(RadioFieldTest, WallsTakeMoreOfHighFrequencies) {
  const Scenario scenario = scenarioOf(std::string(kPlain) + kHall);
  const Network network(scenario);
  double outside = 0;
  double inside = 0;
  for (std::uint64_t seed = 0; seed < 400; ++seed) {
    RadioField field(scenario, network, seed);
    Surroundings place;
    place.y = 299;
    outside += powerAt(field, place, 0, 1) - powerAt(field, place, 0, 0);
    place.y = 301;
    inside += powerAt(field, place, 1, 1) - powerAt(field, place, 1, 0);
  }
  // 20 dB at 2 GHz are 18.8 dB at 1.815 GHz and 12.7 dB at 0.806 GHz.
  EXPECT_NEAR((inside - outside) / 400, 6.2, 0.5);
}

TEST(RadioFieldTest, AMastInTheSameHallIsNotBehindItsWalls) {
  const Scenario scenario =
      scenarioOf(std::string(kPlain) + kHall + "site n 0 325 layers=b3 area=1 sectors=none height=5\n");
  const Network network(scenario);
  RadioField field(scenario, network, 1);
  Surroundings place;
  place.x = 40;
  place.y = 325;
  EXPECT_GT(powerAt(field, place, 0, 2), -75);
}

TEST(RadioFieldTest, NothingArrivesStrongerThanTheLeastCouplingLossAllows) {
  const Scenario scenario = scenarioOf(kPlain);
  const Network network(scenario);
  for (std::uint64_t seed = 0; seed < 50; ++seed) {
    RadioField field(scenario, network, seed);
    const double most = network.sector(0).elementPower / 100.0 - 70.0;
    const double power = powerAt(field, Surroundings{}, 0, 0);
    EXPECT_LE(power, most);
    EXPECT_GT(power, most - 30.0) << "below the mast";
  }
}

}  // namespace
}  // namespace quorl::simulator::network
