#include <csignal>
#include <cstdint>
#include <filesystem>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <fmt/format.h>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "Hexadecimal.h"
#include "ToolRun.h"
#include "hosts/simulator/Recording.h"
#include "store/RawDatabase.h"
#include "support/TemporaryDirectory.h"

namespace quorl::test {
namespace {

namespace fs = std::filesystem;
using Rows = std::vector<std::string>;

/// The rows of a query on a database file, columns joined by "|".
Rows query(const fs::path& file, const char* sql) {
  Rows rows;
  for (const Row& row : RawDatabase(file).run(sql)) rows.push_back(fmt::format("{}", fmt::join(row, "|")));
  return rows;
}

class Replay : public testing::Test {
 protected:
  /// Adds an event to the recording.
  void record(std::int64_t id, std::string_view hex) {
    simulator::RecordedEvent event;
    event.metricID = id;
    event.payload = ByteString(tool::hexBytes(hex).value());
    recordLine(simulator::recordingLine(event));
  }
  void recordLine(const std::string& line) { content_ += line + "\n"; }

  fs::path recording() {
    const fs::path file = directory.path() / "recording.jsonl";
    writeFile(file, content_);
    return file;
  }

  ToolResult replay(const std::string& chipset, std::vector<std::string> more = {}) {
    std::vector<std::string> arguments{"replay", "--chipset", chipset, "--documents", documents.string()};
    arguments.insert(arguments.end(), more.begin(), more.end());
    arguments.push_back(recording().string());
    return runTool(arguments);
  }

  static nlohmann::json summaryOf(const ToolResult& result) {
    EXPECT_EQ(result.outputLines().size(), 1U) << testing::PrintToString(result);
    auto summary = nlohmann::json::parse(result.output, nullptr, false);
    EXPECT_TRUE(summary.is_object()) << testing::PrintToString(result);
    return summary;
  }

  Rows rows(const char* sql) { return query(database, sql); }

  TemporaryDirectory directory;
  fs::path documents = directory.path() / "documents";
  fs::path database = documents / "metricPartV11.sqlite";

  // A registration context of subscription 1 at 1000 ms, and one that cannot be read whole.
  static constexpr std::int64_t kContext = 3986700;
  static constexpr char kGoodContext[] = "08e80710027801";
  static constexpr char kCutContext[] = "08e8073205";

