#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "ToolRun.h"
#include "hosts/simulator/Recording.h"
#include "store/RawDatabase.h"
#include "support/TemporaryDirectory.h"

namespace quorl::test {
namespace {

namespace fs = std::filesystem;

std::vector<std::string> rowsOf(const fs::path& file, const char* sql) {
  return RawDatabase(file).column(sql);
}

class Simulate : public testing::Test {
 protected:
  ToolResult simulate(std::vector<std::string> more) {
    more.insert(more.begin(), {"simulate", "--scenario", "city"});
    return runTool(more);
  }
  static nlohmann::json lastLine(const ToolResult& result) {
    const auto lines = result.outputLines();
    auto parsed = lines.empty() ? nlohmann::json() : nlohmann::json::parse(lines.back(), nullptr, false);
    EXPECT_TRUE(parsed.is_object()) << testing::PrintToString(result);
    return parsed;
  }

  TemporaryDirectory directory;
  const fs::path recording = directory.path() / "way.jsonl";
  const fs::path documents = directory.path() / "documents";
  const fs::path database = documents / "metricPartV11.sqlite";
};

TEST_F(Simulate, WritesARecordingThatTheSameSeedRepeats) {
  const auto result = simulate({"--seed", "3", "--minutes", "2", "--output", recording.string()});
  EXPECT_EQ(result.exitCode, 0) << testing::PrintToString(result);
  EXPECT_EQ(result.errors, "") << "no progress bar where there is no terminal";
  const auto read = simulator::readRecording(recording);
  ASSERT_TRUE(read);
  EXPECT_TRUE(read->faults.empty());
  EXPECT_EQ(lastLine(result)["events"], read->events.size());
  const std::string first = readFile(recording);
  simulate({"--seed", "3", "--minutes", "2", "--output", recording.string()});
  EXPECT_TRUE(readFile(recording) == first);
  simulate({"--seed", "4", "--minutes", "2", "--output", recording.string()});
  EXPECT_FALSE(readFile(recording) == first);
}

TEST_F(Simulate, WhatTheProductWasDeliveredReplaysIntoTheSameRows) {
  const auto lived = simulate(
      {"--minutes", "0.1", "--documents", documents.string(), "--record", recording.string(), "--family", "ice"});
  EXPECT_EQ(lived.exitCode, 0) << testing::PrintToString(lived);
  const auto summary = lastLine(lived);
  EXPECT_GT(summary["rowsInserted"].get<int>(), 100);
  const fs::path again = directory.path() / "again";
  const auto replayed = runTool({"replay", "--chipset", "ice", "--documents", again.string(), recording.string()});
  EXPECT_EQ(replayed.exitCode, 0) << testing::PrintToString(replayed);
  EXPECT_EQ(lastLine(replayed)["events"], summary["events"]);
  // A recording has no telephony.
  constexpr char kRows[] =
      "SELECT metric_name || '|' || attribute_name || '|' || attribute_value || '|' || collected_on FROM "
      "Metric WHERE metric_tech <> 'RAT' ORDER BY Id";
  EXPECT_TRUE(rowsOf(again / "metricPartV11.sqlite", kRows) == rowsOf(database, kRows));
}

TEST_F(Simulate, MakesAHistoryThatTheProductFindsAndKeeps) {
  const auto made = simulate({"--documents", documents.string(), "--history-days", "2"});
  EXPECT_EQ(made.exitCode, 0) << testing::PrintToString(made);
  EXPECT_EQ(made.errors, "");
  const auto summary = lastLine(made);
  const auto rows = summary["rows"].get<std::uint64_t>();
  EXPECT_GT(rows, 1000U);
  EXPECT_EQ(rowsOf(database, "SELECT count(*) FROM Metric"), std::vector{std::to_string(rows)});
  const auto listed = runTool({"metrics", "--documents", documents.string()});
  EXPECT_EQ(listed.exitCode, 0);
  EXPECT_NE(listed.output.find("Nr ConnectionStats"), std::string::npos);
  EXPECT_EQ(rowsOf(database, "SELECT count(*) FROM Metric"), std::vector{std::to_string(rows)});
}

TEST_F(Simulate, LostRowsAreToldWithTheirReason) {
  ASSERT_EQ(simulate({"--minutes", "0.01", "--documents", documents.string()}).exitCode, 0);
  RawDatabase(database).run("CREATE TRIGGER refusal BEFORE INSERT ON Metric BEGIN SELECT RAISE(ABORT, 'refused'); END");
  const auto result = simulate({"--minutes", "0.01", "--documents", documents.string()});
  EXPECT_EQ(result.exitCode, 1);
  const auto failed = lastLine(result)["insertsFailed"].get<std::uint64_t>();
  EXPECT_GT(failed, 1U);
  EXPECT_EQ(lastLine(result)["rowsInserted"], 0);
  EXPECT_EQ(result.errors, "quorl-tool: " + std::to_string(failed) + " rows could not be stored: refused\n");
}

TEST_F(Simulate, WhatTheProductPrintsGoesToStandardErrorAndOnlyWhenAskedFor) {
  ASSERT_EQ(simulate({"--minutes", "0.01", "--documents", documents.string()}).exitCode, 0);
  RawDatabase(database).run("CREATE TRIGGER refusal BEFORE INSERT ON Metric BEGIN SELECT RAISE(ABORT, 'refused'); END");
  constexpr char kPrinted[] = "\nerror occurred while fetching metric contents ";
  const auto verbose = simulate({"--minutes", "0.01", "--documents", documents.string(), "--verbose"});
  EXPECT_NE(verbose.errors.find(kPrinted), std::string::npos) << verbose.errors;
  EXPECT_NE(verbose.errors.find("Appdelegate - applicationDidBecomeActive"), std::string::npos);
  EXPECT_EQ(verbose.outputLines().size(), 1U);
  const auto quiet = simulate({"--minutes", "0.01", "--documents", documents.string()});
  EXPECT_EQ(quiet.errorLines().size(), 1U) << quiet.errors;
}

TEST_F(Simulate, AHistoryIsAsLongAsItsUse) {
  const auto made = simulate({"--documents", documents.string(), "--history-days", "3", "--sessions-per-day", "2",
                              "--session-minutes", "0.5"});
  EXPECT_EQ(made.exitCode, 0) << testing::PrintToString(made);
  EXPECT_LE(lastLine(made)["sessions"].get<int>(), 8);
  EXPECT_GE(lastLine(made)["sessions"].get<int>(), 5);
  const auto longer = simulate({"--documents", (directory.path() / "longer").string(), "--history-days", "3",
                                "--sessions-per-day", "2", "--session-minutes", "2"});
  // How many sessions there are depends on the time of day at which the history ends.
  const auto rowsOfASession = [](const ToolResult& result) {
    const auto summary = lastLine(result);
    return summary["rows"].get<double>() / summary["sessions"].get<double>();
  };
  EXPECT_GT(rowsOfASession(longer), 2 * rowsOfASession(made));
}

TEST_F(Simulate, KeepsItsRowsWhenTheirRecordingCannotBeWritten) {
  const auto result = simulate({"--minutes", "5", "--documents", documents.string(), "--record", "/dev/full"});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.errors, "quorl-tool: /dev/full: No space left on device\n");
  const auto summary = lastLine(result);
  EXPECT_GT(summary["rowsInserted"].get<int>(), 0);
  EXPECT_EQ(summary["insertsFailed"], 0);
  fs::remove(documents / "metricPartV11.sqlite-wal");
  EXPECT_EQ(RawDatabase(database).column("SELECT count(*) FROM Metric").at(0), summary["rowsInserted"].dump())
      << "the database file alone is whole";
}

TEST_F(Simulate, TellsOfTheRowsOfItsHistoryThatTheProductRemoves) {
  const auto result = simulate({"--documents", documents.string(), "--history-days", "31", "--sessions-per-day", "1",
                                "--session-minutes", "0.1", "--minutes", "0.05"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_THAT(result.errors, testing::MatchesRegex("quorl-tool: [0-9]+ rows of thirty days ago and older were "
                                                   "removed\n"));
}

TEST_F(Simulate, TellsWhatCannotBeWritten) {
  const auto noFolder = simulate({"--minutes", "1", "--output", "/no/such/folder/way.jsonl"});
  EXPECT_EQ(noFolder.exitCode, 1);
  EXPECT_EQ(noFolder.errors, "quorl-tool: /no/such/folder/way.jsonl: No such file or directory\n");
  const auto fullDisk = simulate({"--minutes", "5", "--output", "/dev/full"});
  EXPECT_EQ(fullDisk.exitCode, 1);
  EXPECT_EQ(fullDisk.errors, "quorl-tool: /dev/full: No space left on device\n");
  const std::string file = (directory.path() / "file").string();
  writeFile(file, "x");
  const auto noDocuments = simulate({"--documents", file, "--history-days", "1"});
  EXPECT_EQ(noDocuments.exitCode, 1);
  EXPECT_EQ(noDocuments.errors.rfind("quorl-tool: " + file + ": ", 0), 0U) << noDocuments.errors;
}

TEST_F(Simulate, TellsWhatIsWrongWithAScenario) {
  EXPECT_EQ(runTool({"simulate", "--scenario", "moon", "--output", recording.string()}).exitCode, 2);
  const fs::path scenario = directory.path() / "wrong.scenario";
  writeFile(scenario, "nonsense here\n");
  const auto result = runTool({"simulate", "--scenario", scenario.string(), "--output", recording.string()});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.errors.rfind("quorl-tool: " + scenario.string() + ":1: ", 0), 0U) << result.errors;
  EXPECT_EQ(runTool({"simulate", "--scenario", "/no/such.scenario", "--output", recording.string()}).exitCode, 1);
  EXPECT_FALSE(fs::exists(recording));
}

TEST_F(Simulate, RefusesOptionsThatDoNotFitTogether) {
  EXPECT_EQ(simulate({}).exitCode, 2);
  EXPECT_EQ(simulate({"--output", recording.string(), "--documents", documents.string()}).exitCode, 2);
  EXPECT_EQ(simulate({"--output", recording.string(), "--history-days", "3"}).exitCode, 2);
  EXPECT_EQ(simulate({"--output", recording.string(), "--speed", "3"}).exitCode, 2);
  EXPECT_EQ(simulate({"--documents", documents.string(), "--start", "2026-01-05 09:30:00"}).exitCode, 2);
  EXPECT_EQ(simulate({"--output", recording.string(), "--start", "yesterday"}).exitCode, 2);
  EXPECT_EQ(simulate({"--output", recording.string(), "--family", "neither"}).exitCode, 2);
  EXPECT_EQ(simulate({"--documents", documents.string(), "--history-days", "3", "--speed", "3"}).exitCode, 2);
  EXPECT_EQ(simulate({"--documents", documents.string(), "--history-days", "3", "--record", recording.string()}).errors,
            "quorl-tool: --record and --speed need --minutes beside --history-days (see quorl-tool simulate --help)\n");
  EXPECT_FALSE(fs::exists(documents));
}

TEST_F(Simulate, SparesTheDatabase) {
  ASSERT_EQ(simulate({"--minutes", "0.01", "--documents", documents.string()}).exitCode, 0);
  const std::string before = readFile(database);
  const auto recorded =
      simulate({"--minutes", "0.01", "--documents", documents.string(), "--record", database.string()});
  EXPECT_EQ(recorded.exitCode, 2);
  EXPECT_EQ(recorded.errors, "quorl-tool: " + database.string() +
                                 ": belongs to a database and is not overwritten (see quorl-tool simulate --help)\n");
  EXPECT_EQ(simulate({"--minutes", "0.01", "--output", database.string()}).exitCode, 2);
  EXPECT_TRUE(readFile(database) == before);
}

}  // namespace
}  // namespace quorl::test
