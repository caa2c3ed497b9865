#include <filesystem>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "TextTable.h"
#include "ToolRun.h"
#include "store/RawDatabase.h"
#include "support/TemporaryDirectory.h"

// The subcommands that show what the screens show.

namespace quorl::test {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;
using ::testing::SizeIs;
using ::testing::StartsWith;
using Words = std::vector<std::string>;
using Json = nlohmann::json;

class ScreensTool : public testing::Test {
 protected:
  void SetUp() override {
    // A replay of nothing leaves an empty store behind.
    const auto recording = directory.path() / "empty.jsonl";
    writeFile(recording, "");
    const ToolResult made = runTool({"replay", "--chipset", "mav20", "--documents", documents(), recording.string()});
    ASSERT_EQ(made.exitCode, 0) << made.errors;
  }

  std::string documents() const { return (directory.path() / "documents").string(); }
  ToolResult tool(Words words) const {
    words.insert(words.end(), {"--documents", documents()});
    return runTool(words);
  }
  std::vector<Json> json(Words words) const {
    words.emplace_back("--json");
    const ToolResult result = tool(words);
    EXPECT_EQ(result.exitCode, 0) << result.errors;
    std::vector<Json> lines;
    for (const std::string& line : result.outputLines()) lines.push_back(Json::parse(line));
    return lines;
  }

  void sql(const std::string& text) const { RawDatabase(documents() + "/metricPartV11.sqlite").run(text); }
  /// Inserts what `rows`, a SELECT or VALUES, gives for the columns of a row in their order.
  void insert(const std::string& rows) const {
    sql("INSERT INTO Metric (metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
        "is_attribute_graphable, metric_id, subs_id, collected_on) " +
        rows);
  }
  /// A row of today, also if midnight passes during the test.
  void stored(const std::string& tech, const std::string& metric, const std::string& attribute,
              const std::string& value, int subsId = 0, const std::string& when = "+1 minutes",
              const std::string& metricId = "803010") const {
    insert("VALUES ('" + tech + "', '" + metric + "', '" + attribute + "', '" + value + "', 'INT', 1, '" + metricId +
           "', " + std::to_string(subsId) + ", datetime('now', '" + when + "'))");
  }

