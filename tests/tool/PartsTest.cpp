#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <gtest/gtest.h>

#include "Commands.h"
#include "Hexadecimal.h"
#include "JsonLine.h"
#include "NearestNames.h"
#include "ProgressBar.h"
#include "TextTable.h"

// The functions that the subcommands share. All other tests of the tool run it as a program.

namespace quorl::tool {
namespace {

TEST(Hexadecimal, ReadsBackEveryByte) {
  std::string bytes;
  for (int value = 0; value < 256; ++value) bytes.push_back(static_cast<char>(value));
  EXPECT_EQ(hexBytes(hexText(bytes)), bytes);
  EXPECT_EQ(hexText("\x08\xe8"), "08e8");
}

TEST(Hexadecimal, TakesBlanksBetweenBytesOnly) {
  EXPECT_EQ(hexBytes(" 08\te8 \r"), "\x08\xe8");
  for (const char* text : {"0", "080", "0 8", "0x08", "08,E8", "g0"}) EXPECT_EQ(hexBytes(text), std::nullopt) << text;
  EXPECT_EQ(hexBytes(std::string("0\0", 2)), std::nullopt);
}

TEST(EditDistance, CountsSingleCharacters) {
  EXPECT_EQ(editDistance("", ""), 0U);
  EXPECT_EQ(editDistance("abc", ""), 3U);
  EXPECT_EQ(editDistance("", "abc"), 3U);
  EXPECT_EQ(editDistance("kitten", "sitting"), 3U);
  EXPECT_EQ(editDistance("Guti", "guti"), 1U);
}

TEST(NearestNames, ComeNearestFirstThenInTheirOrder) {
  EXPECT_EQ(nearestNames("cat", {"dog", "cart", "hat", "cat"}, 3),
            (std::vector<std::string_view>{"cat", "cart", "hat"}));
  EXPECT_EQ(nearestNames("cat", {"dog"}, 3), std::vector<std::string_view>{"dog"});
}

TEST(TerminalText, CountsCharactersAndNotBytes) {
  EXPECT_EQ(displayWidth("Größe"), 5U);
}

TEST(JsonText, HasNoControlCharacters) {
  EXPECT_EQ(jsonLine({{"a", "\x1b\x7f\u0080\u009b\u009f\u00a0ß"}}),
            "{\"a\":\"\\u001b\\u007f\\u0080\\u009b\\u009f\u00a0ß\"}");
  EXPECT_EQ(withEscapedControls("\"\xc2"), "\"\xc2") << "a cut character at the end";
}

/// What `print` writes to standard error.
std::string errorsOf(const std::function<void()>& print) {
  testing::internal::CaptureStderr();
  print();
  return testing::internal::GetCapturedStderr();
}

TEST(Complaint, IsOneLineWithoutControlCharacters) {
  EXPECT_EQ(errorsOf([] { complain("no key \"\x1b]0;x\x07\u009b\n\""); }), "quorl-tool: no key \".]0;x...\"\n");
}

TEST(ProgressText, GrowsWithTheShare) {
  EXPECT_EQ(progressText(0, "rows"), "[>                             ]   0 % rows");
  EXPECT_EQ(progressText(0.5, "rows"), "[===============>              ]  50 % rows");
  EXPECT_EQ(progressText(1, "rows"), "[==============================] 100 % rows");
  EXPECT_EQ(progressText(7, "rows"), progressText(1, "rows"));
  EXPECT_EQ(progressText(-1, "rows"), progressText(0, "rows"));
  EXPECT_EQ(progressText(0.0 / 0.0, "rows"), progressText(0, "rows"));
}

}  // namespace
}  // namespace quorl::tool
