#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "ToolRun.h"
#include "support/TemporaryDirectory.h"

namespace quorl::test {
namespace {

namespace fs = std::filesystem;

class Carriers : public testing::Test {
 protected:
  void script(std::string_view content) { writeFile(file_, content); }
  ToolResult carriers(std::vector<std::string> more = {}) {
    more.insert(more.begin(), {"carriers", "--telephony", file_.string()});
    return runTool(more);
  }
  /// The objects of the output, one for each line.
  static std::vector<nlohmann::json> objects(const ToolResult& result) {
    std::vector<nlohmann::json> lines;
    for (const std::string& line : result.outputLines()) lines.push_back(nlohmann::json::parse(line, nullptr, false));
    return lines;
  }

  TemporaryDirectory directory;

 private:
  const fs::path file_ = directory.path() / "script.jsonl";
};

constexpr std::string_view kTwoSims = R"({"atMs":0,"event":"simInserted","slot":1,"carrier":"Testnet North"}
{"atMs":0,"event":"simInserted","slot":2,"carrier":"Testnet South"}
{"atMs":0,"event":"bands","slot":2,"active":{"LTE":[3,20]},"supported":{"LTE":[1,3,7,20]}}
{"atMs":5000,"event":"simRemoved","slot":1}
)";

TEST_F(Carriers, ShowsRecordsTabsAndTheCurrentSubscription) {
  script(kTwoSims);
  const ToolResult result = carriers({"--until-ms", "0"});
  EXPECT_EQ(result.exitCode, 0) << testing::PrintToString(result);
  EXPECT_EQ(result.errors, "");
  EXPECT_EQ(result.output,
            "Slot  Carrier        SIM  Subscription  Cell rows  Active bands  Supported bands\n"
            "1     Testnet North  yes  0             0          0             0\n"
            "2     Testnet South  yes  1             0          0             0\n"
            "\n"
            "Tab  Title          Selected\n"
            "1    Testnet North  yes\n"
            "2    Testnet South\n"
            "\n"
            "Current subscription: 0\n");
}

TEST_F(Carriers, PressingATabChoosesItsSubscription) {
  script(kTwoSims);
  const auto lines = objects(carriers({"--until-ms", "0", "--press", "2", "--json"}));
  ASSERT_EQ(lines.size(), 5U);
  EXPECT_EQ(lines[2], (nlohmann::json{{"tab", 1}, {"title", "Testnet North"}, {"selected", false}}));
  EXPECT_EQ(lines[3], (nlohmann::json{{"tab", 2}, {"title", "Testnet South"}, {"selected", true}}));
  EXPECT_EQ(lines[4], (nlohmann::json{{"currentSubscription", 1}}));
}

TEST_F(Carriers, ASimThatWentTakesItsTabWithIt) {
  script(kTwoSims);
  const auto lines = objects(carriers({"--json"}));
  ASSERT_EQ(lines.size(), 3U);
  EXPECT_EQ(lines[0]["carrier"], "Testnet South");
  EXPECT_EQ(lines[1]["title"], "Testnet South");
  EXPECT_EQ(lines[2]["currentSubscription"], 1);
}

TEST_F(Carriers, BandRowsAreForBuildsThatHaveThem) {
  script(kTwoSims);
  EXPECT_EQ(objects(carriers({"--json"})).at(0)["supportedBands"], 0);
  const nlohmann::json record = objects(carriers({"--json", "--carrier-build"})).at(0);
  EXPECT_EQ(record["activeBands"], 1);
  EXPECT_EQ(record["supportedBands"], 1);
}

TEST_F(Carriers, APhoneWithoutASimHasNoTab) {
  script("");
  const ToolResult result = carriers({"--json"});
  EXPECT_EQ(result.exitCode, 0) << testing::PrintToString(result);
  const auto lines = objects(result);
  ASSERT_FALSE(lines.empty());
  for (const nlohmann::json& line : lines) EXPECT_FALSE(line.contains("tab")) << line;
}

TEST_F(Carriers, KeepsRowsWhereItIsTold) {
  script(kTwoSims);
  const fs::path documents = directory.path() / "documents";
  EXPECT_EQ(carriers({"--documents", documents.string(), "--internal-build"}).exitCode, 0);
  EXPECT_TRUE(fs::exists(documents / "metricPartV11.sqlite"));
}

TEST_F(Carriers, ATabThatIsNotThereIsAFailure) {
  script(kTwoSims);
  const ToolResult result = carriers({"--press", "2"});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.errors, "quorl-tool: there is no tab 2, the bar has 1\n");
}

TEST_F(Carriers, ABadLineIsToldAndTheRestPlays) {
  script(std::string("nonsense\n") + std::string(kTwoSims));
  const ToolResult result = carriers({"--json"});
  EXPECT_EQ(result.exitCode, 1);
  ASSERT_EQ(result.errorLines().size(), 1U);
  EXPECT_NE(result.errors.find("script.jsonl:1: "), std::string::npos) << result.errors;
  EXPECT_EQ(objects(result).back()["currentSubscription"], 1);
}

TEST_F(Carriers, AScriptThatCannotBeReadIsAFailure) {
  const ToolResult result = carriers();
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.errorLines().size(), 1U) << result.errors;
}

}  // namespace
}  // namespace quorl::test
