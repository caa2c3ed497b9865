#include <algorithm>
#include <set>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "messages/KBBMetricUtility.h"
#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"
#include "messages/classes/nas_context.h"
#include "messages/classes/nr_connection.h"

namespace quorl {
namespace {

bool isKnown(std::uint32_t tag) {
  return KBBMetricUtility::isValidMetricIdTag(tag, Guti::kTable);
}

std::vector<std::string_view> textsOf(std::uint32_t metricId) {
  std::vector<std::string_view> texts;
  for (const auto& entry : KBBMetricUtility::entries())
    if (entry.metricId == metricId) texts.push_back(entry.text);
  return texts;
}

TEST(KBBMetricUtilityTest, EveryEntryIsAKnownId) {
  ASSERT_EQ(KBBMetricUtility::entries().size(), 72U);
  std::set<std::uint32_t> ids;
  for (const auto& entry : KBBMetricUtility::entries()) {
    EXPECT_TRUE(isKnown(entry.metricId)) << entry.text;
    ids.insert(entry.metricId);
  }
  EXPECT_EQ(ids.size(), 72U);
}

TEST(KBBMetricUtilityTest, NeighboursOfKnownIdsAreUnknown) {
  EXPECT_FALSE(isKnown(0xC1001)) << "below the smallest";
  EXPECT_TRUE(isKnown(0xC1002));
  EXPECT_FALSE(isKnown(0xC1003));
  EXPECT_TRUE(isKnown(0x3CD50D));
  EXPECT_FALSE(isKnown(0x3CD50E)) << "above the largest";
  EXPECT_FALSE(isKnown(0xC500B));
}

TEST(KBBMetricUtilityTest, ZeroAndTheLargestTagAreUnknown) {
  EXPECT_FALSE(isKnown(0));
  EXPECT_FALSE(isKnown(0xFFFFFFFF));
}

TEST(KBBMetricUtilityTest, NoFieldHasATagThatIsAMetricId) {
  for (const MessageTable* table : allMessageTables())
    for (const FieldEntry& field : table->fields)
      EXPECT_FALSE(KBBMetricUtility::isValidMetricIdTag(field.tag, *table)) << table->className << '.' << field.key;
}

TEST(KBBMetricUtilityTest, ClassMakesNoDifference) {
  for (const MessageTable* table : allMessageTables())
    EXPECT_TRUE(KBBMetricUtility::isValidMetricIdTag(0xC5004, *table)) << table->className;
  EXPECT_TRUE(KBBMetricUtility::isValidMetricIdTag(0xC5004, CellularNrRrcConnCount::kTable))
      << "though the reader of this class never asks";
}

TEST(KBBMetricUtilityTest, OnlyNrRrcConnCountDoesNotAsk) {
  for (const MessageTable* table : allMessageTables())
    EXPECT_EQ(table->acceptsMetricIdTags, table->className == "CellularNrRrcConnCount") << table->className;
}

TEST(KBBMetricUtilityTest, TextsKeepTheirSpellingsAsMeant) {
  using Texts = std::vector<std::string_view>;
  EXPECT_EQ(textsOf(0xCA163), Texts{"CellularRatLacSrvInfo"});
  EXPECT_EQ(textsOf(0xCA162), Texts{"CellularRatLacSrvInfo"});
  EXPECT_EQ(textsOf(0x3CD001), Texts{"kCellularGsmIdleConfig"});
  EXPECT_EQ(textsOf(0xC4F57), Texts{"CellularLTEConnectionStats"});
  EXPECT_EQ(textsOf(0xC3E0B), Texts{"Cellular WcdmaRachattempt"});
}

TEST(KBBMetricUtilityTest, TextsWithoutClassNameNone) {
  for (const char* name : {"KCellularLteRadioLinkFailure", "KCellularRsrpRsrqSinr", "CellularCsCallPageRespFail",
                           "kCellularGsmScellInfo", "CellularLTEConnectionStats", "Cellular WcdmaRachattempt"}) {
    const auto entries = KBBMetricUtility::entries();
    EXPECT_TRUE(std::any_of(entries.begin(), entries.end(), [&](const auto& entry) { return entry.text == name; }))
        << name;
    EXPECT_EQ(makeMessage(name), nullptr) << name;
  }
}

TEST(KBBMetricUtilityTest, EntriesAreInTheirOrder) {
  const auto entries = KBBMetricUtility::entries();
  EXPECT_EQ(entries.front().text, "KCellularLteRrcState");
  EXPECT_EQ(entries.front().metricId, 0x3C4E04U);
  EXPECT_EQ(entries[31].text, "CellularLteScellInfo");
  EXPECT_EQ(entries.back().text, "CellularNrRrcConnCount");
}

TEST(KBBMetricUtilityTest, ConcurrentQueriesAgree) {
  std::vector<std::thread> threads;
  std::vector<char> answers(4, 0);
  for (char& answer : answers) threads.emplace_back([&answer] { answer = isKnown(0xC5004) && !isKnown(0xC5006); });
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(answers, std::vector<char>(4, 1));
}

}  // namespace
}  // namespace quorl
