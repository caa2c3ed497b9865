#include <limits>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "messages/MetricDictionary.h"

namespace quorl {
namespace {

std::string walk(const MetricDictionary& dictionary) {
  std::string keys;
  for (const MetricEntry* entry : dictionary.walkOrder()) keys += (keys.empty() ? "" : " ") + entry->key.string();
  return keys;
}

TEST(MetricDictionaryTest, EntriesKeepTheOrderInWhichTheyWereSet) {
  MetricDictionary dictionary;
  EXPECT_TRUE(dictionary.empty());
  dictionary.set("b", std::int64_t{1});
  dictionary.set("a", true);
  dictionary.set("b", Text("x"));
  EXPECT_EQ(logText(dictionary), "[b: x, a: true]") << "replaced in place";
  EXPECT_EQ(dictionary.size(), 2U);
}

TEST(MetricDictionaryTest, FindingAndRemoving) {
  MetricDictionary dictionary;
  dictionary.append(Text::fromLiteral("a"), std::uint64_t{1});
  dictionary.append(Text::fromLiteral("b"), std::uint64_t{2});
  ASSERT_NE(dictionary.find("b"), nullptr);
  EXPECT_EQ(*dictionary.find("b")->get<std::uint64_t>(), 2U);
  EXPECT_EQ(dictionary.find("c"), nullptr);
  dictionary.remove("a");
  dictionary.remove("c");
  EXPECT_EQ(logText(dictionary), "[b: 2]");
}

TEST(MetricDictionaryTest, ValueCanBeChangedWhereItStands) {
  MetricDictionary dictionary;
  dictionary.set("inner", MetricDictionary());
  dictionary.find("inner")->get<MetricDictionary>()->set("a", std::int64_t{-1});
  EXPECT_EQ(logText(dictionary), "[inner: [a: -1]]");
}

TEST(MetricDictionaryTest, CopiesAreDeep) {
  MetricDictionary inner;
  inner.set("a", std::int64_t{1});
  MetricDictionary dictionary;
  dictionary.set("inner", inner);
  MetricDictionary copy = dictionary;
  copy.find("inner")->get<MetricDictionary>()->set("a", std::int64_t{2});
  EXPECT_EQ(logText(dictionary), "[inner: [a: 1]]");
  EXPECT_EQ(logText(copy), "[inner: [a: 2]]");
}

TEST(MetricDictionaryTest, EqualityLooksAtKeysAndValuesNotAtTheOrder) {
  MetricDictionary a;
  a.set("x", std::int64_t{1});
  a.set("y", Text("t"));
  MetricDictionary b;
  b.set("y", Text("t"));
  b.set("x", std::int64_t{1});
  EXPECT_EQ(a, b);
  b.set("z", true);
  EXPECT_NE(a, b);
  b.remove("z");
  b.set("x", std::int64_t{2});
  EXPECT_NE(a, b);
}

TEST(MetricDictionaryTest, EveryKindIsComparedByItsContent) {
  const auto dictionaryWith = [](auto value) {
    MetricDictionary dictionary;
    dictionary.set("k", std::move(value));
    return dictionary;
  };
  EXPECT_EQ(dictionaryWith(ByteString("a")), dictionaryWith(ByteString("a")));
  EXPECT_NE(dictionaryWith(ByteString("a")), dictionaryWith(Text("a")));
  EXPECT_EQ(dictionaryWith(NumberList{{1, 2}, true}), dictionaryWith(NumberList{{1, 2}, true}));
  EXPECT_NE(dictionaryWith(NumberList{{1, 2}, true}), dictionaryWith(NumberList{{1}, true}));
  EXPECT_EQ(dictionaryWith(MetricDictionaryList(2)), dictionaryWith(MetricDictionaryList(2)));
  EXPECT_NE(dictionaryWith(MetricDictionaryList(2)), dictionaryWith(MetricDictionaryList(1)));
  EXPECT_NE(dictionaryWith(MetricFloat{1.5F}), dictionaryWith(MetricFloat{2.5F}));
}

TEST(MetricDictionaryTest, WalkTakesRowsFirstThenWhatGivesNoneThenWhatEndsIt) {
  MetricDictionary dictionary;
  dictionary.set("empty_text", Text());
  dictionary.set("child", MetricDictionary());
  dictionary.set("bytes", ByteString("x"));
  dictionary.set("number", std::int64_t{1});
  dictionary.set("empty_list", MetricDictionaryList());
  dictionary.set("empty_numbers", NumberList());
  dictionary.set("list", MetricDictionaryList(1));
  dictionary.set("numbers", NumberList{{1}, false});
  dictionary.set("text", Text("x"));
  EXPECT_EQ(walk(dictionary), "number text bytes numbers child list empty_text empty_list empty_numbers");
}

TEST(MetricDictionaryTest, WalkOfPlainEntriesIsTheirOrder) {
  MetricDictionary dictionary;
  dictionary.set("b", true);
  dictionary.set("a", MetricFloat{0.5F});
  EXPECT_EQ(walk(dictionary), "b a");
  EXPECT_EQ(walk(MetricDictionary()), "");
}

TEST(MetricValueTest, IntegersOfEveryKind) {
  EXPECT_EQ(MetricValue(std::int64_t{-5}).integer(), -5);
  EXPECT_EQ(MetricValue(std::uint64_t{5}).integer(), 5);
  EXPECT_EQ(MetricValue(true).integer(), 1);
  EXPECT_EQ(MetricValue(MetricFloat{3.0F}).integer(), 3);
  EXPECT_EQ(MetricValue(Text("5")).integer(), std::nullopt);
  EXPECT_EQ(MetricValue(MetricFloat{3.5F}).integer(), std::nullopt);
}

TEST(MetricValueTest, ComputedWholeFloatIsNoInteger) {
  const MetricValue computed(MetricFloat{10.0F, /*isComputed=*/true});
  EXPECT_EQ(computed.integer(), std::nullopt);
  EXPECT_FALSE(computed.isInteger());
  EXPECT_EQ(computed.number(), 10.0F);
  EXPECT_EQ(logText(computed), "10.0");
}

TEST(MetricValueTest, UnsignedNumberBeyondTheSignedRangePassesTheTestButIsNoInteger) {
  const MetricValue large(std::numeric_limits<std::uint64_t>::max());
  EXPECT_TRUE(large.isInteger());
  EXPECT_EQ(large.integer(), std::nullopt);
  EXPECT_EQ(large.integerText(), "18446744073709551615");
}

TEST(MetricValueTest, FloatsBeyondSixtyFourBitsAreNoIntegers) {
  EXPECT_EQ(MetricValue(MetricFloat{0x1p63F}).integer(), std::nullopt);
  EXPECT_EQ(MetricValue(MetricFloat{std::numeric_limits<float>::infinity()}).integer(), std::nullopt);
  EXPECT_EQ(MetricValue(MetricFloat{std::numeric_limits<float>::quiet_NaN()}).integer(), std::nullopt);
  EXPECT_EQ(MetricValue(MetricFloat{-0x1p62F}).integer(), -(std::int64_t{1} << 62));
}

TEST(MetricValueTest, ThirtyTwoBitsHaveTheirLimits) {
  EXPECT_EQ(MetricValue(std::int64_t{2147483647}).integer32(), 2147483647);
  EXPECT_EQ(MetricValue(std::int64_t{2147483648}).integer32(), std::nullopt);
  EXPECT_EQ(MetricValue(std::int64_t{-2147483648}).integer32(), std::numeric_limits<std::int32_t>::min());
  EXPECT_EQ(MetricValue(std::int64_t{-2147483649}).integer32(), std::nullopt);
  EXPECT_EQ(MetricValue(std::uint64_t{4294967295}).integer32(), std::nullopt);
}

TEST(MetricValueTest, LogTextOfByteStringsShowsTheirLengthOnly) {
  EXPECT_EQ(logText(MetricValue(ByteString("12345"))), "<5 bytes>");
  EXPECT_EQ(logText(MetricValue(NumberList{{static_cast<std::uint64_t>(-3), 2}, true})), "[-3, 2]");
  EXPECT_EQ(logText(MetricValue(MetricDictionaryList(2))), "[[:], [:]]");
}

TEST(MetricValueTest, FloatTextIsShortestWithAFraction) {
  EXPECT_EQ(floatText(10.0F), "10.0");
  EXPECT_EQ(floatText(-12.5F), "-12.5");
  EXPECT_EQ(floatText(0.1F), "0.1");
  EXPECT_EQ(floatText(16777216.0F), "16777216.0");
}

}  // namespace
}  // namespace quorl
