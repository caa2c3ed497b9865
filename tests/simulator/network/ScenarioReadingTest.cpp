#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <utility>
#include <variant>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "hosts/simulator/ScenarioFiles.h"
#include "simulator/network/TestScenarios.h"
#include "support/TemporaryDirectory.h"

namespace quorl::simulator::network {
namespace {

using ::testing::ElementsAre;
using ::testing::ElementsAreArray;
using ::testing::IsEmpty;
using ::testing::SizeIs;

constexpr const char* kSmall = R"(
about "One site"
network north 001-01 "Testnet North"
layer north b3 lte band=3 channel=1300 width=20
site north 0 0 layers=b3 area=4097
point 100 0
sim 1 north
)";

std::vector<std::string> problems(const std::string& text) {
  std::istringstream input(text);
  std::vector<std::string> texts;
  for (const ScenarioProblem& problem : readScenario(input, "test.scenario").problems)
    texts.push_back(logText(problem));
  return texts;
}

TEST(ScenarioReadingTest, TheShippedScenariosRead) {
  EXPECT_THAT(scenarioNames({QUORL_SOURCE_DIR "/resources"}), ElementsAreArray(kShippedScenarios));
  for (const char* name : kShippedScenarios) {
    const Scenario scenario = shippedScenario(name);
    EXPECT_EQ(scenario.name, name);
    EXPECT_FALSE(scenario.about.empty()) << name;
    for (const Operator& network : scenario.operators) EXPECT_EQ(network.plmn.mcc, 1) << "not a test network: " << name;
  }
}

TEST(ScenarioReadingTest, WhatIsLeftOutHasItsUsualValue) {
  const Scenario scenario = scenarioOf(kSmall);
  EXPECT_EQ(scenario.name, "test");
  EXPECT_EQ(scenario.about, "One site");
  EXPECT_EQ(scenario.environment, Environment::UrbanMacro);
  ASSERT_EQ(scenario.sites.size(), 1U);
  EXPECT_THAT(scenario.sites[0].azimuths, ElementsAre(0, 120, 240));
  EXPECT_EQ(scenario.sites[0].height, 25);
  EXPECT_EQ(scenario.layers[0].priority, 5);
  EXPECT_EQ(scenario.layers[0].power, 4600);
  EXPECT_EQ(scenario.routeEnd, RouteEnd::Stop);
  EXPECT_TRUE(scenario.sims[0].isPresent);
  EXPECT_FALSE(scenario.sims[1].isPresent);
}

TEST(ScenarioReadingTest, AGridStandsInHexagons) {
  const Scenario scenario =
      scenarioOf(std::string(kSmall) + "grid north 0 0 columns=4 rows=2 spacing=500 layers=b3 area=10 areas=2\n");
  ASSERT_EQ(scenario.sites.size(), 9U);
  EXPECT_EQ(scenario.sites[1].x, 0);
  EXPECT_EQ(scenario.sites[4].x, 1500);
  EXPECT_EQ(scenario.sites[5].x, 250);
  EXPECT_NEAR(scenario.sites[5].y, 433.0, 0.1);
  EXPECT_EQ(scenario.sites[2].areaCode, 10U);
  EXPECT_EQ(scenario.sites[3].areaCode, 11U);
}

TEST(ScenarioReadingTest, TheScriptHasTimesInThreeForms) {
  const Scenario scenario = scenarioOf(std::string(kSmall) +
                                       "at 1:02:03 screen off\nat 2:30 call in talk=20 unanswered\nat 0.25s burst 7\n"
                                       "every 0:10 malformed 3 from=1:00  # damaged\n");
  ASSERT_EQ(scenario.steps.size(), 4U);
  EXPECT_EQ(scenario.steps[0].atMs, 3723000U);
  EXPECT_EQ(scenario.steps[1].atMs, 150000U);
  EXPECT_EQ(scenario.steps[2].atMs, 250U);
  EXPECT_EQ(scenario.steps[3].atMs, 60000U);
  EXPECT_EQ(scenario.steps[3].everyMs, 10000U);
  const auto& call = std::get<action::PlaceCall>(scenario.steps[1].action);
  EXPECT_FALSE(call.isOutgoing);
  EXPECT_FALSE(call.isAnswered);
  EXPECT_EQ(call.talkSeconds, 20);
}

TEST(ScenarioReadingTest, ABadLineIsNamedByItsNumber) {
  // One line after the small scenario's seven.
  const std::vector<std::pair<std::string, std::string>> cases{
      {"landscape hilly",
       "the first word must be one of about, environment, load, network, layer, site, grid, zone, cdma, route, point, "
       "sim, at, every: landscape"},
      {"environment hilly", "environment must be one of urban, street, rural: hilly"},
      {"load", "load is missing"},
      {"load much", "load is no number: much"},
      {"load nan", "load is no number: nan"},
      {"load 120", "load must be between 0 and 100"},
      {"network north 001-02 Other", "network north stands twice"},
      {"network east 1-2 East", "a network code has 3 digits, a dash and 2 or 3 digits: 1-2"},
      {"network east abc-01 East", "country code is no whole number: abc"},
      {"network east 001-01", "a carrier name is missing"},
      {"layer west b1 lte band=1 channel=300 width=20", "no network of that name: west"},
      {"layer north b3 lte band=3 channel=1300 width=20", "layer b3 stands twice"},
      {"layer north b1 wimax band=1 channel=300 width=20", "technology must be one of gsm, umts, lte, nr: wimax"},
      {"layer north b1 lte channel=300 width=20", "band= is missing"},
      {"layer north b1 lte band=1 channel=1300 width=20", "channel 1300 does not belong to band 1"},
      {"layer north b1 lte band=1 channel=300 width=12", "no carrier is 12 MHz wide there"},
      {"layer north b1 lte band=1 channel=300", "width= is missing"},
      {"layer north b1 lte band=1 channel=300 width=20 standalone", "only nr can be standalone"},
      {"layer north b1 lte band=1 channel=300 width=20 colour=red", "colour= has no meaning here"},
      {"layer north b1 lte band=1 band=3 channel=300 width=20", "band stands twice"},
      {"layer north g gsm band=900 channel=110", "channel 110 does not belong to band 900"},
      {"site north 0 layers=b3 area=1", "y is missing"},
      {"site north 0 0 area=1", "layers= is missing"},
      {"site north 0 0 layers=b3", "area= is missing"},
      {"site north 0 0 layers=b4 area=1", "no layer of that name in this network: b4"},
      {"site north 0 0 layers=b3,,b3 area=1", "layers= has an empty entry"},
      {"site north 0 0 layers=b3 area=99999", "area must be between 1 and 65533"},
      {"site north 0 0 layers=b3 area=1 sectors=400", "sectors must be between 0 and 359"},
      {"site north 0 0 layers=b3 area=1 extra", "\"extra\" has no meaning here"},
      {"grid north 0 0 columns=200 rows=200 spacing=500 layers=b3 area=1", "more than 5000 cells"},
      {"zone hall 10 0 0 10 loss=20", "a zone goes from left to right and bottom to top"},
      {"zone hall 0 0 10 10", "loss= is missing"},
      {"cdma 0 0 reach=100 mcc=1 sid=1 nid=1 band=0 channel=1 pilot=600 base=1", "pilot must be between 0 and 511"},
      {"route home", "route must be one of stop, loop, return: home"},
      {"point 5 5", "speed= is missing"},
      {"point 5 5 speed=0", "speed must be between 0.1 and 500"},
      {"sim 3 north", "slot must be between 1 and 2"},
      {"sim 1 north", "slot 1 has a sim already"},
      {"sim 2 north volte=maybe", "volte must be one of yes, no: maybe"},
      {"sim 2 north roaming=moon", "no network of that name: moon"},
      {"at noon screen off", "time must be hours:minutes:seconds, minutes:seconds or a number with s: noon"},
      {"at 1:75 screen off", "time must be between 0 and 59"},
      {"at 1:00", "what happens is missing"},
      {"at 1:00 dance", "nothing happens by that name: dance"},
      {"at 1:00 call up", "must be out or in: up"},
      {"at 1:00 screen", "on or off is missing"},
      {"at 1:00 burst 0", "count must be between 1 and 1000000"},
      {"every 0s screen off", "a repetition comes 0.1 s after the last at the earliest"},
      {"about \"no end", "a text without its closing quote"},
      {std::string("about a\x01z"), "a control character"},
  };
  for (const auto& [line, reason] : cases)
    EXPECT_THAT(problems(kSmall + line + "\n"), ElementsAre("test.scenario:8: " + reason)) << line;
}

TEST(ScenarioReadingTest, WhatTheWholeLacksIsToldOnceTheLinesAreRight) {
  EXPECT_THAT(problems("# nothing\n"), ElementsAre("test.scenario: no network", "test.scenario: no site",
                                                   "test.scenario: no point of the route", "test.scenario: no sim"));
  EXPECT_THAT(problems(std::string(kSmall) + "at 1:00 call in slot=2\n"),
              ElementsAre("test.scenario: the script uses slot 2, which has no sim"));
  EXPECT_THAT(problems(std::string(kSmall) + "route loop\npoint 5 5 speed=10\n"),
              ElementsAre("test.scenario: a loop needs a speed at its first point, for the way back"));
  EXPECT_THAT(problems("load much\n"), ElementsAre("test.scenario:1: load is no number: much"));
}

TEST(ScenarioReadingTest, EveryBadLineIsTold) {
  EXPECT_THAT(problems("load a\n\n# fine\nload b\n"),
              ElementsAre("test.scenario:1: load is no number: a", "test.scenario:4: load is no number: b"));
}

TEST(ScenarioReadingTest, ManyBadLinesEndTheReading) {
  std::string text;
  for (int i = 0; i < 1000; ++i) text += "nonsense\n";
  EXPECT_EQ(problems(text).size(), 100U);
}

TEST(ScenarioReadingTest, AFileThatIsNotThereIsAProblemOfTheWhole) {
  const auto reading = readScenario(std::filesystem::path("/nowhere/at-all.scenario"));
  ASSERT_EQ(reading.problems.size(), 1U);
  EXPECT_EQ(logText(reading.problems[0]), "/nowhere/at-all.scenario: cannot be opened: No such file or directory");
}

TEST(ScenarioReadingTest, ProblemsOfAFileHaveItsPathAsGiven) {
  const test::TemporaryDirectory directory;
  const auto file = directory.path() / "wrong.scenario";
  std::ofstream(file) << "load much\n";
  EXPECT_EQ(logText(readScenario(file).problems.at(0)), file.string() + ":1: load is no number: much");
  const std::filesystem::path folder = directory.path().string() + "/";
  EXPECT_EQ(logText(readScenario(folder).problems.at(0)), folder.string() + ": is a directory");
}

TEST(ScenarioReadingTest, AByteOrderMarkStandsForNothing) {
  EXPECT_THAT(problems("\xEF\xBB\xBF" + std::string(kSmall)), IsEmpty());
  EXPECT_THAT(problems("\xEF\xBB\xBF"
                       "load much\n"),
              ElementsAre("test.scenario:1: load is no number: much"));
  EXPECT_THAT(problems(std::string(kSmall) + "\xEF\xBB\xBF\n"), SizeIs(1)) << "only at the beginning";
}

}  // namespace
}  // namespace quorl::simulator::network