 private:
  std::string content_;
};

TEST_F(Replay, StoresARowForEachAttribute) {
  record(kContext, kGoodContext);
  const ToolResult result = replay("ice15");
  EXPECT_EQ(result.exitCode, 0) << testing::PrintToString(result);
  EXPECT_EQ(result.errors, "");
  EXPECT_EQ(rows("SELECT metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, metric_id, "
                 "subs_id, collected_on FROM Metric ORDER BY Id"),
            (Rows{"LTE|NAS|timestamp|1000|INT|3986700|1|1970-01-01 00:00:01",
                  "LTE|NAS|reg_status|KREG_STATUS_LIMITED_SERVICE|STRING|3986700|1|1970-01-01 00:00:01",
                  "LTE|NAS|subs_id|1|INT|3986700|1|1970-01-01 00:00:01"}));
}

TEST_F(Replay, KeepsWhatItMakesForItsUserAlone) {
  record(kContext, kGoodContext);
  replay("ice15");
  EXPECT_EQ(fs::status(documents).permissions(), fs::perms(0700));
  EXPECT_EQ(fs::status(database).permissions(), fs::perms(0600));
}

TEST_F(Replay, LeavesADatabaseFileThatIsWholeByItself) {
  record(kContext, kGoodContext);
  replay("ice15");
  const fs::path alone = directory.path() / "alone.sqlite";
  fs::copy_file(database, alone);
  EXPECT_EQ(query(alone, "SELECT count(*) FROM Metric"), Rows{"3"});
}

TEST_F(Replay, CountsWhatBecameOfTheEvents) {
  record(kContext, kGoodContext);
  record(4711, kGoodContext);
  recordLine("{}");
  record(kContext, kCutContext);
  record(3985409, kGoodContext);
  const auto summary = summaryOf(replay("ice15"));
  EXPECT_EQ(summary["events"], 5);
  EXPECT_EQ(summary["eventsWithoutRow"], 2) << "an id of no row, and no id at all";
  EXPECT_EQ(summary["unreadablePayloads"], 2) << "a damaged payload, and a metric whose class does not exist";
  EXPECT_EQ(summary["rowsInserted"], 3);
  EXPECT_EQ(summary["insertsFailed"], 0);
  EXPECT_TRUE(summary["seconds"].is_number());
  EXPECT_GE(summary["seconds"].get<double>(), 0);
  EXPECT_EQ(rows("SELECT count(*) FROM Metric"), Rows{"3"});
}

TEST_F(Replay, MetricsWithAFixedClassAreReadable) {
  record(806743, "08e807b80101");
  record(827746, "08e8071801");
  const auto summary = summaryOf(replay("mav20"));
  EXPECT_EQ(summary["unreadablePayloads"], 0);
  EXPECT_EQ(rows("SELECT DISTINCT metric_name FROM Metric ORDER BY Id"),
            (Rows{"ConnectionStats", "Cellular RatRetention"}));
}

TEST_F(Replay, ReportsBadLinesAndPlaysTheRest) {
  recordLine("nonsense");
  record(kContext, kGoodContext);
  recordLine(R"({"kKeyMetricID":"3986700"})");
  const ToolResult result = replay("ice15");
  EXPECT_EQ(result.exitCode, 1);
  const std::string file = (directory.path() / "recording.jsonl").string();
  EXPECT_EQ(result.errors, "quorl-tool: " + file + ":1: not JSON\nquorl-tool: " + file +
                               ":3: kKeyMetricID is no integer of 64 bits\n");
  EXPECT_EQ(summaryOf(result)["events"], 1);
  EXPECT_EQ(rows("SELECT count(*) FROM Metric"), Rows{"3"});
}

TEST_F(Replay, TextsOfAFileReachTheTerminalWithoutControlCharacters) {
  recordLine(R"({"\u001b]0;x\u0007":1})");
  EXPECT_EQ(replay("ice15").errors,
            "quorl-tool: " + (directory.path() / "recording.jsonl").string() + ":1: there is no key \".]0;x.\"\n");
}

TEST_F(Replay, PlaysSeveralFilesInTheirOrder) {
  record(kContext, "10017801");
  const fs::path second = directory.path() / "second.jsonl";
  writeFile(second, R"({"kKeyMetricID":3986700,"kKeyPayload":"EAJ4AQ=="})"
                    "\n");
  const ToolResult result =
      runTool({"replay", "--chipset", "ice", "--documents", documents.string(), second.string(), recording().string()});
  EXPECT_EQ(summaryOf(result)["events"], 2);
  EXPECT_EQ(rows("SELECT attribute_value FROM Metric WHERE attribute_name = 'reg_status' ORDER BY Id"),
            (Rows{"KREG_STATUS_LIMITED_SERVICE", "KREG_STATUS_REGISTRATION_FAILURE"}));
}

TEST_F(Replay, AppliesTheRulesOfTheFamilyOfTheChipset) {
  // Aggregation of one carrier: rsrp -9250, that is -92 dBm, on an Ice device only.
  record(3986195, "08e807120458c390017801");
  replay("ice15");
  EXPECT_EQ(rows("SELECT attribute_value FROM Metric WHERE attribute_name LIKE '%rsrp'"), Rows{"-92"});
  fs::remove_all(documents);
  replay("mav20");
  EXPECT_EQ(rows("SELECT attribute_value FROM Metric WHERE attribute_name LIKE '%rsrp'"), Rows{"-9250"});
}

TEST_F(Replay, OldRowsFallToTheNextStart) {
  record(kContext, kGoodContext);
  replay("ice15");
  EXPECT_EQ(rows("SELECT count(*) FROM Metric"), Rows{"3"});
  const auto again = summaryOf(replay("ice15"));
  EXPECT_EQ(again["rowsInserted"], 3);
  EXPECT_EQ(rows("SELECT count(*) FROM Metric"), Rows{"3"}) << "those of 1970 went, and came anew";
  EXPECT_EQ(replay("ice15").errors, "quorl-tool: 3 rows of thirty days ago and older were removed\n");
}

TEST_F(Replay, RebasedRowsAreOfTodayAndStay) {
  record(kContext, kGoodContext);
  replay("ice15", {"--rebase-time"});
  replay("ice15", {"--rebase-time"});
  EXPECT_EQ(rows("SELECT count(*) FROM Metric"), Rows{"6"});
  EXPECT_EQ(rows("SELECT count(*) FROM Metric WHERE abs(julianday('now') - julianday(collected_on)) < 0.01"),
            Rows{"6"});
}

TEST_F(Replay, LogGoesToStandardErrorAndOnlyWhenAskedFor) {
  record(kContext, kGoodContext);
  const ToolResult quiet = replay("ice15");
  EXPECT_EQ(quiet.errors, "");
  const ToolResult verbose = replay("ice15", {"--verbose"});
  EXPECT_EQ(verbose.outputLines().size(), 1U);
  for (const char* line : {"Hardware manager - init - basebandchipset: ice15 - deviceClass: Quillo - isMavDevice: 0",
                           "Appdelegate - applicationDidBecomeActive", "Appdelegate - applicationWillTerminate",
                           "successfully inserted metric to db"})
    EXPECT_NE(verbose.errors.find(line), std::string::npos) << line;
}

TEST_F(Replay, FirstEventComesAfterTheRetentionRunAndTheWithdrawalAfterTheLastRow) {
  record(kContext, kGoodContext);
  const std::string log = replay("ice15", {"--verbose"}).errors;
  const std::size_t retention = log.find("successfully deleted older rows");
  const std::size_t activation = log.find("successfully started listening Zelkor applicationDidBecomeActive");
  const std::size_t event = log.find("received - metricId 3986700");
  const std::size_t lastRow = log.rfind("successfully inserted metric to db");
  const std::size_t withdrawal = log.find("removeVexilConfigForAppid success? TRUE");
  EXPECT_LT(activation, event);
  EXPECT_LT(retention, event);
  EXPECT_LT(event, lastRow);
  EXPECT_LT(lastRow, withdrawal);
  EXPECT_NE(withdrawal, std::string::npos);
}

TEST_F(Replay, TellsTheDeviceWhatItIs) {
  const ToolResult result =
      replay("mav20", {"--verbose", "--internal-build", "--carrier-build", "--device-class", "Tabrin"});
  EXPECT_NE(result.errors.find("basebandchipset: mav20 - deviceClass: Tabrin - isMavDevice: 1"), std::string::npos);
}

TEST_F(Replay, DeviceThatIsNeitherFamilyPlaysLikeMav) {
  record(806915, "08e80718027801");
  const ToolResult result = replay("other");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(summaryOf(result)["rowsInserted"], 3);
}

TEST_F(Replay, UnknownBasebandPrintsTheDialogAndEndsAsItsButtonDoes) {
  record(kContext, kGoodContext);
  const ToolResult result = replay("unknown");
  EXPECT_EQ(result.exitCode, -SIGABRT);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.errorLines().at(0),
            "Error Occured: Unable to get baseband information. Please try again or file a bug report. [Done]");
}