  TemporaryDirectory directory;
};

// metrics

TEST_F(ScreensTool, MetricsListsTheMetricsBehindTheTelephonyRows) {
  stored("MISC", "Reg Attempt", "cause", "3");
  stored("LTE", "Tx Power", "power", "11");
  stored("LTE", "Other SIM", "power", "11", 1);
  const auto lines = json({"metrics"});
  ASSERT_THAT(lines, SizeIs(3));
  EXPECT_EQ(lines[0]["tech"], "RAT");
  EXPECT_EQ(lines[0]["name"], "Cell Info");
  EXPECT_EQ(lines[1]["tech"], "LTE");
  EXPECT_EQ(lines[1]["name"], "Tx Power");
  EXPECT_EQ(lines[2]["tech"], "MISC");
}

TEST_F(ScreensTool, MetricsOfTheOtherSubscription) {
  stored("LTE", "Tx Power", "power", "11", 1);
  EXPECT_THAT(json({"metrics"}), SizeIs(1));
  const auto lines = json({"metrics", "--subscription", "1"});
  ASSERT_THAT(lines, SizeIs(2));
  EXPECT_EQ(lines[1]["subscription"], 1);
}

TEST_F(ScreensTool, MetricsOfAnInternalBuildHaveTheBandRows) {
  EXPECT_THAT(json({"metrics", "--internal-build"}), SizeIs(3));
  EXPECT_THAT(json({"metrics", "--carrier-build"}), SizeIs(3));
}

TEST_F(ScreensTool, MetricsAsATable) {
  stored("LTE", "Tx Power", "power", "11", 0, "-1 days");
  const ToolResult result = tool({"metrics"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.errors, "");
  const auto lines = result.outputLines();
  ASSERT_THAT(lines, SizeIs(5));
  EXPECT_THAT(lines[0], StartsWith("Last refreshed: "));
  EXPECT_EQ(lines[2], "Technology  Metric     Last seen");
  EXPECT_THAT(lines[3], StartsWith("RAT         Cell Info  "));
  EXPECT_THAT(lines[4], StartsWith("LTE         Tx Power   "));
}

TEST_F(ScreensTool, RowsThatCannotBeReadAreAFailure) {
  stored("LTE", "Tx Power", "power", "11");
  sql("UPDATE Metric SET metric_tech = NULL");
  const ToolResult metrics = tool({"metrics"});
  EXPECT_EQ(metrics.exitCode, 1);
  EXPECT_EQ(metrics.errors, "quorl-tool: the metrics cannot be read (see --verbose)\n");
  const ToolResult exported = tool({"export", "--time-frame", "daily"});
  EXPECT_EQ(exported.exitCode, 1);
  EXPECT_EQ(exported.errors, "quorl-tool: the rows cannot be read (see --verbose)\n");
  EXPECT_EQ(exported.output, "");
}

TEST_F(ScreensTool, VerboseShowsTheLog) {
  EXPECT_THAT(tool({"metrics", "--verbose"}).errors, HasSubstr("AllMetricsViewModel - loadMetricList "));
}

// show

TEST_F(ScreensTool, ShowPrintsTheLatestValuesAsTheDetailScreenDoes) {
  stored("LTE", "Serving Cell Info", "dl_bw", "50", 0, "-1 minutes");
  stored("LTE", "Serving Cell Info", "dl_bw", "100");
  stored("LTE", "Serving Cell Info", "timestamp", "1700000000123");
  const auto lines = json({"show", "--tech", "LTE", "--metric", "Serving Cell Info"});
  ASSERT_THAT(lines, SizeIs(1));
  EXPECT_EQ(lines[0]["attribute"], "dl_bw");
  EXPECT_EQ(lines[0]["value"], "20 MHz");
  EXPECT_EQ(lines[0]["isBookmarked"], false);
  EXPECT_EQ(lines[0]["graphable"], true);
  EXPECT_FALSE(lines[0].contains("section"));
}

TEST_F(ScreensTool, ABandwidthIsReadByTheFamilyOfTheStoredMetrics) {
  stored("LTE", "Serving Cell Info", "dl_bw", "100", 0, "+1 minutes", "3948738");
  EXPECT_EQ(json({"show", "--tech", "LTE", "--metric", "Serving Cell Info"})[0]["value"], "10 MHz");
  EXPECT_EQ(json({"show", "--tech", "LTE", "--metric", "Serving Cell Info", "--chipset", "mav1"})[0]["value"],
            "20 MHz");
}

TEST_F(ScreensTool, ShowPrintsSections) {
  for (const char* attribute : {"0-section-rsrp", "1-section-rsrp", "2-section-rsrp"})
    stored("LTE", "CA Status", attribute, "-90");
  const auto lines = json({"show", "--tech", "LTE", "--metric", "CA Status"});
  ASSERT_THAT(lines, SizeIs(2));
  EXPECT_EQ(lines[0]["section"], "CA Status 0");
  EXPECT_EQ(lines[1]["section"], "CA Status 1");
  EXPECT_EQ(lines[1]["name"], "rsrp");
  EXPECT_THAT(tool({"show", "--tech", "LTE", "--metric", "CA Status"}).output, HasSubstr("\nCA Status 0\n"));
}

TEST_F(ScreensTool, ShowAsATable) {
  stored("LTE", "Tx Power", "power", "11");
  const ToolResult result = tool({"show", "--tech", "LTE", "--metric", "Tx Power", "--internal-build"});
  EXPECT_EQ(result.errors, "");
  const auto lines = result.outputLines();
  ASSERT_THAT(lines, SizeIs(4));
  EXPECT_THAT(lines[0], StartsWith("Last seen on: "));
  EXPECT_EQ(lines[2], "Attribute  Value  Pinned  Graph");
  EXPECT_EQ(lines[3], "power      11             yes");
}

TEST_F(ScreensTool, ShowOfNothingIsAFailure) {
  const ToolResult result = tool({"show", "--tech", "LTE", "--metric", "Tx Power"});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.errors,
            "quorl-tool: there is nothing of LTE \"Tx Power\" for subscription 0 (see quorl-tool metrics)\n");
}

TEST_F(ScreensTool, ControlCharactersOfAStoredTextDoNotReachTheTerminal) {
  insert("VALUES ('LTE', 'Odd', 'power', char(27) || '[31mred' || char(10), 'STRING', 0, '1', 0, datetime('now'))");
  const ToolResult result = tool({"show", "--tech", "LTE", "--metric", "Odd"});
  EXPECT_THAT(result.output, HasSubstr(".[31mred."));
  EXPECT_THAT(result.output, Not(HasSubstr("\x1b")));
}

TEST_F(ScreensTool, ControlCharactersOfAStoredNameDoNotReachTheTerminalInASummary) {
  insert("VALUES ('LTE', 'Odd' || char(27) || '[31m', 'power', '1', 'INT', 0, '1', 0, datetime('now'))");
  const ToolResult result = tool({"summary"});
  EXPECT_THAT(result.output, HasSubstr("Odd.[31m"));
  EXPECT_THAT(result.output, Not(HasSubstr("\x1b")));
}

// dashboard, pin, unpin

TEST_F(ScreensTool, DashboardPrintsTheDefaultPinsThatHaveReadings) {
  stored("LTE", "Serving Cell Info", "dl_freq", "300");
  stored("LTE", "Serving Cell Info", "ul_freq", "18300");
  const auto lines = json({"dashboard"});
  ASSERT_THAT(lines, SizeIs(2));
  EXPECT_EQ(lines[0]["attribute"], "dl_freq");
  EXPECT_EQ(lines[0]["value"], "300");
  EXPECT_EQ(lines[0]["metric"], "Serving Cell Info");
  EXPECT_EQ(lines[1]["attribute"], "ul_freq");
  EXPECT_THAT(json({"dashboard", "--subscription", "1"}), IsEmpty());
}

TEST_F(ScreensTool, ADashboardWithASingleReadingPrintsNoneAndSaysSo) {
  stored("LTE", "Serving Cell Info", "dl_freq", "300");
  const ToolResult result = tool({"dashboard"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.output, "Attribute  Value  Technology  Metric  Last seen\n");
  EXPECT_EQ(result.errors, "quorl-tool: fewer than two of the pinned attributes have a reading\n");
}

TEST_F(ScreensTool, DashboardAsATable) {
  stored("LTE", "Serving Cell Info", "dl_freq", "300");
  stored("LTE", "Serving Cell Info", "ul_freq", "18300");
  const ToolResult result = tool({"dashboard"});
  EXPECT_EQ(result.errors, "");
  const auto lines = result.outputLines();
  ASSERT_THAT(lines, SizeIs(3));
  EXPECT_EQ(lines[0], "Attribute  Value  Technology  Metric             Last seen");
  EXPECT_THAT(lines[1], StartsWith("dl_freq    300    LTE         Serving Cell Info  "));
}

TEST_F(ScreensTool, PinPutsAnAttributeOnTheDashboardAndUnpinTakesItOff) {
  stored("LTE", "Tx Power", "power", "11");
  stored("LTE", "Tx Power", "band", "3");
  for (const char* attribute : {"power", "band"}) {
    const ToolResult pinned = tool({"pin", "--tech", "LTE", "--metric", "Tx Power", "--attribute", attribute});
    EXPECT_EQ(pinned.exitCode, 0);
    EXPECT_EQ(pinned.output + pinned.errors, "");
  }
  EXPECT_THAT(json({"dashboard"}), SizeIs(2));
  EXPECT_EQ(json({"show", "--tech", "LTE", "--metric", "Tx Power"})[1]["isBookmarked"], true);
  const ToolResult unpinned = tool({"unpin", "--tech", "LTE", "--attribute", "power"});
  EXPECT_EQ(unpinned.exitCode, 0);
  EXPECT_EQ(unpinned.output + unpinned.errors, "");
  EXPECT_EQ(json({"show", "--tech", "LTE", "--metric", "Tx Power"})[1]["isBookmarked"], false);
}

TEST_F(ScreensTool, PinningWhatIsNotThereTellsTheNearestNames) {
  stored("LTE", "Tx Power", "power", "11");
  const ToolResult result = tool({"pin", "--tech", "LTE", "--metric", "Tx Power", "--attribute", "powr"});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.errors,
            "quorl-tool: there is no attribute \"powr\" of LTE \"Tx Power\" for subscription 0; nearest: power\n");
}

TEST_F(ScreensTool, UnpinningWhatIsNotPinnedIsAFailure) {
  const ToolResult result = tool({"unpin", "--tech", "LTE", "--attribute", "power", "--subscription", "1"});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.errors, "quorl-tool: LTE \"power\" is not on the dashboard of subscription 1\n");
}

