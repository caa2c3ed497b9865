#include <gtest/gtest.h>

#include "capture/HighlightedText.h"

namespace quorl {
namespace {

TEST(HighlightedTextTest, ColoursTheNameInWhateverCase) {
  EXPECT_EQ(highlight("Log Configuration: DEFAULT now", "default"),
            (HighlightedText{"Log Configuration: ", "DEFAULT", " now"}));
}

TEST(HighlightedTextTest, ColoursNothingWhereTheNameDoesNotOccur) {
  EXPECT_EQ(highlight("Chunk file size: 32 Mb", "Default"), (HighlightedText{"Chunk file size: 32 Mb", "", ""}));
  EXPECT_EQ(highlight("", "Default"), HighlightedText());
  EXPECT_EQ(highlight("Def", "Default"), (HighlightedText{"Def", "", ""}));
}

TEST(HighlightedTextTest, AnEmptyNameColoursNothing) {
  EXPECT_EQ(highlight("Max log file: 256 files", ""), (HighlightedText{"Max log file: 256 files", "", ""}));
}

TEST(HighlightedTextTest, OnlyTheFirstOfTwoIsColoured) {
  EXPECT_EQ(highlight("Log Configuration: log", "log"), (HighlightedText{"", "Log", " Configuration: log"}));
}

TEST(HighlightedTextTest, LettersBeyondAsciiHaveCasesToo) {
  EXPECT_EQ(highlight("Protokoll: ÄRGER", "ärger"), (HighlightedText{"Protokoll: ", "ÄRGER", ""}));
  EXPECT_EQ(highlight("日本: テスト", "テスト").highlighted, "テスト");
}

TEST(HighlightedTextTest, TheWholeIsTheTextThatWentIn) {
  EXPECT_EQ(highlight("Log Configuration: Voice", "voice").text(), "Log Configuration: Voice");
}

}  // namespace
}  // namespace quorl