TEST_F(Replay, TelephonyScriptPlaysBesideTheRecording) {
  record(kContext, kGoodContext);
  const ToolResult result =
      replay("mav20", {"--internal-build", "--telephony", sourcePath("resources/telephony/two-sims.jsonl").string()});
  EXPECT_EQ(result.exitCode, 0) << testing::PrintToString(result);
  EXPECT_EQ(rows("SELECT DISTINCT subs_id FROM Metric WHERE metric_tech = 'RAT' ORDER BY subs_id"), (Rows{"0", "1"}));
  EXPECT_EQ(rows("SELECT count(*) FROM Metric WHERE metric_tech = 'LTE'"), Rows{"3"});
  EXPECT_EQ(rows("SELECT count(*) FROM Metric"), Rows{summaryOf(result)["rowsInserted"].dump()});
}

TEST_F(Replay, StepOfTheScriptComesBeforeTheEventOfItsTime) {
  recordLine(R"({"atMs":100,"kKeyMetricID":3986700,"kKeyPayload":"EAF4AQ=="})");
  recordLine(R"({"atMs":200,"kKeyMetricID":3986700,"kKeyPayload":"EAJ4AQ=="})");
  const fs::path script = directory.path() / "script.jsonl";
  writeFile(script, R"({"atMs":0,"event":"simInserted","slot":1,"carrier":"Testnet"}
{"atMs":200,"event":"cell","slot":1,"info":{"kHVCellMonitorTAC":513}}
)");
  const ToolResult result = replay("ice15", {"--telephony", script.string()});
  EXPECT_EQ(result.exitCode, 0) << testing::PrintToString(result);
  EXPECT_EQ(rows("SELECT attribute_value FROM Metric WHERE attribute_name IN ('reg_status', 'kHVCellMonitorTAC') "
                 "ORDER BY Id"),
            (Rows{"KREG_STATUS_REGISTRATION_FAILURE", "513", "KREG_STATUS_LIMITED_SERVICE"}));
}

TEST_F(Replay, BadLinesOfTheScriptAreReportedAndAMissingScriptIsAnError) {
  record(kContext, kGoodContext);
  const fs::path script = directory.path() / "script.jsonl";
  const ToolResult missing = replay("ice15", {"--telephony", script.string()});
  EXPECT_EQ(missing.exitCode, 1);
  EXPECT_EQ(missing.errorLines().size(), 1U);
  EXPECT_FALSE(fs::exists(documents));
  writeFile(script, "nonsense\n");
  const ToolResult bad = replay("ice15", {"--telephony", script.string()});
  EXPECT_EQ(bad.exitCode, 1);
  EXPECT_EQ(bad.errors.rfind("quorl-tool: " + script.string() + ":1: ", 0), 0U) << bad.errors;
  EXPECT_EQ(rows("SELECT count(*) FROM Metric"), Rows{"3"});
}

