#include <sstream>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "ToolRun.h"

namespace quorl::test {
namespace {

using Arguments = std::vector<std::string>;

/// The names of the subcommands, as the help lists them.
std::vector<std::string> subcommands() {
  std::istringstream help(runTool({"--help"}).output);
  std::string line;
  while (std::getline(help, line) && line != "Subcommands:") continue;
  std::vector<std::string> names;
  while (std::getline(help, line) && !line.empty()) std::istringstream(line) >> names.emplace_back();
  EXPECT_GT(names.size(), 10U);
  return names;
}

TEST(ToolUsage, WrongUseIsOneLineAndExitTwo) {
  const Arguments wrong[] = {
      {},
      {"decode"},
      {"decode", "--class"},
      {"decode", "--class", "KCellularEmmContext", "surplus"},
      {"encode"},
      {"catalogue", "surplus"},
      {"replay", "--documents", "somewhere", "file.jsonl"},
      {"replay", "--chipset", "mav", "file.jsonl"},
      {"replay", "--chipset", "mav", "--documents", "somewhere"},
      {"replay", "--chipset", "mav", "--documents", "somewhere", "--no-such-option", "file.jsonl"},
      {"summary"},
      {"schema", "--class"},
      {"--no-such-option"},
      {"no-such-command"},
  };
  for (const Arguments& arguments : wrong) {
    const ToolResult result = runTool(arguments);
    EXPECT_EQ(result.exitCode, 2) << testing::PrintToString(arguments) << testing::PrintToString(result);
    EXPECT_EQ(result.output, "") << testing::PrintToString(arguments);
    EXPECT_EQ(result.errorLines().size(), 1U) << testing::PrintToString(arguments) << result.errors;
  }
}

TEST(ToolUsage, NamesWhatIsWrong) {
  EXPECT_EQ(runTool({"no-such-command"}).errors,
            "quorl-tool: there is no subcommand \"no-such-command\" (see quorl-tool --help)\n");
  EXPECT_EQ(runTool({"decode"}).errors, "quorl-tool: --class is required (see quorl-tool --help)\n");
}

TEST(ToolUsage, HelpIsAResult) {
  const ToolResult whole = runTool({"--help"});
  EXPECT_EQ(whole.exitCode, 0);
  EXPECT_EQ(whole.errors, "");
  for (const std::string& command : subcommands()) {
    const ToolResult one = runTool({command, "--help"});
    EXPECT_EQ(one.exitCode, 0) << command;
    EXPECT_EQ(one.errors, "") << command;
    EXPECT_NE(one.output.find("Usage: quorl-tool " + command), std::string::npos) << one.output;
  }
}

TEST(ToolUsage, VersionIsAResult) {
  const ToolResult result = runTool({"--version"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.errors, "");
  EXPECT_THAT(result.output, testing::MatchesRegex("quorl-tool [0-9]+\\.[0-9]+\\.[0-9]+\n"));
}

TEST(ToolUsage, TheManualNamesEverySubcommand) {
  const std::string manual = readFile(sourcePath("packaging/man/quorl-tool.1"));
  for (const std::string& name : subcommands())
    EXPECT_NE(manual.find("\n.B " + name + "\n"), std::string::npos) << name;
}

TEST(ToolUsage, UnknownClassComesWithTheNearestNames) {
  for (const char* command : {"decode", "encode", "schema"}) {
    const ToolResult result = runTool({command, "--class", "KCellularEmContext"});
    EXPECT_EQ(result.exitCode, 2) << command;
    EXPECT_EQ(result.output, "") << command;
    EXPECT_EQ(result.errors,
              "quorl-tool: there is no message class \"KCellularEmContext\"; the nearest are KCellularEmmContext, "
              "KCellularMmContext, KCellularGmmContext\n");
  }
  EXPECT_EQ(runTool({"decode", "--class", "kCellularGsmIdleConfig"}).exitCode, 2)
      << "class names are told apart by case";
  EXPECT_EQ(runTool({"decode", "--class", ""}).exitCode, 2);
  EXPECT_EQ(runTool({"decode", "--class", std::string(100000, 'x')}).exitCode, 2);
}

TEST(ToolUsage, OutputThatCannotBeWrittenIsAFailure) {
  const ToolResult result = runProgram("/bin/sh", {"-c", "\"$0\" catalogue > /dev/full", QUORL_TOOL});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.errors, "quorl-tool: standard output cannot be written\n");
}

}  // namespace
}  // namespace quorl::test
