#include <algorithm>
#include <map>
#include <random>

#include "store/DatabaseFixture.h"

// The grouped reads take the bare columns of a sorted subquery. That these come from the latest row is not promised by
// SQL, so it is checked over many tables.

namespace quorl {
namespace {

class LatestRowTest : public test::DatabaseFixture, public testing::WithParamInterface<unsigned> {
 protected:
  struct Stored {
    std::string tech;
    std::string name;
    std::string attribute;
    std::string value;
    std::string collectedOn;
    std::int32_t subsId;
  };

  std::vector<Stored> fillAtRandom(unsigned seed) {
    std::mt19937 random(seed);
    const auto upTo = [&](unsigned count) { return static_cast<unsigned>(random() % count); };
    std::vector<Stored> rows;
    const unsigned count = 1 + upTo(400);
    const unsigned instants = 1 + upTo(500);  // few instants: many rows of the same time
    run("BEGIN");
    for (unsigned i = 0; i < count; ++i) {
      Stored row{upTo(2) == 0 ? "LTE" : "5G",
                 "Name " + std::to_string(upTo(6)),
                 "attribute_" + std::to_string(upTo(8)),
                 std::to_string(i),
                 wallClockText(Date(std::chrono::seconds(1767600000 + upTo(instants)))),
                 static_cast<std::int32_t>(upTo(2))};
      run("INSERT INTO Metric (metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
          "is_attribute_graphable, metric_id, subs_id, collected_on) VALUES ('" +
          row.tech + "', '" + row.name + "', '" + row.attribute + "', '" + row.value + "', 'INT', 0, '1', " +
          std::to_string(row.subsId) + ", '" + row.collectedOn + "')");
      rows.push_back(std::move(row));
    }
    run("COMMIT");
    return rows;
  }
};

INSTANTIATE_TEST_SUITE_P(Tables, LatestRowTest, testing::Range(0U, 60U));

TEST_P(LatestRowTest, EachGroupAnswersARowOfItsLatestTime) {
  openWithTables();
  const std::vector<Stored> rows = fillAtRandom(GetParam());

  for (const std::int32_t subsId : {0, 1}) {
    std::map<std::string, std::string> latestByName;
    std::map<std::pair<std::string, std::string>, std::map<std::string, std::string>> latestByAttribute;
    for (const Stored& row : rows) {
      if (row.subsId != subsId) continue;
      auto& ofName = latestByName[row.name];
      ofName = std::max(ofName, row.collectedOn);
      auto& ofAttribute = latestByAttribute[{row.tech, row.name}][row.attribute];
      ofAttribute = std::max(ofAttribute, row.collectedOn);
    }

    const test::Listed listed = available(subsId);
    std::map<std::string, std::string> seen;
    for (const auto& [tech, entries] : listed.result) {
      for (const MetricList& entry : entries) {
        const std::string time = wallClockText(entry.collectedOn);
        EXPECT_TRUE(seen.emplace(entry.metricName, time).second) << entry.metricName;
        EXPECT_TRUE(std::any_of(rows.begin(), rows.end(),
                                [&, &technology = tech](const Stored& row) {
                                  return row.tech == technology && row.name == entry.metricName &&
                                         row.collectedOn == time && row.subsId == subsId;
                                }))
            << "no such row: " << entry.metricName;
      }
    }
    EXPECT_EQ(seen, latestByName);

    for (const auto& [metric, latest] : latestByAttribute) {
      std::map<std::string, std::string> read;
      for (const Metric& row : contents(std::nullopt, subsId, metric.first, metric.second).result) {
        read.emplace(row.attributeNameNonLocalized, wallClockText(row.collectedOn));
        const Stored& stored = rows.at(std::stoul(row.attributeValue));
        EXPECT_EQ(stored.collectedOn, wallClockText(row.collectedOn));
        EXPECT_EQ(stored.attribute, row.attributeNameNonLocalized);
      }
      EXPECT_EQ(read, latest);
    }
  }
}

}  // namespace
}  // namespace quorl
