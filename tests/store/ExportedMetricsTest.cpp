#include <random>
#include <set>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "store/ExportedMetrics.h"
#include "support/FakePlatform.h"

namespace quorl {
namespace {

class ExportedMetricsTest : public ::testing::Test {
 protected:
  void append(std::string_view tech, std::string_view name, std::string_view attribute, std::string_view value,
              std::string_view metricId = "803010", std::int32_t subsId = 0) {
    rows.append({{}, tech, name, {}, attribute, value, Date(std::chrono::seconds(1767605412)), metricId, subsId},
                strings);
  }

  test::FakeStrings strings;
  ExportedMetrics rows;
};

TEST_F(ExportedMetricsTest, ARowIsARecordOfItsOwn) {
  strings.table = {{"power", "Power"}};
  append("LTE", "Tx Power", "power", "11", "3986178", 1);
  ASSERT_EQ(rows.size(), 1U);
  const Metric metric = rows.row(0).metric();
  EXPECT_NE(metric.id, Uuid{});
  EXPECT_EQ(metric.metricTech, "LTE");
  EXPECT_EQ(metric.metricName, "Tx Power");
  EXPECT_EQ(metric.attributeName, "Power");
  EXPECT_EQ(metric.attributeNameNonLocalized, "power");
  EXPECT_EQ(metric.attributeValue, "11");
  EXPECT_EQ(metric.attributeValueType, "");
  EXPECT_EQ(metric.collectedOn, Date(std::chrono::seconds(1767605412)));
  EXPECT_EQ(metric.metricId, "3986178");
  EXPECT_EQ(metric.subsId, 1);
  EXPECT_FALSE(metric.graphable);
  EXPECT_FALSE(metric.isBookmarked);
  EXPECT_EQ(metric.sectionNumber, std::nullopt);
}

TEST_F(ExportedMetricsTest, StartsEmpty) {
  EXPECT_TRUE(rows.empty());
  append("", "", "", "", "");
  EXPECT_FALSE(rows.empty());
  EXPECT_EQ(rows.row(0).attributeValue, "");
}

TEST_F(ExportedMetricsTest, TextsThatDifferInOneFieldOnlyStayApart) {
  append("LTE", "a", "b", "1", "7");
  append("5G", "a", "b", "2", "7");
  append("LTE", "ab", "", "3", "7");
  append("LTE", "a", "b", "4", "8");
  append("LTE", "a", "b", "5", "7");
  EXPECT_EQ(rows.row(0).metricTech, "LTE");
  EXPECT_EQ(rows.row(1).metricTech, "5G");
  EXPECT_EQ(rows.row(2).metricName, "ab");
  EXPECT_EQ(rows.row(2).attributeNameNonLocalized, "");
  EXPECT_EQ(rows.row(3).metricId, "8");
  EXPECT_EQ(rows.row(4).metricId, "7");
  EXPECT_EQ(rows.row(4).attributeValue, "5");
}

TEST_F(ExportedMetricsTest, ValuesOfEveryLengthStayWhole) {
  constexpr std::size_t kLengths[] = {0, 1, 6, 7, 8, 9, 13, 255, 256, 70'000, 1'048'572, 1'048'576, 3'000'000, 8};
  std::vector<std::string> values;
  for (const std::size_t length : kLengths) values.emplace_back(length, static_cast<char>('a' + length % 26));
  values.emplace_back("kHVCellMonitorCellTypeServing");
  values.emplace_back("\xF0\x9F\x93\xB6 g\xC3\xBCt");
  values.emplace_back("\x7F\x7F\x7F\x7F\x7F\x7F\x7F");
  for (const std::string& value : values) append("LTE", "a", "b", value);
  for (std::size_t i = 0; i < values.size(); ++i) EXPECT_EQ(rows.row(i).attributeValue, values[i]);
}

TEST_F(ExportedMetricsTest, ManyRowsInRandomOrderReadAsTheyWereWritten) {
  struct Expected {
    std::string tech, name, attribute, value, id;
    std::int32_t subsId;
  };
  std::mt19937 random(20260105);
  std::vector<Expected> expected;
  for (int i = 0; i < 50'000; ++i) {
    Expected row{"t" + std::to_string(random() % 5),  "n" + std::to_string(random() % 20),
                 "a" + std::to_string(random() % 30), {},
                 std::to_string(random() % 20),       static_cast<int>(random() % 2)};
    row.value = random() % 3 == 0 ? std::to_string(random()) + std::to_string(random()) : std::to_string(random() % 99);
    append(row.tech, row.name, row.attribute, row.value, row.id, row.subsId);
    expected.push_back(std::move(row));
  }
  ASSERT_EQ(rows.size(), expected.size());
  std::set<Uuid> ids;
  for (std::size_t i = 0; i < expected.size(); ++i) {
    const ExportedMetric row = rows.row(i);
    ids.insert(row.id);
    EXPECT_EQ(row.metricTech, expected[i].tech);
    EXPECT_EQ(row.metricName, expected[i].name);
    EXPECT_EQ(row.attributeName, expected[i].attribute);
    EXPECT_EQ(row.attributeNameNonLocalized, expected[i].attribute);
    EXPECT_EQ(row.attributeValue, expected[i].value);
    EXPECT_EQ(row.metricId, expected[i].id);
    EXPECT_EQ(row.subsId, expected[i].subsId);
  }
  EXPECT_EQ(ids.size(), expected.size());
}

TEST_F(ExportedMetricsTest, ACopyOutlivesItsOriginal) {
  append("LTE", "Tx Power", "power", "a value too long to stand in its row");
  ExportedMetrics copy = rows;
  rows = ExportedMetrics();
  EXPECT_EQ(copy.row(0).attributeValue, "a value too long to stand in its row");
  EXPECT_EQ(copy.row(0).metricName, "Tx Power");
}

}  // namespace
}  // namespace quorl
