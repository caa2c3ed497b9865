#include <algorithm>
#include <set>
#include <string>
#include <thread>
#include <utility>
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

TEST(KBBMetricUtilityTest, TheListIsThisAndInThisOrder) {
  const std::vector<std::pair<std::uint32_t, std::string_view>> expected = {
      {0x3C4E04, "KCellularLteRrcState"},
      {0x3C4E18, "KCellularLteCdrxConfig"},
      {0x3C4E25, "KCellularLteRadioLinkFailure"},
      {0x3C40C2, "KCellularLteScellInfo"},
      {0x3CD30E, "KCellularLteSelReselCellInfo"},
      {0x3CD301, "KCellularLteServingCellMeasurement"},
      {0x3CD302, "KCellularLteTxPower"},
      {0x3C4F6A, "KCellularRsrpRsrqSinr"},
      {0x3CD50C, "KCellularEmmContext"},
      {0x3CD30B, "KCellularLteComponentCarrierInfo"},
      {0x3CD313, "KCellularLteCarrierAggregationStatus"},
      {0x3CD310, "KCellularLteNbrInterRatCellMeas"},
      {0x3CD30F, "KCellularLteNbrEutraCellMeas"},
      {0x3CD509, "KCellularMmCommonInfo"},
      {0x3CD50D, "KCellularActivatedBearerContexts"},
      {0x3CD112, "KCellularWcdmaRrcConnectionState"},
      {0x3C300C, "KCellularWcdmaCellInfo"},
      {0x3CD102, "KCellularWcdmaScellMeasurement"},
      {0x3CD103, "KCellularWcdmaTxPower"},
      {0x3CD105, "KCellularWcdmaNbrCellMeas"},
      {0x3CD104, "KCellularWcdmaSelReselCellInfo"},
      {0x3CD113, "KCellularWcdmaRrcConfiguration"},
      {0x3CD50A, "KCellularMmContext"},
      {0x3CD50B, "KCellularGmmContext"},
      {0x3C2E0C, "kCellularGsmScellInfo"},
      {0x3CD001, "kCellularGsmIdleConfig"},
      {0x3CD002, "kCellularGsmIdleScellMeasurement"},
      {0x3CD003, "kCellularGsmCsRfMeasurement"},
      {0x3CD009, "kCellularGsmGrrEventMeasCr"},
      {0x3CD00C, "kCellularGsmGprsConfig"},
      {0x3C0013, "kCellularSimCardFiles"},
      {0xC40C2, "CellularLteScellInfo"},
      {0xC40C3, "CellularLteOtaMsg"},
      {0xC5000, "CellularNrSysInfoBlocks"},
      {0xC5001, "CellularNrOtaMsg"},
      {0xC5002, "CellularNrScellInfo"},
      {0xC5003, "CellularNrRachAttempt"},
      {0xC5005, "CellularNrRrcState"},
      {0xC5007, "CellularNrScgAddition"},
      {0xC5008, "CellularNrScgRemoval"},
      {0xC500A, "CellularNrBeamSwitch"},
      {0xC5010, "CellularNrRrcResume"},
      {0xC5014, "CellularNrUlPdcpStats"},
      {0xC5015, "CellularNrEndcUsageStats"},
      {0xC5016, "CellularNrConnectionStats"},
      {0xC4F57, "CellularLTEConnectionStats"},
      {0xC5018, "CellularNrSDMActivation"},
      {0xC5019, "CellularNrSdmEndcRelease"},
      {0xCA108, "CellularLqmStateChange"},
      {0xCA104, "CellularRegAttempt"},
      {0xCA102, "CellularRegisteredPlmnStatus"},
      {0xCA163, "CellularRatLacSrvInfo"},
      {0xC7407, "CellularHealthMonitor"},
      {0xCC226, "CellularVoiceCallEvent"},
      {0xC7505, "CellularRfTunerEvent"},
      {0xCC006, "CellularCallEndDetails"},
      {0xCC007, "CellularCsCallPageRespFail"},
      {0xCC008, "CellularCsCallGwlPageRespFail"},
      {0xC5013, "CellularNrRadioLinkFailure"},
      {0xCA123, "CellularLqmDataStall"},
      {0xC1002, "CellularCdmaCellInfo"},
      {0xC300C, "CellularGsmWcdmaCellInfo"},
      {0xC3E02, "CellularWcdmaRrcState"},
      {0xC3E0B, "Cellular WcdmaRachattempt"},
      {0xC4F04, "CellularLteRsrpRsrqSinrHist"},
      {0xC4F12, "CellularLteRrcStateHist"},
      {0xC4120, "CellularLteRachAttempt"},
      {0xCA100, "CellularServiceStatus"},
      {0xCA101, "CellularSysOprtMode"},
      {0xCA103, "CellularSimHplmn"},
      {0xCA162, "CellularRatLacSrvInfo"},
      {0xC5004, "CellularNrRrcConnCount"},
  };
  std::vector<std::pair<std::uint32_t, std::string_view>> entries;
  for (const auto& entry : KBBMetricUtility::entries()) entries.emplace_back(entry.metricId, entry.text);
  EXPECT_EQ(entries, expected);
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
