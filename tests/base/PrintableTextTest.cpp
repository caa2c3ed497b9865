#include <string>

#include <gtest/gtest.h>

#include "base/PrintableText.h"

namespace quorl {
namespace {

TEST(PrintableText, KeepsCharactersOfAllLengths) {
  EXPECT_EQ(printable(""), "");
  EXPECT_EQ(printable("Größe 5 €, 𝄞"), "Größe 5 €, 𝄞");
  EXPECT_EQ(printable("\u00a0\u00c5"), "\u00a0\u00c5") << "the characters behind C1 are none of it";
}

TEST(PrintableText, PutsADotForEachControlCharacter) {
  EXPECT_EQ(printable("a\tb\x7f\nGröße"), "a.b..Größe");
  EXPECT_EQ(printable("\x1b]0;x\x07"), ".]0;x.");
  EXPECT_EQ(printable(std::string("a\0b", 3)), "a.b");
  EXPECT_EQ(printable("\u0080-\u009b31m-\u009f"), ".-.31m-.");
}

TEST(PrintableText, PutsADotForEachByteThatIsNoCharacter) {
  EXPECT_EQ(printable("\x9b"
                      "31m"),
            ".31m");
  EXPECT_EQ(printable("a\xc3"), "a.");
  EXPECT_EQ(printable("\xe2\x82z\xff\xc0\x9b"), "..z...");
  EXPECT_EQ(printable("\xe0\x80\x9b|\xf0\x80\x80\x9b|\xed\xa0\x80|\xf4\x90\x80\x80"), "...|....|...|....");
  EXPECT_EQ(printable("\xe0\xa0\x80\xed\x9f\xbf\xf0\x90\x80\x80\xf4\x8f\xbf\xbf"),
            "\xe0\xa0\x80\xed\x9f\xbf\xf0\x90\x80\x80\xf4\x8f\xbf\xbf")
      << "the first and last of each length";
}

}  // namespace
}  // namespace quorl