TEST_F(Replay, MissingRecordingIsAnErrorBeforeAnythingIsMade) {
  const ToolResult result = runTool({"replay", "--chipset", "mav", "--documents", documents.string(),
                                     recording().string(), (directory.path() / "missing.jsonl").string()});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.errors,
            "quorl-tool: " + (directory.path() / "missing.jsonl").string() + ": No such file or directory\n");
  EXPECT_FALSE(fs::exists(documents));
}

TEST_F(Replay, DocumentsThatCannotBeUsedAreAnError) {
  writeFile(directory.path() / "file", "x");
  for (const fs::path& place : {directory.path() / "file", directory.path() / "file" / "below", fs::path("/proc/x")}) {
    documents = place;
    const ToolResult result = replay("mav");
    EXPECT_EQ(result.exitCode, 1) << place << testing::PrintToString(result);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(result.errorLines().size(), 1U);
    EXPECT_EQ(result.errors.rfind("quorl-tool: " + place.string() + ": ", 0), 0U) << result.errors;
  }
}

TEST_F(Replay, FileThatIsNoDatabaseIsAnErrorAndStaysAsItIs) {
  fs::create_directory(documents);
  const std::string content(4096, 'x');
  writeFile(database, content);
  const ToolResult result = replay("mav");
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.errors, "quorl-tool: " + database.string() + ": file is not a database\n");
  EXPECT_EQ(readFile(database), content);
  fs::remove(database);
  fs::create_directory(database);
  EXPECT_EQ(replay("mav").exitCode, 1);
}

TEST_F(Replay, FailedInsertsAreCountedAndMakeItFail) {
  record(kContext, kGoodContext);
  replay("ice15", {"--rebase-time"});
  query(database, "CREATE TRIGGER refusal BEFORE INSERT ON Metric BEGIN SELECT RAISE(ABORT, 'refused'); END");
  const ToolResult result = replay("ice15");
  const auto summary = summaryOf(result);
  EXPECT_EQ(summary["rowsInserted"], 0);
  EXPECT_EQ(summary["insertsFailed"], 3);
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.errors, "quorl-tool: 3 rows could not be stored: refused\n");
}

TEST_F(Replay, ShippedRecordingsAreReadWhole) {
  for (const auto& [chipset, name] : {std::pair("mav20", "mav"), std::pair("ice15", "ice")}) {
    const fs::path file = sourcePath("resources/recordings/" + std::string(name) + ".jsonl");
    const ToolResult result = runTool(
        {"replay", "--chipset", chipset, "--documents", (documents / name).string(), "--rebase-time", file.string()});
    EXPECT_EQ(result.exitCode, 0) << testing::PrintToString(result);
    const auto summary = summaryOf(result);
    EXPECT_EQ(summary["eventsWithoutRow"], 0);
    EXPECT_EQ(summary["unreadablePayloads"], 0);
    EXPECT_EQ(summary["insertsFailed"], 0);
    EXPECT_EQ(query(documents / name / "metricPartV11.sqlite", "SELECT count(*) FROM Metric"),
              Rows{summary["rowsInserted"].dump()});
  }
}

TEST_F(Replay, SummaryShowsEachMetricOnce) {
  record(kContext, kGoodContext);
  record(kContext, "08d00f7801");
  record(3986701, "08e80710007801");
  replay("ice15");
  const ToolResult table = runTool({"summary", "--documents", documents.string()});
  EXPECT_EQ(table.exitCode, 0);
  EXPECT_EQ(table.output,
            "Technology  Metric          Rows  Last seen\n"
            "GSM         Active Bearers     1  1970-01-01 00:00:01\n"
            "LTE         Active Bearers     1  1970-01-01 00:00:01\n"
            "LTE         NAS                5  1970-01-01 00:00:02\n"
            "UMTS        Active Bearers     1  1970-01-01 00:00:01\n");
  EXPECT_EQ(runTool({"summary", "--json", "--documents", documents.string()}).outputLines().at(2),
            R"({"tech":"LTE","name":"NAS","rows":5,"lastSeen":"1970-01-01 00:00:02"})");
}

TEST_F(Replay, SummaryOfNothingIsAnError) {
  const ToolResult missing = runTool({"summary", "--documents", documents.string()});
  EXPECT_EQ(missing.exitCode, 1);
  EXPECT_EQ(missing.errors, "quorl-tool: " + database.string() + ": No such file or directory\n");
  fs::create_directory(documents);
  writeFile(database, "");
  EXPECT_EQ(runTool({"summary", "--documents", documents.string()}).errors,
            "quorl-tool: " + database.string() + ": no such table: Metric\n");
  fs::remove(database);
  fs::create_symlink(database, database);
  EXPECT_EQ(runTool({"summary", "--documents", documents.string()}).errors,
            "quorl-tool: " + database.string() + ": Too many levels of symbolic links\n")
      << "it may be there, and cannot be looked at";
}

}  // namespace
}  // namespace quorl::test
