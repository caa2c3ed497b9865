#include <cstdint>
#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "hosts/desktop/SimulatorOptions.h"
#include "support/TemporaryDirectory.h"

namespace quorl::desktop {
namespace {

using testing::AllOf;
using testing::ElementsAre;
using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

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

TEST(SimulatorOptions, BadLinesAreLeftOutAndTold) {
  const test::TemporaryDirectory directory;
  const std::string recording = (directory.path() / "way.jsonl").string();
  const std::string script = (directory.path() / "sims.jsonl").string();
  std::ofstream(recording) << "{\"kKeyMetricID\":806915}\nno json\n{\"atMs\":-1}\n{\"atMs\":5}\n";
  std::ofstream(script) << "{\"atMs\": 0, \"event\": \"nothing\"}\n"
                           "{\"atMs\": 0, \"event\": \"simRemoved\", \"slot\": 1}\n";
  const Programme programme = programmeOf({"--recording", recording, "--telephony", script});
  EXPECT_EQ(programme.events.size(), 2U);
  ASSERT_TRUE(programme.telephony);
  EXPECT_EQ(programme.telephony->size(), 1U);
  EXPECT_THAT(programme.faults,
              ElementsAre(recording + ":2: not JSON", StartsWith(recording + ":3: "), StartsWith(script + ":1: ")));
}

TEST(SimulatorOptions, AFileThatCannotBeReadIsNoProgramme) {
  for (const char* option : {"--scenario", "--recording", "--telephony"}) {
    const std::string unreadable = "/proc/self/mem";
    const auto options = parsed({option, unreadable});
    ASSERT_TRUE(options);
    const auto programme = options->programme();
    ASSERT_FALSE(programme) << option;
    EXPECT_THAT(programme.error(), StartsWith(unreadable + ":"));
  }
}

/// What is said of a command line that is not taken.
std::string refusal(const std::vector<std::string>& arguments) {
  testing::internal::CaptureStderr();
  const auto refused = parsed(arguments);
  std::string told = testing::internal::GetCapturedStderr();
  EXPECT_EQ(refused ? 0 : refused.error(), 2) << arguments.back();
  return told;
}

TEST(SimulatorOptions, MistakesAreTold) {
  constexpr char kSeeHelp[] = " (see quorl-simulator --help)\n";
  for (const auto& wrong : std::vector<std::vector<std::string>>{{"--sims", "3"},
                                                                 {"--scenario", "moon"},
                                                                 {"--recording", "/no/such/file"},
                                                                 {"--history-days", "32"},
                                                                 {"--wrong"},
                                                                 {"--seconds"}})
    EXPECT_THAT(refusal(wrong), AllOf(StartsWith("quorl-simulator: "), HasSubstr(wrong.front()), EndsWith(kSeeHelp)));
  EXPECT_EQ(refusal({"--seconds", "-1"}),
            std::string("quorl-simulator: --seconds: -1 is no number from 0.001 to 1000000000") + kSeeHelp);
  EXPECT_EQ(refusal({"--speed", "0"}),
            std::string("quorl-simulator: --speed: 0 is no number from 0.01 to 1000") + kSeeHelp);
}

TEST(SimulatorOptions, NumbersAreFiniteAndWithinTheirLimits) {
  for (const char* seconds : {"nan", "inf", "0", "-0.5", "1e999", "5s", ""}) refusal({"--seconds", seconds});
  for (const char* speed : {"nan", "-nan", "inf", "0.009", "1001", "fast"}) refusal({"--speed", speed});
  for (const char* seed : {"-1", "1.5", "18446744073709551616"}) refusal({"--seed", seed});
  EXPECT_EQ(parsed({"--seconds", "1e-3"})->seconds, 0.001);
  EXPECT_EQ(parsed({"--speed", "1000"})->speed, 1000);
  EXPECT_EQ(parsed({"--seed", "18446744073709551615"})->seed, UINT64_MAX);
  EXPECT_EQ(parsed({"--history-days", "010"})->historyDays, 10) << "not octal";
}

/// What a console prints to standard output and to standard error.
std::pair<std::string, std::string> printedBy(const std::vector<std::string>& arguments) {
  const auto console = parsed(arguments)->console();
  testing::internal::CaptureStdout();
  testing::internal::CaptureStderr();
  console->print("a line");
  std::string output = testing::internal::GetCapturedStdout();
  return {std::move(output), testing::internal::GetCapturedStderr()};
}

TEST(SimulatorOptions, TheProductsPrintsGoWhereNoResultsAre) {
  const auto pair = [](std::string output, std::string errors) {
    return std::pair(std::move(output), std::move(errors));
  };
  EXPECT_EQ(printedBy({}), pair("a line\n", ""));
  EXPECT_EQ(printedBy({"--verbose"}), pair("a line\n", ""));
  EXPECT_EQ(printedBy({"--print"}), pair("", ""));
  EXPECT_EQ(printedBy({"--print", "--verbose"}), pair("", "a line\n"));
}

}  // namespace
}  // namespace quorl::desktop
