#include <cstring>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include <gtest/gtest.h>

#include "ToolRun.h"
#include "support/TemporaryDirectory.h"

// What options take for a number or a text.

namespace quorl::test {
namespace {

namespace fs = std::filesystem;
using Arguments = std::vector<std::string>;

std::string refusal(const Arguments& arguments) {
  const ToolResult result = runTool(arguments);
  EXPECT_EQ(result.exitCode, 2) << testing::PrintToString(arguments) << testing::PrintToString(result);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.errorLines().size(), 1U) << result.errors;
  return result.errors;
}

TEST(ToolOptions, NumbersOutOfTheirRangeAreRefused) {
  const Arguments simulate{"simulate", "--scenario", "city", "--documents", "/nowhere"};
  const Arguments carriers{"carriers", "--telephony", "/nowhere"};
  const auto with = [](Arguments arguments, const std::string& option, const std::string& value) {
    arguments.insert(arguments.end(), {option, value});
    return arguments;
  };
  EXPECT_EQ(refusal(with(simulate, "--minutes", "nan")),
            "quorl-tool: --minutes: nan is no number from 0 to 44640 (see quorl-tool --help)\n");
  EXPECT_EQ(refusal(with(simulate, "--speed", "nan")),
            "quorl-tool: --speed: nan is no number from 0.001 to 100000 (see quorl-tool --help)\n");
  refusal(with(simulate, "--session-minutes", "nan"));
  refusal(with(simulate, "--history-days", "32"));
  refusal(with(simulate, "--sessions-per-day", "-1"));
  EXPECT_EQ(refusal(with(simulate, "--seed", "-1")),
            "quorl-tool: --seed: -1 is no whole number from 0 to 18446744073709551615 (see quorl-tool --help)\n");
  refusal(with(simulate, "--seed", "18446744073709551616"));
  EXPECT_EQ(refusal(with(carriers, "--until-ms", "-1")),
            "quorl-tool: --until-ms: -1 is no whole number from 0 to 9223372036854775807 (see quorl-tool --help)\n");
  refusal(with(carriers, "--until-ms", "99999999999999999999"));
  EXPECT_EQ(refusal(with(carriers, "--press", "-1")),
            "quorl-tool: --press: -1 is no whole number from 1 to 18446744073709551615 (see quorl-tool --help)\n");
  refusal(with(carriers, "--press", "0"));
}

TEST(ToolOptions, EmptyTextsAreRefused) {
  EXPECT_EQ(refusal({"carriers", "--telephony", ""}),
            "quorl-tool: --telephony: must not be empty (see quorl-tool --help)\n");
  refusal({"replay", "--chipset", "mav", "--documents", "/nowhere", "--telephony", "", "file.jsonl"});
  refusal({"replay", "--chipset", "mav", "--documents", "", "file.jsonl"});
  refusal({"metrics", "--documents", ""});
  refusal({"summary", "--documents", ""});
  refusal({"export", "--documents", "/nowhere", "--time-frame", "daily", "--output", ""});
  refusal({"simulate", "--scenario", "city", "--documents", "/nowhere", "--record", ""});
}

/// Makes a locale whose only speciality is a comma in numbers, in the form in which the C library reads it.
void makeCommaLocale(const fs::path& directory) {
  constexpr std::uint32_t kMagic = 0x20031114;
  constexpr std::uint32_t kItems = 6;
  constexpr std::uint32_t kHeadSize = 8 + 4 * kItems;
  // Decimal point, separator of thousands, groups; the first two as wide characters from a multiple of 4; encoding.
  const std::string texts(",\0.\0\3\3\0\0,\0\0\0.\0\0\0UTF-8\0", 22);
  const std::vector<std::uint32_t> head{kMagic,        kItems,        kHeadSize,      kHeadSize + 2,
                                        kHeadSize + 4, kHeadSize + 8, kHeadSize + 12, kHeadSize + 16};
  std::string content(kHeadSize, '\0');
  std::memcpy(content.data(), head.data(), kHeadSize);
  fs::create_directories(directory);
  writeFile(directory / "LC_NUMERIC", content + texts);
}

TEST(ToolOptions, NumbersHaveAPointInEveryLocale) {
  const TemporaryDirectory directory;
  makeCommaLocale(directory.path() / "comma");
  const Arguments locale{"-u", "LC_ALL", "LOCPATH=" + directory.path().string(), "LC_NUMERIC=comma"};
  Arguments printf = locale;
  printf.insert(printf.end(), {"/usr/bin/printf", "%.1f", "0,5"});
  ASSERT_EQ(runProgram("/usr/bin/env", printf).output, "0,5") << "the locale must be in force";

  const fs::path file = directory.path() / "way.jsonl";
  Arguments simulate = locale;
  simulate.insert(simulate.end(),
                  {QUORL_TOOL, "simulate", "--scenario", "city", "--minutes", "0.5", "--output", file.string()});
  const ToolResult result = runProgram("/usr/bin/env", simulate);
  EXPECT_EQ(result.exitCode, 0) << testing::PrintToString(result);
  const fs::path other = directory.path() / "other.jsonl";
  runTool({"simulate", "--scenario", "city", "--minutes", "0.5", "--output", other.string()});
  EXPECT_TRUE(readFile(file) == readFile(other));
}

}  // namespace
}  // namespace quorl::test