// history

TEST_F(ScreensTool, HistoryOfADayIsOfOneSubscriptionAndThatOfAWeekOfBoth) {
  // In one statement, so that midnight cannot come between them.
  insert(
      "SELECT 'RAT', 'Cell Info', 'kHVCellMonitorCellId', value, 'INT', 1, 'Cell Info', subs_id, "
      "datetime('now', '+1 minutes') FROM (SELECT '10' AS value, 0 AS subs_id UNION SELECT '30', 1)");
  const Words attribute{"history", "--metric", "Cell Info", "--attribute", "kHVCellMonitorCellId", "--time-frame"};
  const auto with = [&](Words words) {
    words.insert(words.begin(), attribute.begin(), attribute.end());
    return json(words);
  };
  const auto daily = with({"daily"});
  ASSERT_THAT(daily, SizeIs(1));
  EXPECT_EQ(daily[0]["value"], "10");
  EXPECT_EQ(with({"daily", "--subscription", "1"}).at(0)["value"], "30");
  const auto weekly = with({"weekly"});
  ASSERT_THAT(weekly, SizeIs(1));
  EXPECT_EQ(weekly[0]["value"], "20.0");
  EXPECT_EQ(with({"weekly", "--subscription", "1"}), weekly);
}

TEST_F(ScreensTool, HistoryOfAWeekAveragesEachDay) {
  insert(
      "SELECT 'RAT', 'Cell Info', 'kHVCellMonitorCellId', value, 'INT', 1, 'Cell Info', 0, datetime('now') "
      "FROM (SELECT '10' AS value UNION SELECT '25')");
  for (const char* frame : {"weekly", "monthly"}) {
    const auto lines =
        json({"history", "--metric", "Cell Info", "--attribute", "kHVCellMonitorCellId", "--time-frame", frame});
    ASSERT_THAT(lines, SizeIs(1));
    EXPECT_EQ(lines[0]["value"], "17.5");
    const ToolResult text =
        tool({"history", "--metric", "Cell Info", "--attribute", "kHVCellMonitorCellId", "--time-frame", frame});
    EXPECT_THAT(text.output, StartsWith("kHVCellMonitorCellId average\n\nTime "));
  }
}

