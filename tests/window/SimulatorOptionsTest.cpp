#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "hosts/desktop/SimulatorOptions.h"

namespace quorl::desktop {
namespace {

tl::expected<SimulatorOptions, int> parsed(std::vector<std::string> arguments) {
  arguments.insert(arguments.begin(), "quorl-simulator");
  std::vector<char*> pointers;
  for (std::string& argument : arguments) pointers.push_back(argument.data());
  return SimulatorOptions::parse(static_cast<int>(pointers.size()), pointers.data());
}

Programme programmeOf(const std::vector<std::string>& arguments) {
  const auto options = parsed(arguments);
  EXPECT_TRUE(options);
  auto programme = options->programme();
  EXPECT_TRUE(programme) << programme.error();
  return *std::move(programme);
}

TEST(SimulatorOptions, AUsualPhoneIsInTheCity) {
  const Programme programme = programmeOf({});
  ASSERT_TRUE(programme.scenario);
  EXPECT_EQ(programme.scenario->scenario.name, "city");
  EXPECT_EQ(programme.scenario->seed, 1U);
  EXPECT_EQ(programme.scenario->family, simulator::metrics::Family::Mav);
  EXPECT_FALSE(programme.telephony) << "the scenario's own";
  EXPECT_TRUE(programme.events.empty());
  EXPECT_FALSE(programme.record);
}

TEST(SimulatorOptions, ScenarioSeedAndFamilyAreChosen) {
  const Programme programme =
      programmeOf({"--scenario", "tunnel", "--seed", "5", "--chipset", "ice17", "--record", "way.jsonl"});
  ASSERT_TRUE(programme.scenario);
  EXPECT_EQ(programme.scenario->scenario.name, "tunnel");
  EXPECT_EQ(programme.scenario->seed, 5U);
  EXPECT_EQ(programme.scenario->family, simulator::metrics::Family::Ice);
  EXPECT_EQ(programme.record, std::filesystem::path("way.jsonl"));
}

TEST(SimulatorOptions, APhoneWithFewerSimsLosesWhatConcernsTheOthers) {
  const auto simsAndSteps = [](const std::vector<std::string>& more) {
    const Programme programme = programmeOf(more);
    const auto& scenario = programme.scenario->scenario;
    return std::pair(scenario.sims[0].isPresent + scenario.sims[1].isPresent, scenario.steps.size());
  };
  const auto all = simsAndSteps({});
  const auto one = simsAndSteps({"--sims", "1"});
  const auto none = simsAndSteps({"--sims", "0"});
  EXPECT_EQ(all.first, 2);
  EXPECT_EQ(one.first, 1);
  EXPECT_EQ(none.first, 0);
  EXPECT_GT(all.second, one.second);
  EXPECT_GT(one.second, none.second);
  EXPECT_EQ(simsAndSteps({"--sims", "2"}), all);
}

TEST(SimulatorOptions, ARecordingStandsInForTheScenario) {
  const Programme programme = programmeOf({"--recording", QUORL_SOURCE_DIR "/resources/recordings/mav.jsonl"});
  EXPECT_FALSE(programme.scenario);
  EXPECT_FALSE(programme.events.empty());
  ASSERT_TRUE(programme.telephony);
  EXPECT_FALSE(programme.telephony->empty()) << "the shipped script";
}

TEST(SimulatorOptions, AScriptStandsInForTheScenariosTelephony) {
  const Programme programme = programmeOf({"--telephony", QUORL_SOURCE_DIR "/resources/telephony/two-sims.jsonl"});
  EXPECT_TRUE(programme.scenario);
  ASSERT_TRUE(programme.telephony);
  const Programme oneSim =
      programmeOf({"--telephony", QUORL_SOURCE_DIR "/resources/telephony/two-sims.jsonl", "--sims", "1"});
  EXPECT_LT(oneSim.telephony->size(), programme.telephony->size());
}

TEST(SimulatorOptions, AKnownFamilyInAScenarioHasAPast) {
  const auto pastOf = [](const std::vector<std::string>& arguments) {
    const auto options = parsed(arguments);
    return options->history(*options->programme(), Date(std::chrono::seconds(1767605400)));
  };
  const auto usual = pastOf({});
  ASSERT_TRUE(usual);
  EXPECT_EQ(usual->days, 7);
  EXPECT_EQ(usual->choice.scenario.name, "city");
  EXPECT_EQ(pastOf({"--history-days", "2"})->days, 2);
  EXPECT_FALSE(pastOf({"--history-days", "0"}));
  EXPECT_FALSE(pastOf({"--chipset", "none"}));
  EXPECT_FALSE(pastOf({"--chipset", "other"}));
  EXPECT_TRUE(pastOf({"--chipset", "ice15"}));
  EXPECT_FALSE(pastOf({"--recording", QUORL_SOURCE_DIR "/resources/recordings/mav.jsonl"}));
}

TEST(SimulatorOptions, MistakesAreTold) {
  const auto options = parsed({"--scenario", "moon"});
  ASSERT_TRUE(options);
  EXPECT_FALSE(options->programme());
  for (const auto& wrong : std::vector<std::vector<std::string>>{{"--sims", "3"},
                                                                 {"--speed", "0"},
                                                                 {"--recording", "/no/such/file"},
                                                                 {"--history-days", "32"},
                                                                 {"--wrong"}}) {
    const auto refused = parsed(wrong);
    ASSERT_FALSE(refused) << wrong.front();
    EXPECT_NE(refused.error(), 0);
  }
}

}  // namespace
}  // namespace quorl::desktop
