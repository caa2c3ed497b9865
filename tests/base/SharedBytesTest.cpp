#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "base/SharedBytes.h"

namespace quorl {
namespace {

TEST(SharedBytesTest, OwnsACopyOfWhatItWasMadeFrom) {
  std::string source = "payload";
  const SharedBytes bytes{std::string_view(source)};
  source[0] = 'X';
  EXPECT_EQ(bytes.view(), "payload");
  EXPECT_EQ(bytes.size(), 7U);
}

TEST(SharedBytesTest, ACopySharesItsBytes) {
  const SharedBytes bytes{std::string_view("payload")};
  const SharedBytes copy = bytes;
  EXPECT_EQ(copy.data(), bytes.data());
}

TEST(SharedBytesTest, ACopyOutlivesTheFirst) {
  SharedBytes copy;
  {
    const SharedBytes bytes{std::string_view("payload")};
    copy = bytes;
  }
  EXPECT_EQ(copy.view(), "payload");
}

TEST(SharedBytesTest, WhatWasMovedFromIsEmpty) {
  SharedBytes bytes{std::string_view("payload")};
  const SharedBytes taken = std::move(bytes);
  EXPECT_EQ(taken.view(), "payload");
  EXPECT_TRUE(bytes.empty());
  EXPECT_NE(bytes.data(), nullptr);
}

TEST(SharedBytesTest, AssigningToItselfKeepsTheBytes) {
  SharedBytes bytes{std::string_view("payload")};
  const SharedBytes& same = bytes;
  bytes = same;
  EXPECT_EQ(bytes.view(), "payload");
}

TEST(SharedBytesTest, BytesOfValueZeroAreKept) {
  const ByteString bytes(std::string_view("a\0b", 3));
  EXPECT_EQ(bytes.size(), 3U);
  EXPECT_EQ(bytes.view(), std::string_view("a\0b", 3));
}

TEST(SharedBytesTest, ALiteralIsReferredTo) {
  static constexpr char kLiteral[] = "literal";
  const Text text = Text::fromLiteral(kLiteral);
  EXPECT_EQ(text.data(), kLiteral);
  const Text copy = text;
  EXPECT_EQ(copy.data(), kLiteral);
}

TEST(SharedBytesTest, EqualityIsThatOfTheContent) {
  EXPECT_EQ(Text("abc"), Text::fromLiteral("abc"));
  EXPECT_EQ(Text("abc"), std::string_view("abc"));
  EXPECT_FALSE(Text("abc") == Text("abd"));
  EXPECT_EQ(ByteString(std::string_view()), ByteString());
}

TEST(SharedBytesTest, CopiesAreUsedOnSeveralThreads) {
  const SharedBytes bytes{std::string(1000, 'x')};
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t) {
    threads.emplace_back([copy = bytes] {
      for (int i = 0; i < 1000; ++i) {
        const SharedBytes another = copy;
        ASSERT_EQ(another.size(), 1000U);
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
}

}  // namespace
}  // namespace quorl