TEST_F(ScreensTool, HistoryDrawsBarsWhenAskedTo) {
  stored("RAT", "Cell Info", "kHVCellMonitorCellId", "50");
  stored("RAT", "Cell Info", "kHVCellMonitorCellId", "100");
  const Words words{"history", "--metric", "Cell Info", "--attribute", "kHVCellMonitorCellId", "--time-frame", "daily"};
  const auto barWidths = [&](const ToolResult& result) {
    std::vector<std::size_t> widths;
    for (const std::string& line : result.outputLines()) {
      const std::size_t bar = line.find("█");
      if (bar != std::string::npos) widths.push_back(tool::displayWidth(std::string_view(line).substr(bar)));
    }
    return widths;
  };
  Words charted = words;
  charted.emplace_back("--chart");
  const auto widths = barWidths(tool(charted));
  ASSERT_THAT(widths, SizeIs(2));
  EXPECT_GE(widths[1], 10U);
  EXPECT_EQ(widths[0], (widths[1] + 1) / 2);
  EXPECT_THAT(barWidths(tool(words)), IsEmpty());  // the output is a file
}

TEST_F(ScreensTool, HistoryOfNothingSaysWhatTheScreenSays) {
  const ToolResult result = tool({"history", "--metric", "Cell Info", "--attribute", "x", "--time-frame", "monthly"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.output, "x average\n\nhavent received for today\n");
}

// export

TEST_F(ScreensTool, ExportPrintsTheTextAndNothingElse) {
  stored("LTE", "Tx Power", "power", "MODULATION_11");
  stored("LTE", "Tx Power", "power", "12", 1);
  const ToolResult result = tool({"export", "--time-frame", "daily"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.errors, "");
  EXPECT_THAT(result.output, StartsWith("QuorlInternal_4.Metric(id: "));
  EXPECT_THAT(result.output, HasSubstr("attributeValue: MODULATION_11, attributeValueType: , collectedOn: "));
  EXPECT_THAT(result.output, HasSubstr("sectionNumber: nil),QuorlInternal_4.Metric(id: "));
  EXPECT_THAT(result.output,
              ::testing::EndsWith("subsId: 1, graphable: false, isBookmarked: false, sectionNumber: nil)"));
}

TEST_F(ScreensTool, ExportTakesTheRowsOfItsTimeFrame) {
  stored("LTE", "Tx Power", "power", "1");
  stored("LTE", "Tx Power", "power", "2", 0, "-4 days");
  stored("LTE", "Tx Power", "power", "3", 0, "-20 days");
  EXPECT_THAT(tool({"export", "--time-frame", "daily"}).output, HasSubstr("attributeValue: 1,"));
  EXPECT_THAT(tool({"export", "--time-frame", "daily"}).output, Not(HasSubstr("attributeValue: 2,")));
  EXPECT_THAT(tool({"export", "--time-frame", "weekly"}).output, HasSubstr("attributeValue: 2,"));
  EXPECT_THAT(tool({"export", "--time-frame", "weekly"}).output, Not(HasSubstr("attributeValue: 3,")));
  EXPECT_THAT(tool({"export", "--time-frame", "monthly"}).output, HasSubstr("attributeValue: 3,"));
}

TEST_F(ScreensTool, ExportOfNothingIsAnEmptyText) {
  const ToolResult result = tool({"export", "--time-frame", "daily"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.output, "");
}

TEST_F(ScreensTool, ExportWritesAFileForItsOwnerAlone) {
  stored("LTE", "Tx Power", "power", "11");
  const auto file = directory.path() / "export.txt";
  const ToolResult result = tool({"export", "--time-frame", "daily", "--output", file.string()});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.output, "");
  EXPECT_THAT(readFile(file), HasSubstr("attributeValue: 11, "));
  EXPECT_EQ(std::filesystem::status(file).permissions(), std::filesystem::perms(0600));
}

TEST_F(ScreensTool, AnExportThatCannotBeWrittenIsAFailure) {
  const auto file = directory.path() / "missing" / "export.txt";
  const ToolResult result = tool({"export", "--time-frame", "daily", "--output", file.string()});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.errors, "quorl-tool: " + file.string() + ": No such file or directory\n");
}

TEST_F(ScreensTool, AnExportSparesTheDatabase) {
  stored("LTE", "Tx Power", "power", "11");
  const auto database = documents() + "/metricPartV11.sqlite";
  const ToolResult result = tool({"export", "--time-frame", "daily", "--output", database});
  EXPECT_EQ(result.exitCode, 2);
  EXPECT_EQ(result.errors, "quorl-tool: " + database + ": belongs to a database and is not overwritten\n");
  EXPECT_EQ(tool({"export", "--time-frame", "daily", "--output", database + "-wal"}).exitCode, 2);
  EXPECT_THAT(tool({"export", "--time-frame", "daily"}).output, HasSubstr("attributeValue: 11, "));
}

// All of them

TEST_F(ScreensTool, RowsThatTheRetentionTakesAreTold) {
  stored("LTE", "Tx Power", "power", "1", 0, "-31 days");
  stored("LTE", "Tx Power", "power", "2", 0, "-40 days");
  stored("LTE", "Tx Power", "power", "3");
  EXPECT_EQ(tool({"metrics"}).errors, "quorl-tool: 2 rows of thirty days ago and older were removed\n");
  EXPECT_EQ(tool({"metrics"}).errors, "");
  stored("LTE", "Tx Power", "power", "1", 0, "-31 days");
  EXPECT_EQ(tool({"summary"}).errors, "") << "does not open the store";
  EXPECT_EQ(tool({"export", "--time-frame", "daily"}).errors,
            "quorl-tool: 1 row of thirty days ago and older was removed\n");
}

TEST_F(ScreensTool, WithoutADatabaseNothingIsMade) {
  const auto missing = (directory.path() / "missing").string();
  for (const Words& words :
       std::vector<Words>{{"metrics"},
                          {"dashboard"},
                          {"show", "--tech", "a", "--metric", "b"},
                          {"pin", "--tech", "a", "--metric", "b", "--attribute", "c"},
                          {"unpin", "--tech", "a", "--attribute", "c"},
                          {"history", "--metric", "a", "--attribute", "b", "--time-frame", "daily"},
                          {"export", "--time-frame", "daily"}}) {
    Words all = words;
    all.insert(all.end(), {"--documents", missing});
    const ToolResult result = runTool(all);
    EXPECT_EQ(result.exitCode, 1) << words[0];
    EXPECT_EQ(result.errors, "quorl-tool: " + missing + "/metricPartV11.sqlite: No such file or directory\n");
    EXPECT_FALSE(std::filesystem::exists(missing));
  }
}

TEST_F(ScreensTool, WrongUseIsToldInOneLine) {
  const auto errorOf = [&](const Words& words) {
    const ToolResult result = tool(words);
    EXPECT_EQ(result.exitCode, 2);
    return result.errors;
  };
  EXPECT_EQ(errorOf({"metrics", "--subscription", "2"}),
            "quorl-tool: --subscription: 2 not in {0,1} (see quorl-tool --help)\n");
  EXPECT_EQ(errorOf({"export", "--time-frame", "hourly"}),
            "quorl-tool: --time-frame: hourly not in {daily,weekly,monthly} (see quorl-tool --help)\n");
  EXPECT_EQ(errorOf({"export"}), "quorl-tool: --time-frame is required (see quorl-tool --help)\n");
}

TEST_F(ScreensTool, TheDatabaseFileIsWholeAfterwards) {
  ASSERT_EQ(tool({"dashboard"}).exitCode, 0);  // writes the default pins
  std::error_code none;
  const auto log = documents() + "/metricPartV11.sqlite-wal";
  EXPECT_TRUE(!std::filesystem::exists(log, none) || std::filesystem::file_size(log) == 0);
}

}  // namespace
}  // namespace quorl::test
