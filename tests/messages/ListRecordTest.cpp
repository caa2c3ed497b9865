#include <limits>
#include <stdexcept>
#include <vector>

#include <gtest/gtest.h>

#include "messages/wire/ListRecord.h"

namespace quorl {
namespace {

template <typename List>
class ListRecordTest : public testing::Test {
 protected:
  using Element = std::remove_pointer_t<decltype(List::list)>;

  static std::vector<Element> elements(const List& list) { return {list.list, list.list + list.count}; }
  static void add(List& list, const std::vector<Element>& values) {
    for (const Element value : values) list.add(value);
  }
};

using ElementForms = testing::Types<UInt32List, UInt64List, SInt32List>;
TYPED_TEST_SUITE(ListRecordTest, ElementForms);

TYPED_TEST(ListRecordTest, NewOneIsEmptyWithoutStorage) {
  const TypeParam list;
  EXPECT_EQ(list.list, nullptr);
  EXPECT_EQ(list.count, 0U);
  EXPECT_EQ(list.size, 0U);
}

TYPED_TEST(ListRecordTest, AddingGrowsTheCapacityAndKeepsTheElements) {
  using Value = typename TestFixture::Element;
  TypeParam list;
  for (Value i = 0; i < 100; ++i) list.add(i);
  ASSERT_EQ(list.count, 100U);
  EXPECT_GE(list.size, list.count);
  for (Value i = 0; i < 100; ++i) EXPECT_EQ(elementAtIndex(list, static_cast<std::size_t>(i)), i);
}

TYPED_TEST(ListRecordTest, ClearingFreesTheStorage) {
  TypeParam list;
  this->add(list, {1, 2});
  list.clear();
  EXPECT_EQ(list.list, nullptr);
  EXPECT_EQ(list.count, 0U);
  EXPECT_EQ(list.size, 0U);
}

TYPED_TEST(ListRecordTest, SettingReplacesAllByACopy) {
  using Value = typename TestFixture::Element;
  TypeParam list;
  this->add(list, {1, 2, 3});
  std::vector<Value> values = {7, 8};
  list.set(values.data(), values.size());
  values[0] = 9;
  EXPECT_EQ(this->elements(list), (std::vector<Value>{7, 8}));
  list.set(nullptr, 0);
  EXPECT_EQ(list.count, 0U);
}

TYPED_TEST(ListRecordTest, ItsOwnElementsCanBeSetAndAdded) {
  using Value = typename TestFixture::Element;
  TypeParam list;
  this->add(list, {1, 2, 3});
  list.set(list.list + 1, 2);
  EXPECT_EQ(this->elements(list), (std::vector<Value>{2, 3}));
  list.addAll(list);
  EXPECT_EQ(this->elements(list), (std::vector<Value>{2, 3, 2, 3}));
}

TYPED_TEST(ListRecordTest, CopyIsIndependent) {
  using Value = typename TestFixture::Element;
  TypeParam source;
  TypeParam target;
  this->add(source, {1, 2});
  this->add(target, {5});
  target.copyFrom(source);
  source.add(3);
  EXPECT_EQ(this->elements(target), (std::vector<Value>{1, 2}));
}

TYPED_TEST(ListRecordTest, EqualListsHaveEqualHashes) {
  TypeParam a;
  TypeParam b;
  EXPECT_TRUE(a.isEqual(b));
  EXPECT_EQ(a.hash(), 0U);
  this->add(a, {1, 2});
  EXPECT_FALSE(a.isEqual(b));
  this->add(b, {1, 2});
  EXPECT_TRUE(a.isEqual(b));
  EXPECT_EQ(a.hash(), b.hash());
}

TYPED_TEST(ListRecordTest, OrderAndLengthCount) {
  TypeParam a;
  TypeParam b;
  this->add(a, {1, 2});
  this->add(b, {2, 1});
  EXPECT_FALSE(a.isEqual(b));
  EXPECT_NE(a.hash(), b.hash());
  b.set(a.list, 1);
  EXPECT_FALSE(a.isEqual(b));
}

TYPED_TEST(ListRecordTest, RangeErrorTellsIndexAndCount) {
  TypeParam list;
  this->add(list, {1, 2});
  try {
    elementAtIndex(list, 2);
    FAIL() << "no range error";
  } catch (const std::out_of_range& error) {
    EXPECT_STREQ(error.what(), "idx (2) is out of range (2)");
  }
}

TEST(ListRecordNumbersTest, ElementsAreExtendedByTheirSign) {
  SInt32List signedList;
  signedList.add(-3);
  EXPECT_EQ(numbers(signedList), (NumberList{{static_cast<std::uint64_t>(-3)}, true}));

  UInt32List unsignedList;
  unsignedList.add(std::numeric_limits<std::uint32_t>::max());
  EXPECT_EQ(numbers(unsignedList), (NumberList{{0xFFFFFFFF}, false}));

  UInt64List wide;
  wide.add(std::numeric_limits<std::uint64_t>::max());
  EXPECT_EQ(numbers(wide), (NumberList{{std::numeric_limits<std::uint64_t>::max()}, false}));
}

}  // namespace
}  // namespace quorl
