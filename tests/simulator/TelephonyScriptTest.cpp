#include <filesystem>
#include <fstream>
#include <ostream>
#include <set>
#include <sstream>
#include <string>
#include <utility>
#include <variant>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "hosts/simulator/TelephonyScript.h"
#include "support/TemporaryDirectory.h"

namespace quorl::simulator {
namespace {

namespace event = telephony_event;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

TelephonyScript read(const std::string& text) {
  std::istringstream input(text);
  return readTelephonyScript(input, "run.jsonl");
}

/// The event of a script of one good line.
template <typename Event>
Event only(const std::string& line) {
  const TelephonyScript script = read(line);
  EXPECT_THAT(script.problems, IsEmpty()) << line;
  if (script.steps.size() != 1 || !std::holds_alternative<Event>(script.steps[0].event)) {
    ADD_FAILURE() << "not one event of the kind expected: " << line;
    return {};
  }
  return std::get<Event>(script.steps[0].event);
}

std::vector<std::string> problems(const std::string& text) {
  std::vector<std::string> result;
  for (const auto& problem : read(text).problems) result.push_back(logText(problem));
  return result;
}

TEST(TelephonyScriptTest, ReadsSimEvents) {
  const auto named = only<event::SimInserted>(R"({"atMs":0,"event":"simInserted","slot":2,"carrier":"Testnet"})");
  EXPECT_EQ(named.slot, 2);
  EXPECT_EQ(named.carrier, "Testnet");
  EXPECT_FALSE(only<event::SimInserted>(R"({"atMs":0,"event":"simInserted","slot":1})").carrier);
  EXPECT_FALSE(only<event::SimInserted>(R"({"atMs":0,"event":"simInserted","slot":1,"carrier":null})").carrier);
  EXPECT_EQ(only<event::SimRemoved>(R"({"atMs":0,"event":"simRemoved","slot":1})").slot, 1);
}

TEST(TelephonyScriptTest, ReadsCarrierEvents) {
  EXPECT_EQ(only<event::CarrierName>(R"({"atMs":0,"event":"carrierName","slot":1,"name":"Testnet"})").name, "Testnet");
  EXPECT_FALSE(only<event::CarrierName>(R"({"atMs":0,"event":"carrierName","slot":1,"name":null})").name);
  EXPECT_FALSE(only<event::CarrierMap>(R"({"atMs":0,"event":"carrierMap","present":false})").isPresent);
}

TEST(TelephonyScriptTest, CellKeepsTheOrderAndTheKindsOfItsEntries) {
  const auto cell = only<event::Cell>(
      R"({"atMs":0,"event":"cell","slot":1,"info":{"z":-5,"a":"text","m":1.5,"b":null,"c":true,"d":[],"e":{}}})");
  EXPECT_TRUE(cell.isUpdate);
  ASSERT_TRUE(cell.info.legacyInfo && cell.info.legacyInfo->size() == 1 && cell.info.legacyInfo->front());
  std::vector<std::string> entries;
  for (const auto& [key, value] : *cell.info.legacyInfo->front()) {
    if (const auto* number = std::get_if<std::int64_t>(&value)) entries.push_back(key + "=" + std::to_string(*number));
    if (const auto* text = std::get_if<std::string>(&value)) entries.push_back(key + "=" + *text);
    if (const auto* other = std::get_if<HVUnknownValue>(&value)) entries.push_back(key + ":" + other->typeName);
  }
  EXPECT_THAT(entries, ElementsAre("z=-5", "a=text", "m:number", "b:null", "c:boolean", "d:array", "e:object"));
}

TEST(TelephonyScriptTest, CellMayBeNoneAndMayComeWithoutAnUpdate) {
  const auto cell = only<event::Cell>(R"({"atMs":0,"event":"cell","slot":1,"info":null,"update":false})");
  EXPECT_FALSE(cell.info.legacyInfo);
  EXPECT_FALSE(cell.isUpdate);
}

TEST(TelephonyScriptTest, ReadsSignals) {
  EXPECT_EQ(only<event::Signal>(R"({"atMs":0,"event":"signal","slot":1,"rsrp":-101})").rsrp, -101);
  EXPECT_FALSE(only<event::Signal>(R"({"atMs":0,"event":"signal","slot":1,"rsrp":null})").rsrp);
}

TEST(TelephonyScriptTest, ReadsBands) {
  const auto record =
      only<event::Bands>(R"({"atMs":0,"event":"bands","slot":2,"active":{"NR":[78],"LTE":[]},"supported":null})");
  ASSERT_TRUE(record.bands.activeBands);
  EXPECT_THAT(*record.bands.activeBands,
              ElementsAre(testing::Pair("NR", ElementsAre(78)), testing::Pair("LTE", IsEmpty())));
  EXPECT_FALSE(record.bands.supportedBands);
  EXPECT_FALSE(only<event::Bands>(R"({"atMs":0,"event":"bands","slot":2})").bands.activeBands);
}

TEST(TelephonyScriptTest, ReadsFailuresAndRecoveries) {
  const auto failed = only<event::Failure>(R"({"atMs":0,"event":"fail","what":"signal","slot":2,"error":"deaf"})");
  EXPECT_EQ(failed.what, event::Service::Signal);
  EXPECT_EQ(failed.slot, 2);
  ASSERT_TRUE(failed.error);
  EXPECT_EQ(failed.error->text, "deaf");
  const auto all = only<event::Failure>(R"({"atMs":0,"event":"fail","what":"subscriptions","error":"x"})");
  EXPECT_EQ(all.what, event::Service::Subscriptions);
  EXPECT_FALSE(only<event::Failure>(R"({"atMs":0,"event":"recover","what":"bands","slot":1})").error);
}

TEST(TelephonyScriptTest, ReadsConnections) {
  const auto connection =
      only<event::Connection>(R"({"atMs":0,"event":"connection","slot":1,"type":"Ims","status":"Connecting"})");
  EXPECT_EQ(connection.slot, 1);
  EXPECT_EQ(connection.type, HVDataConnectionType::Ims);
  EXPECT_EQ(connection.status, HVDataConnectionStatus::Connecting);
}

TEST(TelephonyScriptTest, StepsAreSortedByTimeAndThoseOfOneTimeKeepTheirOrder) {
  const TelephonyScript script = read(R"({"atMs":20,"event":"simRemoved","slot":1}
{"atMs":10,"event":"simRemoved","slot":2}
{"atMs":10,"event":"simRemoved","slot":1})");
  std::vector<std::pair<std::chrono::milliseconds, int>> steps;
  for (const auto& step : script.steps) steps.emplace_back(step.at, std::get<event::SimRemoved>(step.event).slot);
  EXPECT_THAT(steps, ElementsAre(std::pair(10ms, 2), std::pair(10ms, 1), std::pair(20ms, 1)));
}

TEST(TelephonyScriptTest, BlankLinesAndCarriageReturnsDoNotCountAsEvents) {
  const TelephonyScript script = read("\n  \t\r\n{\"atMs\":0,\"event\":\"simRemoved\",\"slot\":1}\r\n\n");
  EXPECT_EQ(script.steps.size(), 1U);
  EXPECT_THAT(script.problems, IsEmpty());
}

TEST(TelephonyScriptTest, BadLineIsReportedWithFileAndLineAndTheRestGoesOn) {
  const std::string text = R"({"atMs":0,"event":"simRemoved","slot":1}

not json
{"atMs":5,"event":"simRemoved","slot":2})";
  EXPECT_THAT(problems(text), ElementsAre("run.jsonl:3: no JSON"));
  EXPECT_EQ(read(text).steps.size(), 2U);
}

struct BadLine {
  const char* line;
  const char* reason;
};

void PrintTo(const BadLine& bad, std::ostream* out) {
  *out << bad.line;
}

class BadTelephonyLineTest : public ::testing::TestWithParam<BadLine> {};

TEST_P(BadTelephonyLineTest, IsLeftOutAndSaysWhy) {
  EXPECT_THAT(problems(GetParam().line), ElementsAre(std::string("run.jsonl:1: ") + GetParam().reason));
  EXPECT_THAT(read(GetParam().line).steps, IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(
    All, BadTelephonyLineTest,
    ::testing::Values(
        BadLine{"[1]", "no JSON object"}, BadLine{R"({"atMs":0)", "no JSON"},
        BadLine{"{\"atMs\":0,\"event\":\"\xff\"}", "no JSON"}, BadLine{R"({"event":"simRemoved"})", "atMs is missing"},
        BadLine{R"({"atMs":"0","event":"simRemoved","slot":1})", "atMs must be a whole number"},
        BadLine{R"({"atMs":1.5,"event":"simRemoved","slot":1})", "atMs must be a whole number"},
        BadLine{R"({"atMs":-1,"event":"simRemoved","slot":1})", "atMs must be between 0 and 2592000000"},
        BadLine{R"({"atMs":2592000001,"event":"simRemoved","slot":1})", "atMs must be between 0 and 2592000000"},
        BadLine{R"({"atMs":18446744073709551615,"event":"simRemoved","slot":1})", "atMs must be a whole number"},
        BadLine{R"({"atMs":0})", "event is missing"}, BadLine{R"({"atMs":0,"event":7})", "event must be a text"},
        BadLine{R"({"atMs":0,"event":"explode"})", "event \"explode\" is not known"},
        BadLine{R"({"atMs":0,"event":"simRemoved"})", "slot is missing"},
        BadLine{R"({"atMs":0,"event":"simRemoved","slot":3})", "slot must be 1 or 2"},
        BadLine{R"({"atMs":0,"event":"simRemoved","slot":4294967297})", "slot must be 1 or 2"},
        BadLine{R"({"atMs":0,"event":"simRemoved","slot":1,"sloth":1})", "field \"sloth\" is not known"},
        BadLine{R"({"atMs":0,"event":"simInserted","slot":1,"carrier":7})", "carrier must be a text or null"},
        BadLine{R"({"atMs":0,"event":"carrierName","slot":1})", "name is missing"},
        BadLine{R"({"atMs":0,"event":"carrierMap","present":"no"})", "present must be true or false"},
        BadLine{R"({"atMs":0,"event":"cell","slot":1})", "info is missing"},
        BadLine{R"({"atMs":0,"event":"cell","slot":1,"info":[]})", "info must be an object or null"},
        BadLine{R"({"atMs":0,"event":"cell","slot":1,"info":{},"update":1})", "update must be true or false"},
        BadLine{R"({"atMs":0,"event":"cell","slot":1,"info":{"a":18446744073709551615}})", "\"a\" is too large"},
        BadLine{R"({"atMs":0,"event":"signal","slot":1})", "rsrp is missing"},
        BadLine{R"({"atMs":0,"event":"signal","slot":1,"rsrp":-90.5})", "rsrp must be a whole number"},
        BadLine{R"({"atMs":0,"event":"bands","slot":1,"active":[]})", "active must be an object or null"},
        BadLine{R"({"atMs":0,"event":"bands","slot":1,"active":{"LTE":1}})", "active of \"LTE\" must be a list"},
        BadLine{R"({"atMs":0,"event":"bands","slot":1,"supported":{"LTE":["1"]}})",
                "supported of \"LTE\" must hold whole numbers"},
        BadLine{R"({"atMs":0,"event":"fail","what":"fuel","error":"x"})", "what \"fuel\" is not known"},
        BadLine{R"({"atMs":0,"event":"fail","what":"cell","error":"x"})", "slot is missing"},
        BadLine{R"({"atMs":0,"event":"fail","what":"cell","slot":1})", "error is missing"},
        BadLine{R"({"atMs":0,"event":"recover","what":"subscriptions","slot":1})", "field \"slot\" is not known"},
        BadLine{R"({"atMs":0,"event":"connection","slot":1,"type":"Fax","status":"Unknown"})",
                "type \"Fax\" is not known"},
        BadLine{R"({"atMs":0,"event":"connection","slot":1,"type":"Ims","status":"Up"})",
                "status \"Up\" is not known"}));

TEST(TelephonyScriptTest, FileThatCannotBeOpenedIsAProblemOfTheFile) {
  const test::TemporaryDirectory directory;
  const TelephonyScript script = readTelephonyScript(directory.path() / "none.jsonl");
  ASSERT_EQ(script.problems.size(), 1U);
  EXPECT_EQ(logText(script.problems[0]), "none.jsonl:0: cannot be opened: No such file or directory");
}

TEST(TelephonyScriptTest, DirectoryInPlaceOfAFileIsAProblem) {
  const test::TemporaryDirectory directory;
  EXPECT_EQ(readTelephonyScript(directory.path()).problems.size(), 1U);
}

TEST(TelephonyScriptTest, ProblemsOfAFileBearItsName) {
  const test::TemporaryDirectory directory;
  std::ofstream(directory.path() / "two.jsonl") << "{}\n";
  const TelephonyScript script = readTelephonyScript(directory.path() / "two.jsonl");
  ASSERT_EQ(script.problems.size(), 1U);
  EXPECT_EQ(logText(script.problems[0]), "two.jsonl:1: atMs is missing");
}

TEST(TelephonyScriptTest, ShippedScriptHasNoBadLineAndUsesOnlyTestNetworks) {
  const auto script =
      readTelephonyScript(std::filesystem::path(QUORL_SOURCE_DIR) / "resources" / "telephony" / "two-sims.jsonl");
  EXPECT_THAT(script.problems, IsEmpty());
  std::set<std::size_t> kinds;
  std::size_t cells = 0;
  for (const TelephonyScriptStep& step : script.steps) {
    kinds.insert(step.event.index());
    const auto* cell = std::get_if<event::Cell>(&step.event);
    if (cell == nullptr || !cell->info.legacyInfo) continue;
    for (const auto& [key, value] : *cell->info.legacyInfo->front()) {
      if (key != "kHVCellMonitorMCC") continue;
      ++cells;
      EXPECT_EQ(std::get<std::int64_t>(value), 1);
    }
  }
  EXPECT_GT(cells, 0U);
  EXPECT_EQ(kinds.size(), std::variant_size_v<event::Event>);
}

}  // namespace
}  // namespace quorl::simulator
